#include "driver/run_workspace.h"

#include <memory>
#include <string>
#include <unordered_set>
#include <vector>

#include "builder/project_builder.h"
#include "builder/schema_lock.h"
#include "driver/compile_commands.h"
#include "driver/configured_paths.h"
#include "driver/depfile.h"
#include "driver/listing.h"
#include "driver/observers.h"
#include "driver/project_queue.h"
#include "driver/report_page.h"
#include "driver/run_hints.h"
#include "generators/common.h"
#include "generators/exported_project.h"
#include "generators/generate.h"
#include "platform/console.h"
#include "platform/folder_lock.h"
#include "text/file_lookup.h"
#include "text/files.h"
#include "text/output_policy.h"
#include "text/paths.h"
#include "text/scope_timer.h"
#include "text/trace.h"
#include "workspace/workspace.h"
#include "workspace/workspace_parser.h"

namespace qrex {

namespace {

enum class LoadedTo { Run, Ask };  // a question writes nothing

class WorkspaceRun {
 public:
  explicit WorkspaceRun(ConfigSettings& settings, LoadedTo purpose = LoadedTo::Run)
      : m_settings(settings), m_purpose(purpose), m_workspace(settings) {}
  bool LoadAll();
  bool ReadSchemas();
  bool Run(ScopeTimer& timer);
  Workspace& Loaded() { return m_workspace; }
  bool IsCompleted() const { return m_isCompleted; }  // else an error has ended it early

 private:
  bool LoadWorkspaceFile(const std::string& entry);
  bool RunProjects(ScopeTimer& timer);
  bool IsLeftAlone(const Project& project) const;
  void GenerateProject(Project& project);
  bool ProcessProject(Project& project);
  void ReportLeftOut(size_t firstIndex) const;
  void Prepare(const Project& project);
  void MakeDirectories(const Project& project);
  void CreateMissingFiles(Project& project) const;
  void Repackage(const Project& project) const;
  bool BuildProject(Project& project);
  void GenerateWorkspace();
  ProjectFile* FindCompileFile(bool& found);
  bool CompileOneFile(ScopeTimer& timer);
  bool ShowGeneratedFile();

  ConfigSettings& m_settings;
  const LoadedTo m_purpose;
  Workspace m_workspace;
  std::optional<SchemaLock> m_schemas;
  Generator m_generator{m_settings.leftovers};
  ProjectQueue m_queue{m_settings};
  std::unordered_set<std::string> m_prepared;  // directories and marker files that are in place
  bool m_isCompleted = false;
};

std::string PrintedList(const std::vector<std::string>& entries) {
  std::string text = "[";
  for (size_t i = 0; i < entries.size(); ++i) text += (i > 0 ? "," : "") + entries[i];
  return text + "]\n";
}

void WriteOpening(const ConfigSettings& settings) {
  const std::string list = PrintedList(settings.workspaces);
  switch (settings.mode) {
    case RunMode::Clean:
      TraceWriter() << "Cleaning workspace " << list;
      break;
    case RunMode::Compile:
      TraceWriter() << "Compiling file " << settings.compileFilePath << "...\n";
      break;
    case RunMode::Build:
      TraceWriter() << "Building workspace " << list;
      break;
    case RunMode::Gen:
      TraceWriter() << "Generating workspace " << list;
      break;
    case RunMode::Show:
      TraceWriter() << "Showing generated file in workspace " << list;
      break;
  }
}

// --- Loading

bool WorkspaceRun::LoadAll() {
  for (std::string& entry : m_settings.workspaces) {
    if (HasExtension(entry, "qrws")) {
      if (!LoadWorkspaceFile(entry)) return false;
    } else {
      entry = ProjectPathOf(entry);
      m_workspace.LoadProject(entry);  // a project that fails has printed its message; the run goes on with it empty
    }
  }
  return m_workspace.CheckFileReferences();
}

bool WorkspaceRun::LoadWorkspaceFile(const std::string& entry) {
  std::string fullPath;
  if (!FindInTree(m_settings, entry, m_workspace.rootDir, fullPath)) {
    m_settings.Tell(Message(Severity::Error, "Error: ", "Couldn't open workspace file " + entry)
                        .WithHint(TriedInTree(m_settings, entry)));
    return false;
  }
  if (m_purpose == LoadedTo::Run) {
    CopyIfNewer(m_settings.leftovers, fullPath, m_settings.exportUntranslatedInclude + "/" + entry, true);
  }
  const size_t slash = entry.rfind('/');
  m_workspace.relativeDir = slash == std::string::npos ? std::string() : entry.substr(0, slash);
  WorkspaceParser parser(m_workspace, fullPath);
  MpfwSourceFile* file = parser.LoadSourceFile(fullPath);
  if (!file) {
    TraceWriter() << "Error in workspace file " << fullPath << "\n";
    return false;
  }
  const TextRange expansion{std::string_view(file->expansion)};
  try {
    parser.SetInput(expansion);
    m_workspace.name = parser.ParseWorkspace();
    return true;
  } catch (LexScannerException& exception) {
    MapErrorPosition(file->map, expansion, exception);
    m_settings.macroWorld.messages->Take(ParseErrorOf(m_settings.sourceFiles, exception));
    return false;
  }
}

// With the key schemaLock; only a run that translates keeps it.
bool WorkspaceRun::ReadSchemas() {
  const bool translates = m_settings.mode == RunMode::Build || m_settings.mode == RunMode::Compile;
  if (m_settings.schemaLock.empty() || !translates) return true;
  try {
    m_settings.schemas = &m_schemas.emplace(m_settings);
    return true;
  } catch (const IException& exception) {
    m_settings.Tell(ErrorOf(exception));
    return false;
  }
}

// --- Projects

bool WorkspaceRun::Run(ScopeTimer& timer) {
  switch (m_settings.mode) {
    case RunMode::Compile:
      return CompileOneFile(timer);
    case RunMode::Show:
      return ShowGeneratedFile();
    default:
      return RunProjects(timer);
  }
}

bool WorkspaceRun::RunProjects(ScopeTimer& timer) {
  m_workspace.SortProjects();
  if (CompilerOf(m_settings.compiler).keepsGuids) m_workspace.SyncProjectGuids();
  if (m_settings.mode == RunMode::Gen) {
    MemoryTextWriter names;
    for (const auto& project : m_workspace.projects) {
      if (project != m_workspace.projects.front()) names << " ";
      names << project->name;
    }
    WriteIfChanged(m_settings.leftovers, names, m_workspace.name + ".projects");
    for (const auto& project : m_workspace.projects) {
      if (!IsLeftAlone(*project)) GenerateProject(*project);
    }
    GenerateWorkspace();
  } else {
    if (m_settings.mode == RunMode::Build && !m_settings.rebuildAll) m_queue.Expect(m_workspace.projects);
    for (size_t i = 0; i < m_workspace.projects.size(); ++i) {
      Project& project = *m_workspace.projects[i];
      if (IsLeftAlone(project) || ProcessProject(project)) continue;
      m_queue.Finish();
      ReportLeftOut(i + 1);
      return false;
    }
    if (!m_queue.Finish()) return false;
  }
  const bool isWhole = m_queue.Errors() == 0 && m_settings.faulty.empty() && IsWholeWorkspace(m_workspace);
  // Who asks for a dependency file goes by the exit status: without one it is not 0.
  const bool isTold = m_settings.depfile.empty() || (isWhole && WriteDepfile(m_workspace, m_generator.Files()));
  TraceWriter() << "\n";
  timer.Stop();
  timer.Label() << "Completed";
  m_isCompleted = true;
  if (m_queue.Warnings() > 0 || m_queue.Errors() > 0) {
    timer.Label() << " with " << m_queue.Warnings() << " warnings, " << m_queue.Errors() << " errors";
  }
  if (!m_settings.faulty.empty() || !isTold) return false;
  return m_queue.Errors() == 0 || (m_settings.mode != RunMode::Clean && !m_settings.failOnErrors);
}

// After an error that ends the run.
void WorkspaceRun::ReportLeftOut(size_t firstIndex) const {
  std::string names;
  for (size_t i = firstIndex; i < m_workspace.projects.size(); ++i) names += " " + m_workspace.projects[i]->name;
  if (!names.empty()) TraceWriter() << Hint("the run ends here and leaves out:" + names);
}

// What is known of it is no more than its name: no file that an earlier run wrote of it is touched.
bool WorkspaceRun::IsLeftAlone(const Project& project) const {
  if (!project.hasFaultyFile) return false;
  TraceWriter() << Hint("nothing is done for the project of " + project.filePath + ", whose error is told above");
  return true;
}

// Builds or cleans.
bool WorkspaceRun::ProcessProject(Project& project) {
  Prepare(project);
  if (m_settings.mode != RunMode::Clean) {
    if (!project.exported) WriteExportedProject(project);
    if (m_settings.mode == RunMode::Build) Repackage(project);
  }
  const bool isTranslated = project.usesQrex && (!project.exported || IsLibrary(project.targetType));
  if (isTranslated) return BuildProject(project);
  if (!m_queue.ExportsHeaders(project)) return true;
  ProjectConfig* config = project.ConfigOfRun();
  if (!config) return false;
  ExportPublicHeaders(project, *config);
  return true;
}

void WorkspaceRun::GenerateProject(Project& project) {
  Prepare(project);
  project.CollectFiles();
  if (!project.exported) CreateMissingFiles(project);
  m_generator.WriteProject(project, Form::Plain);
  if (!project.exported) WriteExportedProject(project);
  if (!project.usesQrex) return;
  m_generator.WriteProject(project, Form::Translated);
  TellCopiedSources(project);
}

void WorkspaceRun::Prepare(const Project& project) {
  MakeDirectories(project);
  const std::string marker = PathJoin(project.rootDir, kMarkerFile);
  if (!m_prepared.contains(marker) &&
      CopyIfNewer(m_settings.leftovers, marker, m_settings.exportUntranslatedInclude + "/" + kMarkerFile, false)) {
    m_prepared.insert(marker);
  }
}

void WorkspaceRun::MakeDirectories(const Project& project) {
  auto make = [this](const std::string& path) {
    if (m_prepared.insert(path).second) CreateDirectories(path, true);
  };
  for (const auto& config : project.configs) {
    if (!m_settings.translateOnly) {
      make(config->platform + "/" + config->name + "/" + project.name);
    }
    if (project.exported) continue;
    const bool isLibrary = IsLibrary(project.targetType);
    // A build makes the folder of a program ahead of its link; the generated projects find it made.
    if (!m_settings.translateOnly && (isLibrary || m_settings.mode == RunMode::Gen)) {
      make(PathJoin3(m_settings.exportLib, config->platform, config->name));
    }
    if (!isLibrary) continue;
    make(m_settings.exportTranslatedInclude);
    make(m_settings.exportUntranslatedInclude);
  }
}

void WorkspaceRun::CreateMissingFiles(Project& project) const {
  FileLookup files;
  for (const ProjectFile* file : project.files) {
    const std::string path = project.SourcePath(*file);
    if (files.Exists(path)) continue;
    WriteToConsole("Creating missing file " + path + "\n" + Hint(project.ListingHint(*file)));
    if (!CreateEmptyFile(path, false)) WriteToConsole("Error creating " + path + "\n");
  }
}

// The built target of a prepackaged project goes to the library directory: by the name that every compiler looks for
// and, in the gcc family, by the one that its tools give it.
void WorkspaceRun::Repackage(const Project& project) const {
  if (!m_settings.repackageExecutableTargets || !project.exported) return;
  if (project.targetType == TargetType::UtilityProject) return;
  auto copy = [&](const std::string& name) {
    const std::string target = m_settings.platform + "/" + m_settings.config + "/" + name;
    CopyIfNewer(m_settings.leftovers, PathJoin(project.rootDir, target), m_settings.exportLib + "/" + target, false);
  };
  copy(project.name + "." + std::string(TargetTypeExtension(project.targetType)));
  if (IsGccFamily(m_settings.compiler)) copy(GccTargetName(project));
}

bool WorkspaceRun::BuildProject(Project& project) {
  ProjectConfig* config = project.ConfigOfRun();
  if (!config) return false;
  return m_settings.mode == RunMode::Clean ? m_queue.Clean(project, *config) : m_queue.Build(project, *config);
}

void WorkspaceRun::GenerateWorkspace() {
  if (IsVisualCpp(m_settings.compiler) && !m_settings.platformEnvironments.empty()) {
    ApplyEnvironment(m_settings.platformEnvironments.begin()->second);
  }
  m_generator.WriteWorkspace(m_workspace, Form::Plain);
  if (AnyProjectUsesQrex(m_workspace)) m_generator.WriteWorkspace(m_workspace, Form::Translated);
  HintAtCallOfMake(m_workspace);
}

// --- One file

ProjectFile* WorkspaceRun::FindCompileFile(bool& found) {
  std::string root, relative;
  found = FindWorkspaceRoot(m_settings.compileFilePath, root, relative);
  if (!found) {
    TraceWriter() << "Search for " << kMarkerFile << " failed\n"
                  << Hint("an empty file of that name marks the root of the tree, above " + m_settings.compileFilePath);
    return nullptr;
  }
  ProjectFile* file = m_workspace.FindFile(relative);
  return file && file->project->usesQrex ? file : nullptr;
}

bool WorkspaceRun::CompileOneFile(ScopeTimer& timer) {
  bool found;
  ProjectFile* file = FindCompileFile(found);
  if (!found) return false;
  auto abort = [](std::string_view why) {
    TraceWriter() << "Compilation aborted: File is " << why << "\n";
    return false;
  };
  if (!file) return abort("not part of an qrex project");
  Project& project = *file->project;
  if (project.exported) return abort("part of an exported project");
  if (file->kind != FileKind::C && file->kind != FileKind::Cpp && file->kind != FileKind::Asm) {
    return abort("not a cpp, c or asm file");
  }
  ProjectConfig* config = project.ConfigOfRun();
  if (!config) return false;
  DeleteReporting(BuildPaths(project, *config).Translated(*file));
  if (!m_queue.Compile(project, *config, *file)) return false;
  TraceWriter() << "\n";
  timer.Stop();
  timer.Label() << "Compile completed";
  m_isCompleted = true;
  return true;
}

bool WorkspaceRun::ShowGeneratedFile() {
  bool found;
  const ProjectFile* file = FindCompileFile(found);
  if (!found) return false;
  if (!file) {
    TraceWriter() << "File is not part of an qrex project\n";
    return false;
  }
  const ProjectConfig* config = file->project->ConfigOfRun();
  if (!config) return false;
  TraceWriter() << "\n" << PathJoin(TranslationDirectory(*config), file->path) << "(1)\n";
  return true;
}

// Tools of two builds in one folder would write over each other's objects and captured output.
void WaitForOtherBuilds(platform::FolderLock& folder) {
  if (folder.TryToTake()) return;
  uint64_t holder = folder.Holder();
  if (!platform::IsProcessRunning(holder)) holder = 0;  // killed: what it started is about to end
  TraceWriter() << "Waiting for " << (holder == 0 ? "another process" : "process " + std::to_string(holder))
                << ", which builds in this folder\n";
  platform::FlushStdout();
  folder.Take();
}

// The keeper shares the lock: the next build must not find it held any more.
struct KeeperEnd {
  platform::Processes& tools;
  ~KeeperEnd() { tools.Stop(); }
};

}  // namespace

bool RunWorkspace(ConfigSettings& settings, std::shared_ptr<void>* loaded) {
  ScopeTimer timer;
  WriteOpening(settings);
  if (!CheckPathSyntax(settings)) return false;
  platform::FolderLock folder(".");
  const bool builds = settings.mode == RunMode::Build || settings.mode == RunMode::Compile;
  const KeeperEnd keeperEnd{settings.tools};
  if (builds && !settings.translateOnly) {
    if (settings.jobs != 1) settings.jobServer = platform::JobServer::FromEnvironment();
    WaitForOtherBuilds(folder);
    if (!settings.outputNotes.DeleteNoted()) return false;
  }
  const auto run = std::make_shared<WorkspaceRun>(settings);
  if (loaded) *loaded = run;
  RunObservers observers(settings);
  observers.Expect(run->Loaded());
  const bool isLoaded = run->LoadAll();
  const bool succeeded = isLoaded && run->ReadSchemas() && WriteCompileCommands(run->Loaded()) && run->Run(timer);
  return observers.End(run->IsCompleted(), isLoaded ? &run->Loaded() : nullptr) && succeeded;
}

std::shared_ptr<Workspace> LoadToAsk(ConfigSettings& settings) {
  if (!CheckPathSyntax(settings)) return nullptr;
  const auto run = std::make_shared<WorkspaceRun>(settings, LoadedTo::Ask);
  run->LoadAll();
  run->Loaded().SortProjects();
  return {run, &run->Loaded()};
}

bool ListWorkspace(ConfigSettings& settings, std::string& list) {
  if (!CheckPathSyntax(settings)) return false;
  WorkspaceRun run(settings, LoadedTo::Ask);
  if (!run.LoadAll() || !IsWholeWorkspace(run.Loaded())) return false;
  list = ListingOf(run.Loaded());
  return true;
}

bool AnswerQuestion(ConfigSettings& settings, const Question& question) {
  if (!CheckPathSyntax(settings)) return false;
  WorkspaceRun run(settings, LoadedTo::Ask);
  if (!run.LoadAll() || !IsWholeWorkspace(run.Loaded())) return false;
  run.Loaded().SortProjects();
  if (question.about == Question::About::Page) return WriteWorkspacePage(run.Loaded(), question.file);
  std::optional<std::string> answer;
  try {
    answer = AnswerTo(question, run.Loaded());
  } catch (const IException& exception) {
    settings.Tell(ErrorOf(exception));
  }
  if (answer) WriteToConsole(*answer);
  return answer.has_value();
}

bool FollowPositions(ConfigSettings& settings, Follow follow, const std::vector<std::string>& positions) {
  if (!CheckPathSyntax(settings)) return false;
  WorkspaceRun run(settings, LoadedTo::Ask);
  if (!run.LoadAll()) return false;
  PositionFilter filter(run.Loaded(), follow);
  if (positions.empty()) filter.Run();
  std::string text;
  for (const std::string& position : positions) {
    const auto followed = filter.Rewritten(position);
    if (!followed) {
      TraceWriter() << "Error: " << position << " is no position in a "
                    << (follow == Follow::Back ? "file that was translated" : "source that is translated") << "\n";
      return false;
    }
    text += *followed + "\n";
  }
  WriteToConsole(text);
  return true;
}

}  // namespace qrex
