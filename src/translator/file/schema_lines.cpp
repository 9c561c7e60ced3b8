#include "translator/file/schema_lines.h"

#include <unordered_set>

#include "translator/kinds/enum_def.h"
#include "translator/kinds/variant_def.h"
#include "translator/model/releases.h"
#include "translator/symbols/scanned_file.h"

namespace qrex {

namespace {

// Blanks and what ends lines as %XX.
std::string Word(std::string_view text) {
  static constexpr char kDigits[] = "0123456789ABCDEF";
  std::string word;
  for (const char c : text) {
    const auto byte = static_cast<unsigned char>(c);
    if (byte > ' ' && c != '%') {
      word += c;
    } else {
      word.append(1, '%').append(1, kDigits[byte >> 4]).append(1, kDigits[byte & 15]);
    }
  }
  return word;
}

// As it is archived: behind typedefs, without decorators.
std::string ArchivedType(TypeView type, NameSpace& root) {
  type = WithoutDecorators(type, root).type;
  const TypeOp op = type.Op();
  if (type.IsBuiltIn()) return std::string(BuiltInTypeName(op));
  if (type.IsNamed()) return Word(type.Name());
  const std::string inner = ArchivedType(type.Inner(), root);
  if (op == kOpArray) return inner + "[" + std::to_string(type.Count()) + "]";
  if (op == kOpMap) return "xmap<" + ArchivedType(type.Key(), root) + "," + inner + ">";
  if (type.IsTemplate()) return std::string(TemplateTypeName(op)) + "<" + inner + ">";
  return inner + (op == kOpPointer ? "*" : "&");
}

std::string FieldWord(const std::string& name, TypeView type, NameSpace& root) {
  return Word(name) + ":" + ArchivedType(type, root);
}

class SchemaLines {
 public:
  std::vector<SchemaLine> Of(const ClassDef& def) {
    m_met.insert(&def);
    NameSpace& root = *def.owner.rootNameSpace;
    for (const ModelRelease& release : ReleasesOf(def)) {
      if (!def.m_schemaPosition) break;
      SchemaLine& line = Add(def, SchemaKind::Release, release.number);
      for (const ModelField* field : release.drops) line.words.push_back("-" + Word(field->m_name));
      for (const ModelField* field : release.adds)
        line.words.push_back("+" + FieldWord(field->m_name, field->m_type, root));
    }
    for (const ModelField* field : def.m_modelFields) Follow(field->m_type, root);
    return std::move(m_lines);
  }

 private:
  SchemaLine& Add(const NameSpaceElement& element, SchemaKind kind, int64_t release) {
    return m_lines.emplace_back(
        SchemaLine{{Word(element.owner.file.project->rootToProjDir), element.GetQualifiedName(), kind, release}, {}});
  }

  // Into what is stored in place: objects behind pointers have archives of their own.
  void Follow(TypeView type, NameSpace& root) {
    type = WithoutDecorators(type, root).type;
    const TypeOp op = type.Op();
    const bool isReference = op == kOpPointer || op == kOpReference || (op >= kOpPtr && op <= kOpCref);
    if (isReference) return;
    if (op == kOpMap) Follow(type.Key(), root);
    if (type.HasInner()) return Follow(type.Inner(), root);
    if (!type.IsNamed() || op == kOpCppText) return;
    const NameSpaceElement* const element = NamedElement(type, root);
    if (!element || !m_met.insert(element).second) return;
    if (element->category == Category::Enum) AddEnum(static_cast<const EnumDef&>(*element));
    if (element->category == Category::Variant) AddVariant(static_cast<const VariantDef&>(*element));
    if (element->category == Category::Class) AddHeld(static_cast<const ClassDef&>(*element));
  }

  void AddEnum(const EnumDef& def) {
    SchemaLine& line = Add(def, SchemaKind::Enum, 0);
    for (size_t i = 0; i < def.m_labels.size(); ++i) {
      const int64_t value = def.m_values.empty() ? static_cast<int64_t>(i) : def.m_values[i];
      line.words.push_back(Word(def.m_labels[i]) + ":" + std::to_string(value));
    }
  }

  void AddVariant(const VariantDef& def) {
    NameSpace& root = *def.owner.rootNameSpace;
    std::vector<std::string> words;
    for (const auto& item : def.m_items) {
      if (!item->isStruct) {
        words.push_back(FieldWord(item->name, item->type, root));
        continue;
      }
      std::string fields;
      for (const ClassField& field : item->fields)
        fields += (fields.empty() ? "" : ",") + FieldWord(field.name, field.type, root);
      words.push_back(Word(item->name) + ":{" + fields + "}");
    }
    Add(def, SchemaKind::Variant, 0).words = std::move(words);
    for (const auto& item : def.m_items) {
      if (!item->isStruct) Follow(item->type, root);
      for (const ClassField& field : item->fields) Follow(field.type, root);
    }
  }

  // A model with a $schema tells its own releases.
  void AddHeld(const ClassDef& def) {
    if (def.m_referencedModel && m_met.insert(def.m_referencedModel).second) AddHeld(*def.m_referencedModel);
    if (!def.HasEmbeddedModel() || def.m_schemaPosition) return;
    NameSpace& root = *def.owner.rootNameSpace;
    std::vector<std::string> words;
    for (const ModelField* field : def.m_modelFields) words.push_back(FieldWord(field->m_name, field->m_type, root));
    Add(def, SchemaKind::Model, 0).words = std::move(words);
    for (const ModelField* field : def.m_modelFields) Follow(field->m_type, root);
  }

  std::vector<SchemaLine> m_lines;
  std::unordered_set<const NameSpaceElement*> m_met;
};

}  // namespace

std::string SchemaProject(std::string_view folder) { return Word(folder); }

std::vector<SchemaLine> SchemaLinesOf(const ClassDef& def) { return SchemaLines().Of(def); }

}  // namespace qrex
