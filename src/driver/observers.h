// Who looks at the builds of a run, as its settings and the terminal say. Where nobody does, no observer is set.
#pragma once

#include <memory>
#include <vector>

#include "builder/build_observer.h"
#include "driver/progress.h"
#include "report/build_record.h"
#include "report/page.h"
#include "workspace/workspace.h"

namespace qrex {

class RunObservers {
 public:
  explicit RunObservers(ConfigSettings& settings);
  ~RunObservers();  // ends it, if an exception is under way
  RunObservers(const RunObservers&) = delete;
  RunObservers& operator=(const RunObservers&) = delete;

  void Expect(const Workspace& workspace);
  // Writes what the settings ask for, the page with what is declared in `loaded`, unless null. False: a file could not
  // be written, and a message has told.
  bool End(bool completed, Workspace* loaded);

 private:
  class ToAll;
  ConfigSettings& m_settings;
  MessageConsumer* const m_messagesBefore;
  std::unique_ptr<Progress> m_progress;
  std::unique_ptr<BuildRecord> m_record;
  std::unique_ptr<ToAll> m_all;
  bool m_hasEnded = false;
};

}  // namespace qrex
