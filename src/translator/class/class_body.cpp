#include "translator/class/class_body.h"

#include <algorithm>

#include "translator/class/text_checks.h"
#include "translator/declared/class_def.h"
#include "translator/emit/annotations.h"
#include "translator/emit/emit.h"
#include "translator/reader/qrex_parser.h"

namespace qrex {

namespace {

void DealWithTextTo(QrexParser& parser, const ClassDef& def, const char* position) {
  if (def.ExternalDefinition()) {
    parser.DropTo(position);
  } else {
    parser.CopyTo(position);
  }
}

void ParseItem(QrexParser& parser, ClassDef& def, bool isPrivate) {
  DealWithTextTo(parser, def, parser.current.text.begin);
  parser.Advance();
  for (const ClassKeyword& keyword : parser.Keywords().classLevel) {
    if (!parser.Is(keyword.word)) continue;
    keyword.parse(parser, def);
    if (keyword.endsOn == EndsOn::LastToken) parser.Advance();
    return;
  }
  const char* const begin = parser.current.text.begin;
  const size_t methods = def.m_methods.size();
  ParseFieldOrMethod(parser, def);
  if (def.m_methods.size() > methods) CheckTextOfMethod(parser, def, isPrivate, begin);
  parser.Advance();
}

// At a `(`, behind the name of the class: not so in its destructor.
bool StandsBehindConstructor(const QrexParser& parser, const ClassDef& def) {
  const TextRange name = parser.previous.text;
  return parser.Is(kOpenParen) && (name == def.name || name == "$$") && name.begin[-1] != '~';
}

}  // namespace

void ParseClassBody(QrexParser& parser, ClassDef& def) {
  parser.Advance();
  bool isPrivate = def.m_kind == ClassKind::Class && def.m_mixinBaseClass.empty();
  for (int64_t depth = 1;;) {
    if (parser.Is(kEndOfText)) parser.Fail("Met EOS before read matching brace");
    if (parser.Is(kDollar)) {
      ParseItem(parser, def, isPrivate);
      continue;
    }
    if (parser.Is(kDollarDollar)) {  // the token behind it is not examined
      parser.CopyToCurrent();
      parser.DropBehindCurrent();
      parser.Advance();
      parser.out << def.name;
      def.m_hasConstructor |= depth == 1 && StandsBehindConstructor(parser, def);
      parser.Advance();
      continue;
    }
    def.m_hasConstructor |= depth == 1 && StandsBehindConstructor(parser, def);
    if (parser.Is(kOpenBrace)) ++depth;
    if (parser.Is(kCloseBrace) && --depth == 0) return;
    if (depth == 1 && parser.Is(kColon)) {
      const TextRange word = parser.previous.text;
      if (word == "public") isPrivate = false;
      if (word == "private" || word == "protected") isPrivate = true;
    }
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
  auto [isField, member] = parser.ParseMethodOrAttribute({.constAllowed = true, .reflected = def.m_reflected});
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
    WriteAnnotations(parser.out, def, member.returnType, OutputLine::HasText);
    Write(parser.out, "$type$ $name$;", "type"_ = TypeView(member.returnType), "name"_ = name);
    parser.Flush();
  }
  def.m_fields.push_back({name, member.returnType, FieldKind::Plain, def.m_reflected});
  parser.DropBehindCurrent();
}

}  // namespace qrex
