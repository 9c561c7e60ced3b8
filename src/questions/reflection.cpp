#include "questions/reflection.h"

#include <algorithm>
#include <map>

#include "questions/declarations.h"
#include "questions/type_json.h"
#include "text/version.h"
#include "translator/interface/interface_def.h"
#include "translator/kinds/enum_def.h"
#include "translator/kinds/functor_def.h"
#include "translator/kinds/global_defs.h"
#include "translator/kinds/variant_def.h"
#include "translator/model/releases.h"

namespace qrex {

namespace {

constexpr int64_t kForm = 1;  // of the JSON; another one for what a reader would take wrongly

class Reflection {
 public:
  std::string Of(const Workspace& workspace, const std::vector<ScannedFile*>& files) {
    const ConfigSettings& settings = workspace.settings;
    m_json.Open('{').Member("form", kForm).Member("release", Version()).Member("config", settings.config);
    m_json.Member("platform", settings.platform).Key("declarations").Open('[');
    for (const ScannedFile* file : files) {
      for (const Declared& declared : DeclarationsOf(*file)) {
        m_json.Line();
        Write(declared);
      }
      for (const TypeRegistration& type : file->registrations.types) WriteRegistered(*file, type);
    }
    m_json.Close(']').Close('}');
    return m_json.Text() + "\n";
  }

 private:
  void Write(const Declared& declared);
  void WritePlace(const ScannedFile& file, const SourcePlace& place);
  void WriteRegistered(const ScannedFile& file, const TypeRegistration& type);
  void WriteMembers(const NameSpaceElement& element);
  void WriteClass(const ClassDef& def);
  void WriteModel(const ClassDef& def);
  void WriteModelField(const ClassDef& def, const ModelField& field);
  void WriteInterface(const InterfaceDef& def);
  void WriteEnum(const EnumDef& def);
  void WriteVariant(const VariantDef& def);
  void WriteFields(std::string_view member, const std::vector<ClassField>& fields);
  void WriteMethods(const std::vector<FunctionSignature>& methods);
  template <typename Elements>
  void WriteNames(std::string_view member, const Elements& elements) {
    if (elements.empty()) return;
    m_json.Key(member).Open('[');
    for (const auto* element : elements) m_json.Value(element->GetQualifiedName());
    m_json.Close(']');
  }
  void WriteFlag(std::string_view member, bool value) {
    if (value) m_json.Member(member, true);
  }

  JsonWriter m_json;
};

void Reflection::WritePlace(const ScannedFile& file, const SourcePlace& place) {
  m_json.Member("project", file.file.project->name);
  m_json.Member("file", place.file.empty() ? file.SourcePath() : place.file);
  if (place.line > 0) m_json.Member("line", place.line);
}

void Reflection::Write(const Declared& declared) {
  const NameSpaceElement& element = *declared.element;
  m_json.Open('{').Member("kind", element.GetKeyword()).Member("name", element.GetQualifiedName());
  WritePlace(element.owner, declared.place);
  WriteFlag("exported", element.m_exported);
  WriteFlag("reflected", element.m_reflected);
  WriteFlag("registered", element.m_registered);
  WriteFlag("undefined", element.status != DeclStatus::Defined);
  WriteMetadata(m_json, element.metadata);
  WriteMembers(element);
  m_json.Close('}');
}

// What $type registers has no name but that of the type.
void Reflection::WriteRegistered(const ScannedFile& file, const TypeRegistration& type) {
  SourcePlace place;
  file.host.FindSourcePlace(type.position, place);
  m_json.Line().Open('{').Member("kind", "type").Member("name", TypeText(type.code));
  WritePlace(file, place);
  WriteTypeMembers(m_json, type.code);
  m_json.Close('}');
}

void Reflection::WriteMembers(const NameSpaceElement& element) {
  switch (element.category) {
    case Category::Class:
      return WriteClass(static_cast<const ClassDef&>(element));
    case Category::Interface:
      return WriteInterface(static_cast<const InterfaceDef&>(element));
    case Category::Enum:
      return WriteEnum(static_cast<const EnumDef&>(element));
    case Category::Variant:
      return WriteVariant(static_cast<const VariantDef&>(element));
    case Category::Functor:
      return WriteSignature(m_json, static_cast<const FunctorDef&>(element).m_signature);
    case Category::GlobalFunction:
      return WriteSignature(m_json, static_cast<const GlobalFunctionDef&>(element).m_signature);
    case Category::GlobalVar:
      return WriteTypeMembers(m_json, static_cast<const GlobalVarDef&>(element).m_type);
    case Category::Typedef:
      return WriteTypeMembers(m_json, static_cast<const TypedefDef&>(element).m_type);
    case Category::NameSpace:
      break;  // what is in it stands for itself
  }
}

void Reflection::WriteFields(std::string_view member, const std::vector<ClassField>& fields) {
  static constexpr std::string_view kKinds[] = {"plain", "indep", "dep"};
  m_json.Key(member).Open('[');
  for (const ClassField& field : fields) {
    m_json.Open('{').Member("name", field.name);
    WriteTypeMembers(m_json, field.type);
    if (field.kind != FieldKind::Plain) m_json.Member("node", kKinds[static_cast<size_t>(field.kind)]);
    WriteFlag("reflected", field.reflected);
    m_json.Close('}');
  }
  m_json.Close(']');
}

void Reflection::WriteMethods(const std::vector<FunctionSignature>& methods) {
  m_json.Key("methods").Open('[');
  for (const FunctionSignature& method : methods) {
    m_json.Open('{').Member("name", method.name);
    WriteMetadata(m_json, method.metadata);
    WriteSignature(m_json, method);
    m_json.Close('}');
  }
  m_json.Close(']');
}

void Reflection::WriteClass(const ClassDef& def) {
  if (def.IsTemplate()) m_json.Member("template", def.m_templateArgList);
  WriteNames("interfaces", def.m_interfaces);
  WriteNames("bases", def.m_bases);
  WriteNames("mixins", def.m_mixins);
  WriteNames("basesBehindMixins", def.m_postMixinBases);
  WriteFields("fields", def.m_fields);
  WriteMethods(def.m_methods);
  if (def.m_referencedModel) m_json.Member("modelName", def.m_referencedModel->GetQualifiedName());
  if (def.HasEmbeddedModel()) WriteModel(def);
  const std::vector<Declared> nested = NestedDeclarationsOf(def);
  if (nested.empty()) return;
  m_json.Key("nested").Open('[');
  for (const Declared& declared : nested) Write(declared);
  m_json.Close(']');
}

void Reflection::WriteModelField(const ClassDef& def, const ModelField& field) {
  m_json.Open('{').Member("name", field.m_name);
  WriteTypeMembers(m_json, field.m_type);
  m_json.Member("added", field.m_rsnAdded);
  if (field.IsDropped()) m_json.Member("dropped", field.m_rsnDropped);
  if (!field.m_evolveCode.empty()) {
    m_json.Key("evolve").Open('{').Key("reads").Open('[');
    for (const size_t index : field.m_evolveArgs) m_json.Value(def.m_modelFields[index]->m_name);
    m_json.Close(']').Member("code", field.m_evolveCode).Close('}');
  }
  m_json.Close('}');
}

// Fields in the order in which an archive has them.
void Reflection::WriteModel(const ClassDef& def) {
  m_json.Key("model").Open('{').Key("fields").Open('[');
  for (const ModelField* field : def.m_modelFields) WriteModelField(def, *field);
  m_json.Close(']').Key("releases").Open('[');
  for (const ModelRelease& release : ReleasesOf(def)) {
    m_json.Open('{').Member("release", release.number);
    for (const auto& [member, fields] : {std::pair("drops", &release.drops), std::pair("adds", &release.adds)}) {
      m_json.Key(member).Open('[');
      for (const ModelField* field : *fields) m_json.Value(field->m_name);
      m_json.Close(']');
    }
    m_json.Close('}');
  }
  m_json.Close(']').Close('}');
}

void Reflection::WriteInterface(const InterfaceDef& def) {
  if (def.m_isIpc || def.m_isRmi) m_json.Member("remote", def.m_isIpc ? "ipc" : "rmi");
  WriteNames("bases", def.m_bases);
  m_json.Key("attributes").Open('[');
  for (const AttributeDef& attribute : def.m_attributes) {
    m_json.Open('{').Member("name", attribute.name);
    WriteTypeMembers(m_json, attribute.type);
    m_json.Close('}');
  }
  m_json.Close(']');
  WriteMethods(def.m_methods);
}

void Reflection::WriteEnum(const EnumDef& def) {
  WriteFlag("class", def.m_isClass);
  m_json.Key("labels").Open('[');
  for (size_t i = 0; i < def.m_labels.size(); ++i) {
    const int64_t value = def.m_values.empty() ? static_cast<int64_t>(i) : def.m_values[i];
    m_json.Open('{').Member("name", def.m_labels[i]).Member("value", value);
    WriteFlag("disabled", !def.m_enabled[i]);
    WriteFlag("default", i == def.m_defaultIndex);
    m_json.Close('}');
  }
  m_json.Close(']');
}

void Reflection::WriteVariant(const VariantDef& def) {
  WriteFlag("hasDefault", def.m_hasDefault);
  m_json.Key("items").Open('[');
  for (const auto& item : def.m_items) {
    m_json.Open('{').Member("name", item->EffectiveName()).Member("tag", static_cast<int64_t>(item->tag));
    if (item->isStruct) {
      WriteFields("fields", item->fields);
    } else {
      WriteTypeMembers(m_json, item->type);
    }
    WriteFlag("onHeap", item->onHeap);
    m_json.Close('}');
  }
  m_json.Close(']');
}

// --- The list

std::string Spaced(const std::vector<const ModelField*>& fields, char sign) {
  std::string text;
  for (const ModelField* field : fields) text.append(" ").append(1, sign).append(field->m_name);
  return text;
}

std::string ModelLines(const ClassDef& def) {
  std::string text;
  for (const ModelRelease& release : ReleasesOf(def)) {
    text +=
        "    " + std::to_string(release.number) + ":" + Spaced(release.drops, '-') + Spaced(release.adds, '+') + "\n";
  }
  return text;
}

}  // namespace

std::string ReflectionJson(const Workspace& workspace, const std::vector<ScannedFile*>& files) {
  return Reflection().Of(workspace, files);
}

std::string ReflectionList(const std::vector<ScannedFile*>& files) {
  std::string list;
  const auto add = [&list](const ScannedFile& file, const SourcePlace& place, const std::string& what) {
    list +=
        (place.file.empty() ? file.SourcePath() : place.file) + ":" + std::to_string(place.line) + ": " + what + "\n";
  };
  for (const ScannedFile* file : files) {
    for (const Declared& declared : DeclarationsOf(*file)) {
      add(*file, declared.place, PrintedElement(*declared.element));
      if (declared.element->category != Category::Class) continue;
      const auto& def = static_cast<const ClassDef&>(*declared.element);
      if (def.HasEmbeddedModel()) list += ModelLines(def);
    }
    for (const TypeRegistration& type : file->registrations.types) {
      SourcePlace place;
      file->host.FindSourcePlace(type.position, place);
      add(*file, place, "$type " + TypeText(type.code));
    }
  }
  return list;
}

}  // namespace qrex
