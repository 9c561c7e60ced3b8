#include "translator/types/metadata.h"

#include <cstring>
#include <iterator>
#include <utility>

#include "text/numbers.h"
#include "translator/types/type_code.h"

namespace qrex {

namespace {

uint64_t TakeLittleEndian(std::string_view& code, size_t bytes) {
  uint64_t value = 0;
  for (size_t i = bytes; i-- > 0;) value = value << 8 | static_cast<unsigned char>(code[i]);
  code.remove_prefix(bytes);
  return value;
}

std::vector<MetadataValue> TakeMetadataValues(std::string_view& code, size_t count) {
  std::vector<MetadataValue> values(count);
  for (MetadataValue& value : values) value = TakeMetadataValue(code);
  return values;
}

}  // namespace

MetadataValue TakeMetadataValue(std::string_view& code) {
  using Kind = MetadataValue::Kind;
  const auto op = static_cast<uint8_t>(code.front());
  code.remove_prefix(1);
  MetadataValue value;
  if (op >= kOpMetaList) {
    value.kind = Kind::List;
    value.values = TakeMetadataValues(code, op - kOpMetaList);
  } else if (op >= kOpMetaFunctor) {
    value.kind = Kind::Functor;
    ReadCompactString(code, value.text);
    value.values = TakeMetadataValues(code, op - kOpMetaFunctor);
  } else if (op == kOpMetaString) {
    value.kind = Kind::String;
    ReadCompactString(code, value.text);
  } else if (op == kOpMetaFloat) {
    value.kind = Kind::Float;
    const uint64_t bits = TakeLittleEndian(code, sizeof value.real);
    std::memcpy(&value.real, &bits, sizeof value.real);
  } else {
    value.kind = op == kOpMetaBool ? Kind::Bool : Kind::Int;
    value.number = static_cast<int32_t>(TakeLittleEndian(code, op == kOpMetaBool ? 1 : sizeof value.number));
  }
  return value;
}

std::vector<MetadataValue> ItemsOfMetadata(std::string_view code) {
  std::vector<MetadataValue> items;
  while (!code.empty()) {
    MetadataValue value = TakeMetadataValue(code);
    if (value.kind == MetadataValue::Kind::List) {
      std::move(value.values.begin(), value.values.end(), std::back_inserter(items));
    } else {
      items.push_back(std::move(value));
    }
  }
  return items;
}

}  // namespace qrex
