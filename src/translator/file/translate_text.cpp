#include "translator/file/translate_text.h"

#include <memory>
#include <optional>

#include "macro/expand.h"
#include "translator/emit/write.h"
#include "translator/file/importer.h"
#include "translator/file/keywords.h"
#include "translator/file/predefined_variables.h"
#include "translator/file/release_check.h"
#include "translator/file/schema_check.h"
#include "translator/file/tails.h"
#include "translator/reader/kept_output.h"
#include "translator/reader/line_directives.h"
#include "translator/reader/qrex_parser.h"

namespace qrex {

namespace {

std::string IncludeGuard(std::string_view path) {
  std::string guard = "_";
  for (char c : path) {
    const bool isPlain = (c >= '0' && c <= '9') || (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z');
    guard += isPlain ? c : '_';
  }
  return guard;
}

void TranslateExpanded(ScannedFile& file, IOutputStream& target, KeptOutput* kept, TextRange expanded) {
  const FileKind kind = file.file.kind;
  constexpr size_t kUsualLine = 32;
  file.text.lines.reserve(expanded.Size() / kUsualLine);
  QrexParserOutputStream stream(target, file.text.lines, expanded, file.text.map);
  stream.TellCopies(kept);
  std::optional<LineDirectives> directives;
  if (file.HasLineDirectives()) stream.Use(directives.emplace(target, file, file.text.lines, expanded));
  TextWriter out(stream);
  if (kind == FileKind::H) {
    TextWriter head(target);  // not counted in the line table, which begins with the text proper
    Write(head, R"(
      #pragma once
      #ifndef $guard$
      #define $guard$

    )",
          "guard"_ = IncludeGuard(file.file.path));
    head.Flush();
  }
  {
    QrexParser parser(file, stream, out, expanded, AllKeywords());
    parser.Translate();
    CheckSchemas(file);
    const bool asksForTarget = parser.WantsCompilableText() || file.host.KeepsSchemas();
    if (kind == FileKind::Cpp && asksForTarget) CheckTargetRelease(parser);
  }
  out.Flush();
  const char* const last = stream.SourcePosition();
  if (last && !directives) file.text.lines.push_back(last);

  file.hasDeclarations = file.rootNameSpace->HaveSomethingToRegister();
  if (kind == FileKind::Cpp) WriteReflectionTails(file, out);
  if (directives && last) out << PositionMark(last);
  if (file.file.isMainSource) {
    WriteProjectRegistration(file, file.host.RegisterMap(), out);
    WriteProjectRegistration(file, file.host.UnregisterMap(), out);
  }
  constexpr char kGuardEnd[] = "\n#endif // include guard\n";
  if (kind == FileKind::H && !directives) out << kGuardEnd;
  out.Flush();
  if (!directives) return;
  directives->Finish();
  TextWriter foot(target);  // which came of no line
  if (kind == FileKind::H) foot << kGuardEnd;
  foot.Flush();
}

TextRange SourceOf(const ScannedFile& file) {
  constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";
  TextRange source{std::string_view(file.text.source)};
  const bool isMarked = file.frame.dialect == Dialect::Cpp && source.View().starts_with(kByteOrderMark);
  if (isMarked) source.begin += kByteOrderMark.size();
  return source;
}

}  // namespace

void TranslateText(ScannedFile& file, IOutputStream& target, KeptOutput* kept) {
  DefinePredefinedVariables(file);
  file.text.lines.clear();
  TextRange expanded;
  try {
    Importer importer(file);
    file.text.map.calls = file.HasLineDirectives() || kept ? std::make_unique<std::vector<SourceMap::Call>>() : nullptr;
    expanded = ExpandWithMap(&importer, file.frame, SourceOf(file), 0, 0, file.text.expanded, file.text.map);
    file.place = file.host.Symbols().NextPlace();
    TranslateExpanded(file, target, kept, expanded);
  } catch (LexScannerException& exception) {
    MapErrorPosition(file.text.map, expanded, exception);
    if (exception.file.empty() && exception.position) {
      SourcePlace place;
      if (file.host.FindSourcePlace(exception.position, place)) exception.SetPlace(place);
    }
    throw;
  }
}

}  // namespace qrex
