// How often the nodes of a thread's dependency graphs were calculated, and how long that took; and what only the graph
// itself can tell of a node. GraphView.h shows it.

@import "Vesk/vxObject/Graph.h"
@import "Vesk/vxObject/Path.h"

#include <functional>

namespace vesk {

// --- Counts and times

// Times are nanoseconds.
struct CalculationTimes {
  uint64 m_count = 0;   // that gave a value
  uint64 m_failed = 0;  // that threw
  int64 m_total = 0;    // with what was calculated meanwhile
  int64 m_own = 0;      // without
  int64 m_last = 0;     // of the last one, with
  int64 m_longest = 0;
};

// While one lives, the calculations of its thread are counted and timed, and nodes have numbers. Without one nothing is
// kept, and a calculation takes no longer. Several on a thread share what they know; it must end on its thread.
class GraphWatch {
 public:
  GraphWatch();
  ~GraphWatch();
  GraphWatch(GraphWatch const&) = delete;
  void operator=(GraphWatch const&) = delete;

  // Since there is a watch, or since it was last told to begin anew.
  CalculationTimes TimesOf(DGNode const& node) const;
  void BeginAnew();

  // A number from 1, which no other node has before or after; null for a node that is gone.
  uint64 NumberOf(DGNode const& node);
  DGNode const* Find(uint64 number) const;

 private:
  GraphState& m_state;
};

// --- What the graph tells of a node, for the library

enum EGraphState {
  GS_FRESH,
  GS_UNSURE,  // something before it has changed: the next read looks whether that matters
  GS_STALE,   // the next read calculates
  GS_RUNNING  // is being calculated
};

struct GraphSource {
  void const* m_object = nullptr;
  xstring m_name;  // of a field that is known by its memory
  Path m_path;     // of any other
};

// What only the graph itself can tell.
struct GraphAccess {
  static DGLinks const& Inputs(DGNode const& node);
  static DGLinks const& Dependents(DGNode const& node);
  static EGraphState StateOf(DGNode const& node);
  static bool HasValue(DGNode const& node);
  // Nodes of this thread that have a value, until `each` answers false.
  static void EachWithValue(std::function<bool(DGNode const&)> const& each);
  // Whether the node is a field of a model.
  static bool DescribeSource(DGNode const& node, GraphSource& source);
};

}  // namespace vesk
