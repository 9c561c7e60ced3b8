// Whole generated texts. A case is a header `cases/NAME.h` and what comes of it, `NAME.expected.h`; with the `.cpp`
// that imports the header, `NAME.cpp` (or an empty one), and what comes of that, `NAME.expected.cpp`, if it is more
// than the import. Names that begin with `dll_` or `compilable_` say what the project or its configuration is. The
// texts of `dll_` are whole; others are expected without the lines around each header, and with tables and traits on
// one line.
//
// `scripts/test --update` writes what is expected anew, and shows what changed. What is told of headers stands in
// `told`.
#include <cstdlib>
#include <filesystem>

#include "text_cases.h"
#include "translator/translate_fixture.h"

namespace qrex {
namespace {

const std::string kFolder = QREX_SOURCE_DIR "/tests/translator/cases/";

std::vector<std::string> NamesIn(const std::string& folder, const std::string& extension) {
  std::vector<std::string> names;
  for (const auto& entry : std::filesystem::directory_iterator(folder)) {
    const std::string name = entry.path().filename().string();
    if (!name.ends_with(extension) || name.ends_with(".expected.h")) continue;
    names.push_back(name.substr(0, name.size() - extension.size()));
  }
  std::sort(names.begin(), names.end());
  return names;
}

std::string TextOf(const std::string& path) {
  std::string text;
  LoadText(text, path, true);
  return text;
}

class CasesTest : public TranslateTest, public ::testing::WithParamInterface<std::string> {
 protected:
  // Or, when asked for, makes `text` what is expected; an empty text has no file.
  static void Compare(const std::string& path, const std::string& text) {
    const std::string expected = TextOf(path);
    if (text == expected || !std::getenv("QREX_UPDATE")) {
      EXPECT_EQ(expected, text) << path;
    } else if (text.empty()) {
      std::filesystem::remove(path);
    } else {
      ReplaceFile(path, text);
    }
  }
};

// With each constant of a traits class behind the one ahead of it, and opening braces behind what they open.
std::string Joined(const std::string& text) {
  std::istringstream lines(text);
  std::string result;
  for (std::string line; std::getline(lines, line);) {
    const size_t begin = std::min(line.find_first_not_of(' '), line.size());
    const bool isConstant = result.ends_with(";\n") && (line.compare(begin, 18, "static const bool ") == 0 ||
                                                        line.compare(begin, 20, "static const vesk::E") == 0);
    if (isConstant || (line.compare(begin, std::string::npos, "{") == 0 && !result.empty())) {
      result.back() = ' ';
      line.erase(0, begin);
    }
    result += line + '\n';
  }
  return result;
}

TEST_P(CasesTest, GivesWhatIsExpected) try {
  const std::string& name = GetParam();
  settings.compilableText = name.starts_with("compilable_");
  MakeWorld(name.starts_with("dll_") ? TargetType::DynamicLinkLibrary : TargetType::Application);
  const std::string import = "@import \"t.h\"\n", source = TextOf(kFolder + name + ".cpp");
  AddFile("t.h", TextOf(kFolder + name + ".h"));
  AddFile("t.cpp", source.empty() ? import : source);
  const auto shown = [&](const std::string& text) {
    return name.starts_with("dll_") || text.empty() ? text : Joined(Folded(WithoutGuard(text)));
  };
  Compare(kFolder + name + ".expected.h", shown(Translate("t.h")));
  const std::string translated = Translate("t.cpp");
  Compare(kFolder + name + ".expected.cpp", shown(translated == "#include \"t.h\"\n" ? "" : translated));
} catch (const IException& exception) {
  FAIL() << ExceptionText(exception);
}

INSTANTIATE_TEST_SUITE_P(, CasesTest, ::testing::ValuesIn(NamesIn(kFolder, ".h")),
                         [](const auto& each) { return each.param; });

// Headers with what is told of each: an error, or else messages. What `compilable_` is told of with the key is no fault
// without it.
class ToldTest : public TranslateTest, public ::testing::WithParamInterface<std::string> {};

TEST_P(ToldTest, IsWhatIsExpected) {
  const bool isCompilable = GetParam().starts_with("compilable_");
  for (const auto& [name, text, expected] : TextCasesOf("translator/told/" + GetParam() + ".txt")) {
    SCOPED_TRACE(name + "\n" + text);
    settings.compilableText = isCompilable;
    EXPECT_EQ(expected, Told(text));
    settings.compilableText = false;
    if (isCompilable) {
      EXPECT_EQ("", Told(text));
    }
  }
}

INSTANTIATE_TEST_SUITE_P(, ToldTest, ::testing::ValuesIn(NamesIn(QREX_SOURCE_DIR "/tests/translator/told", ".txt")),
                         [](const auto& each) { return each.param; });

}  // namespace
}  // namespace qrex
