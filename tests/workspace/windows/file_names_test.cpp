// Names that differ in case alone are those of one file.

#include "world_fixture.h"

namespace qrex {

using FileNamesTest = WorldTest;

TEST_F(FileNamesTest, OneFileWhateverItsCase) {
  const std::string files = "qrex { \"src\" { \"Foo.H\" \"\xc3\x84.h\" \"*.h\" } }";
  Write("tree/app/src/foo.h", "");
  ASSERT_TRUE(platform::WriteFile("tree/app/src/\xc3\xa4.h", ""));
  std::string paths;
  for (const auto& [path, file] : AddProject("app", "Application", files).filesByPath) {
    if (path.ends_with(".h") || path.ends_with(".H")) paths.append(path).append(" ");
  }
  EXPECT_EQ("app/src/Foo.H app/src/\xc3\x84.h ", paths);
  ASSERT_TRUE(workspace->CheckFileReferences()) << trace;
  ASSERT_TRUE(workspace->FindFile("app/src/Foo.H"));
  EXPECT_EQ(workspace->FindFile("app/src/Foo.H"), workspace->FindFile("APP/src/foo.h"));
  EXPECT_EQ(workspace->FindFile("app/src/\xc3\x84.h"), workspace->FindFile("app/src/\xc3\xa4.h"));

  Load({});
  AddProject("app", "Application", files);
  AddProject("lib", "Static Library", "qrex { \"../app/SRC\" { \"foo.h\" } }");
  EXPECT_FALSE(workspace->CheckFileReferences());
  EXPECT_NE(std::string::npos, trace.find(" both reference file ")) << trace;
}

}  // namespace qrex
