// Graphs as they are shown. What generated text named a node after is in the name of its type:
// "kinds::Cell::Depnode_twice", "kinds::Counted<vesk::IObjectBaseMixin<kinds::Cell, vesk::EmptyBase> >::Depnode_more".

@import "Vesk/vxObject/ValueTypes.h"
@import "Vesk/vxObject/views/limit_text.h"

#include <cstdlib>
#include <cstring>
#include <set>
#include <typeindex>
#include <unordered_set>
#if defined(__GNUC__)
#include <cxxabi.h>
#endif

namespace vesk {

inline namespace views {

inline xstring TypeNameOf(DGNode const& node) {
  xstring name = typeid(node).name();
#if defined(__GNUC__)
  int status;
  if (char* const plain = abi::__cxa_demangle(name.c_str(), nullptr, nullptr, &status)) {
    name = plain;
    std::free(plain);
  }
#else
  if (name.rfind("struct ", 0) == 0) name.erase(0, 7);
#endif
  return name;
}

// The class that a node is declared in; that of the mixin's object for one in a mixin.
inline xstring FindClassName(xstring const& type) {
  const std::size_t end = type.rfind("::");
  if (end == xstring::npos) return xstring();
  const xstring name = type.substr(0, end);
  constexpr std::string_view base = "BaseMixin<";
  const std::size_t at = name.rfind(base);
  if (at == xstring::npos) return name;
  const std::size_t begin = at + base.size();
  return name.substr(begin, name.find(',', begin) - begin);
}

class NodeTypes {
 public:
  struct Type {
    xstring m_class;
    bool m_isCache;
  };
  Type const& Of(DGNode const& node) {
    const auto [at, isNew] = m_types.try_emplace(typeid(node));
    if (isNew) {
      const xstring name = TypeNameOf(node);
      at->second = {FindClassName(name), name.find("::_depnode_") != xstring::npos};
    }
    return at->second;
  }

 private:
  std::unordered_map<std::type_index, Type> m_types;
};

// "twice" of "Cell::twice".
inline xstring MemberName(xstring const& name) {
  const std::size_t at = name.find("::");
  return xstring(at == xstring::npos ? std::string(name) : name.substr(at + 2));
}

inline octet_t const* AddressOf(DGNode const& node) {
  return static_cast<octet_t const*>(dynamic_cast<void const*>(&node));
}

// The object is what a node visits last. A stale value may refer to what is gone: only one that is fresh is visited.
struct LastObject : IObjectVisitor {
  void VisitObject(ptr<IObject> const& object) override { m_object = object; }
  ptr<IObject> m_object;
};

inline void const* AskForOwner(DGNode const& node, ReflectedClass const& record) {
  if (GraphAccess::StateOf(node) != GS_FRESH || !GraphAccess::HasValue(node)) return nullptr;
  LastObject visitor;
  node.VisitContainingObject(visitor);
  const bool isOwner = visitor.m_object && visitor.m_object->GetReflectedClass() == &record;
  return isOwner ? visitor.m_object.Object() : nullptr;
}

template <typename Field>
Field const* FieldNamed(Field const* fields, ssize_t count, xstring const& name) {
  const auto at = std::find_if(fields, fields + count, [&name](Field const& field) { return field.m_name == name; });
  return at == fields + count ? nullptr : at;
}

inline bool IsShort(EValueKind kind) { return kind >= VK_BOOL && kind <= VK_ENUM; }

class Viewer {
 public:
  Viewer(GraphLimits const& limits, GraphWatch* watch) : m_limits(limits), m_watch(watch) {}

  GraphView View(xvector<DGNode const*> const& around) {
    for (DGNode const* node : around) Add(*node, 0);
    for (std::size_t i = 0; i < m_view.m_nodes.size(); ++i) Expand(i);
    for (std::size_t i = 0; i < m_view.m_nodes.size(); ++i) AddLinks(i);
    for (GraphNode& node : m_view.m_nodes) {
      if (node.m_kind == GN_FIELD) DescribeField(node);
    }
    return std::move(m_view);
  }

  GraphNode Describe(DGNode const& of) {
    GraphNode node;
    node.m_node = &of;
    node.m_inputs = GraphAccess::Inputs(of).size();
    node.m_dependents = GraphAccess::Dependents(of).size();
    node.m_state = GraphAccess::StateOf(of);
    node.m_hasValue = GraphAccess::HasValue(of);
    if (m_watch) {
      node.m_number = m_watch->NumberOf(of);
      node.m_times = m_watch->TimesOf(of);
    }
    GraphSource source;
    if (GraphAccess::DescribeSource(of, source)) {
      node.m_owner = source.m_object;
      node.m_hasValue = true;
    } else {
      DescribeMember(node);
    }
    return node;
  }

 private:
  void Add(DGNode const& node, ssize_t distance) {
    if (m_places.count(&node)) return;
    if (m_view.m_nodes.size() >= m_limits.m_nodes) {
      m_view.m_isPartial = true;
      return;
    }
    m_places[&node] = m_view.m_nodes.size();
    m_view.m_nodes.push_back(Describe(node));
    m_view.m_nodes.back().m_distance = distance;
  }

  void Expand(std::size_t i) {
    DGNode const& node = *m_view.m_nodes[i].m_node;
    const ssize_t distance = m_view.m_nodes[i].m_distance;
    if (distance <= 0 && -distance < m_limits.m_inputDepth) AddAll(GraphAccess::Inputs(node), distance - 1);
    if (distance >= 0 && distance < m_limits.m_dependentDepth) AddAll(GraphAccess::Dependents(node), distance + 1);
  }
  void AddAll(DGLinks const& links, ssize_t distance) {
    const std::size_t count = std::min(links.size(), m_limits.m_breadth);
    if (count < links.size()) m_view.m_isPartial = true;
    for (std::size_t i = 0; i < count; ++i) Add(*links.begin()[i].m_node, distance);
  }

  // From both ends, as either may have more neighbours than are looked at.
  void AddLinks(std::size_t i) {
    DGNode const& node = *m_view.m_nodes[i].m_node;
    AddLinksOf(GraphAccess::Inputs(node), [&](std::size_t other) { AddLink(other, i); });
    AddLinksOf(GraphAccess::Dependents(node), [&](std::size_t other) { AddLink(i, other); });
  }
  template <typename Each>
  void AddLinksOf(DGLinks const& links, Each each) {
    const std::size_t count = std::min(links.size(), m_limits.m_breadth);
    for (std::size_t i = 0; i < count; ++i) {
      const auto other = m_places.find(links.begin()[i].m_node);
      if (other != m_places.end()) each(other->second);
    }
  }
  void AddLink(std::size_t from, std::size_t to) {
    if (m_linked.insert({from, to}).second) m_view.m_links.push_back({from, to});
  }

  void DescribeMember(GraphNode& node) {
    const xstring name = MemberName(node.m_node->Name());
    node.m_name = LimitText(name, m_limits.m_text);
    node.m_class = m_nodeTypes.Of(*node.m_node).m_class;
    ReflectedClass const* const record = Find<ReflectedClass>(node.m_class);
    if (DGIndepNode const* indep = dynamic_cast<DGIndepNode const*>(node.m_node)) {
      node.m_kind = GN_INDEP;
      node.m_state = GS_FRESH;
      node.m_hasValue = true;
      node.m_times = CalculationTimes();
      if (record) DescribeIndep(node, *record, name, const_cast<DGIndepNode&>(*indep));
    } else if (dynamic_cast<DGAsyncNode const*>(node.m_node)) {
      node.m_kind = GN_ASYNC;
    } else {
      node.m_kind = !name.empty() && name.back() == ')' ? GN_CACHE : GN_DEP;
    }
    if (node.m_kind == GN_DEP && record) DescribeDep(node, *record, name);
    if (!node.m_owner && record) node.m_owner = AskForOwner(*node.m_node, *record);
    if (node.m_owner && record) m_owners[node.m_owner] = record;
  }
  void DescribeDep(GraphNode& node, ReflectedClass const& record, xstring const& name) {
    ReflectedDepField const* const field = FieldNamed(record.m_depFields, record.m_numDepFields, name);
    if (!field) return;
    octet_t const* const owner = AddressOf(*node.m_node) - field->m_nodeOffset;
    node.m_owner = owner;
    if (!field->m_type || !node.m_hasValue) return;
    node.m_value = TextOf(record, field->m_type, [&](ValueType const&) { return owner + field->m_valueOffset; });
  }
  void DescribeIndep(GraphNode& node, ReflectedClass const& record, xstring const& name, DGIndepNode& indep) {
    ReflectedField const* const field = FieldNamed(record.m_fields, record.m_numFields, name);
    if (!field) return;
    node.m_owner = AddressOf(indep) - field->m_offset;
    node.m_value = TextOf(record, field->m_type, [&](ValueType const& type) {
      return static_cast<octet_t const*>(ValueBeforeNode(indep, type));
    });
  }
  template <typename Locate>
  xstring TextOf(ReflectedClass const& record, octet_t const* code, Locate locate) {
    const ReflectedType type = DecodeType({code, record.m_strings});
    ValueType const& resolved = m_types.Of(type);
    if (!IsShort(resolved.m_kind)) return xstring();
    octet_t const* const address = locate(resolved);
    if (!address) return xstring();
    return LimitText(Value(type, const_cast<octet_t*>(address)).Text(), m_limits.m_text);
  }

  // Of an object whose other nodes are shown, which tell its class.
  void DescribeField(GraphNode& node) {
    GraphSource source;
    GraphAccess::DescribeSource(*node.m_node, source);
    const auto owner = m_owners.find(node.m_owner);
    ReflectedClass const* const record = owner == m_owners.end() ? nullptr : owner->second;
    xstring name = source.m_name;
    if (name.empty()) {
      name = record ? PathText(*record, source.m_path) : xstring();
    } else {
      constexpr std::string_view model = "_model_.";
      const std::size_t at = name.find(model);
      node.m_class = name.substr(0, name.find("::"));
      name = at == xstring::npos ? MemberName(name) : name.substr(at + model.size());
    }
    node.m_name = LimitText(name, m_limits.m_text);
    if (!record) return;
    node.m_class = record->m_name;
    try {
      const Value value = Value(*record, const_cast<void*>(node.m_owner)).Find(name);
      if (!name.empty() && IsShort(value.Kind())) node.m_value = LimitText(value.Text(), m_limits.m_text);
    } catch (AccessError const&) {  // in a container that cannot be walked
    }
  }

  GraphLimits const& m_limits;
  GraphWatch* m_watch;
  ValueTypes m_types;
  NodeTypes m_nodeTypes;
  GraphView m_view;
  std::unordered_map<DGNode const*, std::size_t> m_places;
  std::set<std::pair<std::size_t, std::size_t>> m_linked;
  std::unordered_map<void const*, ReflectedClass const*> m_owners;
};

inline xvector<DGNode const*> PartOf(DGLinks const& links, std::size_t first, std::size_t count) {
  xvector<DGNode const*> nodes;
  for (std::size_t i = first; i < links.size() && i - first < count; ++i) nodes.push_back(links.begin()[i].m_node);
  return nodes;
}

}  // namespace views

inline GraphView ViewGraph(xvector<DGNode const*> const& around, GraphLimits const& limits, GraphWatch* watch) {
  return Viewer(limits, watch).View(around);
}

inline xvector<DGNode const*> InputsOf(DGNode const& node, std::size_t first, std::size_t count) {
  return PartOf(GraphAccess::Inputs(node), first, count);
}
inline xvector<DGNode const*> DependentsOf(DGNode const& node, std::size_t first, std::size_t count) {
  return PartOf(GraphAccess::Dependents(node), first, count);
}

// Functions have no place in the record: they are found among the nodes that have a value. One that has keys is not
// in the object, but tells it.
inline void AddCaches(ReflectedClass const& record, void const* object, std::size_t most,
                      xvector<DGNode const*>& nodes) {
  NodeTypes types;
  const std::unordered_set<DGNode const*> known(nodes.begin(), nodes.end());
  octet_t const* const begin = static_cast<octet_t const*>(object);
  GraphAccess::EachWithValue([&](DGNode const& node) {
    octet_t const* const at = AddressOf(node);
    const bool isInside = begin <= at && at < begin + record.m_size;
    NodeTypes::Type const& type = types.Of(node);
    const bool isOurs =
        isInside || (type.m_isCache && type.m_class == record.m_name && AskForOwner(node, record) == object);
    if (isOurs && known.count(&node) == 0) nodes.push_back(&node);
    return nodes.size() < most;
  });
}

inline xvector<DGNode const*> NodesOf(ReflectedClass const& record, void const* object, std::size_t most) {
  xvector<DGNode const*> nodes;
  octet_t* const begin = static_cast<octet_t*>(const_cast<void*>(object));
  for (ssize_t i = 0; i < record.m_numFields && nodes.size() < most; ++i) {
    ReflectedField const& field = record.m_fields[i];
    DGIndepNode const* node = IndepNodeAt(record, begin, {field.m_name, field.m_offset, nullptr});
    if (node) nodes.push_back(node);
  }
  for (ssize_t i = 0; i < record.m_numDepFields && nodes.size() < most; ++i) {
    void* const at = begin + record.m_depFields[i].m_nodeOffset;
    nodes.push_back(static_cast<DGDepNode const*>(at));
  }
  if (nodes.size() < most) AddCaches(record, object, most, nodes);
  return nodes;
}

inline DGNode const* FindNode(ReflectedClass const& record, void const* object, std::string_view name) {
  for (DGNode const* node : NodesOf(record, object)) {
    if (MemberName(node->Name()) == name) return node;
  }
  return nullptr;
}

}  // namespace vesk
