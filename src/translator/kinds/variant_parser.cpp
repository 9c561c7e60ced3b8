#include "translator/kinds/variant_parser.h"

#include "translator/emit/emit.h"
#include "translator/emit/records.h"
#include "translator/kinds/type_registration.h"
#include "translator/kinds/variant_def.h"
#include "translator/kinds/variant_emission.h"
#include "translator/reader/qrex_parser.h"
#include "translator/reader/qualifiers.h"

namespace qrex {

namespace {

class VariantStatement {
 public:
  VariantStatement(QrexParser& parser, ClassDef* enclosing) : m_parser(parser), m_enclosing(enclosing) {}
  void Parse();

 private:
  void ReadHeading();
  void ReadQualifiers();
  void ReadBody();
  void CheckTextInClass() const;
  void CheckTextOfItems() const;
  void ReadDefault();
  void ReadItem();
  void ReadStruct(VariantItem& item);
  void CheckTextOfDefault() const;
  ParsedType ReadTypeAndName(Naming naming);

  QrexParser& m_parser;
  ClassDef* const m_enclosing;
  bool m_exported = false;
  VariantDef* m_old = nullptr;
  std::unique_ptr<VariantDef> m_made;
  VariantDef* m_def = nullptr;
  TextRange m_default;  // the expression
};

void VariantStatement::ReadHeading() {
  m_parser.Advance();
  m_exported = m_parser.ParseExportModifier();
  if (m_exported && m_enclosing) m_parser.Fail("'+' modifier not permitted on nested variant");
  const std::string name = m_parser.RequireIdentifier();
  if (!m_enclosing) {
    if (NameSpaceElement* found = m_parser.Current().Lookup(name)) {
      if (found->category != Category::Variant) m_parser.FailConflict("variant", name, *found);
      m_old = static_cast<VariantDef*>(found);
    }
  }
  m_made = std::make_unique<VariantDef>(m_parser.file, m_parser.SourcePosition());
  m_def = m_made.get();
  m_def->name = name;
  m_def->parent = &m_parser.Current();
  m_def->m_nested = m_enclosing != nullptr;
  m_def->SetExported(m_exported);
}

void VariantStatement::ReadQualifiers() {
  bool redundant = false;
  m_parser.ParseQualifierFlags(m_def->m_reflected, m_def->m_registered, " >> on " + PrintedElement(*m_def),
                               [&](bool on) {
                                 const QualifierWord* word = FindQualifierWord(m_parser.current.text.View());
                                 if (!word || !word->onVariant) return false;
                                 m_def->m_qualifiers.*word->state = on ? TriState::On : TriState::Off;
                                 redundant = redundant || word->needsReflection;
                                 return true;
                               });
  if (redundant) m_parser.CheckRedundant(*m_def);
}

void VariantStatement::ReadDefault() {
  const char* const begin = m_parser.current.text.end;
  while (!m_parser.Is(kSemicolon)) {
    if (m_parser.Is(kEndOfText)) m_parser.Fail("Met EOS before read ';'");
    m_parser.Advance();
  }
  LexScanner expression(TextRange(begin, m_parser.current.text.begin));
  SkipWhiteSpace(expression);
  m_default = expression;
  Write(m_parser.out, R"(
    $name$()
    {
        new (this) $name$($value$);
    }
  )",
        "name"_ = m_def->name, "value"_ = expression.View());
  m_def->m_hasDefault = true;
  m_parser.Advance();
}

ParsedType VariantStatement::ReadTypeAndName(Naming naming) {
  std::optional<ParsedType> parsed = m_parser.ParseTypeWithName(naming, m_def->m_reflected);
  if (!parsed || parsed->followedByParen) m_parser.Fail("Syntax error : " + Printed(m_parser.current));
  return std::move(*parsed);
}

void VariantStatement::ReadStruct(VariantItem& item) {
  item.isStruct = true;
  while (!m_parser.Is(kCloseBrace)) {
    if (m_parser.Is(kEndOfText)) m_parser.Fail("Met EOS before read matching brace for struct within $variant block");
    ParsedType parsed = ReadTypeAndName(Naming::Required);
    ClassField& field = item.fields.emplace_back();
    field.name = std::move(parsed.name);
    field.type = std::move(parsed.type);
    if (!m_parser.Accept(kSemicolon)) {
      m_parser.Fail("; expected after type definition when read " + Printed(m_parser.current));
    }
  }
  m_parser.Advance();
  item.name = m_parser.RequireIdentifier();
}

void VariantStatement::ReadItem() {
  if (m_parser.Is(kEndOfText)) m_parser.Fail("Met EOS before read matching brace for $variant block");
  auto item = std::make_unique<VariantItem>();
  item->onHeap = m_parser.Accept(kStar);
  if (m_parser.Accept(kOpenBrace)) {
    ReadStruct(*item);
  } else {
    ParsedType parsed = ReadTypeAndName(Naming::Optional);
    item->type = std::move(parsed.type);
    item->name = std::move(parsed.name);
    item->typeText = TypeText(item->type);
    item->isVoid = IsVoid(item->type);
  }
  if (!m_parser.Is(kSemicolon)) {
    m_parser.Fail("; expected after type definition when read " + Printed(m_parser.current));
  }
  item->tag = m_def->m_items.size();
  if (item->isVoid && !item->IsNamed()) {
    if (m_def->m_hasDefault) {
      m_parser.Fail("Variant " + m_def->name + " : anonymous type 'void' incompatible with a default value");
    }
    m_def->m_hasDefault = true;
  }
  m_def->m_items.push_back(std::move(item));
  m_parser.Advance();
}

void VariantStatement::ReadBody() {
  TextWriter& out = m_parser.out;
  out << "class " << m_def->name << "\n";
  {
    Block body(out, ";");
    out << "public:\n";
    m_parser.Expect(kOpenBrace, "{");
    if (m_parser.Is("default")) ReadDefault();
    while (!m_parser.Is(kDollar) && !m_parser.Is(kDollarDollar) && !m_parser.Is(kCloseBrace)) ReadItem();
    if (m_def->m_items.empty()) m_parser.Fail(PrintedElement(*m_def) + " is empty");
    m_parser.Expect(kCloseBrace, "}");
    m_parser.RequireSemicolonAfter(*m_def);
    m_def->status = DeclStatus::Defined;
    out << "\n";
    WriteVariantBody(out, *m_def);
  }
}

void VariantStatement::CheckTextInClass() const {
  if (!m_def->m_nested || !m_parser.WantsCompilableText()) return;
  if (m_def->m_reflected) CheckNestedRecord(m_parser, *m_def);
  for (const auto& item : m_def->m_items) {
    for (const ClassField& field : item->fields) {
      if (TypeText(field.type) != m_def->name) continue;
      m_parser.WarnOfText("Item " + item->name + " of " + PrintedElement(*m_def) +
                              " has a value of it, and is complete before it: declare it in the name space",
                          *m_def);
    }
  }
}

// "default void free;" has the form of an item, and `new (this) V(void free)` is no C++.
void VariantStatement::CheckTextOfDefault() const {
  LexScanner scanner(m_default, m_parser.scanner.dialect);
  if (!m_parser.WantsCompilableText() || !NextToken(scanner).Is("void")) return;
  const LexToken item = NextToken(scanner);
  const std::string name = item.kind == kIdentifier ? item.text.Text() : "";
  m_parser.WarnOfText(
      "The default of " + PrintedElement(*m_def) + " is an item, not a value: write " +
          (name.empty() ? "void;" : "default " + name + "(); and behind it the item void " + name + ";"),
      *m_def);
}

void VariantStatement::CheckTextOfItems() const {
  if (!m_parser.WantsCompilableText() || !m_def->HasSerialise()) return;
  for (const auto& item : m_def->m_items) {
    std::vector<TypeView> types{item->type};
    for (const ClassField& field : item->fields) types.emplace_back(field.type);
    for (const TypeView type : types) {
      const NameSpaceElement* variant = VariantWithoutDefault(type, *m_def->owner.rootNameSpace);
      if (!variant) continue;
      m_parser.WarnOfText("Item " + item->EffectiveName() + " of " + PrintedElement(*m_def) +
                              " is read into no value of " + HowToGiveDefault(*variant),
                          *m_def);
    }
  }
}

void VariantStatement::Parse() {
  ReadHeading();
  if (m_parser.Is(kSemicolon)) {
    m_parser.out << "class " << m_def->name << ";\n";
    m_parser.EnterForward(std::move(m_made), m_old, m_enclosing);
    m_parser.Flush();
    return m_parser.DropBehindCurrent();
  }
  m_parser.Enter(std::move(m_made), m_enclosing);
  m_parser.CheckPublicHeader(*m_def);
  if (m_old && m_old->status == DeclStatus::Defined) m_parser.FailRepeated(*m_old, *m_def);
  if (m_parser.Is(kShiftLeft)) ReadQualifiers();
  if (m_parser.Accept(kColon)) m_parser.ParseMetadataList(m_def->metadata);
  ReadBody();
  WriteVariantTail(m_parser.out, *m_def);
  if (!m_def->m_nested) WriteTypeTraits(m_parser.out, *m_def);
  m_parser.Flush();
  m_parser.CheckReferences(*m_def);
  m_parser.CheckMetadata(*m_def);
  CheckTextInClass();
  CheckTextOfDefault();
  CheckTextOfItems();
  m_parser.DropBehindCurrent();
}

}  // namespace

void ParseVariant(QrexParser& parser, ClassDef* enclosing) { VariantStatement(parser, enclosing).Parse(); }

}  // namespace qrex
