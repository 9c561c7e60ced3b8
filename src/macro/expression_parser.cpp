#include "macro/expression_parser.h"

#include "lex/cpp_literals.h"
#include "platform/arithmetic.h"
#include "platform/system.h"
#include "text/numbers.h"

namespace qrex {

namespace {

constexpr int kMaxNesting = 1000;

// The left-associative levels, the loosest first.
struct Level {
  int32_t operators[4];
};
constexpr Level kLevels[] = {
    {{kOrOr}},
    {{kAndAnd}},
    {{kOr}},
    {{kXor}},
    {{kAnd}},
    {{kEqual, kNotEqual}},
    {{kLess, kGreater, kLessEqual, kGreaterEqual}},
    {{kShiftLeft, kShiftRight}},
    {{kPlus, kMinus}},
    {{kStar, kSlash, kPercent}},
    {{kXorXor}},
};
constexpr int kLevelCount = static_cast<int>(std::size(kLevels));

bool HasOperator(const Level& level, int32_t kind) {
  for (int32_t op : level.operators) {
    if (op == kind && op != 0) return true;
  }
  return false;
}

// The operator of a compound assignment; kNoToken for `=`, 0 for no assignment.
int32_t AssignedOperator(int32_t kind) {
  switch (kind) {
    case kAssign:
      return kNoToken;
    case kPlusAssign:
      return kPlus;
    case kMinusAssign:
      return kMinus;
    case kStarAssign:
      return kStar;
    case kSlashAssign:
      return kSlash;
    case kPercentAssign:
      return kPercent;
    case kAndAssign:
      return kAnd;
    case kOrAssign:
      return kOr;
    case kXorAssign:
      return kXor;
    case kShiftLeftAssign:
      return kShiftLeft;
    case kShiftRightAssign:
      return kShiftRight;
    case kAndAndAssign:
      return kAndAnd;
    case kOrOrAssign:
      return kOrOr;
    case kXorXorAssign:
      return kXorXor;
    default:
      return 0;
  }
}

}  // namespace

// One method per level of the grammar. Everything is evaluated while it is read; nothing short-circuits.
struct ExpressionGrammar {
  ExpressionParser& parser;

  struct Nesting {
    explicit Nesting(ExpressionGrammar& grammar) : depth(grammar.parser.m_depth) {
      if (depth >= kMaxNesting || platform::IsStackShort()) {
        throw LexScannerException("Expression nested too deeply", grammar.parser.current);
      }
      ++depth;
    }
    ~Nesting() { --depth; }
    int& depth;
  };

  int32_t Kind() const { return parser.current.kind; }

  Literal Assignment() {
    Nesting nesting(*this);
    Literal value = Conditional();
    while (const int32_t op = AssignedOperator(Kind())) {
      parser.Advance();
      Literal right = Conditional();
      if (op != kNoToken) ApplyBinary(op, value, right);
      FailAssign(value);
    }
    return value;
  }

  Literal Conditional() {
    Literal condition = Binary(0);
    if (Kind() != kQuestion) return condition;
    Nesting nesting(*this);
    parser.Advance();
    Literal whenTrue = Assignment();
    parser.Expect(kColon, ":");
    Literal whenFalse = Conditional();
    bool holds;
    AsBool(condition, holds, false);
    return holds ? whenTrue : whenFalse;
  }

  // Precedence climbing: one call for all levels that have no operator.
  Literal Binary(int level) {
    Literal left = Unary();
    for (;;) {
      int found = kLevelCount - 1;
      while (found >= level && !HasOperator(kLevels[found], Kind())) --found;
      if (found < level) return left;
      const int32_t op = Kind();
      parser.Advance();
      Literal right = Binary(found + 1);
      left = ApplyBinary(op, left, right);
    }
  }

  Literal Unary() {
    const int32_t op = Kind();
    if (op != kPlus && op != kMinus && op != kTilde && op != kNot) return Postfix();
    Nesting nesting(*this);
    parser.Advance();
    return ApplyUnary(op, Unary());
  }

  Literal Postfix() {
    Literal value = Primary();
    for (;;) {
      if (Kind() == kDot || Kind() == kOpenParen) {
        const bool isDot = Kind() == kDot;
        parser.Advance();
        throw LexScannerException(
            isDot ? "Dot operator currently not supported" : "Function application currently not supported",
            parser.current);
      }
      if (Kind() != kOpenBracket) return value;
      parser.Advance();
      const Literal index = Assignment();
      value = ApplyIndex(value, index);
      parser.Expect(kCloseBracket, "]");
    }
  }

  Literal Primary() {
    const LexToken token = parser.current;
    switch (token.kind) {
      case kDecimal:
      case kHex:
        parser.Advance();
        return Literal::OfInt(static_cast<int64_t>(IntegerValue(token, parser.scanner.dialect)));
      case kFloat:
        parser.Advance();
        return Literal::OfFloat(FloatValue(token, parser.scanner.dialect));
      case kSingleQuoted:
      case kDoubleQuoted:
      case kRawString: {
        std::string text;
        DecodeString(token, parser.scanner.dialect, text);
        parser.Advance();
        return Literal::OfString(std::move(text));
      }
      case kOpenParen: {
        parser.Advance();
        Literal value = Assignment();
        parser.Expect(kCloseParen, ")");
        return value;
      }
      case kIdentifier:
        return Word();
      default:
        FailUnexpected();
    }
  }

  [[noreturn]] void FailUnexpected() {
    throw LexScannerException(
        "Unexpected " + Printed(parser.current) + " after " + Printed(parser.previous) + " in expression",
        parser.current);
  }

  Literal Word() {
    static constexpr struct {
      std::string_view word;
      Literal (*apply)(const Literal& argument);
    } kFunctions[] = {
        {"len", ApplyLen},
        {"is_bool", IsKind<LiteralKind::Bool>},
        {"is_char", IsKind<LiteralKind::Char>},
        {"is_int", IsKind<LiteralKind::Int64>},
        {"is_double", IsKind<LiteralKind::Float64>},
        {"is_string", IsKind<LiteralKind::String>},
        {"bool", ToBool},
        {"char", ToChar},
        {"int", ToInt},
        {"double", ToDouble},
        {"string", ToText},
        {"sin", Real<platform::Sine>},
        {"cos", Real<platform::Cosine>},
        {"tan", Real<platform::Tangent>},
        {"exp", Real<platform::Exponential>},
        {"log", Log},
    };
    const LexToken token = parser.current;
    if (token.Is("true") || token.Is("false")) {
      parser.Advance();
      return Literal::OfBool(token.Is("true"));
    }
    if (token.Is("__FILE__")) {
      parser.Advance();
      return Literal::OfString({});
    }
    if (token.Is("__LINE__")) {
      parser.Advance();
      return Literal::OfInt(0);
    }
    for (const auto& function : kFunctions) {
      if (!token.Is(function.word)) continue;
      parser.Advance();
      parser.Expect(kOpenParen, "(");
      const Literal argument = Assignment();
      Literal result = function.apply(argument);
      parser.Expect(kCloseParen, ")");
      return result;
    }
    FailUnexpected();
  }

  template <LiteralKind kind>
  static Literal IsKind(const Literal& value) {
    return Literal::OfBool(value.kind == kind);
  }
  static Literal ToBool(const Literal& value) {
    bool out;
    AsBool(value, out, true);
    return Literal::OfBool(out);
  }
  static Literal ToChar(const Literal& value) {
    unsigned char out;
    AsChar(value, out, true);
    return Literal::OfChar(out);
  }
  static Literal ToInt(const Literal& value) {
    int64_t out;
    AsInt64(value, out, true);
    return Literal::OfInt(out);
  }
  static Literal ToDouble(const Literal& value) {
    double out;
    AsFloat64(value, out, true);
    return Literal::OfFloat(out);
  }
  static Literal ToText(const Literal& value) {
    std::string out;
    AsString(value, out, true);
    return Literal::OfString(std::move(out));
  }
  template <double (*function)(double)>
  static Literal Real(const Literal& value) {
    double out;
    AsFloat64(value, out, false);
    return Literal::OfFloat(function(out));
  }
  static Literal Log(const Literal& value) {
    double out;
    AsFloat64(value, out, false);
    if (!(out > 0)) {
      MemoryTextWriter text;
      text << "Can't take log of value " << out;
      throw LiteralException(text.TakeText());
    }
    return Literal::OfFloat(platform::Logarithm(out));
  }
};

void ExpressionParser::ParseExpression(Literal& out) {
  try {
    out = ExpressionGrammar{*this}.Assignment();
  } catch (const LiteralException& exception) {
    throw LexScannerException(exception.message, current);
  }
}

namespace {

template <typename T, bool (*convert)(const Literal&, T&, bool, bool)>
T ReadAs(ExpressionParser& parser, std::string_view what, bool isExplicit) {
  Literal value;
  parser.ParseExpression(value);
  if (value.kind == LiteralKind::Undefined) {
    throw LexScannerException("Expected " + std::string(what) + " when read " + Printed(parser.current),
                              parser.current);
  }
  try {
    T out{};
    convert(value, out, isExplicit, true);
    return out;
  } catch (const LiteralException& exception) {
    throw LexScannerException(exception.message, parser.current);
  }
}

// A string of length 1 gives its character also without `explicit`.
bool AsReadChar(const Literal& value, unsigned char& out, bool isExplicit, bool throwOnFailure) {
  const bool isCharacter = value.kind == LiteralKind::String && value.text.size() == 1;
  return AsChar(value, out, isExplicit || isCharacter, throwOnFailure);
}

}  // namespace

bool ExpressionParser::ReadBool(bool e) { return ReadAs<bool, AsBool>(*this, "bool", e); }
unsigned char ExpressionParser::ReadChar(bool e) { return ReadAs<unsigned char, AsReadChar>(*this, "character", e); }
int8_t ExpressionParser::ReadInt8(bool e) { return ReadAs<int8_t, AsInt8>(*this, "int8", e); }
int16_t ExpressionParser::ReadInt16(bool e) { return ReadAs<int16_t, AsInt16>(*this, "int16", e); }
int32_t ExpressionParser::ReadInt32(bool e) { return ReadAs<int32_t, AsInt32>(*this, "int32", e); }
int64_t ExpressionParser::ReadInt64(bool e) { return ReadAs<int64_t, AsInt64>(*this, "int64", e); }
uint8_t ExpressionParser::ReadUInt8(bool e) { return ReadAs<uint8_t, AsUInt8>(*this, "uint8", e); }
uint16_t ExpressionParser::ReadUInt16(bool e) { return ReadAs<uint16_t, AsUInt16>(*this, "uint16", e); }
uint32_t ExpressionParser::ReadUInt32(bool e) { return ReadAs<uint32_t, AsUInt32>(*this, "uint32", e); }
uint64_t ExpressionParser::ReadUInt64(bool e) { return ReadAs<uint64_t, AsUInt64>(*this, "uint64", e); }
float ExpressionParser::ReadFloat32(bool e) { return ReadAs<float, AsFloat32>(*this, "float32", e); }
double ExpressionParser::ReadFloat64(bool e) { return ReadAs<double, AsFloat64>(*this, "float64", e); }
std::string ExpressionParser::ReadStringValue(bool e) { return ReadAs<std::string, AsString>(*this, "string", e); }

}  // namespace qrex
