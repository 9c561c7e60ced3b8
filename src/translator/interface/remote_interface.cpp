// Remote interfaces: the stub that marshals each call into an archive, and the skeleton (rmi) or scion (ipc) that
// unmarshals a message and calls the object. Values travel in declared order, filtered by direction: the stub's `<<`
// chain is the thunk's `>>` chain, and the thunk's answer is what the stub's Result_ function reads.

#include "translator/interface/remote_interface.h"

#include <algorithm>

#include "translator/emit/emit.h"
#include "translator/symbols/scanned_file.h"

namespace qrex {

namespace {

bool ComesBack(const FunctionArg& arg) {
  return arg.direction == ArgDirection::Out || arg.direction == ArgDirection::InOut;
}

size_t CountResults(const FunctionSignature& method) {
  size_t count = 0;
  for (const FunctionArg& arg : method.arguments) count += ComesBack(arg);
  return count;
}

TypeView WithoutLeading(TypeView type, std::initializer_list<TypeOp> ops) {
  type = type.WithoutMetadata();
  while (std::find(ops.begin(), ops.end(), type.Op()) != ops.end()) type = type.Inner().WithoutMetadata();
  return type;
}

class RemoteText {
 public:
  RemoteText(TextWriter& out, const InterfaceDef& interface)
      : m_out(out),
        m_interface(interface),
        m_name(interface.name),
        m_count(std::to_string(interface.m_methods.size())) {}

  void WriteStub();
  void WriteServer();  // skeleton or scion

 private:
  void WriteStubMethod(const FunctionSignature& method, size_t index);
  void WriteResultFunction(const FunctionSignature& method);
  void WriteThunk(const FunctionSignature& method, size_t index);
  void WriteThunkTable(std::string_view kind);
  void WriteFactory(std::string_view kind);

  // " << name" or " >> name" of the values that go out with the call.
  void WriteOutgoing(const FunctionSignature& method, std::string_view op) {
    for (const FunctionArg& arg : method.arguments) {
      if (arg.direction == ArgDirection::Copy)
        m_out << op << "*" << arg.name;
      else if (arg.direction != ArgDirection::Out)
        m_out << op << arg.name;
    }
  }

  TextWriter& m_out;
  const InterfaceDef& m_interface;
  const std::string& m_name;
  const std::string m_count;
};

void RemoteText::WriteResultFunction(const FunctionSignature& method) {
  m_out << "static void Result_" << method.name
        << (m_interface.m_isRmi ? "(vesk::InputArchive& _ar, void** _p)\n" : "(vesk::Archive& _ar, void** _p)\n");
  Block body(m_out);
  for (const FunctionArg& arg : method.arguments) {
    if (ComesBack(arg)) m_out << "_ar >> *(" << TypeText(WithoutLeading(arg.type, {kOpReference})) << "*) *_p++;\n";
  }
}

void RemoteText::WriteStubMethod(const FunctionSignature& method, size_t index) {
  const size_t results = CountResults(method);
  if (results > 0) WriteResultFunction(method);
  m_out << "void " << method.name << "(";
  WriteArgDeclarations(m_out, method.arguments);
  m_out << (method.isConst ? ") const\n" : ")\n");
  Block body(m_out);
  if (results > 0) {
    WriteText(m_out,
              "vesk::QueuedResponse<$0>* qr__ = new vesk::QueuedResponse<$0>;\n"
              "qr__->m_fn = &Result_$1;\n",
              {std::to_string(results), method.name});
    size_t number = 0;
    for (const FunctionArg& arg : method.arguments) {
      if (ComesBack(arg)) m_out << "qr__->m_outparams[" << number++ << "] = &" << arg.name << ";\n";
    }
  }
  m_out << "StubBegin(" << index << "," << (results > 0 ? "qr__" : "NULL") << ")";
  WriteOutgoing(method, " << ");
  m_out << ";\nStubEnd();\n";
}

void RemoteText::WriteFactory(std::string_view kind) {
  WriteText(m_out,
            "struct $0$1Factory : public vesk::I$0Factory\n"
            "{\n"
            "    $0$1Factory()\n"
            "    {\n"
            "        vesk::Register$0(vesk::GetIpcInterfaceName<$1>(),this);\n"
            "    }\n"
            "    ~$0$1Factory()\n"
            "    {\n"
            "        vesk::Unregister$0(vesk::GetIpcInterfaceName<$1>());\n"
            "    }\n"
            "    virtual vesk::$0* Create$0()\n"
            "    {\n"
            "        return new $0$1;\n"
            "    }\n"
            "};\n"
            "void _Register_$0$1()\n"
            "{\n"
            "    static $0$1Factory s;\n"
            "}\n",
            {kind, m_name});
  std::string scope = m_interface.parent->GetQualifiedName();
  if (!scope.empty()) scope += "::";
  m_interface.owner.registerNames.push_back(scope + std::string(kind) + m_name);
}

void RemoteText::WriteStub() {
  WriteText(m_out, "struct Stub$0 : vesk::Stub\n{\n", {m_name});
  {
    IndentScope indent(m_out, 4);
    WriteText(m_out, "Stub$0() : Stub(vesk::ptr<$0>(this),$1) {}\n", {m_name, m_count});
    for (size_t i = 0; i < m_interface.m_methods.size(); ++i) WriteStubMethod(m_interface.m_methods[i], i);
  }
  m_out << "};\n";
  WriteFactory("Stub");
}

void RemoteText::WriteThunk(const FunctionSignature& method, size_t index) {
  m_out << "void Thunk" << index << "()\n";
  Block body(m_out);
  if (method.arguments.empty()) {
    m_out << "Pop();\n";
  } else {
    for (const FunctionArg& arg : method.arguments) {
      const TypeView type = WithoutLeading(arg.type, {kOpReference, kOpConst});
      if (arg.direction == ArgDirection::Copy) {
        WriteText(m_out, "std::auto_ptr<$0> $1(new $0);\n", {TypeText(type.Inner()), arg.name});
      } else {
        PrintDeclaration(m_out, type, arg.name, DeclarationMode::Plain);
        m_out << ";\n";
      }
    }
    m_out << "auto _ar = Pop(); _ar";
    WriteOutgoing(method, " >> ");
    m_out << ";\n";
  }
  m_out << "Invoke()->" << method.name << "(";
  for (const FunctionArg& arg : method.arguments) {
    m_out << (&arg == &method.arguments.front() ? "" : ",") << arg.name
          << (arg.direction == ArgDirection::Copy ? ".release()" : "");
  }
  m_out << ");\n";
  if (CountResults(method) == 0) return;
  m_out << "Push()";
  for (const FunctionArg& arg : method.arguments) {
    if (ComesBack(arg)) m_out << " << " << arg.name;
  }
  m_out << ";\n";
}

void RemoteText::WriteThunkTable(std::string_view kind) {
  for (size_t i = 0; i < m_interface.m_methods.size(); ++i) {
    WriteText(m_out, "static void sThunk$0(void* _self) { (($1$2*)_self)->Thunk$0(); }\n",
              {std::to_string(i), kind, m_name});
  }
  WriteText(m_out, "static const vesk::$0ThunkFn* Get$0ThunkFnTable()\n", {kind});
  Block body(m_out);
  WriteText(m_out, "static const vesk::$0ThunkFn t[] =\n", {kind});
  {
    Block rows(m_out, ";");
    for (size_t i = 0; i < m_interface.m_methods.size(); ++i) m_out << "&sThunk" << i << ",\n";
  }
  m_out << "return t;\n";
}

void RemoteText::WriteServer() {
  const std::string_view kind = m_interface.m_isRmi ? "Skeleton" : "Scion";
  WriteText(m_out, "struct $0$1 : vesk::$0\n{\n", {kind, m_name});
  {
    IndentScope indent(m_out, 4);
    WriteText(m_out, "$0$1() : vesk::$0(Get$0ThunkFnTable(),$2) {}\n", {kind, m_name, m_count});
    WriteText(m_out,
              m_interface.m_isRmi ? "vesk::ptr<$0> Invoke()\n"
                                    "{\n"
                                    "    return vesk::ptr<$0>(m_delegate.m_self, m_delegate.m_table);\n"
                                    "}\n"
                                  : "$0& Invoke()\n"
                                    "{\n"
                                    "    return reinterpret_cast<$0&>(m_delegate);\n"
                                    "}\n",
              {m_name});
    for (size_t i = 0; i < m_interface.m_methods.size(); ++i) WriteThunk(m_interface.m_methods[i], i);
    WriteThunkTable(kind);
  }
  m_out << "};\n";
  WriteFactory(kind);
}

}  // namespace

void WriteRemoteInterface(TextWriter& out, const InterfaceDef& interface) {
  out << "\n//### Registration of stub/scion of ";
  PrintElement(out, interface);
  out << "\n";
  NameSpaceFrame frame(out, interface.parent);
  RemoteText text(out, interface);
  text.WriteStub();
  text.WriteServer();
}

}  // namespace qrex
