// Every setting of a run: plain data that all floors from workspace/ up may read.
#pragma once

#include <map>
#include <memory>
#include <set>
#include <string>
#include <unordered_set>
#include <vector>

#include "macro/mpfw_parser.h"
#include "platform/job_server.h"
#include "platform/process.h"
#include "platform/system.h"
#include "text/files.h"
#include "text/output_notes.h"
#include "workspace/compilers.h"

namespace qrex {

struct Project;
class BuildObserver;  // builder/build_observer.h
class SchemaLock;     // builder/schema_lock.h

enum class RunMode { Clean, Compile, Build, Gen, Show };
enum class RuntimeChoice { None, Source, Built };

struct PlatformEnvironment {
  std::string PATH, INCLUDE, LIB;  // `;`-separated lists
};

struct ConfigSettings {
  int64_t begun = platform::SystemFileTime();  // when the run began
  SourceFileList sourceFiles;                  // every file loaded through the macro layer in this run
  MacroWorld macroWorld;
  MpfwContext context{sourceFiles, macroWorld};
  std::vector<std::string> virtualTree;
  std::string sourceFolder;  // where relative roots begin; empty: the folder of the run
  std::string exportLib;
  std::string exportTranslatedInclude;
  std::string exportUntranslatedInclude;
  std::vector<std::string> workspaces;
  std::string systemName, systemProcessor, systemVersion, sizeofPointer;
  std::string platform, config;
  std::string compileFilePath;
  bool defaultToDll = true;
  bool diagnostics = false;
  CompilerKind compiler = CompilerKind::vc8;
  bool targetXP = false;
  std::string platformToolset;  // of .vcxproj files, instead of the compiler's; set: projects may name theirs
  std::string windowsSdk;       // beside it; empty: the newest
  bool translateOnly = false;
  bool rebuildAll = false;
  bool writeTokenEquivalent = true;
  bool exportPublicHeaders = true;
  bool repackageExecutableTargets = true;
  bool solutionContainsPrepackagedProjects = true;
  bool makeTranslatedFilesReadOnly = true;
  bool makeExportedHeaderFilesReadOnly = true;
  bool modernCpp = false;
  bool compilableText = false;
  bool lineDirectives = false;        // translator/reader/line_directives.h
  bool positionMaps = false;          // translator/file/position_map.h
  bool annotations = false;           // translator/emit/annotations.h
  int64_t jobs = 1;                   // tools at once; 0: as many as there are processors
  std::vector<std::string> launcher;  // words ahead of compilers
  bool commandFiles = true;  // compilers are given response files; false: command lines, where they are not too long
  bool failOnErrors = false;
  bool fingerprints = false;                    // builder/fingerprints.h
  bool keepGoing = false;                       // an error in a source ends its translation, and not the run
  std::string buildTrace;                       // the file of a trace; empty: none is written
  std::string report;                           // and that of a page
  RuntimeChoice runtime = RuntimeChoice::None;  // the root that follows those of virtualTree
  RunMode mode = RunMode::Build;
  std::vector<std::string> call;  // the program and its arguments, for what calls it again
  bool ninja = false;
  std::string depfile;                // to be written behind a run; empty: none
  bool compileCommands = false;       // compile_commands.json is written ahead of it
  RunMode fileMode = RunMode::Build;  // without what the command line added
  std::map<std::string, PlatformEnvironment> platformEnvironments;
  // Whoever may read the settings may write files and run tools.
  mutable LeftoverSweep leftovers;
  mutable std::set<std::string> listedFolders;  // those that were searched by wildcards
  mutable OutputNotes outputNotes{"qrexsource/unfinished.notes"};
  mutable platform::Processes tools;
  std::unique_ptr<platform::JobServer> jobServer;  // of the make that runs this program; null: none
  // Objects and targets of this run: where stamps are equal, it is later than what stood there before.
  std::unordered_set<std::string> made;
  bool hasToldOfLongCommand = false;
  std::unordered_set<std::string> faulty;     // sources with an error, which has been told
  std::unordered_set<const Project*> unmade;  // whose target could not be made
  std::string schemaLock;                     // the file of recorded releases; empty: none is kept
  SchemaLock* schemas = nullptr;              // as it is read in this run, not owned; null: none is kept
  BuildObserver* observer = nullptr;          // of the build, not owned; null: nobody looks
  bool coloursToolMessages = false;           // where a terminal shows them

  void Tell(const Message& message) const { macroWorld.messages->Take(message); }
  const PlatformEnvironment* Environment() const;  // of `platform`, or null
};

// What of the configuration decides on translations, as text: keys and variables with their values.
std::string TranslationKeys(const ConfigSettings& settings);

// Sets the process variables PATH (entries joined with the system's own separator), INCLUDE and LIB.
void ApplyEnvironment(const PlatformEnvironment& environment);

// The first of: the path as given, each import path joined with it, each virtualTree root joined with it, that exists.
bool FindImport(const ConfigSettings& settings, const std::string& path, std::string& found);
// The first virtualTree root under which the path exists, and the full path there.
bool FindInTree(const ConfigSettings& settings, const std::string& path, std::string& root, std::string& fullPath);
// Hints for what these did not find: the paths that were tried.
std::string TriedImports(const ConfigSettings& settings, const std::string& path);
std::string TriedInTree(const ConfigSettings& settings, const std::string& path);

}  // namespace qrex
