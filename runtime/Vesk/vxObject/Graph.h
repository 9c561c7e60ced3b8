// The dependency graph. A node that is read while another one is being calculated becomes an input of that one. A
// change of an input makes everything behind it dirty, without calculating anything. A dirty node is brought up to date
// when it is next read: its inputs first, and itself only if one of them really changed. One thread.

@import "Vesk/vxObject/Visitors.h"

namespace vesk {

enum EDGFlags {
  DF_SYNC_DEP = 1,
  DF_PROPAGATE_HARD_DIRTINESS = 2,  // each calculation counts as a change
  DF_ASYNC_IO = 4                   // calculated from the queue for input and output
};

class GraphError : public std::logic_error {
 public:
  using std::logic_error::logic_error;
};

class DGNode {
 public:
  explicit DGNode(int flags = 0) : m_flags(flags) {}
  // A copy of an object calculates for itself; an assigned one has changed.
  DGNode(DGNode const& rhs) : m_flags(rhs.m_flags) {}
  DGNode& operator=(DGNode const&) {
    Invalidate(true);
    return *this;
  }
  virtual ~DGNode() {
    Forget();
    for (DGNode const* dependent : std::exchange(m_dependents, {})) dependent->RemoveInput(this);
  }

  virtual xstring Name() const { return xstring(); }
  virtual ssize_t ByteSize() const { return 0; }  // on the heap
  virtual ssize_t EvictionQueueIndex() const { return 0; }
  virtual void VisitContainingObject(IObjectVisitor&) const {}
  virtual bool RecalcCache() const { return false; }  // whether the value changed
  virtual bool IsEvictable() const { return true; }
  virtual void OnEvict() const {}
  virtual void OnInvalidate() const {}

  void SetFlag(int flag) { m_flags |= flag; }
  bool HasFlag(int flag) const { return (m_flags & flag) != 0; }

  // What reads the value calls first.
  void ReadBarrier() const {
    Link();
    BringUpToDate();
  }

  // Drops the cached value. What depends on it looks again when it is next read. `force`: whether it likes it or not.
  void TryEvict(bool force) const {
    if (m_state == EState::Hard || m_isCalculating || !(force || IsEvictable())) return;
    OnEvict();
    Forget();
    m_state = EState::Hard;
    InvalidateDependents(false);
  }

  bool IsUpToDate() const { return m_state == EState::Clean; }
  xvector<DGNode const*> const& Inputs() const { return m_inputs; }
  xvector<DGNode const*> const& Dependents() const { return m_dependents; }

 protected:
  // Hard: calculate again. Soft: only if an input changed.
  enum class EState { Hard, Soft, Clean };

  static DGNode const*& Calculating() {
    static DGNode const* node = nullptr;
    return node;
  }

  struct CalculationScope {
    explicit CalculationScope(DGNode const* node) : m_outer(std::exchange(Calculating(), node)) {}
    ~CalculationScope() { Calculating() = m_outer; }
    DGNode const* m_outer;
  };

  void Link() const {
    DGNode const* reader = Calculating();
    if (!reader || reader == this ||
        std::find(reader->m_inputs.begin(), reader->m_inputs.end(), this) != reader->m_inputs.end()) {
      return;
    }
    reader->m_inputs.push_back(this);
    m_dependents.push_back(reader);
  }

  void Invalidate(bool hard) const {
    const bool wasClean = m_state == EState::Clean;
    if (hard || wasClean) m_state = hard ? EState::Hard : EState::Soft;
    if (!wasClean) return;
    OnInvalidate();
    InvalidateDependents(false);
  }
  void InvalidateDependents(bool hard) const {
    for (DGNode const* dependent : xvector<DGNode const*>(m_dependents)) dependent->Invalidate(hard);
  }

  static void Dirty(DGNode const* node) { node->Invalidate(true); }

  void UpdateByteSize() const { m_byteSize = ByteSize(); }
  virtual void OnNoDependents() const {}

  mutable EState m_state = EState::Hard;

 private:
  friend class EvictionQueue;

  void BringUpToDate() const {
    if (m_isCalculating) throw GraphError("cyclic dependency: " + Name());
    if (m_state == EState::Soft) {
      for (DGNode const* input : xvector<DGNode const*>(m_inputs)) {
        input->BringUpToDate();
        if (m_state == EState::Hard) break;
      }
    }
    if (m_state != EState::Hard) {
      m_state = EState::Clean;
      return;
    }
    Forget();
    bool changed = false;
    {
      CalculationScope scope(this);
      m_isCalculating = true;
      try {
        changed = RecalcCache();
      } catch (...) {
        m_isCalculating = false;
        throw;
      }
      m_isCalculating = false;
    }
    m_state = EState::Clean;
    JoinQueue();
    if (!changed) return;
    for (DGNode const* dependent : m_dependents) {
      if (!dependent->m_isCalculating) dependent->Invalidate(true);
    }
  }

  // Leaves the graph behind it.
  void Forget() const {
    LeaveQueue();
    for (DGNode const* input : std::exchange(m_inputs, {})) {
      xvector<DGNode const*>& dependents = input->m_dependents;
      const auto at = std::find(dependents.begin(), dependents.end(), this);
      if (at != dependents.end()) dependents.erase(at);
      if (dependents.empty()) input->OnNoDependents();
    }
  }
  void RemoveInput(DGNode const* input) const {
    const auto at = std::find(m_inputs.begin(), m_inputs.end(), input);
    if (at != m_inputs.end()) m_inputs.erase(at);
    Invalidate(true);
  }

  void JoinQueue() const;
  void LeaveQueue() const;

  int m_flags;
  mutable ssize_t m_byteSize = 0;
  mutable bool m_isCalculating = false;
  mutable xvector<DGNode const*> m_inputs;
  mutable xvector<DGNode const*> m_dependents;
  mutable std::list<DGNode const*>* m_queue = nullptr;  // where it is queued
  mutable std::list<DGNode const*>::iterator m_queuePlace;
};

// Eight queues hold the nodes with a cached value, by when it was calculated.
class EvictionQueue {
 public:
  static EvictionQueue& Get(ssize_t index) {
    static EvictionQueue* const queues = new EvictionQueue[8];  // outlives every static node
    return queues[index];
  }

  ssize_t Count() const { return static_cast<ssize_t>(m_nodes.size()); }
  ssize_t ByteSize() const {
    ssize_t size = 0;
    for (DGNode const* node : m_nodes) size += node->m_byteSize;
    return size;
  }

  // Evicts the oldest values until the others hold at most `budget` bytes.
  void EvictDownTo(ssize_t budget) {
    ssize_t size = ByteSize();
    for (DGNode const* node : std::list<DGNode const*>(m_nodes)) {
      if (size <= budget) return;
      const ssize_t bytes = node->m_byteSize;
      node->TryEvict(false);
      if (!node->m_queue) size -= bytes;
    }
  }

 private:
  friend class DGNode;
  std::list<DGNode const*> m_nodes;
};

inline void DGNode::JoinQueue() const {
  m_queue = &EvictionQueue::Get(EvictionQueueIndex()).m_nodes;
  m_queuePlace = m_queue->insert(m_queue->end(), this);
}
inline void DGNode::LeaveQueue() const {
  if (m_queue) m_queue->erase(m_queuePlace);
  m_queue = nullptr;
}

// The node of a `$dep` field.
class DGDepNode : public DGNode {
 public:
  explicit DGDepNode(int flags = DF_SYNC_DEP) : DGNode(flags) {}
};

// Tells the node of an `$indep` field from whatever else a record may place at an address: a value that belongs to its
// own place.
class IndepMark {
 public:
  IndepMark() {}
  IndepMark(IndepMark const&) {}
  IndepMark& operator=(IndepMark const&) { return *this; }

 protected:
  static bool StandsAt(void const* address) {
    std::uintptr_t value;
    std::memcpy(&value, address, sizeof(value));
    return value == Of(address);
  }

 private:
  static std::uintptr_t Of(void const* address) {
    return reinterpret_cast<std::uintptr_t>(address) ^ static_cast<std::uintptr_t>(0x9E3779B97F4A7C15);
  }
  std::uintptr_t m_value = Of(this);
};

// The node of an `$indep` field: always up to date, and told of changes.
class DGIndepNode : public DGNode, private IndepMark {
 public:
  void OnChange() { InvalidateDependents(true); }

  // The node at an address where anything may stand, with room for a node; null when it is no node.
  static DGIndepNode* At(void* address) {
    if (reinterpret_cast<std::uintptr_t>(address) % alignof(DGIndepNode) != 0) return nullptr;
    DGIndepNode* const node = static_cast<DGIndepNode*>(address);
    return IndepMark::StandsAt(static_cast<IndepMark*>(node)) ? node : nullptr;
  }
};

// --- Values that nodes keep

template <typename T>
constexpr bool TypeHasAdditionalSize() {
  return IsContainer<T> || std::is_same<T, string8>::value || std::is_same<T, string16>::value;
}

template <typename T>
ssize_t CacheValueAdditionalSize(T const& value) {
  if constexpr (TypeHasAdditionalSize<T>()) return static_cast<ssize_t>(value.size() * sizeof(*value.begin()));
  return 0;
}

// What a cached value may refuse: a type with an overload of its own.
template <typename T>
bool CacheValueIsEvictable(T const&) {
  return true;
}
template <typename T>
void OnEvictCacheValue(T const&) {}
template <typename T>
void ClearCacheValue(T& value) {
  value = T();
}

}  // namespace vesk
