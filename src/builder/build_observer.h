// Who looks at a build while it goes on: the status line of a terminal, a trace, a page. The build tells what begins
// and ends at that moment; it asks no clock for it, and works nothing out where nobody looks.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "platform/process.h"
#include "text/message.h"

namespace qrex {

class ProjectBuilder;
class ScannedFile;

// Why a translated file, an object or a target is made.
struct MakeReason {
  enum class Cause {
    RebuildAll,      // it was asked for
    NothingKnown,    // no dependency file tells of an earlier build of it
    Missing,         // it is not there
    Changed,         // `file` is newer, which is of `time`
    InputMissing,    // `file`, which it is made from, is not there
    Ahead,           // its own time is still to come, and tells nothing
    RecordsMove,     // the records of a header come to it or leave it
    Differs,         // its command, a key or an input is not what it was, see builder/fingerprints.h
    OthersRegister,  // of a main source: what the other files register has changed
  };
  Cause cause = Cause::Missing;
  std::string file = {};  // translated files by the path of their source
  int64_t time = 0;       // 100 ns units since 1601
};

enum class ToolKind { Compiler, Assembler, ResourceCompiler, Linker, ManifestTool };

// What a step runs a tool for.
struct ToolTask {
  ToolKind kind = ToolKind::Compiler;
  std::string project;
  std::string source;  // by its path in the tree; empty of a target
  std::string output;
  std::vector<std::string> inputs;
};

struct ToolMessage {
  Severity severity = Severity::Error;
  std::string text;       // what the tool printed behind the place
  SourcePlace place;      // as the tool named it
  SourcePlace generated;  // where that was followed back to a source: what the tool named
};

class BuildObserver {
 public:
  using ToolId = platform::Processes::Id;

  virtual ~BuildObserver() = default;
  // Ahead of the first step of a project. `expectedSteps`: that tools are likely to run; of a build that runs none,
  // files to translate.
  virtual void ProjectBegins(const std::string& /*name*/, size_t /*expectedSteps*/) {}
  virtual void ProjectEnds(const ProjectBuilder& /*builder*/) {}  // with all that it found; perhaps told again
  virtual void IsStale(const std::string& /*output*/, const MakeReason& /*why*/) {}
  // A translation begins and ends those of its imports within its own.
  virtual void TranslationBegins(const ScannedFile& /*file*/) {}
  virtual void TranslationEnds(const ScannedFile& /*file*/) {}
  virtual void ToolBegins(ToolId /*tool*/, const ToolTask& /*task*/) {}
  virtual void ToolEnds(ToolId /*tool*/, const platform::ProcessEnd& /*end*/) {}
  virtual void Take(const ToolMessage& /*message*/) {}
  virtual void StepIsOver(ToolId /*lastTool*/, bool /*succeeded*/) {}  // behind its messages
  // While tools are waited for: how long, in milliseconds, until StillWaiting is called.
  virtual int Patience() const { return platform::Processes::kForever; }
  virtual void StillWaiting() {}
  // What tools print is shown when they have ended: meanwhile the terminal has something else to show.
  virtual bool HoldsTerminal() const { return false; }
};

}  // namespace qrex
