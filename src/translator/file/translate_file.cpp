#include "translator/file/translate_file.h"

#include <algorithm>
#include <chrono>
#include <thread>
#include <unordered_set>

#include "lex/scanner.h"
#include "macro/expand.h"
#include "platform/system.h"
#include "text/files.h"
#include "text/output_policy.h"
#include "text/trace.h"
#include "translator/emit/write.h"
#include "translator/file/keywords.h"
#include "translator/file/predefined_variables.h"
#include "translator/file/release_check.h"
#include "translator/file/tails.h"
#include "translator/reader/qrex_parser.h"
#include "workspace/project_model.h"

namespace qrex {

namespace {

// The chain of imports that leads from `from` to `to`, both included.
std::vector<const ScannedFile*> ImportChain(const ScannedFile& from, const ScannedFile& to) {
  std::unordered_set<const ScannedFile*> seen{&from};
  struct Level {
    const ScannedFile* file;
    size_t next = 0;
  };
  std::vector<Level> path{{&from}};
  while (!path.empty()) {
    Level& level = path.back();
    if (level.file == &to) {
      std::vector<const ScannedFile*> chain;
      for (const Level& step : path) chain.push_back(step.file);
      return chain;
    }
    if (level.next == level.file->imports.size()) {
      path.pop_back();
    } else {
      const ScannedFile* import = level.file->imports[level.next++];
      if (seen.insert(import).second) path.push_back({import});
    }
  }
  return {};
}

constexpr int kMaxImportDepth = 50'000;

struct Nested {
  explicit Nested(int& depth) : depth(depth) { ++depth; }
  ~Nested() { --depth; }
  int& depth;
};

// Brings what the file under expansion imports up to date, and makes it visible.
class Importer : public ImportHandler {
 public:
  explicit Importer(ScannedFile& file) : m_file(file) {}

  bool Import(LSFrame& frame, const std::string& path, const char* position) override {
    ProjectFile* target = m_file.ResolveImport(path);
    if (!target) return false;
    int& depth = frame.World().importDepth;
    if (depth >= kMaxImportDepth || platform::IsStackShort()) {
      throw LexScannerException("Imports nested too deeply", position);
    }
    ScannedFile& imported = m_file.host.GetScannedFile(*target);
    if (!imported.file.project->usesQrex) {
      throw LexScannerException("File " + imported.SourcePath() + " is not part of a project using qrex", nullptr)
          .WithHint(m_file.UseHint(imported));
    }
    const Nested nested(depth);
    BringUpToDate(imported);

    // A file in progress is not translated again, so a cycle shows as a chain from the import back to this file.
    if (&imported == &m_file || imported.importClosure.Has(m_file.index)) {
      ReportCycle(imported);
      return false;
    }
    m_file.frame.AddOrderedImport(imported.frame);
    m_file.imports.push_back(&imported);
    m_file.importClosure.Add(imported.index);
    m_file.importClosure.Add(imported.importClosure);
    m_file.importsIObject = m_file.importsIObject || imported.importsIObject;
    return true;
  }

  std::string ImportHint(const std::string& path) const override { return m_file.ImportHint(path); }
  std::string PlaceOf(const char* position) const override {
    std::string path;
    int64_t line;
    return m_file.host.FindSourcePosition(position, path, line) ? path + "(" + std::to_string(line) + ")" : "";
  }

 private:
  void ReportCycle(const ScannedFile& imported) const {
    const std::vector<const ScannedFile*> chain = ImportChain(imported, m_file);
    TraceWriter trace;
    trace << "\nERROR: Cycle detected in import directives.  Files in cycle are...\n";
    trace << "    " << m_file.file.path << "\n";
    for (size_t i = 0; i + 1 < chain.size(); ++i) trace << "    " << chain[i]->file.path << "\n";
  }

  ScannedFile& m_file;
};

std::string IncludeGuard(std::string_view path) {
  std::string guard = "_";
  for (char c : path) {
    const bool isPlain = (c >= '0' && c <= '9') || (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z');
    guard += isPlain ? c : '_';
  }
  return guard;
}

void TranslateText(ScannedFile& file, IOutputStream& target, TextRange expanded) {
  const FileKind kind = file.file.kind;
  constexpr size_t kUsualLine = 32;
  file.lineTable.reserve(expanded.Size() / kUsualLine);
  QrexParserOutputStream stream(target, file.lineTable, expanded, file.expansionMap);
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
    if (kind == FileKind::Cpp && parser.WantsCompilableText()) CheckTargetRelease(parser);
  }
  out.Flush();
  if (const char* last = stream.SourcePosition()) file.lineTable.push_back(last);

  file.hasDeclarations = file.rootNameSpace->HaveSomethingToRegister();
  if (kind == FileKind::Cpp) WriteReflectionTails(file, out);
  if (file.file.isMainSource) {
    WriteProjectRegistration(file, file.host.RegisterMap(), out);
    WriteProjectRegistration(file, file.host.UnregisterMap(), out);
  }
  if (kind == FileKind::H) out << "\n#endif // include guard\n";
  out.Flush();
}

TextRange SourceOf(const ScannedFile& file) {
  constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";
  TextRange source{std::string_view(file.sourceText)};
  const bool isMarked = file.frame.dialect == Dialect::Cpp && source.View().starts_with(kByteOrderMark);
  if (isMarked) source.begin += kByteOrderMark.size();
  return source;
}

}  // namespace

void TranslateFile(ScannedFile& file, IOutputStream& target) {
  DefinePredefinedVariables(file);
  file.lineTable.clear();
  TextRange expanded;
  try {
    Importer importer(file);
    expanded = ExpandWithMap(&importer, file.frame, SourceOf(file), 0, 0, file.expandedText, file.expansionMap);
    TranslateText(file, target, expanded);
  } catch (LexScannerException& exception) {
    MapErrorPosition(file.expansionMap, expanded, exception);
    if (exception.file.empty() && exception.position) {
      file.host.FindSourcePosition(exception.position, exception.file, exception.line);
    }
    throw;
  }
}

// --- Output

namespace {

class DiscardStream : public IOutputStream {
 public:
  void Write(const void*, size_t) override {}
  void Flush() override {}
};

bool IsTranslatedKind(FileKind kind) {
  return kind == FileKind::C || kind == FileKind::Cpp || kind == FileKind::H || kind == FileKind::Asm ||
         kind == FileKind::Py;
}

void PrepareTarget(const std::string& path) {
  CreateDirectories(path, false);
  ChangeReadOnly(path, false);
}

bool IsTokenEquivalent(const std::string& path, GeneratedFile& generated, Dialect dialect) {
  std::string old;
  if (!ReadWholeFile(old, path)) return false;
  const std::string text = generated.Text();
  try {
    return SameTokens(LexScanner(std::string_view(old), dialect), LexScanner(std::string_view(text), dialect));
  } catch (const LexScannerException&) {
    return false;  // the old file is not C++ that the scanner accepts
  }
}

// The output holds the tails of this translation, and no longer those of the one before.
void HoldTails(ScannedFile& file, const std::vector<ScannedFile*>& oldImports) {
  for (ScannedFile* import : oldImports) {
    if (import->tailHolder == &file) import->tailHolder = nullptr;
  }
  file.lostTail = false;
  for (ScannedFile* import : file.newTails) {
    if (import->tailHolder && import->HasTail()) import->tailHolder->lostTail = true;
    import->tailHolder = &file;
  }
}

// The time of a translation is that of the reading, so that what is edited while it runs is stale in the next run. It
// is compared with stamps of sources: a file system whose clock is behind, or moves in seconds, shows in what was
// written.
int64_t TranslationTime(const std::string& target, int64_t readTime, bool isWritten) {
  const int64_t stamp = LastWriteTime(target);
  return OnScaleOf(stamp, isWritten ? std::min(readTime, stamp) : readTime);
}

// The stamp of what is read now. The clock of stamps first passes the begin of the run: a source that was saved just
// ahead of it could bear the stamp of its translation, and be stale again in the next run.
int64_t ReadingTime(const ConfigSettings& settings) {
  constexpr int kMostWaits = 100;  // of a fraction of a tick each
  for (int waits = 0; CurrentStamp() <= settings.begun && waits < kMostWaits; ++waits) {
    std::this_thread::sleep_for(std::chrono::microseconds(200));
  }
  return CurrentStamp();
}

void WriteTranslation(ScannedFile& file, const std::string& target) {
  const int64_t readTime = ReadingTime(file.host.Settings());
  if (!LoadText(file.sourceText, file.SourcePath(), true)) {
    throw LexScannerException("Couldn't open file " + file.SourcePath(), nullptr)
        .WithHint(file.file.project->ListingHint(file.file));
  }
  const std::vector<ScannedFile*> knownImports = std::move(file.imports);
  file.ForgetTranslation();
  GeneratedFile generated(file.host.Settings().leftovers, target);
  DiscardStream discarded;
  IOutputStream& out = file.needsWriting ? static_cast<IOutputStream&>(generated) : discarded;
  try {
    TranslateFile(file, out);
  } catch (...) {
    file.imports = knownImports;  // a part of them would hide from the next run what makes this file stale
    throw;
  }
  if (!file.needsWriting) return;

  const ConfigSettings& settings = file.host.Settings();
  const bool isWritten = settings.writeTokenEquivalent || !IsTokenEquivalent(target, generated, file.frame.dialect);
  if (!isWritten) {
    if (settings.diagnostics) TraceWriter() << "Token equivalent: " << target << "\n";
  } else {
    if (settings.diagnostics) TraceWriter() << "Writing: " << target << "\n";
    PrepareTarget(target);
    generated.Commit();
  }
  if (settings.makeTranslatedFilesReadOnly) ChangeReadOnly(target, true);
  file.needsWriting = false;
  file.latestTargetTime = file.targetTime = 0;
  file.translationTime = TranslationTime(target, readTime, isWritten);
  HoldTails(file, knownImports);
}

// False, with a message, when it failed.
bool CopySource(const ScannedFile& file, const std::string& target) {
  ChangeReadOnly(target, false);
  CreateDirectories(target, false);
  file.host.Settings().leftovers.Beside(target);
  const bool readOnly = file.host.Settings().makeTranslatedFilesReadOnly;
  if (const platform::Result copied = CopyFile(file.SourcePath(), target, false, readOnly); !copied) {
    TraceWriter() << "ERROR: Copy file " << file.SourcePath() << " to " << target << " failed\n";
    ReportSystemError(copied.Code());
    TraceWriter() << Hint(file.file.project->ListingHint(file.file));
    return false;
  }
  if (readOnly) ChangeReadOnly(target, true);
  return true;
}

}  // namespace

void BringUpToDate(ScannedFile& file) {
  if (file.translated) return;
  file.translated = true;
  const std::string target = file.host.TranslatedPath(file);
  if (IsTranslatedKind(file.file.kind)) {
    WriteTranslation(file, target);
  } else if (file.needsWriting) {
    file.needsWriting = false;
    const int64_t readTime = ReadingTime(file.host.Settings());
    if (CopySource(file, target)) file.translationTime = TranslationTime(target, readTime, true);
    file.latestTargetTime = file.targetTime = 0;
  }
}

}  // namespace qrex
