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

class DGNode : private QueuePlace, private ChangePlace {
 public:
  explicit DGNode(int flags = 0) : m_flags(flags) {}
  // A copy of an object calculates for itself; an assigned one has changed.
  DGNode(DGNode const& rhs) : QueuePlace(), ChangePlace(), m_flags(rhs.m_flags) {}
  DGNode& operator=(DGNode const&) {
    m_isNews = true;
    Invalidate(true);
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
  bool HasFlag(int flag) const { return (m_flags & flag) != 0; }

  // What reads the value calls first. GraphError where the value depends on itself.
  void ReadBarrier() const {
    GraphState& state = GraphState::Get();
    if (m_state != EState::Clean) BringUpToDate(state);
    DGNode const* reader = state.m_calculation ? state.m_calculation->m_node : nullptr;
    if (reader && reader != this) Link(state);
  }

  // Drops the cached value. What depends on it calculates again when it is next read. `force`: whether the node likes
  // it or not. A node that is being calculated keeps what it has.
  void TryEvict(bool force) const;

  bool IsUpToDate() const { return m_state == EState::Clean; }
  xvector<DGNode const*> Inputs() const;
  xvector<DGNode const*> Dependents() const;

 protected:
  // Hard: calculate again. Soft: only if an input changed.
  enum class EState { Hard, Soft, Clean };

  void Invalidate(bool hard) const;
  // What depends on this node looks at it again.
  void InvalidateDependents() const;
  typedef NodeList<ChangePlace> Changes;
  // What depends on one of these nodes calculates again. Until then it needs no inputs, so that the next change has
  // nothing to do. The list is empty afterwards.
  static void Change(Changes& nodes);
  void Change() const {
    if (!m_dependents.empty()) TellDependents();
  }

  static DGNode const* Changed(NodePlace const* place) {
    return static_cast<DGNode const*>(static_cast<ChangePlace const*>(place));
  }
  void Join(Changes& changes) const { changes.Append(*this); }

  // Makes the node that is being calculated depend on this one. Where there is no memory for that, its value is not
  // kept.
  void Link(GraphState& state) const;
  void UpdateByteSize() const;
  virtual void OnNoDependents() const {}

  mutable EState m_state = EState::Hard;
  mutable bool m_isNews = true;  // the next calculation counts as a change

 private:
  friend class EvictionQueue;
  friend struct GraphState;
  friend struct Calculation;

  enum class EAgain : unsigned char { No, Soft, Hard };
  struct FailedRead;

  // One end of a link: the node at the other end, and where that lists this one.
  struct NodeLink {
    DGNode const* m_node;
    std::size_t m_at;
  };
  typedef xvector<NodeLink> Links;

  static xvector<DGNode const*> NodesOf(Links const& links);
  static void MakeRoom(Links& links);
  void TellDependents() const;
  void TellTheOne() const;

  void BringUpToDate(GraphState& state) const;
  void BeginRead(GraphState& state) const;
  void Evaluate(GraphState& state) const;
  void Update(GraphState& state) const;
  void LookAtInputs(GraphState& state) const;
  void Calculate(GraphState& state) const;
  void CalculateHere(GraphState& state) const;
  void CalculateElsewhere(GraphState& state) const;
  void Recalculate(GraphState& state) const;

  void Mark(bool hard, Changes& dirty) const;
  void CalculateAgain(EAgain again) const {
    if (again > m_again) m_again = again;
  }
  static void Spread(GraphState& state, Changes& dirty);
  static void Tell(Changes& dirty);

  void Forget() const;
  void DropDependents(GraphState* state, Changes& dirty) const;
  static void Drop(Links& links, Links DGNode::*backwards, std::size_t at);
  void JoinQueue(GraphState& state) const;
  void LeaveQueue() const;

  int m_flags;
  mutable bool m_isCalculating = false;
  mutable bool m_isEmpty = true;        // nothing to evict
  mutable EAgain m_again = EAgain::No;  // whether what is being calculated must be calculated again, and how
  mutable ssize_t m_byteSize = 0;
  mutable Links m_inputs;  // in the order in which they were read
  mutable Links m_dependents;
  mutable EvictionQueue* m_queue = nullptr;  // where it is queued
  mutable std::size_t m_unwound = 0;         // the serial of the target that it waits for
};

// The node of a `$dep` field.
class DGDepNode : public DGNode {
 public:
  explicit DGDepNode(int flags = DF_SYNC_DEP) : DGNode(flags) {}
};

// Tells the node of an `$indep` field from whatever else a record may place at an address: a value that belongs to
// its own place.
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
  void OnChange() { Change(); }

  // The node at an address where anything may stand, with room for a node; null when it is no node.
  static DGIndepNode* At(void* address) {
    if (reinterpret_cast<std::uintptr_t>(address) % alignof(DGIndepNode) != 0) return nullptr;
    DGIndepNode* const node = static_cast<DGIndepNode*>(address);
    return IndepMark::StandsAt(static_cast<IndepMark*>(node)) ? node : nullptr;
  }
};

}  // namespace vesk
