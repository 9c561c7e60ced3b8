// Scanner, literals and sections.
#include "fuzz/fuzz_world.h"
#include "lex/cpp_literals.h"
#include "lex/literals.h"
#include "lex/sections.h"

using namespace qrex;

namespace {

void Decode(const LexToken& token, Dialect dialect) {
  std::string text;
  switch (token.kind) {
    case kDecimal:
    case kHex:
      fuzz::Run([&] { IntegerValue(token, dialect); });
      break;
    case kFloat:
      fuzz::Run([&] { FloatValue(token, dialect); });
      break;
    case kDoubleQuoted:
    case kSingleQuoted:
    case kRawString:
      DecodeString(token, dialect, text);
      EscapedString(text);
      break;
    default:
      break;
  }
}

void ScanAll(const LexScanner& whole) {
  fuzz::Run([&] {
    LexScanner scanner = whole;
    for (LexToken token; (token = NextToken(scanner, true)).kind != kEndOfText;) Decode(token, whole.dialect);
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
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  const std::string text(reinterpret_cast<const char*>(data), size);
  ScanAll(LexScanner(std::string_view(text), Dialect::Qrex));
  ScanAll(LexScanner(std::string_view(text), Dialect::Cpp));
  return 0;
}
