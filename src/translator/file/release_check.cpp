#include "translator/file/release_check.h"

#include <algorithm>

#include "lex/cpp_literals.h"
#include "translator/declared/class_def.h"
#include "translator/reader/qrex_parser.h"

namespace qrex {

namespace {

int64_t LastRelease(const ClassDef& def) {
  int64_t last = 0;
  for (const ModelField* field : def.m_modelFields) last = std::max({last, field->m_rsnAdded, field->m_rsnDropped});
  return last;
}

// The model of the project with the latest release, among those of the name space; or null.
const ClassDef* LatestModel(const NameSpace& nameSpace, const ClassDef* latest) {
  for (const auto& [name, element] : nameSpace.Elements()) {
    if (element->category == Category::NameSpace) {
      latest = LatestModel(static_cast<const NameSpace&>(*element), latest);
    } else if (element->category == Category::Class) {
      const auto& def = static_cast<const ClassDef&>(*element);
      if (!latest || LastRelease(def) > LastRelease(*latest)) latest = &def;
    }
  }
  return latest;
}

// What the macro vxDefineTarget of the runtime leaves in the text.
constexpr std::string_view kTarget = "vxDefineTargetFunctions";

}  // namespace

void CheckTargetRelease(QrexParser& parser) {
  const std::string_view text = parser.expanded.View();
  const size_t found = text.find(kTarget);
  if (found == text.npos) return;
  LexScanner scanner(TextRange(text.substr(found)), parser.scanner.dialect);
  NextToken(scanner);
  if (NextToken(scanner).kind != kOpenParen || !NextToken(scanner).Is(parser.file.file.project->MangledProjDir()))
    return;
  if (NextToken(scanner).kind != kComma) return;
  const LexToken number = NextToken(scanner);
  if (number.kind != kDecimal) return;
  const int64_t release = static_cast<int64_t>(IntegerValue(number, scanner.dialect));
  TranslationHost& host = parser.file.host;
  if (host.KeepsSchemas()) {
    return host.DefinesTarget(parser.file, release, parser.stream.SourcePosition(number.text.begin));
  }
  const ClassDef* latest = nullptr;
  for (const ScannedFile* file : parser.file.host.FilesOfProject()) {
    if (file->rootNameSpace) latest = LatestModel(*file->rootNameSpace, latest);
  }
  if (!latest || LastRelease(*latest) <= release) return;
  const std::string last = std::to_string(LastRelease(*latest));
  parser.ReportWarning(Warning::EarlierRelease,
                       "The target of the project writes archives of release " + number.text.Text() + ", but " +
                           PrintedElement(*latest) + " has release " + last +
                           ": nothing could read them, define the target with " + last,
                       nullptr, number.text.begin);
}

}  // namespace qrex
