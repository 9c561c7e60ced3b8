// Numbers and quoted strings: how far a literal reaches, its value, and the escapes in both directions.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "lex/scanner.h"
#include "text/text_writer.h"

namespace qrex {

int32_t ReadNumber(LexScanner& scanner);  // -1 without moving, else kDecimal, kHex or kFloat
bool ReadQuoted(LexScanner& scanner, char quote, std::string_view what);
bool ReadEscape(LexScanner& scanner);

uint64_t DecimalValue64(const LexToken& token);  // wraps
uint32_t DecimalValue32(const LexToken& token);
uint64_t HexValue64(const LexToken& token);
double FloatValue(const LexToken& token);
void DecodeString(const LexToken& token, std::string& out);
void ReadQuotedText(LexScanner& scanner, std::string& out);  // leaves the scanner on the closing quote

char ByteOfEscape(char letter);  // the letter itself when it is no escape
void WriteEscapedChar(std::string& out, char c);
void WriteCharLiteral(std::string& out, char c);     // 'c' with escapes
std::string EscapedString(std::string_view text);    // each byte by WriteEscapedChar, no quotes
std::string PrintedByte(const LexScanner& scanner);  // the byte at the position as in messages, "EOS" at the end

}  // namespace qrex
