// Tokens, literals and the readers of sections.

#include "lex/scanner.h"

#include <gtest/gtest.h>

#include "lex/cpp_literals.h"
#include "lex/literals.h"
#include "lex/sections.h"
#include "text_cases.h"

namespace qrex {

// The message and the offset of a failure; else what `read` answers.
template <typename Read>
std::string Outcome(const std::string& text, Read read, Dialect dialect = Dialect::Qrex) {
  LexScanner scanner(std::string_view(text), dialect);
  try {
    return read(scanner);
  } catch (const LexScannerException& exception) {
    return exception.message + " at " + std::to_string(exception.position - text.data());
  }
}

// Each token as kind (10000 left out) and text; a failure ends the list.
std::string Tokens(const std::string& text, bool keepComments = false, Dialect dialect = Dialect::Qrex) {
  std::string tokens;
  const auto list = [&](LexScanner& scanner) {
    for (LexToken token; (token = NextToken(scanner, keepComments)).kind != kEndOfText;) {
      tokens += (tokens.empty() ? "" : "  ") + std::to_string(token.kind - 10000) + " " + token.text.Text();
    }
    return std::string();
  };
  const std::string end = Outcome(text, list, dialect);
  return end.empty() ? tokens : tokens + "  !" + end;
}

TEST(ScannerTest, Tokens) {
  for (const auto& [name, text, tokens] : TextCasesOf("lex/cases/tokens.txt")) EXPECT_EQ(tokens, Tokens(text)) << name;
  for (const auto& [name, text, tokens] : TextCasesOf("lex/cases/cpp_tokens.txt")) {
    EXPECT_EQ(tokens, Tokens(text, false, Dialect::Cpp)) << name;
  }
}

TEST(ScannerTest, WordsAndComments) {
  EXPECT_EQ("8 a  1 //b  8 c  1 /* * /\n*/  32 /", Tokens("a//b\nc/* * /\n*/ /", true));
  LexScanner scanner;
  EXPECT_EQ(kEndOfText, NextToken(scanner).kind);
  EXPECT_EQ(kEndOfText, NextToken(scanner).kind);
}

TEST(ScannerTest, Numbers) {
  const auto token = [](const char* text) { return LexToken{kDecimal, TextRange(std::string_view(text))}; };
  EXPECT_EQ(7u, DecimalValue64(token("007")));
  EXPECT_EQ(0u, DecimalValue64(token("18446744073709551616")));
  EXPECT_EQ(1u, DecimalValue32(token("4294967297")));
  EXPECT_EQ(31u, HexValue64(token("0X1F")));
  EXPECT_EQ(1u, HexValue64(token("0xF0000000000000001")));
  EXPECT_EQ(0.125, FloatValue(token("1.25e-1")));
}

TEST(ScannerTest, Strings) {
  const auto decode = [](const char* text, int32_t kind = kDoubleQuoted) {
    std::string decoded = "old";
    DecodeString({kind, TextRange(std::string_view(text))}, decoded);
    return decoded;
  };
  EXPECT_EQ("a\tbA", decode("\"a\\tb\\x41\""));
  EXPECT_EQ("\r\n\a\b\f\t\v\"\\'?", decode("'\\r\\n\\a\\b\\f\\t\\v\\\"\\\\\\'\\?'", kSingleQuoted));
  EXPECT_EQ(std::string(1, '\0'), decode("\"\\0\""));
  EXPECT_EQ("a\\x", decode("r\"a\\x\""));

  EXPECT_EQ("\\t\\0\\xc8\\?\\\\\\\"\\'a~\\x7f", EscapedString(std::string("\t\0\xc8?\\\"'a~\x7f", 10)));
}

TEST(ScannerTest, QuotedText) {
  for (const auto& [name, text, expected] : TextCasesOf("lex/cases/quoted_text.txt")) {
    EXPECT_EQ(expected, Outcome(text, [](LexScanner& scanner) {
                std::string out;
                ReadQuotedText(scanner, out);
                return out + " up to " + scanner.Text();
              }));
  }
}

TEST(ScannerTest, LinesAndEquality) {
  const std::string text = "a\n\nb";
  const TextRange range{std::string_view(text)};
  EXPECT_EQ(1, LineOfPosition(range, text.data() + 1));
  EXPECT_EQ(2, LineOfPosition(range, text.data() + 2));
  EXPECT_EQ(3, LineOfPosition(range, text.data() + 4));
  EXPECT_EQ(-1, LineOfPosition(range, text.data() + 5));
  const auto same = [](std::string_view a, std::string_view b) { return SameTokens(LexScanner(a), LexScanner(b)); };
  EXPECT_TRUE(same("a +b // c", "a\n+ /* d */ b"));
  EXPECT_FALSE(same("a b", "a"));
  EXPECT_FALSE(same("a", "a b"));
  EXPECT_FALSE(same("\"a\"", "'a'"));
}

TEST(ScannerTest, Parser) {
  ParserBase parser;
  const auto fails = [&](std::string_view text, auto act) {
    return Outcome(std::string(text), [&](LexScanner& scanner) {
      parser = ParserBase();
      parser.SetInput(scanner);
      return act(), std::string("none");
    });
  };
  EXPECT_EQ("Expected { after EOS when read a at 0", fails("a", [&] { parser.Expect(kOpenBrace, "{"); }));
  EXPECT_EQ("Expected identifier after a when read EOS at 1", fails("a", [&] {
              EXPECT_EQ("a", parser.ReadIdentifier());
              parser.ReadIdentifier();
            }));
  EXPECT_EQ("none", fails("{", [&] { parser.Expect(kOpenBrace, "{"); }));
  EXPECT_EQ(kOpenBrace, parser.previous.kind);

  const auto printed = [](const char* file, int64_t line) {
    LexScannerException exception("no", nullptr);
    exception.file = file;
    exception.line = line;
    return ExceptionText(exception);
  };
  EXPECT_EQ("a(3) : error : no", printed("a", 3));
  EXPECT_EQ("a : error : no", printed("a", -1));
  EXPECT_EQ("Line 3: error : no", printed("", 3));
  EXPECT_EQ("error : no", printed("", -1));
}

// --- Sections

TEST(SectionsTest, Blocks) {
  const auto block = [](const std::string& text, bool paren = false) {
    return Outcome(text, [&](LexScanner& scanner) {
      int indent = -1;
      const TextRange range = paren ? ReadParenBlock(scanner, indent) : ReadBraceBlock(scanner, indent);
      return std::to_string(indent) + "<" + range.Text() + ">" + scanner.Text();
    });
  };
  EXPECT_EQ("0< x >;", block("  { x };"));
  EXPECT_EQ("0<x + y // c>\nz", block(" x + y // c\nz"));
  EXPECT_EQ("0</* c\nd */ x>\nz", block(" /* c\nd */ x\nz"));
  EXPECT_EQ("0<  a\n  >\n", block("{\r\n  a\n  }\n"));
  EXPECT_EQ("4<a\n      b>\n", block("\n  {\n    a\n      b\n  }\n"));
  EXPECT_EQ("5<a\r\n\tb>", block("\r\n{\r\n\t a\r\n\tb\r\n}"));
  EXPECT_EQ("0<>x", block("\n{\n}x"));
  EXPECT_EQ("0<{}>", block("{{}}"));
  EXPECT_EQ("Expected { when read x at 1", block("\nx"));
  EXPECT_EQ("Expected ( when read x at 0", block("x", true));
  EXPECT_EQ("Met EOS while reading bracketted string at 4", block("(a()", true));
  EXPECT_EQ("Met EOS before closing } at 3", block("\n{ "));
}

// C++ text: what a compiler takes is a token, and nothing that it would skip fails.
TEST(CppScannerTest, Numbers) {
  const auto value = [](const char* text, int32_t kind) {
    return IntegerValue({kind, TextRange(std::string_view(text))}, Dialect::Cpp);
  };
  EXPECT_EQ(1000u, value("1'000ull", kDecimal));
  EXPECT_EQ(5u, value("0b1'01", kDecimal));
  EXPECT_EQ(8u, value("010", kDecimal));
  EXPECT_EQ(0u, value("0", kDecimal));
  EXPECT_EQ(255u, value("0xF'Fu", kHex));
  EXPECT_THROW(value("10_km", kDecimal), LexScannerException);
  EXPECT_EQ(1000.5, FloatValue({kFloat, TextRange(std::string_view("1'000.5f"))}, Dialect::Cpp));
}

TEST(CppScannerTest, Strings) {
  const auto decode = [](const std::string& text, int32_t kind = kDoubleQuoted) {
    std::string decoded = "old";
    DecodeString({kind, TextRange(std::string_view(text))}, Dialect::Cpp, decoded);
    return decoded;
  };
  EXPECT_EQ("a\tAA\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80q\"b",
            decode("u8\"a\\t\\101\\x41\\u00e9\\u20AC\\U0001F600\\q\\\"\\\nb\""));
  EXPECT_EQ("a)\"\\n", decode("LR\"x(a)\"\\n)x\"", kRawString));
  EXPECT_EQ("", decode("R\"()\"", kRawString));
}

TEST(CppScannerTest, Sections) {
  const std::string text = "R\"(})\" '}' } rest";
  LexScanner scanner(std::string_view(text), Dialect::Cpp);
  EXPECT_EQ("R\"(})\" '}'", ReadSection(scanner, true, kOpenBrace, kCloseBrace).Text());
  const std::string line = "a R\"(\n)\" b\nc";
  LexScanner ofLine(std::string_view(line), Dialect::Cpp);
  int indent;
  EXPECT_EQ("a R\"(\n)\" b", ReadBraceBlock(ofLine, indent).Text());
}

}  // namespace qrex
