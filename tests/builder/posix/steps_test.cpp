// Commands of tools as they are told of, and the steps of a build as a scheduler carries them out.

#include <csignal>

#include "builder/scheduler.h"
#include "message_of.h"
#include "world_fixture.h"

namespace qrex {

namespace {

class StepsTest : public WorldTest {
 protected:
  StepsTest() {
    PutToolsOnPath();
    settings.compiler = CompilerKind::gcc;
  }

  CommandResult Run(const Command& command) {
    StartCommand(settings.tools, command);
    return EndCommand(command, *settings.tools.WaitForAny());
  }
};

// --- Commands

TEST_F(StepsTest, CommandsAnswerAsTheOptionsSay) {
  ASSERT_EQ(3, Run({.line = "cmd /c exit 3"}).ReturnCode());
  ASSERT_EQ("", trace);
  WriteProgram("tools/both", "printf 'a\\r\\nb'\nprintf oops >&2\n");
  Write("out1.txt", "of an earlier run");
  CommandResult both = Run({.line = "both", .capturesOutput = true, .capturesErrors = true});
  ASSERT_EQ("a\nb|oops|oops\n", both.output + "|" + both.errors + "|" + TakeTrace());
  ASSERT_FALSE(FileExists("out1.txt") || FileExists("out2.txt"));
  both = Run({.line = "both", .echo = true, .capturesOutput = true, .errorsIntoOutput = true});
  ASSERT_EQ("a\nboops|both 1>out1.txt 2>&1\n", both.output + "|" + TakeTrace());
  both = Run({.line = "both", .capturesOutput = true, .capturesErrors = true, .failOnErrorText = true});
  ASSERT_FALSE(both.succeeded);
  ASSERT_EQ("both 1>out1.txt 2>out2.txt\noops\n", trace);
}

TEST_F(StepsTest, CommandsThatFail) {
  WriteProgram("tools/dies", "kill -ABRT $$\n");
  Write("plain", "");
  const std::pair<Command, const char*> cases[] = {
      {{.line = "exit 7"}, "exit 7\nReturn code : 7\n"},
      {{.line = "exit 7", .echo = true}, "exit 7\nReturn code : 7\n"},
      {{.line = "cmd /c nosuch x 2>/dev/null"},
       "ERROR: nosuch was not found on PATH\ncmd /c nosuch x 2>/dev/null\nReturn code : 127\n"},
      {{.line = "dies"}, "ERROR: dies was ended by signal 6\ndies\nReturn code : 134\n"},
      {{.line = "./plain 2>/dev/null"}, "ERROR: ./plain cannot be executed\n./plain 2>/dev/null\nReturn code : 126\n"},
  };
  for (auto [command, expected] : cases) {
    command.failOnNonZero = true;
    EXPECT_FALSE(Run(command).succeeded) << command.line;
    EXPECT_EQ(expected, TakeTrace());
  }
}

// --- Steps

// What a step is told and tells, in order: one of several commands, each of which ends with its status.
class NotedStep : public BuildStep {
 public:
  NotedStep(std::string& notes, char name, std::vector<std::string> lines)
      : m_notes(notes), m_name(name), m_lines(std::move(lines)) {}
  std::optional<Command> Prepare() override {
    if (m_next == m_lines.size()) return std::nullopt;
    m_notes.append(1, m_name).append("+ ");
    return Command{.line = m_lines[m_next++]};
  }
  void Finish(const CommandResult& result) override {
    m_notes.append(1, m_name).append(std::to_string(result.ReturnCode())).append(" ");
    m_hasSucceeded = result.ReturnCode() == 0;
  }

 private:
  std::string& m_notes;
  const char m_name;
  const std::vector<std::string> m_lines;
  size_t m_next = 0;
};

TEST_F(StepsTest, StepsAreFinishedInTheirOrder) {
  // The first ends last, once the third has begun.
  WriteProgram("tools/await", "while [ ! -e c ]; do sleep 0.01; done; exit 3\n");
  const std::pair<int, const char*> cases[] = {{1, "a+ a0 a! b+ b5 b? c+ c0 c+ c0 c! "},
                                               {3, "a+ b+ c+ a3 a? b5 b? c0 c+ c0 c! "}};
  for (const auto& [slots, expected] : cases) {
    DeleteFile("c");
    std::string notes;
    settings.jobs = slots;
    Scheduler scheduler(settings);
    auto add = [&](char name, std::vector<std::string> lines) {
      scheduler.Add(std::make_unique<NotedStep>(notes, name, std::move(lines)),
                    [&notes, name](bool succeeded) { notes.append(1, name).append(succeeded ? "! " : "? "); });
    };
    add('a', {slots == 1 ? "true" : "await"});
    add('b', {"exit 5"});
    add('c', {"touch c", "true"});
    scheduler.WaitForAll();
    EXPECT_EQ(expected, notes);
  }
}

TEST_F(StepsTest, AnInterruptEndsAllSteps) {
  std::signal(SIGINT, SIG_DFL);  // what a shell runs in the background ignores it
  WriteProgram("tools/writes", "echo half > \"$1\"; sleep 30\n");
  WriteProgram("tools/stopped", "while [ ! -e y ]; do sleep 0.01; done; kill -INT $$\n");
  std::string notes;
  settings.jobs = 3;
  Scheduler scheduler(settings);
  EXPECT_EQ("Interrupted while running stopped", MessageOf([&] {
              for (const char* line : {"stopped", "writes x", "writes y"}) {
                scheduler.Add(std::make_unique<NotedStep>(notes, 'x', std::vector<std::string>{line}), [](bool) {});
              }
              scheduler.WaitForAll();
            }));
  EXPECT_EQ(0u, settings.tools.RunningCount());
  EXPECT_EQ("x+ x+ x+ ", notes);
}

}  // namespace

}  // namespace qrex
