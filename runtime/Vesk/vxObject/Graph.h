// The dependency graph. A node that is read while another one is being calculated becomes an input of that one. A
// change of an input makes everything behind it dirty, without calculating anything. A dirty node is brought up to date
// when it is next read: its inputs first, and itself only if one of them really changed. Chains may be of any length:
// what is dirty, and what has to be looked at, is kept in work lists, and calculations within each other go on on a
// stack of their own.
//
// A calculation may write what it has read. The value that it answers stands until the outermost read ends; then the
// node is dirty again. One that throws leaves its node dirty; the error is not looked for twice within one read.
//
// A graph belongs to the thread that reads it: nodes of one thread do not meet those of another.

@import "Vesk/vxObject/GraphState.h"
#include <cstring>

namespace vesk {

// What nodes of generated text derive from. A node's class names types of the user, so the steps of a calculation are
// not here, but in GraphState.
class DGNode : private DGQueuePlace, private DGChangePlace {
 public:
  explicit DGNode(int flags = 0) : m_flags(flags), m_state(flags & DF_SOURCE ? ENodeState::Clean : ENodeState::Hard) {}
  // A copy of an object calculates for itself; an assigned one has changed.
  DGNode(DGNode const& rhs) : DGNode(rhs.m_flags) {}
  DGNode& operator=(DGNode const&) {
    m_isNews = true;
    GraphState::Get().Invalidate(*this, true);
    return *this;
  }
  virtual ~DGNode();

  virtual xstring Name() const { return xstring(); }
  virtual ssize_t ByteSize() const { return 0; }  // on the heap
  virtual ssize_t EvictionQueueIndex() const { return 0; }
  virtual void VisitContainingObject(IObjectVisitor&) const {}
  virtual bool RecalcCache() const { return false; }  // whether the value changed
  virtual bool IsEvictable() const { return true; }
  virtual void OnEvict() const {}
  virtual void OnInvalidate() const {}

  void SetFlag(int flag) { m_flags |= flag; }

  // What reads the value calls first. GraphError where the value depends on itself.
  void ReadBarrier() const {
    GraphState& state = GraphState::Get();
    if (m_state != ENodeState::Clean) state.BringUpToDate(*this);
    DGNode const* reader = state.m_calculation ? state.m_calculation->m_node : nullptr;
    if (reader && reader != this) state.Link(*this);
  }

  // Drops the cached value. What depends on it calculates again when it is next read. `force`: whether the node likes
  // it or not. A node that is being calculated keeps what it has.
  void TryEvict(bool force) const {
    if (!m_isEmpty && !m_isCalculating && (force || IsEvictable())) GraphState::Get().TryEvict(*this);
  }

  bool IsUpToDate() const { return m_state == ENodeState::Clean; }
  xvector<DGNode const*> Inputs() const;
  xvector<DGNode const*> Dependents() const;

 protected:
  void UpdateByteSize() const;

 private:
  friend class EvictionQueue;
  friend struct GraphState;
  friend struct GraphAccess;
  friend struct Calculation;
  friend struct AsyncQueues;
  friend class DGIndepNode;

  int m_flags;
  mutable ENodeState m_state;
  mutable EAgain m_again = EAgain::No;
  mutable bool m_isNews = true;  // the next calculation counts as a change
  mutable bool m_isCalculating = false;
  mutable bool m_isEmpty = true;  // nothing to evict
  mutable ssize_t m_byteSize = 0;
  mutable DGLinks m_inputs;  // in the order in which they were read
  mutable DGLinks m_dependents;
  mutable EvictionQueue* m_queue = nullptr;  // where it is queued
  mutable std::size_t m_unwound = 0;         // the serial of the target that it waits for
};

inline bool GraphState::IsRead(DGNode const& node) { return !node.m_dependents.empty(); }
inline void GraphState::Join(DGNode const& node, Changes& changes) { changes.Append(node); }
inline void GraphState::Change(DGNode const& node) {
  if (!node.m_dependents.empty()) TellDependents(node);
}

// The node of a `$dep` field.
class DGDepNode : public DGNode {
 public:
  explicit DGDepNode(int flags = DF_SYNC_DEP) : DGNode(flags) {}
};

// Tells the node of an `$indep` field from whatever else a record may place at an address: a value that belongs to
// its own place.
inline std::uintptr_t IndepMarkAt(void const* address) {
  return reinterpret_cast<std::uintptr_t>(address) ^ static_cast<std::uintptr_t>(0x9E3779B97F4A7C15);
}
struct DGIndepMark {
  DGIndepMark() {}
  DGIndepMark(DGIndepMark const&) {}
  DGIndepMark& operator=(DGIndepMark const&) { return *this; }

  std::uintptr_t m_mark = IndepMarkAt(this);
};

// The node of an `$indep` field: always up to date, and told of changes.
class DGIndepNode : public DGNode, private DGIndepMark {
 public:
  void OnChange() { GraphState::Change(*this); }

 private:
  friend DGIndepNode* IndepNodeAt(void* address);
};

// The node at an address where anything may stand, with room for a node; null when it is no node.
inline DGIndepNode* IndepNodeAt(void* address) {
  if (reinterpret_cast<std::uintptr_t>(address) % alignof(DGIndepNode) != 0) return nullptr;
  DGIndepNode* const node = static_cast<DGIndepNode*>(address);
  void const* const place = static_cast<DGIndepMark*>(node);
  std::uintptr_t mark;
  std::memcpy(&mark, place, sizeof(mark));
  return mark == IndepMarkAt(place) ? node : nullptr;
}

}  // namespace vesk
