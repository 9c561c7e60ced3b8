// An archive beside what is read of it today: fields that were dropped since it was written, and fields that were
// added.

@import "Vesk/vxObject/views/archive_view.h"

namespace vesk {

inline namespace views {

inline Value ObjectToday(ArchiveView::Content const& content, std::size_t object) {
  auto const& list = content.m_archive.m_objects.m_list;
  if (object >= list.size() || !list[object].m_self) return Value();
  if (ReflectedClass const* record = ClassOf(ptr<IPersistable>(list[object].m_persistable))) {
    return Value(*record, list[object].m_self);
  }
  ValueType const* const type = content.m_objects[object].m_type;
  return type && type->m_class ? Value(*type->m_class, list[object].m_self) : Value();
}

inline xstring ShortTextOf(Value const& value, std::size_t most) {
  const EValueKind kind = value.Kind();
  if (kind == VK_LIST || kind == VK_SET || kind == VK_MAP)
    return vxMakeString(value.Count() << (value.Count() == 1 ? " element" : " elements"));
  if (kind == VK_REFERENCE) return *static_cast<void* const*>(value.Address()) ? "an object" : "null";
  if (kind == VK_NONE) return xstring();
  if (value.Type().m_code != RC_STRING8) return LimitText(value.Text(), most);
  std::string text;
  PutJsonString(text, LimitText(value.As<string8>(), most), true);
  return text;
}

// Fields of the models in a value, and in those in it, as far as records show them: not in variants.
class Evolution {
 public:
  explicit Evolution(ArchiveView::Content const& content) : m_content(content), m_nodes(content.m_nodes) {}

  xvector<ArchiveChange> Find() {
    if (m_content.m_type) {
      if (!m_nodes.empty()) Compare(0, Value(m_content.m_declared, m_content.m_value));
    }
    for (std::size_t i = 0; i < m_content.m_objects.size(); ++i) {
      const uint32 node = m_content.m_objects[i].m_node;
      if (node < m_nodes.size() && m_nodes[node].m_step == EPathStep::Object) Compare(node, ObjectToday(m_content, i));
    }
    return std::move(m_changes);
  }

 private:
  bool IsFull() const { return m_changes.size() >= m_content.m_options.m_changes; }

  void Compare(uint32 node, Value const& today) {
    if (!today || m_nodes[node].m_kind != AP_GROUP || IsFull()) return;
    switch (today.Kind()) {
      case VK_CLASS:
        return CompareFields(node, today);
      case VK_LIST:
      case VK_SET:
      case VK_MAP:
        if (MayEvolve(*today.Type().m_item)) CompareEntries(node, today);
        return;
      default:
        return;
    }
  }

  static bool MayEvolve(ValueType const& type) {
    return type.m_kind == VK_CLASS || (type.m_item && MayEvolve(*type.m_item));
  }

  // The entries of both are in one order, as nothing happens to the order of what is read.
  void CompareEntries(uint32 node, Value const& today) {
    xvector<uint32> entries;
    EachArchiveChild(m_nodes, node, [&](uint32 child) {
      ArchiveNode const& entry = m_nodes[child];
      const bool isEntry = entry.m_step == EPathStep::Element || entry.m_step == EPathStep::Entry;
      if (isEntry && entry.m_kind != AP_NAME) entries.push_back(ArchiveValueIn(m_nodes, child));
    });
    if (static_cast<ssize_t>(entries.size()) != today.Count()) return;  // a set drops what is equal
    std::size_t i = 0;
    today.Each([&](xstring const&, Value const& entry) {
      Compare(entries[i], entry);
      return ++i < entries.size() && !IsFull();
    });
  }

  void CompareFields(uint32 node, Value const& today) {
    ReflectedClass const* const model = ModelOf(*today.Class());
    if (!model || IsCutOff(m_nodes, node)) return;
    std::map<std::string_view, uint32> written;
    EachArchiveChild(m_nodes, node, [&](uint32 child) {
      if (m_nodes[child].m_step == EPathStep::Field) written.insert({m_nodes[child].m_label, child});
    });
    if (written.empty() && HoldsBytes(node)) return;
    for (ssize_t i = 0; i < model->m_numModelFields && !IsFull(); ++i) {
      ReflectedModelField const& field = model->m_modelFields[i];
      if (!field.m_type) continue;
      const auto at = written.find(field.m_name);
      if (field.m_offset < 0) {
        if (at != written.end()) AddDropped(at->second);
      } else if (at != written.end()) {
        Compare(at->second, today.Find(field.m_name));
      } else {
        AddNew(node, field.m_name, today.Find(field.m_name));
      }
    }
  }
  bool HoldsBytes(uint32 node) const {
    bool holds = false;
    EachArchiveChild(m_nodes, node, [&](uint32 child) { holds |= m_nodes[child].m_kind == AP_BYTES; });
    return holds;
  }

  void AddDropped(uint32 node) {
    ValueType const* const type = m_nodes[node].m_type;
    m_changes.push_back({ArchiveChange::Removed, ArchivePathText(m_content, node), type ? type->m_text : xstring(),
                         ArchiveShortText(m_content, node), xstring()});
  }
  void AddNew(uint32 around, ConstStringZ name, Value const& value) {
    xstring path = ArchivePathText(m_content, around);
    if (!path.empty()) path += '.';
    m_changes.push_back({ArchiveChange::Added, path + name, value.TypeName(), xstring(),
                         ShortTextOf(value, m_content.m_options.m_text)});
  }

  ArchiveView::Content const& m_content;
  xvector<ArchiveNode> const& m_nodes;
  xvector<ArchiveChange> m_changes;
};

}  // namespace views

inline Value ArchiveView::Today() const {
  Content const& content = *m_content;
  if (!content.m_isWhole) return Value();
  return content.m_type ? Value(content.m_declared, content.m_value) : ObjectToday(content, 0);
}

// A project that the head does not name wrote its first release.
inline bool IsOld(ArchiveView::Content const& content) {
  for (auto const& [target, release] : content.m_archive.m_releases) {
    if (target->m_latestModel && release < LastRelease(*target->m_latestModel)) return true;
  }
  return std::any_of(content.m_nodes.begin(), content.m_nodes.end(), [&](ArchiveNode const& node) {
    return node.m_kind == AP_RELEASE && CompactAt(content.BytesOf(node)) != node.m_detail;
  });
}

inline xvector<ArchiveChange> ArchiveView::Evolved() const {
  if (!m_content->m_isWhole || !IsOld(*m_content)) return {};
  return Evolution(*m_content).Find();
}

}  // namespace vesk
