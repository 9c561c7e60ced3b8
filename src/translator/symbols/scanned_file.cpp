#include "translator/symbols/scanned_file.h"

#include <algorithm>
#include <array>

#include "text/paths.h"
#include "text/trace.h"
#include "workspace/workspace.h"

namespace qrex {

namespace {

constexpr std::string_view kIObjectPath = "Vesk/vxObject/IObject.h";
constexpr int64_t kHeaderHeadLines = 4;

bool IsIObject(const ProjectFile& file) { return file.path == kIObjectPath; }

}  // namespace

bool MayHoldTail(const ProjectFile& source, const ProjectFile& imported) {
  return imported.project == source.project && (!imported.pairedSource || imported.pairedSource == &source);
}

void DeclarationRegistry::Update(const std::string& path, const std::vector<std::string>& names) {
  if (const auto before = takenBack.extract(path)) entries.insert_or_assign(path, before.mapped());
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

void DeclarationRegistry::TakeBack(const std::string& path) {
  if (auto taken = entries.extract(path)) takenBack.insert(std::move(taken));
}

bool DeclarationRegistry::IsDirty() {
  dirty = dirty || !takenBack.empty();
  takenBack.clear();
  return dirty;
}

ScannedFile::ScannedFile(TranslationHost& host, ProjectFile& file)
    : host(host), file(file), index(host.NextFileIndex()) {
  Begin();
}

void ScannedFile::Begin() {
  importsIObject = IsIObject(file);
  const bool isCpp = file.kind == FileKind::C || file.kind == FileKind::Cpp || file.kind == FileKind::H;
  frame.dialect = isCpp && host.Settings().modernCpp ? Dialect::Cpp : Dialect::Qrex;
}

void ScannedFile::TakeBack() {
  if (!HasBegun()) return;
  host.TakenBack(*this);
  rootNameSpace->LeaveIndex();
  rootNameSpace.reset();
  frame.Clear();
  text = {};
  registrations = {};
  importClosure = mounted = {};
  tail.written.clear();
  state = TranslationState::NotBegun;
  place = 0;
  isKept = false;
  Begin();
}

std::string ScannedFile::SourcePath() const { return file.project->SourcePath(file); }

namespace {

// Where an import is searched in the tree, in this order.
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
  std::string hint = "no project lists ";
  const auto candidates = ImportCandidates(file, path);
  for (auto candidate = candidates.begin(); candidate != candidates.end(); ++candidate) {
    if (std::find(candidates.begin(), candidate, *candidate) != candidate) continue;
    hint += (candidate == candidates.begin() ? "" : " or ") + *candidate;
  }
  return hint;
}

std::string ScannedFile::UseHint(const ScannedFile& imported) const {
  const Project& user = *file.project;
  const Project& used = *imported.file.project;
  std::string hint = file.path + " imports it";
  if (!used.usesQrex) hint += "; write qrex in " + used.filePath + ", or #include it";
  const auto isUsed = [&](const std::string& path) { return user.workspace->FindSubproject(path) == &used; };
  if (&user != &used && std::none_of(user.subprojects.begin(), user.subprojects.end(), isUsed)) {
    hint += "; write \"" + used.rootToProjDir + "\" in subproj { } of " + user.filePath + ", and it is built first";
  }
  return hint;
}

bool ScannedFile::HasLineDirectives() const {
  const bool isCpp = file.kind == FileKind::C || file.kind == FileKind::Cpp || file.kind == FileKind::H;
  return isCpp && host.Settings().lineDirectives;
}

bool ScannedFile::HasTail() const {
  return hasDeclarations || !registrations.types.empty() || !registrations.registerNames.empty() ||
         !registrations.unregisterNames.empty();
}

bool ScannedFile::MapGeneratedLine(int64_t generatedLine, TextWriter& trace, std::string& path, int64_t& line) const {
  if (!HasBegun()) {
    trace << "\nNOTE: Need @import instead of #include \"" << file.name
          << "\" to pinpoint errors in original source files\n";
    return false;
  }
  if (file.kind == FileKind::H) generatedLine -= kHeaderHeadLines;
  if (generatedLine < 1) return false;
  const char* position = nullptr;
  if (!text.lines.empty()) {
    position = text.lines[std::min<size_t>(static_cast<size_t>(generatedLine), text.lines.size()) - 1];
  }
  if (!position) {
    trace << "\nINTERNAL ERROR: convert error position failed because line number invalid\n";
    return false;
  }
  SourcePlace found;
  if (!host.FindSourcePlace(position, found)) return false;
  path = std::move(found.file);
  line = found.line;
  return true;
}

}  // namespace qrex
