#include "builder/project_builder.h"

#include <algorithm>
#include <utility>

#include "builder/dependency_file.h"
#include "builder/reflection_tails.h"
#include "builder/staleness.h"
#include "builder/tools.h"
#include "platform/system.h"
#include "text/files.h"
#include "text/output_policy.h"
#include "text/paths.h"
#include "text/trace.h"
#include "translator/file/translate_file.h"

namespace qrex {

std::string TranslationDirectory(const ProjectConfig& config) {
  return "qrexsource/" + config.platform + "/" + config.name;
}

std::string DependencyFilePath(const Project& project, const ProjectConfig& config) {
  return TranslationDirectory(config) + "/" + project.name + ".qrexdep";
}

ProjectBuilder::ProjectBuilder(ConfigSettings& settings, Project& project, ProjectConfig& config)
    : settings(settings),
      project(project),
      config(config),
      m_translationDirectory(TranslationDirectory(config)),
      m_intermediateDirectory(config.platform + "/" + config.name + "/" + project.name) {}

ProjectBuilder::~ProjectBuilder() = default;

ScannedFile& ProjectBuilder::GetScannedFile(ProjectFile& file) {
  std::unique_ptr<ScannedFile>& slot = scannedByPath[file.path];
  if (!slot) slot = std::make_unique<ScannedFile>(*this, file);
  return *slot;
}

std::vector<const ScannedFile*> ProjectBuilder::FilesOfProject() const {
  std::vector<const ScannedFile*> files;
  for (const auto& [path, file] : scannedByPath) {
    if (file->file.project == &project && file->place != 0) files.push_back(file.get());
  }
  std::sort(files.begin(), files.end(), [](const auto* a, const auto* b) { return a->file.path < b->file.path; });
  return files;
}

bool ProjectBuilder::RegisterGuid(const guid& id, const std::string& owner, std::string& existingOwner) {
  const auto [entry, isNew] = m_guidOwners.emplace(id, owner);
  if (!isNew) existingOwner = entry->second;
  return isNew;
}

const ScannedFile* ProjectBuilder::FileOfPosition(const char* position) const {
  const auto holds = [position](const ScannedFile& file) {
    return file.HasBegun() && TextRange(std::string_view(file.text.source)).Contains(position);
  };
  if (m_lastPositioned && holds(*m_lastPositioned)) return m_lastPositioned;  // messages come in runs
  for (const auto& [name, file] : scannedByPath) {
    if (holds(*file)) return m_lastPositioned = file.get();
  }
  return nullptr;
}

bool ProjectBuilder::FindSourcePlace(const char* position, SourcePlace& place) const {
  const ScannedFile* const file = position ? FileOfPosition(position) : nullptr;
  if (!file) return false;
  const TextRange text{std::string_view(file->text.source)};
  const auto lines = m_lineStarts.try_emplace(file, text).first;
  place = {file->SourcePath(), lines->second.LineOf(position), position - text.begin,
           EndOfWord(text, position) - text.begin};
  return true;
}

void ProjectBuilder::Tell(const Message& message) {
  if (message.severity == Severity::Warning && message.code != 0) ++warningCount;
  settings.Tell(message);
}

void ProjectBuilder::TakenBack(ScannedFile& file) {
  m_lineStarts.erase(&file);
  if (m_lastPositioned == &file) m_lastPositioned = nullptr;
  registerMap.TakeBack(file.file.path);
  unregisterMap.TakeBack(file.file.path);
}

std::string ProjectBuilder::TranslatedPath(const ProjectFile& file) const {
  return PathJoin(m_translationDirectory, file.path);
}

std::string ProjectBuilder::LibraryDirectory() const {
  return PathJoin3(settings.exportLib, config.platform, config.name);
}

void ProjectBuilder::WriteHeading(std::string_view end) const {
  TraceWriter() << "\n------------------------------------- " << project.name << "  [" << config.name << "|"
                << config.platform << "] ------------------------------------------" << end;
}

bool ProjectBuilder::Build(const std::string& dependencyFile, const ProjectFile* singleFile) {
  const bool isBuild = settings.mode == RunMode::Build;
  if (!settings.translateOnly && settings.Environment()) ApplyEnvironment(*settings.Environment());
  // What these print is searched for words.
  if (RunsTools() && IsGccFamily(settings.compiler)) platform::SetEnvironment("LC_ALL", "C");
  WriteHeading("\n");
  if (project.exported) TraceWriter() << "[prepackaged - only processing headers]\n";
  PrepareFiles(dependencyFile);
  bool result = true;
  try {
    result = ProcessFiles(singleFile);
    if (!project.exported && isBuild) {
      ReportUnregistered();
      if (!settings.translateOnly && result) result = LinkIfStale();
    }
  } catch (const IException&) {
    Save(dependencyFile);
    throw;
  }
  Save(dependencyFile);
  return result;
}

void ProjectBuilder::PrepareFiles(const std::string& dependencyFile) {
  project.CollectFiles();
  if (settings.rebuildAll) {
    DeleteReporting(dependencyFile);
  } else if (!LoadDependencyFile(*this, dependencyFile) && settings.diagnostics) {
    TraceWriter() << "No dependency file " << dependencyFile << "\n";
  }
  if (!settings.translateOnly) CreateDirectories(IntermediateDirectory(), true);
  const size_t knownFiles = FileCount();
  for (ProjectFile* file : project.files) scanned.push_back(&GetScannedFile(*file));
  if (dependencyFileLoaded) ReadTimes();
  for (ScannedFile* file : scanned) {
    file->needsWriting = !dependencyFileLoaded || NeedsTranslation(*this, *file);
    if (!file->needsWriting) continue;
    hasStaleFiles = true;
    if (settings.diagnostics) TraceWriter() << "* " << file->file.name << "\n";
  }
  if (dependencyFileLoaded && hasStaleFiles) FindTailHolders(*this, knownFiles);
}

// What the steps of an unchanged project ask for, at once: many files are waited for together.
void ProjectBuilder::ReadTimes() {
  std::vector<std::string> paths;
  paths.reserve(3 * scanned.size());
  for (const ScannedFile* file : scanned) {
    paths.push_back(file->SourcePath());
    paths.push_back(TranslatedPath(*file));
  }
  if (RunsTools()) {
    for (const ScannedFile* file : scanned) {
      if (HasObject(file->file)) paths.push_back(ObjectPath(*this, file->file));
    }
  }
  const std::vector<int64_t> found = LastWriteTimes(paths);
  size_t at = 0;
  for (ScannedFile* file : scanned) {
    file->times.source = found[at++];
    file->times.target = found[at++];
  }
  for (; at < paths.size(); ++at) m_objectTimes.emplace(std::move(paths[at]), found[at]);
}

bool ProjectBuilder::ProcessFiles(const ProjectFile* singleFile) {
  bool result = true;
  for (ScannedFile* file : scanned) {
    if (!ProcessFile(*file, singleFile)) result = false;
  }
  return result;
}

bool ProjectBuilder::ProcessFile(ScannedFile& file, const ProjectFile* singleFile) {
  const FileKind kind = file.file.kind;
  const bool isBuild = settings.mode == RunMode::Build;
  const bool isWanted = isBuild || &file.file == singleFile;
  const bool isWritten = isWanted && !project.exported;
  bool result = true;
  if (file.file.isMainSource && RegistriesMoved()) WriteAgain(file);
  if (kind == FileKind::Cpp && isWritten && hasStaleFiles && !file.needsWriting && !file.HasBegunInPass()) {
    if (TailsMoved(file)) WriteAgain(file);
  }
  if ((file.needsWriting || file.isKept) && (kind == FileKind::H || isWritten)) BringUpToDate(file);
  if (kind == FileKind::Cpp && singleFile && singleFile->isMainSource && file.times.translation == 0) LearnNames(file);
  if (RunsTools() && isBuild && CompilerOf(settings.compiler).compilesResources && kind == FileKind::Rc) {
    result = CompileResourceIfStale(file);
  }
  if (RunsTools() && HasObject(file.file) && isWanted) result = CompileIfStale(file);
  if (kind == FileKind::Cpp && !file.HasBegunInPass()) MarkRegistered(file);
  return result;
}

// What no run has translated registers something or not: the main source, which is to be compiled alone, has to know.
// The file stays stale.
void ProjectBuilder::LearnNames(ScannedFile& file) {
  const bool needsWriting = std::exchange(file.needsWriting, false);
  BringUpToDate(file);
  file.needsWriting = needsWriting;
}

bool ProjectBuilder::CompileResourceIfStale(ScannedFile& file) {
  const int64_t resourceTime = LastWriteTime(ResourceObjectPath(*this, file.file));
  if (LastWriteTime(file.SourcePath()) < resourceTime && !LiesAhead(*this, resourceTime)) return true;
  return CompileResource(*this, file);
}

bool ProjectBuilder::CompileIfStale(ScannedFile& file) {
  const std::string object = ObjectPath(*this, file.file);
  const auto [known, isNew] = m_objectTimes.try_emplace(object);
  int64_t& objectTime = known->second;
  if (isNew) objectTime = times.LastWriteTime(object);
  if (LatestTargetTime(*this, file) < objectTime && !LiesAhead(*this, objectTime)) return true;
  BringUpToDate(file);
  const bool compiled = file.file.kind == FileKind::Asm ? AssembleFile(*this, file) : CompileFile(*this, file);
  objectTime = times.LastWriteTime(object);
  settings.made.insert(object);
  return compiled;
}

namespace {

std::string HowToRegister(const ScannedFile& header) {
  const ProjectFile& file = header.file;
  const std::string import = "@import \"" + file.name + "\"";
  if (file.pairedSource) return header.file.project->SourcePath(*file.pairedSource) + " lacks " + import;
  std::string source;
  ReplaceExtension(header.SourcePath(), "cpp", source);
  return "write " + source + " with the line " + import + ", and list it in " + file.project->filePath;
}

}  // namespace

void ProjectBuilder::ReportUnregistered() const {
  for (const ScannedFile* file : scanned) {
    if (!file->hasDeclarations || file->tail.isRegistered) continue;
    settings.Tell(Message(Severity::Error,
                          "error : ", "No cpp directly imports " + file->file.name + " - declarations not registered")
                      .At({file->SourcePath(), 1})
                      .WithHint(HowToRegister(*file)));
  }
}

bool ProjectBuilder::LinkIfStale() {
  if (project.targetType == TargetType::UtilityProject && IsGccFamily(settings.compiler)) return true;  // no target
  const std::string target = TargetPath(*this);
  const std::vector<std::string> inputs = CollectLinkInputs(*this);
  const int64_t targetTime = LastWriteTime(target);
  auto timeOf = [&](const std::string& input) {
    const auto known = m_objectTimes.find(input);
    return known == m_objectTimes.end() ? LastWriteTime(input) : known->second;
  };
  std::vector<std::string> watched = LibrariesOfSwitches(*this);
  watched.insert(watched.end(), inputs.begin(), inputs.end());
  auto isLater = [&](const std::string& input) {
    const int64_t time = timeOf(input);
    return time > targetTime || (time == targetTime && settings.made.contains(input));
  };
  const bool isCurrent = targetTime != 0 && std::none_of(watched.begin(), watched.end(), isLater);
  if (isCurrent && !LiesAhead(*this, targetTime)) return true;
  if (!MakeTarget(*this, target, inputs)) return false;
  settings.made.insert(target);
  return true;
}

// A registration that the main source does not hold yet must not be lost: saved with time 0 it is written again.
void ProjectBuilder::Save(const std::string& dependencyFile) {
  if (registerMap.dirty || unregisterMap.dirty) {
    for (ScannedFile* file : scanned) {
      if (file->file.isMainSource && (!file->HasBegun() || file->needsWriting)) file->times.translation = 0;
    }
  }
  if (hasStaleFiles) ForgetUnsettledTails(*this);
  SaveDependencyFile(*this, dependencyFile);
}

void ProjectBuilder::Clean(const std::string& dependencyFile) {
  WriteHeading("\n");
  project.CollectFiles();
  auto remove = [this](const std::string& path) {
    if (!DeleteReporting(path)) ++errorCount;
  };
  remove(dependencyFile);
  for (const ProjectFile* file : project.files) remove(TranslatedPath(*file));
}

namespace {

void ExportFolder(Project& project, const ProjectConfig& config, const ProjectFolder& folder) {
  const ConfigSettings& settings = *project.settings;
  const bool readOnly = settings.makeExportedHeaderFilesReadOnly;
  for (const ProjectFile* file : folder.files) {
    if (file->excluded) continue;
    const std::string source = project.SourcePath(*file);
    const std::string translated = project.usesQrex ? PathJoin(TranslationDirectory(config), file->path) : source;
    CopyIfNewer(settings.leftovers, translated, settings.exportTranslatedInclude + "/" + file->path, readOnly);
    CopyIfNewer(settings.leftovers, source, settings.exportUntranslatedInclude + "/" + file->path, readOnly);
  }
  for (const auto& subfolder : folder.subfolders) {
    if (&folder == &project.rootFolder && subfolder->name == "src") continue;
    ExportFolder(project, config, *subfolder);
  }
}

}  // namespace

void ExportPublicHeaders(Project& project, ProjectConfig& config) {
  project.CollectFiles();
  ExportFolder(project, config, project.rootFolder);
}

}  // namespace qrex
