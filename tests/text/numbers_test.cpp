// Numbers to text and back, the compact length, small string operations.

#include "text/numbers.h"

#include <gtest/gtest.h>

namespace qrex {

template <typename T>
std::string Parse(const std::string& text, int radix = 10) {
  T value{};
  std::string error;
  return ParseNumber(text, value, error, radix) ? ToString(value + 0) : error + " " + ToString(value + 0);
}

std::string ParseReal(const std::string& text) {
  double value = 0;
  std::string error;
  return ParseFloat(text, value, error) ? ToString(value) : error;
}

TEST(NumbersTest, ToText) {
  EXPECT_EQ("0.1000000015", ToString(0.1f));
  EXPECT_EQ("0.10000000000000000555", ToString(0.1));
  EXPECT_EQ("1.5", ToString(1.5));
  EXPECT_EQ("-9223372036854775808", ToString(int64_t{INT64_MIN}));
  EXPECT_EQ("18446744073709551615", ToString(UINT64_MAX));
}

TEST(NumbersTest, FromText) {
  EXPECT_EQ("42", Parse<int32_t>("  42"));
  EXPECT_EQ("-42", Parse<int64_t>("\r\n\t-42"));
  EXPECT_EQ("255", Parse<uint8_t>("fF", 16));
  EXPECT_EQ("18446744073709551615", Parse<uint64_t>("18446744073709551615"));
  for (const std::string& text : {std::string("42 "), std::string("\v42"), std::string("x"), std::string("4\0", 2)}) {
    EXPECT_EQ("String doesn't represent a number 0", Parse<int32_t>(text)) << text;
  }
  for (const char* text : {"", " \n"}) EXPECT_EQ("Empty string 0", Parse<int32_t>(text));
  EXPECT_EQ("Out of range 44", Parse<uint8_t>("300"));
  EXPECT_EQ("Out of range 255", Parse<uint8_t>("-1"));
  EXPECT_EQ("Out of range -128", Parse<int8_t>("128"));
  EXPECT_EQ("Out of range 4294967295", Parse<uint32_t>("-1"));
  EXPECT_EQ("Out of range -2147483648", Parse<int32_t>("2147483648"));
  EXPECT_EQ("0.25", ParseReal(" 2.5e-1"));
  EXPECT_EQ("Empty string", ParseReal(" "));
  EXPECT_EQ("String doesn't represent a floating point number", ParseReal("1.5x"));
  float narrow;
  std::string error;
  EXPECT_TRUE(ParseFloat("0.1", narrow, error));
  EXPECT_EQ(0.1f, narrow);
}

TEST(NumbersTest, CompactLength) {
  const struct {
    uint64_t value;
    std::string bytes;
  } cases[] = {
      {0, std::string(1, '\0')},
      {127, "\x7f"},
      {128, "\x80\x80"},
      {0x3fff, "\xbf\xff"},
      {0x4000, std::string("\xc0\x40\x00", 3)},
      {0x1fffff, "\xdf\xff\xff"},
      {0x200000, std::string("\xe0\x20\x00\x00", 4)},
      {0xfffffff, "\xef\xff\xff\xff"},
      {0x10000000, std::string("\xf0\x10\x00\x00\x00", 5)},
      {0xffffffff, "\xf0\xff\xff\xff\xff"},
  };
  for (const auto& [value, bytes] : cases) {
    std::string out;
    AppendCompactLength(out, value);
    EXPECT_EQ(bytes, out) << value;
    std::string_view in = out;
    uint64_t read = 1;
    EXPECT_TRUE(ReadCompactLength(in, read));
    EXPECT_EQ(value, read);
    EXPECT_TRUE(in.empty());
    for (size_t size = 0; size < out.size(); ++size) {
      in = std::string_view(out).substr(0, size);
      EXPECT_FALSE(ReadCompactLength(in, read));
    }
  }
  std::string out;
  AppendCompactString(out, "ab");
  std::string_view in = out, text;
  EXPECT_TRUE(ReadCompactString(in, text));
  EXPECT_EQ("ab", text);
  in = "\3ab";
  EXPECT_FALSE(ReadCompactString(in, text));
}

TEST(NumbersTest, Strings) {
  std::vector<std::string> pieces{"old"};
  SplitString(";;a;b,c;", pieces, ";,");
  EXPECT_EQ((std::vector<std::string>{"a", "b", "c"}), pieces);
  SplitString("", pieces, ";");
  EXPECT_TRUE(pieces.empty());
  std::string text;
  ReplaceChar("a-b-", text, '-', '+');
  EXPECT_EQ("a+b+", text);
  ReplaceAll("aaa", text, "aa", "aab");
  EXPECT_EQ("aaba", text);
  ReplaceAllInPlace(text, "a", "");
  EXPECT_EQ("b", text);
  ReplaceAllInPlace(text, "", "x");
  EXPECT_EQ("b", text);
  text = "aZ[\xc3\x84";
  ToUpper(text);
  EXPECT_EQ("AZ[\xc3\x84", text);
  ToLower(text);
  EXPECT_EQ("az[\xc3\x84", text);
}

}  // namespace qrex
