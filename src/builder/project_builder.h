// One project in one configuration, from its file list to its target.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "builder/build_files.h"
#include "builder/project_prints.h"
#include "builder/project_schemas.h"
#include "builder/scheduler.h"
#include "builder/times_ahead.h"

namespace qrex {

class ProjectBuilder : public BuildFiles {
 public:
  ProjectBuilder(ConfigSettings& givenSettings, Project& givenProject, ProjectConfig& givenConfig,
                 Scheduler& givenScheduler)
      : BuildFiles(givenSettings, givenProject, givenConfig), scheduler(givenScheduler) {}

  // Translates, and has the scheduler compile and link. `whenOver` is told, behind all steps, whether they succeeded;
  // until then the builder must live. With a single file only that file is compiled, and resources and the link are
  // left out. An exception of the translation goes on to the caller; what was finished before it is kept.
  void Begin(const std::string& dependencyFile, const ProjectFile* singleFile, std::function<void(bool)> whenOver);
  bool Build(const std::string& dependencyFile, const ProjectFile* singleFile);  // to the end
  void Save();  // the dependency file; for a builder that comes to no end, what is known so far
  // Behind a Build: translates again what follows from these files, whose texts have changed since, and no other. What
  // they and all that import them had declared is taken back. A pass that ends early, by an exception, is made good by
  // the next one.
  void TranslateAgain(const std::vector<ProjectFile*>& changed);
  void Clean(const std::string& dependencyFile);  // what could not be deleted counts as errors

  Scheduler& scheduler;
  TimesAhead* timesAhead = nullptr;  // not owned; null: nothing is read ahead

 private:
  struct Object {
    FileStamp stamp;
    const ProjectFile* source = nullptr;
  };
  using Objects = std::unordered_map<std::string, Object>;  // by path

  void WriteHeading(std::string_view end) const;
  const ProjectPrints* Prints() const { return m_prints ? &*m_prints : nullptr; }
  void RunSteps(const ProjectFile* singleFile);
  bool IsAsSaved() const;
  void CheckSchemas();
  bool SaveSchemas();
  void AddLastStep(std::function<void(bool)> whenOver);
  void PrepareFiles(const std::string& dependencyFile);
  void ReadTimes();
  bool TakeTimesAhead();
  size_t ExpectedSteps() const;
  bool RunsTools() const { return !project.exported && !settings.translateOnly; }
  bool Translate(ScannedFile& file);  // false: it failed, and the run goes on
  const Project* UnmadeLibrary() const;
  void ProcessFile(ScannedFile& file, const ProjectFile* singleFile);
  void BeginPass(const std::vector<ProjectFile*>& changed);
  bool RegistriesMoved();  // asked for the main source, behind all that could settle them
  void WriteAgain(ScannedFile& file, MakeReason::Cause why);  // though it was translated in an earlier pass
  void LearnNames(ScannedFile& file);
  void CompileResourceIfStale(ScannedFile& file);
  void CompileIfStale(ScannedFile& file);
  Objects::value_type& ObjectOf(const ScannedFile& file);
  void ReportSharedObject(const std::string& path, const ProjectFile& file, const ProjectFile& other);
  void ReportUnregistered() const;
  FileStamp StampOfInput(const std::string& input, size_t& next) const;
  std::unique_ptr<BuildStep> LinkIfStale();
  std::unique_ptr<BuildStep> ReportUnlinked(const Project& library);

  std::optional<ProjectPrints> m_prints;    // where the key asks for them
  std::optional<ProjectSchemas> m_schemas;  // so, too
  uint64_t m_linkPrint = 0;
  std::string m_dependencyFile;
  std::string m_linked;                           // the target, while it is
  Objects m_objects;                              // as the compile steps know them
  std::vector<Objects::value_type*> m_objectsOf;  // the same by the index of a source, as far as it was asked for
  size_t m_savedFiles = 0;                        // that the dependency file knew
  bool m_hasStaleFiles = false;                   // as judged from the dependency file and the times
  bool m_hasFailed = false;                       // a step has
  bool m_hasFaultyFiles = false;
};

// What is outside the project's `src` folder.
std::vector<const ProjectFile*> PublicFiles(Project& project);
// Copies what is outside the project's `src` folder to the export directories, translated and as it is.
void ExportPublicHeaders(Project& project, ProjectConfig& config);

}  // namespace qrex
