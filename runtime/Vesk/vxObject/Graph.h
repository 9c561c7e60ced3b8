// The dependency graph. A node that is read while another one is being calculated becomes an input of that one. A
// change of an input makes everything behind it dirty, without calculating anything. A dirty node is brought up to date
// when it is next read: its inputs first, and itself only if one of them really changed. Chains may be of any length:
// what is dirty, and what has to be looked at, is kept in work lists, not on the stack.
//
// A calculation may write what it has read. The value that it answers stands until the outermost read ends; then the
// node is dirty again. One that throws leaves its node dirty; the error is not looked for twice within one read.
//
// A graph belongs to the thread that reads it: nodes of one thread do not meet those of another.

@import "Vesk/vxObject/GraphState.h"
#include <cstring>

namespace vesk {

class DGNode {
 public:
  explicit DGNode(int flags = 0) : m_flags(flags) {}
  // A copy of an object calculates for itself; an assigned one has changed.
  DGNode(DGNode const& rhs) : m_flags(rhs.m_flags) {}
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
    DGNode const* reader = state.m_calculation ? state.m_calculation->m_node : nullptr;
    if (m_state != EState::Clean) {
      FailedRead failed{state, this, reader};
      BringUpToDate(state);
      failed.m_reader = nullptr;
    }
    if (reader && reader != this) Link(state);
  }

  // Drops the cached value. What depends on it calculates again when it is next read. `force`: whether the node likes
  // it or not. A node that is being calculated keeps what it has.
  void TryEvict(bool force) const {
    if (m_isEmpty || m_isCalculating || !(force || IsEvictable())) return;
    OnEvict();
    Forget();
    m_state = EState::Hard;
    m_isEmpty = m_isNews = true;
    InvalidateDependents();
  }

  bool IsUpToDate() const { return m_state == EState::Clean; }
  xvector<DGNode const*> Inputs() const { return NodesOf(m_inputs); }
  xvector<DGNode const*> Dependents() const { return NodesOf(m_dependents); }

 protected:
  // Hard: calculate again. Soft: only if an input changed.
  enum class EState { Hard, Soft, Clean };

  void Invalidate(bool hard) const;
  // What depends on this node looks at it again.
  void InvalidateDependents() const;
  // What depends on one of these nodes calculates again. Until then it needs no inputs, so that the next change has
  // nothing to do. A source among them that nobody else reads is gone afterwards.
  static void Change(xvector<DGNode const*> const& nodes);
  void Change() const {
    if (!m_dependents.empty()) Change(xvector<DGNode const*>(1, this));
  }

  // Makes the node that is being calculated depend on this one.
  void Link(GraphState& state) const;
  void UpdateByteSize() const;
  virtual void OnNoDependents() const {}

  mutable EState m_state = EState::Hard;
  mutable bool m_isNews = true;  // the next calculation counts as a change

 private:
  friend class EvictionQueue;
  friend struct GraphState;
  friend struct Calculation;

  // A reader that goes on without the value has still read it: it must look again when that may be there.
  struct FailedRead {
    ~FailedRead() {
      if (!m_reader || m_reader == m_node || m_state.m_deep) return;
      m_node->Link(m_state);
      m_state.m_again.insert({m_reader, false});
    }
    GraphState& m_state;
    DGNode const* m_node;
    DGNode const* m_reader;
  };

  // One end of a link: the node at the other end, and where that lists this one.
  struct NodeLink {
    DGNode const* m_node;
    std::size_t m_at;
  };
  typedef xvector<NodeLink> Links;

  static xvector<DGNode const*> NodesOf(Links const& links) {
    xvector<DGNode const*> nodes;
    for (NodeLink const& link : links) nodes.push_back(link.m_node);
    return nodes;
  }

  void BringUpToDate(GraphState& state) const;
  void Evaluate(GraphState& state) const;
  void Update(GraphState& state) const;
  void Calculate(GraphState& state) const;
  void Recalculate(GraphState& state) const;

  void Mark(GraphState& state, bool hard, xvector<DGNode const*>& dirty) const;
  static void Spread(GraphState& state, xvector<DGNode const*>& dirty);

  void Forget() const;
  Links DropDependents() const;
  static void Drop(Links& links, Links DGNode::*backwards, std::size_t at);
  void JoinQueue(GraphState& state) const;
  void LeaveQueue() const;

  int m_flags;
  mutable bool m_isCalculating = false;
  mutable bool m_isEmpty = true;  // nothing to evict
  mutable ssize_t m_byteSize = 0;
  mutable Links m_inputs;  // in the order in which they were read
  mutable Links m_dependents;
  mutable EvictionQueue* m_queue = nullptr;  // where it is queued
  mutable std::list<DGNode const*>::iterator m_queuePlace;
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

// --- Links

inline void DGNode::Link(GraphState& state) const {
  DGNode const* reader = state.m_calculation->m_node;
  if (!state.m_calculation->IsNew(this)) return;
  reader->m_inputs.push_back({this, m_dependents.size()});
  m_dependents.push_back({reader, reader->m_inputs.size() - 1});
}

// Takes a link out of a list of links; the last one takes its place. `backwards`: the lists at the other ends.
inline void DGNode::Drop(Links& links, Links DGNode::*backwards, std::size_t at) {
  links[at] = links.back();
  links.pop_back();
  if (at < links.size()) (const_cast<DGNode*>(links[at].m_node)->*backwards)[links[at].m_at].m_at = at;
}

// Leaves the graph behind it.
inline void DGNode::Forget() const {
  LeaveQueue();
  for (NodeLink const& link : std::exchange(m_inputs, {})) {
    DGNode const* input = link.m_node;
    Drop(input->m_dependents, &DGNode::m_inputs, link.m_at);
    if (input->m_dependents.empty()) input->OnNoDependents();
  }
}

inline DGNode::Links DGNode::DropDependents() const {
  Links dependents = std::exchange(m_dependents, {});
  for (NodeLink const& link : dependents) Drop(link.m_node->m_inputs, &DGNode::m_dependents, link.m_at);
  return dependents;
}

inline DGNode::~DGNode() {
  GraphState* state = GraphState::Peek();
  if (state) state->OnDestroy(this);
  Forget();
  if (m_dependents.empty()) return;
  // A calculation that used this node in passing has not been told of a change.
  xvector<DGNode const*> dirty;
  for (NodeLink const& link : DropDependents()) {
    if (!link.m_node->m_isCalculating) link.m_node->Mark(GraphState::Get(), true, dirty);
  }
  Spread(GraphState::Get(), dirty);
}

// --- What is dirty

inline void DGNode::Mark(GraphState& state, bool hard, xvector<DGNode const*>& dirty) const {
  if (m_isCalculating) {
    bool& again = state.m_again[this];
    again = again || hard;
    return;
  }
  const bool wasClean = m_state == EState::Clean;
  if (hard || wasClean) m_state = hard ? EState::Hard : EState::Soft;
  if (wasClean) dirty.push_back(this);
}

// Goes on from nodes that were clean to all that depends on them, then tells them.
inline void DGNode::Spread(GraphState& state, xvector<DGNode const*>& dirty) {
  for (std::size_t i = 0; i < dirty.size(); ++i) {
    for (NodeLink const& link : dirty[i]->m_dependents) link.m_node->Mark(state, false, dirty);
  }
  if (dirty.empty()) return;
  GraphState::NotifyScope scope(state, dirty);
  Calculation detached(state, nullptr);
  for (std::size_t i = 0; i < dirty.size(); ++i) {
    if (dirty[i]) dirty[i]->OnInvalidate();
  }
}

inline void DGNode::Invalidate(bool hard) const {
  GraphState& state = GraphState::Get();
  xvector<DGNode const*> dirty;
  Mark(state, hard, dirty);
  Spread(state, dirty);
}

inline void DGNode::InvalidateDependents() const {
  if (m_dependents.empty()) return;
  GraphState& state = GraphState::Get();
  xvector<DGNode const*> dirty;
  for (NodeLink const& link : m_dependents) link.m_node->Mark(state, false, dirty);
  Spread(state, dirty);
}

inline void DGNode::Change(xvector<DGNode const*> const& nodes) {
  GraphState& state = GraphState::Get();
  xvector<DGNode const*> dirty;
  for (DGNode const* node : nodes) {
    for (NodeLink const& link : node->DropDependents()) {
      if (state.m_calculation) state.m_calculation->Forget(link.m_node, node);
      link.m_node->Mark(state, true, dirty);
    }
    node->OnNoDependents();
  }
  Spread(state, dirty);
}

// --- Calculating

inline void DGNode::BringUpToDate(GraphState& state) const {
  if (m_isCalculating) throw GraphError("cyclic dependency: " + Name());
  if (state.m_isEvaluating) {
    if (state.m_deep) throw DeepRead();
    return Update(state);
  }
  state.Begin();
  try {
    Evaluate(state);
  } catch (...) {
    state.End();
    throw;
  }
  state.End();
}

// The outermost read. What would take too much stack comes out of it as a DeepRead: it is then calculated from here,
// and what wanted it begins again.
inline void DGNode::Evaluate(GraphState& state) const {
  state.Aim(this);
  while (!state.m_targets.empty()) {
    const GraphState::Target target = state.m_targets.back();
    try {
      target.m_node->Update(state);
    } catch (DeepRead const&) {
      DGNode const* deep = std::exchange(state.m_deep, nullptr);
      if (!deep || deep == target.m_node) {
        throw GraphError("calculation takes too much stack: " + target.m_node->Name());
      }
      state.Aim(deep);
      continue;
    } catch (...) {
      if (state.m_targets.size() <= 1) throw;
    }
    if (!state.m_targets.empty() && state.m_targets.back() == target) state.m_targets.pop_back();
  }
}

// Looks at the inputs in the order in which they were read: as long as none has changed, the next one would be read
// again.
inline void DGNode::Update(GraphState& state) const {
  if (m_state == EState::Hard) return Calculate(state);
  struct Step {
    DGNode const* m_node;
    std::size_t m_input;
  };
  xvector<Step> steps(1, Step{this, 0});
  while (!steps.empty()) {
    Step& step = steps.back();
    DGNode const* node = step.m_node;
    if (node->m_state == EState::Soft && step.m_input < node->m_inputs.size()) {
      DGNode const* input = node->m_inputs[step.m_input].m_node;
      if (input->m_state == EState::Clean) {
        ++step.m_input;
      } else {
        steps.push_back({input, 0});
      }
      continue;
    }
    if (node->m_state == EState::Soft) node->m_state = EState::Clean;
    if (node->m_state == EState::Hard) {
      try {
        node->Calculate(state);
      } catch (...) {
        if (state.m_deep || steps.size() == 1) throw;
        steps[steps.size() - 2].m_node->m_state = EState::Hard;  // it may know what to do without this input
      }
    }
    steps.pop_back();
  }
}

inline void DGNode::Calculate(GraphState& state) const {
  if (m_isCalculating) throw GraphError("cyclic dependency: " + Name());
  const auto failed = state.m_failed.find(this);
  if (failed != state.m_failed.end()) std::rethrow_exception(failed->second);
  if (state.IsWaiting(this)) throw GraphError("cyclic dependency: " + Name());
  if (state.IsDeep()) {
    state.m_deep = this;
    throw DeepRead();
  }
  try {
    Recalculate(state);
  } catch (DeepRead const&) {
    m_isNews = true;
    state.Unwind(this);
    throw;
  } catch (...) {
    m_isNews = true;
    if (state.m_deep) {  // the calculation made another error of it
      state.Unwind(this);
      throw DeepRead();
    }
    state.m_failed[this] = std::current_exception();
    throw;
  }
}

inline void DGNode::Recalculate(GraphState& state) const {
  Forget();
  bool isChanged;
  {
    Calculation calculation(state, this);
    m_isEmpty = false;
    isChanged = RecalcCache();
    if (state.m_deep) throw DeepRead();  // its reader thought that it could do without
  }
  m_state = EState::Clean;
  JoinQueue(state);
  if (!std::exchange(m_isNews, false) && !isChanged) return;
  xvector<DGNode const*> dirty;
  for (NodeLink const& link : m_dependents) link.m_node->Mark(state, true, dirty);
  Spread(state, dirty);
}

inline Calculation::Calculation(GraphState& state, DGNode const* node)
    : m_node(node), m_state(state), m_outer(std::exchange(state.m_calculation, this)) {
  if (node) node->m_isCalculating = true;
}
inline Calculation::~Calculation() {
  if (m_node) m_node->m_isCalculating = false;
  m_state.m_calculation = m_outer;
}

inline bool Calculation::IsNew(DGNode const* input) {
  const auto& inputs = m_node->m_inputs;
  const std::size_t few = 16;
  if (m_inputs.empty() && inputs.size() < few) {
    for (DGNode::NodeLink const& link : inputs) {
      if (link.m_node == input) return false;
    }
    return true;
  }
  if (m_inputs.empty()) {
    for (DGNode::NodeLink const& link : inputs) m_inputs.insert(link.m_node);
  }
  return m_inputs.insert(input).second;
}

inline bool Calculation::Owns(void const* address) {
  const std::uintptr_t at = reinterpret_cast<std::uintptr_t>(address);
  const std::uintptr_t here = reinterpret_cast<std::uintptr_t>(__builtin_frame_address(0));
  if (here < at && at < reinterpret_cast<std::uintptr_t>(this)) return true;
  if (!m_isPlaceKnown) {
    m_isPlaceKnown = true;
    ValuePlace::Scope scope(m_place);
    m_node->ByteSize();
  }
  return at - reinterpret_cast<std::uintptr_t>(m_place.m_begin) < m_place.m_size;
}

inline void GraphState::End() {
  m_isEvaluating = false;
  m_deep = nullptr;
  m_failed.clear();
  m_targets.clear();
  m_unwound.clear();
  while (!m_again.empty()) {
    const auto [node, hard] = *m_again.begin();
    m_again.erase(m_again.begin());
    node->Invalidate(hard);
  }
}

// --- Eviction queues

inline void DGNode::JoinQueue(GraphState& state) const {
  m_queue = &state.m_queues[EvictionQueueIndex()];
  m_queue->m_byteSize += m_byteSize;
  m_queuePlace = m_queue->m_nodes.insert(m_queue->m_nodes.end(), this);
  state.Use();
}
inline void DGNode::LeaveQueue() const {
  EvictionQueue* queue = std::exchange(m_queue, nullptr);
  if (!queue) return;
  queue->m_byteSize -= m_byteSize;
  if (queue->m_next == m_queuePlace) ++queue->m_next;
  queue->m_nodes.erase(m_queuePlace);
  queue->m_state->Release();
}
inline void DGNode::UpdateByteSize() const {
  const ssize_t size = ByteSize();
  if (m_queue) m_queue->m_byteSize += size - m_byteSize;
  m_byteSize = size;
}

inline EvictionQueue& EvictionQueue::Get(ssize_t index) { return GraphState::Get().m_queues[index]; }

inline void EvictionQueue::EvictDownTo(ssize_t budget) {
  for (m_next = m_nodes.begin(); m_next != m_nodes.end() && m_byteSize > budget;) (*m_next++)->TryEvict(false);
  m_next = m_nodes.end();
}

}  // namespace vesk
