#include "translator/types/type_code.h"

#include <algorithm>
#include <cstring>

#include "text/numbers.h"

namespace qrex {

namespace {

constexpr std::string_view kBuiltIns[] = {"void",    "bool",    "int8",   "int16",  "int32",   "int64",
                                          "int128",  "uint8",   "uint16", "uint32", "uint64",  "uint128",
                                          "float32", "float64", "char8",  "char16", "string8", "string16"};
constexpr std::string_view kTemplates[] = {"ptr",    "openvariant", "pref", "cref", "xvector",
                                           "xdeque", "xlist",       "xset", "xbag", "DynArray"};

template <typename Value>
void AppendLittleEndian(std::string& out, Value value) {
  for (size_t i = 0; i < sizeof value; ++i) out += static_cast<char>(value >> (8 * i));
}

void AppendByte(std::string& out, size_t byte) { out += static_cast<char>(byte); }

// Of a value that is neither a string, a list nor a functor.
size_t PlainValueBytes(uint8_t op) { return op == kOpMetaBool ? 1 : op == kOpMetaInt ? 4 : 8; }

}  // namespace

std::string_view BuiltInTypeName(TypeOp op) { return kBuiltIns[op]; }
std::string_view TemplateTypeName(TypeOp op) { return kTemplates[op - kOpPtr]; }

// --- Building

void AppendOp(TypeCode& code, TypeOp op) { AppendByte(code, op); }
void PrependOp(TypeCode& code, TypeOp op) { code.insert(0, 1, static_cast<char>(op)); }

void AppendArray(TypeCode& code, uint32_t count) {
  AppendOp(code, kOpArray);
  AppendLittleEndian(code, count);
}

void AppendNamedType(TypeCode& code, TypeOp op, std::string_view name) {
  AppendOp(code, op);
  AppendCompactString(code, name);
}

// --- Metadata

void AppendMetadataBool(std::string& out, bool value) {
  AppendOp(out, kOpMetaBool);
  AppendByte(out, value);
}

void AppendMetadataInt(std::string& out, int32_t value) {
  AppendOp(out, kOpMetaInt);
  AppendLittleEndian(out, static_cast<uint32_t>(value));
}

void AppendMetadataFloat(std::string& out, double value) {
  uint64_t bits;
  std::memcpy(&bits, &value, sizeof bits);
  AppendOp(out, kOpMetaFloat);
  AppendLittleEndian(out, bits);
}

void AppendMetadataString(std::string& out, std::string_view value) {
  AppendOp(out, kOpMetaString);
  AppendCompactString(out, value);
}

void AppendMetadataList(std::string& out, size_t count, std::string_view values) {
  AppendByte(out, kOpMetaList + count);
  out += values;
}

void AppendMetadataFunctor(std::string& out, std::string_view name, size_t count, std::string_view values) {
  AppendByte(out, kOpMetaFunctor + count);
  AppendCompactString(out, name);
  out += values;
}

std::string_view SkipMetadataValue(std::string_view code) {
  const uint8_t op = static_cast<uint8_t>(code.front());
  code.remove_prefix(1);
  size_t values = 0;
  std::string_view text;
  if (op >= kOpMetaList) {
    values = op - kOpMetaList;
  } else if (op >= kOpMetaFunctor) {
    values = op - kOpMetaFunctor;
    ReadCompactString(code, text);
  } else if (op == kOpMetaString) {
    ReadCompactString(code, text);
  } else {
    code.remove_prefix(PlainValueBytes(op));
  }
  for (; values > 0; --values) code = SkipMetadataValue(code);
  return code;
}

// --- Byte code

namespace {

// Rewrites a code: each inline string becomes its index.
class Indexer {
 public:
  Indexer(std::string_view code, const IndexOfString& indexOf) : m_rest(code), m_indexOf(indexOf) {}

  void TranslateType() {
    for (;;) {
      const uint8_t op = Take();
      if (op >= kOpMetaBool) {
        TranslateMetadataOf(op);
      } else if (op < kOpClass) {
        return;
      } else if (op < kOpVolatile) {
        return TakeString();
      } else if (op == kOpArray) {
        TakeBytes(4);
      } else if (op == kOpMap) {
        TranslateType();
      }
    }
  }

  void TranslateMetadata() { TranslateMetadataOf(Take()); }
  const std::string& Bytes() const { return m_bytes; }

 private:
  uint8_t Take() {
    if (m_rest.empty()) return 0;
    const char op = m_rest.front();
    TakeBytes(1);
    return static_cast<uint8_t>(op);
  }

  void TakeBytes(size_t count) {
    m_bytes.append(m_rest.substr(0, count));
    m_rest.remove_prefix(std::min(count, m_rest.size()));
  }

  void TakeString() {
    std::string_view text;
    ReadCompactString(m_rest, text);
    const uint16_t index = m_indexOf(text);
    m_bytes += static_cast<char>(index & 0xFF);
    m_bytes += static_cast<char>(index >> 8);
  }

  void TranslateMetadataOf(uint8_t op) {
    size_t values = 0;
    if (op >= kOpMetaList) {
      values = op - kOpMetaList;
    } else if (op >= kOpMetaFunctor) {
      values = op - kOpMetaFunctor;
      TakeString();
    } else if (op == kOpMetaString) {
      TakeString();
    } else {
      TakeBytes(PlainValueBytes(op));
    }
    for (; values > 0; --values) TranslateMetadata();
  }

  std::string_view m_rest;
  const IndexOfString& m_indexOf;
  std::string m_bytes;
};

}  // namespace

std::string IndexedType(std::string_view code, const IndexOfString& indexOf) {
  Indexer indexer(code, indexOf);
  indexer.TranslateType();
  return indexer.Bytes();
}

std::string IndexedMetadata(std::string_view metadata, const IndexOfString& indexOf) {
  Indexer indexer(metadata, indexOf);
  indexer.TranslateMetadata();
  return indexer.Bytes();
}

}  // namespace qrex
