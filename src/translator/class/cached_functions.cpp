// $cache: const member functions whose results the runtime's dependency graph keeps, one node per function or per key.

#include "text/numbers.h"
#include "translator/class/class_members.h"
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
    if (m_signature.arguments.empty()) {
      WritePlain();
    } else {
      WriteKeyed();
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
  void WriteNodeMembers(const std::string& keyArguments);
  void WriteRecalc(const std::string& keyArguments);
  void WriteQueueIndex();
  std::string BaseText(std::string_view keyed, const std::string& keyType) const;
  void WriteKeyedName();
  void WriteFinalSelf(std::string_view self);
  void WriteAccessor(const std::string& value);

  std::string Node() const { return "_depnode_" + m_written.name; }
  std::string Calc() const { return "_calc_" + m_written.name; }
  bool HasInput() const { return !m_inputName.empty(); }
  std::string KeyType() const { return KeyTypeFrom(0); }
  std::string KeyTypeFrom(size_t first) const;
  std::string KeyExpression(size_t first) const;
  std::string KeyPart(size_t index, const std::string& last = ".first") const;
  std::string KeyArguments() const;

  QrexParser& m_parser;
  TextWriter& m_out;
  ClassDef& m_def;
  FunctionSignature m_written;    // as declared
  FunctionSignature m_signature;  // returns the output
  std::string m_output;           // its type's text
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
  if (m_signature.arguments.size() > kMaxKeys) m_parser.Fail("Too many parameters on $cache function");
}

void CachedFunction::ReadInput() {
  if (!m_async) throw LexScannerException("'with' only allowed on async $cache function", m_parser.previous);
  std::optional<ParsedType> input = m_parser.ParseTypeWithName(Naming::Optional, m_head.reflected);
  if (!input || input->name.empty() || input->followedByParen) m_parser.Fail("Error parsing input type and name");
  m_inputType = std::move(input->type);
  m_inputName = std::move(input->name);
  m_out << "void " << Calc() << "_input(";
  PrintDeclaration(m_out, m_inputType, m_inputName, DeclarationMode::Reference);
  if (!m_signature.arguments.empty()) m_out << ",";
  WriteArgDeclarations(m_out, m_signature.arguments);
  m_out << ") const\n";
  if (m_parser.Accept(kAssign)) {
    const std::string body = ReadShortBody(m_parser, m_def, m_inputName);
    m_parser.Advance();
    m_parser.DropToCurrent();
    Block block(m_out);
    m_out << body << "\n";
  } else {
    m_out << "\n";
    CopyCodeBlock(m_parser, m_def);
    m_out << "\n";
  }
}

void CachedFunction::WriteCalculation() {
  FunctionSignature calculation = m_written;
  calculation.name = Calc();
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
  const std::string text = TypeText(type);
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

std::string CachedFunction::KeyArguments() const {
  std::string arguments;
  for (size_t i = 0; i < m_signature.arguments.size(); ++i) arguments += (i > 0 ? "," : "") + KeyPart(i);
  return arguments;
}

// --- Nodes

std::string CachedFunction::BaseText(std::string_view keyed, const std::string& keyType) const {
  const std::string_view kind = !m_async ? "SyncDepNode" : HasInput() ? "AsyncNodeOnInput" : "AsyncIndepNode";
  return "vesk::DG" + std::string(keyed) + std::string(kind) + "<" + Node() + "," + m_def.name + "," +
         (keyType.empty() ? "" : keyType + ",") + (m_async && HasInput() ? TypeText(m_inputType) + "," : "") +
         m_output + ">";
}

void CachedFunction::WriteRecalc(const std::string& keyArguments) {
  const bool isKeyed = !keyArguments.empty();
  const bool hasPairKey = m_signature.arguments.size() > 1;
  if (m_head.hard) m_out << Node() << "() { SetFlag(vesk::DF_PROPAGATE_HARD_DIRTINESS); }\n";
  m_out << "virtual bool RecalcCache() const\n";
  Block body(m_out);
  if (!m_head.hard) m_out << (isKeyed ? "auto" : m_output) << " _prev = _output;\n";
  if (hasPairKey) m_out << KeyType() << " const& _key = _GetKey();\n";
  const std::string key = !isKeyed ? "" : hasPairKey ? keyArguments : "_GetKey()";
  const std::string self = isKeyed ? "_self->" : "_GetSelf()->";
  if (m_byReference) {
    m_out << self << Calc() << "(_output" << (isKeyed ? "," : "") << key << ");\n";
  } else {
    m_out << "_output = " << self << Calc() << "(" << key << ");\n";
  }
  m_out << "if (vesk::TypeHasAdditionalSize<output_type>()) UpdateByteSize();\n";
  m_out << (m_head.hard ? "return true;\n" : "return _prev != _output;\n");
}

void CachedFunction::WriteNodeMembers(const std::string& keyArguments) {
  if (!m_async) return WriteRecalc(keyArguments);
  const bool isKeyed = !keyArguments.empty();
  const std::string_view key = isKeyed ? ", const key_type& _key" : "";
  if (HasInput()) m_out << "using typename base::input_type;\n";
  if (m_asyncIo) m_out << Node() << "() { SetFlag(vesk::DF_ASYNC_IO); }\n";
  m_out << "static void CalcOutput(const " << m_def.name << "* _self, output_type& _output" << key
        << (HasInput() ? ", const input_type& _input)\n" : ")\n");
  std::string arguments = m_byReference ? "_output" : "";
  for (const std::string& more : {keyArguments, std::string(HasInput() ? "_input" : "")}) {
    if (!more.empty()) arguments += (arguments.empty() ? "" : ",") + more;
  }
  {
    Block body(m_out);
    m_out << (m_byReference ? "" : "_output = ") << "_self->" << Calc() << "(" << arguments << ");\n";
  }
  if (!HasInput()) return;
  m_out << "static void CalcInput(const " << m_def.name << "* _self, input_type& _input" << key << ")\n";
  Block body(m_out);
  m_out << "_self->" << Calc() << "_input(_input" << (isKeyed ? "," : "") << keyArguments << ");\n";
}

void CachedFunction::WriteQueueIndex() {
  if (m_queue != 0) m_out << "virtual vesk::ssize_t EvictionQueueIndex() const { return " << m_queue << "; }\n";
}

void CachedFunction::WriteFinalSelf(std::string_view self) {
  if (m_def.IsMixin()) {
    WriteText(m_out,
              "const typename BC::FinalClass* _GetFinalSelf() const { return static_cast<const typename "
              "BC::FinalClass*>($0); }\n",
              {self});
  } else {
    WriteText(m_out, "$0 const* _GetFinalSelf() const { return $1; }\n", {m_def.name, self});
  }
}

// The function under its declared name, which asks the node.
void CachedFunction::WriteAccessor(const std::string& value) {
  FunctionSignature accessor = m_signature;
  PrependOp(accessor.returnType, kOpConst);
  PrependOp(accessor.returnType, kOpReference);
  WriteSignature(m_out, accessor);
  m_out << "\n";
  Block body(m_out);
  m_out << "return " << value << ";\n";
}

void CachedFunction::WritePlain() {
  const std::string& name = m_written.name;
  const std::string base = BaseText("", "");
  m_out << "struct " << Node() << " : public " << base << "\n";
  {
    Block node(m_out, " _dn_" + name + ";");
    m_out << "typedef " << base << " base;\nusing typename base::output_type;\n";
    WriteNodeMembers("");
    WriteText(m_out, "$0 const* _GetSelf() const { return CONST_ATTRIB_CAST($0,_dn_$1); }\n", {m_def.name, name});
    WriteFinalSelf("_GetSelf()");
    WriteText(m_out, "virtual vesk::xstring Name() const { return \"$0::$1()\"; }\n", {m_def.name, name});
    WriteQueueIndex();
  }
  WriteAccessor("_dn_" + name + ".read()");
  m_def.m_evictionMembers.push_back("_dn_" + name);
}

void CachedFunction::WriteKeyed() {
  const std::string& name = m_written.name;
  const std::string base = BaseText("Keyed", KeyType());
  m_out << "struct " << Node() << " : public " << base << "\n";
  {
    Block node(m_out, ";");
    m_out << "typedef " << base << " base;\n";
    m_out << "using typename base::key_type;\nusing typename base::output_type;\nusing typename base::map_type;\n";
    WriteNodeMembers(KeyArguments());
    WriteKeyedName();
    WriteQueueIndex();
    m_out << "map_type& _GetMap() const { return _self->_map_" << name << "; }\n";
    WriteFinalSelf("_self");
  }
  m_out << "mutable typename " << Node() << "::map_type _map_" << name << ";\n";
  WriteAccessor("_map_" + name + "[" + KeyExpression(0) + "].read(this)");
  m_def.m_evictionMembers.push_back("_map_" + name);
}

void CachedFunction::WriteKeyedName() {
  const size_t count = m_signature.arguments.size();
  m_out << "virtual vesk::xstring Name() const\n";
  Block body(m_out);
  if (count > 1) m_out << KeyType() << " const& _key = _GetKey();\n";
  m_out << "return vxMakeString(\"" << m_def.name << "::" << m_written.name << "(\"";
  if (count == 1) m_out << " << _GetKey()";
  for (size_t i = 0; count > 1 && i < count; ++i) m_out << " << " << KeyPart(i, ".first << ','");
  m_out << " << ')');\n";
}

}  // namespace

void ParseCache(QrexParser& parser, ClassDef& def) { CachedFunction(parser, def).Parse(); }

}  // namespace qrex
