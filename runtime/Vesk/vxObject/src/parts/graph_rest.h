// What few outermost reads need: errors, values that are to be calculated again, further stacks.
// It lives until the read ends: to clear a table of hashes takes the time of the most that was ever in it. While a
// GraphWatch lives, it stays; that it is there is what a calculation looks at, watched or not.

@import "Vesk/vxObject/GraphWatch.h"
@import "Vesk/vxObject/CalculationStack.h"

#include <chrono>
#include <exception>
#include <unordered_map>

namespace vesk {

// What the watches of a thread know.
struct WatchedNodes {
  struct Node {
    uint64 m_number = 0;  // 0 unless somebody asked for it
    CalculationTimes m_times;
  };
  void OnDestroy(DGNode const& node) {
    const auto at = m_nodes.find(&node);
    if (at == m_nodes.end()) return;
    m_byNumber.erase(at->second.m_number);
    m_nodes.erase(at);
  }
  std::unordered_map<DGNode const*, Node> m_nodes;
  std::unordered_map<uint64, DGNode const*> m_byNumber;
  int64 m_within = 0;  // what calculations have taken within the one that runs
  ssize_t m_watches = 0;
};

struct GraphState::Rest {
  void OnDestroy(DGNode const& node);
  void RethrowErrorOf(DGNode const& node) const {
    if (m_failed.empty()) return;
    const auto failed = m_failed.find(&node);
    if (failed != m_failed.end()) std::rethrow_exception(failed->second.m_error);
  }
  CalculationStack m_otherStacks[4];
  // Of either table, as the compiler takes a while over each kind.
  struct Left {
    std::exception_ptr m_error;
    bool m_isHard = false;
  };
  std::unordered_map<DGNode const*, Left> m_failed;
  std::unordered_map<DGNode const*, Left> m_again;  // dirty when the read ends
  std::shared_ptr<WatchedNodes> m_watched;          // null without a watch
};

// A calculation, while it lives. Does nothing without a watch.
struct GraphState::Timing {
  Timing(GraphState& state, DGNode const& node) : m_state(state), m_node(node) {
    if (state.m_isWatched) Begin();
  }
  ~Timing() {
    if (m_watched) End();
  }
  void Succeed() { m_isDone = true; }

 private:
  void Begin();
  void End();

  GraphState& m_state;
  DGNode const& m_node;
  std::shared_ptr<WatchedNodes> m_watched;
  std::chrono::steady_clock::time_point m_begin;
  int64 m_withinOuter = 0;
  bool m_isDone = false;
};

}  // namespace vesk
