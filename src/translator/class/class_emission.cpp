// The members and operators of a class: generated text inside the class and behind it.

#include "translator/class/class_emission.h"

#include <algorithm>

#include "translator/emit/emit.h"
#include "translator/interface/interface_def.h"
#include "translator/model/model.h"

namespace qrex {

namespace {

constexpr std::string_view kArchiveFunctions =
    "void Serialise(vesk::Archive&) const;\n"
    "void Deserialise(vesk::InputArchive&);\n";

void WriteFieldAccessors(TextWriter& out, const ClassDef& def) {
  for (const ClassField& field : def.m_fields) {
    if (field.kind != FieldKind::Plain) continue;
    WriteText(out,
              "$0 Get$1() const { return $1; }\n"
              "void Set$1($0 _v) { $1 = _v; }\n",
              {TypeText(field.type), field.name});
  }
}

void WriteArchiveMembers(TextWriter& out, const ClassDef& def) {
  if (!def.HasEmbeddedModel()) {
    if (def.m_referencedModel) out << kArchiveFunctions;
    return;
  }
  if (def.MemberPlacement() == Placement::InClass) {
    WriteSerialise(out, def, Placement::InClass);
    WriteDeserialise(out, def, Placement::InClass);
    if (!def.m_inheritsModel) WriteVisiting(out, def, Placement::InClass);
    return;
  }
  if (def.CanSerialiseEmbeddedModel()) out << kArchiveFunctions;
  if (!def.m_inheritsModel) WriteVisitingDeclarations(out, def);
}

void WriteQueryInterface(TextWriter& out, const ClassDef& def, std::string_view scope) {
  out << "\nvesk::AnyInterface " << scope << "QueryInterface(const vesk::ReflectedInterface& _ri)\n";
  Block body(out);
  for (const InterfaceDef* interface : AllInterfaces(def)) {
    if (!interface->m_reflected) continue;
    WriteText(out,
              "if (&_ri == &vesk::GetReflectedInterface<$0 >()) { vesk::ptr<$0> p(this); "
              "return reinterpret_cast<vesk::AnyInterface&>(p); }\n",
              {interface->GetQualifiedName()});
  }
  out << "return vesk::AnyInterface();\n";
}

void WriteGetReflectedClass(TextWriter& out, const ClassDef& def, std::string_view scope) {
  out << "vesk::ReflectedClass const* " << scope << "GetReflectedClass() const\n";
  Block body(out);
  if (def.m_reflected) {
    out << "return &_GetReflected( (" << def.GetQualifiedName() << def.TemplateArgs() << "*) 0);\n";
  } else {
    out << "return NULL;\n";
  }
}

void WriteInterfaceMembers(TextWriter& out, const ClassDef& def) {
  if (!def.m_implementsIObject) return;
  if (!def.HaveSomethingToRegister() || def.MemberPlacement() == Placement::InClass) {
    WriteQueryInterface(out, def, "");
    WriteGetReflectedClass(out, def, "");
  } else {
    out << "vesk::AnyInterface QueryInterface(const vesk::ReflectedInterface&);\n"
           "vesk::ReflectedClass const* GetReflectedClass() const;\n";
  }
}

}  // namespace

void WriteInterfaceDefinitions(TextWriter& out, const ClassDef& def) {
  const std::string scope = def.GetQualifiedName() + def.TemplateArgs() + "::";
  WriteQueryInterface(out, def, scope);
  WriteGetReflectedClass(out, def, scope);
}

void WriteClassMembers(TextWriter& out, const ClassDef& def) {
  out << "public:\n";
  IndentScope indent(out, 4);
  WriteEvictDgsNodes(out, def);
  if (!def.m_inheritsModel && def.HasEmbeddedModel()) WriteModelFieldsAndAccessors(out, def);
  WriteFieldAccessors(out, def);
  for (const ClassDef* mixin : def.m_mixins) WriteFieldAccessors(out, *mixin);
  out << "\n";
  WriteArchiveMembers(out, def);
  if (def.m_reflected) {
    if (def.HasDefaultCtor() && def.m_implementsIObject) {
      out << "static vesk::ptr<vesk::IObject> __stdcall sfnCreateInstance();\n";
    }
    if (!def.IsMixin()) {
      out << "friend ";
      if (def.IsTemplate()) {
        WriteGetReflected(out, def);
      } else {
        out << ExportPrefix(def) << "vesk::ReflectedClass const& _GetReflected(" << def.name << " const*);\n";
      }
    }
  }
  WriteInterfaceMembers(out, def);
}

void WriteEvictDgsNodes(TextWriter& out, const ClassDef& def) {
  bool hasNode = def.m_hasEvictBlock || !def.m_evictionMembers.empty();
  for (const ClassField& field : def.m_fields) hasNode = hasNode || field.kind != FieldKind::Plain;
  if (!hasNode) return;
  out << "void EvictDgsNodes() const\n";
  Block body(out);
  if (def.m_hasEvictBlock) out << "EvictDgsNodes_extra();\n";
  if (!def.m_bases.empty() || def.m_inheritsModel || def.IsMixin() || def.m_implementsIPersistable ||
      def.m_implementsIObject) {
    out << "BaseClass::EvictDgsNodes();\n";
  }
  for (const ClassField& field : def.m_fields) {
    if (field.kind != FieldKind::Plain) out << field.name << ".TryEvict(false);\n";
  }
  for (const std::string& member : def.m_evictionMembers) {
    if (member.compare(0, 5, "_map_") == 0) {
      out << "vesk::TryEvict(" << member << ");\n";
    } else {
      out << member << ".TryEvict(false);\n";
    }
  }
}

namespace {

void WriteVisitorOperators(TextWriter& out, const ClassDef& def, std::string_view prefix, std::string_view name) {
  const bool hasModel = !def.IsMixin() && (def.HasEmbeddedModel() || def.m_referencedModel);
  if (!hasModel && (!def.IsIObjectVisitable() || def.m_implementsIObject)) return;
  WriteText(out,
            "\n$0inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,$1 const& _x) "
            "{ _x.VisitObjects(_v); return _v; }\n",
            {prefix, name});
  if (!hasModel) return;
  if (!def.m_implementsIObject) {
    WriteText(out, "$0inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,$1 const*) { return _v; }\n",
              {prefix, name});
  }
  WriteText(out,
            "$0inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,$1 const& _x) "
            "{ _x.VisitPrefs(_v); return _v; }\n",
            {prefix, name});
}

void WriteForwarder(TextWriter& out, const ClassDef& def, const FunctionSignature& method) {
  out << "\ninline ";
  PrintType(out, method.returnType);
  out << " __stdcall " << method.name << "(";
  WriteSelfAndArgDeclarations(out, def.name, method);
  out << ") { ";
  WriteReturn(out, method.returnType);
  out << "_self->" << method.name << "(";
  WriteArgNames(out, method.arguments);
  out << "); }";
}

void WriteAdtFunction(TextWriter& out, const ClassDef& def, const FunctionSignature& method) {
  out << "\n" << ExportPrefix(def);
  PrintType(out, method.returnType);
  out << " __stdcall " << method.name << "(";
  WriteSelfAndArgDeclarations(out, def.name, method);
  out << ");";
}

}  // namespace

void WriteClassOperators(TextWriter& out, const ClassDef& def) {
  const std::string& name = def.GetTemplateClassName();
  const std::string prefix = def.TemplatePrefix();
  WriteVisitorOperators(out, def, prefix, name);
  if (def.WriteInsertionExtractionInTermsOfSerialise()) {
    WriteText(out,
              "$0\ntemplate<typename Archive> inline void Serialise(Archive& _ar,$1 const& _x) { _x.Serialise(_ar); }\n"
              "$0\ntemplate<typename Archive> inline void Deserialise(Archive& _ar,$1& _x) { _x.Deserialise(_ar); }\n",
              {prefix, name});
  }
  if (def.qualifiers.os == TriState::On) {
    WriteText(out,
              "\n$0inline vesk::xostream& operator<<(vesk::xostream& _os,$1 const& _x) "
              "{ (($1&)_x).Write(_os); return _os; }\n",
              {prefix, name});
  } else if (def.qualifiers.os == TriState::Unset && !def.IsMixin()) {
    WriteModelStreamInsertion(out, def);
  }
  if (def.IsAdt() && def.status == DeclStatus::Deferred) {
    WriteReflectionDeclarations(out, def);
    for (const FunctionSignature& method : def.m_methods) WriteAdtFunction(out, def, method);
    return;
  }
  for (const FunctionSignature& method : def.m_methods) WriteForwarder(out, def, method);
}

void ClassDef::WriteExtraTraits(TextWriter& out) const {
  const std::string& qualified = GetQualifiedName();
  const std::pair<std::string_view, bool> traits[] = {
      {"has_reflected_default_ctor", m_reflected && HasDefaultCtor()},
      {"has_reflected_dtor", m_reflected && HasDtor()},
      {"has_reflected_copy_ctor", m_reflected && HasCopy()},
      {"has_reflected_equality", m_reflected && HasEquality()},
      {"has_reflected_compare", m_reflected && HasEquality()},
      {"has_reflected_write_xostream", m_reflected && HasPrint()},
      {"has_reflected_serialise", m_reflected && HasSerialise()},
      {"has_reflected_visit_IObjects", m_reflected && IsIObjectVisitable()},
      {"has_reflected_visit_Prefs", m_reflected && IsPrefVisitable()},
      {"implements_IObject", m_implementsIObject},
      {"implements_IPersistable", m_implementsIPersistable},
      {"can_serialise_model", CanSerialiseEmbeddedModel()},
      {"has_model", HasEmbeddedModel()},
      {"using_model_base_class", m_inheritsModel},
  };
  out << "template<> struct ClassTypeTraits<" << qualified << ">\n";
  {
    Block body(out, ";");
    for (const auto& [name, value] : traits) out << "static const bool " << name << " = " << BitText(value) << ";\n";
  }

  auto writeImplements = [&](std::string_view how, const InterfaceDef& interface) {
    WriteText(out, "template<> struct $0_implements_interface<$1,$2> { static const bool value = true; };\n",
              {how, qualified, interface.GetQualifiedName()});
  };
  std::vector<const InterfaceDef*> inherited;
  for (const InterfaceDef* interface : m_interfaces) {
    writeImplements("directly", *interface);
    for (const InterfaceDef::FlatBase& flat : interface->FlattenedBases()) {
      if (std::find(inherited.begin(), inherited.end(), flat.base) == inherited.end()) inherited.push_back(flat.base);
    }
  }
  for (const InterfaceDef* interface : inherited) {
    if (std::find(m_interfaces.begin(), m_interfaces.end(), interface) == m_interfaces.end()) {
      writeImplements("indirectly", *interface);
    }
  }
}

std::vector<const InterfaceDef*> AllInterfaces(const ClassDef& def) {
  std::vector<const InterfaceDef*> all;
  for (const InterfaceDef* interface : def.m_interfaces) {
    for (const InterfaceDef::FlatBase& flat : interface->FlattenedBases()) all.push_back(flat.base);
    all.push_back(interface);
  }
  return all;
}

void WriteForwardDeclaration(TextWriter& out, const ClassDef& def) {
  out << def.TemplatePrefix() << def.StructWord() << def.name << ";\n";
}

void WriteReflectionDeclarations(TextWriter& out, const ClassDef& def) {
  if (!def.m_reflected) return;
  if (def.MemberPlacement() == Placement::InClass) return WriteGetTypeOps(out, def);
  for (std::string_view text : {"vesk::ReflectedClass const& _GetReflected(", "vesk::TypeOps const& _GetTypeOps("}) {
    out << ExportPrefix(def) << text << def.GetTemplateClassName() << " const*);\n";
  }
}

}  // namespace qrex
