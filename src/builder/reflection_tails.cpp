#include "builder/reflection_tails.h"

#include "translator/file/translate_file.h"

namespace qrex {

namespace {

// Goes through the files as a build that translates them all, and deals out the tails as it would.
class TailWalk {
 public:
  TailWalk(const BuildFiles& builder, size_t knownFiles)
      : m_builder(builder), m_knownFiles(knownFiles), m_visited(builder.FileCount()), m_holders(builder.FileCount()) {
    for (ScannedFile* file : builder.scanned) Visit(*file);
  }
  ScannedFile* HolderOf(const ScannedFile& file) const { return m_holders[file.index]; }

 private:
  void Visit(ScannedFile& file) {
    if (m_visited[file.index]) return;
    m_visited[file.index] = true;
    for (ScannedFile* import : file.imports) Visit(*import);
    if (file.file.kind != FileKind::Cpp) return;
    for (const ScannedFile* import : file.imports) {
      ScannedFile*& holder = m_holders[import->index];
      if (!holder && Takes(file, *import)) holder = &file;
    }
  }

  bool Takes(const ScannedFile& file, const ScannedFile& import) const {
    if (import.file.kind == FileKind::Cpp) return false;  // holds its own
    if (MayHoldTail(file.file, import.file)) return true;
    return import.file.project == file.file.project && !IsKnown(*import.file.pairedSource);
  }

  bool IsKnown(const ProjectFile& file) const {
    const auto found = m_builder.scannedByPath.find(file.path);
    return found != m_builder.scannedByPath.end() && found->second->index < m_knownFiles;
  }

  const BuildFiles& m_builder;
  const size_t m_knownFiles;
  std::vector<bool> m_visited;
  std::vector<ScannedFile*> m_holders;
};

// The dependency file tells of declarations; that a header has nothing but $type, $init or $uninit shows only when it
// is translated.
bool HasTail(ScannedFile& header) {
  if (header.hasDeclarations) return true;
  BringUpToDate(header);
  return header.HasTail();
}

}  // namespace

void FindTailHolders(BuildFiles& builder, size_t knownFiles) {
  const TailWalk walk(builder, knownFiles);
  for (const auto& [path, file] : builder.scannedByPath) file->tail.holder = walk.HolderOf(*file);
}

bool TailsMoved(ScannedFile& file) {
  if (file.tail.isLost) return true;
  for (ScannedFile* import : file.imports) {
    if (import->file.kind == FileKind::Cpp) continue;
    const bool holds = import->tail.holder == &file;
    const bool takes = !import->tail.isRegistered && MayHoldTail(file.file, import->file);
    if (holds == takes) continue;
    if (HasTail(*import)) return true;
    if (takes) import->tail.holder = &file;
  }
  return false;
}

void ForgetUnsettledTails(BuildFiles& builder) {
  const TailWalk walk(builder, builder.FileCount());
  for (const auto& [path, file] : builder.scannedByPath) {
    if (file->tail.isLost) file->times.translation = 0;
    ScannedFile* const holder = walk.HolderOf(*file);
    const bool hasNone = file->HasBegun() && !file->HasTail();
    if (holder == file->tail.holder || hasNone) continue;
    if (holder) holder->times.translation = 0;
    if (file->tail.holder) file->tail.holder->times.translation = 0;
  }
}

}  // namespace qrex
