#include "translator/kinds/functor_def.h"

#include "translator/emit/byte_code.h"
#include "translator/emit/emit.h"
#include "translator/emit/records.h"

namespace qrex {

void FunctorDef::CollectReferences(std::vector<const NameSpaceElement*>& out) const {
  CollectNamedTypes(signature, *owner.rootNameSpace, out);
}

namespace {

void WriteSelfSignature(TextWriter& out, const FunctionSignature& signature, std::string_view name) {
  PrintType(out, signature.returnType);
  out << " " << name << "(";
  WriteSelfAndArgDeclarations(out, "void", signature);
  out << ")";
}

// "public:" and "private:" stand to the left of the members.
void WriteAccess(TextWriter& out, std::string_view access) {
  IndentScope outdent(out, -4);
  out << access << ":\n";
}

void WriteFunctorClass(TextWriter& out, const FunctorDef& def) {
  const FunctionSignature& signature = def.signature;
  out << "class " << def.name << "\n";
  {
    Block body(out, ";");
    WriteAccess(out, "public");
    out << "typedef ";
    WriteSelfSignature(out, signature, "(__stdcall *STUB_FN)");
    out << ";\n";
    WriteText(out,
              "$0() : m_self(nullptr), m_stubFn(nullptr) {}\n"
              "$0(void* _self, STUB_FN _stubFn) : m_self(_self), m_stubFn(_stubFn) {}\n"
              "$0($0 const& _rhs) : m_self(_rhs.m_self), m_stubFn(_rhs.m_stubFn) {}\n"
              "$0& operator=($0 const& _rhs) { m_self = _rhs.m_self; m_stubFn = _rhs.m_stubFn; return *this; }\n"
              "bool operator==($0 const& _rhs) const { return m_self == _rhs.m_self && m_stubFn == _rhs.m_stubFn; }\n"
              "bool operator<($0 const& _rhs) const { return m_self < _rhs.m_self || (m_self == _rhs.m_self && "
              "m_stubFn < _rhs.m_stubFn); }\n"
              "bool operator<=($0 const& _rhs) const { return m_self < _rhs.m_self || (m_self == _rhs.m_self && "
              "m_stubFn <= _rhs.m_stubFn); }\n"
              "bool operator!=($0 const& _rhs) const { return !operator==(_rhs); }\n"
              "bool operator>($0 const& _rhs) const { return _rhs.operator<(*this); }\n"
              "bool operator>=($0 const& _rhs) const { return _rhs.operator<=(*this); }\n"
              "typedef void ($0::*bool_type)() const;\n"
              "void bool_type_mem_fn() const {}\n"
              "operator bool_type() const { return m_stubFn ? &$0::bool_type_mem_fn : 0; }\n"
              "$0& operator=(vesk::NullInterface) { m_self = nullptr; m_stubFn = nullptr; return *this; }\n",
              {def.name});
    FunctionSignature call = signature;
    call.name = "operator()";
    call.isInline = false;
    WriteSignature(out, call);
    out << " { ";
    WriteReturn(out, signature.returnType);
    out << "m_stubFn(m_self" << (signature.arguments.empty() ? "" : ",");
    WriteArgNames(out, signature.arguments);
    out << "); }\n";
    WriteText(out,
              "void write(vesk::xostream& os) const { os << \"$0(\" << m_self << ',' << (void*)m_stubFn << ')'; }\n",
              {def.name});
    WriteAccess(out, "private");
    out << "void* m_self;\nSTUB_FN m_stubFn;\n";
  }
  WriteText(out, "inline vesk::xostream& operator<<(vesk::xostream& os, $0 f) { f.write(os); return os; }\n",
            {def.name});
}

}  // namespace

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
  parser.ParseFunctionSignature(def.signature, false, false, false, def.m_reflected);
  def.name = def.signature.name;
  def.metadata = def.signature.metadata;
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

  const FunctionSignature& Signature() const { return m_functor->signature; }

  void WriteStaticDelegate() {
    m_out << "static ";
    WriteSelfSignature(m_out, Signature(), "__stdcall static_delegate");
    m_out << "\n";
  }

  void WritePlain() {
    m_out << "struct " << m_name << "_delegator\n";
    {
      Block body(m_out, ";");
      WriteStaticDelegate();
      Block code(m_out);
      m_out << m_body << "\n";
    }
    WriteText(m_out, "\n$0 $1(NULL,$1_delegator::static_delegate);", {m_functor->GetQualifiedName(), m_name});
  }

  void WriteBound() {
    m_out << "struct " << m_name << "_delegator : public " << m_base << "\n";
    {
      Block body(m_out, ";");
      PrintType(m_out, Signature().returnType);
      m_out << " member_delegate(";
      WriteArgDeclarations(m_out, Signature().arguments);
      m_out << ")" << (Signature().isConst ? " const" : "") << (m_isConst ? " const" : "") << "\n";
      {
        Block code(m_out);
        m_out << m_body << "\n";
      }
      WriteStaticDelegate();
      Block code(m_out);
      WriteReturn(m_out, Signature().returnType);
      m_out << "static_cast<" << m_name << "_delegator*>(_self)->member_delegate(";
      WriteArgNames(m_out, Signature().arguments);
      m_out << ");\n";
    }
    const std::string object = m_isConst ? "const_cast<" + m_base + "*>(" + m_object + ")" : m_object;
    WriteText(m_out, "\n$0 $1($2,$1_delegator::static_delegate);", {m_functor->GetQualifiedName(), m_name, object});
  }

  QrexParser& m_parser;
  TextWriter& m_out;
  bool m_isConst = false;
  const FunctorDef* m_functor = nullptr;
  std::string m_name, m_object, m_base, m_body;
};

}  // namespace

void ParseMakeFunctor(QrexParser& parser) { MakeFunctor(parser).Parse(); }

void FunctorDef::WriteReflectedDefinition(TextWriter& out) {
  out << ExportPrefix(*this) << "vesk::ReflectedFunctor const& _GetReflected(" << name << " const*)\n";
  Block body(out);
  StringTable strings;
  WriteSignatureArrays(out, name, signature, strings);
  WriteStringTable(out, strings, name);
  out << "static const vesk::ReflectedFunctor " << name << "_functor =\n";
  {
    Block record(out, ";");
    WriteSignatureRows(out, *this, signature, strings);
  }
  out << "return " << name << "_functor;\n";
}

}  // namespace qrex
