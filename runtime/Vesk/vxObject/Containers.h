// The containers of the type grammar: those of the standard library, with the few operations that generated text adds.
// Positions are signed, a range is (first, count).

@import "Vesk/vxObject/Text.h"
@import "Vesk/vxObject/Traits.h"

#include <algorithm>
#include <deque>
#include <functional>
#include <limits>
#include <list>
#include <map>
#include <set>
#include <stdexcept>
#include <vector>

namespace vesk {

// Whether a value can hold no containers.
template <typename T>
constexpr bool IsLeaf = std::is_trivially_copyable<T>::value;
template <typename C>
constexpr bool IsLeaf<basic_xstring<C>> = true;
template <typename A, typename B>
constexpr bool IsLeaf<std::pair<A, B>> = IsLeaf<std::remove_const_t<A>>&& IsLeaf<B>;

// A container that may be assigned a part of itself, as a tree one of its branches, which is destroyed or written over
// in the midst of a plain assignment.
template <typename C>
class Assignable : public C {
 public:
  using C::C;
  Assignable() {}
  Assignable(C const& items) : C(items) {}
  Assignable(Assignable const&) = default;
  Assignable(Assignable&&) = default;
  Assignable& operator=(Assignable&&) = default;
  Assignable& operator=(Assignable const& rhs) {
    if constexpr (IsLeaf<typename C::value_type>) {
      C::operator=(rhs);
    } else {
      C::operator=(C(rhs));
    }
    return *this;
  }
};

template <typename T>
class xvector : public Assignable<std::vector<T>> {
 public:
  typedef std::vector<T> base;
  using typename base::const_iterator;
  using typename base::iterator;
  using Assignable<base>::Assignable;
  using base::erase;
  using base::insert;
  xvector() {}
  xvector(base const& items) : Assignable<base>(items) {}
  // Both throw std::out_of_range: a hook may have taken the position away since it was asked for.
  void erase(ssize_t first, ssize_t count) {
    const ssize_t size = static_cast<ssize_t>(base::size());
    if (first < 0 || count < 0 || first > size - count) throw std::out_of_range("elements to erase");
    base::erase(base::begin() + first, base::begin() + first + count);
  }
  // The items may be its own.
  iterator insert(const_iterator at, T const* first, T const* last) {
    if (at - base::cbegin() > base::cend() - base::cbegin()) throw std::out_of_range("position to insert at");
    if (last - first == 1) {
      if (at != base::cend()) return base::insert(at, *first);
      base::push_back(*first);
      return base::end() - 1;
    }
    if (!IsOwn(first)) return base::insert(at, first, last);
    const base items(first, last);
    return base::insert(at, items.begin(), items.end());
  }

 private:
  bool IsOwn(T const* item) const {
    if constexpr (std::is_same<T, bool>::value) {
      return false;
    } else {
      const std::less<T const*> less;
      return !less(item, base::data()) && less(item, base::data() + base::size());
    }
  }
};

template <typename T>
class xdeque : public Assignable<std::deque<T>> {
 public:
  using Assignable<std::deque<T>>::Assignable;
};

template <typename T>
class xlist : public Assignable<std::list<T>> {
 public:
  using Assignable<std::list<T>>::Assignable;
};

template <typename T>
class xset : public Assignable<std::set<T>> {
 public:
  using Assignable<std::set<T>>::Assignable;
  bool Insert(T const& key) { return this->insert(key).second; }
  bool Delete(T const& key) { return this->erase(key) > 0; }
  bool Contains(T const& key) const { return this->count(key) > 0; }
};

template <typename T>
class xbag : public Assignable<std::multiset<T>> {
 public:
  using Assignable<std::multiset<T>>::Assignable;
};

// A key that is not there: inserted by the non-const operator, std::out_of_range from the const one.
template <typename K, typename V>
class xmap : public Assignable<std::map<K, V>> {
 public:
  typedef std::map<K, V> base;
  using Assignable<base>::Assignable;
  V& operator[](K const& key) { return base::operator[](key); }
  V const& operator[](K const& key) const { return this->at(key); }
};

template <typename T, ssize_t N>
class Array {
 public:
  Array() : m_items() {}
  ssize_t size() const { return N; }
  T& operator[](ssize_t i) { return m_items[i]; }
  T const& operator[](ssize_t i) const { return m_items[i]; }
  T* begin() { return m_items; }
  T* end() { return m_items + N; }
  T const* begin() const { return m_items; }
  T const* end() const { return m_items + N; }

 private:
  T m_items[N];
};

// An array whose size is set at run time; it keeps its items when it is resized. (No std::vector: its bool has no
// references.)
template <typename T>
class DynArray {
 public:
  DynArray() {}
  explicit DynArray(ssize_t size) { resize(size); }
  DynArray(std::initializer_list<T> items) : DynArray(static_cast<ssize_t>(items.size())) {
    std::copy(items.begin(), items.end(), begin());
  }
  DynArray(DynArray const& rhs) : DynArray(rhs.m_size) { std::copy(rhs.begin(), rhs.end(), begin()); }
  DynArray(DynArray&& rhs) noexcept { swap(rhs); }
  DynArray& operator=(DynArray rhs) {
    swap(rhs);
    return *this;
  }
  ~DynArray() {
    std::destroy_n(m_items, m_size);
    if (m_items) std::allocator<T>().deallocate(m_items, static_cast<std::size_t>(m_size));
  }
  void swap(DynArray& rhs) noexcept {
    std::swap(m_size, rhs.m_size);
    std::swap(m_items, rhs.m_items);
  }
  // std::length_error for a size below 0, or above what memory could hold.
  void resize(ssize_t size) {
    constexpr ssize_t most = std::numeric_limits<ssize_t>::max() / static_cast<ssize_t>(sizeof(T));
    if (size < 0 || size > most) throw std::length_error("size of a DynArray");
    DynArray items;
    if (size > 0) items.m_items = std::allocator<T>().allocate(static_cast<std::size_t>(size));
    std::uninitialized_value_construct_n(items.m_items, size);
    items.m_size = size;
    std::move(begin(), begin() + std::min(size, m_size), items.begin());
    swap(items);
  }
  ssize_t size() const { return m_size; }
  T& operator[](ssize_t i) { return m_items[i]; }
  T const& operator[](ssize_t i) const { return m_items[i]; }
  T* begin() { return m_items; }
  T* end() { return m_items + m_size; }
  T const* begin() const { return m_items; }
  T const* end() const { return m_items + m_size; }

 private:
  friend struct DynArrayView;
  ssize_t m_size = 0;
  T* m_items = nullptr;
};

namespace unqualified {
using vesk::DynArray;
using vesk::xbag;
using vesk::xdeque;
using vesk::xlist;
using vesk::xmap;
using vesk::xset;
using vesk::xvector;
}  // namespace unqualified

// What the containers share: equality of the two arrays, order and printing as [a,b,c] of them all.
template <typename T, ssize_t N>
bool operator==(Array<T, N> const& a, Array<T, N> const& b) {
  return std::equal(a.begin(), a.end(), b.begin());
}
template <typename T, ssize_t N>
bool operator!=(Array<T, N> const& a, Array<T, N> const& b) {
  return !(a == b);
}
template <typename T>
bool operator==(DynArray<T> const& a, DynArray<T> const& b) {
  return std::equal(a.begin(), a.end(), b.begin(), b.end());
}
template <typename T>
bool operator!=(DynArray<T> const& a, DynArray<T> const& b) {
  return !(a == b);
}

template <typename T>
struct ContainerTraits {
  static const bool is_container = false;
};
template <typename T, bool Grows, bool Keyed>
struct ContainerTraitsOf {
  static const bool is_container = true;
  static const bool grows = Grows;  // by push_back
  static const bool keyed = Keyed;  // elements are inserted
  typedef T element_type;
};
template <typename T>
struct ContainerTraits<xvector<T>> : ContainerTraitsOf<T, true, false> {};
template <typename T>
struct ContainerTraits<xdeque<T>> : ContainerTraitsOf<T, true, false> {};
template <typename T>
struct ContainerTraits<xlist<T>> : ContainerTraitsOf<T, true, false> {};
template <typename T>
struct ContainerTraits<xset<T>> : ContainerTraitsOf<T, false, true> {};
template <typename T>
struct ContainerTraits<xbag<T>> : ContainerTraitsOf<T, false, true> {};
template <typename K, typename V>
struct ContainerTraits<xmap<K, V>> : ContainerTraitsOf<std::pair<K, V>, false, true> {};
template <typename T>
struct ContainerTraits<DynArray<T>> : ContainerTraitsOf<T, false, false> {};
template <typename T, ssize_t N>
struct ContainerTraits<Array<T, N>> : ContainerTraitsOf<T, false, false> {};

template <typename T>
constexpr bool IsContainer = ContainerTraits<T>::is_container;

// What an iterator leads to: a vector of bools gives something that stands for one.
template <typename E, typename Item>
decltype(auto) AsElement(Item const& item) {
  if constexpr (std::is_same<E, bool>::value) {
    return static_cast<bool>(item);
  } else {
    return (item);
  }
}

// Whether a type offers something, by the parts that it consists of: containers and pairs declare their operators
// whether their items have them or not.
template <template <typename> class Offers, typename T, typename = void>
struct PartsOffer : Offers<T> {};
template <template <typename> class Offers, typename T>
struct PartsOffer<Offers, T, std::enable_if_t<IsContainer<T>>>
    : PartsOffer<Offers, typename ContainerTraits<T>::element_type> {};
template <template <typename> class Offers, typename A, typename B>
struct PartsOffer<Offers, std::pair<A, B>> : std::conjunction<PartsOffer<Offers, A>, PartsOffer<Offers, B>> {};

template <typename T>
using EqualExpression = decltype(std::declval<T const&>() == std::declval<T const&>());
template <typename T>
using LessExpression = decltype(std::declval<T const&>() < std::declval<T const&>());
template <typename T>
using OffersEqual = Detector<void, EqualExpression, T>;
template <typename T>
using OffersLess = Detector<void, LessExpression, T>;
template <typename T>
constexpr bool HasEqual = PartsOffer<OffersEqual, T>::value;
template <typename T>
constexpr bool HasLess = PartsOffer<OffersLess, T>::value;

template <typename T>
bool ItemLess(T const& a, T const& b) {
  return a < b;
}
template <typename K, typename V>
bool ItemLess(std::pair<K, V> const& a, std::pair<K, V> const& b) {
  if constexpr (HasEqual<K>) {
    return a.first == b.first ? a.second < b.second : a.first < b.first;
  } else {
    return a.first < b.first || (!(b.first < a.first) && a.second < b.second);
  }
}

// The first items that differ decide. They are found by `==`: to ask for a < b and b < a of each, as the standard
// library does, takes twice the time for each level of containers within containers.
template <typename T, typename = std::enable_if_t<IsContainer<T>>>
bool operator<(T const& a, T const& b) {
  if constexpr (HasEqual<T>) {
    const auto [at, other] = std::mismatch(a.begin(), a.end(), b.begin(), b.end());
    return other != b.end() && (at == a.end() || ItemLess(*at, *other));
  } else {
    return std::lexicographical_compare(a.begin(), a.end(), b.begin(), b.end(),
                                        [](auto const& x, auto const& y) { return ItemLess(x, y); });
  }
}

template <typename T, typename = std::enable_if_t<IsContainer<T>>>
xostream& operator<<(xostream& os, T const& items) {
  os.Write("[");
  bool isFirst = true;
  for (auto const& item : items) {
    if (!isFirst) os.Write(',');
    isFirst = false;
    os << AsElement<typename ContainerTraits<T>::element_type>(item);
  }
  os.Write("]");
  return os;
}

}  // namespace vesk
