// $cache: const member functions whose results the runtime's dependency graph keeps, one node per function or per key.

#include "text/numbers.h"
#include "translator/class/class_members.h"
#include "translator/class/node_text.h"
#include "translator/emit/emit.h"
#include "translator/reader/code_block.h"
#include "translator/reader/qrex_parser.h"

namespace qrex {

namespace {

constexpr int64_t kQueues = 8;
constexpr size_t kMaxKeys = 100;  // the texts of nested pairs grow with the square of their number

class CachedFunction {
 public:
  CachedFunction(QrexParser& parser, ClassDef& def) : m_parser(parser), m_out(parser.out), m_def(def) {}

  void Parse() {
    m_head = ReadNodeHead(m_parser, m_def);
    if (m_parser.Accept(kShiftLeft)) ReadQualifiers();
    m_written = m_parser.ParseFunctionSignature({.constAllowed = true, .reflected = m_head.reflected});
    if (!m_written.isConst) m_parser.Fail("$cache function must be declared const");
    Normalise();
    m_parser.DropToCurrent();
    if (m_parser.AcceptWord("with")) ReadInput();
    WriteCalculation();
    if (IsKeyed()) {
      WriteKeyed();
    } else {
      WritePlain();
    }
    m_parser.Flush();
  }

 private:
  void ReadQualifiers();
  void ReadQueue();
  void Normalise();
  void ReadInput();
  void WriteCalculation();
  void WritePlain();
  void WriteKeyed();
  void WriteBase();
  void WriteQueueIndex();
  void WritePairKey();
  void WriteCalculations();
  void WriteSyncCalculation();
  void WriteAsyncCalculations();
  void WriteCalcInput();
  void WriteFinalSelf(std::string_view self);
  void WriteNameParts();
  void WriteAccessor(const std::string& value);

  bool HasInput() const { return !m_inputName.empty(); }
  bool IsKeyed() const { return !m_signature.arguments.empty(); }
  bool HasPairKey() const { return m_signature.arguments.size() > 1; }
  std::string KeyTypeFrom(size_t first) const;
  std::string KeyExpression(size_t first) const;
  std::string KeyPart(size_t index, const std::string& last = ".first") const;
  std::string Arguments(std::string_view key, std::string_view input) const;

  QrexParser& m_parser;
  TextWriter& m_out;
  ClassDef& m_def;
  FunctionSignature m_written;    // as declared
  FunctionSignature m_signature;  // returns the output
  std::string m_output;           // its type's text
  std::string m_calc;             // the function that calculates
  std::string m_keyType;          // of the keyed form, as are the key's parts as arguments
  std::string m_keyArguments;
  NodeHead m_head;
  bool m_byReference = false, m_async = false, m_asyncIo = false;
  int64_t m_queue = 0;
  TypeCode m_inputType;
  std::string m_inputName;
};

void CachedFunction::ReadQualifiers() {
  while (!m_parser.Accept(kShiftRight)) {
    const bool on = !m_parser.Accept(kMinus);
    if (m_parser.Is("queue")) {
      ReadQueue();
      continue;
    }
    if (m_parser.Is("async")) {
      m_async = on;
    } else if (m_parser.Is("io")) {
      m_asyncIo = on;
    } else if (!m_parser.Is("visit")) {
      m_parser.Fail("Unrecognised qualifier << " + Printed(m_parser.current) + " >> on $cache");
    }
    m_parser.Advance();
  }
}

void CachedFunction::ReadQueue() {
  m_parser.Advance();
  m_parser.Expect(kOpenParen, "(");
  m_queue = m_parser.ReadInt64();
  if (m_queue < 0 || m_queue >= kQueues) {
    m_parser.Fail("Eviction queue index " + ToString(m_queue) + " must be between 0 and 7");
  }
  m_parser.Expect(kCloseParen, ")");
}

// The output of a function that returns void is its first parameter.
void CachedFunction::Normalise() {
  m_signature = m_written;
  m_byReference = IsVoid(m_written.returnType);
  if (m_byReference) {
    TypeView type = m_written.arguments.empty() ? TypeView() : m_written.arguments.front().type;
    type = type.WithoutMetadata();
    const bool isReference = type.Op() == kOpReference;
    if (isReference) type = type.Inner().WithoutMetadata();
    if (!isReference || type.Op() == kOpConst) m_parser.Fail("$cache function missing output type");
    m_signature.returnType = TypeCode(type.Code());
    m_signature.arguments.erase(m_signature.arguments.begin());
  }
  m_output = TypeText(m_signature.returnType);
  m_calc = "_calc_" + m_written.name;
  if (m_signature.arguments.size() > kMaxKeys) m_parser.Fail("Too many parameters on $cache function");
  if (!IsKeyed()) return;
  m_keyType = KeyTypeFrom(0);
  for (size_t i = 0; i < m_signature.arguments.size(); ++i) m_keyArguments += (i > 0 ? "," : "") + KeyPart(i);
}

void CachedFunction::ReadInput() {
  if (!m_async) throw LexScannerException("'with' only allowed on async $cache function", m_parser.previous);
  std::optional<ParsedType> input = m_parser.ParseTypeWithName(Naming::Optional, m_head.reflected);
  if (!input || input->name.empty() || input->followedByParen) m_parser.Fail("Error parsing input type and name");
  m_inputType = std::move(input->type);
  m_inputName = std::move(input->name);
  auto parameters = [&] {
    if (IsKeyed()) m_out << ",";
    WriteArgDeclarations(m_out, m_signature.arguments);
  };
  Write(m_out, "void $calc$_input($type$& $name$$parameters$) const\n", "calc"_ = m_calc,
        "type"_ = TypeView(m_inputType), "name"_ = m_inputName, "parameters"_ = parameters);
  if (m_parser.Accept(kAssign)) {
    const std::string body = ReadShortBody(m_parser, m_def, m_inputName);
    m_parser.Advance();
    m_parser.DropToCurrent();
    Write(m_out, R"(
      {
          $body$
      }
    )",
          "body"_([&] { m_out << body << "\n"; }));
  } else {
    m_out << "\n";
    CopyCodeBlock(m_parser, m_def);
    m_out << "\n";
  }
}

void CachedFunction::WriteCalculation() {
  FunctionSignature calculation = m_written;
  calculation.name = m_calc;
  if (HasInput()) {
    FunctionArg input;
    input.type = m_inputType;
    input.name = m_inputName;
    calculation.arguments.push_back(input);
  }
  WriteSignature(m_out, calculation);
  m_out << "\n";
  CopyCodeBlock(m_parser, m_def);
  m_out << "\n";
}

// --- Keys: one parameter is its own key, several are nested pairs.

std::string CachedFunction::KeyTypeFrom(size_t first) const {
  TypeView type = TypeView(m_signature.arguments[first].type).WithoutMetadata();
  while (type.Op() == kOpReference || type.Op() == kOpConst) type = type.Inner().WithoutMetadata();
  std::string text = TypeText(type);
  if (first + 1 == m_signature.arguments.size()) return text;
  return "std::pair<" + text + "," + KeyTypeFrom(first + 1) + ">";
}

std::string CachedFunction::KeyExpression(size_t first) const {
  const std::string& name = m_signature.arguments[first].name;
  if (first + 1 == m_signature.arguments.size()) return name;
  return "std::make_pair(" + name + "," + KeyExpression(first + 1) + ")";
}

std::string CachedFunction::KeyPart(size_t index, const std::string& last) const {
  std::string part = "_key";
  for (size_t i = 0; i < index; ++i) part += ".second";
  return index + 1 < m_signature.arguments.size() ? part + last : part;
}

// What is handed to the calculation: the output, when it is a reference, the key's parts, the input.
std::string CachedFunction::Arguments(std::string_view key, std::string_view input) const {
  std::string arguments;
  for (std::string_view argument : {If(m_byReference, "_output"), key, input}) {
    if (!arguments.empty() && !argument.empty()) arguments += ",";
    arguments += argument;
  }
  return arguments;
}

// --- Nodes

void CachedFunction::WritePlain() {
  Write(m_out, R"~(
    struct _depnode_$name$ : public $base$
    {
        typedef $base$ base;
        using typename base::output_type;
        $calculations$
        $class$ const* _GetSelf() const { return CONST_ATTRIB_CAST($class$,_dn_$name$); }
        $finalSelf$
        virtual vesk::xstring Name() const { return "$class$::$name$()"; }
        $queueIndex$
    } _dn_$name$;
  )~",
        "name"_ = m_written.name, "class"_ = m_def.name, "base"_([&] { WriteBase(); }),
        "calculations"_([&] { WriteCalculations(); }), "finalSelf"_([&] { WriteFinalSelf("_GetSelf()"); }),
        "queueIndex"_([&] { WriteQueueIndex(); }));
  WriteAccessor("_dn_" + m_written.name + ".read()");
  m_def.m_evictionMembers.push_back("_dn_" + m_written.name);
}

void CachedFunction::WriteKeyed() {
  Write(m_out, R"(
    struct _depnode_$name$ : public $base$
    {
        typedef $base$ base;
        using typename base::key_type;
        using typename base::output_type;
        using typename base::map_type;
        $calculations$
        virtual vesk::xstring Name() const
        {
            $pairKey$
            return vxMakeString("$class$::$name$("$parts$ << ')');
        }
        $queueIndex$
        map_type& _GetMap() const { return _self->_map_$name$; }
        $finalSelf$
    };
    mutable typename _depnode_$name$::map_type _map_$name$;
  )",
        "name"_ = m_written.name, "class"_ = m_def.name, "base"_([&] { WriteBase(); }),
        "calculations"_([&] { WriteCalculations(); }), "pairKey"_([&] { WritePairKey(); }),
        "parts"_([&] { WriteNameParts(); }), "queueIndex"_([&] { WriteQueueIndex(); }),
        "finalSelf"_([&] { WriteFinalSelf("_self"); }));
  WriteAccessor("_map_" + m_written.name + "[" + KeyExpression(0) + "].read(this)");
  m_def.m_evictionMembers.push_back("_map_" + m_written.name);
}

void CachedFunction::WriteBase() {
  const std::string_view kind = !m_async ? "SyncDepNode" : HasInput() ? "AsyncNodeOnInput" : "AsyncIndepNode";
  auto inputType = [&] { Write(m_out, "$type$,", "type"_ = TypeView(m_inputType)); };
  Write(m_out, "vesk::DG$keyed$$kind$<_depnode_$name$,$class$,$keyType$$comma$$inputType$$output$>",
        "keyed"_ = If(IsKeyed(), "Keyed"), "kind"_ = kind, "name"_ = m_written.name, "class"_ = m_def.name,
        "keyType"_ = m_keyType, "comma"_ = If(IsKeyed(), ","), "inputType"_ = If(HasInput(), inputType),
        "output"_ = m_output);
}

void CachedFunction::WriteQueueIndex() {
  if (m_queue == 0) return;
  Write(m_out, "virtual vesk::ssize_t EvictionQueueIndex() const { return $queue$; }\n", "queue"_ = m_queue);
}

// Both forms begin the functions that need the parts of a pair by asking for it.
void CachedFunction::WritePairKey() {
  if (HasPairKey()) Write(m_out, "$type$ const& _key = _GetKey();\n", "type"_ = m_keyType);
}

void CachedFunction::WriteCalculations() {
  if (!m_async) {
    WriteSyncCalculation();
  } else {
    WriteAsyncCalculations();
  }
}

void CachedFunction::WriteSyncCalculation() {
  const std::string_view key = HasPairKey() ? m_keyArguments : If(IsKeyed(), "_GetKey()");
  if (m_head.hard) {
    Write(m_out, "_depnode_$name$() { SetFlag(vesk::DF_PROPAGATE_HARD_DIRTINESS); }\n", "name"_ = m_written.name);
  }
  const std::string_view previousType = m_head.hard ? "" : IsKeyed() ? "auto" : std::string_view(m_output);
  WriteRecalcCache(m_out, {"_output", "output_type", previousType}, "", [&] {
    WritePairKey();
    Write(m_out, "$assign$$self$->$calc$($arguments$);\n", "assign"_ = If(!m_byReference, "_output = "),
          "self"_ = IsKeyed() ? "_self" : "_GetSelf()", "calc"_ = m_calc, "arguments"_ = Arguments(key, ""));
  });
}

// The calculation may run on another thread: it sees the object, the key and the input, not the node.
void CachedFunction::WriteAsyncCalculations() {
  auto flag = [&] { Write(m_out, "_depnode_$name$() { SetFlag(vesk::DF_ASYNC_IO); }\n", "name"_ = m_written.name); };
  Write(m_out, R"(
    $inputType$
    $constructor$
    static void CalcOutput(const $class$* _self, output_type& _output$key$$input$)
    {
        $assign$_self->$calc$($arguments$);
    }
    $calcInput$
  )",
        "inputType"_ = If(HasInput(), "using typename base::input_type;"), "constructor"_ = If(m_asyncIo, flag),
        "class"_ = m_def.name, "key"_ = If(IsKeyed(), ", const key_type& _key"),
        "input"_ = If(HasInput(), ", const input_type& _input"), "assign"_ = If(!m_byReference, "_output = "),
        "calc"_ = m_calc, "arguments"_ = Arguments(m_keyArguments, If(HasInput(), "_input")),
        "calcInput"_ = If(HasInput(), [&] { WriteCalcInput(); }));
}

void CachedFunction::WriteCalcInput() {
  Write(m_out, R"(
    static void CalcInput(const $class$* _self, input_type& _input$key$)
    {
        _self->$calc$_input(_input$comma$$keyArguments$);
    }
  )",
        "class"_ = m_def.name, "key"_ = If(IsKeyed(), ", const key_type& _key"), "calc"_ = m_calc,
        "comma"_ = If(IsKeyed(), ","), "keyArguments"_ = m_keyArguments);
}

void CachedFunction::WriteFinalSelf(std::string_view self) {
  if (m_def.IsMixin()) {
    return Write(m_out, R"(
      const typename BC::FinalClass* _GetFinalSelf() const { return static_cast<const typename BC::FinalClass*>($self$); }
    )",
                 "self"_ = self);
  }
  Write(m_out, "$class$ const* _GetFinalSelf() const { return $self$; }\n", "class"_ = m_def.name, "self"_ = self);
}

void CachedFunction::WriteNameParts() {
  if (!HasPairKey()) m_out << " << _GetKey()";
  for (size_t i = 0; HasPairKey() && i < m_signature.arguments.size(); ++i) {
    m_out << " << " << KeyPart(i, ".first << ','");
  }
}

// The function under its declared name, which asks the node.
void CachedFunction::WriteAccessor(const std::string& value) {
  FunctionSignature accessor = m_signature;
  PrependOp(accessor.returnType, kOpConst);
  PrependOp(accessor.returnType, kOpReference);
  Write(m_out, R"(
    $signature$
    {
        return $value$;
    }
  )",
        "signature"_ = accessor, "value"_ = value);
}

}  // namespace

void ParseCache(QrexParser& parser, ClassDef& def) { CachedFunction(parser, def).Parse(); }

}  // namespace qrex
