// The projects of a run as they are built: while the last compilers of one still run, the next one is translated and
// its compilers begin. Links, messages and counts keep the order of the projects.
#pragma once

#include <cstdint>
#include <list>
#include <memory>
#include <optional>
#include <string>

#include "builder/project_builder.h"
#include "text/scope_timer.h"

namespace qrex {

class ProjectQueue {
 public:
  explicit ProjectQueue(ConfigSettings& settings) : m_settings(settings), m_scheduler(settings) {}

  void Expect(const std::vector<std::unique_ptr<Project>>& projects);  // builds of these, in their order
  // These are false when an error ends the run, which is told then.
  bool Build(Project& project, ProjectConfig& config);
  bool Compile(Project& project, ProjectConfig& config, const ProjectFile& file);
  bool Clean(Project& project, ProjectConfig& config);
  bool Finish();
  bool ExportsHeaders(const Project& project) const;

  int64_t Errors() const { return m_errors; }
  int64_t Warnings() const { return m_warnings; }

 private:
  struct Begun {
    Begun(ConfigSettings& settings, Project& project, ProjectConfig& config, Scheduler& scheduler)
        : builder(settings, project, config, scheduler) {}
    ProjectBuilder builder;
    ScopeTimer timer;
    std::string exportText;  // of the trace log
  };

  template <typename Work>
  bool Guarded(Work work);
  void Export(Project& project, ProjectConfig& config);
  void End(Begun& begun, bool succeeded);

  ConfigSettings& m_settings;
  std::optional<TimesAhead> m_timesAhead;
  std::list<Begun> m_begun;
  Scheduler m_scheduler;  // has steps of these
  int64_t m_errors = 0, m_warnings = 0;
};

}  // namespace qrex
