// Scanner, literals and sections.
#include "fuzz/fuzz_world.h"
#include "lex/literals.h"
#include "lex/sections.h"

using namespace qrex;

namespace {

void Decode(const LexToken& token) {
  std::string text;
  switch (token.kind) {
    case kDecimal:
      DecimalValue64(token);
      DecimalValue32(token);
      break;
    case kHex:
      HexValue64(token);
      break;
    case kFloat:
      FloatValue(token);
      break;
    case kDoubleQuoted:
    case kSingleQuoted:
      DecodeString(token, text);
      EscapedString(text);
      break;
    default:
      break;
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  const std::string text(reinterpret_cast<const char*>(data), size);
  const LexScanner whole{std::string_view(text)};
  fuzz::Run([&] {
    LexScanner scanner = whole;
    for (LexToken token; (token = NextToken(scanner, true)).kind != kEndOfText;) Decode(token);
    if (!SameTokens(whole, whole)) __builtin_trap();
  });
  fuzz::Run([&] {
    LexScanner scanner = whole;
    int indent;
    ReadBraceBlock(scanner, indent);
    ReadParenBlock(scanner, indent);
  });
  fuzz::Run([&] {
    LexScanner scanner = whole;
    TextRange argument;
    while (ReadArgument(scanner, argument, kCloseParen).kind == kComma) {
    }
    ReadBracketSection(scanner, false);
  });
  fuzz::Run([&] {
    LexScanner scanner = whole;
    std::string decoded;
    ReadQuotedText(scanner, decoded);
  });
  return 0;
}
