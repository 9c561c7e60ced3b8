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
#include "translator/symbols/name_space.h"
#include "workspace/project_model.h"

namespace qrex {

class ScannedFile;

// The qualified names that each .cpp file registers, by path.
struct DeclarationRegistry {
  explicit DeclarationRegistry(bool isRegister) : isRegister(isRegister) {}
  // Stores the list of a file (an empty list removes the entry) and sets `dirty` when that changed anything.
  void Update(const std::string& path, const std::vector<std::string>& names);

  bool dirty = false;
  bool isRegister;
  std::map<std::string, std::vector<std::string>> entries;
};

// The project build as the translator sees it; ProjectBuilder implements it.
class TranslationHost {
 public:
  virtual ~TranslationHost() = default;
  virtual const ConfigSettings& Settings() const = 0;
  virtual const ProjectConfig& Config() const = 0;
  virtual ProjectFile* FindFile(const std::string& path) const = 0;  // the workspace's file map; or null
  virtual ScannedFile& GetScannedFile(ProjectFile& file) = 0;        // created on first need, not translated
  virtual std::string TranslatedPath(const ScannedFile& file) const = 0;
  virtual bool RegisterGuid(const guid& id, const std::string& owner, std::string& existingOwner) = 0;
  virtual DeclarationRegistry& RegisterMap() = 0;
  virtual DeclarationRegistry& UnregisterMap() = 0;
  virtual SymbolIndex& Symbols() = 0;  // every declaration of this build
  virtual size_t NextFileIndex() = 0;  // 0, 1, 2, ...: given to each ScannedFile as it is made
  virtual void CountWarning() = 0;
  // The scanned file whose source text holds the position, and the line there; false when none does.
  virtual bool FindSourcePosition(const char* position, std::string& path, int64_t& line) const = 0;
};

struct TypeRegistration {
  std::string code;                  // the type code
  const NameSpace* scope = nullptr;  // the name space of the declaration
};

// Whether this .cpp may hold the reflection tail of an imported file: it is of the same project, and no other .cpp
// has its stem.
bool MayHoldTail(const ProjectFile& source, const ProjectFile& imported);

class ScannedFile {
 public:
  ScannedFile(TranslationHost& host, ProjectFile& file);

  ProjectFile* ResolveImport(const std::string& path) const;  // or null
  std::string ImportHint(const std::string& path) const;      // where it was looked for, see Hint
  std::string UseHint(const ScannedFile& imported) const;     // of an import that is found and can't be used
  std::string SourcePath() const;
  void ForgetTranslation();  // what the one before has found, ahead of the next
  // The source position of a 1-based line of the generated text; false (with a message to `trace`) when there is none.
  bool MapGeneratedLine(int64_t generatedLine, TextWriter& trace, std::string& path, int64_t& line) const;

  bool HasTail() const;  // once translated: it leaves something for a reflection tail

  TranslationHost& host;
  ProjectFile& file;
  std::vector<std::string> registerNames;    // $init
  std::vector<std::string> unregisterNames;  // $uninit
  std::vector<TypeRegistration> typeRegistrations;
  std::vector<const char*> lineTable;  // source position of each generated line, null where unknown
  bool registered = false;             // its tail has been written to an output
  ScannedFile* tailHolder = nullptr;   // the .cpp in whose output; null where none is known
  std::vector<ScannedFile*> newTails;  // of a .cpp: those that its translation wrote
  bool lostTail = false;               // of a .cpp: its output holds a tail that has been written into another one
  bool needsWriting = false;
  std::string sourceText;
  std::string expandedText;
  SourceMap expansionMap;
  std::vector<ScannedFile*> imports;  // direct ones, in order
  int64_t sourceTime = 0;             // of this file alone; these are caches, 0 while unknown
  int64_t targetTime = 0;             // of the translated file
  int64_t latestSourceTime = 0;       // the latest of these over the import closure
  int64_t latestTargetTime = 0;
  int64_t translationTime = 0;  // when the output was last brought up to date
  bool translated = false;
  bool hasDeclarations = false;
  const size_t index;           // in the build, for IndexSet
  IndexSet importClosure;       // the files that this one imports, directly or through others
  IndexSet mounted;             // those whose @import was passed: their declarations are visible
  bool importsIObject = false;  // Vesk/vxObject/IObject.h is in the import closure
  LSFileFrame frame{host.Settings().context.rootFrame.World()};
  std::unique_ptr<NameSpace> rootNameSpace;
};

}  // namespace qrex
