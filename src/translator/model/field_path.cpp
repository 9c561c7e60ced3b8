#include "translator/model/field_path.h"

#include "text/numbers.h"

namespace qrex {

namespace {

using Kind = PathElement::Kind;

constexpr size_t kLocalSize = 16;  // bytes that a vesk::Path holds without a buffer on the heap
constexpr int64_t kOneByteBound = 128;
constexpr size_t kUnboundedIndexSize = 5;

std::string ConstantBytes(const PathElement& element) {
  std::string bytes;
  AppendCompactLength(bytes, static_cast<uint64_t>(element.value));
  return bytes;
}

size_t CompactSize(int64_t value) {
  std::string bytes;
  AppendCompactLength(bytes, static_cast<uint64_t>(value));
  return bytes.size();
}

TypeOp KeyOp(const PathElement& element) { return TypeView(element.key).WithoutMetadata().Op(); }

// 0 for a key without a known size.
size_t KeySize(const PathElement& element) {
  static constexpr size_t kSizes[] = {0, 1, 1, 2, 4, 8, 16, 1, 2, 4, 8, 16, 4, 8, 1, 2};
  const TypeOp op = KeyOp(element);
  if (op == kOpEnum) return 4;
  return op < std::size(kSizes) ? kSizes[op] : 0;
}

// The type through which a key is stored; an enumeration is stored as its integer.
std::string_view KeyShortName(const PathElement& element) {
  static constexpr std::string_view kNames[] = {"",        "bool",    "int8",   "int16",  "int32",  "int64",
                                                "int128",  "uint8",   "uint16", "uint32", "uint64", "uint128",
                                                "float32", "float64", "char8",  "char16"};
  const TypeOp op = KeyOp(element);
  return op == kOpEnum ? "vesk::int32" : kNames[op];
}

std::string KeyTypeText(const PathElement& element) {
  return KeyOp(element) == kOpEnum ? "vesk::int32" : TypeText(element.key);
}

bool IsOneByteIndex(const PathElement& element) { return element.value >= 0 && element.value <= kOneByteBound; }

std::string Decimal(char byte) { return std::to_string(static_cast<unsigned char>(byte)); }

}  // namespace

size_t FieldPath::ParameterCount() const {
  size_t count = 0;
  for (const PathElement& element : m_elements) count += element.kind != Kind::Constant;
  return count;
}

std::string FieldPath::Parameters(size_t first, size_t last) const {
  std::string text;
  size_t number = 0;
  for (const PathElement& element : m_elements) {
    if (element.kind == Kind::Constant) continue;
    if (number >= first && number < last) {
      if (!text.empty()) text += ",";
      text += element.kind == Kind::Key ? TypeText(element.key) + " const& " : "vesk::ssize_t ";
      text += ParameterName(number);
    }
    ++number;
  }
  return text;
}

std::string FieldPath::Arguments(size_t first, size_t last) {
  std::string text;
  for (size_t number = first; number < last; ++number) {
    if (number > first) text += ",";
    text += ParameterName(number);
  }
  return text;
}

std::string FieldPath::Checks() const {
  std::string text;
  size_t number = 0;
  for (const PathElement& element : m_elements) {
    if (element.kind == Kind::Constant) continue;
    const std::string name = ParameterName(number++);
    if (element.kind != Kind::Index) continue;
    text += "vxAssert(0 <= " + name;
    if (element.value >= 0) text += " && " + name + " < " + std::to_string(element.value);
    text += "); ";
  }
  return text;
}

std::string FieldPath::Body() const {
  size_t size = 0;
  bool isFixed = true;
  bool isKnown = true;
  for (const PathElement& element : m_elements) {
    if (element.kind == Kind::Constant) {
      size += CompactSize(element.value);
    } else if (element.kind == Kind::Key) {
      const size_t keySize = KeySize(element);
      isKnown = isKnown && keySize > 0;
      size += keySize;
    } else if (IsOneByteIndex(element)) {
      size += 1;
    } else {
      size += element.value < 0 ? kUnboundedIndexSize : CompactSize(element.value - 1);
      isFixed = false;
    }
  }
  return Checks() + (!isKnown ? ArchiveBody() : isFixed ? InitBody(size) : ReserveBody(size));
}

std::string FieldPath::ArchiveBody() const {
  std::string text = "vesk::FieldPathArchive _ar; ";
  size_t number = 0;
  for (const PathElement& element : m_elements) {
    if (element.kind == Kind::Constant) {
      text += "vesk::SerialiseVariableLengthUint(_ar," + std::to_string(element.value) + "); ";
    } else if (element.kind == Kind::Index) {
      text += "vesk::SerialiseVariableLengthUint(_ar," + ParameterName(number++) + "); ";
    } else {
      text += "_ar << " + ParameterName(number++) + "; ";
    }
  }
  return text + "_ar.InitPath(_path); ";
}

// `size` is an upper bound.
std::string FieldPath::ReserveBody(size_t size) const {
  const bool isLocal = size <= kLocalSize;
  std::string text = "vesk::octet_t* p=_path.";
  text += isLocal ? "BeginReserveLocal(" : "BeginReserveHeap(" + std::to_string(size);
  text += "); ";
  size_t number = 0;
  for (const PathElement& element : m_elements) {
    if (element.kind == Kind::Constant) {
      for (char byte : ConstantBytes(element)) text += "*p++ =" + Decimal(byte) + "; ";
      continue;
    }
    const std::string name = ParameterName(number++);
    if (element.kind == Kind::Key) {
      text +=
          "*(" + std::string(KeyShortName(element)) + "*)p=" + name + "; p+=" + std::to_string(KeySize(element)) + "; ";
    } else if (IsOneByteIndex(element)) {
      text += "*p++ =(vesk::octet_t)" + name + "; ";
    } else {
      text += "p=vesk::SerialiseVariableLengthInteger(p," + name + "); ";
    }
  }
  return text + "_path." + (isLocal ? "EndReserveLocal" : "EndReserveHeap") + "(p); ";
}

std::string FieldPath::InitBody(size_t size) const {
  std::string text = "vesk::octet_t* p=_path.";
  text += size <= kLocalSize ? "InitLocalBuffer(" : "InitHeapBuffer(";
  text += std::to_string(size) + "); ";
  size_t position = 0;
  size_t number = 0;
  for (const PathElement& element : m_elements) {
    if (element.kind == Kind::Constant) {
      for (char byte : ConstantBytes(element)) text += "p[" + std::to_string(position++) + "]=" + Decimal(byte) + "; ";
      continue;
    }
    const std::string name = ParameterName(number++);
    if (element.kind == Kind::Index) {
      text += "p[" + std::to_string(position++) + "]=(vesk::octet_t)" + name + "; ";
    } else {
      text += "*(" + KeyTypeText(element) + "*)(p+" + std::to_string(position) + ")=" + name + "; ";
      position += KeySize(element);
    }
  }
  return text;
}

}  // namespace qrex
