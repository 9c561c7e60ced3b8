// What few outermost reads need: errors, values that are to be calculated again, further stacks.
// It lives until the read ends: to clear a table of hashes takes the time of the most that was ever in it.

@import "Vesk/vxObject/Graph.h"
@import "Vesk/vxObject/CalculationStack.h"

#include <exception>
#include <unordered_map>

namespace vesk {

struct GraphState::Rest {
  void OnDestroy(DGNode const& node) {
    m_again.erase(&node);
    m_failed.erase(&node);
  }
  void RethrowErrorOf(DGNode const& node) const {
    if (m_failed.empty()) return;
    const auto failed = m_failed.find(&node);
    if (failed != m_failed.end()) std::rethrow_exception(failed->second);
  }
  CalculationStack m_otherStacks[4];
  std::unordered_map<DGNode const*, std::exception_ptr> m_failed;
  std::unordered_map<DGNode const*, bool> m_again;  // dirty when the read ends, and whether hard
};

}  // namespace vesk
