// Reflection records: plain aggregates that generated text initialises as static tables. A type is an array of bytes
// (ByteCode.h decodes it) whose names are indices into the string table of the record. Absent pointers are null.

@import "Vesk/vxObject/Containers.h"
@import "Vesk/vxObject/Traits.h"

namespace vesk {

struct IObject;
struct IObjectVisitor;
struct IPrefVisitor;
struct Archive;
struct InputArchive;
template <typename I>
class ptr;

// A type or a metadata list in byte code, with the table that its names refer to.
struct ReflectionByteCode {
  ReflectionByteCode(octet_t const* code, ConstStringZ const* strings) : m_code(code), m_strings(strings) {}
  octet_t const* m_code;
  ConstStringZ const* m_strings;
};

typedef bool (*CompareVariableFn)(void const*, void const*);
typedef void (*PrintVariableFn)(xostream&, void const*);
typedef void (*ConstructArrayFn)(void*, ssize_t, ssize_t);
typedef void (*CopyConstructArrayFn)(void*, ssize_t, void const*, ssize_t, ssize_t);
typedef void (*AssignArrayFn)(void*, ssize_t, void const*, ssize_t, ssize_t);
typedef void (*DestructArrayFn)(void*, ssize_t, ssize_t);
typedef void (*SerialiseArrayFn)(Archive&, void const*, ssize_t, ssize_t);
typedef void (*DeserialiseArrayFn)(InputArchive&, void*, ssize_t, ssize_t);
typedef void (*VisitObjectsInArrayFn)(IObjectVisitor&, void const*, ssize_t, ssize_t);
typedef void (*VisitPrefsInArrayFn)(IPrefVisitor&, void const*, ssize_t, ssize_t);
typedef ssize_t (*FindInArrayFn)(void const*, ssize_t, ssize_t, void const*);

// What can be done with values of a type that is known only by its record. A range of an array is [begin, end).
struct TypeOps {
  std::size_t m_size;
  CompareVariableFn m_equal;
  CompareVariableFn m_less;
  PrintVariableFn m_print;
  ConstructArrayFn m_construct;
  CopyConstructArrayFn m_copyConstruct;
  AssignArrayFn m_assign;
  DestructArrayFn m_destruct;
  SerialiseArrayFn m_serialise;
  DeserialiseArrayFn m_deserialise;
  VisitObjectsInArrayFn m_visitObjects;
  VisitPrefsInArrayFn m_visitPrefs;
  FindInArrayFn m_lowerBound;
  FindInArrayFn m_upperBound;
};

// Walks a map or set that is known only by its record.
struct XMapFns {
  typedef void (*VisitFn)(void* context, void const* key, void const* value);  // a set's value is null
  ssize_t (*m_size)(void const* container);
  void (*m_visit)(void const* container, VisitFn visit, void* context);
};
typedef XMapFns XSetFns;

struct PtrMapOrSetFns {
  XMapFns const* m_fns;
};

struct IXMap {
  template <typename M>
  struct Stubs {
    static XMapFns const& GetTable() {
      static const XMapFns table = {
          [](void const* map) { return static_cast<ssize_t>(static_cast<M const*>(map)->size()); },
          [](void const* map, XMapFns::VisitFn visit, void* context) {
            for (auto const& [key, value] : *static_cast<M const*>(map)) visit(context, &key, &value);
          }};
      return table;
    }
  };
};

struct IXSet {
  template <typename S>
  struct Stubs {
    static XSetFns const& GetTable() {
      static const XSetFns table = {
          [](void const* set) { return static_cast<ssize_t>(static_cast<S const*>(set)->size()); },
          [](void const* set, XMapFns::VisitFn visit, void* context) {
            for (auto const& key : *static_cast<S const*>(set)) visit(context, &key, nullptr);
          }};
      return table;
    }
  };
};

struct ReflectedReturnType {
  octet_t const* m_type;  // null for void
};

struct ReflectedArg {
  ConstStringZ m_name;
  octet_t const* m_type;
};

struct ReflectedField {
  ConstStringZ m_name;
  ssize_t m_offset;
  octet_t const* m_type;
};

struct ReflectedDepField {
  ConstStringZ m_name;
  ssize_t m_valueOffset;
  octet_t const* m_type;  // null for void
  ssize_t m_nodeOffset;
};

struct ReflectedModelField {
  ConstStringZ m_name;
  ssize_t m_offset;       // -1 for a dropped field
  octet_t const* m_type;  // null for a referenced model
  RSN m_added;
  RSN m_dropped;  // -1 while it is current
  PtrMapOrSetFns const* m_mapOrSetFns = nullptr;
};

struct ReflectedClassMethod {
  ConstStringZ m_name;
  ReflectedReturnType m_return;
  ReflectedArg const* m_args;
  ssize_t m_numArgs;
  octet_t const* m_metadata;
  bool m_isConst;
  FunctionPointer m_function;  // takes the object as its first argument
};

enum EClassFlags {
  CF_CLASS = 1,
  CF_MODEL = 2,
  CF_HAS_MODEL = 4,
  CF_REFERENCES_MODEL = 8,
  CF_ADT = 16,
  CF_PASS_BY_VALUE = 32,
  CF_RETURN_BY_VALUE = 64,
  CF_ROD = 128
};

typedef ptr<IObject>(__stdcall* CreateInstanceFn)();

struct ReflectedClass {
  uint32 m_flags;
  ConstStringZ m_name;
  std::size_t m_size;
  octet_t const* m_metadata;
  ReflectedField const* m_fields;
  ssize_t m_numFields;
  ReflectedModelField const* m_modelFields;
  ssize_t m_numModelFields;
  ReflectedDepField const* m_depFields;
  ssize_t m_numDepFields;
  ReflectedClassMethod const* m_methods;
  ssize_t m_numMethods;
  ConstStringZ const* m_strings;
  ConstStringZ const* m_interfaces;  // the bases of its interfaces, then its own
  ssize_t m_numBaseInterfaces;
  ssize_t m_numInterfaces;
  void const* m_objectTable;  // that of IObject
  CreateInstanceFn m_create;
  TypeOps m_ops;
};

struct ReflectedInterfaceMethod {
  ConstStringZ m_name;
  ReflectedReturnType m_return;
  ReflectedArg const* m_args;
  ssize_t m_numArgs;
  octet_t const* m_metadata;
};

struct ReflectedAttribute {
  ConstStringZ m_name;
  octet_t const* m_type;
};

struct ReflectedInterface;

// The address of an interface's record, as `&record` gives it. It is a pointer, except that it equals that of a copy:
// of a record of the same name and layout in another module of the process (Layout.h compares them).
class InterfaceRecord {
 public:
  InterfaceRecord(ReflectedInterface const* record) : m_record(record) {}
  operator ReflectedInterface const*() const { return m_record; }
  ReflectedInterface const& operator*() const { return *m_record; }
  ReflectedInterface const* operator->() const { return m_record; }
  friend bool operator==(InterfaceRecord a, InterfaceRecord b);
  friend bool operator!=(InterfaceRecord a, InterfaceRecord b) { return !(a == b); }
  friend bool operator==(InterfaceRecord a, ReflectedInterface const* b) { return a == InterfaceRecord(b); }
  friend bool operator!=(InterfaceRecord a, ReflectedInterface const* b) { return !(a == InterfaceRecord(b)); }

 private:
  ReflectedInterface const* m_record;
};

struct ReflectedInterface {
  InterfaceRecord operator&() const { return std::addressof(*this); }
  ConstStringZ m_name;
  octet_t const* m_metadata;
  ConstStringZ const* m_bases;
  ssize_t m_numBases;
  ssize_t m_numInheritedMethods;
  ReflectedInterfaceMethod const* m_methods;
  ssize_t m_numMethods;
  ReflectedAttribute const* m_attributes;
  ssize_t m_numAttributes;
  ConstStringZ const* m_strings;
};

struct ReflectedEnum {
  ConstStringZ m_name;
  octet_t const* m_metadata;
  ConstStringZ const* m_strings;
  ssize_t m_numLabels;
  ConstStringZ const* m_labels;
  int32 const* m_values;  // null: the positions
  bool const* m_enabled;  // null: all
};

struct ReflectedVariant {
  ConstStringZ m_name;
  std::size_t m_size;
  octet_t const* m_metadata;
  ReflectedField const* m_items;  // in the order of their tags; without a type for an anonymous struct
  ssize_t m_numItems;
  ConstStringZ const* m_strings;
  TypeOps m_ops;
};

struct ReflectedFunctor {
  ConstStringZ m_name;
  ReflectedReturnType m_return;
  ReflectedArg const* m_args;
  ssize_t m_numArgs;
  octet_t const* m_metadata;
  ConstStringZ const* m_strings;
};

struct ReflectedGlobalFunction {
  ConstStringZ m_name;
  ReflectedReturnType m_return;
  ReflectedArg const* m_args;
  ssize_t m_numArgs;
  octet_t const* m_metadata;
  ConstStringZ const* m_strings;
  FunctionPointer m_function;
};

struct ReflectedGlobalVariable {
  ConstStringZ m_name;
  void const* m_address;
  octet_t const* m_type;
  ConstStringZ const* m_strings;
};

struct ReflectedTypedef {
  ConstStringZ m_name;
  octet_t const* m_type;
  ConstStringZ const* m_strings;
};

// The records of a type, found through the name space of the type.
template <typename T>
ReflectedClass const& GetReflectedClass() {
  return _GetReflected(static_cast<T const*>(nullptr));
}
template <typename T>
ReflectedInterface const& GetReflectedInterface() {
  return _GetReflected(static_cast<T const*>(nullptr));
}
template <typename T>
ReflectedVariant const& GetReflectedVariant() {
  return _GetReflected(static_cast<T const*>(nullptr));
}
template <typename T>
ReflectedEnum const& GetReflectedEnum() {
  return _GetReflected(static_cast<T const*>(nullptr));
}
template <typename T>
ReflectedFunctor const& GetReflectedFunctor() {
  return _GetReflected(static_cast<T const*>(nullptr));
}

template <typename T>
using ClassRecordExpression = decltype(static_cast<ReflectedClass const&>(_GetReflected(std::declval<T const*>())));

// Null for a class without a record.
template <typename T>
ReflectedClass const* RecordOf() {
  if constexpr (Detects<ClassRecordExpression, T>) return &_GetReflected(static_cast<T const*>(nullptr));
  return nullptr;
}

// Null for a number without a label.
inline ConstStringZ FindLabel(ReflectedEnum const& record, int32 number) {
  if (!record.m_values) return number >= 0 && number < record.m_numLabels ? record.m_labels[number] : nullptr;
  for (ssize_t i = 0; i < record.m_numLabels; ++i) {
    if (record.m_values[i] == number) return record.m_labels[i];
  }
  return nullptr;
}

// An enumeration with a record prints its label.
inline xostream& PrintEnum(xostream& os, ReflectedEnum const* record, int32 number) {
  if (ConstStringZ label = record ? FindLabel(*record, number) : nullptr) return os << label;
  return os << number;
}

template <typename E>
using EnumRecordExpression = decltype(static_cast<ReflectedEnum const&>(_GetReflected(std::declval<E const*>())));

template <typename E, typename = std::enable_if_t<std::is_enum<E>::value>, typename = void>
xostream& operator<<(xostream& os, E value) {
  ReflectedEnum const* record = nullptr;
  if constexpr (Detects<EnumRecordExpression, E>) record = &GetReflectedEnum<E>();
  return PrintEnum(os, record, static_cast<int32>(value));
}

template <typename I>
ConstStringZ GetIpcInterfaceName() {
  return _GetIpcInterfaceName(static_cast<I const*>(nullptr));
}

}  // namespace vesk
