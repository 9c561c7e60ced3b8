#include "translator/kinds/functor_emission.h"

#include "translator/emit/byte_code.h"
#include "translator/emit/emit.h"

namespace qrex {

void WriteSelfSignature(TextWriter& out, const FunctionSignature& signature, std::string_view name) {
  PrintType(out, signature.returnType);
  out << " " << name << "(";
  WriteSelfAndArgDeclarations(out, "void", signature);
  out << ")";
}

namespace {

// "public:" and "private:" are outdented by one level.
void WriteAccess(TextWriter& out, std::string_view access) {
  IndentScope outdent(out, -4);
  out << access << ":\n";
}

}  // namespace

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
