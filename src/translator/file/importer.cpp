#include "translator/file/importer.h"

#include <unordered_set>
#include <vector>

#include "platform/system.h"
#include "translator/file/translate_file.h"

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
      chain.reserve(path.size());
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
  explicit Nested(int& counter) : depth(counter) { ++depth; }
  ~Nested() { --depth; }
  int& depth;
};

}  // namespace

bool Importer::Import(LSFrame& frame, const std::string& path, const char* position) {
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
  try {
    BringUpToDate(imported);
  } catch (const FaultyFileException&) {
    throw FaultyFileException("not translated: it imports " + imported.SourcePath() + ", which has an error", position);
  }

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

std::string Importer::PlaceOf(const char* position) const {
  SourcePlace place;
  return m_file.host.FindSourcePlace(position, place) ? place.file + "(" + std::to_string(place.line) + ")" : "";
}

void Importer::ReportCycle(const ScannedFile& imported) const {
  const std::vector<const ScannedFile*> chain = ImportChain(imported, m_file);
  std::string text = "Cycle detected in import directives.  Files in cycle are...\n    " + m_file.file.path;
  for (size_t i = 0; i + 1 < chain.size(); ++i) text += "\n    " + chain[i]->file.path;
  m_file.host.Tell(Message(Severity::Error, "ERROR: ", text).Apart());
}

}  // namespace qrex
