// Carries out the steps of a build, as many at once as there are slots, and as the job server of a make permits. They
// begin and are finished in the order in which they were added, and what is written meanwhile is held back until those
// ahead of it are finished: so counts and log do not depend on how many there are.
#pragma once

#include <deque>
#include <functional>
#include <memory>
#include <string>

#include "builder/build_step.h"

namespace qrex {

class Scheduler {
 public:
  explicit Scheduler(const ConfigSettings& settings);
  ~Scheduler() { Abandon(); }
  Scheduler(const Scheduler&) = delete;
  Scheduler& operator=(const Scheduler&) = delete;

  bool Overlaps() const { return m_slots > 1; }  // steps may run at once
  // Begins the step, and comes back when a slot is free: if there is one slot, when the step is over. `whenOver` is
  // told whether it has succeeded. An interrupt by the user ends all steps, and goes on as the exception of EndCommand.
  void Add(std::unique_ptr<BuildStep> step, std::function<void(bool)> whenOver);
  // As a step that is not made before all those ahead of it are over; it may turn out to be none.
  void AddBehind(std::function<std::unique_ptr<BuildStep>()> make, std::function<void(bool)> whenOver);
  void WaitForAll();
  void Abandon();  // ends the tools; the steps have failed, and are not told
  // What the work writes to the trace log, for later.
  std::string TextOf(const std::function<void()>& work);

 private:
  static constexpr platform::Processes::Id kNone = ~platform::Processes::Id{0};
  struct Begun {
    std::function<std::unique_ptr<BuildStep>()> make;  // until it is made
    std::unique_ptr<BuildStep> step;
    std::function<void(bool)> whenOver;
    Command command;
    platform::Processes::Id id = kNone;  // of the last command
    std::optional<platform::Processes::Ended> ended;
    bool isOver = false;
    std::string textBehind;  // of the trace log, written since it began

    bool IsRunning() const { return !make && !isOver && !ended; }
  };

  void Queue(Begun begun);
  void RunNext(Begun& begun);
  bool MakeStep(Begun& begun);  // false: it has to wait for a slot
  void AwaitToken();
  std::optional<platform::Processes::Ended> WaitForTool(int milliseconds);
  bool WaitForOne(int milliseconds = platform::Processes::kForever);  // false: none has ended in that time
  void HoldTraceBehind();
  void FinishInOrder();
  size_t RunningCount() const;

  platform::Processes& m_tools;
  const size_t m_slots;
  platform::JobServer* const m_jobServer;
  BuildObserver* const& m_observer;  // of the settings
  std::deque<Begun> m_begun;         // in the order of their addition; the first is not over yet
};

}  // namespace qrex
