// Reading a model block: fields, constructors, and the schema with its evolution. What the block says is checked here,
// so that the generated `Deserialise` can read the archives of every earlier release.

#include <algorithm>

#include "lex/cpp_literals.h"
#include "translator/emit/emit.h"
#include "translator/model/model.h"
#include "translator/reader/code_block.h"
#include "translator/reader/qrex_parser.h"
#include "translator/reader/qualifiers.h"

namespace qrex {

namespace {

class ModelBlock {
 public:
  ModelBlock(QrexParser& parser, ClassDef& def, Expansion expansion)
      : m_parser(parser), m_def(def), m_expansion(expansion) {}
  void Parse();

 private:
  struct Evolution {
    bool named = false;         // the field has an entry
    std::vector<size_t> reads;  // the arguments of its code, by index among all fields
  };

  void ParseFields(bool dropped);
  void CheckField(const ModelField& field, bool dropped);
  void ParseConstructors();
  void FinishWithoutSchema();
  void ParseDropped();
  void ParseSchema();
  void ParseRelease(int64_t& previous);
  void ParseDrop(int64_t release);
  void ParseAdd(int64_t release);
  void CheckSchema();
  void ParseEvolve();
  void ParseEvolveEntry(std::vector<Evolution>& evolutions);
  void ParseEvolveArguments(ModelField& field, Evolution& evolution);
  void CheckRedundantEvolution(const std::vector<Evolution>& evolutions);

  std::vector<std::unique_ptr<ModelField>>& Fields() { return m_def.m_currentThenDroppedModelFields; }
  size_t IndexOf(std::string_view name) const;  // among all fields; their number when there is none
  bool IsFirst(const ModelField& field) const { return field.m_rsnAdded == m_def.m_firstRsn; }

  QrexParser& m_parser;
  ClassDef& m_def;
  const Expansion m_expansion;
  size_t m_reached = 0;  // see ExpansionFault
};

size_t ModelBlock::IndexOf(std::string_view name) const {
  const auto& fields = m_def.m_currentThenDroppedModelFields;
  auto found = std::find_if(fields.begin(), fields.end(), [&](const auto& field) { return field->m_name == name; });
  return static_cast<size_t>(found - fields.begin());
}

void ModelBlock::Parse() {
  if (m_parser.Accept(kShiftLeft)) ParseQualifierList(m_parser, m_def);
  m_parser.Expect(kOpenBrace, "{");
  ParseFields(false);
  m_def.m_numCurrentModelFields = Fields().size();
  ParseConstructors();
  if (!m_parser.Is(kDollar)) return FinishWithoutSchema();

  m_parser.Advance();
  if (m_parser.Is("dropped")) {
    ParseDropped();
  } else if (!m_parser.Is("schema")) {
    m_parser.Fail("$dropped or $schema expected when read $" + Printed(m_parser.current));
  }
  ParseSchema();
  if (m_parser.Accept(kDollar)) {
    if (!m_parser.Is("evolve")) m_parser.Fail("$evolve expected when read $" + Printed(m_parser.current));
    ParseEvolve();
  }
  if (!m_parser.Is(kCloseBrace)) m_parser.FailExpected("}");
}

void ModelBlock::FinishWithoutSchema() {
  for (const auto& field : Fields()) {
    field->m_rsnAdded = 0;
    m_def.m_modelFields.push_back(field.get());
  }
  m_def.m_numModelSchema = 1;
  if (!m_parser.Is(kCloseBrace)) m_parser.FailExpected("}");
}

void ModelBlock::ParseFields(bool dropped) {
  const bool strict = m_def.m_reflected || m_def.IsMixin();
  while (!m_parser.Is(kDollar) && !m_parser.Is(kDollarDollar) && !m_parser.Is(kCloseBrace) &&
         !m_parser.Is("explicit")) {
    if (m_parser.Is(kEndOfText)) m_parser.Fail("Met EOS before read matching brace for $model block");
    std::optional<ParsedType> parsed = m_parser.ParseTypeWithName(Naming::Required, strict);
    if (!parsed) m_parser.FailExpected("identifier");
    auto field = std::make_unique<ModelField>();
    field->m_name = std::move(parsed->name);
    field->m_type = std::move(parsed->type);
    if (!m_parser.Is(kSemicolon)) {
      m_parser.Fail("; expected after field declaration when read " + Printed(m_parser.current));
    }
    CheckField(*field, dropped);
    Fields().push_back(std::move(field));
    m_parser.Advance();
  }
}

void ModelBlock::CheckField(const ModelField& field, bool dropped) {
  const bool repeats =
      IndexOf(field.m_name) < Fields().size() ||
      std::any_of(m_def.m_fields.begin(), m_def.m_fields.end(), [&](const auto& f) { return f.name == field.m_name; });
  if (repeats) m_parser.Fail("Repeated field name " + field.m_name);
  TypeContext context;
  context.isMutable = true;
  context.inModel = true;
  context.serialisable = m_def.m_implementsIPersistable;
  const std::string_view fault = TypeFault(field.m_type, m_parser.Root(), context);
  if (!fault.empty()) m_parser.Fail(std::string(fault));
  if (dropped) return;  // it has no accessors
  const std::string message = ExpansionFault(field.m_type, m_parser.Root(), m_expansion, &m_def, &m_reached);
  if (!message.empty()) m_parser.Fail("Field " + field.m_name + " : " + message);
}

void ModelBlock::ParseConstructors() {
  while (m_parser.Is("explicit") || m_parser.Is(kDollarDollar)) {
    if (m_parser.AcceptWord("explicit")) {
      m_parser.out << "explicit ";
      if (!m_parser.Is(kDollarDollar)) m_parser.FailExpected("$$");
    }
    m_parser.Advance();
    m_parser.out << m_def.ModelStructName();
    m_parser.Flush();
    m_parser.DropToCurrent();
    m_parser.Expect(kOpenParen, "(");
    if (m_parser.Is(kCloseParen)) m_def.m_haveModelDefaultCtor = true;
    while (!m_parser.Is(kOpenBrace)) {
      if (m_parser.Is(kEndOfText)) m_parser.Fail("Met EOS while scanning for '{'");
      m_parser.Advance();
    }
    m_parser.SkipToMatching(kOpenBrace, kCloseBrace, "Met EOS before read matching brace for $model block");
    m_parser.CopyTo(m_parser.current.text.end);
    m_parser.out << "\n";
    m_parser.Advance();
  }
}

void ModelBlock::ParseDropped() {
  m_parser.Advance();
  m_parser.Expect(kOpenBrace, "{");
  ParseFields(true);
  m_parser.Expect(kCloseBrace, "}");
  if (!m_parser.Is(kDollar)) m_parser.FailExpected("$schema");
  m_parser.Advance();
  if (!m_parser.Is("schema")) m_parser.Fail("$schema expected when read $" + Printed(m_parser.current));
}

// --- $schema

void ModelBlock::ParseSchema() {
  m_def.m_schemaPosition = m_parser.stream.SourcePosition(m_parser.current.text.begin);
  m_parser.Advance();
  m_parser.Expect(kOpenBrace, "{");
  for (int64_t previous = -1; !m_parser.Is(kCloseBrace);) {
    if (m_parser.Is(kEndOfText)) m_parser.Fail("Met EOS before read matching brace for $schema block");
    ParseRelease(previous);
  }
  CheckSchema();
  m_parser.Advance();
}

void ModelBlock::ParseRelease(int64_t& previous) {
  if (!m_parser.Is(kDecimal) && !m_parser.Is(kHex)) {
    m_parser.Fail("Release number expected when read " + Printed(m_parser.current));
  }
  const uint64_t value = IntegerValue(m_parser.current, m_parser.scanner.dialect);
  const int64_t release = static_cast<int32_t>(value);
  if (release <= previous) {
    m_parser.Fail("Unexpected release number " + std::to_string(release) + " (must strictly increase)");
  }
  if (m_def.m_numModelSchema == 0) m_def.m_firstRsn = release;
  m_parser.Advance();
  m_parser.Expect(kColon, ":");
  if (!m_parser.Is(kMinus) && !m_parser.Is(kPlus)) m_parser.Fail("No schema changes specified");
  while (m_parser.Accept(kMinus)) ParseDrop(release);
  while (m_parser.Accept(kPlus)) ParseAdd(release);
  if (m_parser.Is(kMinus)) {
    m_parser.Fail(
        "Syntax error: unexpected '-' : note that dropped fields must appear before added fields within a schema");
  }
  ++m_def.m_numModelSchema;
  previous = release;
}

void ModelBlock::ParseDrop(int64_t release) {
  if (!m_parser.Is(kIdentifier)) m_parser.FailExpected("field identifier");
  const size_t index = IndexOf(m_parser.current.text.View());
  const std::string name = m_parser.current.text.Text();
  if (index == Fields().size() || index < m_def.m_numCurrentModelFields) {
    m_parser.Fail("Field " + name + " not declared as dropped");
  }
  ModelField& field = *Fields()[index];
  if (field.m_rsnAdded < 0) {
    m_parser.Fail("Field " + name + " can't be dropped from the schema until it has been added");
  }
  if (field.IsDropped()) m_parser.Fail("Field " + name + " already dropped in the schema");
  field.m_rsnDropped = release;
  m_parser.Advance();
}

void ModelBlock::ParseAdd(int64_t release) {
  if (!m_parser.Is(kIdentifier)) m_parser.FailExpected("field identifier");
  const std::string name = m_parser.current.text.Text();
  const size_t index = IndexOf(name);
  if (index == Fields().size()) m_parser.Fail("Field " + name + " not declared in the model");
  ModelField& field = *Fields()[index];
  if (field.m_rsnAdded >= 0) m_parser.Fail("Field " + name + " already added in the schema");
  field.m_rsnAdded = release;
  m_def.m_modelFields.push_back(&field);
  m_parser.Advance();
}

void ModelBlock::CheckSchema() {
  for (size_t i = 0; i < Fields().size(); ++i) {
    const ModelField& field = *Fields()[i];
    if (field.m_rsnAdded < 0) m_parser.Fail("Field " + field.m_name + " never added in a schema");
    if (i >= m_def.m_numCurrentModelFields && !field.IsDropped()) {
      m_parser.Fail("Field " + field.m_name + " never dropped in a schema");
    }
  }
}

// --- $evolve

void ModelBlock::ParseEvolve() {
  m_parser.Advance();
  m_parser.Expect(kOpenBrace, "{");
  std::vector<Evolution> evolutions(Fields().size());
  while (!m_parser.Is(kCloseBrace)) ParseEvolveEntry(evolutions);
  CheckRedundantEvolution(evolutions);
  m_parser.Advance();
}

void ModelBlock::ParseEvolveEntry(std::vector<Evolution>& evolutions) {
  constexpr std::string_view kAtEnd = "Met EOS before read matching brace for $evolve block";
  if (m_parser.Is(kEndOfText)) m_parser.Fail(std::string(kAtEnd));
  if (!m_parser.Is(kIdentifier)) m_parser.FailExpected("field identifier");
  const std::string name = m_parser.current.text.Text();
  const size_t index = IndexOf(name);
  if (index == Fields().size()) m_parser.Fail("Field " + name + " not declared in the model");
  ModelField& field = *Fields()[index];
  if (IsFirst(field)) m_parser.Fail("Can't initialise field " + name + " that appeared in the first schema");
  if (!field.m_evolveCode.empty()) m_parser.Fail("Repeated initialisation code for field " + name);
  evolutions[index].named = true;
  m_parser.Advance();
  if (m_parser.Accept(kOpenParen)) ParseEvolveArguments(field, evolutions[index]);

  if (!m_parser.Is(kOpenBrace)) m_parser.FailExpected("{");
  LexScanner code(TextRange(m_parser.current.text.end, nullptr));
  m_parser.SkipToMatching(kOpenBrace, kCloseBrace, kAtEnd);
  code.end = m_parser.current.text.begin;
  // A line comment at the end would swallow the bracket that is written behind the code.
  const char* lastToken = m_parser.previous.text.end;
  if (std::string_view(lastToken, code.end).find("//") != std::string_view::npos) code.end = lastToken;
  SkipWhiteSpace(code);
  while (!code.Empty() && (code.end[-1] == ' ' || (code.end[-1] >= 9 && code.end[-1] <= 13))) --code.end;
  field.m_evolveCode = MarkedText(m_parser, code.begin, code.end);
  if (!field.m_evolveCode.empty()) field.m_evolveCode += m_parser.EndMark();
  m_parser.Advance();
}

// The current token is behind the `(`, afterwards behind the `)`.
void ModelBlock::ParseEvolveArguments(ModelField& field, Evolution& evolution) {
  if (m_parser.Accept(kCloseParen)) return;
  for (;;) {
    if (m_parser.Is(kEndOfText)) m_parser.Fail("Met EOS in middle of arg list");
    if (!m_parser.Is(kIdentifier)) m_parser.FailExpected("identifier");
    const std::string name = m_parser.current.text.Text();
    auto& ordered = m_def.m_modelFields;
    auto found = std::find_if(ordered.begin(), ordered.end(), [&](const ModelField* f) { return f->m_name == name; });
    if (found == ordered.end()) m_parser.Fail("Field " + name + " not declared in the model");
    const ModelField& argument = **found;
    const bool isGone = argument.IsDropped() && argument.m_rsnDropped < field.m_rsnAdded;
    if (argument.m_rsnAdded >= field.m_rsnAdded || isGone) {
      m_parser.Fail("Field " + name + " not available in the schema just before " + field.m_name + " was added");
    }
    evolution.reads.push_back(IndexOf(name));
    field.m_evolveArgs.push_back(static_cast<size_t>(found - ordered.begin()));
    m_parser.Advance();
    if (m_parser.Accept(kCloseParen)) return;
    if (m_parser.Is(kEndOfText)) m_parser.Fail("Met EOS in middle of arg list");
    if (!m_parser.Accept(kComma)) {
      m_parser.Fail("Syntax error in dependency arg list : " + Printed(m_parser.current));
    }
  }
}

// Code is needed for a current field that was added late, and for what such code reads, directly or through others.
void ModelBlock::CheckRedundantEvolution(const std::vector<Evolution>& evolutions) {
  std::vector<bool> needed(Fields().size());
  std::vector<size_t> pending;
  auto need = [&](size_t index) {
    if (needed[index] || IsFirst(*Fields()[index])) return;
    needed[index] = true;
    pending.push_back(index);
  };
  for (size_t i = 0; i < m_def.m_numCurrentModelFields; ++i) need(i);
  while (!pending.empty()) {
    const size_t index = pending.back();
    pending.pop_back();
    for (size_t read : evolutions[index].reads) need(read);
  }
  for (size_t i = 0; i < Fields().size(); ++i) {
    if (evolutions[i].named && !needed[i]) {
      m_parser.Fail("Redundant initialisation of field " + Fields()[i]->m_name);
    }
  }
}

}  // namespace

void ParseModelBlock(QrexParser& parser, ClassDef& def, Expansion expansion) {
  ModelBlock(parser, def, expansion).Parse();
}

}  // namespace qrex
