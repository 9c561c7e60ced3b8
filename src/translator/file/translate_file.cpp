#include "translator/file/translate_file.h"

#include <utility>

#include "translator/file/translate_text.h"
#include "translator/file/translation_output.h"
#include "translator/reader/kept_output.h"

namespace qrex {

namespace {

class DiscardStream : public IOutputStream {
 public:
  void Write(const void*, size_t) override {}
  void Flush() override {}
};

// The output holds the tails of this translation, and no longer those of the one before.
void HoldTails(ScannedFile& file, const std::vector<ScannedFile*>& oldImports) {
  for (ScannedFile* import : oldImports) {
    if (import->tail.holder == &file) import->tail.holder = nullptr;
  }
  file.tail.isLost = false;
  for (ScannedFile* import : file.tail.written) {
    if (import->tail.holder && import->HasTail()) import->tail.holder->tail.isLost = true;
    import->tail.holder = &file;
  }
}

void ReadSource(ScannedFile& file) {
  const MacroWorld& world = file.frame.World();
  if (world.sources->Read(file.text.source, file.SourcePath())) return;
  throw LexScannerException("Couldn't open file " + file.SourcePath(), nullptr)
      .WithHint(file.file.project->ListingHint(file.file));
}

// The imports that were known until then.
std::vector<ScannedFile*> Translate(ScannedFile& file, IOutputStream& target, KeptOutput* kept = nullptr) {
  ReadSource(file);
  std::vector<ScannedFile*> knownImports = std::exchange(file.imports, {});
  try {
    TranslateText(file, target, kept);
  } catch (...) {
    file.imports = std::move(knownImports);  // a part of them would hide from the next run what makes this file stale
    throw;
  }
  return knownImports;
}

void TranslateAndWrite(ScannedFile& file) {
  const std::string target = file.host.TranslatedPath(file);
  const int64_t readTime = ReadingTime(file.host.Settings());
  GeneratedFile generated(file.host.Settings().leftovers, target);
  const std::vector<ScannedFile*> knownImports = Translate(file, generated);
  WriteOutput(file, target, generated, readTime);
  HoldTails(file, knownImports);
}

void MakeDeclarations(ScannedFile& file) {
  if (KeptOutput* const keeper = file.host.TextKeeper(file)) {
    Translate(file, *keeper, keeper);
  } else {
    DiscardStream discarded;
    Translate(file, discarded);
  }
}

void WorkOn(ScannedFile& file) {
  if (IsTranslatedKind(file.file.kind)) {
    file.needsWriting ? TranslateAndWrite(file) : MakeDeclarations(file);
  } else if (file.needsWriting) {
    const int64_t readTime = ReadingTime(file.host.Settings());
    WriteCopy(file, file.host.TranslatedPath(file), readTime);
  }
}

// Of a file that is kept from an earlier pass, and what it imports: in the order in which they would be translated.
void TakePlaces(ScannedFile& first) {
  struct Level {
    ScannedFile* file;
    size_t next = 0;
  };
  std::vector<Level> path{{&first}};
  while (!path.empty()) {
    Level& level = path.back();
    ScannedFile& file = *level.file;
    if (level.next == file.imports.size() || file.place != 0) {
      if (file.place == 0) file.place = file.host.Symbols().NextPlace();
      path.pop_back();
    } else {
      path.push_back({file.imports[level.next++]});
    }
  }
}

// Begins, unless it is done or under way, and keeps the state.
template <typename Work>
void Begin(ScannedFile& file, Work work) {
  if (file.state == TranslationState::Running) return;
  if (file.state == TranslationState::Done) {
    if (file.isKept && file.place == 0) TakePlaces(file);
    return;
  }
  const bool keepsGoing = file.host.Settings().keepGoing;
  if (file.state == TranslationState::Failed) {
    if (keepsGoing) throw FaultyFileException("", nullptr);
    file.TakeBack();
  }
  file.state = TranslationState::Running;
  file.rootNameSpace = std::make_unique<NameSpace>(file, nullptr, "");
  file.host.TranslationBegins(file);
  try {
    work(file);
  } catch (const IException& exception) {
    file.state = TranslationState::Failed;
    if (!keepsGoing) throw;
    file.host.TellFault(file, exception);
    throw FaultyFileException("", nullptr);
  } catch (...) {
    file.state = TranslationState::Failed;
    file.host.TranslationEnds(file);
    throw;
  }
  file.state = TranslationState::Done;
  file.host.TranslationEnds(file);
}

}  // namespace

bool IsTranslatedKind(FileKind kind) {
  return kind == FileKind::C || kind == FileKind::Cpp || kind == FileKind::H || kind == FileKind::Asm ||
         kind == FileKind::Py;
}

void BringUpToDate(ScannedFile& file) { Begin(file, WorkOn); }

void TranslateInto(ScannedFile& file, IOutputStream& target) {
  Begin(file, [&](ScannedFile& begun) { Translate(begun, target); });
}

}  // namespace qrex
