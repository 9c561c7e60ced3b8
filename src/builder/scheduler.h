// Carries out the steps of a build, as many at once as there are slots. They begin and are finished in the order in
// which they were added, so that counts and log do not depend on how many there are.
#pragma once

#include <deque>
#include <functional>
#include <memory>

#include "builder/build_step.h"

namespace qrex {

class Scheduler {
 public:
  Scheduler(platform::Processes& tools, size_t slots) : m_tools(tools), m_slots(slots) {}
  ~Scheduler() { Abandon(); }
  Scheduler(const Scheduler&) = delete;
  Scheduler& operator=(const Scheduler&) = delete;

  bool Overlaps() const { return m_slots > 1; }  // steps may run at once
  // Begins the step, and comes back when a slot is free: if there is one slot, when the step is over. `whenOver` is
  // told whether it has succeeded. An interrupt by the user ends all steps, and goes on as the exception of EndCommand.
  void Add(std::unique_ptr<BuildStep> step, std::function<void(bool)> whenOver);
  void WaitForAll();
  void Abandon();  // ends the tools; the steps have failed, and are not told

 private:
  struct Begun {
    std::unique_ptr<BuildStep> step;
    std::function<void(bool)> whenOver;
    Command command;
    platform::Processes::Id id = 0;
    std::optional<platform::Processes::Ended> ended;
    bool isOver = false;
  };

  void RunNext(Begun& begun);
  void WaitForOne();
  void FinishInOrder();
  size_t RunningCount() const;

  platform::Processes& m_tools;
  const size_t m_slots;
  std::deque<Begun> m_begun;  // in the order of their addition; the first is not over yet
};

}  // namespace qrex
