#include "workspace/linker_text.h"

#include <algorithm>
#include <optional>
#include <span>

#include "lex/literals.h"
#include "text/paths.h"
#include "workspace/switch_blocks.h"
#include "workspace/switch_tables.h"
#include "workspace/workspace.h"

namespace qrex {

std::vector<std::string> LinkerTokens(const std::string& text) {
  std::vector<std::string> tokens;
  LexScanner scanner{std::string_view(text)};
  for (SkipWhiteSpace(scanner); !scanner.AtEnd(); SkipWhiteSpace(scanner)) {
    const char* const begin = scanner.begin;
    while (!scanner.AtEnd() && *scanner.begin != ' ' && !(*scanner.begin >= 9 && *scanner.begin <= 13)) {
      if (*scanner.begin != '"' || !ReadQuoted(scanner, '"', "switch")) ++scanner.begin;
    }
    tokens.emplace_back(begin, scanner.begin);
  }
  return tokens;
}

bool IsQuoted(const std::string& token) { return token.size() >= 2 && token.front() == '"' && token.back() == '"'; }
std::string Unquoted(const std::string& token) { return token.substr(1, token.size() - 2); }

namespace {

bool IsDefaultLibrary(const std::string& name) {
  return std::any_of(std::begin(kDefaultLibraries), std::end(kDefaultLibraries),
                     [&](std::string_view library) { return EqualIgnoringCase(library, name); });
}

bool IsManaged(const Project& project) {
  if (project.configs.empty()) return false;
  const OptionMap& options = project.configs.front()->compilerOptions;
  auto found = options.find("ManagedExtensions");
  return found != options.end() && found->second != "0";
}

// Walks the subprojects; a project that is met again, as in a cycle, is not walked twice.
class LibraryWalk {
 public:
  LibraryWalk(LibraryChoice choice, std::set<std::string>& libraries) : m_choice(choice), m_libraries(libraries) {}

  void Add(const Project& project, const ProjectConfig& config) {
    if (!m_seen.insert(&project).second) return;
    for (const std::string& token : LinkerTokens(config.linkerText)) {
      if (!IsQuoted(token)) continue;
      if (m_choice.skipDefaultLibraries && IsDefaultLibrary(Unquoted(token))) continue;
      m_libraries.insert(Unquoted(token));
    }
    for (const std::string& path : project.subprojects) AddSubproject(project, path, config);
  }

 private:
  void AddSubproject(const Project& project, const std::string& path, const ProjectConfig& config) {
    const Project* subproject = project.workspace->FindSubproject(path);
    if (!subproject) {
      TraceWriter() << "Error : Can't find subproject " << path << " under project " << project.name << "\n";
      return;
    }
    if (!IsLibrary(subproject->targetType)) return;
    const bool isAdded = subproject->exported || m_choice.forBuild || IsManaged(*subproject);
    if (isAdded) {
      const std::string& root = subproject->exported ? subproject->rootDir : project.settings->exportLib;
      m_libraries.insert(PathJoin(PathJoin3(root, config.platform, config.name), subproject->name + ".lib"));
    }
    if (subproject->targetType != TargetType::StaticLibrary) return;
    if (const ProjectConfig* same = subproject->FindConfig(config.name, config.platform)) {
      Add(*subproject, *same);
    } else {
      TraceWriter() << "Error : Can't find config " << config.name << "|" << config.platform << " in project "
                    << subproject->name << "\n";
    }
  }

  LibraryChoice m_choice;
  std::set<std::string>& m_libraries;
  std::set<const Project*> m_seen;
};

}  // namespace

void GatherLibraries(const Project& project, const ProjectConfig& config, LibraryChoice choice,
                     std::set<std::string>& libraries) {
  LibraryWalk(choice, libraries).Add(project, config);
}

// --- Properties

namespace {

// A token of the switch text, as the tables are asked for it. Switches and names are compared without case.
struct LinkerSwitch {
  explicit LinkerSwitch(const std::string& token) : token(token) {
    const size_t colon = token.find(':');
    name = std::string_view(token).substr(1, colon == std::string::npos ? colon : colon - 1);
    if (colon != std::string::npos) argument = token.substr(colon + 1);
  }

  bool Is(std::string_view text) const { return EqualIgnoringCase(token, text); }
  bool IsNamed(std::string_view text) const { return EqualIgnoringCase(name, text); }
  bool HasQuotedArgument() const { return argument && IsQuoted(*argument); }

  template <typename Rows>
  auto FindIn(const Rows& rows) const {
    return std::find_if(std::begin(rows), std::end(rows), [&](const auto& row) { return Is(row.name); });
  }
  template <typename Rows>
  auto FindNameIn(const Rows& rows) const {
    return std::find_if(std::begin(rows), std::end(rows), [&](const auto& row) { return IsNamed(row.name); });
  }

  const std::string& token;
  std::string_view name;  // between the `/` and the first `:`
  std::optional<std::string> argument;
};

void AddDefinitionFile(const Project& project, OptionMap& options) {
  for (const ProjectFile* file : project.files) {
    if (file->kind == FileKind::Def) options["ModuleDefinitionFile"] = project.SourcePath(*file);
  }
}

// The two kinds of argument that the linker and the librarian share; false if the switch is neither.
bool ReadQuotedArgument(const LinkerSwitch& read, std::span<const SwitchProperty> values,
                        std::span<const SwitchProperty> lists, OptionMap& options, OptionMap& listTexts) {
  if (!read.HasQuotedArgument()) return false;
  if (const auto value = read.FindNameIn(values); value != values.end()) {
    options[std::string(value->property)] = Unquoted(*read.argument);
  } else if (const auto list = read.FindNameIn(lists); list != lists.end()) {
    AppendItem(listTexts[std::string(list->property)], Unquoted(*read.argument));
  } else {
    return false;
  }
  return true;
}

void SetSizes(OptionMap& options, const std::string& area, std::string_view sizes) {
  const size_t comma = sizes.find(',');
  options[area + "ReserveSize"] = sizes.substr(0, comma);
  if (comma != std::string_view::npos) options[area + "CommitSize"] = sizes.substr(comma + 1);
}

bool ReadLinkerSwitch(const LinkerSwitch& read, OptionMap& options, OptionMap& listTexts) {
  if (read.Is("/DLL") || StartsWithIgnoringCase(read.token, "/PDBTYPE:")) return true;  // the target's type says it
  if (const auto flag = read.FindIn(kLinkerFlags); flag != std::end(kLinkerFlags)) {
    options[std::string(flag->property)] = "true";
  } else if (const auto row = read.FindIn(kLinkerEnumerated); row != std::end(kLinkerEnumerated)) {
    options[std::string(row->property)] = row->valueText;
  } else if (ReadQuotedArgument(read, kLinkerValues, kLinkerLists, options, listTexts)) {
    return true;
  } else if (read.IsNamed("HEAP") && read.argument) {
    SetSizes(options, "Heap", *read.argument);
  } else if (read.IsNamed("STACK") && read.argument) {
    SetSizes(options, "Stack", *read.argument);
  } else if (read.IsNamed("MAP") && read.HasQuotedArgument()) {
    options["GenerateMapFile"] = "true";
    options["MapFileName"] = Unquoted(*read.argument);
  } else {
    return false;
  }
  return true;
}

bool ReadLibrarianSwitch(const LinkerSwitch& read, OptionMap& options, OptionMap& listTexts) {
  if (const auto flag = read.FindIn(kLibrarianFlags); flag != std::end(kLibrarianFlags)) {
    options[std::string(flag->property)] = "true";
    return true;
  }
  return ReadQuotedArgument(read, kLibrarianValues, kLibrarianLists, options, listTexts);
}

// Calls `read` for each switch of the text. What is none costs a line that names the tool.
template <typename Read>
void ForEachSwitch(const ProjectConfig& config, std::string_view tool, bool allowsPlainArguments, Read read) {
  for (const std::string& token : LinkerTokens(config.linkerText)) {
    if (token.front() != '/') {
      if (IsQuoted(token) || allowsPlainArguments) continue;
      TraceWriter() << "ERROR: Unexpected " << tool << " argument: " << token << "\n";
    } else if (const LinkerSwitch parts(token); parts.name.empty()) {
      TraceWriter() << "ERROR: Invalid " << tool << " switch : " << token << "\n";
    } else {
      read(parts);
    }
  }
}

std::string DependencyText(const Project& project, const ProjectConfig& config) {
  std::set<std::string> libraries;
  GatherLibraries(project, config, {.skipDefaultLibraries = true, .forBuild = false}, libraries);
  const bool isListOfItems = CompilerOf(project.settings->compiler).Writes(ProjectFormat::Vcxproj);
  std::string text;
  for (const std::string& library : libraries) {
    if (isListOfItems) {
      text += library + ";";
    } else {
      text += (text.empty() ? "&quot;" : " &quot;") + library + "&quot;";
    }
  }
  return text;
}

void MoveListTexts(OptionMap& listTexts, OptionMap& options) {
  for (auto& [property, text] : listTexts) {
    if (!text.empty()) options[property] = std::move(text);
  }
}

}  // namespace

void ParseLinkerText(const Project& project, const ProjectConfig& config, OptionMap& options) {
  AddDefinitionFile(project, options);
  OptionMap listTexts;
  std::string additional;
  ForEachSwitch(config, "linker", IsGccFamily(project.settings->compiler), [&](const LinkerSwitch& read) {
    if (!ReadLinkerSwitch(read, options, listTexts)) additional += (additional.empty() ? "" : " ") + read.token;
  });
  options["AdditionalDependencies"] = DependencyText(project, config);
  if (!additional.empty()) options["AdditionalOptions"] = additional;
  MoveListTexts(listTexts, options);
}

void ParseLibrarianText(const Project& project, const ProjectConfig& config, OptionMap& options) {
  AddDefinitionFile(project, options);
  OptionMap listTexts;
  ForEachSwitch(config, "librarian", false, [&](const LinkerSwitch& read) {
    if (ReadLibrarianSwitch(read, options, listTexts)) return;
    TraceWriter() << "ERROR: Invalid librarian switch : " << read.token << "\n";
  });
  options["AdditionalDependencies"] = "";
  MoveListTexts(listTexts, options);
}

}  // namespace qrex
