// Paths as text, files, directories, identifiers.

#include "text/files.h"

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <filesystem>

#include "platform/error.h"
#include "platform/system.h"
#include "text/guid.h"
#include "text/output_policy.h"
#include "text/paths.h"
#include "text/scope_timer.h"

namespace qrex {

TEST(PathsTest, Parts) {
  EXPECT_TRUE(IsAbsolutePath("/a") && IsAbsolutePath("c:/a"));
  EXPECT_FALSE(IsAbsolutePath("c:/") || IsAbsolutePath("a/b") || IsAbsolutePath("") || IsAbsolutePath("c:\\a"));
  EXPECT_EQ("c.h", FileNameOf("a/b/c.h"));
  EXPECT_EQ("c.h", FileNameOf("c.h"));
  EXPECT_EQ("", FileNameOf("a/"));
  std::string out = "old";
  EXPECT_TRUE(StemOf("a.b/c.d.h", out));
  EXPECT_EQ("c.d", out);
  EXPECT_FALSE(StemOf("dir/.hidden", out) || StemOf("dir/name", out) || StemOf("a.b/name", out));
  EXPECT_EQ("c.d", out);
  EXPECT_EQ("a/b/", NormalisePath("a\\b\\\\"));
  EXPECT_EQ("", NormalisePath("/"));
  EXPECT_TRUE(HasExtension("a/b.CPP", "cpp"));
  EXPECT_FALSE(HasExtension("a/cpp", "cpp"));
  EXPECT_TRUE(ReplaceExtension("a/b.c.cpp", "o", out));
  EXPECT_EQ("a/b.c.o", out);
  EXPECT_FALSE(ReplaceExtension("a/b", "o", out));
  EXPECT_TRUE(StartsWithIgnoringCase("ABc", "ab") && EqualIgnoringCase("a[", "A["));
  EXPECT_FALSE(StartsWithIgnoringCase("a", "ab") || EqualIgnoringCase("[", "{"));
  MemoryTextWriter writer;
  ToBackslashes(writer, "a/b/c");
  EXPECT_EQ("a\\b\\c", writer.TakeText());
}

TEST(PathsTest, Join) {
  EXPECT_EQ("b", PathJoin("", "b"));
  EXPECT_EQ("b", PathJoin(".", "b"));
  EXPECT_EQ("/b", PathJoin("a", "/b"));
  EXPECT_EQ("a", PathJoin("a", "."));
  EXPECT_EQ("a/b", PathJoin("a", "b"));
  EXPECT_EQ("a/c", PathJoin("a/b", "../c"));
  EXPECT_EQ("c", PathJoin("a", "../c"));
  EXPECT_EQ("../c", PathJoin("a", "../../c"));
  EXPECT_EQ("../../c", PathJoin("..", "../c"));
  EXPECT_EQ("a", PathJoin("a/b", ".."));
  EXPECT_EQ("", PathJoin("a", ".."));
  EXPECT_EQ("a/d", PathJoin3("a/b", "../c", "../d"));
}

TEST(PathsTest, Relative) {
  EXPECT_EQ("../../b/c", RelativePath("a/b/c", "a/d/e"));
  EXPECT_EQ("../b", RelativePath("a/b", "a/b"));
  EXPECT_EQ("x/y", RelativePath("x/y", "p/q"));
  EXPECT_EQ(".", RelativePath("", ""));
  EXPECT_EQ("c", RelativePath("A/b/c", "a/B/"));
  EXPECT_EQ("../c", RelativePath("a/c", "a/b"));
}

class FilesTest : public ::testing::Test {
 protected:
  FilesTest() : root(::testing::TempDir() + "/qrex_files") { std::filesystem::remove_all(root); }
  ~FilesTest() override { std::filesystem::remove_all(root); }
  std::string Make(const std::string& name, const std::string& content) {
    const std::string path = root + "/" + name;
    CreateDirectories(path, false);
    ReplaceFile(path, content);
    return path;
  }
  static std::string Content(const std::string& path) {
    std::string content;
    return ReadWholeFile(content, path) ? content : "none";
  }
  const std::string root;
};

TEST_F(FilesTest, Directories) {
  CreateDirectories(root + "/a/b/c.txt", false);
  EXPECT_TRUE(std::filesystem::is_directory(root + "/a/b"));
  EXPECT_FALSE(std::filesystem::exists(root + "/a/b/c.txt"));
  CreateDirectories(root + "/a/d", true);
  Make("a/.h", "");
  Make("a/z", "four");
  std::string list;
  uint32_t sizes = 0;
  FileOrDirIterator entries(root + "/a/*");
  while (const IFileOrDirInfo* entry = entries.Next()) {
    list += entry->Name() + (entry->IsDirectory() ? "/" : "") + (entry->IsHidden() ? "h" : "") + " ";
    sizes += entry->IsDirectory() ? 0 : entry->SizeLow();
  }
  EXPECT_EQ("./h ../h .hh b/ d/ z ", list);
  EXPECT_EQ(4u, sizes);
  EXPECT_EQ(nullptr, FileOrDirIterator(root + "/none/*").Next());
  EXPECT_FALSE(FileExists(root + "/a"));
  EXPECT_EQ(0, LastWriteTime(root + "/a"));
  FileTimes times;
  EXPECT_EQ(0, times.LastWriteTime(root + "/a"));
  EXPECT_EQ(LastWriteTime(root + "/a/z"), times.LastWriteTime(root + "/a/z"));
  EXPECT_EQ(0, times.LastWriteTime(root + "/none/z"));
}

TEST_F(FilesTest, Operations) {
  const std::string path = root + "/f";
  EXPECT_FALSE(FileExists(path));
  EXPECT_EQ(0, LastWriteTime(path));
  EXPECT_FALSE(TouchFile(path, false));
  CreateDirectories(root, true);
  EXPECT_TRUE(CreateEmptyFile(path, false));
  EXPECT_FALSE(CreateEmptyFile(path, false));
  EXPECT_TRUE(CreateEmptyFile(path, true));
  EXPECT_TRUE(FileExists(path));
  EXPECT_TRUE(TouchFile(root + "/g", true));
  EXPECT_NEAR(static_cast<double>(CurrentFileTime()), static_cast<double>(LastWriteTime(root + "/g")), 10e7);
  EXPECT_TRUE(CopyFile(Make("from", "text"), path, false));
  EXPECT_EQ("text", Content(path));
  EXPECT_FALSE(CopyFile(root + "/from", path, true));
  EXPECT_FALSE(CopyFile(root + "/none", path, false));
  EXPECT_TRUE(SetReadOnly(path, true));
  EXPECT_FALSE(TouchFile(path, false) || DeleteFile(path));
  EXPECT_TRUE(SetReadOnly(path, false));
  EXPECT_FALSE(SetReadOnly(root + "/none", true));
  EXPECT_TRUE(DeleteFile(path));
  EXPECT_FALSE(DeleteFile(path));
  std::string full;
  EXPECT_TRUE(FullPathOf(root + "/a/../b/./c", full));
  EXPECT_EQ(root.substr(root.rfind('/')) + "/b/c", full.substr(full.size() - 15));
  EXPECT_FALSE(FullPathOf("", full));
  EXPECT_THROW(FileExists("\xff"), StringConversionException);
}

TEST_F(FilesTest, WhatIsNoPlainFile) {
  CreateDirectories(root, true);
  const std::string pipe = root + "/pipe", link = root + "/link";
  ASSERT_EQ(0, mkfifo(pipe.c_str(), 0666));
  std::filesystem::create_symlink(Make("file", "text"), link);
  FileTimes times;
  for (const std::string& path : {pipe, std::string("/dev/null")}) {
    EXPECT_FALSE(FileExists(path) || FileLookup().Exists(path)) << path;
    EXPECT_EQ(0, LastWriteTime(path)) << path;
    EXPECT_EQ(0, times.LastWriteTime(path)) << path;
    EXPECT_EQ("none", Content(path));
    EXPECT_FALSE(CopyFile(path, root + "/to", false) || File().Open(path, FileMode::ReadBinary)) << path;
  }
  EXPECT_TRUE(FileExists(link) && LastWriteTime(link) != 0);
  ReplaceFile(pipe, "text");
  EXPECT_EQ("text", Content(pipe));
  std::string text = "old";
  EXPECT_TRUE(LoadStream(text, "/dev/null"));
  EXPECT_EQ("", text);
}

TEST_F(FilesTest, TimesOfManyFiles) {  // more than one thread takes at once
  std::vector<std::string> paths;
  std::vector<int64_t> times;
  for (int i = 0; i < 1500; ++i) {
    const std::string name = std::to_string(i % 100) + "/" + std::to_string(i / 100);
    paths.push_back(i % 3 == 0 ? root + "/" + name : Make(name, ""));
    if (i % 3 == 1)
      std::filesystem::last_write_time(paths.back(),
                                       std::filesystem::file_time_type::clock::now() - std::chrono::hours(i));
  }
  paths.push_back(root + "/1");
  for (const std::string& path : paths) times.push_back(LastWriteTime(path));
  EXPECT_EQ(times, LastWriteTimes(paths));
  paths[700] = "\xff";
  EXPECT_THROW(LastWriteTimes(paths), StringConversionException);
}

TEST_F(FilesTest, LineEnds) {
  const std::string path = Make("f", "a\r\rb\r\nc\n\r");
  std::string text;
  EXPECT_TRUE(LoadText(text, path, true));
  EXPECT_EQ("a\n\nb\nc\n\n", text);
  EXPECT_TRUE(LoadText(text, path, false));
  EXPECT_EQ("a\r\rb\r\nc\n\r", text);
  EXPECT_FALSE(LoadText(text, root, true));
  EXPECT_EQ("\r\na\r\n\r\nb", WithCarriageReturns("\na\n\nb"));
}

TEST_F(FilesTest, CheckedFile) {
  const std::string path = Make("f", "");
  std::string payload = "old";
  EXPECT_FALSE(ReadCheckedFile(7, payload, path));
  WriteCheckedFile(7, "123456789", path);
  std::string bytes = Content(path);
  EXPECT_EQ(std::string("\7\0\0\0\x26\x39\xf4\xcb\x09\0\0\0\0\0\0\0", 16) + "123456789", bytes);
  EXPECT_FALSE(ReadCheckedFile(8, payload, path));
  EXPECT_TRUE(ReadCheckedFile(7, payload, path));
  EXPECT_EQ("123456789", payload);
  const auto readsWith = [&](size_t at, char byte) {
    std::string damaged = bytes;
    damaged[at] = byte;
    Make("f", damaged);
    return ReadCheckedFile(7, payload, path);
  };
  EXPECT_FALSE(readsWith(20, 'x') || readsWith(15, '\x80') || readsWith(8, 10) || readsWith(4, 0));
  Make("f", bytes + "behind");
  EXPECT_TRUE(ReadCheckedFile(7, payload, path));
}

TEST_F(FilesTest, FileClass) {
  const std::string path = Make("f", "");
  File file(path, FileMode::WriteBinary);
  file.Write("abc", 3);
  file.Write("", 0);
  EXPECT_EQ(3, file.Length());
  EXPECT_EQ(3, file.Position());
  EXPECT_TRUE(file.IsWritable());
  file.Flush();
  EXPECT_TRUE(file.Open(path, FileMode::ReadText));
  EXPECT_FALSE(file.IsWritable());
  EXPECT_EQ(0, file.Length());
  char bytes[4];
  EXPECT_TRUE(file.Seek(1));
  EXPECT_EQ(2u, file.Read(bytes, 4));
  EXPECT_EQ(0u, file.Read(bytes, 4));
  EXPECT_THROW(file.Write("x", 1), FileException);
  try {
    File none(root + "/none", FileMode::ReadText);
    FAIL();
  } catch (const FileException& exception) {
    EXPECT_EQ("File error (" + root + "/none) : The system cannot find the file specified.", ExceptionText(exception));
  }
}

TEST(ExceptionsTest, PrintedForms) {
  EXPECT_EQ("Operating system error : GetLastError() returned 4711", ExceptionText(SystemException(4711)));
  EXPECT_EQ("File error (p) : The system cannot write to the specified device.", ExceptionText(FileException(29, "p")));
  EXPECT_EQ("m", ExceptionText(LiteralException("m")));
  EXPECT_EQ("String conversion failed", ExceptionText(StringConversionException()));
  EXPECT_EQ("Buffer overflow", ExceptionText(BufferOverflowException()));
  FileExists("/none/none");
  EXPECT_EQ("Operating system error : The system cannot find the file specified.", ExceptionText(SystemException()));
}

TEST(GuidTest, Texts) {
  guid id;
  EXPECT_TRUE(ParseGuid("{01020304-0506-0708-090a-0B0c0d0e0f10}", id));
  const std::array<uint8_t, 16> bytes{4, 3, 2, 1, 6, 5, 8, 7, 9, 10, 11, 12, 13, 14, 15, 16};
  EXPECT_EQ(bytes, id.bytes);
  EXPECT_EQ("{01020304-0506-0708-090A-0B0C0D0E0F10}", GuidText(id));
  const guid before = id;
  for (const char* wrong : {"", "01020304-0506-0708-090a-0B0c0d0e0f10", "{01020304-0506-0708-090a-0B0c0d0e0f1g}",
                            "{01020304-0506-0708-090a-0B0c0d0e0f10} ", "{010203040506-0708-090a--0B0c0d0e0f10}"}) {
    EXPECT_FALSE(ParseGuid(wrong, id)) << wrong;
  }
  EXPECT_EQ(before, id);
  guid greater = id;
  greater.bytes[7] = 0x80;  // the highest byte of the first half
  EXPECT_TRUE(id < greater);
  guid secondHalf = id;
  secondHalf.bytes[15] = 0xff;
  EXPECT_TRUE(id < secondHalf && secondHalf < greater);
  EXPECT_NE(MakeGuid(), MakeGuid());
}

}  // namespace qrex
