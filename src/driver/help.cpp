#include "driver/help.h"

#include <algorithm>

#include "driver/config_keys.h"
#include "text/version.h"

namespace qrex {

namespace {

constexpr char kUsage[] = R"(
Qrex [NAME="VALUE" ...] FILE.qrex [LINE ...]
                           does what the configuration says. NAME is seen as $(NAME) in every file; each LINE stands
                           behind those of the file and so overrides them, as in: Qrex zoo.qrex mode=gen
Qrex [*]FOLDER/FILE.sln    stands for FILE.qrex, with * for FILE.translate.qrex, and builds build_FILE.sln afterwards
Qrex --init NAME [FOLDER]  lays out a workspace that builds and runs, in the folder NAME; overwrites nothing
Qrex --help                this text
Qrex --version             the release
)";

class HelpPage {
 public:
  void Heading(std::string_view title) { m_text.append("\n").append(title).append("\n"); }
  void Row(std::string_view key, std::string_view help) {
    std::string line = "  " + std::string(key);
    line.resize(std::max(line.size() + 1, kHelpColumn), ' ');
    m_text.append(line).append(help).append("\n");
  }
  void Text(std::string_view text) { m_text.append(text); }
  std::string Take() { return std::move(m_text); }

 private:
  static constexpr size_t kHelpColumn = 48;
  std::string m_text;
};

std::string Word(std::string_view word, std::string_view rest) { return std::string(word).append(rest); }

}  // namespace

std::string HelpText() {
  const ConfigSettings defaults;
  HelpPage page;
  page.Text(Word("Qrex ", Version()) + ", a translator and build driver for C++ with reflection\n");
  page.Text(kUsage);

  page.Heading("mode = WORD");
  for (size_t i = 0; i < std::size(kModes); ++i) {
    const bool isDefault = static_cast<RunMode>(i) == defaults.mode;
    page.Row(kModes[i].word, Word(kModes[i].help, isDefault ? "; the default" : ""));
  }
  page.Heading("Keys with their defaults; $(name) expands in every string");
  page.Row(Word("compiler = ", CompilerOf(defaults.compiler).keyword), "one of " + CompilerWords());
  for (const auto& key : kListKeys) page.Row(Word(key.word, " = { }"), key.help);
  for (const auto& key : kStringKeys) page.Row(Word(key.word, " = \"\""), key.help);
  for (const auto& key : kBoolKeys) page.Row(Word(key.word, defaults.*key.field ? " = true" : " = false"), key.help);
  for (const auto& key : kEnvironmentKeys) page.Row(Word(key.word, "(\"platform\") = { }"), key.help);
  for (const auto& key : kPathVariables) page.Row("$" + Word(key.word, " = \"\""), key.help);
  page.Row("$TARGET_DIR = \"\"", "instead of platform and config: their last two folders, .../x64/Debug");
  page.Row("$COMPILE_FILE_PATH = \"\"", "the source that compile and show are about");
  page.Row("$NAME = \"\"", "any other variable, seen as $(NAME)");
  page.Row("@import \"FILE\"", "the statements of another file; the macro language works in all of it");
  return page.Take();
}

}  // namespace qrex
