// Programs started side by side: what they print, how they end, what they are given of this process; and lines for the
// command interpreter.

#include "platform/process.h"

#include <chrono>
#include <csignal>
#include <map>
#include <thread>

#include "platform/file_system.h"
#include "platform/interpreter.h"
#include "platform/peer_process.h"
#include "platform/windows/api.h"
#include "platform/windows/interpreter.h"
#include "world_fixture.h"

namespace qrex::platform {

namespace {

using Cause = ProcessEnd::Cause;
using Stream = Program::Stream;

Program Steps(std::vector<std::string> steps) {
  steps.insert(steps.begin(), QREX_STAND_IN);
  return {.words = std::move(steps), .output = Stream::Captured, .errorsIntoOutput = true};
}
Program Quiet(std::string line) {
  return {.line = std::move(line), .output = Stream::Captured, .errorsIntoOutput = true};
}

class ProcessTest : public WorldTest {
 protected:
  std::string Output(const Program& program) { return tools.Run(program).output.Take().value_or("lost"); }

  ProcessTest() { PutToolsOnPath(); }
  Processes tools;
};

TEST_F(ProcessTest, Ends) {
  WriteProgram("tools/five", "exit 5\n");
  Write("tools/batch.bat", "@exit 6\r\n");
  Write("text.exe", "no program\n");
  const std::string long32k(40'000, 'x');
  const struct {
    Program program;
    Cause cause;
    int code, interpreterCode;
  } rows[] = {
      {Steps({"exit", "3"}), Cause::Exited, 3, 3},
      {Steps({"exit", "127"}), Cause::Exited, 127, 127},
      {Steps({"crash"}), Cause::EndedBySignal, static_cast<int>(0xC0000005), static_cast<int>(0xC0000005)},
      {Steps({"stop"}), Cause::EndedBySignal, SIGINT, static_cast<int>(0xC000013A)},
      {Steps({"exit", long32k}), Cause::NotStarted, 0, -1},
      {Quiet("cmd /c exit 3"), Cause::Exited, 3, 3},
      {Quiet("cmd /c five a b"), Cause::Exited, 5, 5},
      {Quiet("five 1>nul"), Cause::Exited, 5, 5},
      {Quiet("cmd /c batch"), Cause::Exited, 6, 6},
      {Quiet("five " + long32k), Cause::NotStarted, 0, -1},
      {{.words = {"nowhere-to-be-found", "x"}}, Cause::NotFound, 0, 9009},
      {{.words = {"batch", "x"}}, Cause::Exited, 6, 6},
  };
  for (const auto& row : rows) {
    const ProcessEnd end = tools.Run(row.program).end;
    const std::string label = (row.program.words.empty() ? row.program.line : row.program.words.back()).substr(0, 40);
    EXPECT_EQ(row.cause, end.cause) << label;
    EXPECT_EQ(row.code, end.code) << label;
    EXPECT_EQ(row.interpreterCode, end.InterpreterCode()) << label;
  }
  EXPECT_EQ(Cause::NotFound, tools.Run(Quiet("cmd /c nowhere-to-be-found")).end.cause);
  EXPECT_EQ("exception 0xC0000005", tools.Run(Steps({"crash"})).end.EndedBy());
}

TEST_F(ProcessTest, StreamsKeepTheirOrder) {
  Program program = Steps({"out", "1", "+", "err", "2", "+", "out", "3"});
  EXPECT_EQ("1\n2\r\n3\n", Output(program));
  program.errorsIntoOutput = false;
  program.errors = Stream::Captured;
  Processes::Ended apart = tools.Run(program);
  EXPECT_EQ("1\n3\n", apart.output.Take());
  EXPECT_EQ("2\r\n", apart.errors.Take());
}

TEST_F(ProcessTest, WhatIsPrinted) {
  const std::string text = Output(Steps({"large", "5000000", "+", "out", "end"}));
  EXPECT_EQ(5000004u, text.size());
  EXPECT_EQ("xend\n", text.substr(text.size() - 5));
  EXPECT_EQ(".", Output(Steps({"read"})));                                      // standard input is empty
  const std::string decoded = Output(Steps({"bytes", "84", "+", "out", "x"}));  // no UTF-8, in whatever code page
  EXPECT_TRUE(decoded.ends_with("x\n"));
  EXPECT_NE("\x84x\n", decoded);
}

// Words reach the program as they are, and so does what stands in a line, with an interpreter and without.
TEST_F(ProcessTest, Words) {
  EXPECT_EQ("<a b><><\"><\\\"><c\\><d e\\><%PATH%><^&|<>><x>",
            Output(Steps({"words", "a b", "", "\"", "\\\"", "c\\", "d e\\", "%PATH%", "^&|<>", "x"})));
  std::filesystem::create_directory("tools");
  std::filesystem::copy_file(QREX_STAND_IN, "tools/my_stand_in.exe");
  const std::string line = R"(cmd /c my_stand_in words "a;b|c<d>e" a&b ^x (y))";
  const std::string expected = "<a;b|c<d>e><a&b><^x><(y)>";
  EXPECT_EQ(expected + "<%TEMP%><100%>", Output(Quiet(line + R"( %TEMP% "100%")")));
  EXPECT_EQ(expected, Output(Quiet(line + " 2>&1")));
  EXPECT_EQ(R"(show "a|b" 2>&1 1>x a^&b "100"^%"")", ForInterpreter(R"(show "a|b" 2>&1 1>x a&b "100%")"));
}

TEST_F(ProcessTest, Peers) {
  EXPECT_FALSE(PeerProcess({"nowhere-to-be-found"}).IsStarted());
  PeerProcess peer({QREX_STAND_IN, "answer"});
  ASSERT_TRUE(peer.IsStarted() && peer.Write("one\n"));
  std::string answers;
  while (answers.size() < 4 && peer.Read(answers)) {
  }
  EXPECT_EQ("one!", answers);
  std::thread waits([&] {
    while (peer.Read(answers)) {
    }
  });
  peer.CloseStreams();
  waits.join();
  EXPECT_EQ("one!", answers);
}

TEST_F(ProcessTest, OursStaysOurs) {
  SECURITY_ATTRIBUTES inherited = {sizeof inherited, nullptr, TRUE};
  const Handle ours(CreateEventW(&inherited, TRUE, FALSE, nullptr));
  EXPECT_EQ("none", Output(Steps({"handle", std::to_string(AsNumber(ours.Get()))})));
}

TEST_F(ProcessTest, ManyAtOnce) {
  constexpr int kCount = 150;
  std::map<Processes::Id, int> numbers;
  for (int i = 0; i < kCount; ++i) {
    numbers[tools.Start(Steps({"sleep", "500", "+", "out", std::to_string(i), "+", "exit", std::to_string(i % 100)}))] =
        i;
  }
  EXPECT_EQ(size_t{kCount}, tools.RunningCount());
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
  const Processes::Id slow = tools.Start(Steps({"sleep", "30000"}));
  EXPECT_FALSE(tools.WaitForAny(0));
  EXPECT_FALSE(tools.WaitForAny(20));
  EXPECT_EQ("quick\n", Output(Steps({"out", "quick"})));
  EXPECT_EQ(1u, tools.RunningCount());
  tools.EndAll();
  const std::optional<Processes::Ended> ended = tools.WaitForAny(0);
  ASSERT_TRUE(ended);
  EXPECT_EQ(slow, ended->id);
  EXPECT_EQ(Cause::EndedBySignal, ended->end.cause);
  EXPECT_EQ("this program", ended->end.EndedBy());
}

bool Runs(const std::string& file) {
  const Handle process(OpenProcess(SYNCHRONIZE, FALSE, static_cast<DWORD>(std::stoul(World::ReadText(file)))));
  constexpr DWORD kMoment = 500;
  return process && WaitForSingleObject(process.Get(), kMoment) == WAIT_TIMEOUT;
}

// What a tool leaves behind is not waited for; what is ended takes all that it started along.
TEST_F(ProcessTest, Children) {
  const auto begin = std::chrono::steady_clock::now();
  tools.Run(Steps({"start", "left"}));
  EXPECT_LT(std::chrono::steady_clock::now() - begin, std::chrono::seconds(10));
  EXPECT_TRUE(Runs("left"));
  const Handle left(OpenProcess(PROCESS_TERMINATE, FALSE, static_cast<DWORD>(std::stoul(ReadText("left")))));
  TerminateProcess(left.Get(), 0);

  tools.Start(Steps({"start", "child", "+", "touch", "ready", "+", "sleep", "30000"}));
  while (!FileExists("ready")) Sleep(1);
  EXPECT_TRUE(Runs("child"));
  tools.EndAll();
  EXPECT_EQ(0u, tools.RunningCount());
  EXPECT_FALSE(Runs("child"));
  tools.Run(Steps({"start", "orphan", "+", "crash"}));
  EXPECT_FALSE(Runs("orphan"));
}

TEST_F(ProcessTest, CompilerOfTheGccFamily) {
  WriteProgram("tools/gcc", "exit 7\n");
  EXPECT_EQ(7, tools.Run(Quiet("cmd /c gcc-4 x")).end.code);  // where no gcc-4 is on the path, gcc serves
  std::filesystem::rename("tools/gcc.exe", "tools/gcc-4.exe");
  EXPECT_NE("", FindProgram("gcc-4"));
  EXPECT_EQ(FindProgram("tools/gcc-4.EXE").size(), FindProgram("gcc-4").size());
  EXPECT_EQ("", FindProgram("gcc-5") + FindProgram("none/gcc-4"));
}

TEST_F(ProcessTest, BatchFile) {
  Write("a/mark.bat", "@echo Updated %TIME% %DATE% >\"mark.dep\"\r\n");
  EXPECT_EQ(0, tools.Run({.line = "cmd /c \"a\\mark.bat\""}).end.InterpreterCode());
  const std::string content = Read("mark.dep");
  EXPECT_EQ(0u, content.find("Updated "));
  EXPECT_EQ(std::string::npos, content.find('%'));
  EXPECT_NE(0, tools.Run(Quiet("cmd /c \"a\\none.bat\"")).end.InterpreterCode());
}

}  // namespace

}  // namespace qrex::platform
