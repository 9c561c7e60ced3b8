#include "translator/symbols/scanned_file.h"

#include <algorithm>
#include <array>
#include <unordered_set>

#include "lex/scanner.h"
#include "text/files.h"
#include "text/numbers.h"
#include "text/output_policy.h"
#include "text/paths.h"
#include "text/scope_timer.h"
#include "text/trace.h"
#include "translator/reader/qrex_parser.h"
#include "translator/symbols/name_space.h"
#include "workspace/workspace.h"

namespace qrex {

namespace {

constexpr std::string_view kIObjectPath = "Vesk/vxObject/IObject.h";
constexpr int64_t kHeaderHeadLines = 4;

bool IsIObject(const ProjectFile& file) { return file.path == kIObjectPath; }

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

bool IsTokenEquivalent(const std::string& path, GeneratedFile& generated) {
  std::string old;
  if (!ReadWholeFile(old, path)) return false;
  const std::string text = generated.Text();
  try {
    return SameTokens(LexScanner(std::string_view(old)), LexScanner(std::string_view(text)));
  } catch (const LexScannerException&) {
    return false;  // what stood there is no text of ours
  }
}

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

}  // namespace

bool MayHoldTail(const ProjectFile& source, const ProjectFile& imported) {
  return imported.project == source.project && (!imported.pairedSource || imported.pairedSource == &source);
}

void DeclarationRegistry::Update(const std::string& path, const std::vector<std::string>& names) {
  auto found = entries.find(path);
  if (names.empty()) {
    if (found == entries.end()) return;
    entries.erase(found);
  } else {
    if (found != entries.end() && found->second == names) return;
    entries[path] = names;
  }
  dirty = true;
}

ScannedFile::ScannedFile(TranslationHost& host, ProjectFile& file)
    : host(host),
      file(file),
      index(host.NextFileIndex()),
      rootNameSpace(std::make_unique<NameSpace>(*this, nullptr, "")) {
  importsIObject = IsIObject(file);
}

ScannedFile::~ScannedFile() = default;

std::string ScannedFile::SourcePath() const { return file.project->SourcePath(file); }

namespace {

// Where an import may stand in the tree, in the order of the search.
std::array<std::string, 4> ImportCandidates(const ProjectFile& importer, const std::string& path) {
  const size_t slash = importer.path.rfind('/');
  const std::string directory = slash == std::string::npos ? std::string() : importer.path.substr(0, slash);
  const Project& project = *importer.project;
  return {PathJoin(directory, path), path, PathJoin(project.rootToProjDir, path), PathJoin(project.sourceDir, path)};
}

}  // namespace

ProjectFile* ScannedFile::ResolveImport(const std::string& path) const {
  for (const std::string& candidate : ImportCandidates(file, path)) {
    if (ProjectFile* found = host.FindFile(candidate)) return found;
  }
  return nullptr;
}

std::string ScannedFile::ImportHint(const std::string& path) const {
  if (ResolveImport(path)) return {};  // it failed for another reason
  std::string text = "no project lists ";
  const auto candidates = ImportCandidates(file, path);
  for (auto candidate = candidates.begin(); candidate != candidates.end(); ++candidate) {
    if (std::find(candidates.begin(), candidate, *candidate) != candidate) continue;
    text += (candidate == candidates.begin() ? "" : " or ") + *candidate;
  }
  return text;
}

bool ScannedFile::Import(LSFrame&, const std::string& path, const char*) {
  ProjectFile* target = ResolveImport(path);
  if (!target) return false;
  ScannedFile& imported = host.GetScannedFile(*target);
  imported.WriteGeneratedFile();

  // A file in progress is not translated again, so a cycle shows as a chain from the import back to this file.
  if (&imported == this || imported.importClosure.Has(index)) {
    const std::vector<const ScannedFile*> chain = ImportChain(imported, *this);
    TraceWriter trace;
    trace << "\nERROR: Cycle detected in import directives.  Files in cycle are...\n";
    trace << "    " << file.path << "\n";
    for (size_t i = 0; i + 1 < chain.size(); ++i) trace << "    " << chain[i]->file.path << "\n";
    return false;
  }
  frame.AddOrderedImport(imported.frame);
  imports.push_back(&imported);
  importClosure.Add(imported.index);
  importClosure.Add(imported.importClosure);
  importsIObject = importsIObject || imported.importsIObject;
  return true;
}

void ScannedFile::WriteGeneratedFile() {
  if (!file.project->usesQrex) {
    throw LexScannerException("File " + SourcePath() + " is not part of a project using qrex", nullptr);
  }
  if (translated) return;
  translated = true;
  const std::string target = host.TranslatedPath(*this);
  if (IsTranslatedKind(file.kind)) {
    WriteTranslation(target);
  } else if (needsWriting) {
    needsWriting = false;
    const int64_t readTime = CurrentFileTime();
    if (CopySource(target)) translationTime = readTime;
    latestTargetTime = targetTime = 0;
  }
}

// The time of the translation is that of the reading: what is edited while it runs is stale in the next run.
void ScannedFile::WriteTranslation(const std::string& target) {
  const int64_t readTime = CurrentFileTime();
  if (!LoadText(sourceText, SourcePath(), true)) {
    throw LexScannerException("Couldn't open file " + SourcePath(), nullptr).WithHint(file.project->ListingHint(file));
  }
  registerNames.clear();
  unregisterNames.clear();
  typeRegistrations.clear();
  newTails.clear();
  const std::vector<ScannedFile*> knownImports = std::move(imports);
  imports.clear();
  importClosure = {};
  importsIObject = IsIObject(file);
  GeneratedFile generated(target);
  DiscardStream discarded;
  IOutputStream& out = needsWriting ? static_cast<IOutputStream&>(generated) : discarded;
  try {
    TranslateFile(*this, out);
  } catch (...) {
    imports = knownImports;  // a part of them would hide from the next run what makes this file stale
    throw;
  }
  if (!needsWriting) return;

  const ConfigSettings& settings = host.Settings();
  if (!settings.writeTokenEquivalent && IsTokenEquivalent(target, generated)) {
    if (settings.diagnostics) TraceWriter() << "Token equivalent: " << target << "\n";
  } else {
    if (settings.diagnostics) TraceWriter() << "Writing: " << target << "\n";
    PrepareTarget(target);
    generated.Commit();
    if (settings.makeTranslatedFilesReadOnly) ChangeReadOnly(target, true);
  }
  needsWriting = false;
  latestTargetTime = targetTime = 0;
  translationTime = readTime;
  HoldTails(knownImports);
}

// The output holds the tails of this translation, and no longer those of the one before.
void ScannedFile::HoldTails(const std::vector<ScannedFile*>& oldImports) {
  for (ScannedFile* import : oldImports) {
    if (import->tailHolder == this) import->tailHolder = nullptr;
  }
  lostTail = false;
  for (ScannedFile* import : newTails) {
    if (import->tailHolder && import->HasTail()) import->tailHolder->lostTail = true;
    import->tailHolder = this;
  }
}

bool ScannedFile::HasTail() const {
  return hasDeclarations || !typeRegistrations.empty() || !registerNames.empty() || !unregisterNames.empty();
}

bool ScannedFile::CopySource(const std::string& target) const {
  ChangeReadOnly(target, false);
  CreateDirectories(target, false);
  if (!CopyFile(SourcePath(), target, false)) {
    const SystemException failure;
    TraceWriter() << "ERROR: Copy file " << SourcePath() << " to " << target << " failed\n";
    ReportSystemError(failure);
    TraceWriter() << Hint(file.project->ListingHint(file));
    return false;
  }
  TouchFile(target, false);
  if (host.Settings().makeTranslatedFilesReadOnly) ChangeReadOnly(target, true);
  return true;
}

bool ScannedFile::MapGeneratedLine(int64_t generatedLine, TextWriter& trace, std::string& path, int64_t& line) const {
  if (!translated) {
    trace << "\nNOTE: Need @import instead of #include \"" << file.name
          << "\" to pinpoint errors in original source files\n";
    return false;
  }
  if (file.kind == FileKind::H) generatedLine -= kHeaderHeadLines;
  if (generatedLine < 1) return false;
  const char* position = nullptr;
  if (!lineTable.empty()) {
    position = lineTable[std::min<size_t>(static_cast<size_t>(generatedLine), lineTable.size()) - 1];
  }
  if (!position) {
    trace << "\nINTERNAL ERROR: convert error position failed because line number invalid\n";
    return false;
  }
  return host.FindSourcePosition(position, path, line);
}

}  // namespace qrex
