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

// --- The heap of `$new`

// The objects made by `$new` in all threads, until they are collected or their DestroyObject is called. Each call is
// safe in any thread, but Collect wants that no other thread changes objects meanwhile.
class ObjectHeap {
 public:
  static ObjectHeap& Get();
  ObjectHeap();
  ~ObjectHeap();
  ObjectHeap(ObjectHeap const&) = delete;
  void operator=(ObjectHeap const&) = delete;

  // `size`: the bytes of the object. A pointer into it, such as one to a base, reaches it.
  void Add(ptr<IObject> const& object, std::size_t size);
  // Forgets an object that is being destroyed. Any other address is none of its business.
  void Remove(void const* object);
  ssize_t Count() const;

  // Destroys the objects that cannot be reached from the roots, in the order in which they were made. Answers how
  // many. A destructor may make objects, and may destroy others that are about to be: they are destroyed once.
  ssize_t Collect(xvector<ptr<IObject>> const& roots);

 private:
  struct Objects;
  Objects* m_objects;
};

// An object that is no IObject stays its maker's.
template <typename T>
T* DollarNew(T* object) {
  AssertFinalClass<T>();
  if constexpr (IsObjectClass<T>) {
    try {
      ObjectHeap::Get().Add(ptr<IObject>(object), sizeof(T));
    } catch (...) {
      object->DestroyObject();
      throw;
    }
  }
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
