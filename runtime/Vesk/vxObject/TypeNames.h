// From a C++ type to the type of the reflection grammar that byte code would tell: TypeOf<xvector<int32>>(). Names of
// classes, enumerations and so on are those of their records.

@import "Vesk/vxObject/IObject.h"

#include <tuple>

namespace vesk {

inline ReflectedType NamedType(octet_t code, ConstStringZ name) {
  ReflectedType type;
  type.m_code = code;
  type.m_name = name;
  return type;
}
inline ReflectedType TypeAround(octet_t code, ReflectedType inner) {
  ReflectedType type;
  type.m_code = code;
  type.m_inner.push_back(std::move(inner));
  return type;
}

template <typename T>
using RecordExpression = decltype(_GetReflected(std::declval<T const*>()));

template <typename T>
ReflectedType TypeOf();

// A type with a record, or a scalar.
template <typename T>
struct TypeOfValue {
  static ReflectedType Get() {
    typedef std::tuple<void, bool, int8, int16, int32, int64, int128, uint8, uint16, uint32, uint64, uint128, float32,
                       float64, char8, char16, string8, string16>
        Scalars;
    constexpr int code = CodeOf(static_cast<Scalars*>(nullptr));
    if constexpr (code >= 0) {
      return NamedType(static_cast<octet_t>(code), "");
    } else {
      static_assert(Detects<RecordExpression, T>, "the type is not reflected");
      return OfRecord(_GetReflected(static_cast<T const*>(nullptr)));
    }
  }

 private:
  template <typename... S>
  static constexpr int CodeOf(std::tuple<S...>*) {
    int code = -1, i = 0;
    ((std::is_same<S, T>::value ? code = i : 0, ++i), ...);
    return code;
  }
  static ReflectedType OfRecord(ReflectedClass const& r) { return NamedType(RC_CLASS, r.m_name); }
  static ReflectedType OfRecord(ReflectedInterface const& r) { return NamedType(RC_INTERFACE, r.m_name); }
  static ReflectedType OfRecord(ReflectedEnum const& r) { return NamedType(RC_ENUM, r.m_name); }
  static ReflectedType OfRecord(ReflectedVariant const& r) { return NamedType(RC_VARIANT, r.m_name); }
  static ReflectedType OfRecord(ReflectedFunctor const& r) { return NamedType(RC_FUNCTOR, r.m_name); }
  static ReflectedType OfRecord(ReflectionByteCode code) { return DecodeType(code); }
};

template <typename T, octet_t Code>
struct TypeOfAround {
  static ReflectedType Get() { return TypeAround(Code, TypeOf<T>()); }
};
template <typename T>
struct TypeOfValue<T const> : TypeOfAround<T, RC_CONST> {};
template <typename T>
struct TypeOfValue<T volatile> : TypeOfAround<T, RC_VOLATILE> {};
template <typename T>
struct TypeOfValue<T*> : TypeOfAround<T, RC_POINTER> {};
template <typename T>
struct TypeOfValue<T&> : TypeOfAround<T, RC_REFERENCE> {};
template <typename T>
struct TypeOfValue<ptr<T>> : TypeOfAround<T, RC_PTR> {};
template <typename T>
struct TypeOfValue<openvariant<T>> : TypeOfAround<T, RC_OPENVARIANT> {};
template <typename T>
struct TypeOfValue<pref<T>> : TypeOfAround<T, RC_PREF> {};
template <typename T>
struct TypeOfValue<cref<T>> : TypeOfAround<T, RC_CREF> {};
template <typename T>
struct TypeOfValue<xvector<T>> : TypeOfAround<T, RC_VECTOR> {};
template <typename T>
struct TypeOfValue<xdeque<T>> : TypeOfAround<T, RC_DEQUE> {};
template <typename T>
struct TypeOfValue<xlist<T>> : TypeOfAround<T, RC_LIST> {};
template <typename T>
struct TypeOfValue<xset<T>> : TypeOfAround<T, RC_SET> {};
template <typename T>
struct TypeOfValue<xbag<T>> : TypeOfAround<T, RC_BAG> {};
template <typename T>
struct TypeOfValue<DynArray<T>> : TypeOfAround<T, RC_DYNARRAY> {};
template <typename T, ssize_t N>
struct TypeOfValue<Array<T, N>> {
  static ReflectedType Get() {
    ReflectedType type = TypeAround(RC_ARRAY, TypeOf<T>());
    type.m_size = static_cast<int32>(N);
    return type;
  }
};
template <typename T, std::size_t N>
struct TypeOfValue<T[N]> : TypeOfValue<Array<T, static_cast<ssize_t>(N)>> {};
template <typename K, typename V>
struct TypeOfValue<xmap<K, V>> {
  static ReflectedType Get() {
    ReflectedType type = TypeAround(RC_MAP, TypeOf<K>());
    type.m_inner.push_back(TypeOf<V>());
    return type;
  }
};

template <typename T>
ReflectedType TypeOf() {
  return TypeOfValue<T>::Get();
}

// Without metadata, and typedefs as what they stand for: what two spellings of a type have in common.
inline ReflectedType PlainType(ReflectedType type) {
  if (type.m_code == RC_TYPEDEF) {
    if (ReflectedTypedef const* record = Find<ReflectedTypedef>(type.m_name)) {
      return PlainType(DecodeType({record->m_type, record->m_strings}));
    }
  }
  type.m_metadata.clear();
  for (ReflectedType& inner : type.m_inner) inner = PlainType(inner);
  return type;
}

}  // namespace vesk
