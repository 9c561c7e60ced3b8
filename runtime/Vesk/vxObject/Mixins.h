// The bases that generated text builds classes on. FinalClass is the class that is being built: each mixin of its chain
// can reach it. Objects made with `$new` belong to the heap below until it is collected.

@import "Vesk/vxObject/Model.h"
#include <mutex>
#include <unordered_set>

namespace vesk {

struct EmptyBase {};

template <typename B>
using EvictMember = decltype(std::declval<B const&>().EvictDgsNodes());

template <typename CN, typename B>
struct BaseMixin : public B {
  typedef CN FinalClass;

  CN* GetThisAsFinalClass() { return static_cast<CN*>(this); }
  CN const* GetThisAsFinalClass() const { return static_cast<CN const*>(this); }

  void EvictDgsNodes() const {
    if constexpr (Detects<EvictMember, B>) B::EvictDgsNodes();
  }
  void VisitObjects(IObjectVisitor& v) const {
    if constexpr (Detects<VisitObjectsMember, B>) B::VisitObjects(v);
  }
  void VisitPrefs(IPrefVisitor& v) const {
    if constexpr (Detects<VisitPrefsMember, B>) B::VisitPrefs(v);
  }
};

// --- The heap of `$new`

// The objects made by `$new` in all threads, until they are collected or their DestroyObject is called. Each call is
// safe in any thread, but Collect wants that no other thread changes objects meanwhile.
class ObjectHeap : private IObjectVisitor {
 public:
  static ObjectHeap& Get() {
    static ObjectHeap* const heap = new ObjectHeap;  // outlives every static object
    return *heap;
  }

  // `size`: the bytes of the object. A pointer into it, such as one to a base, reaches it.
  void Add(ptr<IObject> const& object, std::size_t size) {
    std::lock_guard<std::mutex> lock(m_mutex);
    m_objects[Address(object.Object())] = {object, size, ++m_lastSerial};
  }
  // Forgets an object that is being destroyed. Any other address is none of its business.
  void Remove(void const* object) {
    std::lock_guard<std::mutex> lock(m_mutex);
    m_objects.erase(Address(object));
  }
  ssize_t Count() const {
    std::lock_guard<std::mutex> lock(m_mutex);
    return static_cast<ssize_t>(m_objects.size());
  }

  // Destroys the objects that cannot be reached from the roots, in the order in which they were made. Answers how
  // many. A destructor may make objects, and may destroy others that are about to be: they are destroyed once.
  ssize_t Collect(xvector<ptr<IObject>> const& roots) {
    m_reached.clear();
    for (ptr<IObject> const& root : roots) VisitObject(root);
    while (!m_pending.empty()) {
      const ptr<IObject> object = m_pending.back();
      m_pending.pop_back();
      object->VisitObjects(*this);
    }
    ssize_t count = 0;
    for (Made const& made : Unreached()) {
      if (!Take(made)) continue;
      made.m_object->DestroyObject();
      ++count;
    }
    return count;
  }

 private:
  typedef std::uintptr_t Number;
  struct Made {
    ptr<IObject> m_object;
    std::size_t m_size;
    uint64 m_serial;
  };

  static Number Address(void const* object) { return reinterpret_cast<Number>(object); }

  void VisitObject(ptr<IObject> const& object) override {
    if (!object) return;
    const ptr<IObject> whole = WholeObject(object);
    if (m_reached.insert(whole.Object()).second) m_pending.push_back(whole);
  }
  // The object of this heap that holds the other one, as it was made.
  ptr<IObject> WholeObject(ptr<IObject> const& object) const {
    std::lock_guard<std::mutex> lock(m_mutex);
    auto at = m_objects.upper_bound(Address(object.Object()));
    if (at == m_objects.begin()) return object;
    --at;
    return Address(object.Object()) - at->first < at->second.m_size ? at->second.m_object : object;
  }
  xvector<Made> Unreached() const {
    std::lock_guard<std::mutex> lock(m_mutex);
    xvector<Made> unreached;
    for (auto const& [address, made] : m_objects) {
      if (m_reached.count(made.m_object.Object()) == 0) unreached.push_back(made);
    }
    std::sort(unreached.begin(), unreached.end(), [](Made const& a, Made const& b) { return a.m_serial < b.m_serial; });
    return unreached;
  }
  // Whether the object is still there, and no other one stands in its place.
  bool Take(Made const& made) {
    std::lock_guard<std::mutex> lock(m_mutex);
    const auto at = m_objects.find(Address(made.m_object.Object()));
    if (at == m_objects.end() || at->second.m_serial != made.m_serial) return false;
    m_objects.erase(at);
    return true;
  }

  mutable std::mutex m_mutex;
  std::map<Number, Made> m_objects;
  uint64 m_lastSerial = 0;
  std::unordered_set<void const*> m_reached;
  xvector<ptr<IObject>> m_pending;
};

// An object that is no IObject stays its maker's.
template <typename T>
T* DollarNew(T* object) {
  AssertFinalClass<T>();
  if constexpr (IsObjectClass<T>) ObjectHeap::Get().Add(ptr<IObject>(object), sizeof(T));
  return object;
}

template <typename CN, typename B>
struct IObjectBaseMixin : public BaseMixin<CN, B> {
  void DestroyObject() {
    ObjectHeap::Get().Remove(this->GetThisAsFinalClass());
    delete this->GetThisAsFinalClass();
  }
};

// B is an IObjectBaseMixin.
template <typename B>
struct PersistableMixin : public B {
  void Serialise(Archive&) const {}
  void Deserialise(InputArchive&) {}
};

}  // namespace vesk
