#include "report/page.h"

#include <algorithm>

#include "platform/console.h"
#include "report/json_writer.h"
#include "report/page_parts.h"
#include "report/reason_text.h"
#include "text/files.h"
#include "text/numbers.h"

namespace qrex {

namespace {

constexpr int64_t kMicrosecond = 10;                     // in units of file times
constexpr int64_t kUnixEpoch = 116'444'736'000'000'000;  // 1970 in them
constexpr size_t kMostExcerpts = 2000;                   // of messages with their source lines
constexpr int64_t kLinesAround = 1;
constexpr size_t kLongestLine = 300;

int64_t Milliseconds(int64_t time) { return (time - kUnixEpoch) / (1000 * kMicrosecond); }
int64_t Number(size_t value) { return static_cast<int64_t>(value); }

// Each name once, in the order in which it was met.
class Names {
 public:
  size_t IndexOf(const std::string& name) {
    const auto [found, isNew] = m_indices.try_emplace(name, m_names.size());
    if (isNew) m_names.push_back(name);
    return found->second;
  }
  const std::vector<std::string>& All() const { return m_names; }

 private:
  std::unordered_map<std::string, size_t> m_indices;
  std::vector<std::string> m_names;
};

// The lines around a place, of files that are read once.
class Excerpts {
 public:
  void Write(JsonWriter& json, const SourcePlace& place) {
    json.Key("lines").Open('[');
    const std::vector<std::string>& lines = LinesOf(place.file);
    const int64_t end = std::min(place.line + kLinesAround, Number(lines.size()));
    for (int64_t number = std::max<int64_t>(place.line - kLinesAround, 1); number <= end; ++number) {
      json.Open('[').Value(number).Value(lines[static_cast<size_t>(number - 1)]).Close(']');
    }
    json.Close(']');
  }

 private:
  const std::vector<std::string>& LinesOf(const std::string& path) {
    const auto [known, isNew] = m_files.try_emplace(path);
    std::string text;
    if (!isNew || !platform::IsValidUtf8(path) || !FileExists(path) || !LoadText(text, path, true))
      return known->second;
    for (size_t begin = 0; begin < text.size();) {
      const size_t end = std::min(text.find('\n', begin), text.size());
      std::string line = text.substr(begin, std::min(end - begin, kLongestLine));
      while (!line.empty() && line.size() == kLongestLine && (text[begin + line.size()] & 0xC0) == 0x80)
        line.pop_back();
      known->second.push_back(std::move(line));
      begin = end + 1;
    }
    return known->second;
  }

  std::map<std::string, std::vector<std::string>> m_files;
};

class Page {
 public:
  Page(const BuildRecord& record, const PageHeading& heading) : m_record(record), m_heading(heading) {}

  std::string Data(std::string_view workspace) {
    for (const auto& [path, file] : m_record.files) m_pathOfSource[file.sourcePath] = path;
    m_json.Open('{').Member("title", m_heading.title).Member("subtitle", m_heading.subtitle);
    m_json.Member("began", Milliseconds(m_record.begin))
        .Member("total", (m_record.end - m_record.begin) / kMicrosecond);
    m_json.Member("slots", Number(m_record.slotCount)).Member("completed", m_heading.completed);
    m_json.Member("errors", m_record.errorCount).Member("warnings", m_record.warningCount);
    WriteSpans();
    WriteFiles();
    WriteReasons();
    WriteMessages();
    m_json.Key("projects").Open('[');
    for (const std::string& name : m_projects.All()) m_json.Value(name);
    m_json.Close(']').Member("built", m_heading.built);
    if (!workspace.empty()) m_json.Key("workspace").Json(workspace);
    m_json.Close('}');
    return m_json.Text();
  }

 private:
  void WriteSpans();
  void WriteSpan(const Span& span);
  void WriteFiles();
  void WriteReasons();
  void WriteMessages();
  size_t ReasonOf(const MakeReason& why);

  const BuildRecord& m_record;
  const PageHeading& m_heading;
  JsonWriter m_json;
  Names m_files, m_projects, m_reasonKeys;
  std::vector<MakeReason> m_reasons;
  std::unordered_map<std::string, std::string> m_pathOfSource;
  Excerpts m_excerpts;
};

size_t Page::ReasonOf(const MakeReason& why) {
  const size_t index = m_reasonKeys.IndexOf(ReasonText(why));
  if (index == m_reasons.size()) m_reasons.push_back(why);
  return index;
}

std::string_view KindOf(const Span& span) {
  if (span.kind == Span::Kind::Translation) return span.writes ? "translate" : "read";
  switch (span.task.kind) {
    case ToolKind::Compiler:
      return "compile";
    case ToolKind::Assembler:
      return "assemble";
    case ToolKind::ResourceCompiler:
      return "resource";
    case ToolKind::Linker:
      return "link";
    case ToolKind::ManifestTool:
      return "manifest";
  }
  return {};
}

void Page::WriteSpans() {
  m_json.Key("spans").Open('[');
  for (const Span& span : m_record.spans) WriteSpan(span);
  m_json.Close(']').Key("critical").Open('[');
  for (const size_t index : CriticalPath(m_record)) m_json.Value(Number(index));
  m_json.Close(']');
}

void Page::WriteSpan(const Span& span) {
  m_json.Line().Open('{').Member("kind", KindOf(span));
  if (!span.task.source.empty()) m_json.Member("file", Number(m_files.IndexOf(span.task.source)));
  m_json.Member("output", span.task.output).Member("project", Number(m_projects.IndexOf(span.task.project)));
  m_json.Member("begin", (span.begin - m_record.begin) / kMicrosecond);
  m_json.Member("time", (span.end - span.begin) / kMicrosecond);
  if (span.slot > 0) m_json.Member("slot", Number(span.slot));
  if (span.depth > 0) m_json.Member("depth", Number(span.depth));
  if (span.inner > 0) m_json.Member("inner", span.inner / kMicrosecond);
  if (const MakeReason* why = m_record.Why(span)) m_json.Member("why", Number(ReasonOf(*why)));
  if (span.hasFailed) m_json.Member("failed", true);
  if (!span.isOver) m_json.Member("cut", true);
  m_json.Close('}');
}

void Page::WriteFiles() {
  m_json.Key("files").Open('[');
  for (size_t i = 0; i < m_files.All().size(); ++i) {  // grows by what is imported
    const std::string path = m_files.All()[i];
    const auto recorded = m_record.files.find(path);
    m_json.Line().Open('[').Value(path);
    const std::string project = recorded == m_record.files.end() ? std::string() : recorded->second.project;
    m_json.Value(Number(m_projects.IndexOf(project))).Open('[');
    if (recorded != m_record.files.end()) {
      for (const std::string& import : recorded->second.imports) m_json.Value(Number(m_files.IndexOf(import)));
    }
    m_json.Close(']').Close(']');
  }
  m_json.Close(']');
}

void Page::WriteReasons() {
  m_json.Key("reasons").Open('[');
  for (const MakeReason& why : m_reasons) {
    m_json.Line().Open('{').Member("text", ReasonText(why));
    const auto path = m_pathOfSource.find(why.file);
    if (path != m_pathOfSource.end()) m_json.Member("path", path->second);
    if (why.time != 0) m_json.Member("time", Milliseconds(why.time));
    m_json.Close('}');
  }
  m_json.Close(']');
}

void Page::WriteMessages() {
  m_json.Key("messages").Open('[');
  size_t count = 0;
  for (const RecordedMessage& message : m_record.messages) {
    m_json.Line().Open('{').Member("severity", message.severity == Severity::Error ? "error" : "warning");
    m_json.Member("text", message.text);
    if (!message.place.file.empty()) {
      m_json.Member("place", message.place.file).Member("line", message.place.line);
      if (!message.generated.file.empty()) {
        m_json.Member("generated", message.generated.file + ":" + std::to_string(message.generated.line));
      }
      const auto path = m_pathOfSource.find(message.place.file);
      if (path != m_pathOfSource.end()) m_json.Member("path", path->second);
      if (++count <= kMostExcerpts) m_excerpts.Write(m_json, message.place);
    }
    m_json.Close('}');
  }
  m_json.Close(']');
}

}  // namespace

std::string PageText(const BuildRecord& record, const PageHeading& heading, std::string_view workspace) {
  std::string page;
  std::string_view rest = kPageHtml;
  const std::string data = Page(record, heading).Data(workspace);
  for (const auto& [mark, text] : {std::pair<std::string_view, std::string_view>("/*style*/", kPageStyle),
                                   {"/*data*/", data},
                                   {"/*script*/", kPageScript}}) {
    const size_t at = rest.find(mark);
    page.append(rest.substr(0, at)).append(text);
    rest.remove_prefix(at + mark.size());
  }
  return page.append(rest);
}

}  // namespace qrex
