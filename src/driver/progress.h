// The status line of a build on a terminal: how much is done, what runs, how long, and what it is about.
//
//   [17/240] 3 running, 0:12, app/src/x.cpp
//
// While nothing ends, it tells what has been running longest, and since when. The total is what is known of the
// projects that have begun, with an estimate of those to come, so it may move.
#pragma once

#include <deque>
#include <map>
#include <string>

#include "builder/build_observer.h"
#include "platform/console.h"
#include "workspace/workspace.h"

namespace qrex {

// The line in so many columns: first its end goes, then the head of the path. Names may hold any bytes.
struct ProgressState {
  size_t done = 0, total = 0, running = 0;
  int64_t seconds = 0;  // of the run
  std::string subject;  // a path, or what a tool does
  int64_t since = 0;    // for how many seconds the subject has been running; told from a few on
};
std::string ProgressLine(const ProgressState& state, size_t columns);

class Progress : public BuildObserver {
 public:
  explicit Progress(const ConfigSettings& settings);

  // Whose projects are going to be built, in its order. Nothing is asked of the disk until something is stale.
  void Expect(const Workspace& workspace) { m_workspace = &workspace; }

  void ProjectBegins(const std::string& name, size_t expectedSteps) override;
  void ProjectEnds(const ProjectBuilder& builder) override;
  void TranslationBegins(const ScannedFile& file) override;
  void TranslationEnds(const ScannedFile& file) override;
  void ToolBegins(ToolId tool, const ToolTask& task) override;
  void ToolEnds(ToolId tool, const platform::ProcessEnd& end) override;
  int Patience() const override;
  void StillWaiting() override;
  bool HoldsTerminal() const override { return true; }

 private:
  struct Running {
    ToolId tool;
    std::string project, subject;
    bool counts;
    int64_t begin;
  };
  struct Steps {
    size_t expected = 0, done = 0;
  };

  void Estimate();
  void Count(const std::string& project) { ++m_projects[project].done; }
  size_t DoneCount() const;
  size_t TotalCount() const;
  void Tell(const std::string& subject);
  void Draw(const std::string& subject, int64_t begin);

  const ConfigSettings& m_settings;
  const int64_t m_begin;
  const Workspace* m_workspace = nullptr;
  platform::StatusLine m_line;
  std::map<std::string, Steps> m_projects;  // by name
  std::deque<Running> m_running;            // in the order of their beginnings
  bool m_isEstimated = false;
  bool m_isBehind = false;  // the line tells less than is known
  int64_t m_drawn = 0;      // when
};

}  // namespace qrex
