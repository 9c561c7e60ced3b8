// What annotations of C++26 hold for metadata that has no constant of its own: texts and lists. Generated text names
// these types where the key `annotations` is set and the compiler reflects.
#pragma once

#include <cstddef>

namespace vesk {

// All members are public: only such a type can be that of an annotation.
template <size_t size>
struct AnnotationText {
  char text[size]{};
  constexpr AnnotationText(const char (&literal)[size]) {
    for (size_t i = 0; i < size; ++i) text[i] = literal[i];
  }
  constexpr operator const char*() const { return text; }
};

// AnnotationList(1, AnnotationText("m")): `first`, then the list `rest`.
template <typename... Items>
struct AnnotationList {};

template <typename First, typename... Rest>
struct AnnotationList<First, Rest...> {
  First first;
  AnnotationList<Rest...> rest;
  constexpr AnnotationList(const First& item, const Rest&... items) : first(item), rest(items...) {}
};

template <typename... Items>
AnnotationList(const Items&...) -> AnnotationList<Items...>;

}  // namespace vesk
