// One page that looks: its requests, each answered, and what it is told without asking. It knows nothing of sockets.
// A request is {"id": 7, "do": "rows", ...}; its answer {"id": 7, "ok": {...}} or {"id": 7, "error": "why not"}.
//
//   hello                         what is shown, and whether it may be changed
//   rows   path, first, count     rows below a place
//   watch  ranges                 the same, now and whenever one changes, in place of what was watched before
//   look   path                   all of a place but what stands below it
//   types; type  name             what is registered; one of it
//   find   text                   begins a search, ends the one before
//   set    path, value            changes, where the program allows them; `insert` without a value makes a fresh one
//   insert path, at, value; remove path, at; move path, from, to; undo; redo
//   call   path, method, args;  calculate path     what is stale
//   graph  path or node, depth    the dependency graph around a value
//   parts  slot, first, count     of an archive; compare: how that in slot 1 differs from that in slot 0
//
// A message of bytes is a line of JSON, {"id": 8, "do": "archive", "slot": 0}, and behind it an archive.
//
// It is told {"push": "rows", ...} what changed of the rows that it watches, "log" what hooks told, "found" what a
// search found, "undo" what could be undone: together at most kMostMessages a second.

@import "Vesk/vxObject/InspectorArchives.h"
@import "Vesk/vxObject/InspectorCalls.h"
@import "Vesk/vxObject/InspectorGraph.h"
@import "Vesk/vxObject/InspectorLog.h"
@import "Vesk/vxObject/InspectorSearch.h"
@import "Vesk/vxObject/InspectorTypes.h"

namespace vesk {

// What the pages of a program share.
struct InspectorShared {
  InspectorTree m_tree;
  InspectorChanges m_changes{m_tree};
  InspectorCalls m_calls{m_tree};
  InspectorLog m_log;
  InspectorGraph m_graph{m_tree};
  bool m_takesArchives = true;
  xstring m_title;
};

class InspectorSession {
 public:
  typedef std::chrono::steady_clock Clock;
  typedef std::function<void(xstring const& message)> SendFunction;
  static constexpr int kMostMessages = 20;  // a second, that nobody asked for
  static constexpr ssize_t kMostRows = 400;
  static constexpr std::size_t kMostText = 1 << 20;  // bytes of a message ahead of an archive

  InspectorSession(InspectorShared& shared, SendFunction send) : m_shared(shared), m_send(std::move(send)) {}
  InspectorSession(InspectorSession const&) = delete;
  void operator=(InspectorSession const&) = delete;

  // A message of the page. Whatever it is, an answer comes of it, and nothing is thrown but for want of memory.
  void Receive(std::string_view text, bool isText = true) {
    InspectorWriter out;
    out.Open('{');
    try {
      const std::size_t line = isText ? text.size() : std::min(text.find('\n'), text.size());
      if (line > kMostText) throw InspectorError("the message is too large");
      const InspectorJson message = InspectorJson::Parse(text.substr(0, line));
      m_bytes = text.substr(line);
      out.Member("id", message["id"].AsCount(0));
      try {
        InspectorWriter answer;
        answer.Open('{');
        Answer(answer, message);
        answer.Close('}');
        out.Name("ok").Raw(answer.Take());
      } catch (...) {
        out.Member("error", InspectorErrorText());
      }
    } catch (InspectorError const& error) {
      out.Member("error", error.what());
    }
    m_send(out.Close('}').Take());
  }

  // What hooks told, for the next message.
  void Hear(xstring const& log) {
    if (m_log.size() >= kMostText) return;
    if (!m_log.empty()) m_log += ',';
    m_log += log;
  }

  // Tells what has changed, when it is time to, and goes on with a search.
  bool IsTime() const { return Clock::now() >= (m_search.IsDone() ? m_next : std::min(m_next, m_nextSlice)); }
  void Tick() {
    if (!m_search.IsDone() && Clock::now() >= m_nextSlice) {
      m_search.Go(m_shared.m_tree, Clock::now() + kSlice);
      m_nextSlice = Clock::now() + 2 * kSlice;
    }
    const auto begin = Clock::now();
    if (begin < m_next) return;
    InspectorWriter out;
    out.Open('{').Member("push", "changes");
    const std::size_t empty = out.Size();
    PutRanges(out);
    if (!m_log.empty()) out.Name("logs").Open('[').Raw(std::exchange(m_log, xstring())).Close(']');
    PutUndo(out);
    if (m_search.HasNews()) {
      out.Name("found").Open('{');
      m_search.Put(out);
      out.Close('}');
    }
    if (out.Size() > empty) m_send(out.Close('}').Take());
    // What takes long is done less often: a twentieth of the program's time is the page's.
    const auto now = Clock::now();
    m_next = now + std::max<Clock::duration>(std::chrono::milliseconds(1000 / kMostMessages), 20 * (now - begin));
  }

 private:
  static constexpr std::chrono::milliseconds kSlice{10};
  static constexpr ssize_t kMostFirst = ssize_t(1) << 48;  // more than any container has

  typedef void (InspectorSession::*Handler)(InspectorWriter& out, InspectorJson const& message);
  struct Request {
    std::string_view m_name;
    Handler m_handler;
  };

  // A row as it was sent last, or a place that is looked at.
  struct Range {
    xstring m_path;  // as JSON
    ssize_t m_first = 0;
    ssize_t m_count = 0;
    ssize_t m_total = -1;
    xvector<xstring> m_rows;
  };

  void Answer(InspectorWriter& out, InspectorJson const& message) {
    static constexpr Request kRequests[] = {
        {"hello", &InspectorSession::Hello},         {"rows", &InspectorSession::Rows},
        {"look", &InspectorSession::Look},           {"watch", &InspectorSession::Watch},
        {"types", &InspectorSession::Types},         {"type", &InspectorSession::Type},
        {"find", &InspectorSession::Find},           {"set", &InspectorSession::Set},
        {"insert", &InspectorSession::Insert},       {"remove", &InspectorSession::Remove},
        {"move", &InspectorSession::Move},           {"undo", &InspectorSession::Undo},
        {"redo", &InspectorSession::Redo},           {"call", &InspectorSession::Call},
        {"calculate", &InspectorSession::Calculate}, {"graph", &InspectorSession::Graph},
        {"archive", &InspectorSession::Archive},     {"parts", &InspectorSession::Parts},
        {"compare", &InspectorSession::Compare}};
    xstring const& name = message["do"].AsText();
    for (Request const& request : kRequests) {
      if (request.m_name == name) return (this->*request.m_handler)(out, message);
    }
    throw InspectorError("no such request");
  }

  // --- What is there

  void Hello(InspectorWriter& out, InspectorJson const&) {
    out.Member("title", m_shared.m_title).Member("changes", m_shared.m_changes.IsAllowed());
    m_undo = m_redo = "?";
  }
  // A place that throws is shown as what it threw.
  static xstring RowText(std::function<InspectorPlace()> const& find, xstring const& name) {
    InspectorWriter row;
    try {
      InspectorRows::PutRow(row, find());
    } catch (...) {
      row = InspectorWriter();
      row.Member("name", InspectorRows::Cut(name, InspectorRows::kRowBytes)).Member("kind", "none");
      row.Member("text", InspectorErrorText()).Member("bad", true);
    }
    return row.Take();
  }

  void Rows(InspectorWriter& out, InspectorJson const& message) {
    const ssize_t first = std::max<ssize_t>(message["first"].AsCount(0), 0);
    const ssize_t count = std::min(message["count"].AsCount(kMostRows), kMostRows);
    ssize_t total = 0;
    const xvector<xstring> rows = RowsOf(message["path"], first, count, total);
    out.Member("count", total).Member("first", first).Name("rows").Open('[');
    for (xstring const& row : rows) out.Raw(row);
    out.Close(']');
  }
  // Of an empty path what is shown; and how many there are in all.
  xvector<xstring> RowsOf(InspectorJson const& path, ssize_t first, ssize_t count, ssize_t& total) const {
    if (path.m_kind == InspectorJson::List && path.m_items.empty()) return RootRows(first, count, total);
    const InspectorPlace place = m_shared.m_tree.Find(path);
    total = InspectorTree::Count(place);
    xvector<xstring> rows;
    first = std::min(first, total);
    InspectorTree::Each(place, first, std::max<ssize_t>(count, 0), [&](ssize_t at, InspectorPlace const& inner) {
      InspectorWriter row;
      row.Open('{').Name("step");
      InspectorTree::PutStep(row, place, at, inner.m_name);
      rows.push_back(row.Raw(RowText([&] { return inner; }, inner.m_name)).Close('}').Take());
      return true;
    });
    return rows;
  }
  xvector<xstring> RootRows(ssize_t first, ssize_t count, ssize_t& total) const {
    xvector<xstring> rows;
    total = static_cast<ssize_t>(m_shared.m_tree.Roots().size());
    for (auto const& [name, source] : m_shared.m_tree.Roots()) {
      if (first-- > 0) continue;
      if (static_cast<ssize_t>(rows.size()) >= count) break;
      InspectorWriter row;
      row.Open('{').Member("step", name).Raw(RowText([&, &key = name] { return m_shared.m_tree.Root(key); }, name));
      rows.push_back(row.Close('}').Take());
    }
    return rows;
  }

  void Look(InspectorWriter& out, InspectorJson const& message) {
    const InspectorPlace place = m_shared.m_tree.Find(message["path"]);
    const InspectorPlace opened = InspectorTree::Opened(place);
    InspectorRows::PutRow(out, place);
    InspectorRows::PutEdited(out, place);
    if (place.m_value) InspectorRows::PutLabels(out, place.m_value);
    const bool mayChange = m_shared.m_changes.IsAllowed();
    out.Member("editable", mayChange && !place.m_isFixed &&
                               (InspectorRows::IsScalar(place.m_value.Kind()) || place.m_value.Kind() == VK_VARIANT));
    if (mayChange && !opened.m_isFixed && InspectorRows::IsList(opened)) {
      out.Member("list", InspectorChanges::IsPlain(opened.m_value, *opened.m_value.Type().m_item) ? "all" : "order");
    }
    InspectorTypes::PutMetadata(out, place.m_declared.m_metadata);
    if (m_shared.m_graph.IsIn(message["path"], place)) out.Member("graph", true);
    ReflectedClass const* const record = opened.m_value ? opened.m_value.Class() : nullptr;
    if (!record) return;
    out.Member("class", record->m_name);
    if (mayChange && !opened.m_isFixed) InspectorCalls::PutMethods(out, *record);
  }

  void Types(InspectorWriter& out, InspectorJson const&) { InspectorTypes::PutAll(out); }
  void Type(InspectorWriter& out, InspectorJson const& message) {
    InspectorTypes::PutType(out, message["name"].AsText());
  }
  void Find(InspectorWriter&, InspectorJson const& message) {
    m_search.Begin(message["text"].AsText());
    m_next = Clock::time_point();
  }

  // --- What is changed

  void Set(InspectorWriter&, InspectorJson const& message) {
    m_shared.m_changes.Set(message["path"], message["value"]);
  }
  void Insert(InspectorWriter&, InspectorJson const& message) {
    m_shared.m_changes.Insert(message["path"], message["at"].AsCount(0), message["value"]);
  }
  void Remove(InspectorWriter&, InspectorJson const& message) {
    m_shared.m_changes.Remove(message["path"], message["at"].AsCount(-1));
  }
  void Move(InspectorWriter&, InspectorJson const& message) {
    m_shared.m_changes.Move(message["path"], message["from"].AsCount(-1), message["to"].AsCount(-1));
  }
  void Undo(InspectorWriter&, InspectorJson const&) { m_shared.m_changes.Undo(); }
  void Redo(InspectorWriter&, InspectorJson const&) { m_shared.m_changes.Redo(); }
  void Call(InspectorWriter& out, InspectorJson const& message) {
    m_shared.m_changes.CheckAllowed();
    m_shared.m_calls.Call(out, message["path"], message["method"].AsText(), message["args"]);
  }

  void Calculate(InspectorWriter&, InspectorJson const& message) {
    m_shared.m_changes.CheckAllowed();
    const InspectorPlace place = m_shared.m_tree.Find(message["path"]);
    if (!place.m_node) throw InspectorError("the value is not calculated");
    place.m_node->ReadBarrier();
  }

  // --- Graph and archives

  void Graph(InspectorWriter& out, InspectorJson const& message) {
    m_shared.m_graph.Put(out, message["path"], static_cast<uint64>(message["node"].AsCount(0)),
                         message["depth"].AsCount(3));
  }
  void Archive(InspectorWriter& out, InspectorJson const& message) {
    if (!m_shared.m_takesArchives) throw InspectorError("the program takes no archives");
    if (m_bytes.empty()) throw InspectorError("no archive came");
    const InspectorJson type = message["type"];
    m_archives.Open(out, message["slot"].AsCount(0), type.m_text, m_bytes.substr(1));
  }
  void Parts(InspectorWriter& out, InspectorJson const& message) {
    m_archives.Parts(out, message["slot"].AsCount(0), message["first"].AsCount(0), message["count"].AsCount(100));
  }
  void Compare(InspectorWriter& out, InspectorJson const&) { m_archives.Compare(out); }

  // --- What it is told

  void Watch(InspectorWriter&, InspectorJson const& message) {
    ssize_t rows = 0;
    xvector<Range> ranges;
    for (InspectorJson const& item : message["ranges"].m_items) {
      Range range;
      range.m_path = xstring(item["path"].m_raw);
      range.m_first = std::min(std::max<ssize_t>(item["first"].AsCount(0), 0), kMostFirst);
      range.m_count = std::max<ssize_t>(std::min(item["count"].AsCount(0), kMostRows - rows), 0);
      rows += std::max<ssize_t>(range.m_count, 1);
      if (rows > kMostRows) break;
      ranges.push_back(std::move(range));
    }
    for (Range& range : ranges) TakeOver(range);
    m_ranges = std::move(ranges);
    m_next = Clock::time_point();
  }
  // What the page has been told of the rows already.
  void TakeOver(Range& range) const {
    range.m_rows.resize(range.m_count);
    for (Range const& old : m_ranges) {
      if (old.m_path != range.m_path) continue;
      range.m_total = old.m_total;
      for (ssize_t i = 0; i < static_cast<ssize_t>(old.m_rows.size()); ++i) {
        const ssize_t at = old.m_first + i - range.m_first;
        if (at >= 0 && at < range.m_count) range.m_rows[at] = old.m_rows[i];
      }
    }
  }
  void PutRanges(InspectorWriter& out) {
    bool isOpen = false;
    for (std::size_t i = 0; i < m_ranges.size(); ++i) {
      InspectorWriter told;
      Refresh(m_ranges[i], told);
      if (told.Size() == 0) continue;
      if (!std::exchange(isOpen, true)) out.Name("ranges").Open('[');
      out.Open('{').Name("path").Raw(m_ranges[i].m_path).Raw(told.Take()).Close('}');
    }
    if (isOpen) out.Close(']');
  }
  // What is other than before: "count", and [position, row] for each row.
  void Refresh(Range& range, InspectorWriter& told) {
    xvector<xstring> rows;
    ssize_t total = -1;
    try {
      rows = RowsOf(InspectorJson::Parse(range.m_path), range.m_first, range.m_count, total);
    } catch (...) {  // it is gone
      (void)InspectorErrorText();
      total = -1;
    }
    if (total != range.m_total) told.Member("count", total);
    bool isOpen = false;
    for (std::size_t i = 0; i < rows.size(); ++i) {
      if (i < range.m_rows.size() && rows[i] == range.m_rows[i]) continue;
      if (!std::exchange(isOpen, true)) told.Name("rows").Open('[');
      told.Open('[').Put(range.m_first + static_cast<ssize_t>(i)).Raw(rows[i]).Close(']');
    }
    if (isOpen) told.Close(']');
    range.m_total = total;
    range.m_rows = std::move(rows);
  }
  void PutUndo(InspectorWriter& out) {
    const xstring undo = m_shared.m_changes.UndoText(), redo = m_shared.m_changes.RedoText();
    if (undo == m_undo && redo == m_redo) return;
    out.Name("undo").Open('[').Put(undo).Put(redo).Close(']');
    m_undo = undo;
    m_redo = redo;
  }

  InspectorShared& m_shared;
  SendFunction m_send;
  Clock::time_point m_next, m_nextSlice;  // of a message, of a search
  xstring m_log;                          // what hooks told since the last message
  xvector<Range> m_ranges;
  InspectorSearch m_search;
  InspectorArchives m_archives;
  std::string_view m_bytes;  // behind the line of the message that is answered
  xstring m_undo, m_redo;
};

}  // namespace vesk
