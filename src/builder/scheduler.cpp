#include "builder/scheduler.h"

#include <algorithm>

namespace qrex {

void Scheduler::Add(std::unique_ptr<BuildStep> step, std::function<void(bool)> whenOver) {
  Begun begun;
  begun.step = std::move(step);
  begun.whenOver = std::move(whenOver);
  RunNext(begun);
  m_begun.push_back(std::move(begun));
  FinishInOrder();
  while (RunningCount() >= m_slots) WaitForOne();
}

void Scheduler::WaitForAll() {
  while (!m_begun.empty()) WaitForOne();
}

void Scheduler::Abandon() {
  if (m_begun.empty()) return;
  m_tools.EndAll();
  while (m_tools.WaitForAny(0)) {
  }
  m_begun.clear();
}

void Scheduler::RunNext(Begun& begun) {
  std::optional<Command> command = begun.step->Prepare();
  begun.isOver = !command;
  begun.ended.reset();
  if (!command) return;
  begun.command = std::move(*command);
  begun.id = StartCommand(m_tools, begun.command);
}

void Scheduler::WaitForOne() {
  std::optional<platform::Processes::Ended> ended = m_tools.WaitForAny();
  if (!ended) return;
  const auto begun = std::find_if(m_begun.begin(), m_begun.end(), [&](const Begun& each) {
    return !each.isOver && !each.ended && each.id == ended->id;
  });
  if (begun != m_begun.end()) begun->ended = std::move(ended);
  FinishInOrder();
}

void Scheduler::FinishInOrder() {
  try {
    while (!m_begun.empty()) {
      Begun& first = m_begun.front();
      if (first.ended) {
        first.step->Finish(EndCommand(first.command, std::move(*first.ended)));
        RunNext(first);
      }
      if (!first.isOver) return;
      const bool hasSucceeded = first.step->HasSucceeded();
      const auto whenOver = std::move(first.whenOver);
      m_begun.pop_front();
      whenOver(hasSucceeded);
    }
  } catch (...) {
    Abandon();
    throw;
  }
}

size_t Scheduler::RunningCount() const {
  return static_cast<size_t>(
      std::count_if(m_begun.begin(), m_begun.end(), [](const Begun& each) { return !each.isOver && !each.ended; }));
}

}  // namespace qrex
