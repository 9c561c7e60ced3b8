// How nodes are linked and become dirty. `inline` are steps that are taken nowhere else: what a plain write and read
// pass is one function each, but for what they call of the node's own.

@import "Vesk/vxObject/Caches.h"
@import "Vesk/vxObject/src/parts/graph_rest.h"

#include <algorithm>
#include <unordered_set>

namespace vesk {

// --- The state of a thread

GraphState::GraphState() {
  for (EvictionQueue& queue : m_queues) queue.m_state = this;
}
GraphState::~GraphState() { delete m_rest; }

GraphState::Rest& GraphState::NeedRest() {
  if (!m_rest) m_rest = new Rest;
  return *m_rest;
}

inline void GraphState::Aim(DGNode const* node) { m_targets.push_back({node, ++m_lastSerial}); }
void GraphState::Unwind(DGNode const& node) {
  if (!m_targets.empty()) node.m_unwound = m_targets.back().m_serial;
}
inline bool GraphState::IsWaiting(DGNode const& node) const {
  const std::size_t serial = node.m_unwound;
  if (serial == 0 || m_targets.empty() || serial == m_targets.back().m_serial) return false;
  const auto target = std::lower_bound(m_targets.begin(), m_targets.end(), serial,
                                       [](Target const& t, std::size_t other) { return t.m_serial < other; });
  return target != m_targets.end() && target->m_serial == serial;
}

inline bool GraphState::IsDeep() const {
  const std::uintptr_t here = reinterpret_cast<std::uintptr_t>(__builtin_frame_address(0));
  return m_calculation && m_calculation->m_outer && m_stack > here && m_stack - here > m_mostStack;
}

void GraphState::OnDestroy(DGNode const& node) {
  if (m_rest) m_rest->OnDestroy(node);
  if (!m_isEvaluating) return;
  m_targets.erase(
      std::remove_if(m_targets.begin(), m_targets.end(), [&](Target const& t) { return t.m_node == &node; }),
      m_targets.end());
  for (Calculation* at = m_calculation; at; at = at->m_outer) at->OnDestroy(&node);
  // What a calculation had made and wanted to read: the calculation itself must begin further out.
  if (m_deep == &node) m_deep = m_calculation ? m_calculation->m_node : nullptr;
}

void GraphState::LoseInput() {
  if (m_calculation && m_calculation->m_node) CalculateAgain(*m_calculation->m_node, EAgain::Hard);
}
inline void GraphState::CalculateAgain(DGNode const& node, EAgain again) {
  if (again > node.m_again) node.m_again = again;
}

// --- What others ask and tell

// A reader that goes on without the value has still read it: it must look again when that may be there.
struct GraphState::FailedRead {
  ~FailedRead() {
    if (!m_reader || m_reader == &m_node || m_state.m_deep) return;
    CalculateAgain(*m_reader, EAgain::Soft);
    try {
      m_state.Link(m_node);
    } catch (std::bad_alloc const&) {
    }
  }
  GraphState& m_state;
  DGNode const& m_node;
  DGNode const* m_reader;
};

void GraphState::TryEvict(DGNode const& node) {
  node.OnEvict();
  LeaveQueue(node);
  Forget(node);
  node.m_inputs.GiveUp();
  node.m_state = ENodeState::Hard;
  node.m_isEmpty = node.m_isNews = true;
  InvalidateDependents(node);
}

static xvector<DGNode const*> NodesOf(DGLinks const& links) {
  xvector<DGNode const*> nodes;
  for (DGLink const& link : links) nodes.push_back(link.m_node);
  return nodes;
}
xvector<DGNode const*> DGNode::Inputs() const { return NodesOf(m_inputs); }
xvector<DGNode const*> DGNode::Dependents() const { return NodesOf(m_dependents); }

// --- Links

void DGLinks::MakeRoom() {
  if (!IsFull()) return;
  const std::size_t capacity = m_size ? 2 * m_size : 1;
  DGLink* const links = new DGLink[capacity];
  std::copy(begin(), end(), links);
  delete[] std::exchange(m_links, links);
  m_capacity = capacity;
}

void GraphState::Link(DGNode const& node) {
  DGNode const& reader = *m_calculation->m_node;
  try {
    if (reader.m_inputs.IsFull() || node.m_dependents.IsFull()) {
      reader.m_inputs.MakeRoom();
      node.m_dependents.MakeRoom();
    }
    if (!m_calculation->IsNew(&node)) return;
  } catch (std::bad_alloc const&) {
    CalculateAgain(reader, EAgain::Hard);
    throw;
  }
  reader.m_inputs.Add({&node, node.m_dependents.size()});
  node.m_dependents.Add({&reader, reader.m_inputs.size() - 1});
}

// Takes a link out of a list of links. `backwards`: the lists at the other ends.
inline void GraphState::Drop(DGLinks& links, DGLinks DGNode::*backwards, std::size_t at) {
  links.Remove(at);
  if (at < links.size()) (const_cast<DGNode*>(links[at].m_node)->*backwards)[links[at].m_at].m_at = at;
}

inline void GraphState::OnNoDependents(DGNode const& node) {
  if (node.m_flags & DF_SOURCE) OnSourceUnread(node);
}

// Leaves the graph behind it.
inline void GraphState::Forget(DGNode const& node) {
  for (DGLink const& link : node.m_inputs) {
    DGNode const& input = *link.m_node;
    Drop(input.m_dependents, &DGNode::m_inputs, link.m_at);
    if (input.m_dependents.empty()) OnNoDependents(input);
  }
  node.m_inputs.Clear();
}

// The links keep their memory for those who will read this node again.
void GraphState::DropDependents(DGNode const& node, bool isDestroyed, Changes& dirty) {
  for (DGLink const& link : node.m_dependents) {
    DGNode const& dependent = *link.m_node;
    Drop(dependent.m_inputs, &DGNode::m_dependents, link.m_at);
    if (dependent.m_isCalculating) {
      // A calculation that used a node in passing is not told of its end.
      if (isDestroyed) continue;
      m_calculation->Forget(&dependent, &node);
    }
    Mark(dependent, true, dirty);
  }
  node.m_dependents.Clear();
}

DGNode::~DGNode() {
  GraphState* state = GraphState::Peek();
  if (state) state->OnDestroy(*this);
  GraphState::LeaveQueue(*this);
  GraphState::Forget(*this);
  if (m_dependents.empty()) return;
  GraphState::Changes dirty;
  GraphState::Get().DropDependents(*this, true, dirty);
  GraphState::Get().Spread(dirty);
}

// --- What is dirty

DGNode const* GraphState::Changed(DGPlace const* place) {
  return static_cast<DGNode const*>(static_cast<DGChangePlace const*>(place));
}

inline void GraphState::Mark(DGNode const& node, bool hard, Changes& dirty) {
  if (node.m_isCalculating) return CalculateAgain(node, hard ? EAgain::Hard : EAgain::Soft);
  const bool wasClean = node.m_state == ENodeState::Clean;
  if (hard || wasClean) node.m_state = hard ? ENodeState::Hard : ENodeState::Soft;
  if (wasClean) Join(node, dirty);
}

// Goes on from nodes that were clean to all that depends on them, then tells them. Who is told may do anything: what
// has become clean again leaves the list of one change for that of the next.
void GraphState::Spread(Changes& dirty) {
  if (dirty.IsEmpty()) return;
  for (DGPlace const* at = dirty.First(); at != dirty.End(); at = at->m_next) {
    for (DGLink const& link : Changed(at)->m_dependents) Mark(*link.m_node, false, dirty);
  }
  if (!m_calculation) return Tell(dirty);
  Calculation detached(*this, nullptr);
  Tell(dirty);
}
inline void GraphState::Tell(Changes& dirty) {
  while (!dirty.IsEmpty()) {
    DGNode const* node = Changed(dirty.First());
    Leave(*dirty.First());
    node->OnInvalidate();
  }
}

void GraphState::Invalidate(DGNode const& node, bool hard) {
  Changes dirty;
  Mark(node, hard, dirty);
  Spread(dirty);
}

void GraphState::InvalidateDependents(DGNode const& node) {
  if (node.m_dependents.empty()) return;
  Changes dirty;
  for (DGLink const& link : node.m_dependents) Mark(*link.m_node, false, dirty);
  Spread(dirty);
}

void GraphState::TellDependents(DGNode const& node) {
  GraphState& state = Get();
  if (!state.m_calculation && node.m_dependents.size() == 1 && node.m_dependents[0].m_node->m_dependents.empty()) {
    return TellTheOne(node);
  }
  Changes dirty;
  state.DropDependents(node, false, dirty);
  OnNoDependents(node);
  state.Spread(dirty);
}
// What is most often so: one value depends on the node, nothing on that, and nothing is being calculated.
inline void GraphState::TellTheOne(DGNode const& node) {
  DGNode const& dependent = *node.m_dependents[0].m_node;
  Drop(dependent.m_inputs, &DGNode::m_dependents, node.m_dependents[0].m_at);
  node.m_dependents.Clear();
  const bool wasClean = std::exchange(dependent.m_state, ENodeState::Hard) == ENodeState::Clean;
  OnNoDependents(node);
  if (wasClean) dependent.OnInvalidate();
}

void GraphState::Change(Changes& nodes) {
  Changes dirty;
  while (!nodes.IsEmpty()) {
    DGNode const* node = Changed(nodes.First());
    Leave(*nodes.First());
    DropDependents(*node, false, dirty);
    OnNoDependents(*node);
  }
  Spread(dirty);
}

}  // namespace vesk
