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
      : m_out(out), m_interface(interface), m_name(interface.name) {}

  void WriteStub();
  void WriteServer();  // skeleton or scion

 private:
  void WriteStubMethod(const FunctionSignature& method, size_t index);
  void WriteResultFunction(const FunctionSignature& method);
  void WriteResponse(const FunctionSignature& method, size_t results);
  void WriteThunk(const FunctionSignature& method, size_t index);
  void WriteIncoming(const FunctionSignature& method);
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

  // A hole's function: that of each method with its index.
  auto EachMethod(void (RemoteText::*write)(const FunctionSignature& method, size_t index)) {
    return [this, write] {
      for (size_t i = 0; i < m_interface.m_methods.size(); ++i) (this->*write)(m_interface.m_methods[i], i);
    };
  }

  TextWriter& m_out;
  const InterfaceDef& m_interface;
  const std::string& m_name;
};

// --- Stub

void RemoteText::WriteStub() {
  Write(m_out, R"(
    struct Stub$name$ : vesk::Stub
    {
        Stub$name$() : Stub(vesk::ptr<$name$>(this),$count$) {}
        $methods$
    };
  )",
        "name"_ = m_name, "count"_ = m_interface.m_methods.size(),
        "methods"_ = EachMethod(&RemoteText::WriteStubMethod));
  WriteFactory("Stub");
}

void RemoteText::WriteStubMethod(const FunctionSignature& method, size_t index) {
  const size_t results = CountResults(method);
  if (results > 0) WriteResultFunction(method);
  Write(m_out, R"(
    void $method$($parameters$)$const$
    {
        $response$
        StubBegin($index$,$responseName$)$values$;
        StubEnd();
    }
  )",
        "method"_ = method.name, "parameters"_([&] { WriteArgDeclarations(m_out, method.arguments); }),
        "const"_ = If(method.isConst, " const"), "response"_ = If(results > 0, [&] { WriteResponse(method, results); }),
        "index"_ = index, "responseName"_ = results > 0 ? "qr__" : "NULL",
        "values"_([&] { WriteOutgoing(method, " << "); }));
}

void RemoteText::WriteResultFunction(const FunctionSignature& method) {
  auto result = [&](const FunctionArg& arg) {
    if (!ComesBack(arg)) return;
    Write(m_out, "_ar >> *($type$*) *_p++;\n", "type"_ = WithoutLeading(arg.type, {kOpReference}));
  };
  Write(m_out, R"(
    static void Result_$method$(vesk::$archive$& _ar, void** _p)
    {
        $results$
    }
  )",
        "method"_ = method.name, "archive"_ = m_interface.m_isRmi ? "InputArchive" : "Archive",
        "results"_ = Each(m_out, method.arguments, "", result));
}

// Tells the connection where the answer's values belong.
void RemoteText::WriteResponse(const FunctionSignature& method, size_t results) {
  size_t number = 0;
  auto parameter = [&](const FunctionArg& arg) {
    if (!ComesBack(arg)) return;
    Write(m_out, "qr__->m_outparams[$number$] = &$name$;\n", "number"_ = number++, "name"_ = arg.name);
  };
  Write(m_out, R"(
    vesk::QueuedResponse<$results$>* qr__ = new vesk::QueuedResponse<$results$>;
    qr__->m_fn = &Result_$method$;
    $parameters$
  )",
        "results"_ = results, "method"_ = method.name, "parameters"_ = Each(m_out, method.arguments, "", parameter));
}

// --- Skeleton and scion

void RemoteText::WriteServer() {
  const std::string_view kind = m_interface.m_isRmi ? "Skeleton" : "Scion";
  auto invoke = [&] {
    if (m_interface.m_isRmi) {
      return Write(m_out, R"(
        vesk::ptr<$name$> Invoke()
        {
            return vesk::ptr<$name$>(m_delegate.m_self, m_delegate.m_table);
        }
      )",
                   "name"_ = m_name);
    }
    Write(m_out, R"(
      $name$& Invoke()
      {
          return reinterpret_cast<$name$&>(m_delegate);
      }
    )",
          "name"_ = m_name);
  };
  Write(m_out, R"(
    struct $kind$$name$ : vesk::$kind$
    {
        $kind$$name$() : vesk::$kind$(Get$kind$ThunkFnTable(),$count$) {}
        $invoke$
        $thunks$
        $thunkTable$
    };
  )",
        "kind"_ = kind, "name"_ = m_name, "count"_ = m_interface.m_methods.size(), "invoke"_ = invoke,
        "thunks"_ = EachMethod(&RemoteText::WriteThunk), "thunkTable"_([&] { WriteThunkTable(kind); }));
  WriteFactory(kind);
}

void RemoteText::WriteThunk(const FunctionSignature& method, size_t index) {
  auto argument = [&](const FunctionArg& arg) {
    m_out << arg.name << (arg.direction == ArgDirection::Copy ? ".release()" : "");
  };
  auto result = [&](const FunctionArg& arg) {
    if (ComesBack(arg)) m_out << " << " << arg.name;
  };
  auto results = [&] { Write(m_out, "Push()$results$;\n", "results"_ = Each(m_out, method.arguments, "", result)); };
  const bool isReference = !m_interface.m_isRmi && m_interface.WantsCompilableText();  // as a scion's Invoke answers
  Write(m_out, R"(
    void Thunk$index$()
    {
        $incoming$
        Invoke()$access$$method$($arguments$);
        $results$
    }
  )",
        "index"_ = index, "incoming"_([&] { WriteIncoming(method); }), "access"_ = isReference ? "." : "->",
        "method"_ = method.name, "arguments"_ = Each(m_out, method.arguments, ",", argument),
        "results"_ = If(CountResults(method) > 0, results));
}

// The parameters as variables, and the values that came with the call.
void RemoteText::WriteIncoming(const FunctionSignature& method) {
  const auto& arguments = method.arguments;
  const bool nothingComes = std::all_of(arguments.begin(), arguments.end(),
                                        [](const FunctionArg& arg) { return arg.direction == ArgDirection::Out; });
  auto variable = [&](const FunctionArg& arg) {
    const TypeView type = WithoutLeading(arg.type, {kOpReference, kOpConst});
    if (arg.direction == ArgDirection::Copy) {
      Write(m_out, "std::auto_ptr<$type$> $name$(new $type$);\n", "type"_ = type.Inner(), "name"_ = arg.name);
    } else {
      Write(m_out, "$type$ $name$;\n", "type"_ = type, "name"_ = arg.name);
    }
  };
  Write(m_out, R"(
    $variables$
    $pop$$values$;
  )",
        "pop"_ = arguments.empty() || (nothingComes && m_interface.WantsCompilableText()) ? "Pop()"
                                                                                          : "auto _ar = Pop(); _ar",
        "variables"_ = Each(m_out, method.arguments, "", variable), "values"_([&] { WriteOutgoing(method, " >> "); }));
}

void RemoteText::WriteThunkTable(std::string_view kind) {
  const size_t count = m_interface.m_methods.size();
  auto functions = [&] {
    for (size_t i = 0; i < count; ++i) {
      Write(m_out, "static void sThunk$index$(void* _self) { (($kind$$name$*)_self)->Thunk$index$(); }\n", "index"_ = i,
            "kind"_ = kind, "name"_ = m_name);
    }
  };
  auto rows = [&] {
    for (size_t i = 0; i < count; ++i) m_out << "&sThunk" << i << ",\n";
  };
  Write(m_out, R"(
    $functions$
    static const vesk::$kind$ThunkFn* Get$kind$ThunkFnTable()
    {
        static const vesk::$kind$ThunkFn t[] =
        {
            $rows$
        };
        return t;
    }
  )",
        "functions"_ = functions, "kind"_ = kind, "rows"_ = rows);
}

// --- Factory of either side

void RemoteText::WriteFactory(std::string_view kind) {
  Write(m_out, R"(
    struct $kind$$name$Factory : public vesk::I$kind$Factory
    {
        $kind$$name$Factory()
        {
            vesk::Register$kind$(vesk::GetIpcInterfaceName<$name$>(),this);
        }
        ~$kind$$name$Factory()
        {
            vesk::Unregister$kind$(vesk::GetIpcInterfaceName<$name$>());
        }
        virtual vesk::$kind$* Create$kind$()
        {
            return new $kind$$name$;
        }
    };
    void _Register_$kind$$name$()
    {
        static $kind$$name$Factory s;
    }
  )",
        "kind"_ = kind, "name"_ = m_name);
  std::string scope = m_interface.parent->GetQualifiedName();
  if (!scope.empty()) scope += "::";
  m_interface.owner.registrations.registerNames.push_back(scope + std::string(kind) + m_name);
}

}  // namespace

void WriteRemoteInterface(TextWriter& out, const InterfaceDef& interface) {
  Write(out, R"(

    //### Registration of stub/scion of $interface$
  )",
        "interface"_([&] { PrintElement(out, interface); }));
  NameSpaceFrame frame(out, interface.parent);
  RemoteText text(out, interface);
  text.WriteStub();
  text.WriteServer();
}

}  // namespace qrex
