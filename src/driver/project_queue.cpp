#include "driver/project_queue.h"

#include <utility>

#include "driver/run_hints.h"
#include "text/exceptions.h"
#include "text/trace.h"

namespace qrex {

// What ends a build early is reported here, and ends the run: the projects that are under way keep what they know.
template <typename Work>
bool ProjectQueue::Guarded(Work work) {
  try {
    work();
    return true;
  } catch (const IException& exception) {
    for (Begun& begun : m_begun) begun.builder.Save();
    m_settings.Tell(ErrorOf(exception));
  }
  return false;
}

void ProjectQueue::Expect(const std::vector<std::unique_ptr<Project>>& projects) {
  m_timesAhead.emplace(m_settings.leftovers);
  for (const auto& project : projects) {
    const ProjectConfig* const config = project->FindConfig(m_settings.config, m_settings.platform);
    if (config && IsTranslated(*project)) {
      m_timesAhead->Add(*project, *config, !project->exported && !m_settings.translateOnly);
    }
  }
  m_timesAhead->Begin();
}

bool ProjectQueue::Build(Project& project, ProjectConfig& config) {
  Begun& begun = m_begun.emplace_back(m_settings, project, config, m_scheduler);
  if (m_timesAhead) begun.builder.timesAhead = &*m_timesAhead;
  return Guarded([&] {
    begun.builder.Begin(DependencyFilePath(project, config), nullptr,
                        [this, &begun](bool succeeded) { End(begun, succeeded); });
    if (ExportsHeaders(project)) Export(project, config);
  });
}

bool ProjectQueue::ExportsHeaders(const Project& project) const {
  return !project.exported && m_settings.exportPublicHeaders && m_settings.mode == RunMode::Build;
}

// They are in place ahead of the compilers of the next project, and what is said of them stands behind the link.
void ProjectQueue::Export(Project& project, ProjectConfig& config) {
  const std::string text = m_scheduler.TextOf([&] { ExportPublicHeaders(project, config); });
  if (m_begun.empty()) {
    WriteHeldToTrace(text);
  } else {
    m_begun.back().exportText = text;
  }
}

// They end in their order.
void ProjectQueue::End(Begun& begun, bool succeeded) {
  TellCopiedSources(begun.builder.project);
  m_errors += begun.builder.errorCount;
  m_warnings += begun.builder.warningCount;
  if (succeeded) {
    begun.timer.Stop();
    begun.timer.Label() << begun.builder.project.name;
  }
  const std::string exportText = std::move(begun.exportText);
  m_begun.pop_front();
  WriteHeldToTrace(exportText);
}

bool ProjectQueue::Compile(Project& project, ProjectConfig& config, const ProjectFile& file) {
  ProjectBuilder builder(m_settings, project, config, m_scheduler);
  return Guarded([&] { builder.Build(DependencyFilePath(project, config), &file); }) && m_settings.faulty.empty();
}

bool ProjectQueue::Clean(Project& project, ProjectConfig& config) {
  return Guarded([&] {
    ProjectBuilder builder(m_settings, project, config, m_scheduler);
    ScopeTimer timer;
    builder.Clean(DependencyFilePath(project, config));
    m_errors += builder.errorCount;
    if (builder.errorCount > 0) return;
    timer.Stop();
    timer.Label() << project.name;
  });
}

bool ProjectQueue::Finish() {
  if (m_timesAhead) m_timesAhead->End();
  return Guarded([&] { m_scheduler.WaitForAll(); });
}

}  // namespace qrex
