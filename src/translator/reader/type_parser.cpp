// The QrexParser operations on types, signatures and metadata.

#include <limits>

#include "lex/literals.h"
#include "lex/sections.h"
#include "text/numbers.h"
#include "translator/reader/qrex_parser.h"

namespace qrex {

namespace {

constexpr size_t kMaxMetadataValues = 31;

struct TemplateName {
  std::string_view word;
  std::string_view ops;  // the opcodes that it stands for, outermost first
};
constexpr char kMovableVector[] = {kOpVector, kOpMovable, kOpPref};
constexpr char kSingleOps[] = {kOpSet,  kOpAssignable, kOpMovable, kOpOffsettable, kOpPtr, kOpOpenVariant, kOpPref,
                               kOpCref, kOpVector,     kOpDeque,   kOpList,        kOpBag, kOpDynArray};
constexpr TemplateName kTemplateNames[] = {
    {"xset", {&kSingleOps[0], 1}},        {"mvector", {kMovableVector, 3}},     {"assignable", {&kSingleOps[1], 1}},
    {"movable", {&kSingleOps[2], 1}},     {"offsettable", {&kSingleOps[3], 1}}, {"ptr", {&kSingleOps[4], 1}},
    {"openvariant", {&kSingleOps[5], 1}}, {"pref", {&kSingleOps[6], 1}},        {"cref", {&kSingleOps[7], 1}},
    {"xvector", {&kSingleOps[8], 1}},     {"xdeque", {&kSingleOps[9], 1}},      {"xlist", {&kSingleOps[10], 1}},
    {"xbag", {&kSingleOps[11], 1}},       {"DynArray", {&kSingleOps[12], 1}},
};

constexpr std::string_view kPlatformDependent[] = {"char",     "short",   "int",      "long",  "__int8", "__int16",
                                                   "__int32",  "__int64", "__int128", "float", "double", "signed",
                                                   "unsigned", "DWORD",   "WORD",     "BYTE"};

uint8_t OpcodeOf(Category category) {
  switch (category) {
    case Category::Typedef:
      return kOpTypedef;
    case Category::Interface:
      return kOpInterface;
    case Category::Class:
      return kOpClass;
    case Category::Functor:
      return kOpFunctor;
    case Category::GlobalFunction:
      return kOpGlobalFunction;
    case Category::Variant:
      return kOpVariant;
    case Category::Enum:
      return kOpEnum;
    default:
      return kOpCppText;
  }
}

void AppendInt32(std::string& out, uint32_t value) {
  for (int i = 0; i < 4; ++i) out += static_cast<char>(value >> (8 * i));
}

}  // namespace

void QrexParser::ParseInnerType(TypeCode& type, bool reflected) {
  NestingGuard guard(*this);
  if (!ParseTypeWithName(type, nullptr, false, nullptr, reflected)) Fail("Syntax error : " + Printed(current));
}

// The built-in names and templates; false when the word is none of them.
bool QrexParser::ParseDecoratorType(TypeCode& type, bool reflected) {
  for (uint8_t op = kOpVoid; op <= kOpString16; ++op) {
    if (!Is(BuiltInTypeName(op))) continue;
    type += static_cast<char>(op);
    Advance();
    return true;
  }
  if (Is("xstring")) {
    type += static_cast<char>(kOpString8);
    Advance();
    return true;
  }
  if (Is("xmap")) {
    Advance();
    Expect(kLess, "<");
    type += static_cast<char>(kOpMap);
    ParseInnerType(type, reflected);
    Expect(kComma, ",");
    ParseInnerType(type, reflected);
    SplitShiftRight();
    Expect(kGreater, ">");
    return true;
  }
  for (const TemplateName& name : kTemplateNames) {
    if (!Is(name.word)) continue;
    if (name.ops.size() > 1) {
      ReportWarning(1005, "mvector<T> is deprecated - instead use xvector<movable<pref<T> > >");
    }
    Advance();
    Expect(kLess, "<");
    type += name.ops;
    ParseInnerType(type, reflected);
    SplitShiftRight();
    Expect(kGreater, ">");
    return true;
  }
  return false;
}

bool QrexParser::ParseBaseType(TypeCode& type, bool reflected) {
  const char* const begin = current.text.begin;  // `typename` belongs to the text of a type that stays C++
  AcceptWord("typename");
  if (!Is(kIdentifier) && !Is(kColonColon)) return false;
  NameSpace* scope = Accept(kColonColon) ? &Root() : nullptr;
  NameSpaceElement* found = nullptr;
  for (bool isScoped = scope != nullptr;; isScoped = true) {
    if (!Is(kIdentifier)) FailExpected("identifier");
    if (!isScoped || (scope && scope->GetQualifiedName() == "vesk")) {
      if (!isScoped && reflected) CheckPlatformDependent();
      if (ParseDecoratorType(type, reflected)) return true;
    }
    found = scope ? scope->Lookup(current.text.View()) : isScoped ? nullptr : FindName(current.text.View());
    if (reflected && !found) Fail("Unrecognised identifier : " + current.text.Text());
    Advance();
    if (Is(kLess)) {
      if (reflected) Fail("Error reading '<'. Templates cannot be reflected");
      SkipAngles();
      Advance();
      found = nullptr;
    }
    if (!Is(kColonColon)) break;
    if (found && found->category != Category::NameSpace) {
      Fail(":: not expected here : " + PrintedElement(*found) + " is not a namespace");
    }
    scope = static_cast<NameSpace*>(found);
    Advance();
  }
  if (found && found->category != Category::NameSpace && found->category != Category::GlobalVar) {
    AppendNamedType(type, OpcodeOf(found->category), found->GetQualifiedName());
  } else {
    AppendNamedType(type, kOpCppText, std::string_view(begin, static_cast<size_t>(previous.text.end - begin)));
  }
  return true;
}

void QrexParser::CheckPlatformDependent() const {
  for (std::string_view word : kPlatformDependent) {
    if (Is(word)) Fail("Can't accept platform dependent type: " + std::string(word));
  }
}

// Optional `const`, the base type, then any of `*`, `const` and `: [metadata]`. The last suffix is the outermost.
bool QrexParser::ParseSuffixedType(TypeCode& type, bool reflected) {
  const bool leadingConst = AcceptWord("const");
  TypeCode base;
  if (!ParseBaseType(base, reflected)) return false;
  if (leadingConst) base.insert(0, 1, static_cast<char>(kOpConst));
  for (;;) {
    if (Accept(kStar)) {
      base.insert(0, 1, static_cast<char>(kOpPointer));
    } else if (AcceptWord("const")) {
      base.insert(0, 1, static_cast<char>(kOpConst));
    } else if (Is(kColon)) {
      Advance();
      std::string metadata;
      ParseMetadataList(metadata);
      base.insert(0, metadata);
    } else {
      break;
    }
  }
  type = std::move(base);
  return true;
}

bool QrexParser::ParseTypeWithName(TypeCode& type, std::string* name, bool nameRequired, bool* followedByParen,
                                   bool reflected) {
  TypeCode base;
  if (!ParseSuffixedType(base, reflected)) return false;
  const bool isReference = Accept(kAnd);
  if (name) {
    if (Is(kIdentifier)) {
      *name = ReadIdentifier();
    } else if (nameRequired) {
      FailExpected("identifier");
    }
    lastNameEnd = previous.text.end;
    if (followedByParen) *followedByParen = Is(kOpenParen);
  }
  // Arrays stand outer dimension first; metadata that follows a dimension stands in front of its code.
  TypeCode dimensions, dimension;
  while (Is(kOpenBracket) || Is(kColon)) {
    if (Accept(kColon)) {
      std::string metadata;
      ParseMetadataList(metadata);
      dimension.insert(0, metadata);
      continue;
    }
    if (isReference) Fail("Unexpected '[' : arrays on reference type are illegal");
    dimensions += dimension;
    dimension = ParseArraySuffix();
  }
  if (isReference) type += static_cast<char>(kOpReference);
  dimensions += dimension;
  lastSuffixSize = isReference ? 0 : dimensions.size();
  type += dimensions + base;
  return true;
}

TypeCode QrexParser::ParseArraySuffix() {
  TypeCode code;
  Advance();
  if (Accept(kCloseBracket)) {
    code += static_cast<char>(kOpDynArray);
    return code;
  }
  const int64_t size = ReadInt64();
  if (size <= 0 || static_cast<int32_t>(size) <= 0) Fail("Array size must be greater than zero");
  Expect(kCloseBracket, "]");
  code += static_cast<char>(kOpArray);
  AppendInt32(code, static_cast<uint32_t>(size));
  return code;
}

// --- Signatures

namespace {

[[noreturn]] void FailAt(const char* position, std::string message) {
  throw LexScannerException(std::move(message), position);
}

uint8_t Op(std::string_view code) { return code.empty() ? 0 : static_cast<uint8_t>(code.front()); }

// What a remote call needs of an argument in each direction.
void CheckDirection(const FunctionArg& arg, const char* position) {
  std::string_view code = SkipMetadata(arg.type);
  const std::string& name = arg.name;
  const bool isReference = Op(code) == kOpReference;
  auto isConst = [&](std::string_view inner) { return Op(SkipMetadata(inner)) == kOpConst; };
  switch (arg.direction) {
    case ArgDirection::In:
      if (isReference) {
        code = SkipMetadata(code.substr(1));
        if (Op(code) != kOpConst) FailAt(position, "in parameter " + name + " passed by reference");
      }
      if (Op(code) == kOpConst) code = SkipMetadata(code.substr(1));
      if (Op(code) == kOpPointer) FailAt(position, "in parameter " + name + " : cannot marshall pointer type");
      break;
    case ArgDirection::Out:
    case ArgDirection::InOut:
      if (!isReference) FailAt(position, "out parameter " + name + " must be passed by reference");
      if (isConst(code.substr(1))) {
        FailAt(position, "out parameter " + name + " cannot be passed by const reference");
      }
      break;
    case ArgDirection::Copy:
      if (Op(code) != kOpPointer) FailAt(position, "copy parameter " + name + " must be passed by pointer");
      if (isConst(code.substr(1))) {
        FailAt(position, "copy parameter " + name + " cannot be passed by pointer to const");
      }
      code = SkipMetadata(code.substr(1));
      if (Op(code) == kOpReference) {
        FailAt(position, "'copy' parameter " + name + " : cannot marshall reference type");
      }
      if (Op(code) == kOpPointer) FailAt(position, "'copy' parameter " + name + " : cannot marshall pointer type");
      break;
    case ArgDirection::None:
      break;
  }
}

}  // namespace

void QrexParser::ParseFunctionArg(FunctionArg& arg, bool directionsRequired, bool reflected) {
  if (directionsRequired) {
    if (!Accept(kOpenBracket)) Fail("[in] or [out] expected when read " + Printed(current));
    static constexpr std::string_view kWords[] = {"", "in", "out", "inout", "copy"};
    for (size_t i = 1; i < std::size(kWords); ++i) {
      if (Is(kWords[i])) arg.direction = static_cast<ArgDirection>(i);
    }
    if (arg.direction == ArgDirection::None) Fail("in,out,inout or copy expected when read " + Printed(current));
    Advance();
    Expect(kCloseBracket, "]");
  }
  const char* const position = current.text.begin;
  if (!ParseTypeWithName(arg.type, &arg.name, true, nullptr, reflected)) {
    Fail("Type expected when read " + Printed(current));
  }
  CheckDirection(arg, position);
}

std::string QrexParser::ReadArgumentText() {
  TextRange argument;
  previous = current;
  current = ReadArgument(scanner, argument, kCloseParen);
  return argument.Text();
}

// From behind the `(` to behind the `)`.
void QrexParser::ParseArguments(FunctionSignature& signature, bool directionsRequired, bool polymorphicAllowed,
                                bool reflected) {
  while (!Is(kCloseParen)) {
    FunctionArg& arg = signature.arguments.emplace_back();
    if (Is(kOpenBracket) && !directionsRequired) {
      if (!polymorphicAllowed) Fail("'[' unexpected.  Polymorphic argument not allowed here");
      arg.polymorphic = true;
      Advance();
    }
    ParseFunctionArg(arg, directionsRequired, reflected);
    if (arg.polymorphic) Expect(kCloseBracket, "]");
    if (Is(kAssign)) arg.defaultValue = ReadArgumentText();
    if (Is(kCloseParen)) break;
    if (!Accept(kComma)) Fail(", or ) expected in argument list when read " + Printed(current));
  }
  Advance();
}

void QrexParser::ParseSignatureEnd(FunctionSignature& signature, bool constAllowed) {
  if (Is("const")) {
    if (!constAllowed) Fail("const specifier on global function prohibited");
    signature.isConst = true;
    Advance();
  }
  if (Accept(kColon)) ParseOptionalMetadata(signature.metadata);
}

void QrexParser::ParseFunctionSignature(FunctionSignature& signature, bool constAllowed, bool directionsRequired,
                                        bool polymorphicAllowed, bool reflected) {
  signature.isInline = AcceptWord("inline");
  if (!ParseTypeWithName(signature.returnType, nullptr, false, nullptr, reflected) || !Is(kIdentifier)) {
    Fail("Function name expected when read " + Printed(current));
  }
  signature.name = ReadIdentifier();
  Expect(kOpenParen, "(");
  ParseArguments(signature, directionsRequired, polymorphicAllowed, reflected);
  ParseSignatureEnd(signature, constAllowed);
}

void QrexParser::ParseMethodOrAttribute(bool constAllowed, bool& isAttribute, FunctionSignature& signature, bool ipc,
                                        bool reflected) {
  signature.isInline = AcceptWord("inline");
  const char* const position = current.text.begin;
  bool followedByParen = false;
  if (!ParseTypeWithName(signature.returnType, &signature.name, true, &followedByParen, reflected)) {
    Fail("Type expected when read " + Printed(current));
  }
  isAttribute = !followedByParen;
  if (isAttribute) return;
  if (ipc && !IsVoid(signature.returnType)) {
    FailAt(position, "Return type " + TypeText(signature.returnType) + " invalid - must be void");
  }
  Expect(kOpenParen, "(");
  ParseArguments(signature, ipc, false, reflected);
  ParseSignatureEnd(signature, constAllowed);
}

// --- Metadata

// Values separated by `,` up to `close`, which is passed; their number.
size_t QrexParser::ParseMetadataValues(std::string& out, int32_t close, std::string_view expected,
                                       std::string_view exceeded) {
  NestingGuard guard(*this);
  size_t count = 0;
  for (; !Is(close); ++count) {
    if (count == kMaxMetadataValues) Fail(std::string(exceeded));
    ParseMetadataValue(out);
    if (Is(close)) continue;
    if (!Accept(kComma)) Fail(std::string(expected) + Printed(current));
  }
  Advance();
  return count;
}

void QrexParser::ParseMetadataList(std::string& out) {
  Expect(kOpenBracket, "[");
  std::string values;
  const size_t count = ParseMetadataValues(values, kCloseBracket, ", or ] expected in meta-data list when read ",
                                           "Maximum list size exceeded");
  out += static_cast<char>(kOpMetaList + count);
  out += values;
}

void QrexParser::ParseOptionalMetadata(std::string& out) {
  if (Is(kOpenBracket)) ParseMetadataList(out);
}

void QrexParser::ParseMetadataValue(std::string& out) {
  if (Is(kOpenBracket)) return ParseMetadataList(out);
  if (Is(kIdentifier) && !Is("true") && !Is("false")) {
    const std::string name = ReadIdentifier();
    std::string values;
    size_t count = 0;
    if (Accept(kOpenParen)) {
      count = ParseMetadataValues(values, kCloseParen, ", or ) expected in functor arglist when read ",
                                  "Maximum functor arglist size exceeded");
    }
    out += static_cast<char>(kOpMetaFunctor + count);
    AppendCompactString(out, name);
    out += values;
    return;
  }
  Literal value;
  ParseExpression(value);
  switch (value.kind) {
    case LiteralKind::Bool:
      out += static_cast<char>(kOpMetaBool);
      out += value.boolean ? '\1' : '\0';
      break;
    case LiteralKind::Int64:
      if (value.integer < std::numeric_limits<int32_t>::min() || value.integer > std::numeric_limits<int32_t>::max()) {
        Fail("64-bit integer metadata not supported");
      }
      out += static_cast<char>(kOpMetaInt);
      AppendInt32(out, static_cast<uint32_t>(value.integer));
      break;
    case LiteralKind::Float64: {
      uint64_t bits;
      std::memcpy(&bits, &value.real, sizeof bits);
      out += static_cast<char>(kOpMetaFloat);
      AppendInt32(out, static_cast<uint32_t>(bits));
      AppendInt32(out, static_cast<uint32_t>(bits >> 32));
      break;
    }
    case LiteralKind::String:
      out += static_cast<char>(kOpMetaString);
      AppendCompactString(out, value.text);
      break;
    default:
      Fail("unsupported literal: " + Printed(current));
  }
}

}  // namespace qrex
