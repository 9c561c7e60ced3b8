#include "workspace/linker_text.h"

#include <algorithm>

#include "lex/literals.h"
#include "text/paths.h"
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

}  // namespace qrex
