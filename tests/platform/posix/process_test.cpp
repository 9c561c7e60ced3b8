// Programs started side by side: what they print, how they end, what they are given of this process; and lines for the
// command interpreter.

#include "platform/process.h"

#include <fcntl.h>
#include <unistd.h>

#include <csignal>
#include <map>
#include <set>
#include <sstream>

#include "platform/file_system.h"
#include "platform/posix/interpreter.h"
#include "platform/system.h"
#include "world_fixture.h"

namespace qrex::platform {

namespace {

using Cause = ProcessEnd::Cause;
using Stream = Program::Stream;

Program Script(const std::string& script) {
  return {.words = {"sh", "-c", script}, .output = Stream::Captured, .errorsIntoOutput = true};
}
Program Quiet(std::string line) {
  return {.line = std::move(line), .output = Stream::Captured, .errorsIntoOutput = true};
}

class ProcessTest : public WorldTest {
 protected:
  int Code(const std::string& line) { return tools.Run({.line = line}).end.InterpreterCode(); }
  std::string Output(const Program& program) { return tools.Run(program).output.Take().value_or("lost"); }

  Processes tools;
};

TEST_F(ProcessTest, Ends) {
  Write("text", "no program\n");
  const struct {
    Program program;
    Cause cause;
    int code, interpreterCode;
  } rows[] = {
      {Script("exit 3"), Cause::Exited, 3, 3},
      {Script("kill -9 $$"), Cause::EndedBySignal, 9, 137},
      {Script("exit 127"), Cause::Exited, 127, 127},
      {Quiet("cmd /c exit 3"), Cause::Exited, 3, 3},
      {Quiet("cmd /c nowhere-to-be-found"), Cause::NotFound, 127, 127},
      {Quiet("./text"), Cause::NotExecutable, 126, 126},
      {Quiet("exit 130"), Cause::EndedBySignal, SIGINT, 130},
      {Quiet("true " + std::string(200'000, 'x')), Cause::NotStarted, 0, -1},
      {{.words = {"nowhere-to-be-found", "x"}}, Cause::NotFound, 0, 127},
      {{.words = {"./text"}}, Cause::NotExecutable, 0, 126},
  };
  for (const auto& row : rows) {
    const ProcessEnd end = tools.Run(row.program).end;
    const std::string label = (row.program.words.empty() ? row.program.line : row.program.words.back()).substr(0, 40);
    EXPECT_EQ(row.cause, end.cause) << label;
    EXPECT_EQ(row.code, end.code) << label;
    EXPECT_EQ(row.interpreterCode, end.InterpreterCode()) << label;
  }
}

TEST_F(ProcessTest, WhatIsPrinted) {
  const std::string text = Output(Script("head -c 5000000 /dev/zero | tr '\\0' x; echo end"));
  EXPECT_EQ(5000004u, text.size());
  EXPECT_EQ("xend\n", text.substr(text.size() - 5));
}

TEST_F(ProcessTest, OursStaysOurs) {
  std::set<std::string> given;  // to this process
  for (const auto& entry : std::filesystem::directory_iterator("/proc/self/fd")) {
    std::error_code ignored;
    given.insert(std::filesystem::read_symlink(entry, ignored).string());
  }
  tools.Run(Script("true"));
  const int later = dup(STDERR_FILENO);  // not closed by itself when a program begins
  EXPECT_EQ("", Output(Script("cat")));
  std::istringstream held(Output(Script("for n in /proc/self/fd/*; do readlink $n; done | grep -E 'pipe|socket'")));
  std::set<std::string> own;  // of the tool: its output, and that of the loop
  for (std::string name; std::getline(held, name);) {
    if (!given.contains(name)) own.insert(name);
  }
  EXPECT_EQ(2u, own.size());
  EXPECT_EQ("no\n", Output(Script("[ -e /proc/self/fd/" + std::to_string(later) + " ] && echo yes || echo no")));
  close(later);
}

TEST_F(ProcessTest, ManyAtOnce) {
  constexpr int kCount = 150;
  std::map<Processes::Id, int> numbers;
  for (int i = 0; i < kCount; ++i) {
    numbers[tools.Start(Script("echo " + std::to_string(i) + "; exit " + std::to_string(i % 100)))] = i;
  }
  for (int i = 0; i < kCount; ++i) {
    std::optional<Processes::Ended> ended = tools.WaitForAny();
    ASSERT_TRUE(ended);
    const int number = numbers.at(ended->id);
    EXPECT_EQ(number % 100, ended->end.code);
    EXPECT_EQ(std::to_string(number) + "\n", ended->output.Take());
  }
  EXPECT_FALSE(tools.WaitForAny());
}

TEST_F(ProcessTest, WaitsNoLongerThanIsSaid) {
  const Processes::Id slow = tools.Start(Script("sleep 30"));
  EXPECT_FALSE(tools.WaitForAny(0));
  EXPECT_FALSE(tools.WaitForAny(20));
  EXPECT_EQ("quick\n", Output(Script("echo quick")));
  EXPECT_EQ(1u, tools.RunningCount());
  tools.EndAll();
  const std::optional<Processes::Ended> ended = tools.WaitForAny(0);
  ASSERT_TRUE(ended);
  EXPECT_EQ(slow, ended->id);
  EXPECT_EQ(Cause::EndedBySignal, ended->end.cause);
}

bool IsGone(const std::string& process) {
  for (int i = 0; i < 3000; ++i) {
    std::string state;
    if (!ReadFile("/proc/" + process + "/stat", state, Readable::AnyFile) || state.find(") Z ") != state.npos)
      return true;
    usleep(1000);
  }
  return false;
}

// What a tool leaves behind is not waited for; what is ended takes all that it started along, and what a killed tool
// started is ended, but not what another one works with.
TEST_F(ProcessTest, Children) {
  const std::string left = Output(Script("sleep 30 & echo $!"));
  EXPECT_EQ(0, kill(std::stoi(left), SIGKILL));

  tools.Start(Script("(sleep 30 & echo $! > other) ; touch ready; sleep 30"));
  while (!FileExists("ready")) usleep(1000);
  tools.Run(Script("(trap '' TERM; sleep 30) & echo $! > killed; kill -9 $$"));
  EXPECT_TRUE(IsGone(ReadText("killed").substr(0, ReadText("killed").size() - 1)));
  const std::string other = ReadText("other").substr(0, ReadText("other").size() - 1);
  EXPECT_EQ(0, kill(std::stoi(other), 0));
  tools.EndAll();
  EXPECT_EQ(0u, tools.RunningCount());
  EXPECT_TRUE(IsGone(other));
}

// --- Lines for the command interpreter

// A line that needs no shell is run without one; 2>&1 needs it.
TEST_F(ProcessTest, TheSameWithAShellAndWithout) {
  WriteProgram("bin/show", "for word; do printf '<%s>' \"$word\"; done\nexit 5\n");
  std::filesystem::create_directory("bin/folder");
  SetEnvironment("PATH", "bin:/bin:/usr/bin");
  int plainCount = 0;
  for (const std::string line :
       {R"(show a  "b c" "" x"y"z)", R"(cmd /c show \"a\" "b\"c" d\e "f\g" h\)",
        R"("show" 'x' $HOME ~ {a,b} [x]* #c !)", "show \t a\n b \xc3\xa4", R"(show "a;b|c<d>e" 3>x)", "A=b show x",
        "show \"open", "echo \\t", "if x", "folder", "nowhere x", "bin/show z", "./bin/folder"}) {
    auto ended = tools.Run(Quiet(line)), expected = tools.Run(Quiet(line + " 2>&1"));
    EXPECT_EQ(expected.output.Take(), ended.output.Take()) << line;
    EXPECT_EQ(expected.end.InterpreterCode(), ended.end.InterpreterCode()) << line;
    plainCount += WordsWithoutInterpreter(line).empty() ? 0 : 1;
  }
  EXPECT_EQ(6, plainCount);
}

TEST_F(ProcessTest, CompilerOfTheGccFamily) {
  WriteProgram("bin/gcc", "exit 7\n");
  SetEnvironment("PATH", "bin:/bin:/usr/bin");
  EXPECT_EQ(7, Code("cmd /c gcc-4 x"));  // where no gcc-4 is on the path, gcc serves
  std::filesystem::rename("bin/gcc", "bin/gcc-4");
  EXPECT_EQ(7, Code("gcc-4 x"));
  EXPECT_EQ(FindProgram("bin/gcc-4"), FindProgram("gcc-4"));
  EXPECT_EQ(std::filesystem::current_path() / "bin/gcc-4", FindProgram("gcc-4"));
  EXPECT_EQ("", FindProgram("gcc-5") + FindProgram("none/gcc-4"));
}

TEST_F(ProcessTest, BatchFile) {
  Write("a/mark.bat", "@echo Updated %TIME% %DATE% >\"mark.dep\"\n");
  EXPECT_EQ(0, Code("cmd /c \"a\\mark.bat\""));
  const std::string content = Read("mark.dep");
  EXPECT_EQ(0u, content.find("Updated "));
  EXPECT_EQ(std::string::npos, content.find('%'));
  RemoveFile("a/mark.bat");
  EXPECT_NE(0, Code("cmd /c \"a\\mark.bat\""));
}

}  // namespace

}  // namespace qrex::platform
