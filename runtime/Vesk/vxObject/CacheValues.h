// The values that nodes keep: what they take on the heap, and what evicting them does. Overloads for a type of its own
// change that.

@import "Vesk/vxObject/Graph.h"

namespace vesk {

template <typename T>
constexpr bool TypeHasAdditionalSize() {
  return IsContainer<T> || std::is_same<T, string8>::value || std::is_same<T, string16>::value;
}

template <typename T>
ssize_t CacheValueAdditionalSize(T const& value) {
  if (ValuePlace* place = ValuePlace::Asked()) *place = {&value, sizeof(value)};
  if constexpr (TypeHasAdditionalSize<T>()) return static_cast<ssize_t>(value.size() * sizeof(*value.begin()));
  return 0;
}

// What a cached value may refuse: a type with an overload of its own.
template <typename T>
bool CacheValueIsEvictable(T const&) {
  return true;
}
template <typename T>
void OnEvictCacheValue(T const&) {}
template <typename T>
void ClearCacheValue(T& value) {
  value = T();
}

}  // namespace vesk
