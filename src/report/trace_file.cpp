#include "report/trace_file.h"

#include "report/json_writer.h"
#include "report/reason_text.h"

namespace qrex {

namespace {

constexpr int64_t kMicrosecond = 10;             // in units of file times
constexpr int64_t kLeast = 1000 * kMicrosecond;  // of a translation: shorter ones are many, and tell nothing

std::string_view CategoryOf(const Span& span) {
  if (span.kind == Span::Kind::Translation) return "translation";
  switch (span.task.kind) {
    case ToolKind::Compiler:
      return "compiler";
    case ToolKind::Assembler:
      return "assembler";
    case ToolKind::ResourceCompiler:
      return "resource compiler";
    case ToolKind::Linker:
      return "linker";
    case ToolKind::ManifestTool:
      return "manifest tool";
  }
  return {};
}

void WriteThreadName(JsonWriter& json, size_t slot) {
  const std::string name = slot == 0 ? "translation" : "slot " + std::to_string(slot);
  json.Line().Open('{').Member("ph", "M").Member("name", "thread_name").Member("pid", int64_t{1});
  json.Member("tid", static_cast<int64_t>(slot)).Key("args").Open('{').Member("name", name).Close('}').Close('}');
}

void WriteSpan(JsonWriter& json, const BuildRecord& record, const Span& span) {
  json.Line().Open('{').Member("ph", "X").Member("cat", CategoryOf(span));
  json.Member("name", span.task.source.empty() ? span.task.output : span.task.source);
  json.Member("pid", int64_t{1}).Member("tid", static_cast<int64_t>(span.slot));
  json.Member("ts", (span.begin - record.begin) / kMicrosecond).Member("dur", (span.end - span.begin) / kMicrosecond);
  json.Key("args").Open('{').Member("project", span.task.project).Member("output", span.task.output);
  if (const MakeReason* why = record.Why(span)) json.Member("why", ReasonText(*why));
  if (!span.isOver) json.Member("ended", "with the run");
  if (span.hasFailed) json.Member("failed", true);
  json.Close('}').Close('}');
}

}  // namespace

std::string TraceText(const BuildRecord& record) {
  JsonWriter json;
  json.Open('{').Member("displayTimeUnit", "ms").Key("traceEvents").Open('[');
  for (size_t slot = 0; slot < record.slotCount; ++slot) WriteThreadName(json, slot);
  for (const Span& span : record.spans) {
    if (span.kind == Span::Kind::Translation && span.end - span.begin < kLeast) continue;
    WriteSpan(json, record, span);
  }
  json.Close(']').Close('}');
  return json.Text() + "\n";
}

}  // namespace qrex
