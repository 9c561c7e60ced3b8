#include "builder/scheduler.h"

#include <algorithm>
#include <utility>

#include "platform/system.h"
#include "text/trace.h"

namespace qrex {

namespace {

// Compilers that write into one file of debug information, or read a precompiled header that another source makes, run
// one after the other.
size_t SlotCount(const ConfigSettings& settings) {
  if (!IsGccFamily(settings.compiler)) return 1;
  return settings.jobs == 0 ? platform::ProcessorCount() : static_cast<size_t>(settings.jobs);
}

}  // namespace

Scheduler::Scheduler(const ConfigSettings& settings)
    : m_tools(settings.tools),
      m_slots(SlotCount(settings)),
      m_jobServer(settings.jobServer.get()),
      m_observer(settings.observer) {}

void Scheduler::Add(std::unique_ptr<BuildStep> step, std::function<void(bool)> whenOver) {
  while (!m_begun.empty() && WaitForOne(0)) {  // what has ended meanwhile is told at once, an interrupt most of all
  }
  Begun begun;
  begun.step = std::move(step);
  begun.whenOver = std::move(whenOver);
  AwaitToken();
  RunNext(begun);
  Queue(std::move(begun));
}

void Scheduler::AddBehind(std::function<std::unique_ptr<BuildStep>()> make, std::function<void(bool)> whenOver) {
  Begun begun;
  begun.make = std::move(make);
  begun.whenOver = std::move(whenOver);
  Queue(std::move(begun));
}

void Scheduler::Queue(Begun begun) {
  m_begun.push_back(std::move(begun));
  HoldTraceBehind();
  FinishInOrder();
  while (RunningCount() >= m_slots) WaitForOne();
}

void Scheduler::WaitForAll() {
  while (!m_begun.empty()) WaitForOne();
}

void Scheduler::Abandon() {
  if (m_begun.empty()) return;
  m_tools.EndAll();
  while (WaitForTool(0)) {
  }
  m_begun.clear();
  HoldTraceBehind();
  if (m_jobServer) m_jobServer->KeepTokens(0);
}

std::string Scheduler::TextOf(const std::function<void()>& work) {
  std::string text;
  HoldTrace(&text);
  try {
    work();
  } catch (...) {
    HoldTraceBehind();
    throw;
  }
  HoldTraceBehind();
  return text;
}

// The first program of a make's job runs on the token of that job.
void Scheduler::AwaitToken() {
  constexpr int kBetweenTries = 20;  // milliseconds
  if (!m_jobServer) return;
  while (RunningCount() > m_jobServer->TokenCount() && !m_jobServer->TryTakeToken()) WaitForOne(kBetweenTries);
}

void Scheduler::RunNext(Begun& begun) {
  std::optional<Command> command = begun.step->Prepare();
  begun.isOver = !command;
  begun.ended.reset();
  if (!command) return;
  begun.command = std::move(*command);
  begun.command.showsOutputBehind = m_observer && m_observer->HoldsTerminal() && !begun.command.capturesOutput;
  begun.id = StartCommand(m_tools, begun.command);
  if (m_observer) m_observer->ToolBegins(begun.id, begun.step->Task());
}

std::optional<platform::Processes::Ended> Scheduler::WaitForTool(int milliseconds) {
  if (!m_observer) return m_tools.WaitForAny(milliseconds);
  const bool isForever = milliseconds == platform::Processes::kForever;
  for (;;) {
    std::optional<platform::Processes::Ended> ended =
        m_tools.WaitForAny(isForever ? m_observer->Patience() : milliseconds);
    if (ended) m_observer->ToolEnds(ended->id, ended->end);
    if (ended || m_tools.RunningCount() == 0 || milliseconds == 0) return ended;
    m_observer->StillWaiting();
    if (!isForever) return ended;
  }
}

bool Scheduler::MakeStep(Begun& begun) {
  if (RunningCount() >= m_slots) return false;
  if (m_jobServer && RunningCount() > m_jobServer->TokenCount() && !m_jobServer->TryTakeToken()) return false;
  begun.step = std::exchange(begun.make, nullptr)();
  if (begun.step) {
    RunNext(begun);
  } else {
    begun.isOver = true;
  }
  return true;
}

bool Scheduler::WaitForOne(int milliseconds) {
  std::optional<platform::Processes::Ended> ended = WaitForTool(milliseconds);
  if (!ended) return false;
  const auto begun = std::find_if(m_begun.begin(), m_begun.end(),
                                  [&](const Begun& each) { return each.IsRunning() && each.id == ended->id; });
  if (begun == m_begun.end()) return true;
  if (ended->end.IsInterrupt()) {  // by the user, of all
    const Command command = begun->command;
    Abandon();
    EndCommand(command, std::move(*ended));
  }
  begun->ended = std::move(ended);
  FinishInOrder();
  if (m_jobServer) m_jobServer->KeepTokens(std::max<size_t>(RunningCount(), 1) - 1);
  return true;
}

void Scheduler::FinishInOrder() {
  try {
    while (!m_begun.empty()) {
      HoldTrace(nullptr);
      Begun& first = m_begun.front();
      if (first.make && !MakeStep(first)) break;
      if (first.ended) {
        first.step->Finish(EndCommand(first.command, std::move(*first.ended)));
        RunNext(first);
      }
      if (!first.isOver) break;
      const bool hasSucceeded = !first.step || first.step->HasSucceeded();
      first.step.reset();
      if (m_observer) m_observer->StepIsOver(first.id, hasSucceeded);
      first.whenOver(hasSucceeded);
      if (!first.textBehind.empty()) WriteHeldToTrace(first.textBehind);
      m_begun.pop_front();
    }
  } catch (...) {
    Abandon();
    throw;
  }
  HoldTraceBehind();
}

void Scheduler::HoldTraceBehind() { HoldTrace(m_begun.empty() ? nullptr : &m_begun.back().textBehind); }

size_t Scheduler::RunningCount() const {
  return static_cast<size_t>(
      std::count_if(m_begun.begin(), m_begun.end(), [](const Begun& each) { return each.IsRunning(); }));
}

}  // namespace qrex
