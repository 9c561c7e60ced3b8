// The QrexParser operations on types, signatures and metadata.

#include <array>
#include <limits>

#include "lex/literals.h"
#include "lex/sections.h"
#include "text/numbers.h"
#include "translator/reader/qrex_parser.h"

namespace qrex {

namespace {

struct TemplateName {
  std::string_view word;
  std::array<TypeOp, 3> ops;  // what it means, outermost first; kOpVoid ends
  bool IsDeprecated() const { return ops[1] != kOpVoid; }
};
constexpr TemplateName kTemplateNames[] = {
    {"xset", {kOpSet}},
    {"mvector", {kOpVector, kOpMovable, kOpPref}},
    {"assignable", {kOpAssignable}},
    {"movable", {kOpMovable}},
    {"offsettable", {kOpOffsettable}},
    {"ptr", {kOpPtr}},
    {"openvariant", {kOpOpenVariant}},
    {"pref", {kOpPref}},
    {"cref", {kOpCref}},
    {"xvector", {kOpVector}},
    {"xdeque", {kOpDeque}},
    {"xlist", {kOpList}},
    {"xbag", {kOpBag}},
    {"DynArray", {kOpDynArray}},
};

constexpr std::string_view kPlatformDependent[] = {"char",     "short",   "int",      "long",  "__int8", "__int16",
                                                   "__int32",  "__int64", "__int128", "float", "double", "signed",
                                                   "unsigned", "DWORD",   "WORD",     "BYTE"};

}  // namespace

TypeCode QrexParser::ParseInnerType(bool reflected) {
  NestingGuard guard(*this);
  std::optional<ParsedType> inner = ParseTypeWithName(Naming::None, reflected);
  if (!inner) Fail("Syntax error : " + Printed(current));
  return std::move(inner->type);
}

// The built-in names and templates.
std::optional<TypeCode> QrexParser::ParseDecoratorType(bool reflected) {
  TypeCode type;
  for (uint8_t op = kOpVoid; op <= kOpString16; ++op) {
    const auto builtIn = static_cast<TypeOp>(op);
    if (!Is(BuiltInTypeName(builtIn))) continue;
    AppendOp(type, builtIn);
    Advance();
    return type;
  }
  if (AcceptWord("xstring")) {
    AppendOp(type, kOpString8);
    return type;
  }
  if (Is("xmap")) {
    Advance();
    Expect(kLess, "<");
    AppendOp(type, kOpMap);
    type += ParseInnerType(reflected);
    Expect(kComma, ",");
    type += ParseInnerType(reflected);
    SplitShiftRight();
    Expect(kGreater, ">");
    return type;
  }
  for (const TemplateName& name : kTemplateNames) {
    if (!Is(name.word)) continue;
    if (name.IsDeprecated()) {
      ReportWarning(Warning::DeprecatedMvector, "mvector<T> is deprecated - instead use xvector<movable<pref<T> > >");
    }
    Advance();
    Expect(kLess, "<");
    for (size_t i = 0; i < name.ops.size() && name.ops[i] != kOpVoid; ++i) AppendOp(type, name.ops[i]);
    type += ParseInnerType(reflected);
    SplitShiftRight();
    Expect(kGreater, ">");
    return type;
  }
  return std::nullopt;
}

std::optional<TypeCode> QrexParser::ParseBaseType(bool reflected) {
  const char* const begin = current.text.begin;  // `typename` belongs to the text of a type that stays C++
  AcceptWord("typename");
  if (!Is(kIdentifier) && !Is(kColonColon)) return std::nullopt;
  NameSpace* scope = Accept(kColonColon) ? &Root() : nullptr;
  NameSpaceElement* found = nullptr;
  for (bool isScoped = scope != nullptr;; isScoped = true) {
    if (!Is(kIdentifier)) FailExpected("identifier");
    if (!isScoped || (scope && scope->GetQualifiedName() == "vesk")) {
      if (!isScoped && reflected) CheckPlatformDependent();
      if (std::optional<TypeCode> type = ParseDecoratorType(reflected)) return type;
    }
    found = scope ? scope->Lookup(current.text.View()) : isScoped ? nullptr : FindName(current.text.View());
    if (reflected && !found) FailUnknown();
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
  TypeCode type;
  const TypeOp op = found ? found->kindTraits.op : kOpCppText;
  const std::string_view text(begin, static_cast<size_t>(previous.text.end - begin));
  AppendNamedType(type, op, op == kOpCppText ? text : found->GetQualifiedName());
  return type;
}

void QrexParser::FailUnknown() const {
  LexScannerException failure("Unrecognised identifier : " + current.text.Text(), current);
  if (!Is("std")) throw failure;
  throw failure.WithHint(
      "nothing of std is reflected: write string8 for std::string, xvector<T> for std::vector<T>, xmap<K,V> for "
      "std::map<K,V>");
}

void QrexParser::CheckPlatformDependent() const {
  for (std::string_view word : kPlatformDependent) {
    if (Is(word)) Fail("Can't accept platform dependent type: " + std::string(word));
  }
}

// Optional `const`, the base type, then any of `*`, `const` and `: [metadata]`. The last suffix is the outermost.
std::optional<TypeCode> QrexParser::ParseSuffixedType(bool reflected) {
  const bool leadingConst = AcceptWord("const");
  std::optional<TypeCode> type = ParseBaseType(reflected);
  if (!type) return type;
  if (leadingConst) PrependOp(*type, kOpConst);
  for (;;) {
    if (Accept(kStar)) {
      PrependOp(*type, kOpPointer);
    } else if (AcceptWord("const")) {
      PrependOp(*type, kOpConst);
    } else if (Accept(kColon)) {
      std::string metadata;
      ParseMetadataBehindColon(metadata);
      type->insert(0, metadata);
    } else {
      return type;
    }
  }
}

std::optional<ParsedType> QrexParser::ParseTypeWithName(Naming naming, bool reflected) {
  const std::optional<TypeCode> base = ParseSuffixedType(reflected);
  if (!base) return std::nullopt;
  ParsedType parsed;
  const bool isReference = Accept(kAnd);
  if (naming != Naming::None) {
    if (Is(kIdentifier)) {
      parsed.name = ReadIdentifier();
    } else if (naming == Naming::Required) {
      FailExpected("identifier");
    }
    parsed.followedByParen = Is(kOpenParen);
  }
  parsed.nameEnd = previous.text.end;
  // The outer dimension comes first in the code; metadata behind a dimension goes before that dimension's code.
  TypeCode dimensions, dimension;
  while (Is(kOpenBracket) || Is(kColon)) {
    if (Accept(kColon)) {
      std::string metadata;
      ParseMetadataBehindColon(metadata);
      dimension.insert(0, metadata);
      continue;
    }
    if (isReference) Fail("Unexpected '[' : arrays on reference type are illegal");
    dimensions += dimension;
    dimension = ParseArraySuffix();
  }
  dimensions += dimension;
  if (isReference) {
    AppendOp(parsed.type, kOpReference);
  } else {
    parsed.suffixSize = dimensions.size();
  }
  parsed.type += dimensions;
  parsed.type += *base;
  return parsed;
}

TypeCode QrexParser::ParseArraySuffix() {
  TypeCode code;
  Advance();
  if (Accept(kCloseBracket)) {
    AppendOp(code, kOpDynArray);
    return code;
  }
  const int64_t size = ReadInt64();
  if (size <= 0 || static_cast<int32_t>(size) <= 0) Fail("Array size must be greater than zero");
  Expect(kCloseBracket, "]");
  AppendArray(code, static_cast<uint32_t>(size));
  return code;
}

// --- Signatures

namespace {

[[noreturn]] void FailAt(const char* position, std::string message) {
  throw LexScannerException(std::move(message), position);
}

// What a remote call needs of an argument in each direction.
void CheckDirection(const FunctionArg& arg, const char* position) {
  TypeView type = TypeView(arg.type).WithoutMetadata();
  const std::string& name = arg.name;
  const bool isReference = type.Op() == kOpReference;
  auto innerIsConst = [&] { return type.Inner().WithoutMetadata().Op() == kOpConst; };
  switch (arg.direction) {
    case ArgDirection::In:
      if (isReference) {
        type = type.Inner().WithoutMetadata();
        if (type.Op() != kOpConst) FailAt(position, "in parameter " + name + " passed by reference");
      }
      if (type.Op() == kOpConst) type = type.Inner().WithoutMetadata();
      if (type.Op() == kOpPointer) FailAt(position, "in parameter " + name + " : cannot marshall pointer type");
      break;
    case ArgDirection::Out:
    case ArgDirection::InOut:
      if (!isReference) FailAt(position, "out parameter " + name + " must be passed by reference");
      if (innerIsConst()) FailAt(position, "out parameter " + name + " cannot be passed by const reference");
      break;
    case ArgDirection::Copy:
      if (type.Op() != kOpPointer) FailAt(position, "copy parameter " + name + " must be passed by pointer");
      if (innerIsConst()) FailAt(position, "copy parameter " + name + " cannot be passed by pointer to const");
      type = type.Inner().WithoutMetadata();
      if (type.Op() == kOpReference) {
        FailAt(position, "'copy' parameter " + name + " : cannot marshall reference type");
      }
      if (type.Op() == kOpPointer) FailAt(position, "'copy' parameter " + name + " : cannot marshall pointer type");
      break;
    case ArgDirection::None:
      break;
  }
}

}  // namespace

FunctionArg QrexParser::ParseFunctionArg(const SignatureRules& rules) {
  FunctionArg arg;
  if (rules.directions) {
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
  std::optional<ParsedType> parsed = ParseTypeWithName(Naming::Required, rules.reflected);
  if (!parsed) Fail("Type expected when read " + Printed(current));
  arg.type = std::move(parsed->type);
  arg.name = std::move(parsed->name);
  CheckDirection(arg, position);
  return arg;
}

std::string QrexParser::ReadArgumentText() {
  TextRange argument;
  previous = current;
  current = ReadArgument(scanner, argument, kCloseParen);
  return argument.Text();
}

// From behind the `(` to behind the `)`.
std::vector<FunctionArg> QrexParser::ParseArguments(const SignatureRules& rules) {
  std::vector<FunctionArg> arguments;
  while (!Is(kCloseParen)) {
    const bool polymorphic = Is(kOpenBracket) && !rules.directions;
    if (polymorphic && !rules.polymorphic) Fail("'[' unexpected.  Polymorphic argument not allowed here");
    if (polymorphic) Advance();
    FunctionArg& arg = arguments.emplace_back(ParseFunctionArg(rules));
    arg.polymorphic = polymorphic;
    if (polymorphic) Expect(kCloseBracket, "]");
    if (Is(kAssign)) arg.defaultValue = ReadArgumentText();
    if (Is(kCloseParen)) break;
    if (!Accept(kComma)) Fail(", or ) expected in argument list when read " + Printed(current));
  }
  Advance();
  return arguments;
}

void QrexParser::ParseSignatureEnd(FunctionSignature& signature, const SignatureRules& rules) {
  if (Is("const")) {
    if (!rules.constAllowed) Fail("const specifier on global function prohibited");
    signature.isConst = true;
    Advance();
  }
  if (Accept(kColon) && Is(kOpenBracket)) ParseMetadataBehindColon(signature.metadata);
}

FunctionSignature QrexParser::ParseFunctionSignature(const SignatureRules& rules) {
  FunctionSignature signature;
  signature.isInline = AcceptWord("inline");
  std::optional<ParsedType> returned = ParseTypeWithName(Naming::None, rules.reflected);
  if (!returned || !Is(kIdentifier)) Fail("Function name expected when read " + Printed(current));
  signature.returnType = std::move(returned->type);
  signature.name = ReadIdentifier();
  Expect(kOpenParen, "(");
  signature.arguments = ParseArguments(rules);
  ParseSignatureEnd(signature, rules);
  return signature;
}

ParsedMember QrexParser::ParseMethodOrAttribute(const SignatureRules& rules) {
  ParsedMember member;
  FunctionSignature& signature = member.signature;
  signature.isInline = AcceptWord("inline");
  const char* const position = current.text.begin;
  std::optional<ParsedType> parsed = ParseTypeWithName(Naming::Required, rules.reflected);
  if (!parsed) Fail("Type expected when read " + Printed(current));
  signature.returnType = std::move(parsed->type);
  signature.name = std::move(parsed->name);
  member.isAttribute = !parsed->followedByParen;
  if (member.isAttribute) return member;
  if (rules.directions && !IsVoid(signature.returnType)) {
    FailAt(position, "Return type " + TypeText(signature.returnType) + " invalid - must be void");
  }
  Expect(kOpenParen, "(");
  signature.arguments = ParseArguments(rules);
  ParseSignatureEnd(signature, rules);
  return member;
}

// --- Metadata

// Values separated by `,` up to `close`, which is passed; their number.
size_t QrexParser::ParseMetadataValues(std::string& metadata, int32_t close, std::string_view expected,
                                       std::string_view exceeded) {
  NestingGuard guard(*this);
  size_t count = 0;
  for (; !Is(close); ++count) {
    if (count == kMaxMetadataValues) Fail(std::string(exceeded));
    ParseMetadataValue(metadata);
    if (Is(close)) continue;
    if (!Accept(kComma)) Fail(std::string(expected) + Printed(current));
  }
  Advance();
  return count;
}

void QrexParser::ParseMetadataList(std::string& metadata) {
  Expect(kOpenBracket, "[");
  std::string values;
  const size_t count = ParseMetadataValues(values, kCloseBracket, ", or ] expected in meta-data list when read ",
                                           "Maximum list size exceeded");
  AppendMetadataList(metadata, count, values);
}

void QrexParser::ParseMetadataBehindColon(std::string& metadata) {
  const char* const colon = previous.text.begin;
  ParseMetadataList(metadata);
  if (WantsCompilableText()) m_uncopied.emplace_back(colon, previous.text.end);
}

void QrexParser::ParseMetadataValue(std::string& metadata) {
  if (Is(kOpenBracket)) return ParseMetadataList(metadata);
  if (Is(kIdentifier) && !Is("true") && !Is("false")) {
    const std::string name = ReadIdentifier();
    std::string values;
    size_t count = 0;
    if (Accept(kOpenParen)) {
      count = ParseMetadataValues(values, kCloseParen, ", or ) expected in functor arglist when read ",
                                  "Maximum functor arglist size exceeded");
    }
    return AppendMetadataFunctor(metadata, name, count, values);
  }
  Literal value;
  ParseExpression(value);
  switch (value.kind) {
    case LiteralKind::Bool:
      AppendMetadataBool(metadata, value.boolean);
      break;
    case LiteralKind::Int64:
      if (value.integer < std::numeric_limits<int32_t>::min() || value.integer > std::numeric_limits<int32_t>::max()) {
        Fail("64-bit integer metadata not supported");
      }
      AppendMetadataInt(metadata, static_cast<int32_t>(value.integer));
      break;
    case LiteralKind::Float64:
      AppendMetadataFloat(metadata, value.real);
      break;
    case LiteralKind::String:
      AppendMetadataString(metadata, value.text);
      break;
    default:
      Fail("unsupported literal: " + Printed(current));
  }
}

}  // namespace qrex
