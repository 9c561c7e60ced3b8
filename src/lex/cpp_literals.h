// The literals of C++20 text: how far each reaches, and what it means. Nothing that a compiler would skip, such as
// the text of an #error or of an #if branch that is not taken, may fail here: what is no token is a kStray.
#pragma once

#include <cstdint>
#include <string>

#include "lex/scanner.h"

namespace qrex {

// Each moves over a token that the scanner is at, and returns its kind.
int32_t ReadCppNumber(LexScanner& scanner);  // a preprocessing number: kDecimal (also binary), kHex or kFloat
int32_t ReadCppDot(LexScanner& scanner);     // kDot or a number
int32_t ReadCppWord(LexScanner& scanner);    // an identifier, or a string or character with a prefix
int32_t ReadCppQuoted(LexScanner& scanner);

// The value of a token of the given dialect. Integers wrap; a suffix that is not of the language is an error.
uint64_t IntegerValue(const LexToken& token, Dialect dialect);
double FloatValue(const LexToken& token, Dialect dialect);
// Of all quoted kinds. In C++ an unknown escape is its letter.
void DecodeString(const LexToken& token, Dialect dialect, std::string& out);

}  // namespace qrex
