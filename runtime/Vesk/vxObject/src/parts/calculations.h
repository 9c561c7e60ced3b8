// How nodes are brought up to date, and where their values wait to be dropped or to be calculated.

@import "Vesk/vxObject/src/parts/graph.h"

namespace vesk {

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
  if (node.m_isCalculating || node.m_unwound || m_rest) {
    CheckCalculation(node);
    if (m_isWatched) return CalculateTimed(node);
  }
  if (IsDeep()) return CalculateElsewhere(node);
  CalculateHere(node);
}
void GraphState::CheckCalculation(DGNode const& node) const {
  if (node.m_isCalculating) throw GraphError("cyclic dependency: " + node.Name());
  if (m_rest) m_rest->RethrowErrorOf(node);
  if (IsWaiting(node)) throw GraphError("cyclic dependency: " + node.Name());
}
void GraphState::CalculateTimed(DGNode const& node) {
  Timing timing(*this, node);
  IsDeep() ? CalculateElsewhere(node) : CalculateHere(node);
  timing.Succeed();
}

void GraphState::CalculateHere(DGNode const& node) {
  try {
    Forget(node);
    node.m_again = EAgain::No;
    const bool isChanged = Recalculate(node);
    if (node.m_again != EAgain::No) NeedRest().m_again[&node].m_isHard |= node.m_again == EAgain::Hard;
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
    NeedRest().m_failed[&node].m_error = std::current_exception();
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
    const auto [node, again] = *m_rest->m_again.begin();
    m_rest->m_again.erase(m_rest->m_again.begin());
    Invalidate(*node, again.m_isHard);
  }
  if (!m_isWatched) delete std::exchange(m_rest, nullptr);
}

// --- The calculation that runs

struct Calculation::InputSet : std::unordered_set<DGNode const*> {};

Calculation::Calculation(GraphState& state, DGNode const* node)
    : m_node(node), m_state(state), m_outer(std::exchange(state.m_calculation, this)) {
  if (node) node->m_isCalculating = true;
}
Calculation::~Calculation() {
  if (m_node) m_node->m_isCalculating = false;
  m_state.m_calculation = m_outer;
  delete m_inputs;
}

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
    GraphState::Timing timing(GraphState::Get(), node);
    bool isChanged;
    try {
      isChanged = node.CalculateOutput();
      timing.Succeed();
    } catch (...) {
      GraphState::Get().Invalidate(node, true);
      throw;
    }
    if (isChanged) GraphState::Change(node);
  }
  return count;
}

}  // namespace vesk
