// Reads the byte code of records, and prints what it says.

@import "Vesk/vxObject/ByteCode.h"

#include <cstring>

namespace vesk {

namespace {

class ByteCodeReader {
 public:
  explicit ByteCodeReader(ReflectionByteCode code) : m_at(code.m_code), m_strings(code.m_strings) {}

  ReflectedType ReadType() {
    ReflectedType type;
    while (*m_at >= RC_METADATA) type.m_metadata.push_back(ReadMetadata());
    type.m_code = *m_at++;
    if (type.m_code <= RC_STRING16) return type;
    if (type.m_code < RC_NAMED_END) {
      type.m_name = ReadName();
      return type;
    }
    if (type.m_code == RC_ARRAY) type.m_size = Read<int32>();
    type.m_inner.push_back(ReadType());
    if (type.m_code == RC_MAP) type.m_inner.push_back(ReadType());
    return type;
  }

  MetadataValue ReadMetadata() {
    MetadataValue value;
    const octet_t code = *m_at++;
    int count = 0;
    switch (code) {
      case RC_BOOL_VALUE:
        value.m_kind = MetadataValue::Bool;
        value.m_bool = *m_at++ != 0;
        return value;
      case RC_INT_VALUE:
        value.m_kind = MetadataValue::Int;
        value.m_int = Read<int32>();
        return value;
      case RC_FLOAT_VALUE:
        value.m_kind = MetadataValue::Float;
        value.m_float = Read<float64>();
        return value;
      case RC_STRING_VALUE:
        value.m_kind = MetadataValue::String;
        value.m_text = ReadName();
        return value;
    }
    if (code >= RC_LIST_VALUE) {
      count = code - RC_LIST_VALUE;
    } else {
      count = code - RC_FUNCTOR_VALUE;
      value.m_kind = MetadataValue::Functor;
      value.m_text = ReadName();
    }
    for (int i = 0; i < count; ++i) value.m_values.push_back(ReadMetadata());
    return value;
  }

 private:
  template <typename T>
  T Read() {
    T value;
    std::memcpy(&value, m_at, sizeof(value));
    m_at += sizeof(value);
    return value;
  }
  xstring ReadName() { return m_strings[Read<uint16>()]; }

  octet_t const* m_at;
  ConstStringZ const* m_strings;
};

}  // namespace

ReflectedType DecodeType(ReflectionByteCode code) { return ByteCodeReader(code).ReadType(); }
MetadataValue DecodeMetadata(ReflectionByteCode code) { return ByteCodeReader(code).ReadMetadata(); }

ConstStringZ CodeName(octet_t code) {
  static ConstStringZ const scalars[] = {"void",    "bool",    "int8",   "int16",  "int32",   "int64",
                                         "int128",  "uint8",   "uint16", "uint32", "uint64",  "uint128",
                                         "float32", "float64", "char8",  "char16", "string8", "string16"};
  static ConstStringZ const decorators[] = {"volatile", "const", "assignable", "movable", "offsettable", "*", "&"};
  static ConstStringZ const templates[] = {"ptr",    "openvariant", "pref", "cref", "xvector",
                                           "xdeque", "xlist",       "xset", "xbag", "DynArray"};
  if (code <= RC_STRING16) return scalars[code];
  if (code >= RC_VOLATILE && code <= RC_REFERENCE) return decorators[code - RC_VOLATILE];
  if (code >= RC_PTR && code <= RC_DYNARRAY) return templates[code - RC_PTR];
  return code == RC_ARRAY ? "Array" : code == RC_MAP ? "xmap" : "";
}

xostream& operator<<(xostream& os, MetadataValue const& value) {
  switch (value.m_kind) {
    case MetadataValue::Bool:
      return os << value.m_bool;
    case MetadataValue::Int:
      return os << value.m_int;
    case MetadataValue::Float:
      return os << value.m_float;
    case MetadataValue::String:
      return os << '"' << value.m_text << '"';
    default:
      break;
  }
  const bool isList = value.m_kind == MetadataValue::List;
  os << value.m_text;
  if (!isList && value.m_values.empty()) return os;
  os << (isList ? '[' : '(');
  for (MetadataValue const& item : value.m_values) os << (&item == &value.m_values.front() ? "" : ",") << item;
  return os << (isList ? ']' : ')');
}

xostream& operator<<(xostream& os, ReflectedType const& type) {
  for (MetadataValue const& value : type.m_metadata) os << value << ' ';
  if (type.m_inner.empty()) {
    if (type.m_name.empty()) return os << CodeName(type.m_code);
    return os << type.m_name;
  }
  ReflectedType const& inner = type.m_inner.front();
  switch (type.m_code) {
    case RC_VOLATILE:
    case RC_CONST:
      return os << inner << ' ' << CodeName(type.m_code);
    case RC_POINTER:
    case RC_REFERENCE:
      return os << inner << CodeName(type.m_code);
    case RC_ARRAY:
      return os << inner << '[' << type.m_size << ']';
    case RC_MAP:
      return os << "xmap<" << inner << ',' << type.m_inner.back() << '>';
    default:
      return os << CodeName(type.m_code) << '<' << inner << '>';
  }
}

xstring TypeText(ReflectionByteCode code) { return vxMakeString(DecodeType(code)); }

}  // namespace vesk
