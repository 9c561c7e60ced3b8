// openvariant<T>: one value of any type, kept with its TypeOps; T only tells readers what family is meant. Archives
// write the name of the type in front, so it must be registered (or be a scalar or a string) to be read back.

@import "Vesk/vxObject/Registry.h"

namespace vesk {

template <typename T>
class openvariant {
 public:
  openvariant() {}
  template <typename U, typename = std::enable_if_t<!std::is_same<U, openvariant>::value>>
  openvariant(U const& value) : m_ops(&GetTypeOps<U>()), m_value(Clone(m_ops, &value)) {}
  openvariant(openvariant const& rhs) : m_ops(rhs.m_ops), m_value(Clone(m_ops, rhs.m_value)) {}
  openvariant& operator=(openvariant rhs) {
    std::swap(m_ops, rhs.m_ops);
    std::swap(m_value, rhs.m_value);
    return *this;
  }
  ~openvariant() {
    if (!m_value) return;
    m_ops->m_destruct(m_value, 0, 1);
    ::operator delete(m_value);
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
    return a.m_ops == b.m_ops && (!a.m_value || a.m_ops->m_equal(a.m_value, b.m_value));
  }
  friend bool operator!=(openvariant const& a, openvariant const& b) { return !(a == b); }
  friend bool operator<(openvariant const& a, openvariant const& b) {
    if (a.m_ops != b.m_ops) return a.m_ops < b.m_ops;
    return a.m_value && a.m_ops->m_less(a.m_value, b.m_value);
  }
  friend xostream& operator<<(xostream& os, openvariant const& x) {
    if (x.m_value) x.m_ops->m_print(os, x.m_value);
    return os;
  }

  void Serialise(Archive& ar) const {
    ar << NameOf(m_ops);
    if (m_value) m_ops->m_serialise(ar, m_value, 0, 1);
  }
  void Deserialise(InputArchive& ar) {
    xstring name;
    ar >> name;
    *this = openvariant();
    if (name.empty()) return;
    m_ops = OpsOf(name);
    m_value = ::operator new(m_ops->m_size);
    m_ops->m_construct(m_value, 0, 1);
    m_ops->m_deserialise(ar, m_value, 0, 1);
  }
  void VisitObjects(IObjectVisitor& v) const {
    if (m_value && m_ops->m_visitObjects) m_ops->m_visitObjects(v, m_value, 0, 1);
  }
  void VisitPrefs(IPrefVisitor& v) const {
    if (m_value && m_ops->m_visitPrefs) m_ops->m_visitPrefs(v, m_value, 0, 1);
  }

 private:
  static void* Clone(TypeOps const* ops, void const* value) {
    if (!value) return nullptr;
    void* copy = ::operator new(ops->m_size);
    ops->m_copyConstruct(copy, 0, value, 0, 1);
    return copy;
  }
  static xstring NameOf(TypeOps const* ops) {
    if (!ops) return xstring();
    for (auto const& [name, registered] : TypeOpsTable()) {
      if (registered == ops) return name;
    }
    for (ReflectedClass const* record : All<ReflectedClass>()) {
      if (&record->m_ops == ops) return record->m_name;
    }
    for (ReflectedVariant const* record : All<ReflectedVariant>()) {
      if (&record->m_ops == ops) return record->m_name;
    }
    throw ArchiveError("type of an openvariant is not registered");
  }
  static TypeOps const* OpsOf(xstring const& name) {
    const auto at = TypeOpsTable().find(name);
    if (at != TypeOpsTable().end()) return at->second;
    if (ReflectedClass const* record = Find<ReflectedClass>(name)) return &record->m_ops;
    if (ReflectedVariant const* record = Find<ReflectedVariant>(name)) return &record->m_ops;
    throw ArchiveError("type of an openvariant is not registered: " + name);
  }

  TypeOps const* m_ops = nullptr;
  void* m_value = nullptr;
};

}  // namespace vesk
