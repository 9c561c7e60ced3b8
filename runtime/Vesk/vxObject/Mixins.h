// The bases that generated text builds classes on. FinalClass is the class that is being built: each mixin of its chain
// can reach it. Objects made with `$new` belong to the heap below until it is collected.

@import "Vesk/vxObject/Model.h"

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

template <typename CN, typename B>
struct IObjectBaseMixin : public BaseMixin<CN, B> {
  void DestroyObject() { delete this->GetThisAsFinalClass(); }
};

// B is an IObjectBaseMixin.
template <typename B>
struct PersistableMixin : public B {
  void Serialise(Archive&) const {}
  void Deserialise(InputArchive&) {}
};

// --- The heap of `$new`

class ObjectHeap : private IObjectVisitor {
 public:
  static ObjectHeap& Get() {
    static ObjectHeap heap;
    return heap;
  }
  void Add(ptr<IObject> const& object) { m_objects.push_back(object); }
  ssize_t Count() const { return static_cast<ssize_t>(m_objects.size()); }

  // Destroys the objects that cannot be reached from the roots. Answers how many.
  ssize_t Collect(xvector<ptr<IObject>> const& roots) {
    m_reached.clear();
    for (ptr<IObject> const& root : roots) VisitObject(root);
    while (!m_pending.empty()) {
      const ptr<IObject> object = m_pending.back();
      m_pending.pop_back();
      object->VisitObjects(*this);
    }
    const auto dead = std::stable_partition(m_objects.begin(), m_objects.end(), [this](ptr<IObject> const& object) {
      return m_reached.Contains(object.Object());
    });
    const xvector<ptr<IObject>> unreached(dead, m_objects.end());
    m_objects.resize(dead - m_objects.begin());
    for (ptr<IObject> const& object : unreached) object->DestroyObject();
    return static_cast<ssize_t>(unreached.size());
  }

 private:
  void VisitObject(ptr<IObject> const& object) override {
    if (object && m_reached.Insert(object.Object())) m_pending.push_back(object);
  }

  xvector<ptr<IObject>> m_objects;
  xset<void*> m_reached;
  xvector<ptr<IObject>> m_pending;
};

// An object that is no IObject stays its maker's.
template <typename T>
T* DollarNew(T* object) {
  if constexpr (IsObjectClass<T>) ObjectHeap::Get().Add(ptr<IObject>(object));
  return object;
}

}  // namespace vesk
