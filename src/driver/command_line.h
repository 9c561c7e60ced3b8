// What the process is given, and the order of its steps.
#pragma once

#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "driver/question.h"
#include "driver/where.h"
#include "workspace/config_settings.h"

namespace qrex {

class CommandLine {
 public:
  explicit CommandLine(std::vector<std::string> arguments)
      : m_arguments(std::move(arguments)) {}  // the program's path first
  int Run();                                  // the exit status
  // The same where positions are to be followed, or a question is asked, which the arguments are without.
  int RunFollow(Follow follow, const std::vector<std::string>& positions);
  int RunQuestion(const Question& question);

 private:
  int Dispatch();
  int RunConfiguration();
  int RunList();
  template <typename Answer>
  int RunQuietly(Answer answer);
  bool LoadArguments(size_t firstArgument);
  size_t ReadAssignments(size_t index);
  void NoteCall(size_t firstArgument, size_t configIndex);
  auto Argument(size_t index) const { return m_arguments.begin() + static_cast<ptrdiff_t>(index); }
  void ShowArgument(size_t index, const std::string& remark = {}) const;
  void ReadConfigurationPath(const std::string& argument);
  void RunParallelBuild();

  const std::vector<std::string> m_arguments;
  ConfigSettings m_settings;
  std::shared_ptr<void> m_loaded;  // what the run made of the settings
  std::string m_configPath;
  std::string m_solution;  // as typed, without the leading `*`
  bool m_parallelBuild = false;
  bool m_isListing = false;  // standard output is for the answer alone
};

}  // namespace qrex
