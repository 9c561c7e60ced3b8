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
  MeasureStack(MostCalculationStack);
}

void GraphState::Aim(DGNode const* node) { m_targets.push_back({node, ++m_lastSerial}); }

void GraphState::Unwind(DGNode const* node) {
  if (!m_targets.empty()) node->m_unwound = m_targets.back().m_serial;
}
inline bool GraphState::IsWaiting(DGNode const* node) const {
  const std::size_t serial = node->m_unwound;
  if (serial == 0 || m_targets.empty() || serial == m_targets.back().m_serial) return false;
  const auto target = std::lower_bound(m_targets.begin(), m_targets.end(), serial,
                                       [](Target const& t, std::size_t other) { return t.m_serial < other; });
  return target != m_targets.end() && target->m_serial == serial;
}

inline bool GraphState::IsDeep() const {
  const std::uintptr_t here = reinterpret_cast<std::uintptr_t>(__builtin_frame_address(0));
  return m_calculation && m_calculation->m_outer && m_stack > here && m_stack - here > m_mostStack;
}

void GraphState::OnDestroy(DGNode const* node) {
  if (!m_isEvaluating) return;
  m_again.erase(node);
  m_failed.erase(node);
  m_targets.erase(std::remove_if(m_targets.begin(), m_targets.end(), [=](Target const& t) { return t.m_node == node; }),
                  m_targets.end());
  for (Calculation* at = m_calculation; at; at = at->m_outer) {
    if (at->m_inputs) at->m_inputs->erase(node);
  }
  // What a calculation had made and wanted to read: the calculation itself must begin further out.
  if (m_deep == node) m_deep = m_calculation ? m_calculation->m_node : nullptr;
}

void GraphState::LoseInput() {
  if (m_calculation && m_calculation->m_node) m_calculation->m_node->CalculateAgain(DGNode::EAgain::Hard);
}

// --- What others ask and tell

// A reader that goes on without the value has still read it: it must look again when that may be there.
struct DGNode::FailedRead {
  ~FailedRead() {
    if (!m_reader || m_reader == m_node || m_state.m_deep) return;
    m_reader->CalculateAgain(EAgain::Soft);
    try {
      m_node->Link(m_state);
    } catch (std::bad_alloc const&) {
    }
  }
  GraphState& m_state;
  DGNode const* m_node;
  DGNode const* m_reader;
};

void DGNode::TryEvict(bool force) const {
  if (m_isEmpty || m_isCalculating || !(force || IsEvictable())) return;
  OnEvict();
  Forget();
  m_inputs = Links();
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

// --- Links

// So that adding a link cannot fail.
inline void DGNode::MakeRoom(Links& links) {
  if (links.size() == links.capacity()) links.reserve(links.empty() ? 1 : 2 * links.size());
}

void DGNode::Link(GraphState& state) const {
  DGNode const* reader = state.m_calculation->m_node;
  try {
    MakeRoom(reader->m_inputs);
    MakeRoom(m_dependents);
    if (!state.m_calculation->IsNew(this)) return;
  } catch (std::bad_alloc const&) {
    reader->CalculateAgain(EAgain::Hard);
    throw;
  }
  reader->m_inputs.push_back({this, m_dependents.size()});
  m_dependents.push_back({reader, reader->m_inputs.size() - 1});
}

// Takes a link out of a list of links; the last one takes its place. `backwards`: the lists at the other ends.
inline void DGNode::Drop(Links& links, Links DGNode::*backwards, std::size_t at) {
  if (at + 1 < links.size()) {
    links[at] = links.back();
    (const_cast<DGNode*>(links[at].m_node)->*backwards)[links[at].m_at].m_at = at;
  }
  links.pop_back();
}

// Leaves the graph behind it.
void DGNode::Forget() const {
  LeaveQueue();
  for (NodeLink const& link : m_inputs) {
    DGNode const* input = link.m_node;
    Drop(input->m_dependents, &DGNode::m_inputs, link.m_at);
    if (input->m_dependents.empty()) input->OnNoDependents();
  }
  m_inputs.clear();
}

// The links keep their memory for those who will read this node again.
void DGNode::DropDependents(GraphState* state, Changes& dirty) const {
  for (NodeLink const& link : m_dependents) {
    DGNode const* node = link.m_node;
    Drop(node->m_inputs, &DGNode::m_dependents, link.m_at);
    if (node->m_isCalculating) {
      // A calculation that used a node in passing is not told of its end.
      if (!state) continue;
      state->m_calculation->Forget(node, this);
    }
    node->Mark(true, dirty);
  }
  m_dependents.clear();
}

DGNode::~DGNode() {
  GraphState* state = GraphState::Peek();
  if (state) state->OnDestroy(this);
  Forget();
  if (m_dependents.empty()) return;
  Changes dirty;
  DropDependents(nullptr, dirty);
  Spread(GraphState::Get(), dirty);
}

// --- What is dirty

inline void DGNode::Mark(bool hard, Changes& dirty) const {
  if (m_isCalculating) return CalculateAgain(hard ? EAgain::Hard : EAgain::Soft);
  const bool wasClean = m_state == EState::Clean;
  if (hard || wasClean) m_state = hard ? EState::Hard : EState::Soft;
  if (wasClean) Join(dirty);
}

// Goes on from nodes that were clean to all that depends on them, then tells them. Who is told may do anything: what
// has become clean again leaves the list of one change for that of the next.
void DGNode::Spread(GraphState& state, Changes& dirty) {
  if (dirty.IsEmpty()) return;
  for (NodePlace const* at = dirty.First(); at != dirty.End(); at = at->m_next) {
    for (NodeLink const& link : Changed(at)->m_dependents) link.m_node->Mark(false, dirty);
  }
  if (!state.m_calculation) return Tell(dirty);
  Calculation detached(state, nullptr);
  Tell(dirty);
}
inline void DGNode::Tell(Changes& dirty) {
  while (!dirty.IsEmpty()) {
    DGNode const* node = Changed(dirty.First());
    dirty.First()->Leave();
    node->OnInvalidate();
  }
}

void DGNode::Invalidate(bool hard) const {
  Changes dirty;
  Mark(hard, dirty);
  Spread(GraphState::Get(), dirty);
}

void DGNode::InvalidateDependents() const {
  if (m_dependents.empty()) return;
  Changes dirty;
  for (NodeLink const& link : m_dependents) link.m_node->Mark(false, dirty);
  Spread(GraphState::Get(), dirty);
}

void DGNode::TellDependents() const {
  GraphState& state = GraphState::Get();
  if (!state.m_calculation && m_dependents.size() == 1 && m_dependents[0].m_node->m_dependents.empty()) {
    return TellTheOne();
  }
  Changes dirty;
  DropDependents(&state, dirty);
  OnNoDependents();
  Spread(state, dirty);
}
// What is most often so: one value depends on the node, nothing on that, and nothing is being calculated.
inline void DGNode::TellTheOne() const {
  DGNode const* node = m_dependents[0].m_node;
  Drop(node->m_inputs, &DGNode::m_dependents, m_dependents[0].m_at);
  m_dependents.clear();
  const bool wasClean = std::exchange(node->m_state, EState::Hard) == EState::Clean;
  OnNoDependents();
  if (wasClean) node->OnInvalidate();
}

void DGNode::Change(Changes& nodes) {
  if (nodes.First()->m_next == nodes.End()) {
    DGNode const* node = Changed(nodes.First());
    nodes.First()->Leave();
    return node->Change();
  }
  GraphState& state = GraphState::Get();
  Changes dirty;
  while (!nodes.IsEmpty()) {
    DGNode const* node = Changed(nodes.First());
    nodes.First()->Leave();
    node->DropDependents(&state, dirty);
    node->OnNoDependents();
  }
  Spread(state, dirty);
}

// --- Calculating

void DGNode::BringUpToDate(GraphState& state) const {
  if (!state.m_calculation && !state.m_isEvaluating) return BeginRead(state);
  FailedRead failed{state, this, state.m_calculation ? state.m_calculation->m_node : nullptr};
  if (m_isCalculating) throw GraphError("cyclic dependency: " + Name());
  if (!state.m_isEvaluating) {
    BeginRead(state);
  } else {
    if (state.m_deep) throw DeepRead();
    Update(state);
  }
  failed.m_reader = nullptr;
}

void DGNode::BeginRead(GraphState& state) const {
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

inline void DGNode::Update(GraphState& state) const {
  if (m_state == EState::Hard) return Calculate(state);
  LookAtInputs(state);
}

// Looks at the inputs in the order in which they were read: as long as none has changed, the next one would be read
// again.
void DGNode::LookAtInputs(GraphState& state) const {
  struct Steps {
    explicit Steps(xvector<GraphState::Step>& list) : m_list(list), m_begin(list.size()) {}
    ~Steps() { m_list.resize(m_begin); }
    std::size_t Count() const { return m_list.size() - m_begin; }
    xvector<GraphState::Step>& m_list;
    std::size_t m_begin;
  } steps(state.m_steps);
  steps.m_list.push_back({this, 0});
  while (steps.Count() > 0) {
    GraphState::Step& step = steps.m_list.back();
    DGNode const* node = step.m_node;
    if (node->m_state == EState::Soft && step.m_input < node->m_inputs.size()) {
      DGNode const* input = node->m_inputs[step.m_input].m_node;
      if (input->m_state == EState::Clean) {
        ++step.m_input;
      } else {
        steps.m_list.push_back({input, 0});
      }
      continue;
    }
    if (node->m_state == EState::Soft) node->m_state = EState::Clean;
    if (node->m_state == EState::Hard) {
      try {
        node->Calculate(state);
      } catch (...) {
        if (state.m_deep || steps.Count() == 1) throw;
        steps.m_list[steps.m_list.size() - 2].m_node->m_state = EState::Hard;  // it may know what to do without this
      }
    }
    steps.m_list.pop_back();
  }
}

void DGNode::Calculate(GraphState& state) const {
  if (m_isCalculating) throw GraphError("cyclic dependency: " + Name());
  if (!state.m_failed.empty()) {
    const auto failed = state.m_failed.find(this);
    if (failed != state.m_failed.end()) std::rethrow_exception(failed->second);
  }
  if (state.IsWaiting(this)) throw GraphError("cyclic dependency: " + Name());
  if (state.IsDeep()) return CalculateElsewhere(state);
  CalculateHere(state);
}

void DGNode::CalculateHere(GraphState& state) const {
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
  m_again = EAgain::No;
  bool isChanged;
  {
    Calculation calculation(state, this);
    m_isEmpty = false;
    isChanged = RecalcCache();
    if (state.m_deep) throw DeepRead();  // its reader thought that it could do without
  }
  if (m_again != EAgain::No) state.m_again[this] |= m_again == EAgain::Hard;
  m_state = EState::Clean;
  JoinQueue(state);
  if ((!std::exchange(m_isNews, false) && !isChanged) || m_dependents.empty()) return;
  Changes dirty;
  for (NodeLink const& link : m_dependents) link.m_node->Mark(true, dirty);
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
    if (at->m_node == node && at->m_inputs) at->m_inputs->erase(input);
  }
}

inline bool Calculation::IsNew(DGNode const* input) {
  const auto& inputs = m_node->m_inputs;
  const std::size_t few = 16;
  if (!m_inputs) {
    if (inputs.size() < few) {
      for (DGNode::NodeLink const& link : inputs) {
        if (link.m_node == input) return false;
      }
      return true;
    }
    auto all = std::make_unique<std::unordered_set<DGNode const*>>();
    for (DGNode::NodeLink const& link : inputs) all->insert(link.m_node);
    m_inputs = std::move(all);
  }
  return m_inputs->insert(input).second;
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

// Clearing a table of hashes takes the time of the most that was ever in it, so a used one is given up.
template <typename Map>
inline void Empty(Map& map) {
  if (!map.empty()) Map().swap(map);
}
template <typename T>
inline void Empty(xvector<T>& list) {
  list.clear();
  if (list.capacity() > 1024) list.shrink_to_fit();
}

void GraphState::End() {
  m_isEvaluating = false;
  m_deep = nullptr;
  for (CalculationStack& stack : m_otherStacks) stack.Close();
  Empty(m_failed);
  Empty(m_targets);
  Empty(m_steps);
  while (!m_again.empty()) {
    const auto [node, hard] = *m_again.begin();
    m_again.erase(m_again.begin());
    if (m_again.empty()) std::unordered_map<DGNode const*, bool>().swap(m_again);
    node->Invalidate(hard);
  }
}

// --- Eviction queues

inline void DGNode::JoinQueue(GraphState& state) const {
  m_queue = &state.m_queues[EvictionQueueIndex()];
  m_queue->m_byteSize += m_byteSize;
  ++m_queue->m_count;
  m_queue->m_nodes.Append(*this);
  state.Use();
}
inline void DGNode::LeaveQueue() const {
  EvictionQueue* queue = std::exchange(m_queue, nullptr);
  if (!queue) return;
  queue->m_byteSize -= m_byteSize;
  --queue->m_count;
  QueuePlace const& place = *this;
  if (queue->m_next == &place) queue->m_next = place.m_next;
  place.Leave();
  queue->m_state->Release();
}
void DGNode::UpdateByteSize() const {
  const ssize_t size = ByteSize();
  if (m_queue) m_queue->m_byteSize += size - m_byteSize;
  m_byteSize = size;
}

EvictionQueue& EvictionQueue::Get(ssize_t index) { return GraphState::Get().m_queues[index]; }

void EvictionQueue::EvictDownTo(ssize_t budget) {
  for (m_next = m_nodes.First(); m_next != m_nodes.End() && m_byteSize > budget;) {
    NodePlace const* place = std::exchange(m_next, m_next->m_next);
    static_cast<DGNode const*>(static_cast<QueuePlace const*>(place))->TryEvict(false);
  }
  m_next = m_nodes.End();
}

}  // namespace vesk
