// How nodes are linked, become dirty and are brought up to date. `inline` are steps of a calculation that are taken
// nowhere else.

@import "Vesk/vxObject/Graph.h"

#include <algorithm>

namespace vesk {

// --- The state of a thread

GraphState::GraphState() {
  for (EvictionQueue& queue : m_queues) queue.m_state = this;
}
GraphState::~GraphState() {}

void GraphState::Begin() {
  m_isEvaluating = true;
  m_stack = reinterpret_cast<std::uintptr_t>(__builtin_frame_address(0));
}

void GraphState::Aim(DGNode const* node) { m_targets.push_back({node, ++m_lastSerial}); }

void GraphState::Unwind(DGNode const* node) {
  if (!m_targets.empty()) m_unwound[node] = m_targets.back().m_serial;
}
inline bool GraphState::IsWaiting(DGNode const* node) const {
  const auto at = m_unwound.find(node);
  if (at == m_unwound.end() || m_targets.empty() || at->second == m_targets.back().m_serial) return false;
  const auto target = std::lower_bound(m_targets.begin(), m_targets.end(), at->second,
                                       [](Target const& t, std::size_t serial) { return t.m_serial < serial; });
  return target != m_targets.end() && target->m_serial == at->second;
}

inline bool GraphState::IsDeep() const {
  const std::uintptr_t here = reinterpret_cast<std::uintptr_t>(__builtin_frame_address(0));
  return m_calculation && m_calculation->m_outer && m_stack > here && m_stack - here > MostCalculationStack;
}

GraphState::NotifyScope::NotifyScope(GraphState& state, xvector<DGNode const*>& nodes) : m_state(state) {
  state.m_notified.push_back(&nodes);
}
GraphState::NotifyScope::~NotifyScope() { m_state.m_notified.pop_back(); }

void GraphState::OnDestroy(DGNode const* node) {
  for (xvector<DGNode const*>* nodes : m_notified) {
    std::replace(nodes->begin(), nodes->end(), node, static_cast<DGNode const*>(nullptr));
  }
  if (!m_isEvaluating) return;
  m_again.erase(node);
  m_failed.erase(node);
  m_unwound.erase(node);
  m_targets.erase(std::remove_if(m_targets.begin(), m_targets.end(), [=](Target const& t) { return t.m_node == node; }),
                  m_targets.end());
  for (Calculation* at = m_calculation; at; at = at->m_outer) at->m_inputs.erase(node);
  // What a calculation had made and wanted to read: the calculation itself must begin further out.
  if (m_deep == node) m_deep = m_calculation ? m_calculation->m_node : nullptr;
}

// --- What others ask and tell

DGNode::FailedRead::~FailedRead() {
  if (!m_reader || m_reader == m_node || m_state.m_deep) return;
  m_node->Link(m_state);
  m_state.m_again.insert({m_reader, false});
}

void DGNode::TryEvict(bool force) const {
  if (m_isEmpty || m_isCalculating || !(force || IsEvictable())) return;
  OnEvict();
  Forget();
  m_state = EState::Hard;
  m_isEmpty = m_isNews = true;
  InvalidateDependents();
}

xvector<DGNode const*> DGNode::NodesOf(Links const& links) {
  xvector<DGNode const*> nodes;
  for (NodeLink const& link : links) nodes.push_back(link.m_node);
  return nodes;
}
xvector<DGNode const*> DGNode::Inputs() const { return NodesOf(m_inputs); }
xvector<DGNode const*> DGNode::Dependents() const { return NodesOf(m_dependents); }

void DGNode::TellDependents() const { Change(xvector<DGNode const*>(1, this)); }

// --- Links

void DGNode::Link(GraphState& state) const {
  DGNode const* reader = state.m_calculation->m_node;
  if (!state.m_calculation->IsNew(this)) return;
  reader->m_inputs.push_back({this, m_dependents.size()});
  m_dependents.push_back({reader, reader->m_inputs.size() - 1});
}

// Takes a link out of a list of links; the last one takes its place. `backwards`: the lists at the other ends.
void DGNode::Drop(Links& links, Links DGNode::*backwards, std::size_t at) {
  links[at] = links.back();
  links.pop_back();
  if (at < links.size()) (const_cast<DGNode*>(links[at].m_node)->*backwards)[links[at].m_at].m_at = at;
}

// Leaves the graph behind it.
void DGNode::Forget() const {
  LeaveQueue();
  for (NodeLink const& link : std::exchange(m_inputs, {})) {
    DGNode const* input = link.m_node;
    Drop(input->m_dependents, &DGNode::m_inputs, link.m_at);
    if (input->m_dependents.empty()) input->OnNoDependents();
  }
}

DGNode::Links DGNode::DropDependents() const {
  Links dependents = std::exchange(m_dependents, {});
  for (NodeLink const& link : dependents) Drop(link.m_node->m_inputs, &DGNode::m_dependents, link.m_at);
  return dependents;
}

DGNode::~DGNode() {
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
void DGNode::Spread(GraphState& state, xvector<DGNode const*>& dirty) {
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

void DGNode::Invalidate(bool hard) const {
  GraphState& state = GraphState::Get();
  xvector<DGNode const*> dirty;
  Mark(state, hard, dirty);
  Spread(state, dirty);
}

void DGNode::InvalidateDependents() const {
  if (m_dependents.empty()) return;
  GraphState& state = GraphState::Get();
  xvector<DGNode const*> dirty;
  for (NodeLink const& link : m_dependents) link.m_node->Mark(state, false, dirty);
  Spread(state, dirty);
}

void DGNode::Change(xvector<DGNode const*> const& nodes) {
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

void DGNode::BringUpToDate(GraphState& state) const {
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
void DGNode::Evaluate(GraphState& state) const {
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
void DGNode::Update(GraphState& state) const {
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

void DGNode::Calculate(GraphState& state) const {
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

void DGNode::Recalculate(GraphState& state) const {
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

Calculation::Calculation(GraphState& state, DGNode const* node)
    : m_node(node), m_state(state), m_outer(std::exchange(state.m_calculation, this)) {
  if (node) node->m_isCalculating = true;
}
Calculation::~Calculation() {
  if (m_node) m_node->m_isCalculating = false;
  m_state.m_calculation = m_outer;
}

void Calculation::Forget(DGNode const* node, DGNode const* input) {
  for (Calculation* at = this; at; at = at->m_outer) {
    if (at->m_node == node) at->m_inputs.erase(input);
  }
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

bool Calculation::Owns(void const* address) {
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

void GraphState::End() {
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
void DGNode::UpdateByteSize() const {
  const ssize_t size = ByteSize();
  if (m_queue) m_queue->m_byteSize += size - m_byteSize;
  m_byteSize = size;
}

EvictionQueue& EvictionQueue::Get(ssize_t index) { return GraphState::Get().m_queues[index]; }

void EvictionQueue::EvictDownTo(ssize_t budget) {
  for (m_next = m_nodes.begin(); m_next != m_nodes.end() && m_byteSize > budget;) (*m_next++)->TryEvict(false);
  m_next = m_nodes.end();
}

}  // namespace vesk
