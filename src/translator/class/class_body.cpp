// The scanner of class bodies: text is copied, `$` items are replaced.

#include <algorithm>

#include "translator/class/class_parser.h"
#include "translator/emit/emit.h"
#include "translator/file/keywords.h"

namespace qrex {

namespace {

void DealWithTextTo(QrexParser& parser, const ClassDef& def, const char* position) {
  if (def.ExternalDefinition()) {
    parser.DropTo(position);
  } else {
    parser.CopyTo(position);
  }
}

void ParseItem(QrexParser& parser, ClassDef& def) {
  DealWithTextTo(parser, def, parser.current.text.begin);
  parser.Advance();
  for (const ClassKeyword& keyword : ClassLevelKeywords()) {
    if (!parser.Is(keyword.word)) continue;
    keyword.parse(parser, def);
    if (!keyword.advancesItself) parser.Advance();
    return;
  }
  ParseFieldOrMethod(parser, def);
  parser.Advance();
}

}  // namespace

void ParseClassBody(QrexParser& parser, ClassDef& def) {
  parser.Advance();
  for (int64_t depth = 1;;) {
    if (parser.Is(kEndOfText)) parser.Fail("Met EOS before read matching brace");
    if (parser.Is(kDollar)) {
      ParseItem(parser, def);
      continue;
    }
    if (parser.Is(kDollarDollar)) {  // the token behind it is not examined
      parser.CopyToCurrent();
      parser.DropBehindCurrent();
      parser.Advance();
      parser.out << def.name;
      parser.Advance();
      continue;
    }
    if (parser.Is(kOpenBrace)) ++depth;
    if (parser.Is(kCloseBrace) && --depth == 0) return;
    if (def.ExternalDefinition()) parser.DropTo(parser.current.text.end);
    parser.Advance();
  }
}

void ParseThis(QrexParser& parser, ClassDef&) {
  parser.Advance();
  parser.out << kDollarThis;
  parser.Flush();
  parser.DropToCurrent();
}

void ParseFieldOrMethod(QrexParser& parser, ClassDef& def) {
  const char* begin = parser.current.text.begin;
  bool isField = false;
  FunctionSignature member;
  parser.ParseMethodOrAttribute(true, isField, member, false, def.m_reflected);
  if (!isField) {
    parser.DropTo(begin);  // the method's source stays, without the `$`
    if (parser.Is(kOpenBrace)) parser.SkipToMatching(kOpenBrace, kCloseBrace, "Met EOS before read matching brace");
    def.m_methods.push_back(std::move(member));
    return;
  }
  const std::string& name = member.name;
  const bool repeats =
      std::any_of(def.m_fields.begin(), def.m_fields.end(), [&](const auto& field) { return field.name == name; }) ||
      std::any_of(def.m_modelFields.begin(), def.m_modelFields.end(),
                  [&](const ModelField* field) { return field->m_name == name; });
  if (repeats) parser.Fail("Redefinition of field " + name);
  if (!parser.Is(kSemicolon)) {
    parser.Fail("; expected after field declaration when read " + Printed(parser.current));
  }
  if (!def.ExternalDefinition()) {
    PrintType(parser.out, member.returnType);
    parser.out << " " << name << ";";
    parser.Flush();
  }
  def.m_fields.push_back({name, member.returnType, FieldKind::Plain, def.m_reflected});
  parser.DropBehindCurrent();
}

const QualifierWord* FindQualifierWord(std::string_view word) {
  using Q = ClassQualifiers;
  static constexpr QualifierWord kWords[] = {
      {"dc", &Q::dc, true, false},
      {"abstract", &Q::abstract, false, false},
      {"copy", &Q::copy, true, true},
      {"compare", &Q::compare, true, true},
      {"print", &Q::print, true, true},
      {"ser", &Q::ser, true, true},
      {"os", &Q::os, false, true},
      {"ar", &Q::ar, false, true},
      {"extern", &Q::extern_, false, true},
      {"passbyvalue", &Q::passbyvalue, true, true},
      {"returnbyvalue", &Q::returnbyvalue, true, true},
      {"multiline", &Q::multiline, false, true},
      {"traits", &Q::traits, false, false},
      {"genop", &Q::genop, false, false},
      {"rod", &Q::rod, false, false},
  };
  const auto* found = std::find_if(std::begin(kWords), std::end(kWords),
                                   [&](const QualifierWord& candidate) { return candidate.word == word; });
  return found == std::end(kWords) ? nullptr : found;
}

bool ParseQualifierList(QrexParser& parser, ClassDef& def) {
  bool redundant = false;
  for (; !parser.Accept(kShiftRight); parser.Advance()) {
    const bool on = !parser.Accept(kMinus);
    if (const QualifierWord* word = FindQualifierWord(parser.current.text.View())) {
      if (!on && word->word == "dc" && def.IsPureModel()) parser.Fail("Qualifier <<-dc>> invalid for a $model");
      def.qualifiers.*word->state = on ? TriState::On : TriState::Off;
      redundant = redundant || word->needsReflection;
    } else if (parser.Is("nested")) {
      def.m_nested = true;
    } else if (parser.Is("reflect")) {
      if (on && def.m_nested) parser.Fail("Qualifier <<reflect>> invalid for a nested type");
      def.m_reflected = on;
      if (on) {
        def.m_strict = true;
      } else {
        def.m_registered = false;
      }
    } else if (parser.Is("register")) {
      if (on && def.m_nested) parser.Fail("Qualifier <<register>> invalid for a nested type");
      def.m_registered = on;
      if (on) def.m_reflected = def.m_strict = true;
    } else {
      parser.Fail("Unrecognised qualifier << " + Printed(parser.current) + " >> on " + PrintedElement(def));
    }
  }
  return redundant;
}

}  // namespace qrex
