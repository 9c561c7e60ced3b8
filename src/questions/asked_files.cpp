#include "questions/asked_files.h"

#include "text/files.h"
#include "text/paths.h"
#include "text/trace.h"
#include "translator/file/translate_file.h"

namespace qrex {

bool AskedFiles::Translate() {
  const QuietConsole quiet;
  bool isDone = true;
  for (const auto& project : m_workspace.projects) {
    if (!IsTranslated(*project)) continue;
    isDone = Translate(*project) && isDone;
    if (!isDone && !m_workspace.settings.keepGoing) return false;
  }
  return isDone;
}

bool AskedFiles::Translate(Project& project) {
  ProjectConfig* const config = project.ConfigOfRun();
  if (!config) return false;
  project.CollectFiles();
  BuildFiles& files = *m_projects.emplace_back(std::make_unique<BuildFiles>(*project.settings, project, *config));
  bool isDone = true;
  for (ProjectFile* file : project.files) {
    if (!IsTranslated(*file)) continue;
    ScannedFile& scanned = files.GetScannedFile(*file);
    files.scanned.push_back(&scanned);
    try {
      BringUpToDate(scanned);
      m_files.push_back(&scanned);
    } catch (const FaultyFileException&) {
      m_faulty.push_back(&scanned);
      isDone = false;  // it has been told
    } catch (const IException& exception) {
      files.settings.Tell(ErrorOf(exception));
      return false;
    }
  }
  return isDone;
}

ProjectFile* FindAskedFile(const Workspace& workspace, std::string_view path) {
  std::string folder;
  FullPathOf(".", folder);
  if (!folder.ends_with('/')) folder += '/';
  std::string asked = CollapseDots(NormalisePath(path));
  if (asked.starts_with(folder)) asked.erase(0, folder.size());
  if (ProjectFile* const file = workspace.FindFile(asked)) return file;
  std::string full;
  FullPathOf(asked, full);
  for (const auto& project : workspace.projects) {
    std::vector<std::string> roots = {project->rootDir};
    for (const auto& config : project->configs) roots.push_back(TranslationDirectory(*config));
    for (const std::string& root : roots) {
      std::string fullRoot;
      FullPathOf(root, fullRoot);
      if (!full.starts_with(fullRoot + "/")) continue;
      ProjectFile* const file = workspace.FindFile(full.substr(fullRoot.size() + 1));
      if (file && file->project == project.get()) return file;
    }
  }
  return nullptr;
}

}  // namespace qrex
