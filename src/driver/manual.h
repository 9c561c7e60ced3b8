// What a user may type, once for all who tell it: `Qrex --help`, the manual page, the table of keys in docs/projects.md
// and the completions of shells.
#pragma once

#include <string>
#include <string_view>

namespace qrex {

// A way to call the program. In `arguments` capital letters stand for what the caller puts there.
struct CallForm {
  std::string_view option;  // empty: a configuration
  std::string_view arguments;
  std::string_view help;  // lines
};
inline constexpr CallForm kCallForms[] = {
    {"", "[NAME=\"VALUE\" ...] FILE.qrex [LINE ...]",
     "does what the configuration says. NAME is seen as $(NAME) in every file; each LINE stands\n"
     "behind those of the file and so overrides them, as in: Qrex zoo.qrex mode=gen"},
    {"", "[*]FOLDER/FILE.sln",
     "stands for FILE.qrex, with * for FILE.translate.qrex, and builds build_FILE.sln afterwards"},
    {"--init", "NAME [FOLDER]", "lays out a workspace that builds and runs, in the folder NAME; overwrites nothing"},
    {"--list", "[NAME=\"VALUE\" ...] FILE.qrex [LINE ...]",
     "tells what a run would read and translate, for scripts: docs/cmake.md has the form"},
    {"--where", "[NAME=\"VALUE\" ...] FILE.qrex [LINE ...] [FILE:LINE[:COLUMN] ...]",
     "follows positions in generated text back to the sources, with \" (stale)\" behind those of\n"
     "texts that have changed since; without any it does so in what it reads, line by line:\n"
     "clang-tidy ... | Qrex --where zoo.qrex"},
    {"--there", "[NAME=\"VALUE\" ...] FILE.qrex [LINE ...] [FILE:LINE[:COLUMN] ...]",
     "the other way: to the first generated line that comes of one of a source"},
    {"--graph",
     "[NAME=\"VALUE\" ...] FILE.qrex [projects | imports | models] [--of FILE [--depth N]] [--json] [LINE ...]",
     "what leads to what, as Graphviz reads it; --of shows what FILE leads to and what leads to it"},
    {"--why", "FILE [NAME=\"VALUE\" ...] FILE.qrex [LINE ...]",
     "why a build would make the first FILE again, and which imports lead to the cause"},
    {"--reflect", "[NAME=\"VALUE\" ...] FILE.qrex [--json] [LINE ...]",
     "lists all declarations, with --json their members and histories: docs/reflect.md has the form"},
    {"--report", "[NAME=\"VALUE\" ...] FILE.qrex PAGE.html [LINE ...]",
     "writes a page on the models, histories and imports of a workspace, without a build"},
    {"--help", "", "this text"},
    {"--version", "", "the release"},
};

std::string HelpText();
std::string ManualPage();  // in the man macros of troff
std::string KeyTable();    // in Markdown, a row for each key
std::string BashCompletion();
std::string ZshCompletion();

}  // namespace qrex
