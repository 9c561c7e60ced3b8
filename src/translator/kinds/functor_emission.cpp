#include "translator/kinds/functor_emission.h"

#include "translator/emit/byte_code.h"
#include "translator/emit/emit.h"

namespace qrex {

void WriteSelfSignature(TextWriter& out, const FunctionSignature& signature, std::string_view name) {
  Write(out, "$result$ $name$($arguments$)", "result"_ = TypeView(signature.returnType), "name"_ = name,
        "arguments"_([&] { WriteSelfAndArgDeclarations(out, "void", signature); }));
}

void WriteFunctorClass(TextWriter& out, const FunctorDef& def) {
  const FunctionSignature& signature = def.m_signature;
  FunctionSignature call = signature;
  call.name = "operator()";
  call.isInline = false;
  const bool compilable = def.WantsCompilableText();
  auto writeRecord = [&] {  // which else only the source that defines it knows
    Write(out, "$api$vesk::ReflectedFunctor const& _GetReflected($name$ const*);\n", "api"_ = ExportPrefix(def),
          "name"_ = def.name);
  };
  Write(out, R"(
    class $name$
    {
    public:
        typedef $stub$;
        $name$() : m_self(nullptr), m_stubFn(nullptr) {}
        $name$(void* _self, STUB_FN _stubFn) : m_self(_self), m_stubFn(_stubFn) {}
        $name$($name$ const& _rhs) : m_self(_rhs.m_self), m_stubFn(_rhs.m_stubFn) {}
        $name$& operator=($name$ const& _rhs) { m_self = _rhs.m_self; m_stubFn = _rhs.m_stubFn; return *this; }
        bool operator==($name$ const& _rhs) const { return m_self == _rhs.m_self && m_stubFn == _rhs.m_stubFn; }
        bool operator<($name$ const& _rhs) const { return m_self < _rhs.m_self || (m_self == _rhs.m_self && m_stubFn < _rhs.m_stubFn); }
        bool operator<=($name$ const& _rhs) const { return m_self < _rhs.m_self || (m_self == _rhs.m_self && m_stubFn <= _rhs.m_stubFn); }
        bool operator!=($name$ const& _rhs) const { return !operator==(_rhs); }
        bool operator>($name$ const& _rhs) const { return _rhs.operator<(*this); }
        bool operator>=($name$ const& _rhs) const { return _rhs.operator<=(*this); }
        typedef void ($name$::*bool_type)() const;
        void bool_type_mem_fn() const {}
        operator bool_type() const { return m_stubFn ? &$name$::bool_type_mem_fn : 0; }
        $name$& operator=(vesk::NullInterface) { m_self = nullptr; m_stubFn = nullptr; return *this; }
        $call$ { $check$$return$m_stubFn(m_self$comma$$arguments$); }
        void write(vesk::xostream& os) const { os << "$name$(" << m_self << ',' << (void*)m_stubFn << ')'; }
    private:
        void* m_self;
        STUB_FN m_stubFn;
    };
    $friend$inline vesk::xostream& operator<<(vesk::xostream& os, $name$ f) { f.write(os); return os; }
    $record$
  )",
        "friend"_ = If(def.m_nested && compilable, "friend "), "name"_ = def.name,
        "stub"_([&] { WriteSelfSignature(out, signature, "(__stdcall *STUB_FN)"); }),
        "call"_([&] { WriteSignature(out, call); }),
        "check"_ = If(compilable, "if (!m_stubFn) throw std::logic_error(\"call of a null " + def.name + "\"); "),
        "return"_([&] { WriteReturn(out, signature.returnType); }), "comma"_ = signature.arguments.empty() ? "" : ",",
        "arguments"_([&] { WriteArgNames(out, signature.arguments); }),
        "record"_ = If(compilable && def.m_reflected && !def.m_nested, writeRecord));
}

void FunctorDef::WriteReflectedDefinition(TextWriter& out) {
  StringTable strings;
  Write(out, R"(
    $api$vesk::ReflectedFunctor const& _GetReflected($name$ const*)
    {
        $arrays$
        $strings$
        static const vesk::ReflectedFunctor $name$_functor =
        {
            $rows$
        };
        return $name$_functor;
    }
  )",
        "api"_ = ExportPrefix(*this), "name"_ = name,
        "arrays"_([&] { WriteSignatureArrays(out, name, m_signature, strings); }),
        "strings"_([&] { WriteStringTable(out, strings, name); }),
        "rows"_([&] { WriteSignatureRows(out, *this, m_signature, strings); }));
}

}  // namespace qrex
