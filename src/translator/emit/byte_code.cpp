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
  out << "static const vesk::octet_t " << name << "[] =\n";
  Block rows(out, ";");
  for (size_t i = 0; i < bytes.size(); ++i) {
    const unsigned char byte = static_cast<unsigned char>(bytes[i]);
    out << "0x" << kDigits[byte >> 4] << kDigits[byte & 15];
    const bool isLast = i + 1 == bytes.size();
    if (!isLast) out << ",";
    if (isLast || i % kBytesPerLine == kBytesPerLine - 1) out << "\n";
  }
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
  out << "static vesk::ConstStringZ " << prefix << "_stringTable[] =\n";
  Block rows(out, ";");
  for (const std::string& text : strings.Strings()) out << "\"" << EscapedString(text) << "\",\n";
}

void WriteTypeOps(TextWriter& out, std::string_view type, uint32_t bits) {
  struct Line {
    uint32_t bit;
    std::string_view text;  // $0 is the type
  };
  static constexpr Line kLines[] = {
      {kOpsEqual, "(vesk::CompareVariableFn) (bool (*)($0 const*, $0 const*)) vesk::VariableEqual<$0>"},
      {kOpsLess, "(vesk::CompareVariableFn) (bool (*)($0 const*, $0 const*)) vesk::VariableLess<$0>"},
      {kOpsPrint, "(vesk::PrintVariableFn) (void (*)(vesk::xostream&, $0 const*)) vesk::PrintVariable<$0>"},
      {kOpsConstruct,
       "(vesk::ConstructArrayFn) (void (*)( $0*, vesk::ssize_t, vesk::ssize_t)) vesk::ConstructArray<$0>"},
      {kOpsCopy,
       "(vesk::CopyConstructArrayFn) (void (*)($0*, vesk::ssize_t, $0 const*, vesk::ssize_t, vesk::ssize_t)) "
       "vesk::CopyConstructArray<$0>"},
      {kOpsCopy,
       "(vesk::AssignArrayFn) (void (*)($0*, vesk::ssize_t, $0 const*, vesk::ssize_t, vesk::ssize_t)) "
       "vesk::AssignArray<$0>"},
      {kOpsDestruct, "(vesk::DestructArrayFn) (void (*)( $0*, vesk::ssize_t, vesk::ssize_t)) vesk::DestructArray<$0>"},
      {kOpsSerialise,
       "(vesk::SerialiseArrayFn) (void (*)(vesk::Archive&, $0 const*, vesk::ssize_t, vesk::ssize_t)) "
       "vesk::SerialiseArray<$0>"},
      {kOpsSerialise,
       "(vesk::DeserialiseArrayFn) (void (*)(vesk::InputArchive&, $0*, vesk::ssize_t, vesk::ssize_t)) "
       "vesk::DeserialiseArray<$0>"},
      {kOpsVisitObjects,
       "(vesk::VisitObjectsInArrayFn) (void (*)(vesk::IObjectVisitor&, $0 const*, vesk::ssize_t, vesk::ssize_t)) "
       "vesk::VisitObjectsInArray<$0>"},
      {kOpsVisitPrefs,
       "(vesk::VisitPrefsInArrayFn) (void (*)(vesk::IPrefVisitor&, $0 const*, vesk::ssize_t, vesk::ssize_t)) "
       "vesk::VisitPrefsInArray<$0>"},
      {kOpsLess,
       "(vesk::FindInArrayFn) (vesk::ssize_t (*)($0 const*, vesk::ssize_t, vesk::ssize_t, $0 const*)) "
       "vesk::BinaryLowerBound<$0>"},
      {kOpsLess,
       "(vesk::FindInArrayFn) (vesk::ssize_t (*)($0 const*, vesk::ssize_t, vesk::ssize_t, $0 const*)) "
       "vesk::BinaryUpperBound<$0>"},
  };
  out << "sizeof(" << type << "),\n";
  for (const Line& line : kLines) {
    WriteText(out, bits & line.bit ? line.text : "0", {type});
    out << (&line == std::end(kLines) - 1 ? "\n" : ",\n");
  }
}

}  // namespace qrex
