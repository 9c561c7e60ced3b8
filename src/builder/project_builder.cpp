#include "builder/project_builder.h"

#include <algorithm>
#include <utility>

#include "builder/dependency_file.h"
#include "builder/make_reason.h"
#include "builder/reflection_tails.h"
#include "builder/staleness.h"
#include "builder/target_command.h"
#include "builder/tools.h"
#include "platform/system.h"
#include "text/files.h"
#include "text/output_policy.h"
#include "text/paths.h"
#include "text/trace.h"
#include "translator/file/position_map.h"
#include "translator/file/translate_file.h"

namespace qrex {

void ProjectBuilder::WriteHeading(std::string_view end) const {
  TraceWriter() << "\n------------------------------------- " << project.name << "  [" << config.name << "|"
                << config.platform << "] ------------------------------------------" << end;
}

bool ProjectBuilder::Build(const std::string& dependencyFile, const ProjectFile* singleFile) {
  bool hasSucceeded = false;
  Begin(dependencyFile, singleFile, [&](bool succeeded) { hasSucceeded = succeeded; });
  try {
    scheduler.WaitForAll();
  } catch (const IException&) {
    Save();
    throw;
  }
  return hasSucceeded;
}

void ProjectBuilder::Begin(const std::string& dependencyFile, const ProjectFile* singleFile,
                           std::function<void(bool)> whenOver) {
  m_dependencyFile = dependencyFile;
  if (!settings.translateOnly && settings.Environment()) ApplyEnvironment(*settings.Environment());
  // What these print is searched for words.
  if (RunsTools() && IsGccFamily(settings.compiler)) platform::SetEnvironment("LC_ALL", "C");
  WriteHeading("\n");
  if (project.exported) TraceWriter() << "[prepackaged - only processing headers]\n";
  PrepareFiles(dependencyFile);
  if (settings.observer) settings.observer->ProjectBegins(project.name, ExpectedSteps());
  try {
    RunSteps(singleFile);
    AddLastStep(std::move(whenOver));
  } catch (const IException&) {
    Save();
    throw;
  }
}

void ProjectBuilder::RunSteps(const ProjectFile* singleFile) {
  try {
    for (ScannedFile* file : scanned) ProcessFile(*file, singleFile);
    if (m_schemas && !singleFile) CheckSchemas();
  } catch (const IException&) {
    scheduler.WaitForAll();  // what was begun ahead of the error is finished
    throw;
  }
}

void ProjectBuilder::CheckSchemas() {
  if (m_hasFaultyFiles) return;  // the next run sees what they declare
  try {
    m_schemas->Check();
  } catch (const FaultyFileException&) {
    m_hasFailed = m_hasFaultyFiles = true;
  } catch (const LexScannerException& exception) {
    if (!settings.keepGoing) throw;
    m_hasFailed = true;
    ++errorCount;
    settings.faulty.insert(exception.file);
    settings.Tell(ErrorOf(exception));
  }
}

void ProjectBuilder::AddLastStep(std::function<void(bool)> whenOver) {
  auto link = [this]() -> std::unique_ptr<BuildStep> {
    if (project.exported || settings.mode != RunMode::Build) return nullptr;
    if (!m_hasFaultyFiles) ReportUnregistered();
    if (settings.translateOnly || m_hasFailed) return nullptr;
    if (const Project* const library = UnmadeLibrary()) return ReportUnlinked(*library);
    return LinkIfStale();
  };
  scheduler.AddBehind(link, [this, whenOver = std::move(whenOver)](bool succeeded) {
    m_hasFailed = m_hasFailed || !succeeded;
    if (succeeded && !m_linked.empty()) settings.made.insert(m_linked);
    if (m_prints && !m_linked.empty()) m_prints->Made(m_linked, {succeeded ? m_linkPrint : 0, StampOf(m_linked)});
    if (m_hasFailed) settings.unmade.insert(&project);
    Save();
    whenOver(!m_hasFailed);
  });
}

void ProjectBuilder::PrepareFiles(const std::string& dependencyFile) {
  project.CollectFiles();
  scannedByPath.reserve(project.files.size());
  if (settings.rebuildAll) {
    DeleteReporting(dependencyFile);
  } else if (!LoadDependencyFile(*this, dependencyFile) && settings.diagnostics) {
    TraceWriter() << "No dependency file " << dependencyFile << "\n";
  }
  if (!settings.translateOnly) CreateDirectories(paths.Intermediate(), true);
  m_savedFiles = FileCount();
  for (ProjectFile* file : project.files) scanned.push_back(&GetScannedFile(*file));
  if (settings.fingerprints) m_prints.emplace(*this, dependencyFile);
  if (settings.schemas && !project.exported) m_schemas.emplace(*this, *settings.schemas, dependencyFile);
  if ((dependencyFileLoaded || m_prints) && !TakeTimesAhead()) ReadTimes();
  for (ScannedFile* file : scanned) {
    file->needsWriting = MustTranslate(*this, *file, Prints());
    if (!file->needsWriting) continue;
    m_hasStaleFiles = true;
    if (timesAhead) timesAhead->End();  // a translation may run a script
    if (settings.observer) settings.observer->IsStale(paths.Translated(file->file), WhyTranslated(*this, *file));
    if (settings.diagnostics) TraceWriter() << "* " << file->file.name << "\n";
  }
  if (dependencyFileLoaded && m_hasStaleFiles) FindTailHolders(*this, m_savedFiles);
}

// What the steps of an unchanged project ask for, at once: many files are waited for together.
void ProjectBuilder::ReadTimes() {
  std::vector<std::string> asked;
  asked.reserve(3 * scanned.size());
  for (const ScannedFile* file : scanned) {
    asked.push_back(file->SourcePath());
    asked.push_back(paths.Translated(file->file));
  }
  if (RunsTools()) {
    for (const ScannedFile* file : scanned) {
      if (HasObject(file->file)) asked.push_back(paths.Object(file->file));
    }
  }
  const std::vector<FileStamp> found = StampsOf(asked);
  size_t at = 0;
  for (ScannedFile* file : scanned) {
    file->times.source = found[at].time;
    file->times.sourceSize = found[at++].size;
    file->times.target = found[at].time;
    file->times.targetSize = found[at++].size;
  }
  if (at == asked.size()) return;
  m_objectsOf.resize(FileCount());
  for (const ScannedFile* file : scanned) {
    if (!HasObject(file->file)) continue;
    m_objectsOf[file->index] = &*m_objects.try_emplace(std::move(asked[at]), Object{found[at]}).first;
    ++at;
  }
}

bool ProjectBuilder::TakeTimesAhead() {
  std::vector<TimesAhead::Stamps>* const known = timesAhead ? timesAhead->Of(project) : nullptr;
  if (!known) return false;
  m_objectsOf.resize(FileCount());
  m_objects.reserve(scanned.size());
  for (size_t i = 0; i < scanned.size(); ++i) {
    TimesAhead::Stamps& stamps = (*known)[i];
    ScannedFile& file = *scanned[i];
    file.times.source = stamps.source.time;
    file.times.sourceSize = stamps.source.size;
    file.times.target = stamps.translation.time;
    file.times.targetSize = stamps.translation.size;
    if (!RunsTools() || stamps.objectPath.empty()) continue;
    m_objectsOf[file.index] = &*m_objects.try_emplace(std::move(stamps.objectPath), Object{stamps.object}).first;
  }
  return true;
}

// A little more or less comes of what is met on the way.
size_t ProjectBuilder::ExpectedSteps() const {
  size_t count = 0;
  for (const ScannedFile* file : scanned) {
    bool isMade = file->needsWriting;
    if (RunsTools() && HasObject(file->file) && !isMade) {
      const auto* const object = file->index < m_objectsOf.size() ? m_objectsOf[file->index] : nullptr;
      isMade = !object || object->second.stamp.time <= file->times.target;
    }
    if (isMade && (!RunsTools() || HasObject(file->file))) ++count;
  }
  return count > 0 && RunsTools() && settings.mode == RunMode::Build ? count + 1 : count;
}

void ProjectBuilder::ProcessFile(ScannedFile& file, const ProjectFile* singleFile) {
  const FileKind kind = file.file.kind;
  const bool isBuild = settings.mode == RunMode::Build;
  const bool isWanted = isBuild || &file.file == singleFile;
  const bool isWritten = isWanted && !project.exported;
  if (file.file.isMainSource && RegistriesMoved()) WriteAgain(file, MakeReason::Cause::OthersRegister);
  if (kind == FileKind::Cpp && isWritten && m_hasStaleFiles && !file.needsWriting && !file.HasBegunInPass()) {
    if (TailsMoved(file)) WriteAgain(file, MakeReason::Cause::RecordsMove);
  }
  if (file.file.isMainSource && m_hasFaultyFiles && file.needsWriting && isWritten) {
    return LearnNames(file);  // it would lack what those register
  }
  if ((file.needsWriting || file.isKept) && (kind == FileKind::H || isWritten) && !Translate(file)) return;
  if (kind == FileKind::Cpp && singleFile && singleFile->isMainSource && file.times.translation == 0) LearnNames(file);
  if (RunsTools() && isBuild && CompilerOf(settings.compiler).compilesResources && kind == FileKind::Rc) {
    CompileResourceIfStale(file);
  }
  if (RunsTools() && HasObject(file.file) && isWanted) CompileIfStale(file);
  if (kind == FileKind::Cpp && !file.HasBegunInPass()) MarkRegistered(file);
}

bool ProjectBuilder::Translate(ScannedFile& file) {
  try {
    BringUpToDate(file);
    return true;
  } catch (const FaultyFileException&) {
    m_hasFailed = m_hasFaultyFiles = true;
    return false;
  }
}

// What no run has translated registers something or not: the main source, which is to be compiled alone, has to know.
// The file stays stale.
void ProjectBuilder::LearnNames(ScannedFile& file) {
  const bool needsWriting = std::exchange(file.needsWriting, false);
  Translate(file);
  file.needsWriting = needsWriting;
}

void ProjectBuilder::CompileResourceIfStale(ScannedFile& file) {
  const std::string path = paths.ResourceObject(file.file);
  const FileStamp made = StampOf(path), source = StampOf(file.SourcePath());
  const uint64_t print = m_prints ? m_prints->ResourcePrint(source) : 0;
  const bool isCurrent = source.time < made.time && !LiesAhead(*this, made.time);
  if (isCurrent && !(m_prints && m_prints->Differs(path, print, made))) return;
  scheduler.Add(ResourceStep(*this, file), [this, path, print](bool succeeded) {
    m_hasFailed = m_hasFailed || !succeeded;
    if (m_prints) m_prints->Made(path, {succeeded ? print : 0, StampOf(path)});
  });
}

ProjectBuilder::Objects::value_type& ProjectBuilder::ObjectOf(const ScannedFile& file) {
  if (file.index >= m_objectsOf.size()) m_objectsOf.resize(FileCount());
  Objects::value_type*& object = m_objectsOf[file.index];
  if (!object) {
    const auto [known, isNew] = m_objects.try_emplace(paths.Object(file.file));
    if (isNew) known->second.stamp = times.StampOf(known->first);
    object = &*known;
  }
  return *object;
}

void ProjectBuilder::CompileIfStale(ScannedFile& file) {
  auto& known = ObjectOf(file);
  const std::string& path = known.first;
  Object& object = known.second;
  if (!object.source) object.source = &file.file;
  if (object.source != &file.file) return ReportSharedObject(path, file.file, *object.source);
  if (!MustCompile(*this, file, object.stamp, Prints())) return;
  if (settings.observer) settings.observer->IsStale(path, WhyCompiled(*this, file, object.stamp.time));
  if (!Translate(file)) return;
  const uint64_t print = m_prints ? m_prints->ObjectPrint(file) : 0;
  scheduler.Add(ObjectStep(*this, file), [this, &path, print, &object, &file](bool succeeded) {
    m_hasFailed = m_hasFailed || !succeeded;
    object.stamp = times.StampOf(path);
    settings.made.insert(path);
    if (m_prints) m_prints->Made(file, {succeeded ? print : 0, object.stamp});
  });
}

// One of them would take the other's place in the target.
void ProjectBuilder::ReportSharedObject(const std::string& path, const ProjectFile& file, const ProjectFile& other) {
  TraceWriter() << "ERROR: No object can be made of " << file.path << " : " << path << " is that of " << other.path
                << "\n";
  ++errorCount;
  m_hasFailed = true;
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

// In a run that keeps going: the first of those that the target is linked with which could not be made. A static
// library leaves them to its users.
const Project* ProjectBuilder::UnmadeLibrary() const {
  if (!settings.keepGoing || settings.unmade.empty() || project.targetType == TargetType::StaticLibrary) return nullptr;
  std::vector<const Project*> open{&project};
  std::unordered_set<const Project*> seen{&project};
  while (!open.empty()) {
    const Project* const user = open.back();
    open.pop_back();
    for (const std::string& path : user->subprojects) {
      const Project* const used = project.workspace->FindSubproject(path);
      if (!used || !IsLibrary(used->targetType) || !seen.insert(used).second) continue;
      if (settings.unmade.contains(used)) return used;
      if (used->targetType == TargetType::StaticLibrary) open.push_back(used);
    }
  }
  return nullptr;
}

// The error is that of the library.
std::unique_ptr<BuildStep> ProjectBuilder::ReportUnlinked(const Project& library) {
  TraceWriter() << project.name << " is not linked: " << library.name << " could not be made\n";
  m_hasFailed = true;
  return nullptr;
}

// Most are the objects of the files from `next` on, in their order.
FileStamp ProjectBuilder::StampOfInput(const std::string& input, size_t& next) const {
  for (; next < scanned.size(); ++next) {
    const size_t index = scanned[next]->index;
    const auto* const object = index < m_objectsOf.size() ? m_objectsOf[index] : nullptr;
    if (!object) continue;
    if (object->first != input) break;
    ++next;
    return object->second.stamp;
  }
  const auto known = m_objects.find(input);
  return known == m_objects.end() ? StampOf(input) : known->second.stamp;
}

std::unique_ptr<BuildStep> ProjectBuilder::LinkIfStale() {
  if (project.targetType == TargetType::UtilityProject && IsGccFamily(settings.compiler)) return nullptr;  // no target
  const std::string target = paths.Target();
  const FileStamp targetStamp = StampOf(target);
  const int64_t targetTime = targetStamp.time;
  size_t next = 0;
  auto stampOf = [&](const std::string& input) { return StampOfInput(input, next); };
  std::vector<std::string> watched = LibrariesOfSwitches(project, config);
  const auto libraryCount = static_cast<std::ptrdiff_t>(watched.size());
  for (std::string& input : CollectLinkInputs(project, config)) watched.push_back(std::move(input));
  auto isLater = [&](const std::string& input) {
    const int64_t time = stampOf(input).time;
    return time > targetTime || (time == targetTime && settings.made.contains(input));
  };
  const auto later = targetTime == 0 ? watched.end() : std::find_if(watched.begin(), watched.end(), isLater);
  const bool liesAhead = LiesAhead(*this, targetTime);
  const bool isCurrent = targetTime != 0 && later == watched.end() && !liesAhead;
  if (m_prints) {
    const TargetCommand command = TargetCommandOf(project, config, target, {});
    m_linkPrint = m_prints->TargetPrint(command.tool + "\n" + command.text, watched, stampOf);
  }
  if (isCurrent && !(m_prints && m_prints->Differs(target, m_linkPrint, targetStamp))) return nullptr;
  if (settings.observer) {
    using Cause = MakeReason::Cause;
    const bool hasLater = targetTime != 0 && later != watched.end();
    const Cause cause = isCurrent         ? Cause::Differs
                        : targetTime == 0 ? Cause::Missing
                        : hasLater        ? Cause::Changed
                                          : Cause::Ahead;
    settings.observer->IsStale(target, {cause, hasLater ? *later : "", hasLater ? stampOf(*later).time : 0});
  }
  m_linked = target;
  return TargetStep(*this, target, {watched.begin() + libraryCount, watched.end()});
}

// Nothing was translated, or met for the first time: the dependency file would hold what it holds.
bool ProjectBuilder::IsAsSaved() const {
  return dependencyFileLoaded && FileCount() == m_savedFiles && !m_hasStaleFiles && !registerMap.dirty &&
         !unregisterMap.dirty && std::none_of(scannedByPath.begin(), scannedByPath.end(), [](const auto& file) {
           return file.second->HasBegun();
         });
}

// False, with an error told, where releases could not be recorded: then no file may count as translated.
bool ProjectBuilder::SaveSchemas() {
  if (!settings.schemas) return true;
  try {
    settings.schemas->Write();
    if (m_schemas) m_schemas->Save();
    return true;
  } catch (const IException& exception) {
    settings.faulty.insert(settings.schemaLock);
    settings.Tell(ErrorOf(exception));
    return false;
  }
}

// A registration that the main source does not hold yet must not be lost: saved with time 0 it is written again.
void ProjectBuilder::Save() {
  if (!SaveSchemas()) return;
  if (registerMap.dirty || unregisterMap.dirty) {
    for (ScannedFile* file : scanned) {
      if (file->file.isMainSource && (!file->HasBegun() || file->needsWriting)) file->times.translation = 0;
    }
  }
  if (m_hasStaleFiles) ForgetUnsettledTails(*this);
  const bool isSaved = IsAsSaved() && !platform::IsLink(m_dependencyFile) && TouchFile(m_dependencyFile, false);
  if (!isSaved) SaveDependencyFile(*this, m_dependencyFile);
  if (m_prints) m_prints->Save();
  if (settings.observer) settings.observer->ProjectEnds(*this);
}

void ProjectBuilder::Clean(const std::string& dependencyFile) {
  WriteHeading("\n");
  project.CollectFiles();
  auto remove = [this](const std::string& path) {
    if (!DeleteReporting(path)) ++errorCount;
  };
  remove(dependencyFile);
  if (settings.fingerprints) remove(FingerprintPath(dependencyFile));
  if (!settings.schemaLock.empty()) remove(ProjectSchemas::NotePath(dependencyFile));
  for (const ProjectFile* file : project.files) {
    remove(paths.Translated(*file));
    if (settings.positionMaps) remove(PositionMap::PathFor(paths.Translated(*file)));
  }
}

namespace {

void AddPublicFiles(const ProjectFolder& folder, std::vector<const ProjectFile*>& files) {
  for (const ProjectFile* file : folder.files) {
    if (!file->excluded) files.push_back(file);
  }
  for (const auto& subfolder : folder.subfolders) {
    if (&folder == &folder.project->rootFolder && subfolder->name == "src") continue;
    AddPublicFiles(*subfolder, files);
  }
}

}  // namespace

std::vector<const ProjectFile*> PublicFiles(Project& project) {
  project.CollectFiles();
  std::vector<const ProjectFile*> files;
  AddPublicFiles(project.rootFolder, files);
  return files;
}

void ExportPublicHeaders(Project& project, ProjectConfig& config) {
  const ConfigSettings& settings = *project.settings;
  const bool readOnly = settings.makeExportedHeaderFilesReadOnly;
  for (const ProjectFile* file : PublicFiles(project)) {
    const std::string source = project.SourcePath(*file);
    const std::string translated = project.usesQrex ? PathJoin(TranslationDirectory(config), file->path) : source;
    CopyIfNewer(settings.leftovers, translated, settings.exportTranslatedInclude + "/" + file->path, readOnly);
    CopyIfNewer(settings.leftovers, source, settings.exportUntranslatedInclude + "/" + file->path, readOnly);
  }
}

}  // namespace qrex
