// The expression language: values by their text, failures by their message.

#include "expand_fixture.h"
#include "macro/expression_parser.h"
#include "message_of.h"

namespace qrex {

// The value as text by explicit conversion, or the error's message.
std::string Evaluate(const std::string& text) {
  return MessageOf([&] {
    ExpressionParser parser;
    parser.SetInput(TextRange(std::string_view(text)));
    const std::string value = parser.ReadStringValue(true);
    return parser.current.kind == kEndOfText ? value : value + " then " + Printed(parser.current);
  });
}

struct Evaluation {
  const char* expression;
  const char* result;
};

void AssertTrue(std::initializer_list<const char*> expressions) {
  for (const char* expression : expressions) EXPECT_EQ("true", Evaluate(expression)) << expression;
}

template <size_t N>
void AssertEvaluate(const Evaluation (&cases)[N]) {
  for (const Evaluation& evaluation : cases) {
    EXPECT_EQ(evaluation.result, Evaluate(evaluation.expression)) << evaluation.expression;
  }
}

TEST(ExpressionTest, Precedence) {
  AssertTrue({
      "1 + 2 * 3 == 7 && (1 + 2) * 3 == 9 && 10 - 4 - 3 == 3 && 2 * 3 ^^ 2 == 18 && 1 << 2 < 5",
      "-2 ^^ 2 == 4 && 2 ^^ 3 ^^ 2 == 64 && (1 | 6 ^ 3 & 2) == 5 && (1 + 2 << 3) == 24 && 1 < 2 == true",
      "true || false && false",
      "(false ? 1 : true ? 2 : 3) == 2 && (true ? false ? 1 : 2 : 3) == 2",
      "- - ~0 == -1 && !false && !(1 == 2) && 1 // c\n + /* c */ 1 == 2",
  });
}

TEST(ExpressionTest, Arithmetic) {
  AssertTrue({
      "7 / 2 == 3 && -7 / 2 == -3 && -7 % 2 == -1 && 7 % -2 == 1 && 7.0 / 2 == 3.5 && 1 + 2.5 == 3.5",
      "is_int(2 ^^ 10) && 2 ^^ 10 == 1024 && is_double(2.0 ^^ 10) && 2 ^^ -1 == 0 && 0 ^^ 0 == 1",
      "1 << 64 == 1 && -1 >> 1 == -1 && (6 & 3 | 8) == 10 && 18446744073709551616 == 0 && 0X1F + 007 == 38",
      "(9223372036854775807 + 1) / -1 == 9223372036854775807 + 1 && (9223372036854775807 + 1) % -1 == 0",
  });
  AssertEvaluate({
      {"9223372036854775807 + 1", "-9223372036854775808"},
      {"0.1", "0.10000000000000000555"},
      {"1e21 * 10", "1e+22"},
      {"0 ^^ -1", "Calculation 0 ^^ -1 ill defined"},
      {"0.0 ^^ -1.5", "Calculation 0 ^^ -1.5 ill defined"},
      {"1 / 0", "Division by zero error"},
      {"1 % 0", "Modulo zero error"},
      {"1.0 / 0", "Division by zero"},
      {"true || (1 / 0 == 0)", "Division by zero error"},
      {"true ? 1 : 1 / 0", "Division by zero error"},
      {"7.5 % 2", "Incompatible types (float64 and int64) for % operation"},
      {"true << 1", "Incompatible types (bool and int64) for << operation"},
      {"\"a\" ^^ 2", "Incompatible types (string and int64) for ^ operation"},
      {"1.5 ^ 2", "Incompatible types (float64 and int64) for ^ operation"},
      {"+true", "Incompatible type (bool) for unary + operation"},
      {"~1.5", "Incompatible type (float64) for unary ~ operation"},
      {"!0", "No implicit conversion from int64 to bool"},
  });
}

TEST(ExpressionTest, StringsAndComparisons) {
  AssertTrue({
      "\"a\" + 'b' == 'ab' && \"abc\"[0] + \"d\" == 'ad' && 'abc'[1] == 'b' && (\"ab\" + \"cd\")[1 + 1] == 'c'",
      "len(\"a\\tb\\x41\") + len(r\"a\\t\") == 7 && (bool(1) ? 2 : 3) == 2 && (true || 1) && !(false && 1)",
      "\"a\" < \"b\" && \"a\" < \"ab\" && \"B\" < \"a\" && 'b' >= \"abc\"[1] && \"\\xff\" > \"a\"",
      "1 == 1.0 && true != false && \"A\"[0] == \"A\" && 65 == \"A\"[0]",
  });
  AssertEvaluate({
      {"\"abc\"[3]", "Index 3 out of range [0,3) on string"},
      {"\"abc\"[-1]", "Index -1 out of range [0,3) on string"},
      {"\"abc\"[\"a\"]", "No conversion from string to int64"},
      {"\"abc\"[3000000000]", "No implicit conversion from value 3000000000 to int32"},
      {"1[0]", "[] not available on int64"},
      {"len(1)", "len() not available on int64"},
      {"\"a\" + 1", "Incompatible types (string and int64) for + operation"},
      {"true < false", "Incompatible types (bool and bool) for comparison operation"},
      {"300 == \"A\"[0]", "Incompatible types (int64 and char) for comparison operation"},
      {"1 == true", "Incompatible types (int64 and bool) for comparison operation"},
      {"1 > \"a\"", "Incompatible types (string and int64) for comparison operation"},
      {"false || 1", "No implicit conversion from int64 to bool"},
      {"\"a\" && true", "No conversion from string to bool"},
      {"1 ? 2 : 3", "No implicit conversion from int64 to bool"},
  });
}

TEST(ExpressionTest, WordsAndConversions) {
  AssertTrue({
      "char(321) + char(\"A\") + char('B') == 'AAB' && int(3.9) + int(-3.9) + int(true) + int(\"A\"[0]) == 66",
      "string(1.5) + string(true) + string(-7) + string('c') == '1.5true-7c' && !bool(0.0)",
      "double(true) + double(1) == 2 && sin(0) + cos(0) + tan(0) + exp(0) + log(1) == 2",
      "is_bool(true) && is_int(1) && is_double(1.0) && is_string('a') && is_char('a'[0]) && !is_char('a')",
      "len(__FILE__) + __LINE__ == 0",
  });
  AssertEvaluate({
      {"char(\"AB\")", "No implicit conversion from value AB to char"},
      {"char(1.5)", "No conversion from float64 to char"},
      {"int(\"3\")", "No conversion from string to int64"},
      {"bool(\"x\")", "No conversion from string to bool"},
      {"double(\"A\"[0])", "No conversion from char to float64"},
      {"log(0)", "Can't take log of value 0"},
      {"sin(true)", "No implicit conversion from bool to float64"},
      {"len 1", "Expected ( after len when read 1"},
      {"len(\"a\"", "Expected ) after \"a\" when read EOS"},
  });
}

TEST(ExpressionTest, Syntax) {
  AssertEvaluate({
      {"", "Unexpected EOS after EOS in expression"},
      {"1 +", "Unexpected EOS after + in expression"},
      {"x = 1", "Unexpected x after EOS in expression"},
      {"1 = 2", "Can't assign to int64 r-value"},
      {"'a' += 'b'", "Can't assign to string r-value"},
      {"1 += 'b'", "Incompatible types (int64 and string) for + operation"},
      {"(1", "Expected ) after 1 when read EOS"},
      {"\"a\".b", "Dot operator currently not supported"},
      {"\"a\"(1)", "Function application currently not supported"},
      {"1 $ 2", "1 then $"},
      {"is_float(1)", "Unexpected is_float after EOS in expression"},
  });
}

TEST(ExpressionTest, TypedReaders) {
  const auto read = [](const std::string& text, auto reader) {
    ExpressionParser parser;
    parser.SetInput(TextRange(std::string_view(text)));
    return MessageOf([&] { return std::to_string(reader(parser)); });
  };
  EXPECT_EQ("-128", read("-128", [](auto& parser) { return parser.ReadInt8(); }));
  EXPECT_EQ("No implicit conversion from value 128 to int8", read("128", [](auto& p) { return p.ReadInt8(); }));
  EXPECT_EQ("-128", read("128", [](auto& parser) { return parser.ReadInt8(true); }));
  EXPECT_EQ("No implicit conversion from value -1 to uint16", read("-1", [](auto& p) { return p.ReadUInt16(); }));
  EXPECT_EQ("18446744073709551615", read("-1", [](auto& parser) { return parser.ReadUInt64(); }));
  EXPECT_EQ("No implicit conversion from bool to int64", read("true", [](auto& parser) { return parser.ReadInt32(); }));
  EXPECT_EQ("97", read("'a'", [](auto& parser) { return parser.ReadChar(); }));
  EXPECT_EQ("0.500000", read("0.5", [](auto& parser) { return parser.ReadFloat32(); }));
  EXPECT_EQ("No conversion from string to float32", read("'a'", [](auto& parser) { return parser.ReadFloat32(); }));
}

}  // namespace qrex
