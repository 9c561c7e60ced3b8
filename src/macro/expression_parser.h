// Typed expressions, evaluated while they are parsed. There are no variables: the text has been macro-expanded before.
#pragma once

#include <cstdint>
#include <string>

#include "lex/scanner.h"
#include "macro/literal.h"

namespace qrex {

class ExpressionParser : public ParserBase {
 public:
  void ParseExpression(Literal& out);  // a LiteralException becomes a LexScannerException at the current token

  // One expression, converted. The parser is behind it afterwards.
  bool ReadBool(bool isExplicit = false);
  unsigned char ReadChar(bool isExplicit = false);
  int8_t ReadInt8(bool isExplicit = false);
  int16_t ReadInt16(bool isExplicit = false);
  int32_t ReadInt32(bool isExplicit = false);
  int64_t ReadInt64(bool isExplicit = false);
  uint8_t ReadUInt8(bool isExplicit = false);
  uint16_t ReadUInt16(bool isExplicit = false);
  uint32_t ReadUInt32(bool isExplicit = false);
  uint64_t ReadUInt64(bool isExplicit = false);
  float ReadFloat32(bool isExplicit = false);
  double ReadFloat64(bool isExplicit = false);
  std::string ReadStringValue(bool isExplicit = false);  // the "string" reader

 private:
  friend struct ExpressionGrammar;
  int m_depth = 0;
};

}  // namespace qrex
