#include "driver/observers.h"

#include <algorithm>

#include "driver/report_page.h"
#include "platform/console.h"
#include "report/trace_file.h"

namespace qrex {

// Tells both.
class RunObservers::ToAll : public BuildObserver {
 public:
  ToAll(BuildObserver& first, BuildObserver& second) : m_all{&first, &second} {}

  void ProjectBegins(const std::string& name, size_t expectedSteps) override {
    for (BuildObserver* each : m_all) each->ProjectBegins(name, expectedSteps);
  }
  void ProjectEnds(const ProjectBuilder& builder) override {
    for (BuildObserver* each : m_all) each->ProjectEnds(builder);
  }
  void IsStale(const std::string& output, const MakeReason& why) override {
    for (BuildObserver* each : m_all) each->IsStale(output, why);
  }
  void TranslationBegins(const ScannedFile& file) override {
    for (BuildObserver* each : m_all) each->TranslationBegins(file);
  }
  void TranslationEnds(const ScannedFile& file) override {
    for (BuildObserver* each : m_all) each->TranslationEnds(file);
  }
  void ToolBegins(ToolId tool, const ToolTask& task) override {
    for (BuildObserver* each : m_all) each->ToolBegins(tool, task);
  }
  void ToolEnds(ToolId tool, const platform::ProcessEnd& end) override {
    for (BuildObserver* each : m_all) each->ToolEnds(tool, end);
  }
  void Take(const ToolMessage& message) override {
    for (BuildObserver* each : m_all) each->Take(message);
  }
  void StepIsOver(ToolId lastTool, bool completed) override {
    for (BuildObserver* each : m_all) each->StepIsOver(lastTool, completed);
  }
  int Patience() const override {
    const int first = m_all[0]->Patience(), second = m_all[1]->Patience();
    if (first < 0 || second < 0) return std::max(first, second);  // a negative one is endless
    return std::min(first, second);
  }
  void StillWaiting() override {
    for (BuildObserver* each : m_all) each->StillWaiting();
  }
  bool HoldsTerminal() const override { return m_all[0]->HoldsTerminal() || m_all[1]->HoldsTerminal(); }

 private:
  BuildObserver* const m_all[2];
};

RunObservers::RunObservers(ConfigSettings& settings)
    : m_settings(settings), m_messagesBefore(settings.macroWorld.messages) {
  if (settings.mode != RunMode::Build && settings.mode != RunMode::Compile) return;
  settings.coloursToolMessages = platform::StdoutTakesColours();
  if (platform::StatusColumns() != 0) settings.observer = (m_progress = std::make_unique<Progress>(settings)).get();
  if (settings.buildTrace.empty() && settings.report.empty()) return;
  m_record = std::make_unique<BuildRecord>(*settings.macroWorld.messages);
  settings.macroWorld.messages = m_record.get();
  settings.observer = m_record.get();
  if (!m_progress) return;
  m_all = std::make_unique<ToAll>(*m_progress, *m_record);
  settings.observer = m_all.get();
}

RunObservers::~RunObservers() { End(false, nullptr); }

void RunObservers::Expect(const Workspace& workspace) {
  if (m_progress) m_progress->Expect(workspace);
}

bool RunObservers::End(bool completed, Workspace* loaded) {
  if (std::exchange(m_hasEnded, true)) return true;
  m_settings.observer = nullptr;
  m_settings.macroWorld.messages = m_messagesBefore;
  m_progress.reset();
  if (!m_record) return true;
  m_record->End();
  bool isWritten = true;
  if (!m_settings.buildTrace.empty()) isWritten = WriteReport(m_settings, m_settings.buildTrace, TraceText(*m_record));
  if (!m_settings.report.empty()) {
    isWritten =
        WriteReport(m_settings, m_settings.report, BuildPage(m_settings, *m_record, completed, loaded)) && isWritten;
  }
  return isWritten;
}

}  // namespace qrex
