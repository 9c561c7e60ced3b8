#include "driver/progress.h"

#include <algorithm>

#include "builder/project_builder.h"
#include "text/paths.h"
#include "text/scope_timer.h"

namespace qrex {

namespace {

constexpr int64_t kSecond = 10'000'000;          // in units of file times
constexpr int64_t kBetweenDraws = kSecond / 20;  // more often, nobody could read it
constexpr int kSoon = 50, kNextSecond = 1000;    // milliseconds
constexpr int64_t kLong = 2;                     // seconds, from which on a tool's time is told
constexpr size_t kLeastOfSubject = 8;            // columns; fewer are not worth it

std::string Clock(int64_t seconds) {
  const auto twoDigits = [](int64_t value) { return (value < 10 ? "0" : "") + std::to_string(value); };
  const std::string minutes = seconds < 3600 ? std::to_string(seconds / 60)
                                             : std::to_string(seconds / 3600) + ":" + twoDigits(seconds / 60 % 60);
  return minutes + ":" + twoDigits(seconds % 60);
}

std::string Printable(std::string_view name) {
  std::string text = platform::IsValidUtf8(name) ? std::string(name) : platform::WidenBytes(name);
  for (char& c : text) {
    if (static_cast<unsigned char>(c) < ' ' || c == '\x7f') c = '?';
  }
  return text;
}

// The end of a path tells most.
std::string EndOf(std::string text, size_t columns) {
  if (platform::ColumnsOf(text) <= columns) return text;
  constexpr std::string_view kCut = "...";
  do {
    size_t next = 1;
    while (next < text.size() && (text[next] & 0xC0) == 0x80) ++next;
    text.erase(0, next);
  } while (platform::ColumnsOf(text) + kCut.size() > columns);
  return std::string(kCut) + text;
}

}  // namespace

std::string ProgressLine(const ProgressState& state, size_t columns) {
  std::string line;
  const size_t most = std::max<size_t>(columns, 1) - 1;  // in the last column some terminals go on to the next line
  const auto add = [&](const std::string& part) {
    if (line.size() + part.size() > most) return false;
    line += part;
    return true;
  };
  if (!add("[" + std::to_string(state.done) + "/" + std::to_string(state.total) + "]")) return line;
  if (state.running > 0 && !add(" " + std::to_string(state.running) + " running")) return line;
  if (!add((state.running > 0 ? ", " : " ") + Clock(state.seconds)) || state.subject.empty()) return line;
  const std::string since = state.since >= kLong ? " (" + Clock(state.since) + ")" : std::string();
  if (line.size() + 2 + kLeastOfSubject + since.size() > most) return line;
  return line + ", " + EndOf(Printable(state.subject), most - line.size() - 2 - since.size()) + since;
}

Progress::Progress(const ConfigSettings& settings) : m_settings(settings), m_begin(CurrentFileTime()) {}

void Progress::ProjectBegins(const std::string& name, size_t expectedSteps) {
  if (expectedSteps > 0) Estimate();
  m_projects[name].expected = expectedSteps;
}

void Progress::ProjectEnds(const ProjectBuilder& builder) {
  Steps& steps = m_projects[builder.project.name];
  steps.expected = steps.done;
}

// Of the projects to come: sources whose output is missing or older. What they import is not looked at.
void Progress::Estimate() {
  if (m_isEstimated || !m_workspace) return;
  m_isEstimated = true;
  std::vector<std::string> asked;
  std::vector<Steps*> askers;
  for (const auto& project : m_workspace->projects) {
    const ProjectConfig* config = project->FindConfig(m_settings.config, m_settings.platform);
    if (!config || !project->usesQrex || project->exported || project->hasFaultyFile) continue;
    const auto [known, isNew] = m_projects.try_emplace(project->name);
    if (!isNew) continue;
    project->CollectFiles();
    const BuildPaths paths(*project, *config);
    for (const ProjectFile* file : project->files) {
      if (!m_settings.translateOnly && !HasObject(*file)) continue;
      asked.push_back(project->SourcePath(*file));
      asked.push_back(m_settings.translateOnly ? paths.Translated(*file) : paths.Object(*file));
      askers.push_back(&known->second);
    }
  }
  const std::vector<FileStamp> stamps = StampsOf(asked);
  for (size_t i = 0; i < askers.size(); ++i) {
    if (!m_settings.rebuildAll && stamps[2 * i].time < stamps[2 * i + 1].time) continue;
    const bool isFirst = askers[i]->expected == 0;
    askers[i]->expected += isFirst && !m_settings.translateOnly ? 2 : 1;  // with the link
  }
}

size_t Progress::DoneCount() const {
  size_t count = 0;
  for (const auto& [name, steps] : m_projects) count += steps.done;
  return count;
}

size_t Progress::TotalCount() const {
  size_t count = 0;
  for (const auto& [name, steps] : m_projects) {
    const auto isRunning = [&name = name](const Running& each) { return each.counts && each.project == name; };
    const auto running = std::count_if(m_running.begin(), m_running.end(), isRunning);
    count += std::max(steps.expected, steps.done + static_cast<size_t>(running));
  }
  return count;
}

void Progress::TranslationBegins(const ScannedFile& file) {
  if (m_settings.translateOnly && file.needsWriting) Count(file.file.project->name);
  Tell(file.file.path);
}

void Progress::TranslationEnds(const ScannedFile&) {}

void Progress::ToolBegins(ToolId tool, const ToolTask& task) {
  const bool isTarget = task.source.empty();
  const std::string subject = isTarget ? "linking " + std::string(FileNameOf(task.output)) : task.source;
  m_running.push_back({tool, task.project, subject, task.kind != ToolKind::ManifestTool, CurrentFileTime()});
  Tell(subject);
}

void Progress::ToolEnds(ToolId tool, const platform::ProcessEnd&) {
  const auto ended =
      std::find_if(m_running.begin(), m_running.end(), [&](const Running& each) { return each.tool == tool; });
  if (ended == m_running.end()) return;
  if (ended->counts) Count(ended->project);
  m_running.erase(ended);
  m_isBehind = true;
}

int Progress::Patience() const { return m_isBehind ? kSoon : kNextSecond; }

void Progress::StillWaiting() {
  if (!m_running.empty()) Draw(m_running.front().subject, m_running.front().begin);
}

void Progress::Tell(const std::string& subject) {
  const int64_t now = CurrentFileTime();
  m_isBehind = now - m_drawn < kBetweenDraws;
  if (!m_isBehind) Draw(subject, now);
}

void Progress::Draw(const std::string& subject, int64_t begin) {
  m_drawn = CurrentFileTime();
  m_isBehind = false;
  const ProgressState state{
      DoneCount(), TotalCount(), m_running.size(), (m_drawn - m_begin) / kSecond, subject, (m_drawn - begin) / kSecond};
  const size_t columns = platform::StatusColumns();
  m_line.Show(ProgressLine(state, columns));
}

}  // namespace qrex
