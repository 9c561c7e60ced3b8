// The dependency graph as who looks into a program sees it: of a node what it belongs to, what it reads and what reads
// it, whether it is stale, and, while a GraphWatch lives, how often it was calculated and how long that took. Looking
// calculates nothing, evicts nothing and makes nothing dirty.
//
// A graph is looked at on the thread that it belongs to, and in parts: a view holds so many nodes, and of each so many
// neighbours. A view is true until the graph changes. Who keeps a node for longer keeps its number in a GraphWatch,
// which is told when a node goes.

@import "Vesk/vxObject/Access.h"
@import "Vesk/vxObject/GraphWatch.h"

namespace vesk {

// --- Nodes

enum EGraphNode {
  GN_DEP,    // `$dep`
  GN_INDEP,  // `$indep`
  GN_CACHE,  // `$cache`, of a key if it has keys
  GN_ASYNC,  // the same, calculated later
  GN_FIELD   // of a model, as long as a calculation has read it
};

struct GraphNode {
  DGNode const* m_node = nullptr;
  uint64 m_number = 0;  // where the view was asked for with a watch
  EGraphNode m_kind = GN_FIELD;
  EGraphState m_state = GS_FRESH;
  xstring m_class;                // "kinds::Cell", empty where it is not known
  xstring m_name;                 // "twice", "plus(3)", "lines[2].amount"
  void const* m_owner = nullptr;  // the object, null where it is not known
  xstring m_value;                // of `$dep` and `$indep` fields that hold a scalar, a text or an enumeration
  bool m_hasValue = false;        // false ahead of the first calculation, and once evicted
  std::size_t m_inputs = 0;       // how many there are, shown or not
  std::size_t m_dependents = 0;
  ssize_t m_distance = 0;  // from what was asked for: below 0 for what it reads, above for what reads it
  CalculationTimes m_times;
};

// The positions of two nodes of a view: `m_to` reads `m_from`.
struct GraphLink {
  std::size_t m_from;
  std::size_t m_to;
};

struct GraphView {
  xvector<GraphNode> m_nodes;  // those that were asked for first
  xvector<GraphLink> m_links;
  bool m_isPartial = false;  // something is left out, other than for its distance
};

struct GraphLimits {
  ssize_t m_inputDepth = 3;
  ssize_t m_dependentDepth = 3;
  std::size_t m_breadth = 50;  // neighbours of a node on each side
  std::size_t m_nodes = 300;
  std::size_t m_text = 80;  // bytes of a value or a key
};

GraphView ViewGraph(xvector<DGNode const*> const& around, GraphLimits const& limits = GraphLimits(),
                    GraphWatch* watch = nullptr);

// Neighbours `first` to `first + count` of a node, as far as there are any.
xvector<DGNode const*> InputsOf(DGNode const& node, std::size_t first, std::size_t count);
xvector<DGNode const*> DependentsOf(DGNode const& node, std::size_t first, std::size_t count);

// The nodes of an object: its reflected `$dep` and `$indep` fields, then, as far as they have a value, those that are
// not in its record: of mixins, and of `$cache` functions; of one with keys those that are fresh. At most `most` of
// them.
xvector<DGNode const*> NodesOf(ReflectedClass const& record, void const* object, std::size_t most = 1000);

// By the name that GraphNode has; null when there is none.
DGNode const* FindNode(ReflectedClass const& record, void const* object, std::string_view name);

}  // namespace vesk

// What stands above is defined here: a program that looks into no graph does not compile it.
@import "Vesk/vxObject/views/graph_view.h"
