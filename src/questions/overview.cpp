#include "questions/overview.h"

#include <utility>
#include <vector>

#include "questions/asked_files.h"
#include "questions/graph.h"
#include "questions/reflection.h"
#include "report/json_writer.h"

namespace qrex {

namespace {

class Faults : public MessageConsumer {
 public:
  explicit Faults(MessageConsumer* next) : m_next(next) {}
  void Take(const Message& message) override {
    if (message.severity == Severity::Error) m_errors.push_back(message);
    if (m_next) m_next->Take(message);
  }
  const std::vector<Message>& Errors() const { return m_errors; }

 private:
  MessageConsumer* const m_next;
  std::vector<Message> m_errors;
};

// For a translation of which the run knows nothing: each error is met anew, and ends its file alone.
class SettingsApart {
 public:
  SettingsApart(ConfigSettings& settings, MessageConsumer& messages)
      : m_settings(settings),
        m_messages(std::exchange(settings.macroWorld.messages, &messages)),
        m_keepGoing(std::exchange(settings.keepGoing, true)),
        m_faulty(std::exchange(settings.faulty, {})) {}
  ~SettingsApart() {
    m_settings.macroWorld.messages = m_messages;
    m_settings.keepGoing = m_keepGoing;
    m_settings.faulty = std::move(m_faulty);
  }
  SettingsApart(const SettingsApart&) = delete;
  SettingsApart& operator=(const SettingsApart&) = delete;

 private:
  ConfigSettings& m_settings;
  MessageConsumer* const m_messages;
  const bool m_keepGoing;
  std::unordered_set<std::string> m_faulty;
};

void WriteFaults(JsonWriter& json, const std::vector<Message>& errors, const std::vector<ScannedFile*>& faulty) {
  json.Key("faults").Open('[');
  for (const Message& error : errors) {
    json.Line().Open('{').Member("text", error.text);
    if (!error.place.file.empty()) json.Member("place", error.place.file).Member("line", error.place.line);
    json.Close('}');
  }
  json.Close(']').Key("faultyFiles").Open('[');
  for (const ScannedFile* file : faulty) json.Value(file->file.path);
  json.Close(']');
}

void WriteImports(JsonWriter& json, const Workspace& workspace, const Graph& graph,
                  const std::vector<ScannedFile*>& faulty) {
  std::unordered_map<std::string_view, int64_t> projects;
  json.Key("imports").Open('{').Key("projects").Open('[');
  for (const auto& project : workspace.projects) {
    const bool isNew = projects.try_emplace(project->name, static_cast<int64_t>(projects.size())).second;
    if (isNew) json.Value(project->name);
  }
  std::unordered_set<std::string_view> isFaulty;
  for (const ScannedFile* file : faulty) isFaulty.insert(file->file.path);
  std::vector<std::vector<size_t>> imports(graph.nodes.size());
  for (const GraphEdge& edge : graph.edges) imports[edge.from].push_back(edge.to);
  json.Close(']').Key("files").Open('[');
  for (size_t i = 0; i < graph.nodes.size(); ++i) {
    const GraphNode& node = graph.nodes[i];
    json.Line().Open('[').Value(node.id).Value(projects.at(node.project)).Value(isFaulty.contains(node.id)).Open('[');
    for (const size_t import : imports[i]) json.Value(static_cast<int64_t>(import));
    json.Close(']').Close(']');
  }
  json.Close(']').Close('}');
}

}  // namespace

Overview OverviewOf(Workspace& workspace, MessageConsumer* alsoTold) {
  Faults faults(alsoTold);
  const SettingsApart apart(workspace.settings, faults);
  AskedFiles asked(workspace);
  Overview overview;
  try {
    overview.isWhole = asked.Translate();
  } catch (const IException& exception) {
    faults.Take(ErrorOf(exception));
  }
  std::vector<ScannedFile*> files = asked.Files();
  files.insert(files.end(), asked.FaultyFiles().begin(), asked.FaultyFiles().end());
  JsonWriter json;
  json.Open('{');
  WriteFaults(json, faults.Errors(), asked.FaultyFiles());
  json.Key("reflection").Json(ReflectionJson(workspace, asked.Files()));
  WriteImports(json, workspace, GraphOfImports(files), asked.FaultyFiles());
  json.Close('}');
  overview.json = json.Text();
  return overview;
}

}  // namespace qrex
