// The functions that fill a TypeOps, and the tables of the types that have no record of their own. What a type cannot
// do (compare, print, be archived) its functions refuse at run time, so that a table can be made of any type.

@import "Vesk/vxObject/Archive.h"
@import "Vesk/vxObject/Visitors.h"

#include <cstring>

namespace vesk {

template <typename T>
using PrintExpression = decltype(std::declval<xostream&>() << std::declval<T const&>());
template <typename T>
using OffersPrint = Detector<void, PrintExpression, T>;

template <typename T>
bool VariableEqual(T const* a, T const* b) {
  if constexpr (HasEqual<T>) return *a == *b;
  return a == b;
}

template <typename T>
bool VariableLess(T const* a, T const* b) {
  if constexpr (HasLess<T>) return *a < *b;
  return a < b;
}

template <typename T>
void PrintVariable(xostream& os, T const* x) {
  if constexpr (PartsOffer<OffersPrint, T>::value) {
    os << *x;
  } else {
    os << "?";
  }
}

template <typename T>
void ConstructArray(T* array, ssize_t begin, ssize_t end) {
  if constexpr (IsArithmetic<T>) {
    std::memset(array + begin, 0, static_cast<std::size_t>(end - begin) * sizeof(T));
  } else {
    std::uninitialized_value_construct(array + begin, array + end);
  }
}

// A container of keys that have no order is always empty, and not every standard library can copy it.
template <typename T, typename = void>
constexpr bool IsEverEmpty = false;
template <typename T>
constexpr bool IsEverEmpty<T, std::enable_if_t<ContainerTraits<T>::keyed>> = !HasLess<typename T::key_type>;

template <typename T>
void CopyConstructArray(T* array, ssize_t at, T const* source, ssize_t begin, ssize_t end) {
  if constexpr (IsArithmetic<T>) {
    std::memcpy(array + at, source + begin, static_cast<std::size_t>(end - begin) * sizeof(T));
  } else if constexpr (IsEverEmpty<T>) {
    ConstructArray(array, at, at + end - begin);
  } else {
    std::uninitialized_copy(source + begin, source + end, array + at);
  }
}

template <typename T>
void AssignArray(T* array, ssize_t at, T const* source, ssize_t begin, ssize_t end) {
  for (ssize_t i = begin; i < end; ++i, ++at) {
    if constexpr (IsEverEmpty<T>) {
    } else if constexpr (std::is_copy_assignable<T>::value || !std::is_copy_constructible<T>::value) {
      array[at] = source[i];
    } else if (array + at != source + i) {  // it has const fields
      array[at].~T();
      new (array + at) T(source[i]);
    }
  }
}

// The range that asks for the alignment of the type in place of destroying anything.
constexpr ssize_t kAskAlignment = -1;

template <typename T>
void DestructArray(T* array, ssize_t begin, ssize_t end) {
  if (begin == kAskAlignment) {
    *static_cast<ssize_t*>(static_cast<void*>(array)) = alignof(T);
    return;
  }
  for (ssize_t i = begin; i < end; ++i) array[i].~T();
}

template <typename T>
using OffersArchive =
    std::disjunction<std::is_enum<T>, Detector<void, SerialiseMember, T>, Detector<void, SerialiseFunction, T>>;
template <typename T>
constexpr bool IsSerialisable = PartsOffer<OffersArchive, T>::value;

template <typename T>
void SerialiseArray(Archive& ar, T const* array, ssize_t begin, ssize_t end) {
  if constexpr (IsSerialisable<T>) {
    for (ssize_t i = begin; i < end; ++i) ar << array[i];
  } else {
    FailArchive("type cannot be archived");
  }
}

template <typename T>
void DeserialiseArray(InputArchive& ar, T* array, ssize_t begin, ssize_t end) {
  if constexpr (IsSerialisable<T>) {
    for (ssize_t i = begin; i < end; ++i) ar >> array[i];
  } else {
    FailArchive("type cannot be archived");
  }
}

// Of a type that is known only by its operations. One that cannot be destroyed is taken to be aligned by its size.
inline std::size_t AlignmentOf(TypeOps const& ops) {
  if (!ops.m_destruct) return std::min<std::size_t>(ops.m_size & (~ops.m_size + 1), alignof(void*));
  ssize_t alignment;
  ops.m_destruct(&alignment, kAskAlignment, kAskAlignment);
  return static_cast<std::size_t>(alignment);
}

template <typename T>
void VisitObjectsInArray(IObjectVisitor& v, T const* array, ssize_t begin, ssize_t end) {
  if constexpr (!IsArithmetic<T>) {
    for (ssize_t i = begin; i < end; ++i) v << array[i];
  }
}

template <typename T>
void VisitPrefsInArray(IPrefVisitor& v, T const* array, ssize_t begin, ssize_t end) {
  if constexpr (!IsArithmetic<T>) {
    for (ssize_t i = begin; i < end; ++i) v << array[i];
  }
}

template <typename T>
ssize_t BinaryLowerBound(T const* array, ssize_t begin, ssize_t end, T const* key) {
  while (begin < end) {
    const ssize_t middle = begin + (end - begin) / 2;
    VariableLess(array + middle, key) ? begin = middle + 1 : end = middle;
  }
  return begin;
}

template <typename T>
ssize_t BinaryUpperBound(T const* array, ssize_t begin, ssize_t end, T const* key) {
  while (begin < end) {
    const ssize_t middle = begin + (end - begin) / 2;
    VariableLess(key, array + middle) ? end = middle : begin = middle + 1;
  }
  return begin;
}

template <typename T>
TypeOps const& MakeTypeOps() {
  static const TypeOps ops = {
      sizeof(T),
      (CompareVariableFn)(bool (*)(T const*, T const*))VariableEqual<T>,
      (CompareVariableFn)(bool (*)(T const*, T const*))VariableLess<T>,
      (PrintVariableFn)(void (*)(xostream&, T const*))PrintVariable<T>,
      (ConstructArrayFn)(void (*)(T*, ssize_t, ssize_t))ConstructArray<T>,
      (CopyConstructArrayFn)(void (*)(T*, ssize_t, T const*, ssize_t, ssize_t))CopyConstructArray<T>,
      (AssignArrayFn)(void (*)(T*, ssize_t, T const*, ssize_t, ssize_t))AssignArray<T>,
      (DestructArrayFn)(void (*)(T*, ssize_t, ssize_t))DestructArray<T>,
      (SerialiseArrayFn)(void (*)(Archive&, T const*, ssize_t, ssize_t))SerialiseArray<T>,
      (DeserialiseArrayFn)(void (*)(InputArchive&, T*, ssize_t, ssize_t))DeserialiseArray<T>,
      (VisitObjectsInArrayFn)(void (*)(IObjectVisitor&, T const*, ssize_t, ssize_t))VisitObjectsInArray<T>,
      (VisitPrefsInArrayFn)(void (*)(IPrefVisitor&, T const*, ssize_t, ssize_t))VisitPrefsInArray<T>,
      (FindInArrayFn)(ssize_t(*)(T const*, ssize_t, ssize_t, T const*))BinaryLowerBound<T>,
      (FindInArrayFn)(ssize_t(*)(T const*, ssize_t, ssize_t, T const*))BinaryUpperBound<T>};
  return ops;
}

template <typename T>
using GetTypeOpsFunction = decltype(_GetTypeOps(std::declval<T const*>()));

// The table of a type: of its record or of `$type` where the type's name space has it, else one made here.
template <typename T>
TypeOps const& GetTypeOps() {
  if constexpr (Detects<GetTypeOpsFunction, T>) {
    return _GetTypeOps(static_cast<T const*>(nullptr));
  } else {
    return MakeTypeOps<T>();
  }
}

}  // namespace vesk
