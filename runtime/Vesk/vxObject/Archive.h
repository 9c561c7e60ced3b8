// How values stand in archives. Scalars are their bytes, little-endian; strings and containers are a compact length and
// their items, of which scalars are one block. A type is written by its own Serialise(Archive&), else by the function
// Serialise(Archive&, T) of its name space. What is read is checked before it is assigned: a value never has contents
// that its type does not allow.

@import "Vesk/vxObject/Releases.h"

#include <algorithm>

namespace vesk {

template <typename T>
Archive& operator<<(Archive& ar, T const& v);
template <typename T>
InputArchive& operator>>(InputArchive& ar, T& v);

// --- Scalars

inline void SwapBytes(void* items, std::size_t count, std::size_t size) {
  octet_t* bytes = static_cast<octet_t*>(items);
  for (std::size_t i = 0; i < count; ++i, bytes += size) std::reverse(bytes, bytes + size);
}

template <typename T>
void WriteScalars(Archive& ar, T const* items, std::size_t count) {
  const std::size_t size = count * sizeof(T);
  ar.Write(items, size);
  if (ArchivesSwapBytes && !ar.m_hostOrder) {
    SwapBytes(ar.m_bytes.data() + ar.m_bytes.size() - size, count, sizeof(T));
  }
}

// Not for bool, whose bytes must be looked at.
template <typename T>
void ReadScalars(InputArchive& ar, T* items, std::size_t count) {
  ar.Read(items, count * sizeof(T));
  if (ArchivesSwapBytes && !ar.m_hostOrder) SwapBytes(items, count, sizeof(T));
}

template <typename T, typename = std::enable_if_t<IsArithmetic<T>>>
void Serialise(Archive& ar, T v) {
  WriteScalars(ar, &v, 1);
}
template <typename T, typename = std::enable_if_t<IsArithmetic<T>>>
void Deserialise(InputArchive& ar, T& v) {
  if constexpr (std::is_same<T, bool>::value) {
    const octet_t number = *ar.Take(1);
    if (number > 1) FailArchive("not a bool");
    v = number != 0;
  } else {
    ReadScalars(ar, &v, 1);
  }
}

// --- Strings and containers

// How many bytes a value takes at least, 0 where that is not known.
template <typename T>
constexpr std::size_t LeastBytes = IsArithmetic<T> ? sizeof(T)
                                   : std::is_enum<T>::value || std::is_base_of<PersistentReference, T>::value ? 1
                                   : IsContainer<T>                                                           ? 1
                                                                                                              : 0;
template <typename C>
constexpr std::size_t LeastBytes<basic_xstring<C>> = 1;
template <typename A, typename B>
constexpr std::size_t LeastBytes<std::pair<A, B>> = LeastBytes<A> + LeastBytes<B>;

inline std::size_t ReadCount(InputArchive& ar, std::size_t leastBytes) {
  const std::size_t count = ReadCompact(ar);
  if (leastBytes > 0 && count > ar.Remaining() / leastBytes) FailArchive("more elements than an archive holds");
  return count;
}

template <typename C>
void Serialise(Archive& ar, basic_xstring<C> const& v) {
  SerialiseVariableLengthUint(ar, v.size());
  WriteScalars(ar, v.data(), v.size());
}
template <typename C>
void Deserialise(InputArchive& ar, basic_xstring<C>& v) {
  const std::size_t count = ReadCount(ar, sizeof(C));
  if constexpr (sizeof(C) == 1) {
    v.assign(reinterpret_cast<C const*>(ar.Take(count)), count);
  } else {
    v.resize(count);
    ReadScalars(ar, &v[0], count);
  }
}

template <typename A, typename B>
void Serialise(Archive& ar, std::pair<A, B> const& v) {
  ar << v.first << v.second;
}
template <typename A, typename B>
void Deserialise(InputArchive& ar, std::pair<A, B>& v) {
  ar >> v.first >> v.second;
}

template <typename T>
constexpr bool IsFixedArray = false;
template <typename T, ssize_t N>
constexpr bool IsFixedArray<Array<T, N>> = true;

// Scalars that stand side by side.
template <typename T>
constexpr bool IsBlock = false;
template <typename T>
constexpr bool IsBlock<xvector<T>> = IsArithmetic<T> && !std::is_same<T, bool>::value;
template <typename T>
constexpr bool IsBlock<DynArray<T>> = IsBlock<xvector<T>>;
template <typename T, ssize_t N>
constexpr bool IsBlock<Array<T, N>> = IsBlock<xvector<T>>;

template <typename T>
void ReadElement(InputArchive& ar, T& item) {
  const std::size_t position = ar.m_position;
  ar >> item;
  if (LeastBytes<T> == 0 && ar.m_position == position) ar.CountEmptyElement();
}

// How many of `count` elements to make room for ahead: memory is in proportion to the bytes that are left.
template <typename T>
std::size_t RoomFor(InputArchive const& ar, std::size_t count) {
  return std::min(count, 16 + 4 * (ar.Remaining() / sizeof(T)));
}

template <typename T>
void ReadElements(InputArchive& ar, xvector<T>& v, std::size_t count) {
  v.clear();
  v.reserve(RoomFor<T>(ar, count));
  for (std::size_t i = 0; i < count; ++i) {
    if constexpr (std::is_same<T, bool>::value) {
      bool item;
      ar >> item;
      v.push_back(item);
    } else {
      v.emplace_back();
      ReadElement(ar, v.back());
    }
  }
}

template <typename T>
void ReadElements(InputArchive& ar, DynArray<T>& v, std::size_t count) {
  v = DynArray<T>();
  for (std::size_t have = 0; have < count;) {
    const std::size_t room = std::min(count, std::max(2 * have, RoomFor<T>(ar, count)));
    v.resize(static_cast<ssize_t>(room));
    for (; have < room; ++have) ReadElement(ar, v[static_cast<ssize_t>(have)]);
  }
}

template <typename T, ssize_t N>
void ReadElements(InputArchive& ar, Array<T, N>& v, std::size_t) {
  for (T& item : v) ReadElement(ar, item);
}

template <typename T, typename Item>
void AddElement(T& v, Item&& item) {
  if constexpr (!ContainerTraits<T>::keyed) {
    v.push_back(std::move(item));
  } else if constexpr (HasLess<typename T::key_type>) {
    v.insert(v.end(), std::move(item));
  } else {
    FailArchive("keys without an order");
  }
}

template <typename T>
void ReadElements(InputArchive& ar, T& v, std::size_t count) {
  v.clear();
  for (std::size_t i = 0; i < count; ++i) {
    typename ContainerTraits<T>::element_type item = typename ContainerTraits<T>::element_type();
    ReadElement(ar, item);
    AddElement(v, std::move(item));
  }
}

template <typename T, typename = std::enable_if_t<IsContainer<T>>>
void Serialise(Archive& ar, T const& v) {
  SerialiseVariableLengthUint(ar, v.size());
  if constexpr (IsBlock<T>) {
    if (v.size() > 0) WriteScalars(ar, &*v.begin(), v.size());
  } else {
    for (auto const& item : v) ar << AsElement<typename ContainerTraits<T>::element_type>(item);
  }
}
template <typename T, typename = std::enable_if_t<IsContainer<T>>, typename = void>
void Deserialise(InputArchive& ar, T& v) {
  const std::size_t count = ReadCount(ar, LeastBytes<typename ContainerTraits<T>::element_type>);
  if constexpr (IsFixedArray<T>) {
    if (count != static_cast<std::size_t>(v.size())) FailArchive("fixed array of another size");
  }
  if constexpr (IsBlock<T>) {
    if constexpr (!IsFixedArray<T>) v.resize(count);
    if (count > 0) ReadScalars(ar, &*v.begin(), count);
  } else {
    ReadElements(ar, v, count);
  }
}

// --- Enumerations and variants: their numbers

// A number without a label is refused; 0 is what a field begins with, label or not.
template <typename E>
void ReadEnum(InputArchive& ar, E& v) {
  const int32 number = static_cast<int32>(ReadCompact(ar));
  if constexpr (Detects<EnumRecordExpression, E>) {
    if (number != 0 && !ar.m_limits.m_anyEnumNumber && !FindLabel(GetReflectedEnum<E>(), number)) {
      FailArchive("number without a label in an enumeration");
    }
  }
  v = static_cast<E>(number);
}

template <typename T>
using VariantItemsExpression = decltype(T::_vesk_items_);
template <typename T>
using VariantRecordExpression = decltype(static_cast<ReflectedVariant const&>(_GetReflected(std::declval<T const*>())));

// A variant's own Deserialise begins by destroying the value, and takes any tag: look at the tag ahead of it.
template <typename T>
void CheckVariantTag(InputArchive& ar) {
  constexpr bool hasItems = Detects<VariantItemsExpression, T>;
  if constexpr (hasItems || Detects<VariantRecordExpression, T>) {
    const std::size_t position = ar.m_position;
    const std::size_t tag = ReadCompact(ar);
    ar.m_position = position;
    std::size_t count;
    if constexpr (hasItems) {
      count = T::_vesk_items_;
    } else {
      count = static_cast<std::size_t>(GetReflectedVariant<T>().m_numItems);
    }
    if (tag >= count) FailArchive("unknown tag of a variant");
  }
}

// --- Dispatch

template <typename T>
using SerialiseMember = decltype(std::declval<T const&>().Serialise(std::declval<Archive&>()));
template <typename T>
using SerialiseFunction = decltype(Serialise(std::declval<Archive&>(), std::declval<T const&>()));
template <typename T>
using DeserialiseMember = decltype(std::declval<T&>().Deserialise(std::declval<InputArchive&>()));
template <typename T>
using DeserialiseFunction = decltype(Deserialise(std::declval<InputArchive&>(), std::declval<T&>()));

template <typename T>
Archive& operator<<(Archive& ar, T const& v) {
  if constexpr (std::is_class<T>::value) NoteModel<T>(ar.m_models);
  if constexpr (std::is_enum<T>::value) {
    SerialiseVariableLengthUint(ar, static_cast<uint32>(v));
  } else if constexpr (Detects<SerialiseMember, T>) {
    v.Serialise(ar);
  } else {
    Serialise(ar, v);
  }
  return ar;
}

template <typename T>
InputArchive& operator>>(InputArchive& ar, T& v) {
  t_reading.m_target = nullptr;
  if constexpr (std::is_enum<T>::value) {
    ReadEnum(ar, v);
  } else if constexpr (LeastBytes<T> > 0) {
    Deserialise(ar, v);
  } else {
    const ReadingScope scope(ar);
    if constexpr (Detects<DeserialiseMember, T>) {
      CheckVariantTag<T>(ar);
      v.Deserialise(ar);
    } else {
      Deserialise(ar, v);
    }
  }
  return ar;
}

}  // namespace vesk
