// The files of one workspace in all formats: an application, a static and a dynamic library, a utility project and a
// prepackaged project, with folders three deep, excluded files and options of configurations and of single files. The
// application and the workspace are kept as whole files; of the others stands in `others.txt` what is not as there.

#include <map>
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

// The lines of `text` that `other` lacks, each of them once and behind `mark`.
std::string LinesBeyond(const std::string& text, const std::string& other, char mark) {
  std::vector<std::string> lines;
  SplitString(other, lines, "\n");
  std::set<std::string> known(lines.begin(), lines.end());
  lines.clear();
  SplitString(text, lines, "\n");
  std::string beyond;
  for (const std::string& line : lines) {
    if (known.insert(line).second) beyond += mark + line + "\n";
  }
  return beyond;
}

class ProjectFilesTest : public GenerateTest, public ::testing::WithParamInterface<Format> {
 protected:
  // A translated form beside the plain one, any other file beside that of the application.
  static std::string Differences(const std::string& name) {
    const bool translated = name.starts_with("build_");
    const std::string text = ReadText(name);
    const std::string base = ReadText(translated ? name.substr(6) : "app" + name.substr(name.find('.')));
    return name + "\n" + (translated ? LinesBeyond(base, text, '-') : "") + LinesBeyond(text, base, '+');
  }

  void AssertFormat(const Format& format) {
    const std::string family = IsGccFamily(format.compiler) ? "gcc" : "vc";
    const std::filesystem::path folder = kData / "expected" / format.folder;
    std::filesystem::copy(kData / "workspace/tree", "tree", std::filesystem::copy_options::recursive);
    std::filesystem::copy(kData / "workspace" / family, family, std::filesystem::copy_options::recursive);
    settings.virtualTree = {"tree", family};
    settings.compiler = format.compiler;
    settings.targetXP = format.targetXP;
    Generate("app");

    std::map<std::string, std::string> expected, generated;
    for (const auto& entry : std::filesystem::directory_iterator(folder)) {
      std::string& text = expected[entry.path().filename().string()] = ReadText(entry.path().string());
      for (const auto& [from, to] : format.differences) ReplaceAllInPlace(text, from, to);
      if (entry.path().filename() != "others.txt") text = WithCarriageReturns(text);
    }
    std::set<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(".")) {
      const std::string name = entry.path().filename().string();
      if (entry.is_regular_file() && name.find("make") == std::string::npos) names.insert(name);
    }
    for (const std::string& name : names) {
      if (expected.count(name)) {
        generated[name] = Read(name);
      } else {
        generated["others.txt"] += Differences(name);
      }
    }
    for (const auto& [name, text] : expected) EXPECT_EQ(text, generated[name]) << name;
  }
};

const Format kFormats[] = {
    {CompilerKind::vc6, false, "vc6", {}},
    {CompilerKind::vc8, false, "vc8", {}},
    {CompilerKind::vc9,
     false,
     "vc8",
     {{"Version=\"8.00\"", "Version=\"9.00\""},
      {"Version 9.00\n# Visual Studio 2005", "Version 10.00\n# Visual Studio 2008"}}},
    {CompilerKind::vc10,
     true,
     "vc14",
     {{"ToolsVersion=\"14.0\"", "ToolsVersion=\"4.0\""},
      {"    <PlatformToolset>v140</PlatformToolset>\n", ""},
      {"Version 12.00\n# Visual Studio 2013", "Version 11.00\n# Visual Studio 2010"}}},
    {CompilerKind::vc11,
     true,
     "vc14",
     {{"ToolsVersion=\"14.0\"", "ToolsVersion=\"4.0\""}, {"v140", "v110_xp"}, {"Studio 2013", "Studio 2012"}}},
    {CompilerKind::vc12, false, "vc14", {{"ToolsVersion=\"14.0\"", "ToolsVersion=\"12.0\""}, {"v140", "v120"}}},
    {CompilerKind::vc14, false, "vc14", {}},
    {CompilerKind::gcc, false, "gcc", {}},
};

TEST_P(ProjectFilesTest, AreAsExpected) { AssertFormat(GetParam()); }

INSTANTIATE_TEST_SUITE_P(, ProjectFilesTest, ::testing::ValuesIn(kFormats),
                         [](const auto& each) { return std::string(CompilerOf(each.param.compiler).keyword); });

}  // namespace

}  // namespace qrex
