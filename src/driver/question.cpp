#include "driver/question.h"

#include <algorithm>
#include <array>

#include "platform/console.h"
#include "questions/graph.h"
#include "questions/reflection.h"
#include "questions/why.h"
#include "text/numbers.h"

namespace qrex {

namespace {

constexpr std::array<std::string_view, 3> kGraphs = {"projects", "imports", "models"};
constexpr size_t kFirst = 2;  // argument behind the option

class QuestionReader {
 public:
  explicit QuestionReader(std::vector<std::string>& arguments) : m_arguments(arguments) {}

  Question Read() {
    const std::string& option = m_arguments[kFirst - 1];
    if (option == "--why") m_question.about = Question::About::Why;
    if (option == "--reflect") m_question.about = Question::About::Declarations;
    if (option == "--report") m_question.about = Question::About::Page;
    const bool isWhy = m_question.about == Question::About::Why;
    if (isWhy) Take(kFirst, "FILE", m_question.file);
    for (size_t i = kFirst; i < m_arguments.size() && m_question.problem.empty();) {
      if (!ReadOption(i) && !ReadGraph(i)) ++i;
    }
    if (m_question.about == Question::About::Page) Take(BehindConfiguration(), "PAGE.html", m_question.file);
    if (m_question.depth >= 0 && m_question.file.empty()) Fail("--depth goes with --of FILE");
    if (!platform::IsValidUtf8(m_question.file)) Fail("No valid UTF-8 in " + m_question.file);
    return m_question;
  }

 private:
  // Removes the argument, and keeps its text.
  void Take(size_t index, const std::string& what, std::string& text) {
    if (index >= m_arguments.size() || m_arguments[index].starts_with("--")) return Fail(what + " is missing");
    text = m_arguments[index];
    Remove(index);
  }
  void Remove(size_t index) { m_arguments.erase(m_arguments.begin() + static_cast<ptrdiff_t>(index)); }
  void Fail(std::string problem) {
    if (m_question.problem.empty()) m_question.problem = std::move(problem);
  }

  bool ReadOption(size_t index) {
    const std::string word = m_arguments[index];
    const bool isGraph = m_question.about == Question::About::Graph;
    if (!word.starts_with("--")) return false;
    Remove(index);
    const bool hasForms = isGraph || m_question.about == Question::About::Declarations;
    if (word == "--json" && hasForms) {
      m_question.asJson = true;
    } else if (word == "--of" && isGraph) {
      Take(index, "FILE behind --of", m_question.file);
    } else if (word == "--depth" && isGraph) {
      std::string number, error;
      Take(index, "N behind --depth", number);
      const bool isNumber = ParseNumber(number, m_question.depth, error) && m_question.depth >= 0;
      if (!isNumber) Fail("--depth takes a number, not " + number);
    } else {
      Fail("Unknown option " + word + " of " + m_arguments[kFirst - 1]);
    }
    return true;
  }

  size_t BehindConfiguration() const {
    const auto isPath = [](const std::string& argument) { return argument.find('=') == argument.npos; };
    const auto path = std::find_if(m_arguments.begin() + kFirst, m_arguments.end(), isPath);
    return static_cast<size_t>(path - m_arguments.begin()) + 1;
  }

  // Behind the configuration; a line of it is never such a word.
  bool ReadGraph(size_t index) {
    if (m_question.about != Question::About::Graph) return false;
    const std::string& word = m_arguments[index];
    if (index < BehindConfiguration() || std::find(kGraphs.begin(), kGraphs.end(), word) == kGraphs.end()) return false;
    m_question.graph = word;
    Remove(index);
    return true;
  }

  std::vector<std::string>& m_arguments;
  Question m_question;
};

void TellUnknown(const Workspace& workspace, const std::string& what) {
  workspace.settings.Tell(Message(Severity::Error, "Error: ", what));
}

std::optional<std::string> GraphText(const Question& question, Workspace& workspace, const AskedFiles& asked) {
  Graph graph = question.graph == "projects"  ? GraphOfProjects(workspace)
                : question.graph == "imports" ? GraphOfImports(asked.Files())
                                              : GraphOfModels(asked.Files());
  if (!question.file.empty()) {
    const std::vector<size_t> centre = FindNodes(graph, workspace, question.file);
    if (centre.empty()) {
      TellUnknown(workspace, question.file + " is no file and no name in the graph of " + graph.title);
      return std::nullopt;
    }
    graph = Around(graph, centre, question.depth < 0 ? graph.nodes.size() : static_cast<size_t>(question.depth));
  }
  return question.asJson ? JsonText(graph) : DotText(graph);
}

std::optional<std::string> WhyOf(const std::string& path, const Workspace& workspace) {
  ProjectFile* const file = FindAskedFile(workspace, path);
  if (file && IsTranslated(*file->project) && IsTranslated(*file)) return WhyText(*file);
  TellUnknown(workspace, path + " is no file that a build of this workspace translates");
  return std::nullopt;
}

}  // namespace

Question ReadQuestion(std::vector<std::string>& arguments) { return QuestionReader(arguments).Read(); }

std::optional<std::string> AnswerTo(const Question& question, Workspace& workspace) {
  if (question.about == Question::About::Why) return WhyOf(question.file, workspace);
  for (const auto& project : workspace.projects) project->CollectFiles();
  AskedFiles asked(workspace);
  const bool isTranslated = question.about == Question::About::Declarations || question.graph != "projects";
  if (isTranslated && !asked.Translate()) return std::nullopt;
  if (question.about == Question::About::Graph) return GraphText(question, workspace, asked);
  return question.asJson ? ReflectionJson(workspace, asked.Files()) : ReflectionList(asked.Files());
}

}  // namespace qrex
