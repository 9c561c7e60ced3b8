// The tokens of a text that may be anything.
#pragma once

#include <algorithm>
#include <string_view>

#include "lex/scanner.h"

namespace qrex::server {

// Calls `take` with each token and its place; what it gives is where the next one is looked for. What is no token is
// passed by.
template <typename Take>
void ForEachToken(std::string_view text, Take take) {
  LexScanner scanner(text, Dialect::Cpp);
  for (size_t at = 0; at < text.size();) {
    scanner.begin = text.data() + at;
    try {
      const LexToken token = NextToken(scanner);
      if (token.kind == kEndOfText) return;
      const auto begin = static_cast<size_t>(token.text.begin - text.data());
      const auto end = static_cast<size_t>(token.text.end - text.data());
      at = std::max(take(token.kind, begin, end), at + 1);
    } catch (const LexScannerException&) {
      ++at;
    }
  }
}

}  // namespace qrex::server
