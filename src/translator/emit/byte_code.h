// The reflection byte code in generated text: arrays of bytes, string tables, TypeOps initialisers.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "text/text_writer.h"

namespace qrex {

// The strings of one record in first-use order, each once.
class StringTable {
 public:
  uint16_t Add(std::string_view text);
  bool Empty() const { return m_strings.empty(); }
  const std::vector<std::string>& Strings() const { return m_strings; }

 private:
  std::vector<std::string> m_strings;
};

// static const vesk::octet_t NAME[] = ...: the code with each inline name replaced by a 16-bit string index.
void WriteTypeByteCode(TextWriter& out, std::string_view arrayName, StringTable& strings, std::string_view typeCode);
void WriteMetadataByteCode(TextWriter& out, std::string_view arrayName, StringTable& strings,
                           std::string_view metadata);
void WriteStringTable(TextWriter& out, const StringTable& strings, std::string_view prefix);      // nothing when empty
void WriteStringTableName(TextWriter& out, const StringTable& strings, std::string_view prefix);  // or "0"

enum TypeOpsBits : uint32_t {
  kOpsEqual = 1,
  kOpsLess = 2,
  kOpsPrint = 4,
  kOpsSerialise = 8,
  kOpsConstruct = 16,
  kOpsDestruct = 32,
  kOpsCopy = 64,
  kOpsVisitObjects = 128,
  kOpsVisitPrefs = 256,
  kOpsAll = 511,
};
void WriteTypeOps(TextWriter& out, std::string_view typeText, uint32_t bits);  // the lines of the initialiser

}  // namespace qrex
