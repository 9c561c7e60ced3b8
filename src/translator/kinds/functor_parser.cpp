#include "translator/kinds/functor_parser.h"

#include "translator/emit/emit.h"
#include "translator/emit/records.h"
#include "translator/kinds/functor_def.h"
#include "translator/kinds/functor_emission.h"
#include "translator/kinds/type_registration.h"
#include "translator/reader/qrex_parser.h"

namespace qrex {

void ParseFunctor(QrexParser& parser, bool nested) {
  parser.Advance();
  auto made = std::make_unique<FunctorDef>(parser.file, parser.SourcePosition());
  FunctorDef& def = *made;
  def.parent = &parser.Current();
  def.m_nested = nested;
  parser.ParseExportModifier(def);
  if (parser.Is(kShiftLeft)) {
    parser.ParseQualifiers(def);
    parser.CheckRedundant(def);
  }
  def.m_signature = parser.ParseFunctionSignature({.reflected = def.m_reflected});
  def.name = def.m_signature.name;
  def.metadata = def.m_signature.metadata;
  if (NameSpaceElement* found = parser.Current().Lookup(def.name)) parser.FailConflict("functor", def.name, *found);
  def.ForgetQualifiedName();
  parser.Current().Add(std::move(made));
  parser.CheckPublicHeader(def);
  parser.DropToCurrent();
  parser.RequireSemicolonAfter(def);
  WriteFunctorClass(parser.out, def);
  if (!def.m_nested) WriteTypeTraits(parser.out, def);
  parser.Flush();
  parser.CheckReferences(def);
  parser.CheckMetadata(def);
  if (def.m_nested && def.m_reflected) CheckNestedRecord(parser, def);
}

// --- Instances

namespace {

// One $makefunctor or $makeconstfunctor: NAME INSTANCE [(object, base)] { body }.
class MakeFunctor {
 public:
  explicit MakeFunctor(QrexParser& parser) : m_parser(parser), m_out(parser.out) {}

  void Parse() {
    m_isConst = m_parser.Is("makeconstfunctor");
    m_parser.Advance();
    const NameSpaceElement& element = m_parser.ParseQualifiedId();
    if (element.category != Category::Functor) m_parser.FailExpected("functor identifier");
    m_functor = static_cast<const FunctorDef*>(&element);
    m_name = m_parser.RequireIdentifier();
    const bool isBound = m_parser.Is(kOpenParen);
    if (isBound) ReadBinding();
    if (!m_parser.Is(kOpenBrace)) m_parser.FailExpected("{");
    ReadBody();
    if (isBound) {
      WriteBound();
    } else {
      WritePlain();
    }
    m_parser.Flush();
    m_parser.DropBehindCurrent();
  }

 private:
  void ReadBinding() {
    m_object = m_parser.ReadArgumentText();
    if (!m_parser.Is(kComma)) m_parser.FailExpected(",");
    m_base = m_parser.ReadArgumentText();
    m_parser.Expect(kCloseParen, ")");
  }

  // The indentation of the body's first line is taken from each of its lines.
  void ReadBody() {
    const char* begin = m_parser.current.text.end;
    m_parser.SkipToMatching(kOpenBrace, kCloseBrace, "Met EOS before read matching brace");
    const char* const end = m_parser.current.text.begin;
    int indent = 0;
    for (; begin < end && (*begin == ' ' || *begin == '\t' || *begin == '\n'); ++begin) {
      indent = *begin == '\n' ? 0 : indent + (*begin == '\t' ? 4 : 1);
    }
    const char* last = end;
    while (last > begin && (last[-1] == ' ' || (last[-1] >= 9 && last[-1] <= 13))) --last;
    for (const char* at = begin; at < last; ++at) {
      m_body += *at;
      if (*at != '\n') continue;
      for (int column = 0; column < indent && at + 1 < last && (at[1] == ' ' || at[1] == '\t'); ++at) {
        column += at[1] == '\t' ? 4 : 1;
      }
    }
  }

  const FunctionSignature& Signature() const { return m_functor->m_signature; }

  void WriteDelegate() { WriteSelfSignature(m_out, Signature(), "__stdcall static_delegate"); }
  void WriteBody() { m_out << m_body << "\n"; }

  void WritePlain() {
    Write(m_out, R"(
      struct $name$_delegator
      {
          static $delegate$
          {
              $body$
          }
      };

      $functor$ $name$(NULL,$name$_delegator::static_delegate);)",
          "name"_ = m_name, "delegate"_([&] { WriteDelegate(); }), "body"_([&] { WriteBody(); }),
          "functor"_ = m_functor->GetQualifiedName());
  }

  void WriteBound() {
    Write(m_out, R"(
      struct $name$_delegator : public $base$
      {
          $result$ member_delegate($parameters$)$methodConst$$const$
          {
              $body$
          }
          static $delegate$
          {
              $return$static_cast<$name$_delegator*>(_self)->member_delegate($arguments$);
          }
      };

      $functor$ $name$($object$,$name$_delegator::static_delegate);)",
          "name"_ = m_name, "base"_ = m_base, "result"_ = TypeView(Signature().returnType),
          "parameters"_([&] { WriteArgDeclarations(m_out, Signature().arguments); }),
          "methodConst"_ = Signature().isConst ? " const" : "", "const"_ = m_isConst ? " const" : "",
          "body"_([&] { WriteBody(); }), "delegate"_([&] { WriteDelegate(); }),
          "return"_([&] { WriteReturn(m_out, Signature().returnType); }),
          "arguments"_([&] { WriteArgNames(m_out, Signature().arguments); }),
          "functor"_ = m_functor->GetQualifiedName(),
          "object"_ = m_isConst ? "const_cast<" + m_base + "*>(" + m_object + ")" : m_object);
  }

  QrexParser& m_parser;
  TextWriter& m_out;
  bool m_isConst = false;
  const FunctorDef* m_functor = nullptr;
  std::string m_name, m_object, m_base, m_body;
};

}  // namespace

void ParseMakeFunctor(QrexParser& parser) { MakeFunctor(parser).Parse(); }

}  // namespace qrex
