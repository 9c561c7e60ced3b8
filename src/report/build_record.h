// What happened in the builds of a run, kept until its end: traces and pages are written from it. Times are 100 ns
// units since 1601; spans stand in the order of their beginnings.
#pragma once

#include <cstdint>
#include <map>
#include <string>
#include <unordered_map>
#include <vector>

#include "builder/build_observer.h"
#include "text/message.h"

namespace qrex {

struct Span {
  enum class Kind { Translation, Tool };
  Kind kind = Kind::Translation;
  ToolTask task;       // of a translation: project, source, output
  size_t slot = 0;     // 0: the translation; tools take the first of the others that is free
  size_t depth = 0;    // of a translation: within so many others, which import it
  bool writes = true;  // else a translation that only reads declarations
  int64_t begin = 0, end = 0;
  int64_t inner = 0;  // of a translation: the time of those within it
  bool isOver = false, hasFailed = false;
  std::string failure;  // how the tool ended, if not with 0
};

struct RecordedFile {
  std::string project;
  std::string sourcePath;
  std::vector<std::string> imports;  // direct ones, by path in the tree
};

struct RecordedMessage {
  Severity severity = Severity::Error;
  std::string text;
  SourcePlace place, generated;
};

class BuildRecord : public BuildObserver, public MessageConsumer {
 public:
  // Takes the messages of the run on their way to `next`.
  explicit BuildRecord(MessageConsumer& next);

  void ProjectEnds(const ProjectBuilder& builder) override;
  void IsStale(const std::string& output, const MakeReason& why) override { m_reasons[output] = why; }
  void TranslationBegins(const ScannedFile& file) override;
  void TranslationEnds(const ScannedFile& file) override;
  void ToolBegins(ToolId tool, const ToolTask& task) override;
  void ToolEnds(ToolId tool, const platform::ProcessEnd& end) override;
  void StepIsOver(ToolId lastTool, bool succeeded) override;
  void Take(const ToolMessage& message) override;
  void Take(const Message& message) override;
  void End();  // of the run: what still runs ends here
  // Of what was made by a text that was made in this run, that text's own. Null: none is known.
  const MakeReason* Why(const Span& span) const;

  const int64_t begin;
  int64_t end = 0;
  size_t slotCount = 1;  // with that of the translation
  std::vector<Span> spans;
  std::map<std::string, RecordedFile> files;  // by path in the tree
  std::vector<RecordedMessage> messages;
  int64_t errorCount = 0, warningCount = 0;  // as the log counts them

 private:
  size_t FreeSlot();

  MessageConsumer& m_next;
  std::unordered_map<std::string, MakeReason> m_reasons;    // by output
  std::unordered_map<std::string, std::string> m_outputOf;  // of translations, by the path of the source
  std::vector<size_t> m_translations;          // those that run, each within the one ahead of it: of `spans`
  std::unordered_map<ToolId, size_t> m_tools;  // of `spans`; those of later steps have other numbers
  std::map<std::string, std::pair<int64_t, int64_t>> m_counts;  // errors and warnings, by project
  std::vector<bool> m_slots;                                    // taken
  bool m_hasErrorOfStep = false;                                // a tool told one since the last step was over
};

}  // namespace qrex
