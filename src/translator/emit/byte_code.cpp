#include "translator/emit/byte_code.h"

#include <algorithm>

#include "lex/literals.h"
#include "text/numbers.h"
#include "translator/emit/emit.h"
#include "translator/types/type_code.h"

namespace qrex {

uint16_t StringTable::Add(std::string_view text) {
  auto found = std::find(m_strings.begin(), m_strings.end(), text);
  if (found == m_strings.end()) found = m_strings.insert(m_strings.end(), std::string(text));
  return static_cast<uint16_t>(found - m_strings.begin());
}

namespace {

constexpr size_t kBytesPerLine = 16;

void WriteArray(TextWriter& out, std::string_view name, const std::string& bytes) {
  static constexpr char kDigits[] = "0123456789abcdef";
  auto writeRows = [&] {
    for (size_t i = 0; i < bytes.size(); ++i) {
      const unsigned char byte = static_cast<unsigned char>(bytes[i]);
      out << "0x" << kDigits[byte >> 4] << kDigits[byte & 15];
      const bool isLast = i + 1 == bytes.size();
      if (!isLast) out << ",";
      if (isLast || i % kBytesPerLine == kBytesPerLine - 1) out << "\n";
    }
  };
  Write(out, R"(
    static const vesk::octet_t $name$[] =
    {
        $rows$
    };
  )",
        "name"_ = name, "rows"_ = writeRows);
}

}  // namespace

void WriteTypeByteCode(TextWriter& out, std::string_view arrayName, StringTable& strings, std::string_view typeCode) {
  WriteArray(out, arrayName, IndexedType(typeCode, [&](std::string_view text) { return strings.Add(text); }));
}

void WriteMetadataByteCode(TextWriter& out, std::string_view arrayName, StringTable& strings,
                           std::string_view metadata) {
  WriteArray(out, arrayName, IndexedMetadata(metadata, [&](std::string_view text) { return strings.Add(text); }));
}

void WriteStringTable(TextWriter& out, const StringTable& strings, std::string_view prefix) {
  if (strings.Empty()) return;
  auto writeRow = [&](const std::string& text) { out << '"' << EscapedString(text) << "\",\n"; };
  Write(out, R"(
    static vesk::ConstStringZ $prefix$_stringTable[] =
    {
        $rows$
    };
  )",
        "prefix"_ = prefix, "rows"_ = Each(out, strings.Strings(), "", writeRow));
}

void WriteStringTableName(TextWriter& out, const StringTable& strings, std::string_view prefix) {
  if (strings.Empty()) {
    out << "0";
  } else {
    out << prefix << "_stringTable";
  }
}

void WriteTypeOps(TextWriter& out, std::string_view type, uint32_t bits) {
  struct Row {
    uint32_t bit;
    EmittedText<Hole<"type", std::string_view>> text;
  };
  static constexpr Row kRows[] = {
      {kOpsEqual, "(vesk::CompareVariableFn) (bool (*)($type$ const*, $type$ const*)) vesk::VariableEqual<$type$>"},
      {kOpsLess, "(vesk::CompareVariableFn) (bool (*)($type$ const*, $type$ const*)) vesk::VariableLess<$type$>"},
      {kOpsPrint, "(vesk::PrintVariableFn) (void (*)(vesk::xostream&, $type$ const*)) vesk::PrintVariable<$type$>"},
      {kOpsConstruct,
       "(vesk::ConstructArrayFn) (void (*)( $type$*, vesk::ssize_t, vesk::ssize_t)) vesk::ConstructArray<$type$>"},
      {kOpsCopy,
       "(vesk::CopyConstructArrayFn) (void (*)($type$*, vesk::ssize_t, $type$ const*, vesk::ssize_t, vesk::ssize_t)) "
       "vesk::CopyConstructArray<$type$>"},
      {kOpsCopy,
       "(vesk::AssignArrayFn) (void (*)($type$*, vesk::ssize_t, $type$ const*, vesk::ssize_t, vesk::ssize_t)) "
       "vesk::AssignArray<$type$>"},
      {kOpsDestruct,
       "(vesk::DestructArrayFn) (void (*)( $type$*, vesk::ssize_t, vesk::ssize_t)) vesk::DestructArray<$type$>"},
      {kOpsSerialise,
       "(vesk::SerialiseArrayFn) (void (*)(vesk::Archive&, $type$ const*, vesk::ssize_t, vesk::ssize_t)) "
       "vesk::SerialiseArray<$type$>"},
      {kOpsSerialise,
       "(vesk::DeserialiseArrayFn) (void (*)(vesk::InputArchive&, $type$*, vesk::ssize_t, vesk::ssize_t)) "
       "vesk::DeserialiseArray<$type$>"},
      {kOpsVisitObjects,
       "(vesk::VisitObjectsInArrayFn) (void (*)(vesk::IObjectVisitor&, $type$ const*, vesk::ssize_t, vesk::ssize_t)) "
       "vesk::VisitObjectsInArray<$type$>"},
      {kOpsVisitPrefs,
       "(vesk::VisitPrefsInArrayFn) (void (*)(vesk::IPrefVisitor&, $type$ const*, vesk::ssize_t, vesk::ssize_t)) "
       "vesk::VisitPrefsInArray<$type$>"},
      {kOpsLess,
       "(vesk::FindInArrayFn) (vesk::ssize_t (*)($type$ const*, vesk::ssize_t, vesk::ssize_t, $type$ const*)) "
       "vesk::BinaryLowerBound<$type$>"},
      {kOpsLess,
       "(vesk::FindInArrayFn) (vesk::ssize_t (*)($type$ const*, vesk::ssize_t, vesk::ssize_t, $type$ const*)) "
       "vesk::BinaryUpperBound<$type$>"},
  };
  out << "sizeof(" << type << "),\n";
  for (const Row& row : kRows) {
    if (bits & row.bit) {
      Write(out, row.text, "type"_ = type);
    } else {
      out << "0";
    }
    out << (&row == std::end(kRows) - 1 ? "\n" : ",\n");
  }
}

}  // namespace qrex
