// Marks in generated text, where `#line` is wanted: they say which place of a source the text behind them came of, and
// whoever writes the output takes them out. So text keeps its places wherever it is put: code that does not stay where
// it is written, and what a tail has of a declaration in another file.
#pragma once

#include <string>
#include <string_view>

namespace qrex {

inline constexpr char kPositionMark = '\x01';  // ahead of the digits
inline constexpr size_t kMarkDigits = 16;

std::string PositionMark(const char* source);
// Of the digits behind a mark; null if they are none.
const char* MarkedPosition(std::string_view digits);

}  // namespace qrex
