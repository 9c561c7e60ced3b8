#include "driver/manual.h"

#include <algorithm>
#include <vector>

#include "driver/config_keys.h"
#include "text/numbers.h"
#include "text/version.h"

namespace qrex {

namespace {

struct ManualRow {
  std::string key;                  // as a statement with its default
  std::string_view word;            // what of it is typed; empty: nothing that can be completed
  std::vector<std::string> values;  // that may be typed behind it; empty: any
  std::string help;
};
struct ManualSection {
  std::string title;
  std::vector<ManualRow> rows;
};

constexpr char kProduct[] = "a translator and build driver for C++ with reflection";
constexpr size_t kCallColumn = 27, kHelpColumn = 48;  // of the help texts on the console

std::string Word(std::string_view word, std::string_view rest) { return std::string(word).append(rest); }

std::string JoinedBy(const char* separator, const std::vector<std::string>& words) {
  std::string text;
  for (const std::string& word : words) text += (text.empty() ? "" : separator) + word;
  return text;
}

std::string Call(const CallForm& form) {
  std::string call = "Qrex";
  for (const std::string_view part : {form.option, form.arguments}) {
    if (!part.empty()) call.append(" ").append(part);
  }
  return call;
}

std::string Padded(std::string text, size_t column) {
  text.resize(std::max(text.size() + 1, column), ' ');
  return text;
}

std::vector<ManualRow> KeyRows() {
  const ConfigSettings defaults;
  std::vector<ManualRow> rows;
  const auto add = [&](std::string_view word, std::string_view rest, std::string_view help) {
    rows.push_back({Word(word, rest), word, {}, std::string(help)});
  };
  add("compiler", Word(" = ", CompilerOf(defaults.compiler).keyword), "one of " + CompilerWords());
  for (const Compiler& compiler : kCompilers) rows.back().values.emplace_back(compiler.keyword);
  for (const auto& key : kListKeys) add(key.word, " = { }", key.help);
  for (const auto& key : kCommandKeys) add(key.word, " = \"\"", key.help);
  add("runtime", Word(" = ", kRuntimes[static_cast<size_t>(defaults.runtime)]), kRuntimeHelp);
  for (const std::string_view runtime : kRuntimes) rows.back().values.emplace_back(runtime);
  for (const auto& key : kStringKeys) add(key.word, " = \"\"", key.help);
  for (const auto& key : kBoolKeys) {
    add(key.word, defaults.*key.field ? " = true" : " = false", key.help);
    rows.back().values = {"true", "false"};
  }
  for (const auto& key : kNumberKeys) add(key.word, " = " + std::to_string(defaults.*key.field), key.help);
  for (const auto& key : kEnvironmentKeys) add(key.word, "(\"platform\") = { }", key.help);
  for (const auto& key : kPathVariables)
    rows.push_back({"$" + Word(key.word, " = \"\""), {}, {}, std::string(key.help)});
  for (const auto& [key, help] : {
           std::pair("$TARGET_DIR = \"\"", "instead of platform and config: their last two folders, .../x64/Debug"),
           std::pair("$COMPILE_FILE_PATH = \"\"", "the source that compile and show are about"),
           std::pair("$NAME = \"\"", "any other variable, seen as $(NAME)"),
           std::pair("@import \"FILE\"", "the statements of another file; the macro language works in all of it"),
       }) {
    rows.push_back({key, {}, {}, help});
  }
  return rows;
}

std::vector<std::string> ModeNames() {
  std::vector<std::string> names;
  for (const ModeWord& mode : kModes) names.emplace_back(mode.word);
  return names;
}

std::vector<ManualSection> ManualSections() {
  std::vector<ManualRow> modes;
  const RunMode usual = ConfigSettings().mode;
  for (size_t i = 0; i < std::size(kModes); ++i) {
    const bool isDefault = static_cast<RunMode>(i) == usual;
    modes.push_back({std::string(kModes[i].word), {}, {}, Word(kModes[i].help, isDefault ? "; the default" : "")});
  }
  return {{"mode = WORD", std::move(modes)}, {"Keys with their defaults; $(name) expands in every string", KeyRows()}};
}

}  // namespace

std::string HelpText() {
  std::string text = Word("Qrex ", Version()) + ", " + kProduct + "\n\n";
  for (const CallForm& form : kCallForms) {
    const std::string call = Call(form);
    std::string lines = call.size() < kCallColumn ? Padded(call, kCallColumn) : call + "\n" + Padded("", kCallColumn);
    std::string help(form.help);
    ReplaceAllInPlace(help, "\n", "\n" + Padded("", kCallColumn));
    text += lines + help + "\n";
  }
  for (const ManualSection& section : ManualSections()) {
    text += "\n" + section.title + "\n";
    for (const ManualRow& row : section.rows) text += Padded("  " + row.key, kHelpColumn) + row.help + "\n";
  }
  return text;
}

// --- The manual page

namespace {

// A text that troff takes as it is.
std::string Roff(std::string_view text) {
  std::string escaped;
  for (const char c : text) {
    if (c == '\\') {
      escaped += "\\e";
    } else if (c == '-') {
      escaped += "\\-";
    } else if (c == '"') {
      escaped += "\\(dq";
    } else {
      escaped += c;
    }
  }
  if (escaped.starts_with('.') || escaped.starts_with('\'')) escaped.insert(0, "\\&");
  return escaped;
}

std::string RoffRow(const std::string& key, std::string_view help) {
  return ".TP\n.B " + Roff(key) + "\n" + Roff(help) + "\n";
}

}  // namespace

std::string ManualPage() {
  std::string page = ".TH Qrex 1 \"\" \"Qrex " + std::string(Version()) + "\" \"User Commands\"\n.SH NAME\nQrex \\- " +
                     Roff(kProduct) + "\n.SH SYNOPSIS\n";
  for (const CallForm& form : kCallForms) {
    page += ".B Qrex" + (form.option.empty() ? "" : " " + Roff(form.option)) + "\n";
    if (!form.arguments.empty()) page += Roff(form.arguments) + "\n";
    page += ".br\n";
  }
  page +=
      ".SH DESCRIPTION\n"
      "Translates C++ sources with declarations that begin with $ and directives that begin with @ into plain C++ "
      "with\n"
      "reflection, serialisation and interfaces, compiles and links what is stale, or writes the project files of\n"
      "Visual Studio, Code::Blocks, Geany, make and ninja. What it does stands in a configuration, a file whose name "
      "ends in\n"
      ".BR .qrex .\n";
  for (const CallForm& form : kCallForms) page += RoffRow(Call(form), form.help);
  page += ".SH CONFIGURATION\n";
  for (const ManualSection& section : ManualSections()) {
    page += ".SS " + Roff(section.title) + "\n";
    for (const ManualRow& row : section.rows) page += RoffRow(row.key, row.help);
  }
  page +=
      ".SH EXIT STATUS\n"
      "0, or 1 when the run could not do what it was told. Errors of compilers and linkers are counted in the last "
      "line.\n"
      ".SH ENVIRONMENT\n.TP\n.B QREX_DATA_FOLDER\n"
      "the folder that holds templates and runtime, in place of that of the program.\n"
      ".TP\n.B QREX_PYTHON\n"
      "the library of Python that @python directives load; the only one that is tried.\n"
      ".SH SEE ALSO\n"
      "The pages in\n.IR /usr/share/doc/qrex/docs ,\nof which\n.I tutorial.md\nis the first to read.\n";
  return page;
}

std::string KeyTable() {
  std::string table = "| Key with its default | Effect |\n|---|---|\n";
  std::vector<ManualRow> rows = KeyRows();
  const std::string usual(kModes[static_cast<size_t>(ConfigSettings().mode)].word);
  rows.insert(rows.begin(), {"mode = " + usual, {}, {}, "one of " + JoinedBy(" ", ModeNames())});
  for (const ManualRow& row : rows) {
    std::string help = row.help;
    ReplaceAllInPlace(help, "|", "\\|");
    table += "| `" + row.key + "` | " + help + " |\n";
  }
  return table;
}

// --- Completions

namespace {

std::vector<std::string> OptionWords() {
  std::vector<std::string> words;
  for (const CallForm& form : kCallForms) {
    if (!form.option.empty()) words.emplace_back(form.option);
  }
  return words;
}

// Keys of one word, each with the `=` of a line on the command line and what may stand behind it.
std::vector<ManualRow> LineRows() {
  std::vector<ManualRow> rows = {{"mode", "mode", ModeNames(), "what to do"}};
  for (ManualRow& row : KeyRows()) {
    if (!row.values.empty()) rows.push_back(std::move(row));
  }
  return rows;
}

}  // namespace

std::string BashCompletion() {
  std::string keys, values;
  for (const ManualRow& row : LineRows()) {
    keys += (keys.empty() ? "" : " ") + Word(row.word, "=");
    values += "    " + Word(row.word, "=*) words='") + JoinedBy(" ", row.values) + "' ;;\n";
  }
  return R"(# Completion of Qrex for bash: options, configurations, and the lines that may stand behind one.
_qrex() {
  local word words
  COMPREPLY=()
  word=${COMP_LINE:0:COMP_POINT}
  word=${word##*[[:blank:]]}
  case $word in
    -*) words=')" +
         JoinedBy(" ", OptionWords()) + R"(' ;;
)" + values +
         R"(    *)
      compopt -o nospace
      mapfile -t COMPREPLY < <(compgen -d -S / -- "$word"
                               compgen -f -X '!*.qrex' -- "$word"; compgen -f -X '!*.sln' -- "$word"
                               [[ $COMP_LINE == *.qrex* ]] && compgen -W ')" +
         keys + R"(' -- "$word")
      local i
      for i in "${!COMPREPLY[@]}"; do
        [[ ${COMPREPLY[i]} == *[/=] ]] || COMPREPLY[i]+=' '
      done
      return ;;
  esac
  mapfile -t COMPREPLY < <(compgen -W "$words" -- "${word#*=}")
}
complete -F _qrex Qrex
)";
}

std::string ZshCompletion() {
  std::string lines;
  for (const ManualRow& row : LineRows()) {
    lines += "    '" + Word(row.word, "=:") + JoinedBy(" ", row.values) + "'\n";
  }
  return R"(#compdef Qrex
# Completion of Qrex for zsh: options, configurations, and the lines that may stand behind one.
_Qrex() {
  local -a options keys
  options=()" +
         JoinedBy(" ", OptionWords()) + R"()
  keys=(
)" + lines +
         R"(  )
  local key
  if [[ $PREFIX == -* ]]; then
    compadd -- $options
  elif [[ $PREFIX == *=* ]]; then
    key=${(M)keys:#${PREFIX%%\=*}=:*}
    compset -P '*='
    compadd -- ${=key#*:}
  else
    (( ${words[(I)*.qrex]} )) && compadd -S '' -- ${keys%%:*}
    _files -g '*.(qrex|sln)(-.)'
  fi
}
_Qrex "$@"
)";
}

}  // namespace qrex
