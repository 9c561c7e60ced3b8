// Decodes the byte code of reflection records: a type into a tree with the metadata that stands in front of each level,
// and a metadata list into values.

@import "Vesk/vxObject/Reflected.h"

namespace vesk {

enum EReflectedCode {
  RC_VOID = 0,
  RC_STRING8 = 16,
  RC_STRING16,
  RC_CLASS = 32,
  RC_INTERFACE,
  RC_TYPEDEF,
  RC_ENUM,
  RC_FUNCTOR,
  RC_VARIANT,
  RC_FUNCTION,
  RC_UNRESOLVED,
  RC_NAMED_END,  // those of named types stand ahead of it
  RC_VOLATILE = 48,
  RC_CONST,
  RC_ASSIGNABLE,
  RC_MOVABLE,
  RC_OFFSETTABLE,
  RC_POINTER,
  RC_REFERENCE,
  RC_PTR = 64,
  RC_OPENVARIANT,
  RC_PREF,
  RC_CREF,
  RC_VECTOR,
  RC_DEQUE,
  RC_LIST,
  RC_SET,
  RC_BAG,
  RC_DYNARRAY,
  RC_ARRAY = 80,
  RC_MAP,
  RC_METADATA = 160,
  RC_BOOL_VALUE,
  RC_INT_VALUE,
  RC_FLOAT_VALUE,
  RC_STRING_VALUE,
  RC_FUNCTOR_VALUE = 192,  // and the number of arguments
  RC_LIST_VALUE = 224      // and the number of values
};

struct MetadataValue {
  enum EKind { Bool, Int, Float, String, Functor, List };
  EKind m_kind = List;
  bool m_bool = false;
  int32 m_int = 0;
  float64 m_float = 0;
  xstring m_text;                   // of a string; the name of a functor
  xvector<MetadataValue> m_values;  // of a list; the arguments of a functor
};

struct ReflectedType {
  octet_t m_code = RC_VOID;
  xstring m_name;                  // of a named type
  int32 m_size = 0;                // of a fixed array
  xvector<ReflectedType> m_inner;  // what a decorator or container holds; key and value of a map
  xvector<MetadataValue> m_metadata;
};

ReflectedType DecodeType(ReflectionByteCode code);
MetadataValue DecodeMetadata(ReflectionByteCode code);
ConstStringZ CodeName(octet_t code);

// As one would declare it: "xvector<int32>", "a::Name const&". Metadata stands in front: "[7,"x"] int32".
xostream& operator<<(xostream& os, ReflectedType const& type);
xostream& operator<<(xostream& os, MetadataValue const& value);
xstring TypeText(ReflectionByteCode code);

// A byte code that owns its text, to compare and to look up by.
struct ReflectionByteCodeValue {
  ReflectionByteCodeValue(ReflectionByteCode code) : m_text(TypeText(code)) {}
  bool operator==(ReflectionByteCodeValue const& rhs) const { return m_text == rhs.m_text; }
  bool operator<(ReflectionByteCodeValue const& rhs) const { return m_text < rhs.m_text; }
  xstring m_text;
};

}  // namespace vesk
