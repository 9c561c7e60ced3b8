// The dependency graph around a value, for the page: what it reads, what reads it, what is stale, and since the page
// looks how often each was calculated and how long that took. Looking calculates nothing.

@import "Vesk/vxObject/GraphView.h"
@import "Vesk/vxObject/InspectorTree.h"

namespace vesk {

class InspectorGraph {
 public:
  explicit InspectorGraph(InspectorTree const& tree) : m_tree(tree) {}

  // Calculations are counted from the first question on, until nobody looks any more.
  void Forget() { m_watch.reset(); }

  // Whether there is something to put.
  bool IsIn(InspectorJson const& path, InspectorPlace const& place) const { return !Around(path, place).empty(); }

  // Around the node with a number, else around the value at a path: its node, or those of the object that it is.
  void Put(InspectorWriter& out, InspectorJson const& path, uint64 number, ssize_t depth) {
    if (!m_watch) m_watch = std::make_unique<GraphWatch>();
    GraphLimits limits;
    limits.m_inputDepth = limits.m_dependentDepth = std::min<ssize_t>(std::max<ssize_t>(depth, 1), 8);
    limits.m_breadth = 12;
    limits.m_nodes = 120;
    const xvector<DGNode const*> around = number > 0 ? Numbered(number) : At(path);
    const GraphView view = ViewGraph(around, limits, m_watch.get());
    out.Member("around", around.size()).Member("partial", view.m_isPartial).Name("nodes").Open('[');
    for (GraphNode const& node : view.m_nodes) PutNode(out, node);
    out.Close(']').Name("links").Open('[');
    for (GraphLink const& link : view.m_links) out.Open('[').Put(link.m_from).Put(link.m_to).Close(']');
    out.Close(']');
  }

 private:
  static constexpr std::size_t kMostNodes = 40;  // of an object

  xvector<DGNode const*> Numbered(uint64 number) const {
    DGNode const* const node = m_watch->Find(number);
    if (!node) throw InspectorError("the node is gone");
    return {node};
  }
  xvector<DGNode const*> At(InspectorJson const& path) const {
    const xvector<DGNode const*> nodes = Around(path, m_tree.Find(path));
    if (nodes.empty()) throw InspectorError("it is in no dependency graph: nothing that is calculated has read it");
    return nodes;
  }
  xvector<DGNode const*> Around(InspectorJson const& path, InspectorPlace const& place) const {
    if (place.m_node) return {place.m_node};
    const Value object = ObjectOf(place);
    if (object) return NodesOf(*object.Class(), object.Address(), kMostNodes);
    if (path.m_items.size() < 2) return {};
    InspectorJson outer = path;
    outer.m_items.pop_back();
    const Value owner = ObjectOf(m_tree.Find(outer));
    DGNode const* const node = owner ? FindNode(*owner.Class(), owner.Address(), place.m_name) : nullptr;
    return node ? xvector<DGNode const*>{node} : xvector<DGNode const*>();
  }
  // Empty for what is no object of the program.
  static Value ObjectOf(InspectorPlace const& place) {
    const InspectorPlace opened = InspectorTree::Opened(place);
    return opened.m_value.Kind() == VK_CLASS && !opened.m_isFixed ? opened.m_value : Value();
  }

  static void PutNode(InspectorWriter& out, GraphNode const& node) {
    constexpr ConstStringZ kKinds[] = {"$dep", "$indep", "$cache", "async $cache", "field"};
    constexpr ConstStringZ kStates[] = {"fresh", "unsure", "stale", "running"};
    out.Open('{').Member("node", node.m_number).Member("kind", kKinds[node.m_kind]);
    out.Member("state", kStates[node.m_state]).Member("class", node.m_class).Member("name", node.m_name);
    if (!node.m_value.empty()) out.Member("text", node.m_value);
    if (!node.m_hasValue) out.Member("empty", true);
    out.Member("inputs", node.m_inputs).Member("dependents", node.m_dependents).Member("at", node.m_distance);
    CalculationTimes const& times = node.m_times;
    out.Member("count", times.m_count).Member("failed", times.m_failed).Member("total", times.m_total);
    out.Member("own", times.m_own).Member("last", times.m_last).Member("longest", times.m_longest).Close('}');
  }

  InspectorTree const& m_tree;
  std::unique_ptr<GraphWatch> m_watch;
};

}  // namespace vesk
