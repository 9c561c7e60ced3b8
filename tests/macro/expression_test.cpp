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

TEST(ExpressionTest, Cases) {
  for (const auto& [name, input, expected] : TextCasesOf("macro/cases/expressions.txt"))
    EXPECT_EQ(expected, Evaluate(input)) << input;
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
