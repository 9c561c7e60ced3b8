// Paths as text, files, directories, identifiers.

#include "text/files.h"

#include "platform/error.h"
#include "platform/system.h"
#include "text/file_lookup.h"
#include "text/guid.h"
#include "text/output_policy.h"
#include "text/paths.h"
#include "text/scope_timer.h"
#include "world_fixture.h"

namespace qrex {

TEST(PathsTest, Parts) {
  EXPECT_TRUE(IsAbsolutePath("/a") && IsAbsolutePath("c:/a"));
  EXPECT_FALSE(IsAbsolutePath("c:/") || IsAbsolutePath("a/b") || IsAbsolutePath("") || IsAbsolutePath("c:\\a"));
  EXPECT_TRUE(FileNameOf("a/b/c.h") == "c.h" && FileNameOf("c.h") == "c.h" && FileNameOf("a/").empty());
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
  const std::array<const char*, 3> kRows[] = {{"", "b", "b"},     {".", "b", "b"},          {"a", "/b", "/b"},
                                              {"a", ".", "a"},    {"a", "b", "a/b"},        {"a/b", "../c", "a/c"},
                                              {"a", "../c", "c"}, {"a", "../../c", "../c"}, {"..", "../c", "../../c"},
                                              {"a/b", "..", "a"}, {"a", "..", ""}};
  for (const auto& [base, path, joined] : kRows) EXPECT_EQ(joined, PathJoin(base, path)) << base << " " << path;
  EXPECT_EQ("a/d", PathJoin3("a/b", "../c", "../d"));
}

TEST(PathsTest, Relative) {
  const std::array<const char*, 3> kRows[] = {{"a/b/c", "a/d/e", "../../b/c"}, {"a/b", "a/b", "../b"},
                                              {"x/y", "p/q", "x/y"},           {"", "", "."},
                                              {"A/b/c", "a/B/", "c"},          {"a/c", "a/b", "../c"}};
  for (const auto& [path, base, relative] : kRows) EXPECT_EQ(relative, RelativePath(path, base)) << path << " " << base;
}

using FilesTest = WorldTest;

TEST_F(FilesTest, Directories) {
  CreateDirectories("a/b/c.txt", false);
  EXPECT_TRUE(std::filesystem::is_directory("a/b"));
  EXPECT_FALSE(std::filesystem::exists("a/b/c.txt"));
  CreateDirectories("a/d", true);
  Write("a/.h", "");
  Write("a/z", "four");
  std::string list;
  uint32_t sizes = 0;
  FileOrDirIterator entries("a/*");
  while (const IFileOrDirInfo* entry = entries.Next()) {
    list += entry->Name() + (entry->IsDirectory() ? "/" : "") + (entry->IsHidden() ? "h" : "") + " ";
    sizes += entry->IsDirectory() ? 0 : entry->SizeLow();
  }
  EXPECT_EQ("./h ../h .hh b/ d/ z ", list);
  EXPECT_EQ(4u, sizes);
  EXPECT_EQ(nullptr, FileOrDirIterator("none/*").Next());
  FileTimes times;
  EXPECT_FALSE(FileExists("a") || LastWriteTime("a") != 0 || times.LastWriteTime("a") != 0);
  EXPECT_EQ(LastWriteTime("a/z"), times.LastWriteTime("a/z"));
  EXPECT_EQ(0, times.LastWriteTime("none/z"));
}

TEST_F(FilesTest, Operations) {
  const std::string path = "f";
  Write("from", "text");
  EXPECT_FALSE(FileExists(path) || LastWriteTime(path) != 0 || TouchFile(path, false));
  EXPECT_TRUE(CreateEmptyFile(path, false) && !CreateEmptyFile(path, false) && CreateEmptyFile(path, true));
  EXPECT_TRUE(FileExists(path) && TouchFile("g", true));
  EXPECT_NEAR(static_cast<double>(CurrentFileTime()), static_cast<double>(LastWriteTime("g")), 10e7);
  EXPECT_TRUE(CopyFile("from", path, false));
  EXPECT_EQ("text", Read(path));
  EXPECT_EQ(80u, CopyFile("from", path, true).Code());
  EXPECT_EQ(2u, CopyFile("none", path, false).Code());
  EXPECT_TRUE(SetReadOnly(path, true));
  EXPECT_FALSE(TouchFile(path, false) || DeleteFile(path) || SetReadOnly("none", true));
  EXPECT_TRUE(SetReadOnly(path, false) && DeleteFile(path) && !DeleteFile(path));
  std::string full;
  EXPECT_TRUE(FullPathOf("a/../b/./c", full));
  EXPECT_EQ(std::filesystem::current_path() / "b/c", full);
  EXPECT_FALSE(FullPathOf("", full));
  EXPECT_THROW(FileExists("\xff"), StringConversionException);
}

TEST_F(FilesTest, TimesOfManyFiles) {  // more than one thread takes at once
  std::vector<std::string> paths;
  std::vector<FileStamp> stamps;
  for (int i = 0; i < 1500; ++i) {
    paths.push_back(std::to_string(i % 100) + "/" + std::to_string(i / 100));
    if (i % 3 != 0) Write(paths.back(), std::string(i, 'x'));
    if (i % 3 == 1) SetStamp(paths.back(), std::filesystem::file_time_type::clock::now() - std::chrono::hours(i));
  }
  paths.push_back("1");
  for (const std::string& path : paths) stamps.push_back(StampOf(path));
  EXPECT_TRUE(stamps == StampsOf(paths));
  EXPECT_EQ(FileStamp(), stamps[0]);
  EXPECT_EQ(1, stamps[1].size);
  paths[700] = "\xff";
  EXPECT_THROW(StampsOf(paths), StringConversionException);
}

TEST_F(FilesTest, LineEnds) {
  const std::string path = "f";
  Write(path, "a\r\rb\r\nc\n\r");
  std::string text;
  EXPECT_TRUE(LoadText(text, path, true));
  EXPECT_EQ("a\n\nb\nc\n\n", text);
  EXPECT_TRUE(LoadText(text, path, false));
  EXPECT_EQ("a\r\rb\r\nc\n\r", text);
  EXPECT_FALSE(LoadText(text, ".", true));
  EXPECT_EQ("\r\na\r\n\r\nb", WithCarriageReturns("\na\n\nb"));
}

TEST_F(FilesTest, FileClass) {
  const std::string path = "f";
  Write(path, "");
  File file(path, FileMode::WriteBinary);
  file.Write("abc", 3);
  file.Write("", 0);
  EXPECT_TRUE(file.Length() == 3 && file.Position() == 3 && file.IsWritable());
  file.Flush();
  EXPECT_TRUE(file.Open(path, FileMode::ReadText));
  EXPECT_TRUE(file.Length() == 0 && !file.IsWritable());
  char bytes[4];
  EXPECT_TRUE(file.Seek(1));
  EXPECT_EQ(2u, file.Read(bytes, 4));
  EXPECT_EQ(0u, file.Read(bytes, 4));
  EXPECT_THROW(file.Write("x", 1), FileException);
  try {
    File none("none", FileMode::ReadText);
    FAIL();
  } catch (const FileException& exception) {
    EXPECT_EQ("File error (none) : " + SentenceOf(2), ExceptionText(exception));
  }
}

TEST(ExceptionsTest, PrintedForms) {
  EXPECT_EQ("Operating system error : GetLastError() returned 4711", ExceptionText(SystemException(4711)));
  EXPECT_EQ("File error (p) : " + SentenceOf(29), ExceptionText(FileException(29, "p")));
  EXPECT_EQ("m", ExceptionText(LiteralException("m")));
  EXPECT_EQ("String conversion failed", ExceptionText(StringConversionException()));
  EXPECT_EQ("Buffer overflow", ExceptionText(BufferOverflowException()));
  EXPECT_FALSE(FileExists("none"));
  EXPECT_EQ("Operating system error : " + SentenceOf(2), ExceptionText(SystemException()));
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
