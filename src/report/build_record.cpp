#include "report/build_record.h"

#include <algorithm>

#include "builder/project_builder.h"
#include "text/scope_timer.h"

namespace qrex {

BuildRecord::BuildRecord(MessageConsumer& next) : begin(CurrentFileTime()), m_next(next), m_slots{true} {}

void BuildRecord::ProjectEnds(const ProjectBuilder& builder) {
  m_counts[builder.project.name] = {builder.errorCount, builder.warningCount};
  for (const auto& [path, file] : builder.scannedByPath) {
    RecordedFile& recorded = files[std::string(path)];
    recorded.project = file->file.project->name;
    recorded.sourcePath = file->SourcePath();
    if (file->imports.empty()) continue;
    recorded.imports.clear();
    for (const ScannedFile* import : file->imports) recorded.imports.push_back(import->file.path);
  }
}

void BuildRecord::TranslationBegins(const ScannedFile& file) {
  Span span;
  span.task.project = file.file.project->name;
  span.task.source = file.file.path;
  span.task.output = file.host.TranslatedPath(file);
  m_outputOf[file.SourcePath()] = span.task.output;
  span.depth = m_translations.size();
  span.writes = file.needsWriting;
  span.begin = CurrentFileTime();
  m_translations.push_back(spans.size());
  spans.push_back(std::move(span));
}

void BuildRecord::TranslationEnds(const ScannedFile& file) {
  Span& span = spans[m_translations.back()];
  m_translations.pop_back();
  span.end = CurrentFileTime();
  span.isOver = true;
  span.hasFailed = file.state == TranslationState::Failed;
  if (!m_translations.empty()) spans[m_translations.back()].inner += span.end - span.begin;
}

size_t BuildRecord::FreeSlot() {
  const auto free = std::find(m_slots.begin(), m_slots.end(), false);
  const auto slot = static_cast<size_t>(free - m_slots.begin());
  if (free == m_slots.end()) m_slots.push_back(true);
  m_slots[slot] = true;
  slotCount = m_slots.size();
  return slot;
}

void BuildRecord::ToolBegins(ToolId tool, const ToolTask& task) {
  m_tools[tool] = spans.size();
  Span span;
  span.kind = Span::Kind::Tool;
  span.task = task;
  span.slot = FreeSlot();
  span.begin = CurrentFileTime();
  spans.push_back(std::move(span));
}

void BuildRecord::ToolEnds(ToolId tool, const platform::ProcessEnd& ended) {
  const auto found = m_tools.find(tool);
  if (found == m_tools.end()) return;
  Span& span = spans[found->second];
  span.end = CurrentFileTime();
  span.isOver = true;
  m_slots[span.slot] = false;
  if (!ended.IsNormal() || ended.code != 0) {
    span.hasFailed = true;
    span.failure = ended.cause == platform::ProcessEnd::Cause::EndedBySignal
                       ? "ended by " + ended.EndedBy()
                       : "ended with status " + std::to_string(ended.InterpreterCode());
  }
}

// A step may fail with no message of a known form. It counts as one error.
void BuildRecord::StepIsOver(ToolId lastTool, bool succeeded) {
  const auto found = m_tools.find(lastTool);
  if (found != m_tools.end()) {
    Span& span = spans[found->second];
    span.hasFailed = !succeeded;
    if (!succeeded && !m_hasErrorOfStep) {
      const std::string what = span.task.source.empty() ? span.task.output : span.task.source;
      messages.push_back(
          {Severity::Error, what + ": the tool " + (span.failure.empty() ? "failed" : span.failure), {}, {}});
    }
    m_tools.erase(found);
  }
  m_hasErrorOfStep = false;
}

void BuildRecord::Take(const ToolMessage& message) {
  m_hasErrorOfStep = m_hasErrorOfStep || message.severity == Severity::Error;
  messages.push_back({message.severity, message.text, message.place, message.generated});
}

void BuildRecord::Take(const Message& message) {
  if (message.severity != Severity::Note) {
    messages.push_back({message.severity, message.label + message.text, message.place, {}});
  }
  m_next.Take(message);
}

const MakeReason* BuildRecord::Why(const Span& span) const {
  if (!span.writes) return nullptr;
  const auto found = m_reasons.find(span.task.output);
  if (found == m_reasons.end()) return nullptr;
  if (found->second.cause != MakeReason::Cause::Changed) return &found->second;
  const auto translated = m_outputOf.find(found->second.file);
  const auto cause = translated == m_outputOf.end() ? m_reasons.end() : m_reasons.find(translated->second);
  return cause == m_reasons.end() ? &found->second : &cause->second;
}

void BuildRecord::End() {
  end = CurrentFileTime();
  for (const auto& [project, counts] : m_counts) {
    errorCount += counts.first;
    warningCount += counts.second;
  }
  for (Span& span : spans) {
    if (!span.isOver) span.end = end;
  }
}

}  // namespace qrex
