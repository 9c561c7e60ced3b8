// One file under translation, as data, and what the translator asks of the build that owns it. Translating is done by
// file/translate_file.h.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "macro/frame.h"
#include "macro/source_map.h"
#include "text/index_set.h"
#include "text/message.h"
#include "translator/symbols/name_space.h"
#include "workspace/project_model.h"

namespace qrex {

class ScannedFile;
class ClassDef;
class KeptOutput;

// The qualified names that each .cpp file registers, by path.
struct DeclarationRegistry {
  explicit DeclarationRegistry(bool isRegister) : isRegister(isRegister) {}
  // Stores the list of a file (an empty list removes the entry) and sets `dirty` when that changed anything.
  void Update(const std::string& path, const std::vector<std::string>& names);
  // The list of a file that is about to be translated again: `dirty` only if the next one differs.
  void TakeBack(const std::string& path);
  bool IsDirty();  // where each list that was taken back had its chance to come again

  bool dirty = false;
  bool isRegister;
  std::map<std::string, std::vector<std::string>> entries;
  std::map<std::string, std::vector<std::string>> takenBack;
};

// The project build as the translator sees it; ProjectBuilder implements it.
class TranslationHost {
 public:
  virtual ~TranslationHost() = default;
  virtual const ConfigSettings& Settings() const = 0;
  virtual const ProjectConfig& Config() const = 0;
  virtual ProjectFile* FindFile(std::string_view path) const = 0;  // the workspace's file map; or null
  virtual ScannedFile& GetScannedFile(ProjectFile& file) = 0;      // created on first need, not translated
  virtual std::string TranslatedPath(const ScannedFile& file) const = 0;
  virtual bool RegisterGuid(const guid& id, const std::string& owner, std::string& existingOwner) = 0;
  virtual DeclarationRegistry& RegisterMap() = 0;
  virtual DeclarationRegistry& UnregisterMap() = 0;
  virtual SymbolIndex& Symbols() = 0;  // every declaration of this build
  virtual size_t NextFileIndex() = 0;  // 0, 1, 2, ...: given to each ScannedFile as it is made
  virtual std::vector<const ScannedFile*> FilesOfProject() const = 0;  // those met so far, by path
  virtual void Tell(const Message& message) = 0;
  // In a run that keeps going: what ended the translation of the file.
  virtual void TellFault(const ScannedFile& file, const IException& exception) = 0;
  virtual void TakenBack(ScannedFile& file) = 0;  // ahead of it: nothing that the file holds may be kept
  // Around the translation of a file, which has those of its imports within it.
  virtual void TranslationBegins(const ScannedFile&) {}
  virtual void TranslationEnds(const ScannedFile&) {}
  // Takes what a translation gives that is not written; null: nobody does.
  virtual KeptOutput* TextKeeper(const ScannedFile&) { return nullptr; }
  // With the key schemaLock: what of a model, whose file is translated, goes against what is recorded of it, empty for
  // nothing; and with which release a source defines the target of its project, at a position in its text.
  virtual bool KeepsSchemas() const { return false; }
  virtual std::string SchemaFault(const ClassDef&) { return {}; }
  virtual void DefinesTarget(const ScannedFile&, int64_t /*release*/, const char* /*position*/) {}
  // In the scanned file whose source text holds the position; false when none does.
  virtual bool FindSourcePlace(const char* position, SourcePlace& place) const = 0;
};

struct TypeRegistration {
  std::string code;                  // the type code
  const NameSpace* scope = nullptr;  // the name space of the declaration
  const char* position = nullptr;    // in the source text
};

// Whether this .cpp may hold the reflection tail of an imported file: it is of the same project, and no other .cpp
// has its stem.
bool MayHoldTail(const ProjectFile& source, const ProjectFile& imported);

// How far the translation of a file is. A failed one is begun anew when the file is asked for again.
enum class TranslationState { NotBegun, Running, Done, Failed };

// What a file reads and how positions lead back to it. Written by its translation alone.
struct FileText {
  std::string source;
  std::string expanded;
  SourceMap map;                   // from the expanded text to sources
  std::vector<const char*> lines;  // source position of each generated line, null where unknown
};

// What a file registers besides its declarations. Written by the handlers of its declarations, read by tails.
struct Registrations : RegistrationLists {  // $init and $uninit
  std::vector<TypeRegistration> types;
};

// Where the reflection tail of a file is. Written by who deals tails out: file/tails and the build.
struct FileTail {
  bool isRegistered = false;          // it has been written to an output
  ScannedFile* holder = nullptr;      // the .cpp in whose output; null where none is known
  std::vector<ScannedFile*> written;  // of a .cpp: those that its translation wrote
  bool isLost = false;                // of a .cpp: its output holds a tail that has been written into another one
};

// Times of a file, as the build knows them; 0 while unknown.
struct KnownTimes {
  int64_t source = 0;        // of this file alone
  int64_t target = 0;        // of the translated file
  int64_t latestSource = 0;  // the latest of these over the import closure
  int64_t latestTarget = 0;
  int64_t translation = 0;  // when the output was last brought up to date
  uint64_t sourceSize = 0;  // with `source`, where fingerprints ask for it; so with the target
  uint64_t targetSize = 0;
  uint64_t sourcePrint = 0;  // of times and sizes over the import closure, see builder/staleness.h
  uint64_t targetPrint = 0;
};

class ScannedFile {
 public:
  ScannedFile(TranslationHost& host, ProjectFile& file);

  ProjectFile* ResolveImport(const std::string& path) const;  // or null
  std::string ImportHint(const std::string& path) const;      // where it was looked for, see Hint
  std::string UseHint(const ScannedFile& imported) const;     // of an import that is found and can't be used
  std::string SourcePath() const;
  // The source position of a 1-based line of the generated text; false (with a message to `trace`) when there is none.
  bool MapGeneratedLine(int64_t generatedLine, TextWriter& trace, std::string& path, int64_t& line) const;
  bool HasBegun() const { return state != TranslationState::NotBegun; }
  bool HasBegunInPass() const { return HasBegun() && !isKept; }
  bool HasLineDirectives() const;  // its output is C or C++, and they are wanted
  bool HasTail() const;            // once translated: it leaves something for a reflection tail
  // As if its translation had not begun, but for what an earlier run could know. No other file may refer to what it has
  // declared: see file/take_back.h.
  void TakeBack();

  TranslationHost& host;
  ProjectFile& file;
  const size_t index;  // in the build, for IndexSet

  // --- Written by the translation of the file alone
  TranslationState state = TranslationState::NotBegun;
  size_t place = 0;  // among the files of this pass, in the order of their main loops; 0: not met yet
  FileText text;
  LSFileFrame frame{host.Settings().context.rootFrame.World()};
  std::unique_ptr<NameSpace> rootNameSpace;  // null until then
  Registrations registrations;
  IndexSet importClosure;       // the files that this one imports, directly or through others
  IndexSet mounted;             // those whose @import was passed: their declarations are visible
  bool importsIObject = false;  // Vesk/vxObject/IObject.h is in the import closure

  // --- Written by the translation, and by the build for a file that it need
  // not translate
  std::vector<ScannedFile*> imports;  // direct ones, in order
  bool hasDeclarations = false;
  FileTail tail;

  // --- Written by the build
  bool isKept = false;        // translated in an earlier pass, and all of it holds
  bool needsWriting = false;  // the translation clears it
  KnownTimes times;           // and sets that of its end

 private:
  void Begin();
};

}  // namespace qrex
