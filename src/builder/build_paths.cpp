#include "builder/build_paths.h"

#include "text/paths.h"

namespace qrex {

std::string TranslationDirectory(const ProjectConfig& config) {
  return "qrexsource/" + config.platform + "/" + config.name;
}

std::string DependencyFilePath(const Project& project, const ProjectConfig& config) {
  return TranslationDirectory(config) + "/" + project.name + ".qrexdep";
}

std::string CompiledDirectory(const Project& project, const ProjectConfig& config) {
  return project.usesQrex ? TranslationDirectory(config) : project.rootDir;
}

std::vector<std::string> IncludePaths(const Project& project, const ProjectConfig& config, bool translated) {
  const std::string base = translated ? TranslationDirectory(config) : project.rootDir;
  std::vector<std::string> paths = {PathJoin(base, project.rootToProjDir), PathJoin(base, project.sourceDir)};
  if (translated) paths.push_back(base);
  const auto& roots = project.settings->virtualTree;
  paths.insert(paths.end(), roots.begin(), roots.end());
  return paths;
}

std::string_view GccTargetExtension(TargetType type) {
  static constexpr std::string_view kExtensions[] = {"", "a", "", "so", "???"};
  return kExtensions[static_cast<size_t>(type)];
}

std::string GccTargetName(const Project& project) {
  const std::string_view extension = GccTargetExtension(project.targetType);
  std::string name = (IsLibrary(project.targetType) ? "lib" : "") + project.name;
  if (!extension.empty()) name.append(".").append(extension);
  return name;
}

std::string GccTargetPath(const Project& project, const ProjectConfig& config) {
  return project.settings->exportLib + "/" + config.platform + "/" + config.name + "/" + GccTargetName(project);
}

bool IsTranslated(const Project& project) {
  return project.usesQrex && !project.hasFaultyFile && (!project.exported || IsLibrary(project.targetType));
}

bool IsTranslated(const ProjectFile& file) { return !file.project->exported || file.kind == FileKind::H; }

bool HasObject(const ProjectFile& file) {
  return file.kind == FileKind::C || file.kind == FileKind::Cpp || file.kind == FileKind::Asm;
}

BuildPaths::BuildPaths(const Project& project, const ProjectConfig& config)
    : m_project(project),
      m_config(config),
      m_translation(TranslationDirectory(config)),
      m_intermediate(config.platform + "/" + config.name + "/" + project.name) {}

std::string BuildPaths::Library() const {
  return PathJoin3(m_project.settings->exportLib, m_config.platform, m_config.name);
}

std::string BuildPaths::Translated(const ProjectFile& file) const { return PathJoin(m_translation, file.path); }

std::string BuildPaths::Compiled(const ProjectFile& file) const {
  return m_project.usesQrex ? Translated(file) : m_project.SourcePath(file);
}

std::string BuildPaths::Object(const ProjectFile& file) const {
  const bool isCompiled = file.kind != FileKind::Asm;  // the one assembler names its objects its own way
  const std::string_view extension = isCompiled && IsGcc() ? ".o" : ".obj";
  std::string path;
  path.reserve(m_intermediate.size() + 1 + file.stem.size() + extension.size());
  path.append(m_intermediate).append("/").append(file.stem).append(extension);
  return path;
}

std::string BuildPaths::ResourceObject(const ProjectFile& file) const {
  return m_intermediate + "/" + file.stem + ".res";
}

std::string BuildPaths::Target() const {
  if (IsGcc()) return GccTargetPath(m_project, m_config);
  return Library() + "/" + m_project.name + "." + std::string(TargetTypeExtension(m_project.targetType));
}

}  // namespace qrex
