// Counts and times of calculations, and what a graph tells of its nodes.

@import "Vesk/vxObject/src/parts/graph.h"

namespace vesk {

void GraphState::Rest::OnDestroy(DGNode const& node) {
  m_again.erase(&node);
  m_failed.erase(&node);
  if (m_watched) m_watched->OnDestroy(node);
}

// --- Counts and times

void GraphState::Timing::Begin() {
  m_watched = m_state.m_rest->m_watched;
  m_withinOuter = std::exchange(m_watched->m_within, 0);
  m_begin = std::chrono::steady_clock::now();
}

// A calculation that is begun again further out took its time, but gave nothing; that of an async node within a read
// only queues another one.
void GraphState::Timing::End() {
  const int64 time = std::chrono::nanoseconds(std::chrono::steady_clock::now() - m_begin).count();
  const int64 own = time - m_watched->m_within;
  m_watched->m_within = m_withinOuter + time;
  const bool isQueued = m_state.m_isEvaluating && dynamic_cast<DGAsyncNode const*>(&m_node);
  try {
    CalculationTimes& times = m_watched->m_nodes[&m_node].m_times;
    times.m_total += time;
    times.m_own += own;
    if (isQueued || (!m_isDone && m_state.m_deep)) return;
    ++(m_isDone ? times.m_count : times.m_failed);
    times.m_last = time;
    times.m_longest = std::max(times.m_longest, time);
  } catch (std::bad_alloc const&) {
  }
}

GraphWatch::GraphWatch() : m_state(GraphState::Get()) {
  auto& watched = m_state.NeedRest().m_watched;
  if (!watched) watched = std::make_shared<WatchedNodes>();
  ++watched->m_watches;
  m_state.m_isWatched = true;
  m_state.Use();
}

// A read that is on its way, or tells of its end, deletes the rest itself.
GraphWatch::~GraphWatch() {
  GraphState::Rest*& rest = m_state.m_rest;
  if (--rest->m_watched->m_watches == 0) {
    rest->m_watched.reset();
    m_state.m_isWatched = false;
    if (!m_state.m_isEvaluating && rest->m_again.empty()) delete std::exchange(rest, nullptr);
  }
  m_state.Release();
}

static WatchedNodes::Node const* FindWatched(WatchedNodes const& watched, DGNode const& node) {
  const auto at = watched.m_nodes.find(&node);
  return at == watched.m_nodes.end() ? nullptr : &at->second;
}

CalculationTimes GraphWatch::TimesOf(DGNode const& node) const {
  WatchedNodes::Node const* watched = FindWatched(*m_state.m_rest->m_watched, node);
  return watched ? watched->m_times : CalculationTimes();
}

void GraphWatch::BeginAnew() {
  auto& nodes = m_state.m_rest->m_watched->m_nodes;
  for (auto at = nodes.begin(); at != nodes.end();) {
    at->second.m_times = CalculationTimes();
    at = at->second.m_number == 0 ? nodes.erase(at) : std::next(at);
  }
}

uint64 GraphWatch::NumberOf(DGNode const& node) {
  static thread_local uint64 s_last = 0;
  WatchedNodes& watched = *m_state.m_rest->m_watched;
  WatchedNodes::Node& known = watched.m_nodes[&node];
  if (known.m_number == 0) {
    watched.m_byNumber.insert({s_last + 1, &node});
    known.m_number = ++s_last;
  }
  return known.m_number;
}

DGNode const* GraphWatch::Find(uint64 number) const {
  auto const& nodes = m_state.m_rest->m_watched->m_byNumber;
  const auto at = nodes.find(number);
  return at == nodes.end() ? nullptr : at->second;
}

// --- What a graph tells

DGLinks const& GraphAccess::Inputs(DGNode const& node) { return node.m_inputs; }
DGLinks const& GraphAccess::Dependents(DGNode const& node) { return node.m_dependents; }

EGraphState GraphAccess::StateOf(DGNode const& node) {
  if (node.m_isCalculating) return GS_RUNNING;
  return node.m_state == ENodeState::Clean ? GS_FRESH : node.m_state == ENodeState::Soft ? GS_UNSURE : GS_STALE;
}

bool GraphAccess::HasValue(DGNode const& node) { return !node.m_isEmpty; }

void GraphAccess::EachWithValue(std::function<bool(DGNode const&)> const& each) {
  GraphState const* state = GraphState::Peek();
  if (!state) return;
  for (EvictionQueue const& queue : state->m_queues) {
    for (DGPlace const* at = queue.m_nodes.First(); at != queue.m_nodes.End(); at = at->m_next) {
      if (!each(*static_cast<DGNode const*>(static_cast<DGQueuePlace const*>(at)))) return;
    }
  }
}

}  // namespace vesk
