// Interface handles. An interface is a pair: the object, and the table of functions that reach its methods. ptr<I> is a
// plain pointer to an object seen through I; it owns nothing. pref<I> and cref<C> are the references that archives
// keep: they are followed when an object is written, and restored when it is read. All compare by the object.

@import "Vesk/vxObject/Reflected.h"

namespace vesk {

// Any ptr<I>, its interface forgotten. Generated text reads a ptr<I> through it, hence the attribute.
struct __attribute__((may_alias)) AnyInterface {
  void* m_self = nullptr;
  void const* m_table = nullptr;
};

template <typename C>
using FinalClassOf = typename C::FinalClass;

// What an object answers about itself (its record, how it is archived, visited and destroyed) comes from its final
// class: the one that its `isa` names its base after. A class that only inherits all that would be written, collected
// and destroyed as its base, and what it adds would be lost. (A mixin is a part of its final class, and passes.)
template <typename C>
void AssertFinalClass() {
  if constexpr (Detects<FinalClassOf, C>) {
    typedef typename C::FinalClass Final;
    static_assert(std::is_same<Final, C>::value || std::is_base_of<C, Final>::value,
                  "This class derives from a class that is an object, but is none itself: it would be archived, "
                  "collected and destroyed as that base. Share code by a mixin instead.");
  }
}

// One use of a handle: what `p->` reaches.
template <typename I>
struct HandleAccess {
  I m_handle;
  I* operator->() { return &m_handle; }
};

template <typename I>
class ptr {
 public:
  ptr() {}
  ptr(NullInterface) {}
  ptr(std::nullptr_t) {}
  ptr(void* self, void const* table) : m_self(self), m_table(table) {}
  explicit ptr(AnyInterface any) : m_self(any.m_self), m_table(any.m_table) {}
  ptr(I const& handle) : m_self(handle.m_self), m_table(handle.m_table) {}

  // Any object whose class has the methods of I.
  template <typename C, typename = std::enable_if_t<std::is_class<C>::value>>
  ptr(C* object) {
    typedef std::remove_const_t<C> Class;
    AssertFinalClass<Class>();
    m_self = const_cast<Class*>(object);
    if (object) m_table = &I::template Stubs<Class>::GetTable();
  }

  // From an interface that derives from I.
  template <typename J, typename = std::enable_if_t<!std::is_same<I, J>::value && std::is_convertible<J, I>::value>>
  ptr(ptr<J> const& rhs) {
    if (rhs) *this = ptr(static_cast<I>(*rhs));
  }

  I operator*() const { return I(m_self, static_cast<typename I::FnTable const*>(m_table)); }
  HandleAccess<I> operator->() const { return {**this}; }
  explicit operator bool() const { return m_self != nullptr; }
  void* Object() const { return m_self; }
  AnyInterface Any() const { return {m_self, m_table}; }

  friend bool operator==(ptr const& a, ptr const& b) { return a.m_self == b.m_self; }
  friend bool operator!=(ptr const& a, ptr const& b) { return a.m_self != b.m_self; }
  friend bool operator<(ptr const& a, ptr const& b) { return a.m_self < b.m_self; }
  friend xostream& operator<<(xostream& os, ptr const& p) { return os << p.m_self; }

 private:
  void* m_self = nullptr;
  void const* m_table = nullptr;
};

// What is common to the references that archives and pref visitors follow.
class PersistentReference {
 public:
  explicit operator bool() const { return m_self != nullptr; }
  void* Object() const { return m_self; }

 protected:
  friend struct ReferenceCleaner;
  explicit PersistentReference(void* self) : m_self(self) {}
  void* m_self;
};

template <typename I>
class pref : public PersistentReference {
 public:
  pref() : PersistentReference(nullptr) {}
  pref(NullInterface) : pref() {}
  pref(std::nullptr_t) : pref() {}
  pref(ptr<I> const& p) : PersistentReference(p.Object()), m_table(p.Any().m_table) {}
  template <typename C, typename = std::enable_if_t<std::is_class<C>::value>>
  pref(C* object) : pref(ptr<I>(object)) {}

  ptr<I> Get() const { return ptr<I>(m_self, m_table); }
  operator ptr<I>() const { return Get(); }
  I operator*() const { return *Get(); }
  HandleAccess<I> operator->() const { return {*Get()}; }

  friend bool operator==(pref const& a, pref const& b) { return a.m_self == b.m_self; }
  friend bool operator!=(pref const& a, pref const& b) { return a.m_self != b.m_self; }
  friend bool operator<(pref const& a, pref const& b) { return a.m_self < b.m_self; }
  friend xostream& operator<<(xostream& os, pref const& p) { return os << p.m_self; }

 private:
  void const* m_table = nullptr;
};

template <typename C>
class cref : public PersistentReference {
 public:
  cref(C* object = nullptr) : PersistentReference(object) {}
  cref(NullInterface) : cref() {}

  C* Get() const { return static_cast<C*>(m_self); }
  C& operator*() const { return *Get(); }
  C* operator->() const { return Get(); }

  friend bool operator==(cref const& a, cref const& b) { return a.m_self == b.m_self; }
  friend bool operator!=(cref const& a, cref const& b) { return a.m_self != b.m_self; }
  friend bool operator<(cref const& a, cref const& b) { return a.m_self < b.m_self; }
  friend xostream& operator<<(xostream& os, cref const& c) { return os << c.m_self; }
};

// Asks an object for another of its interfaces. Null when it has none of that name. I must be registered.
template <typename I, typename J>
ptr<I> QueryInterface(ptr<J> const& p) {
  if (!p) return ptr<I>();
  std::remove_const_t<J> object = *p;  // asking changes nothing, though the method is not const
  return ptr<I>(object.QueryInterface(GetReflectedInterface<std::remove_const_t<I>>()));
}

namespace unqualified {
using vesk::cref;
using vesk::pref;
using vesk::ptr;
}  // namespace unqualified

}  // namespace vesk
