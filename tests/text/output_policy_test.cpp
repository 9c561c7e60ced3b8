// How files reach the disk: what is skipped, what is replaced, read-only flags, and the lines about it; timing lines.

#include "text/output_policy.h"

#include <unistd.h>

#include <regex>

#include "platform/system.h"
#include "text/beside_file.h"
#include "text/scope_timer.h"
#include "world_fixture.h"

namespace qrex {
namespace {

class OutputPolicyTest : public WorldTest {
 protected:
  int WriteText(const std::string& text, const std::string& path) {
    MemoryTextWriter writer;
    writer << text;
    return WriteIfChanged(settings.leftovers, writer, path);
  }
  static size_t PartCount() {
    size_t count = 0;
    for (const auto& entry : std::filesystem::directory_iterator(".")) count += entry.path().extension() == ".part";
    return count;
  }
  static bool IsReadOnly(const std::string& path) {
    return (std::filesystem::status(path).permissions() & std::filesystem::perms::owner_write) ==
           std::filesystem::perms::none;
  }
  static void SetAge(const std::string& path, int seconds) {
    SetStamp(path, std::filesystem::file_time_type::clock::now() - std::chrono::seconds(seconds));
  }
};

TEST_F(OutputPolicyTest, WritesWhatDiffers) {
  EXPECT_EQ(1, WriteText("a\nb\n", "x"));
  EXPECT_EQ("a\r\nb\r\n", Read("x"));
  EXPECT_EQ(0, WriteText("a\nb\n", "x"));
  Write("x", "a\rb\n");
  EXPECT_EQ(0, WriteText("a\nb\n", "x"));
  EXPECT_EQ("a\rb\n", Read("x"));
  EXPECT_EQ(1, WriteText("a\nb", "x"));
  EXPECT_EQ("Writing x\nSkipping x\nSkipping x\nWriting x\n", trace);
  for (const char* other : {"a\r\nb\r", "a\nb\r\r", "a\rb\rc", "a\r\n", "", "b\nb"}) {
    Write("x", other);
    EXPECT_EQ(1, WriteText("a\nb", "x")) << other;
  }
  TakeTrace();
  EXPECT_EQ(1, WriteText("", "empty"));
  EXPECT_EQ(0, WriteText("", "empty"));
  EXPECT_EQ("Writing empty\nSkipping empty\n", trace);
  EXPECT_EQ(1, WriteText("a", std::string(255, 'n')));  // there is no room beside it for its name and more
}

// Writers of one name do not meet, and a sweep takes what nobody holds, whatever its name says of a process.
TEST_F(OutputPolicyTest, ASweepLeavesWhatIsBeingWritten) {
  BesideFile first("x"), second("x");
  EXPECT_NE(first.Path(), second.Path());
  const std::string own = "y.qrex-" + std::to_string(getpid()) + ".part";
  Write(own, "half");
  LeftoverSweep().Beside("x");
  EXPECT_TRUE(FileExists(first.Path()) && FileExists(second.Path()));
  EXPECT_FALSE(FileExists(own));
  Write("y.part", "of the user");
  { const BesideFile abandoned("x"); }
  LeftoverSweep().Beside("x");
  EXPECT_EQ(3u, PartCount());
}

TEST_F(OutputPolicyTest, EachRunSweepsAFolderOnce) {
  constexpr char kLeftover[] = "y.qrex-4194305.part";
  for (int run = 0; run < 2; ++run) {
    LeftoverSweep leftovers;
    for (const bool isFirst : {true, false}) {
      Write(kLeftover, "half");
      leftovers.Beside("x");
      EXPECT_EQ(isFirst, !FileExists(kLeftover)) << run;
    }
  }
}

TEST_F(OutputPolicyTest, ReportsWhatCannotBeWritten) {
  Write("flagged", "old");
  ChangeReadOnly("flagged", true);
  EXPECT_EQ(0, WriteText("new", "flagged"));
  EXPECT_EQ(0, WriteText("new", "none/x"));
  std::filesystem::create_directories("folder");
  EXPECT_EQ(0, WriteText("new", "folder"));
  const std::string tooLong(256, 'n');
  EXPECT_EQ(0, WriteText("new", tooLong));
  EXPECT_EQ(
      "Writing flagged\nError: File error (flagged) : " + SentenceOf(5) +
          "\nWriting none/x\nError: File error (none/x) : " + SentenceOf(platform::WriteFile("none/x", "").Code()) +
          "\nWriting folder\nError: File error (folder) : " + SentenceOf(5) + "\nWriting " + tooLong +
          "\nError: File error (" + tooLong + ") : " + SentenceOf(platform::WriteFile(tooLong, "").Code()) + "\n",
      trace);
  EXPECT_EQ("old", Read("flagged"));
  EXPECT_EQ(0u, PartCount());
}

// In memory, beside its place once it is long, and in lines that are longer than any buffer.
TEST_F(OutputPolicyTest, GeneratedTextIsIndentedAndItsLinesEndOnTheWay) {
  const size_t kLengths[] = {0, 1, 50, 4094, 4095, 4096, 5000, 64 << 10, 70000, 0, 255 << 10, 300000, 7};
  for (size_t lines : {size_t{7}, std::size(kLengths)}) {
    GeneratedFile generated(settings.leftovers, "target");
    std::string expected;
    {
      TextWriter writer(generated);
      writer << "\nbegin\n";
      const IndentScope indent(writer, 3);
      for (size_t i = 0; i < lines; ++i) {
        const std::string line(kLengths[i], static_cast<char>('a' + i));
        writer << line << "\n";
        expected.append("   ").append(line).append("\r\n");
      }
      writer << "rest";
    }
    expected = "\r\nbegin\r\n" + expected + "   rest";
    EXPECT_EQ(expected, generated.Text());
    generated.Commit();
    EXPECT_EQ(expected, Read("target"));
  }
}

TEST_F(OutputPolicyTest, CopiesWhatIsNewer) {
  Write("from", "1");
  SetAge("from", 100);
  EXPECT_TRUE(CopyIfNewer(settings.leftovers, "from", "to/a/b", true));
  EXPECT_EQ("1", Read("to/a/b"));
  EXPECT_TRUE(IsReadOnly("to/a/b"));
  EXPECT_GT(LastWriteTime("to/a/b"), LastWriteTime("from") + 90 * 10000000ll);  // the copy is of now
  Write("from", "2");
  SetAge("from", 50);
  EXPECT_TRUE(CopyIfNewer(settings.leftovers, "from", "to/a/b", false));
  EXPECT_EQ("1", Read("to/a/b"));
  SetAge("from", -1);
  EXPECT_TRUE(CopyIfNewer(settings.leftovers, "from", "to/a/b", false));
  EXPECT_EQ("2", Read("to/a/b"));
  EXPECT_FALSE(IsReadOnly("to/a/b"));
  EXPECT_TRUE(CopyIfNewer(settings.leftovers, "none", "to/a/c", false));
  EXPECT_FALSE(FileExists("to/a/c"));
  EXPECT_EQ("", trace);
  EXPECT_FALSE(CopyIfNewer(settings.leftovers, "from", "to/a", false));
  EXPECT_EQ("...Copy file failed\n", trace);
}

// What the stamps cannot tell the contents do: within a tick, or in a step of a file system that keeps whole seconds.
TEST_F(OutputPolicyTest, CopiesWhatDiffersWhereStampsAreNear) {
  const auto set = [](const std::string& path, std::chrono::milliseconds behind) {
    const auto second = std::chrono::floor<std::chrono::seconds>(std::filesystem::file_time_type::clock::now());
    const auto even = second - std::chrono::seconds(100 + second.time_since_epoch().count() % 2);
    SetStamp(path, even + behind);
  };
  const struct {
    int source, target;  // milliseconds behind an even second
    bool isCopied;
  } kRows[] = {{50, 50, true}, {50, 55, true}, {50, 100, false}, {0, 1900, true}, {0, 2100, false}, {1000, 1000, true}};
  for (const auto& row : kRows) {
    for (const char* text : {"new", "longer"}) {
      Write("from", text);
      Write("to", "old");
      set("from", std::chrono::milliseconds(row.source));
      set("to", std::chrono::milliseconds(row.target));
      EXPECT_TRUE(CopyIfNewer(settings.leftovers, "from", "to", true));
      EXPECT_EQ(row.isCopied ? text : "old", Read("to")) << row.source << " " << row.target;
      if (!row.isCopied) continue;
      const int64_t copied = LastWriteTime("to");  // the same now: nothing is done
      SetReadOnly("to", false);
      set("to", std::chrono::milliseconds(row.source));
      EXPECT_TRUE(CopyIfNewer(settings.leftovers, "from", "to", true));
      EXPECT_FALSE(IsReadOnly("to") || LastWriteTime("to") >= copied);
    }
  }
  // What can't be looked for is told.
  EXPECT_FALSE(CopyIfNewer(settings.leftovers, "from/x", "to", false));
  EXPECT_EQ("...Copy file failed\n", trace);
}

}  // namespace
}  // namespace qrex
