// A search over the names and values of all that is shown. It is done in slices, between which the program goes on: what
// is kept is not where a value stands, but the positions that lead to it.

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
    m_isDone = m_text.empty();
    m_found = 0;
    m_root.clear();
    m_resume.clear();
    m_seen.clear();
  }
  bool IsDone() const { return m_isDone; }

  // Goes on until the time is over or all is looked at; [{"path", "name", "text", "type"}, ...] to `out`.
  void Go(InspectorTree const& tree, Clock::time_point end, InspectorWriter& out) {
    m_end = end;
    m_isStopped = false;
    out.Name("hits").Open('[');
    for (auto at = tree.Roots().lower_bound(m_root); at != tree.Roots().end() && !m_isStopped; ++at) {
      if (at->first != m_root) {
        m_root = at->first;
        m_resume.clear();
      }
      try {
        Look(tree, out);
      } catch (std::exception const&) {  // a source that throws shows nothing
      }
    }
    out.Close(']');
    m_isDone = !m_isStopped || m_found >= kMostFound;
    out.Member("done", m_isDone).Member("cut", m_found >= kMostFound);
  }

 private:
  static constexpr std::size_t kMostDepth = 24;

  static xstring Lower(std::string_view text) {
    xstring lower(text);
    for (char& c : lower) c = c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
    return lower;
  }

  void Look(InspectorTree const& tree, InspectorWriter& out) {
    const InspectorPlace root = tree.Root(m_root);
    InspectorWriter path;
    path.Put(m_root);
    m_path = path.Take();
    const xvector<ssize_t> resume = std::exchange(m_resume, xvector<ssize_t>());
    if (resume.empty()) Test(root, out);
    Walk(root, resume, 0, out);
  }

  // `resume` has the positions at which the last slice ended: what stands there was tested, not what stands in it.
  void Walk(InspectorPlace const& outer, xvector<ssize_t> const& resume, std::size_t depth, InspectorWriter& out) {
    if (depth >= kMostDepth) return;
    const bool resumes = depth < resume.size();
    if (outer.m_value.Kind() == VK_REFERENCE && !resumes) {
      void* const object = *static_cast<void* const*>(outer.m_value.Address());
      if (!m_seen.Insert(object)) return;
    }
    const ssize_t first = resumes ? resume[depth] : 0;
    const std::size_t pathSize = m_path.size();
    m_resume.push_back(first);
    InspectorTree::Each(outer, first, InspectorTree::Count(outer) - first, [&](ssize_t at, InspectorPlace const& place) {
      m_resume[depth] = at;
      InspectorWriter step;
      InspectorTree::PutStep(step, outer, at, place.m_name);
      m_path.resize(pathSize);
      m_path += ',';
      m_path += step.Take();
      const bool wasTested = resumes && at == first;
      if (!wasTested) Test(place, out);
      if (m_found >= kMostFound || Clock::now() >= m_end) {
        m_isStopped = true;
        return false;
      }
      if (!InspectorRows::IsScalar(place.m_value.Kind())) {
        Walk(place, wasTested ? resume : xvector<ssize_t>(), depth + 1, out);
      }
      return !m_isStopped;
    });
    if (!m_isStopped) m_resume.pop_back();
    m_path.resize(pathSize);
  }

  void Test(InspectorPlace const& place, InspectorWriter& out) {
    const bool isScalar = InspectorRows::IsScalar(place.m_value.Kind());
    const bool isFound = Lower(place.m_name).find(m_text) != xstring::npos ||
                         (isScalar && Lower(Beginning(place.m_value)).find(m_text) != xstring::npos);
    if (!isFound || m_found >= kMostFound) return;
    ++m_found;
    out.Open('{').Name("path").Raw('[' + m_path + ']');
    InspectorRows::PutRow(out, place);
    out.Close('}');
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
  xset<void*> m_seen;  // objects behind references
  Clock::time_point m_end;
  ssize_t m_found = 0;
  bool m_isDone = true;
  bool m_isStopped = false;
};

}  // namespace vesk
