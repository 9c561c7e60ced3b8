// The difference of two archives.

@import "Vesk/vxObject/views/archive_view.h"

namespace vesk {

inline namespace views {

// Which elements of two lists are the same: pairs of positions that ascend on both sides.
typedef xvector<std::pair<std::size_t, std::size_t>> Matches;

// Of the longest common subsequence; where that would take too long, of what both begin and end with.
template <typename IsSame>
Matches MatchElements(std::size_t countA, std::size_t countB, IsSame isSame) {
  Matches matches;
  std::size_t begin = 0, endA = countA, endB = countB;
  for (; begin < endA && begin < endB && isSame(begin, begin); ++begin) matches.push_back({begin, begin});
  while (endA > begin && endB > begin && isSame(endA - 1, endB - 1)) --endA, --endB;
  const std::size_t a = endA - begin, b = endB - begin;
  constexpr std::size_t kMostCells = 4000000;
  if (a > 0 && b > 0 && a <= kMostCells / b) {
    // How many elements the rests from here on have in common.
    xvector<uint32> common((a + 1) * (b + 1));
    const auto at = [&](std::size_t i, std::size_t j) -> uint32& { return common[i * (b + 1) + j]; };
    for (std::size_t i = a; i-- > 0;) {
      for (std::size_t j = b; j-- > 0;) {
        at(i, j) = isSame(begin + i, begin + j) ? at(i + 1, j + 1) + 1 : std::max(at(i + 1, j), at(i, j + 1));
      }
    }
    for (std::size_t i = 0, j = 0; i < a && j < b;) {
      if (isSame(begin + i, begin + j)) {
        matches.push_back({begin + i++, begin + j++});
      } else {
        at(i + 1, j) >= at(i, j + 1) ? ++i : ++j;
      }
    }
  }
  for (; endA < countA; ++endA, ++endB) matches.push_back({endA, endB});
  return matches;
}

struct Side {
  explicit Side(ArchiveView::Content const& content) : m_content(content), m_nodes(content.m_nodes) {
    m_references.reserve(m_nodes.size() + 1);
    uint32 count = 0;
    for (ArchiveNode const& node : m_nodes) {
      m_references.push_back(count);
      count += node.m_kind == AP_REFERENCE;
    }
    m_references.push_back(count);
  }
  std::string_view Bytes(uint32 node) const {
    ArchiveNode const& of = m_nodes[node];
    return {reinterpret_cast<char const*>(m_content.BytesOf(of)), of.m_size};
  }
  bool HasReferences(uint32 node) const { return m_references[m_nodes[node].m_end] > m_references[node]; }

  ArchiveView::Content const& m_content;
  xvector<ArchiveNode> const& m_nodes;
  xvector<uint32> m_references;                   // ahead of each node
  std::unordered_map<uint32, uint32> m_partners;  // of objects, on the other side
};

class Comparer {
 public:
  Comparer(ArchiveView::Content const& a, ArchiveView::Content const& b)
      : m_old(a), m_new(b), m_most(b.m_options.m_changes) {}

  // Both begin with a value, or with a reference to an object.
  bool AreAlike() const {
    auto const& a = m_old.m_content;
    auto const& b = m_new.m_content;
    return !a.m_type == !b.m_type &&
           (a.m_type ? a.m_nodes.empty() == b.m_nodes.empty() : a.m_objects.empty() == b.m_objects.empty());
  }

  xvector<ArchiveChange> Compare() {
    if (m_old.m_content.m_type) {
      if (!m_old.m_nodes.empty()) Pair(0, 0);
    } else {
      PairObjects(1, 1);
    }
    for (std::size_t i = 0; i < m_pairs.size(); ++i) {
      const uint32 a = NodeOf(m_old, m_pairs[i].first), b = NodeOf(m_new, m_pairs[i].second);
      if (a != kNoNode && b != kNoNode) Pair(a, b);
    }
    return std::move(m_changes);
  }

 private:
  static uint32 NodeOf(Side const& side, uint32 object) {
    auto const& objects = side.m_content.m_objects;
    const uint32 node = object <= objects.size() ? objects[object - 1].m_node : kNoNode;
    return node < side.m_nodes.size() && side.m_nodes[node].m_step == EPathStep::Object ? node : kNoNode;
  }

  // Whether both may be the same object.
  bool PairObjects(uint32 a, uint32 b) {
    const auto [at, isNew] = m_old.m_partners.insert({a, b});
    if (!isNew) return at->second == b;
    if (!m_new.m_partners.insert({b, a}).second) {
      m_old.m_partners.erase(at);
      return false;
    }
    m_pairs.push_back({a, b});
    return true;
  }

  void Add(ArchiveChange::EKind kind, uint32 a, uint32 b, xstring const& suffix, xstring const& textA,
           xstring const& textB) {
    if (m_changes.size() >= m_most) return;
    Side const& shown = kind == ArchiveChange::Removed ? m_old : m_new;
    const uint32 node = kind == ArchiveChange::Removed ? a : b;
    ValueType const* const type = shown.m_nodes[node].m_type;
    m_changes.push_back(
        {kind, ArchivePathText(shown.m_content, node) + suffix, type ? type->m_text : xstring(), textA, textB});
  }
  void AddChanged(uint32 a, uint32 b) {
    Add(ArchiveChange::Changed, a, b, "", ArchiveShortText(m_old.m_content, a), ArchiveShortText(m_new.m_content, b));
  }
  void AddRemoved(uint32 a) {
    Add(ArchiveChange::Removed, a, kNoNode, "", ArchiveShortText(m_old.m_content, ArchiveValueIn(m_old.m_nodes, a)),
        "");
  }
  void AddAdded(uint32 b) {
    Add(ArchiveChange::Added, kNoNode, b, "", "", ArchiveShortText(m_new.m_content, ArchiveValueIn(m_new.m_nodes, b)));
  }

  bool IsSame(uint32 a, uint32 b) const { return m_old.Bytes(a) == m_new.Bytes(b); }

  void Pair(uint32 a, uint32 b) {
    ArchiveNode const& x = m_old.m_nodes[a];
    ArchiveNode const& y = m_new.m_nodes[b];
    if (m_changes.size() >= m_most) return;
    if (x.m_kind != y.m_kind || (x.m_type ? x.m_type->m_text : "") != (y.m_type ? y.m_type->m_text : "")) {
      return AddChanged(a, b);
    }
    if (x.m_kind == AP_REFERENCE) {
      const bool isSame = x.m_detail && y.m_detail ? PairObjects(x.m_detail, y.m_detail) : x.m_detail == y.m_detail;
      if (!isSame) AddChanged(a, b);
      return;
    }
    if (IsSame(a, b) && !m_old.HasReferences(a) && !m_new.HasReferences(b)) return;
    if (x.m_kind != AP_GROUP) return AddChanged(a, b);
    PairInside(a, b, x.m_type ? x.m_type->m_kind : VK_NONE);
  }

  void PairInside(uint32 a, uint32 b, EValueKind kind) {
    if (kind == VK_LIST) return PairElements(a, b);
    if (kind == VK_SET || kind == VK_MAP) return PairEntries(a, b);
    if (kind == VK_CLASS) return PairFields(a, b);
    // A variant: its tag or type, then its value.
    const xvector<uint32> x = ChildrenOf(m_old, a), y = ChildrenOf(m_new, b);
    if (x.size() != y.size() || x.empty() || !IsSame(x[0], y[0])) return AddChanged(a, b);
    for (std::size_t i = 1; i < x.size(); ++i) Pair(x[i], y[i]);
  }
  static xvector<uint32> ChildrenOf(Side const& side, uint32 group) {
    xvector<uint32> children;
    EachArchiveChild(side.m_nodes, group, [&](uint32 child) { children.push_back(child); });
    return children;
  }

  // --- Fields

  typedef xvector<std::pair<std::string_view, uint32>> Fields;
  static Fields FieldsOf(Side const& side, uint32 group) {
    Fields fields;
    EachArchiveChild(side.m_nodes, group, [&](uint32 child) {
      ArchiveNode const& node = side.m_nodes[child];
      if (node.m_step == EPathStep::Field && node.m_kind != AP_NAME) fields.push_back({node.m_label, child});
      if (node.m_kind == AP_BYTES) fields.push_back({"", child});
    });
    return fields;
  }
  void PairFields(uint32 a, uint32 b) {
    const Fields x = FieldsOf(m_old, a), y = FieldsOf(m_new, b);
    std::map<std::string_view, uint32> others(y.begin(), y.end());  // without a partner
    for (auto const& [name, node] : x) {
      const auto other = others.find(name);
      if (other != others.end()) {
        Pair(node, other->second);
        others.erase(other);
      } else if (!IsCutOff(m_new.m_nodes, b)) {
        AddRemoved(node);
      }
    }
    for (auto const& [name, node] : y) {
      if (others.count(name) > 0 && !IsCutOff(m_old.m_nodes, a)) AddAdded(node);
    }
  }

  // --- Lists

  static xvector<uint32> ElementsOf(Side const& side, uint32 group) {
    xvector<uint32> elements;
    EachArchiveChild(side.m_nodes, group, [&](uint32 child) {
      // A new object's class stands behind the reference.
      const EPathStep step = side.m_nodes[child].m_step;
      const bool isElement = step == EPathStep::Element || step == EPathStep::Entry;
      if (isElement && side.m_nodes[child].m_kind != AP_NAME) elements.push_back(child);
    });
    return elements;
  }
  void PairElements(uint32 a, uint32 b) {
    const xvector<uint32> x = ElementsOf(m_old, a), y = ElementsOf(m_new, b);
    const bool isBlock = (!x.empty() && m_old.m_nodes[x[0]].m_isBlock) || (!y.empty() && m_new.m_nodes[y[0]].m_isBlock);
    if (isBlock) return PairBlocks(x.empty() ? kNoNode : x[0], y.empty() ? kNoNode : y[0]);
    const Matches matches =
        MatchElements(x.size(), y.size(), [&](std::size_t i, std::size_t j) { return IsSame(x[i], y[j]); });
    EachMatch(
        matches, x.size(), y.size(), [&](std::size_t i, std::size_t j) { Pair(x[i], y[j]); },
        [&](std::size_t i) { AddRemoved(x[i]); }, [&](std::size_t j) { AddAdded(y[j]); });
  }
  // Elements between those that are the same are paired as far as there are as many on both sides.
  template <typename Both, typename Old, typename New>
  static void EachMatch(Matches matches, std::size_t countA, std::size_t countB, Both both, Old removed, New added) {
    matches.push_back({countA, countB});
    std::size_t i = 0, j = 0;
    for (auto const& [endA, endB] : matches) {
      while (i < endA && j < endB) both(i++, j++);
      while (i < endA) removed(i++);
      while (j < endB) added(j++);
      if (i < countA && j < countB) both(i++, j++);
    }
  }

  void PairBlocks(uint32 a, uint32 b) {
    const std::size_t size = (a != kNoNode ? m_old.m_nodes[a] : m_new.m_nodes[b]).m_type->m_size;
    const auto count = [size](Side const& side, uint32 node) {
      return node == kNoNode ? 0 : side.m_nodes[node].m_size / size;
    };
    const auto element = [size](Side const& side, uint32 node, std::size_t i) {
      return side.Bytes(node).substr(i * size, size);
    };
    const auto text = [size](Side const& side, uint32 node, std::size_t i) {
      ArchiveNode const& of = side.m_nodes[node];
      return ArchiveValueText(side.m_content, *of.m_type, side.m_content.BytesOf(of) + i * size);
    };
    const auto index = [](std::size_t i) { return vxMakeString('[' << i << ']'); };
    const std::size_t countA = count(m_old, a), countB = count(m_new, b);
    const Matches matches = MatchElements(
        countA, countB, [&](std::size_t i, std::size_t j) { return element(m_old, a, i) == element(m_new, b, j); });
    EachMatch(
        matches, countA, countB,
        [&](std::size_t i, std::size_t j) {
          if (element(m_old, a, i) == element(m_new, b, j)) return;
          Add(ArchiveChange::Changed, a, b, index(j), text(m_old, a, i), text(m_new, b, j));
        },
        [&](std::size_t i) { Add(ArchiveChange::Removed, a, b, index(i), text(m_old, a, i), ""); },
        [&](std::size_t j) { Add(ArchiveChange::Added, a, b, index(j), "", text(m_new, b, j)); });
  }

  // --- Sets and maps

  // By their keys, which may be there several times.
  void PairEntries(uint32 a, uint32 b) {
    const xvector<uint32> x = ElementsOf(m_old, a), y = ElementsOf(m_new, b);
    const bool isBlock = (!x.empty() && m_old.m_nodes[x[0]].m_isBlock) || (!y.empty() && m_new.m_nodes[y[0]].m_isBlock);
    if (isBlock) return PairBlocks(x.empty() ? kNoNode : x[0], y.empty() ? kNoNode : y[0]);
    std::multimap<std::string_view, uint32> others;
    for (uint32 node : y) others.insert({KeyOf(m_new, node), node});
    for (uint32 node : x) {
      const auto other = others.find(KeyOf(m_old, node));
      if (other == others.end()) {
        AddRemoved(node);
        continue;
      }
      Pair(ArchiveValueIn(m_old.m_nodes, node), ArchiveValueIn(m_new.m_nodes, other->second));
      others.erase(other);
    }
    for (uint32 node : y) {
      const auto [begin, end] = others.equal_range(KeyOf(m_new, node));
      if (std::any_of(begin, end, [node](auto const& other) { return other.second == node; })) AddAdded(node);
    }
  }
  static std::string_view KeyOf(Side const& side, uint32 node) {
    const bool hasKey = side.m_nodes[node].m_step == EPathStep::Entry && node + 1 < side.m_nodes[node].m_end;
    return side.Bytes(hasKey ? node + 1 : node);
  }

  Side m_old, m_new;
  std::size_t m_most;
  xvector<ArchiveChange> m_changes;
  xvector<std::pair<uint32, uint32>> m_pairs;  // of objects, to be compared
};

}  // namespace views

inline xvector<ArchiveChange> CompareArchives(ArchiveView const& old, ArchiveView const& now) {
  Comparer comparer(old.Inside(), now.Inside());
  if (!comparer.AreAlike()) return {{ArchiveChange::Changed, xstring(), xstring(), old.Class(), now.Class()}};
  return comparer.Compare();
}

}  // namespace vesk
