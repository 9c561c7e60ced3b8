// Visitors over the objects that a value refers to, and over its persistent references. `v << x` works for every type:
// containers are walked, pointers and references are reported, classes visit their own members, anything else is
// silent.

@import "Vesk/vxObject/Handles.h"

namespace vesk {

// Is told each object that a pointer, ptr, pref or cref leads to. The object is not entered: call its VisitObjects to
// go on.
struct IObjectVisitor {
  virtual ~IObjectVisitor() {}
  virtual void VisitObject(ptr<IObject> const& object) = 0;

  // Where the first value that is visited stands, for who seeks it.
  bool m_seeks = false;
  void const* m_found = nullptr;
};

// Is told each pref and cref, null ones included.
struct IPrefVisitor {
  virtual ~IPrefVisitor() {}
  virtual void VisitPref(PersistentReference const& reference) = 0;
};

template <typename T>
using VisitObjectsMember = decltype(std::declval<T const&>().VisitObjects(std::declval<IObjectVisitor&>()));
template <typename T>
using VisitPrefsMember = decltype(std::declval<T const&>().VisitPrefs(std::declval<IPrefVisitor&>()));
template <typename T>
using QueryInterfaceMember = decltype(std::declval<T&>().QueryInterface(std::declval<ReflectedInterface const&>()));

// A class that an IObject can stand for.
template <typename T>
constexpr bool IsObjectClass = Detects<QueryInterfaceMember, T>;

template <typename T>
IObjectVisitor& operator<<(IObjectVisitor& v, T const& x);
template <typename T>
IPrefVisitor& operator<<(IPrefVisitor& v, T const& x);

template <typename T>
void VisitObjectBehind(IObjectVisitor& v, T* object) {
  if constexpr (std::is_class<T>::value && !std::is_const<T>::value) {
    if constexpr (IsObjectClass<T>) {
      if (object) v.VisitObject(ptr<IObject>(object));
    }
  }
}

template <typename I>
void VisitObjectBehind(IObjectVisitor& v, ptr<I> const& p) {
  if constexpr (IsObjectClass<I>) {
    if (p) v.VisitObject(QueryInterface<IObject>(p));
  }
}

template <typename T>
struct ReferenceKind {
  static const int value = 0;
};
template <typename I>
struct ReferenceKind<ptr<I>> {
  static const int value = 1;
};
template <typename I>
struct ReferenceKind<pref<I>> {
  static const int value = 2;
};
template <typename C>
struct ReferenceKind<cref<C>> {
  static const int value = 3;
};

template <typename V, typename A, typename B>
void VisitParts(V& v, std::pair<A, B> const& pair) {
  v << pair.first << pair.second;
}
template <typename V, typename T>
void VisitParts(V& v, T const& x) {
  if constexpr (IsContainer<T>) {
    for (auto const& item : x) v << item;
  }
}

template <typename T>
IObjectVisitor& operator<<(IObjectVisitor& v, T const& x) {
  if (v.m_seeks) {
    v.m_found = &x;
    v.m_seeks = false;
  }
  if constexpr (ReferenceKind<T>::value == 1) {
    VisitObjectBehind(v, x);
  } else if constexpr (ReferenceKind<T>::value >= 2) {
    VisitObjectBehind(v, x.Get());
  } else if constexpr (std::is_pointer<T>::value) {
    VisitObjectBehind(v, const_cast<std::remove_const_t<std::remove_pointer_t<T>>*>(x));
  } else if constexpr (Detects<VisitObjectsMember, T>) {
    x.VisitObjects(v);
  } else {
    VisitParts(v, x);
  }
  return v;
}

template <typename T>
IPrefVisitor& operator<<(IPrefVisitor& v, T const& x) {
  if constexpr (ReferenceKind<T>::value >= 2) {
    v.VisitPref(x);
  } else if constexpr (Detects<VisitPrefsMember, T>) {
    x.VisitPrefs(v);
  } else {
    VisitParts(v, x);
  }
  return v;
}

}  // namespace vesk
