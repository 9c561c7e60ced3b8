#include "driver/command_line.h"

#include <algorithm>
#include <set>

#include "driver/config_parser.h"
#include "driver/data_folder.h"
#include "driver/init.h"
#include "driver/manual.h"
#include "driver/run_workspace.h"
#include "lex/literals.h"
#include "platform/system.h"
#include "text/files.h"
#include "text/paths.h"
#include "text/scope_timer.h"
#include "text/spelling.h"
#include "text/trace.h"
#include "text/version.h"

namespace qrex {

namespace {

constexpr char kUsage[] = "Usage...\nQrex pathToConfigFile\n";

// name="value" or name='value'. Only the first three tokens are looked at.
bool ReadAssignment(const std::string& argument, std::string& name, std::string& value) {
  LexScanner scanner{std::string_view(argument)};
  try {
    const LexToken nameToken = NextToken(scanner);
    if (nameToken.kind != kIdentifier || NextToken(scanner).kind != kAssign) return false;
    const LexToken token = NextToken(scanner);
    if (token.kind != kSingleQuoted && token.kind != kDoubleQuoted) return false;
    name = nameToken.text.Text();
    DecodeString(token, value);
    return true;
  } catch (const LexScannerException&) {
    return false;  // no assignment: the argument is the configuration
  }
}

// For what was taken for the path of a configuration, and is none.
std::string NoConfigurationHint(const std::string& argument) {
  if (argument.starts_with("-")) {
    std::set<std::string_view> options;
    for (const CallForm& form : kCallForms) options.insert(form.option);
    options.erase("");
    std::string all;
    for (const std::string_view option : options) {
      if (IsAlmost(argument, option)) return "did you mean " + std::string(option) + "?";
      all.append(" ").append(option);
    }
    return "the options are" + all;
  }
  const size_t assign = argument.find('=');
  if (assign == 0 || assign == std::string::npos) return {};
  const std::string name = argument.substr(0, assign), value = argument.substr(assign + 1);
  return "a variable has its value in quotes: '" + name + "=\"" + value +
         "\"'; a line of the configuration stands behind the file";
}

}  // namespace

void CommandLine::ShowArgument(size_t index, const std::string& remark) const {
  if (!m_isListing) WriteToConsole("argv[" + std::to_string(index) + "] = " + m_arguments[index] + remark + "\n");
}

// The index of the first argument, from this one on, that is no assignment.
size_t CommandLine::ReadAssignments(size_t index) {
  for (std::string name, value; index < m_arguments.size(); ++index) {
    if (!ReadAssignment(m_arguments[index], name, value)) break;
    ShowArgument(index, " --> adding variable $" + name + "=" + value);
    m_settings.context.rootFrame.DefineSubstitution(name, value);
  }
  return index;
}

void CommandLine::ReadConfigurationPath(const std::string& argument) {
  m_configPath = argument;
  if (!HasExtension(argument, "sln")) return;
  m_parallelBuild = argument.front() == '*';
  m_solution = argument.substr(m_parallelBuild ? 1 : 0);
  ReplaceExtension(m_solution, m_parallelBuild ? "translate.qrex" : "qrex", m_configPath);
}

// The IDE's own build of the generated solution. Its exit code does not reach the exit status.
void CommandLine::RunParallelBuild() {
  if (const PlatformEnvironment* environment = m_settings.Environment()) ApplyEnvironment(*environment);
  std::string command;
  if (CompilerOf(m_settings.compiler).buildsWithMSBuild) {
    command = "MSBuild /verbosity:minimal /m /t:Build \"/p:Platform=" + m_settings.platform +
              ";Configuration=" + m_settings.config + "\" build_" + m_solution;
  } else {
    command = "devenv build_" + m_solution + " /Build \"" + m_settings.config + "|" + m_settings.platform + "\"";
  }
  TraceWriter() << "\n" << command << "\n";
  ScopeTimer timer;
  const int result = m_settings.tools.Run({.line = command}).end.InterpreterCode();
  m_settings.tools.Stop();
  if (result != 0) TraceWriter() << command << " failed with error code " << result << "\n";
  timer.Stop();
  timer.Label() << "Parallel build with devenv";
}

// With paths as they are: whatever is called again is called in this folder.
void CommandLine::NoteCall(size_t firstArgument, size_t configIndex) {
  const std::string program = platform::ProgramPath(m_arguments[0]);
  m_settings.call = {program.empty() ? m_arguments[0] : program};
  m_settings.call.insert(m_settings.call.end(), Argument(firstArgument), Argument(configIndex));
  m_settings.call.push_back(m_configPath);
  m_settings.call.insert(m_settings.call.end(), Argument(configIndex + 1), m_arguments.end());
}

// The settings, from the arguments beginning with assignments; false, with a message, when they are none.
bool CommandLine::LoadArguments(size_t firstArgument) {
  const size_t configIndex = ReadAssignments(firstArgument);
  if (configIndex >= m_arguments.size()) {
    WriteToConsole(kUsage);
    return false;
  }
  ShowArgument(configIndex);
  ReadConfigurationPath(m_arguments[configIndex]);
  NoteCall(firstArgument, configIndex);
  std::string extraConfigText;
  for (size_t i = configIndex + 1; i < m_arguments.size(); ++i) {
    ShowArgument(i);
    extraConfigText += m_arguments[i] + "\n";
  }
  if (!LoadConfiguration(m_settings, m_configPath, extraConfigText)) {
    if (!FileExists(m_configPath)) TraceWriter() << Hint(NoConfigurationHint(m_arguments[configIndex]));
    return false;
  }
  std::string problem = ValidateSettings(m_settings);
  if (problem.empty()) problem = AddRuntimeRoot(m_settings, m_arguments[0]);
  if (!problem.empty()) {
    WriteToConsole(problem + "Error in config file " + m_configPath + "\n");
    return false;
  }
  return true;
}

int CommandLine::RunConfiguration() {
  WriteToConsole(std::string(ProductLine()) + "\n");
  OpenTrace("stdout", false, false);
  if (m_arguments.size() < 2) {
    WriteToConsole(kUsage);
    return 1;
  }
  ShowArgument(0);
  if (!LoadArguments(1)) return 1;
  if (const PlatformEnvironment* environment = m_settings.Environment()) {
    WriteToConsole("PATH = " + environment->PATH + "\nINCLUDE = " + environment->INCLUDE +
                   "\nLIB = " + environment->LIB + "\n");
  }
  if (!RunWorkspace(m_settings, &m_loaded)) return 1;
  if (m_parallelBuild) RunParallelBuild();
  CloseTrace();
  return 0;
}

// What is told on the way is of interest where there is no answer.
template <typename Answer>
int CommandLine::RunQuietly(Answer answer) {
  OpenTrace("stdout", false, false);
  m_isListing = true;
  std::string told;
  HoldTrace(&told);
  const bool isDone = LoadArguments(2) && answer();
  HoldTrace(nullptr);
  if (!isDone) WriteHeldToTrace(told);
  CloseTrace();
  return isDone ? 0 : 1;
}

int CommandLine::RunList() {
  return RunQuietly([this] {
    std::string list;
    if (!ListWorkspace(m_settings, list)) return false;
    WriteToConsole(list);
    return true;
  });
}

int CommandLine::RunFollow(Follow follow, const std::vector<std::string>& positions) {
  return RunQuietly([&] { return FollowPositions(m_settings, follow, positions); });
}

int CommandLine::RunQuestion(const Question& question) {
  return RunQuietly([&] { return AnswerQuestion(m_settings, question); });
}

namespace {

// Apart from the other arguments, which are those of a run.
int RunWhere(const std::vector<std::string>& arguments, Follow follow) {
  constexpr size_t kConfiguration = 2;
  std::vector<std::string> positions, others;
  for (size_t i = 0; i < arguments.size(); ++i) {
    (i > kConfiguration && IsPosition(arguments[i]) ? positions : others).push_back(arguments[i]);
  }
  return CommandLine(others).RunFollow(follow, positions);
}

int RunAsked(std::vector<std::string> arguments) {
  const Question question = ReadQuestion(arguments);
  if (question.problem.empty()) return CommandLine(arguments).RunQuestion(question);
  std::string usage;
  for (const CallForm& form : kCallForms) {
    if (form.option == arguments[1])
      usage.append("Usage: Qrex ").append(form.option).append(" ").append(form.arguments);
  }
  WriteToConsole(question.problem + "\n" + usage + "\n");
  return 1;
}

// The arguments behind --init: a name, and perhaps a folder.
int RunInit(const std::vector<std::string>& arguments) {
  if (arguments.size() < 3 || arguments.size() > 4) {
    WriteToConsole("Usage: Qrex --init NAME [FOLDER]\n");
    return 1;
  }
  const std::string folder = NormalisePath(arguments.back());
  return InitWorkspace(arguments[0], arguments[2], folder.empty() ? "." : folder) ? 0 : 1;
}

}  // namespace

// The first argument may ask for something else than a run.
int CommandLine::Dispatch() {
  const std::string_view first = m_arguments.size() > 1 ? m_arguments[1] : std::string_view();
  if (first == "--init") return RunInit(m_arguments);
  if (first == "--list") return RunList();
  if (first == "--where") return RunWhere(m_arguments, Follow::Back);
  if (first == "--there") return RunWhere(m_arguments, Follow::Forth);
  for (const std::string_view question : {"--graph", "--why", "--reflect", "--report"}) {
    if (first == question) return RunAsked(m_arguments);
  }
  if (first == "--help") {
    WriteToConsole(HelpText());
    return 0;
  }
  if (first == "--version") {
    WriteToConsole("Qrex " + std::string(Version()) + "\n");
    return 0;
  }
  return RunConfiguration();
}

int CommandLine::Run() {
  try {
    return Dispatch();
  } catch (const IException& exception) {
    TraceWriter() << exception << "\n";
  } catch (const std::exception& exception) {
    TraceWriter() << exception.what() << "\n";
  }
  return 1;
}

}  // namespace qrex
