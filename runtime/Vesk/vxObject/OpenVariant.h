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
  openvariant(openvariant&& rhs) noexcept { Swap(rhs); }
  openvariant& operator=(openvariant rhs) {
    Swap(rhs);
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
    if (m_value && !m_ops->m_serialise) throw ArchiveError("type of an openvariant cannot be archived");
    ar << NameOf(m_ops);
    if (m_value) m_ops->m_serialise(ar, m_value, 0, 1);
  }
  void Deserialise(InputArchive& ar) {
    xstring name;
    ar >> name;
    openvariant read;
    if (!name.empty()) {
      if (!IsTypeAllowed(ar.m_objects.m_allow, ar.m_objects.m_allowType, name)) {
        throw ArchiveError("type is not allowed: " + name);
      }
      read = DefaultOf(OpsOf(name));
      read.m_ops->m_deserialise(ar, read.m_value, 0, 1);
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
  typedef std::unique_ptr<void, void (*)(void*)> Memory;

  void Swap(openvariant& rhs) noexcept {
    std::swap(m_ops, rhs.m_ops);
    std::swap(m_value, rhs.m_value);
  }
  static Memory Allocate(TypeOps const& ops) {
    return Memory(::operator new(ops.m_size), [](void* memory) { ::operator delete(memory); });
  }
  static openvariant DefaultOf(TypeOps const& ops) {
    Memory memory = Allocate(ops);
    ops.m_construct(memory.get(), 0, 1);
    openvariant made;
    made.m_ops = &ops;
    made.m_value = memory.release();
    return made;
  }
  static void* Clone(TypeOps const* ops, void const* value) {
    if (!value) return nullptr;
    if (!ops->m_copyConstruct || !ops->m_destruct) throw std::logic_error("type of an openvariant cannot be copied");
    Memory memory = Allocate(*ops);
    ops->m_copyConstruct(memory.get(), 0, value, 0, 1);
    return memory.release();
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
    throw ArchiveError(NotRegistered("type of an openvariant", ""));
  }
  static TypeOps const* FindOps(xstring const& name) {
    const auto at = TypeOpsTable().find(name);
    if (at != TypeOpsTable().end()) return at->second;
    if (ReflectedClass const* record = Find<ReflectedClass>(name)) return &record->m_ops;
    if (ReflectedVariant const* record = Find<ReflectedVariant>(name)) return &record->m_ops;
    return nullptr;
  }
  // A name in an archive may be that of any registered type, also of one that no openvariant can hold.
  static TypeOps const& OpsOf(xstring const& name) {
    TypeOps const* ops = FindOps(name);
    if (!ops) throw ArchiveError(NotRegistered("type of an openvariant", name));
    if (!ops->m_construct || !ops->m_copyConstruct || !ops->m_destruct || !ops->m_deserialise) {
      throw ArchiveError("type cannot be the value of an openvariant: " + name);
    }
    return *ops;
  }

  TypeOps const* m_ops = nullptr;
  void* m_value = nullptr;
};

namespace unqualified {
using vesk::openvariant;
}  // namespace unqualified

}  // namespace vesk
