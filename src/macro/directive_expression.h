// Expressions of directives are read from expanded text, which is no longer the source: their errors are moved to the
// directive's `@`, and a context line shows the text.
#pragma once

#include <string>

#include "macro/expansion_context.h"
#include "macro/expression_parser.h"
#include "text/numbers.h"

namespace qrex {

inline void PatchExpressionError(LexScannerException& exception, std::string_view opening, std::string_view expansion,
                                 std::string_view closing, const char* position) {
  ReplaceAllInPlace(exception.message, "EOS", closing);
  exception.message.append("\n    in ").append(opening).append(expansion).append(closing);
  exception.position = position;
}

// Reads one value of the whole expansion. `opening` ends in the bracket that counts as the token ahead of it.
template <typename Read>
auto ReadExpression(const std::string& expansion, const std::string& opening, std::string_view closing,
                    const char* position, Read read, std::string_view whenRead = " when read ") {
  try {
    ExpressionParser parser;
    parser.current.kind = kOpenParen;
    parser.current.text = TextRange(std::string_view("("));
    parser.SetInput(TextRange(std::string_view(expansion)));
    auto value = read(parser);
    if (parser.current.kind != kEndOfText) {
      throw LexScannerException("Expected ) after " + Printed(parser.previous) + std::string(whenRead) +
                                    Printed(parser.current) + " in expression",
                                parser.current);
    }
    return value;
  } catch (LexScannerException& exception) {
    PatchExpressionError(exception, opening, expansion, closing, position);
    throw;
  }
}

}  // namespace qrex
