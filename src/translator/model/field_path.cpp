#include "translator/model/field_path.h"

#include "text/numbers.h"
#include "translator/emit/emit.h"

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

// Each element with the name of its parameter, which a constant has none of.
template <typename Visit>
void FieldPath::ForEach(Visit visit) const {
  size_t number = 0;
  for (const PathElement& element : m_elements) {
    visit(element, element.kind == Kind::Constant ? std::string() : ParameterName(number++));
  }
}

void FieldPath::WriteChecks(TextWriter& out) const {
  ForEach([&](const PathElement& element, const std::string& name) {
    if (element.kind != Kind::Index) return;
    Write(out, "vxAssert(0 <= $name$$bound$); ", "name"_ = name,
          "bound"_ = element.value < 0 ? "" : " && " + name + " < " + std::to_string(element.value));
  });
}

void FieldPath::WriteBody(TextWriter& out) const {
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
  WriteChecks(out);
  if (!isKnown) {
    WriteArchiveBody(out);
  } else if (isFixed) {
    WriteInitBody(out, size);
  } else {
    WriteReserveBody(out, size);
  }
}

void FieldPath::WriteArchiveBody(TextWriter& out) const {
  out << "vesk::FieldPathArchive _ar; ";
  ForEach([&](const PathElement& element, const std::string& name) {
    if (element.kind == Kind::Key) {
      Write(out, "_ar << $name$; ", "name"_ = name);
    } else {
      Write(out, "vesk::SerialiseVariableLengthUint(_ar,$value$); ",
            "value"_ = element.kind == Kind::Constant ? std::to_string(element.value) : name);
    }
  });
  out << "_ar.InitPath(_path); ";
}

// `size` is an upper bound.
void FieldPath::WriteReserveBody(TextWriter& out, size_t size) const {
  const bool isLocal = size <= kLocalSize;
  Write(out, "vesk::octet_t* p=_path.BeginReserve$place$($size$); ", "place"_ = isLocal ? "Local" : "Heap",
        "size"_ = isLocal ? "" : std::to_string(size));
  ForEach([&](const PathElement& element, const std::string& name) {
    if (element.kind == Kind::Constant) {
      for (unsigned char byte : ConstantBytes(element)) Write(out, "*p++ =$byte$; ", "byte"_ = byte);
    } else if (element.kind == Kind::Key) {
      Write(out, "*($type$*)p=$name$; p+=$size$; ", "type"_ = KeyShortName(element), "name"_ = name,
            "size"_ = KeySize(element));
    } else if (IsOneByteIndex(element)) {
      Write(out, "*p++ =(vesk::octet_t)$name$; ", "name"_ = name);
    } else {
      Write(out, "p=vesk::SerialiseVariableLengthInteger(p,$name$); ", "name"_ = name);
    }
  });
  Write(out, "_path.EndReserve$place$(p); ", "place"_ = isLocal ? "Local" : "Heap");
}

void FieldPath::WriteInitBody(TextWriter& out, size_t size) const {
  Write(out, "vesk::octet_t* p=_path.Init$place$Buffer($size$); ", "place"_ = size <= kLocalSize ? "Local" : "Heap",
        "size"_ = size);
  size_t position = 0;
  ForEach([&](const PathElement& element, const std::string& name) {
    if (element.kind == Kind::Constant) {
      for (unsigned char byte : ConstantBytes(element)) {
        Write(out, "p[$position$]=$byte$; ", "position"_ = position++, "byte"_ = byte);
      }
    } else if (element.kind == Kind::Index) {
      Write(out, "p[$position$]=(vesk::octet_t)$name$; ", "position"_ = position++, "name"_ = name);
    } else {
      Write(out, "*($type$*)(p+$position$)=$name$; ", "type"_ = KeyTypeText(element), "position"_ = position,
            "name"_ = name);
      position += KeySize(element);
    }
  });
}

}  // namespace qrex
