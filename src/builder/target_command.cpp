#include "builder/target_command.h"

#include <algorithm>
#include <set>

#include "builder/build_paths.h"
#include "builder/tool_names.h"
#include "text/numbers.h"
#include "text/paths.h"
#include "workspace/linker_text.h"
#include "workspace/workspace.h"

namespace qrex {

namespace {

// The libraries of the gcc family, dependents ahead of what they depend on: a walk behind the subprojects, turned
// round. A dynamic library has what it needs linked in; a static one leaves that to its user.
class GccLibraries {
 public:
  explicit GccLibraries(const Project& project) {
    Visit(project);
    m_order.pop_back();  // the project itself
    std::reverse(m_order.begin(), m_order.end());
  }
  const std::vector<const Project*>& Order() const { return m_order; }

 private:
  void Visit(const Project& project) {
    if (!m_seen.insert(&project).second) return;
    const bool isFirst = m_seen.size() == 1;
    if (isFirst || project.targetType == TargetType::StaticLibrary) {
      for (auto path = project.subprojects.rbegin(); path != project.subprojects.rend(); ++path) {
        const Project* subproject = project.workspace->FindSubproject(*path);
        if (subproject && IsLibrary(subproject->targetType)) Visit(*subproject);
      }
    }
    m_order.push_back(&project);
  }

  std::set<const Project*> m_seen;
  std::vector<const Project*> m_order;
};

std::string GccLibraryPath(const Project& library, const ProjectConfig& config) {
  const std::string& root = library.exported ? library.rootDir : library.settings->exportLib;
  const std::string target = GccTargetPath(library, config);
  return PathJoin(PathJoin3(root, config.platform, config.name), FileNameOf(target));
}

std::string ForConfiguration(std::string text, const ProjectConfig& config) {
  ReplaceAllInPlace(text, "$(Platform)", config.platform);
  ReplaceAllInPlace(text, "$(Configuration)", config.name);
  return text;
}

bool HasWholeProgramOptimization(const ProjectConfig& config) {
  auto found = config.generalOptions.find("WholeProgramOptimization");
  return found != config.generalOptions.end() && found->second == "1";
}

std::string VisualLinkerText(const ProjectConfig& config, const std::vector<std::string>& inputs) {
  std::string text;
  bool hasLtcg = false;
  for (const std::string& token : LinkerTokens(config.linkerText)) {
    if (token.front() != '/') continue;
    text.append(" ").append(ForConfiguration(token, config));
    hasLtcg = hasLtcg || EqualIgnoringCase(token, "/LTCG");
  }
  if (!hasLtcg && HasWholeProgramOptimization(config)) text += " /LTCG";
  for (const std::string& input : inputs) {
    text.append(" \"").append(ForConfiguration(input, config)).append("\"");
  }
  return text;
}

// The names in double quotes in the linker switches: libraries, unless they are switches or, with a `$`,
// left to make files.
std::vector<std::string> QuotedLibraries(const ProjectConfig& config) {
  std::vector<std::string> libraries;
  for (const std::string& token : LinkerTokens(config.linkerText)) {
    if (!IsQuoted(token)) continue;
    std::string name = ForConfiguration(Unquoted(token), config);
    const bool isSwitch = name.starts_with('-') && !name.starts_with("-l");
    if (!isSwitch && name.find('$') == std::string::npos) libraries.push_back(std::move(name));
  }
  return libraries;
}

// A static library leaves the libraries that it names to what it is linked into.
std::vector<std::string> LibrariesOfSubprojects(const Project& project, const ProjectConfig& config) {
  std::vector<std::string> libraries;
  if (project.targetType == TargetType::StaticLibrary) return libraries;
  const GccLibraries subprojects(project);
  for (const Project* subproject : subprojects.Order()) {
    if (subproject->targetType != TargetType::StaticLibrary) continue;
    const ProjectConfig* its = subproject->FindConfig(config.name, config.platform);
    if (!its) continue;
    const std::vector<std::string> named = QuotedLibraries(*its);
    libraries.insert(libraries.end(), named.begin(), named.end());
  }
  return libraries;
}

std::string GccLinkerText(const Project& project, const ProjectConfig& config, const std::string& target,
                          const std::vector<std::string>& inputs) {
  std::string text;
  if (project.targetType != TargetType::StaticLibrary) {
    text += "-o " + QuotedInput(project.settings->compiler, target);
    if (project.targetType == TargetType::DynamicLinkLibrary) {
      const std::string name(FileNameOf(target));
      const bool isOneWord = name.find(',') == std::string::npos;  // a comma would end it behind -Wl
      text += " -shared " + (isOneWord ? Quoted(project.settings->compiler, "-Wl,-soname," + name)
                                       : "-Xlinker -soname -Xlinker " + Quoted(project.settings->compiler, name));
    }
  }
  for (const std::string& input : inputs) text += " " + QuotedInput(project.settings->compiler, input);
  if (project.targetType == TargetType::StaticLibrary) return text;
  for (const std::string& library : LibrariesOfSubprojects(project, config)) text += " \"" + library + "\"";
  text += " -Xlinker -rpath -Xlinker '$ORIGIN'";  // the targets of a configuration share a folder, wherever it is moved
  for (const std::string& token : LinkerTokens(config.linkerText)) {
    std::string word = ForConfiguration(token, config);
    ReplaceAllInPlace(word, "$$", "$");  // as make reads it, for which the switches are written as well
    text += " " + word;
  }
  return text;
}

std::string LinkTool(const Project& project, const std::string& target) {
  const bool isStatic = project.targetType == TargetType::StaticLibrary;
  const Compiler& compiler = CompilerOf(project.settings->compiler);
  if (!isStatic) return std::string(compiler.link);
  std::string command(compiler.archive);
  if (compiler.family != CompilerFamily::Gcc) return command;
  return command + " \"" + AsInput(project.settings->compiler, target) + "\"";
}

}  // namespace

std::vector<std::string> CollectLinkInputs(Project& project, const ProjectConfig& config) {
  project.CollectFiles();
  const BuildPaths paths(project, config);
  const bool isGcc = IsGccFamily(project.settings->compiler);
  std::vector<std::string> inputs;
  for (const ProjectFile* file : project.files) {
    if (HasObject(*file)) {
      inputs.push_back(paths.Object(*file));
    } else if (file->kind == FileKind::Rc && !project.libraryIsStatic && !isGcc) {
      inputs.push_back(paths.ResourceObject(*file));
    }
  }
  if (project.targetType == TargetType::StaticLibrary) return inputs;
  if (isGcc) {
    const GccLibraries libraries(project);
    for (const Project* library : libraries.Order()) inputs.push_back(GccLibraryPath(*library, config));
  } else {
    std::set<std::string> libraries;
    GatherLibraries(project, config, LibraryChoice(), libraries);
    inputs.insert(inputs.end(), libraries.begin(), libraries.end());
  }
  return inputs;
}

std::vector<std::string> LibrariesOfSwitches(const Project& project, const ProjectConfig& config) {
  if (!IsGccFamily(project.settings->compiler) || project.targetType == TargetType::StaticLibrary) return {};
  std::vector<std::string> libraries = LibrariesOfSubprojects(project, config);
  const std::vector<std::string> own = QuotedLibraries(config);
  libraries.insert(libraries.end(), own.begin(), own.end());
  return libraries;
}

TargetCommand TargetCommandOf(const Project& project, const ProjectConfig& config, const std::string& target,
                              const std::vector<std::string>& inputs) {
  const bool isGcc = IsGccFamily(project.settings->compiler);
  return {LinkTool(project, target),
          isGcc ? GccLinkerText(project, config, target, inputs) : VisualLinkerText(config, inputs)};
}

}  // namespace qrex
