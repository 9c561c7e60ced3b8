// What changed last: the writes that the hooks of models tell while somebody looks. Between two messages to the page a
// few are kept, and how many there were.

@import "Vesk/vxObject/InspectorRows.h"

namespace vesk {

class InspectorLog {
 public:
  // Hooks are told only while it listens.
  void Listen(bool listens) {
    if (listens && !m_hook) m_hook = std::make_unique<ModelHook>([this](ModelChange const& change) { Add(change); });
    if (!listens) m_hook.reset();
  }
  bool IsEmpty() const { return m_total == 0; }

  // {"total": 12, "items": [{"what": "orders::Order", "path": "lines[2].amount", "kind": "assign", "times": 3}, ...]}
  void Put(InspectorWriter& out) {
    out.Member("total", m_total).Name("items").Open('[');
    for (Entry const& entry : m_entries) {
      constexpr ConstStringZ kKinds[] = {"write", "assign", "offset", "insert", "delete"};
      out.Open('{').Member("what", entry.m_class ? entry.m_class->m_name : "");
      out.Member("path", InspectorRows::Cut(PathOf(entry), InspectorRows::kRowBytes));
      out.Member("kind", kKinds[entry.m_kind]).Member("times", entry.m_times).Close('}');
    }
    out.Close(']');
    m_entries.clear();
    m_total = 0;
  }

 private:
  struct Entry {
    ModelChange::EKind m_kind;
    void const* m_object;
    ReflectedClass const* m_class;
    Path m_path;
    xstring m_name;
    int64 m_times;
  };
  static constexpr std::size_t kMostEntries = 50;

  // A loop that writes one field, or the fields of many objects, makes an entry or so.
  void Add(ModelChange const& change) {
    ++m_total;
    const std::string_view name = change.m_name ? change.m_name : "";
    if (!m_entries.empty()) {
      Entry& last = m_entries.back();
      const bool isSame = last.m_object == change.m_object && last.m_kind == change.m_kind && last.m_name == name;
      if (isSame && last.m_path == change.m_path) {
        ++last.m_times;
        return;
      }
    }
    if (m_entries.size() >= kMostEntries) return;
    m_entries.push_back({change.m_kind, change.m_object, change.m_class, change.m_path, xstring(name), 1});
  }
  static xstring PathOf(Entry const& entry) {
    return entry.m_name.empty() && entry.m_class ? PathText(*entry.m_class, entry.m_path) : entry.m_name;
  }

  std::unique_ptr<ModelHook> m_hook;
  xvector<Entry> m_entries;
  int64 m_total = 0;
};

}  // namespace vesk
