// How nodes are linked, become dirty and are brought up to date. `inline` are steps of a calculation that are taken
// nowhere else: what a plain write and read pass is one function each, but for what they call of the node's own.

@import "Vesk/vxObject/Caches.h"
@import "graph_rest.h"

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

// --- Calculating

void GraphState::BringUpToDate(DGNode const& node) {
  if (m_calculation || m_isEvaluating) return BringUpToDateWithin(node);
  BeginRead(node);
}
void GraphState::BringUpToDateWithin(DGNode const& node) {
  FailedRead failed{*this, node, m_calculation ? m_calculation->m_node : nullptr};
  if (node.m_isCalculating) throw GraphError("cyclic dependency: " + node.Name());
  if (!m_isEvaluating) {
    BeginRead(node);
  } else {
    if (m_deep) throw DeepRead();
    Update(node);
  }
  failed.m_reader = nullptr;
}

// The outermost read.
void GraphState::BeginRead(DGNode const& node) {
  m_isEvaluating = true;
  MeasureStack(MostCalculationStack);
  try {
    Aim(&node);
    while (!m_targets.empty()) UpdateLastTarget();
  } catch (...) {
    End();
    throw;
  }
  End();
}

// What would take too much stack comes out of it as a DeepRead: it is then calculated from here, and what wanted it
// begins again.
inline void GraphState::UpdateLastTarget() {
  const Target target = m_targets.back();
  try {
    Update(*target.m_node);
  } catch (DeepRead const&) {
    DGNode const* deep = std::exchange(m_deep, nullptr);
    if (!deep || deep == target.m_node) {
      throw GraphError("calculation takes too much stack: " + target.m_node->Name());
    }
    return Aim(deep);
  } catch (...) {
    if (m_targets.size() <= 1) throw;
  }
  if (!m_targets.empty() && m_targets.back() == target) m_targets.pop_back();
}

inline void GraphState::Update(DGNode const& node) {
  if (node.m_state == ENodeState::Hard) return Calculate(node);
  LookAtInputs(node);
}

// Those of one call, at the end of the list of all.
struct GraphState::Steps {
  explicit Steps(xvector<Step>& list) : m_list(list), m_begin(list.size()) {}
  ~Steps() {
    m_list.resize(m_begin);
    if (m_begin == 0 && m_list.capacity() > 1024) m_list.shrink_to_fit();
  }
  std::size_t Count() const { return m_list.size() - m_begin; }
  xvector<Step>& m_list;
  std::size_t m_begin;
};

// Looks at the inputs in the order in which they were read: as long as none has changed, the next one would be read
// again.
void GraphState::LookAtInputs(DGNode const& outermost) {
  Steps steps(m_steps);
  steps.m_list.push_back({&outermost, 0});
  while (steps.Count() > 0) {
    Step& step = steps.m_list.back();
    DGNode const* node = step.m_node;
    if (node->m_state == ENodeState::Soft && step.m_input < node->m_inputs.size()) {
      DGNode const* input = node->m_inputs[step.m_input].m_node;
      if (input->m_state == ENodeState::Clean) {
        ++step.m_input;
      } else {
        steps.m_list.push_back({input, 0});
      }
      continue;
    }
    if (node->m_state == ENodeState::Soft) node->m_state = ENodeState::Clean;
    if (node->m_state == ENodeState::Hard) {
      try {
        Calculate(*node);
      } catch (...) {
        if (m_deep || steps.Count() == 1) throw;
        // It may know what to do without this.
        steps.m_list[steps.m_list.size() - 2].m_node->m_state = ENodeState::Hard;
      }
    }
    steps.m_list.pop_back();
  }
}

inline void GraphState::Calculate(DGNode const& node) {
  if (node.m_isCalculating || node.m_unwound || m_rest) CheckCalculation(node);
  if (IsDeep()) return CalculateElsewhere(node);
  CalculateHere(node);
}
void GraphState::CheckCalculation(DGNode const& node) const {
  if (node.m_isCalculating) throw GraphError("cyclic dependency: " + node.Name());
  if (m_rest) m_rest->RethrowErrorOf(node);
  if (IsWaiting(node)) throw GraphError("cyclic dependency: " + node.Name());
}

void GraphState::CalculateHere(DGNode const& node) {
  try {
    Forget(node);
    node.m_again = EAgain::No;
    const bool isChanged = Recalculate(node);
    if (node.m_again != EAgain::No) NeedRest().m_again[&node] |= node.m_again == EAgain::Hard;
    node.m_state = ENodeState::Clean;
    JoinEndOfQueue(node);
    if ((std::exchange(node.m_isNews, false) || isChanged) && !node.m_dependents.empty()) SpreadNews(node);
  } catch (DeepRead const&) {
    BreakOff(node);
    Unwind(node);
    throw;
  } catch (...) {
    BreakOff(node);
    if (m_deep) {  // the calculation made another error of it
      Unwind(node);
      throw DeepRead();
    }
    NeedRest().m_failed[&node] = std::current_exception();
    throw;
  }
}
inline bool GraphState::Recalculate(DGNode const& node) {
  Calculation calculation(*this, &node);
  node.m_isEmpty = false;
  const bool isChanged = node.RecalcCache();
  if (m_deep) throw DeepRead();  // its reader thought that it could do without
  return isChanged;
}
void GraphState::BreakOff(DGNode const& node) {
  if (node.m_state != ENodeState::Clean) LeaveQueue(node);
  node.m_isNews = true;
}
void GraphState::SpreadNews(DGNode const& node) {
  Changes dirty;
  for (DGLink const& link : node.m_dependents) Mark(*link.m_node, true, dirty);
  Spread(dirty);
}

inline void GraphState::End() {
  m_isEvaluating = false;
  m_deep = nullptr;
  m_targets.clear();
  if (m_rest) EndOfRest();
}
// Who is told that a value is to be calculated again may read others, whose end is then the end of all.
void GraphState::EndOfRest() {
  for (CalculationStack& stack : m_rest->m_otherStacks) stack.Close();
  m_rest->m_failed.clear();
  if (m_targets.capacity() > 1024) m_targets.shrink_to_fit();
  while (m_rest && !m_rest->m_again.empty()) {
    const auto [node, hard] = *m_rest->m_again.begin();
    m_rest->m_again.erase(m_rest->m_again.begin());
    Invalidate(*node, hard);
  }
  delete std::exchange(m_rest, nullptr);
}

// --- The calculation that runs

struct Calculation::InputSet : std::unordered_set<DGNode const*> {};

void Calculation::DropInputs() { delete m_inputs; }

void Calculation::Forget(DGNode const* node, DGNode const* input) {
  for (Calculation* at = this; at; at = at->m_outer) {
    if (at->m_node == node && at->m_inputs) at->m_inputs->erase(input);
  }
}
void Calculation::OnDestroy(DGNode const* input) {
  if (m_inputs) m_inputs->erase(input);
}

inline bool Calculation::IsNew(DGNode const* input) {
  const auto& inputs = m_node->m_inputs;
  const std::size_t few = 16;
  if (!m_inputs) {
    if (inputs.size() < few) {
      for (DGLink const& link : inputs) {
        if (link.m_node == input) return false;
      }
      return true;
    }
    auto all = std::make_unique<InputSet>();
    for (DGLink const& link : inputs) all->insert(link.m_node);
    m_inputs = all.release();
  }
  return m_inputs->insert(input).second;
}

bool Calculation::LookWhetherItOwns(void const* address) {
  const std::uintptr_t at = reinterpret_cast<std::uintptr_t>(address);
  const std::uintptr_t here = reinterpret_cast<std::uintptr_t>(__builtin_frame_address(0));
  if (here < at && at < reinterpret_cast<std::uintptr_t>(this)) return true;
  if (!m_isPlaceKnown) {
    m_isPlaceKnown = true;
    ValuePlace::Scope scope(m_place);
    m_node->ByteSize();
  }
  if (at - reinterpret_cast<std::uintptr_t>(m_place.m_begin) < m_place.m_size) return true;
  m_foreign = address;
  return false;
}

// --- Eviction queues

inline void GraphState::JoinEndOfQueue(DGNode const& node) {
  EvictionQueue& queue = m_queues[node.EvictionQueueIndex()];
  DGQueuePlace const& place = node;
  if (node.m_queue == &queue && queue.m_nodes.Last() == &place) return;
  LeaveQueue(node);
  node.m_queue = &queue;
  queue.m_byteSize += node.m_byteSize;
  ++queue.m_count;
  queue.m_nodes.Append(place);
  Use();
}
inline void GraphState::LeaveQueue(DGNode const& node) {
  EvictionQueue* queue = std::exchange(node.m_queue, nullptr);
  if (!queue) return;
  queue->m_byteSize -= node.m_byteSize;
  --queue->m_count;
  DGQueuePlace const& place = node;
  if (queue->m_next == &place) queue->m_next = place.m_next;
  Leave(place);
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
    DGPlace const* place = std::exchange(m_next, m_next->m_next);
    static_cast<DGNode const*>(static_cast<DGQueuePlace const*>(place))->TryEvict(false);
  }
  m_next = m_nodes.End();
}

// --- Queues of async calculations

void AsyncQueues::Join(DGAsyncNode const& node) {
  if (node.m_queues) return;
  AsyncQueues& queues = Get();
  queues.m_waiting[node.m_flags & DF_ASYNC_IO ? InputOutput : Calculations].Append(node);
  node.m_queues = &queues;
  queues.Use();
}
void AsyncQueues::Leave(DGAsyncNode const& node) {
  if (!node.m_queues) return;
  vesk::Leave(static_cast<DGWaitPlace const&>(node));
  std::exchange(node.m_queues, nullptr)->Release();
}

ssize_t AsyncQueues::Run(EQueue queue) {
  ssize_t count = 0;
  for (auto& waiting = Get().m_waiting[queue]; !waiting.IsEmpty(); ++count) {
    DGAsyncNode const& node = *static_cast<DGAsyncNode const*>(static_cast<DGWaitPlace const*>(waiting.First()));
    Leave(node);
    Calculation detached(GraphState::Get(), nullptr);
    bool isChanged;
    try {
      isChanged = node.CalculateOutput();
    } catch (...) {
      GraphState::Get().Invalidate(node, true);
      throw;
    }
    if (isChanged) GraphState::Change(node);
  }
  return count;
}

}  // namespace vesk
