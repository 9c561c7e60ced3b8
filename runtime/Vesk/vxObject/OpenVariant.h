// openvariant<T>: one value of any type, kept with its TypeOps; T only tells readers what family is meant. Archives
// write the name of the type in front, so it must be registered (or be a scalar or a string) to be read back.

@import "Vesk/vxObject/Registry.h"

namespace vesk {

// What an openvariant does that does not depend on its T. Values have their memory to themselves.
struct AnyValue {
  // Both throw std::logic_error or what the type's functions throw. Null of null.
  static void* Clone(TypeOps const* ops, void const* value);
  static void* Default(TypeOps const& ops);
  static void Destroy(TypeOps const& ops, void* value);

  // ArchiveError for a type without a name, and for what no openvariant can hold.
  static xstring NameOf(TypeOps const* ops);
  // Of the type that an archive names next; null for none.
  static TypeOps const* ReadType(InputArchive& ar);
};

template <typename T>
class openvariant {
 public:
  openvariant() {}
  template <typename U, typename = std::enable_if_t<!std::is_same<U, openvariant>::value>>
  openvariant(U const& value) : m_ops(&GetTypeOps<U>()), m_value(AnyValue::Clone(m_ops, &value)) {}
  openvariant(openvariant const& rhs) : m_ops(rhs.m_ops), m_value(AnyValue::Clone(m_ops, rhs.m_value)) {}
  openvariant(openvariant&& rhs) noexcept { Swap(rhs); }
  openvariant& operator=(openvariant rhs) {
    Swap(rhs);
    return *this;
  }
  ~openvariant() {
    if (m_value) AnyValue::Destroy(*m_ops, m_value);
  }

  explicit operator bool() const { return m_value != nullptr; }
  template <typename U>
  bool is() const {
    return m_ops == &GetTypeOps<U>();
  }
  template <typename U>
  U const& as() const {
    vxAssert(is<U>());
    return *static_cast<U const*>(m_value);
  }

  friend bool operator==(openvariant const& a, openvariant const& b) {
    if (a.m_ops != b.m_ops || !a.m_value) return a.m_ops == b.m_ops;
    return a.m_ops->m_equal ? a.m_ops->m_equal(a.m_value, b.m_value) : a.m_value == b.m_value;
  }
  friend bool operator!=(openvariant const& a, openvariant const& b) { return !(a == b); }
  friend bool operator<(openvariant const& a, openvariant const& b) {
    if (a.m_ops != b.m_ops) return a.m_ops < b.m_ops;
    if (!a.m_value) return false;
    return a.m_ops->m_less ? a.m_ops->m_less(a.m_value, b.m_value) : a.m_value < b.m_value;
  }
  friend xostream& operator<<(xostream& os, openvariant const& x) {
    if (!x.m_value) return os;
    if (!x.m_ops->m_print) return os << '?';
    x.m_ops->m_print(os, x.m_value);
    return os;
  }

  void Serialise(Archive& ar) const {
    if (m_value && !m_ops->m_serialise) FailArchive("type of an openvariant cannot be archived");
    ar << AnyValue::NameOf(m_ops);
    if (m_value) m_ops->m_serialise(ar, m_value, 0, 1);
  }
  void Deserialise(InputArchive& ar) {
    openvariant read;
    if (TypeOps const* ops = AnyValue::ReadType(ar)) {
      read.m_value = AnyValue::Default(*ops);
      read.m_ops = ops;
      ops->m_deserialise(ar, read.m_value, 0, 1);
    }
    Swap(read);
  }
  void VisitObjects(IObjectVisitor& v) const {
    if (m_value && m_ops->m_visitObjects) m_ops->m_visitObjects(v, m_value, 0, 1);
  }
  void VisitPrefs(IPrefVisitor& v) const {
    if (m_value && m_ops->m_visitPrefs) m_ops->m_visitPrefs(v, m_value, 0, 1);
  }

 private:
  void Swap(openvariant& rhs) noexcept {
    std::swap(m_ops, rhs.m_ops);
    std::swap(m_value, rhs.m_value);
  }

  TypeOps const* m_ops = nullptr;
  void* m_value = nullptr;
};

namespace unqualified {
using vesk::openvariant;
}  // namespace unqualified

}  // namespace vesk
