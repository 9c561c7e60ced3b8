// Files as POSIX systems have them: pipes and devices among them, and limits of their sizes.

#include <sys/resource.h>
#include <sys/stat.h>

#include "platform/system.h"
#include "text/output_policy.h"
#include "world_fixture.h"

namespace qrex {
namespace {

using PosixFilesTest = WorldTest;

// Beyond a limit of file sizes, as on a full disk: within the text, and in the last bytes, which only the close writes.
TEST_F(PosixFilesTest, WhatIsGeneratedIsCommittedWholeOrNotAtAll) {
  platform::SetSignals();
  rlimit before;
  getrlimit(RLIMIT_FSIZE, &before);
  const std::string text(300 << 10, 't');
  for (rlim_t missing : {rlim_t{1}, rlim_t{100 << 10}}) {
    Write("target", "old");
    const rlimit limit{text.size() - missing, before.rlim_max};
    setrlimit(RLIMIT_FSIZE, &limit);
    {
      GeneratedFile generated(settings.leftovers, "target");
      generated.Write(text.data(), text.size());
      generated.Write(text.data(), 0);
      EXPECT_THROW(generated.Commit(), FileException) << missing;
    }
    setrlimit(RLIMIT_FSIZE, &before);
    EXPECT_EQ("old", Read("target"));
    for (const auto& entry : std::filesystem::directory_iterator(".")) EXPECT_NE(".part", entry.path().extension());
  }
}

TEST_F(PosixFilesTest, WhatIsNoPlainFile) {
  const std::string pipe = "pipe", link = "link";
  ASSERT_EQ(0, mkfifo(pipe.c_str(), 0666));
  Write("file", "text");
  std::filesystem::create_symlink("file", link);
  FileTimes times;
  for (const std::string& path : {pipe, std::string("/dev/null")}) {
    EXPECT_FALSE(FileExists(path) || FileLookup().Exists(path)) << path;
    EXPECT_EQ(0, LastWriteTime(path)) << path;
    EXPECT_EQ(0, times.LastWriteTime(path)) << path;
    EXPECT_EQ("no file " + path, Read(path));
    EXPECT_FALSE(CopyFile(path, "to", false) || File().Open(path, FileMode::ReadBinary)) << path;
  }
  EXPECT_TRUE(FileExists(link) && LastWriteTime(link) != 0);
  ReplaceFile(pipe, "text");
  EXPECT_EQ("text", Read(pipe));
  std::string text = "old";
  EXPECT_TRUE(LoadStream(text, "/dev/null"));
  EXPECT_EQ("", text);
}

}  // namespace
}  // namespace qrex
