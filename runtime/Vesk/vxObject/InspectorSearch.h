// A search over the names and values of all that is shown. It is done in slices, between which the program goes on:
// what is kept is not where a value stands, but the positions that lead to it.

@import "Vesk/vxObject/InspectorRows.h"

#include <chrono>

namespace vesk {

class InspectorSearch {
 public:
  typedef std::chrono::steady_clock Clock;
  static constexpr ssize_t kMostFound = 200;

  // An empty text ends the search that runs.
  void Begin(std::string_view text) {
    m_text = Lower(text);
    m_isDone = m_isTold = m_text.empty();
    m_found = 0;
    m_hits.clear();
    m_root.clear();
    m_resume.clear();
    m_seen.clear();
  }
  bool IsDone() const { return m_isDone; }

  // Goes on until the time is over or all is looked at.
  void Go(InspectorTree const& tree, Clock::time_point end) {
    m_end = end;
    m_isStopped = false;
    for (auto at = tree.Roots().lower_bound(m_root); at != tree.Roots().end() && !m_isStopped; ++at) {
      if (at->first != m_root) {
        m_root = at->first;
        m_resume.clear();
      }
      try {
        Look(tree);
      } catch (...) {  // a source that throws shows nothing
        (void)InspectorErrorText();
      }
    }
    m_isDone = !m_isStopped || m_found >= kMostFound;
  }
  // Whether there is something that Put has not told.
  bool HasNews() const { return !m_hits.empty() || (m_isDone && !m_isTold); }
  // What was found since it was last asked: [{"path", "name", "text", "type"}, ...].
  void Put(InspectorWriter& out) {
    out.Name("hits").Open('[');
    for (xstring const& hit : m_hits) out.Raw(hit);
    m_hits.clear();
    m_isTold = m_isDone;
    out.Close(']').Member("done", m_isDone).Member("cut", m_found >= kMostFound);
  }

 private:
  static constexpr std::size_t kMostDepth = 24;

  static xstring Lower(std::string_view text) {
    xstring lower(text);
    for (char& c : lower) c = c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
    return lower;
  }

  void Look(InspectorTree const& tree) {
    const InspectorPlace root = tree.Root(m_root);
    InspectorWriter path;
    m_path = path.Put(m_root).Take();
    const xvector<ssize_t> resume = std::exchange(m_resume, xvector<ssize_t>());
    if (resume.empty() && IsFound(root, true)) Add(root, m_path);
    Walk(root, resume, 0);
  }

  // `resume` has the positions at which the last slice ended: what stands there was tested, not what stands in it.
  void Walk(InspectorPlace const& outer, xvector<ssize_t> const& resume, std::size_t depth) {
    const bool resumes = depth < resume.size();
    if (depth >= kMostDepth || (!resumes && !IsWorth(outer.m_value))) return;
    const ssize_t first = resumes ? resume[depth] : 0;
    const bool isNamed = outer.m_value.Kind() != VK_LIST && outer.m_value.Kind() != VK_SET;
    m_resume.push_back(first);
    InspectorTree::Each(outer, first, InspectorTree::Count(outer) - first,
                        [&](ssize_t at, InspectorPlace const& place) {
                          m_resume[depth] = at;
                          const bool wasTested = resumes && at == first;
                          if (!wasTested && IsFound(place, isNamed)) Add(place, PathTo(outer, at, place.m_name));
                          if (m_found >= kMostFound || Clock::now() >= m_end) {
                            m_isStopped = true;
                            return false;
                          }
                          if (InspectorRows::IsScalar(place.m_value.Kind())) return true;
                          const xstring path = std::exchange(m_path, PathTo(outer, at, place.m_name));
                          Walk(place, wasTested ? resume : xvector<ssize_t>(), depth + 1);
                          m_path = path;
                          return !m_isStopped;
                        });
    if (!m_isStopped) m_resume.pop_back();
  }
  // An object is entered once, and a list of numbers for what may stand in a number.
  bool IsWorth(Value const& value) {
    if (value.Kind() == VK_REFERENCE) return m_seen.Insert(*static_cast<void* const*>(value.Address()));
    if (value.Kind() != VK_LIST && value.Kind() != VK_SET) return true;
    const EValueKind item = value.Type().m_item->m_kind;
    const bool isNumber = item == VK_INT || item == VK_UINT || item == VK_FLOAT;
    return !isNumber || m_text.find_first_not_of("0123456789.+-einfa") == xstring::npos;
  }
  xstring PathTo(InspectorPlace const& outer, ssize_t position, xstring const& name) const {
    InspectorWriter step;
    InspectorTree::PutStep(step, outer, position, name);
    return m_path + ',' + step.Take();
  }

  bool IsFound(InspectorPlace const& place, bool isNamed) const {
    if (isNamed && Lower(place.m_name).find(m_text) != xstring::npos) return true;
    return InspectorRows::IsScalar(place.m_value.Kind()) &&
           Lower(Beginning(place.m_value)).find(m_text) != xstring::npos;
  }
  void Add(InspectorPlace const& place, xstring const& path) {
    if (m_found >= kMostFound) return;
    ++m_found;
    InspectorWriter hit;
    hit.Open('{').Name("path").Raw('[' + path + ']');
    InspectorRows::PutRow(hit, place);
    m_hits.push_back(hit.Close('}').Take());
  }
  // Of a long text no more than this is looked at.
  static xstring Beginning(Value const& value) {
    if (value.Kind() == VK_TEXT && value.Type().m_code == RC_STRING8) return value.As<string8>().substr(0, 1 << 16);
    return value.Text();
  }

  xstring m_text;
  xstring m_root;
  xstring m_path;  // of the place that is looked at, as JSON without its brackets
  xvector<ssize_t> m_resume;
  xvector<xstring> m_hits;
  xset<void*> m_seen;  // objects behind references
  Clock::time_point m_end;
  ssize_t m_found = 0;
  bool m_isDone = true;
  bool m_isTold = true;
  bool m_isStopped = false;
};

}  // namespace vesk
