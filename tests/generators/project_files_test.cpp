// Whole files of one workspace in all formats: an application, a static and a dynamic library, a utility project and a
// prepackaged project, with folders three deep, excluded files and options of configurations and of single files.

#include <set>
#include <vector>

#include "generators/generate_fixture.h"
#include "text/numbers.h"
#include "text/output_policy.h"

namespace qrex {

namespace {

const std::filesystem::path kData = QREX_SOURCE_DIR "/tests/generators";

struct Format {
  CompilerKind compiler;
  bool targetXP;
  std::string folder;  // of the expected files
  std::vector<std::pair<std::string, std::string>> differences;
};

class ProjectFilesTest : public GenerateTest {
 protected:
  void AssertFormat(const Format& format) {
    const std::string family = IsGccFamily(format.compiler) ? "gcc" : "vc";
    std::filesystem::copy(kData / "workspace/tree", "tree", std::filesystem::copy_options::recursive);
    std::filesystem::copy(kData / "workspace" / family, family, std::filesystem::copy_options::recursive);
    settings.virtualTree = {"tree", family};
    settings.compiler = format.compiler;
    settings.targetXP = format.targetXP;
    Load("app/src/app.qrpj");
    Generate();

    std::set<std::string> expected, generated;
    for (const auto& entry : std::filesystem::directory_iterator(kData / "expected" / format.folder)) {
      expected.insert(entry.path().filename());
      std::string text;
      ASSERT_TRUE(LoadText(text, entry.path(), true));
      for (const auto& [from, to] : format.differences) ReplaceAllInPlace(text, from, to);
      EXPECT_EQ(WithCarriageReturns(text), TextOf(entry.path().filename())) << entry.path();
    }
    for (const auto& entry : std::filesystem::directory_iterator(".")) {
      const std::string name = entry.path().filename();
      if (entry.is_regular_file() && name.find("make") == std::string::npos) generated.insert(name);
    }
    EXPECT_EQ(expected, generated);
  }
};

TEST_F(ProjectFilesTest, Vc6) { AssertFormat({CompilerKind::vc6, false, "vc6", {}}); }
TEST_F(ProjectFilesTest, Vc8) { AssertFormat({CompilerKind::vc8, false, "vc8", {}}); }
TEST_F(ProjectFilesTest, Vc9) {
  AssertFormat({CompilerKind::vc9,
                false,
                "vc8",
                {{"Version=\"8.00\"", "Version=\"9.00\""},
                 {"Version 9.00\n# Visual Studio 2005", "Version 10.00\n# Visual Studio 2008"}}});
}
TEST_F(ProjectFilesTest, Vc10) {
  AssertFormat({CompilerKind::vc10,
                true,
                "vc14",
                {{"ToolsVersion=\"14.0\"", "ToolsVersion=\"4.0\""},
                 {"    <PlatformToolset>v140</PlatformToolset>\n", ""},
                 {"Version 12.00\n# Visual Studio 2013", "Version 11.00\n# Visual Studio 2010"}}});
}
TEST_F(ProjectFilesTest, Vc11) {
  AssertFormat({CompilerKind::vc11,
                true,
                "vc14",
                {{"ToolsVersion=\"14.0\"", "ToolsVersion=\"4.0\""},
                 {"v140", "v110_xp"},
                 {"Visual Studio 2013", "Visual Studio 2012"}}});
}
TEST_F(ProjectFilesTest, Vc12) {
  AssertFormat(
      {CompilerKind::vc12, false, "vc14", {{"ToolsVersion=\"14.0\"", "ToolsVersion=\"12.0\""}, {"v140", "v120"}}});
}
TEST_F(ProjectFilesTest, Vc14) { AssertFormat({CompilerKind::vc14, false, "vc14", {}}); }
TEST_F(ProjectFilesTest, Gcc) { AssertFormat({CompilerKind::gcc, false, "gcc", {}}); }

}  // namespace

}  // namespace qrex
