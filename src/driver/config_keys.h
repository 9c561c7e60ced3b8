// The keys of a configuration file, each with the field that it sets and what `Qrex --help` says of it.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "workspace/config_settings.h"

namespace qrex {

template <typename Field>
struct ConfigKey {
  std::string_view word;
  Field field;
  std::string_view help;
};

inline constexpr ConfigKey<std::string ConfigSettings::*> kStringKeys[] = {
    {"config", &ConfigSettings::config, "the configuration to build, as projects name it"},
    {"platform", &ConfigSettings::platform, "its platform"},
    {"systemName", &ConfigSettings::systemName, "@system_name; \"Windows\" also exports from dynamic libraries"},
    {"systemProcessor", &ConfigSettings::systemProcessor, "@system_processor"},
    {"systemVersion", &ConfigSettings::systemVersion, "@system_version"},
    {"sizeofPointer", &ConfigSettings::sizeofPointer, "@size_of_pointer"},
    {"platformToolset", &ConfigSettings::platformToolset,
     "the tool set in .vcxproj files: v143; projects may name theirs, too"},
    {"sourceFolder", &ConfigSettings::sourceFolder, "where relative roots begin, if not where Qrex runs"},
    {"depfile", &ConfigSettings::depfile, "the file to write what the run read into, as make and ninja read it"},
    {"windowsSdk", &ConfigSettings::windowsSdk, "the version beside it, empty: the newest 10.0"},
    {"buildTrace", &ConfigSettings::buildTrace, "a file for the trace of a build, as trace viewers read it"},
    {"schemaLock", &ConfigSettings::schemaLock, "a file that records each release of each $schema: none may change"},
    {"report", &ConfigSettings::report, "a file for a page: what ran when, what it cost, and why; models, imports"},
};

inline constexpr ConfigKey<bool ConfigSettings::*> kBoolKeys[] = {
    {"targetXP", &ConfigSettings::targetXP, "the _xp tool sets in .vcxproj files"},
    {"defaultToDll", &ConfigSettings::defaultToDll, "the target type Library is a dynamic library, else a static one"},
    {"diagnostics", &ConfigSettings::diagnostics, "tell what is stale and which commands run"},
    {"translateOnly", &ConfigSettings::translateOnly, "run no tools; needs no PATH, INCLUDE, LIB"},
    {"rebuildAll", &ConfigSettings::rebuildAll, "take everything for stale"},
    {"exportPublicHeaders", &ConfigSettings::exportPublicHeaders, "copy public headers to the export directories"},
    {"repackageExecutableTargets", &ConfigSettings::repackageExecutableTargets,
     "copy targets of projects marked export to $EXPORT_LIB"},
    {"solutionContainsPrepackagedProjects", &ConfigSettings::solutionContainsPrepackagedProjects,
     "list projects marked export in the .sln"},
    {"makeTranslatedFilesReadOnly", &ConfigSettings::makeTranslatedFilesReadOnly, "protect translated files"},
    {"makeExportedHeaderFilesReadOnly", &ConfigSettings::makeExportedHeaderFilesReadOnly, "protect exported headers"},
    {"writeTokenEquivalent", &ConfigSettings::writeTokenEquivalent,
     "also write a translation that differs in blanks and comments alone"},
    {"modernCpp", &ConfigSettings::modernCpp, "scan C, C++ and header files as C++20: raw strings, 1'000"},
    {"compilableText", &ConfigSettings::compilableText, "write text that compiles, and warn where none does"},
    {"lineDirectives", &ConfigSettings::lineDirectives,
     "#line in generated text: debuggers and compilers speak of the sources"},
    {"positionMaps", &ConfigSettings::positionMaps, "keep what --where needs beside translated files"},
    {"annotations", &ConfigSettings::annotations, "metadata of members also as annotations of C++26"},
    {"ninja", &ConfigSettings::ninja, "gen writes build.ninja as well, beside make files"},
    {"failOnErrors", &ConfigSettings::failOnErrors, "end with status 1 when errors of tools were counted"},
    {"keepGoing", &ConfigSettings::keepGoing, "go on behind a translation error, tell all of them, end with status 1"},
    {"fingerprints", &ConfigSettings::fingerprints,
     "make again what has changed in any way: keys, switches, older files"},
    {"commandFiles", &ConfigSettings::commandFiles,
     "compilers read their options in response files, else on command lines"},
    {"compileCommands", &ConfigSettings::compileCommands,
     "write compile_commands.json, for clangd, clang-tidy and others"},
};

inline constexpr ConfigKey<int64_t ConfigSettings::*> kNumberKeys[] = {
    {"jobs", &ConfigSettings::jobs, "so many compilers at once; 0: as many as there are processors"},
};

inline constexpr ConfigKey<std::vector<std::string> ConfigSettings::*> kListKeys[] = {
    {"virtualTree", &ConfigSettings::virtualTree, "the roots under which workspaces, projects and sources are found"},
    {"workspaces", &ConfigSettings::workspaces, "workspace files and single projects, by their path below a root"},
};

inline constexpr ConfigKey<std::vector<std::string> ConfigSettings::*> kCommandKeys[] = {
    {"launcher", &ConfigSettings::launcher, "a command ahead of compilers, by its words: ccache, distcc"},
};

inline constexpr ConfigKey<std::string PlatformEnvironment::*> kEnvironmentKeys[] = {
    {"PATH", &PlatformEnvironment::PATH, "where tools are found, for one platform"},
    {"INCLUDE", &PlatformEnvironment::INCLUDE, "what they see as INCLUDE; asked for by every compiler"},
    {"LIB", &PlatformEnvironment::LIB, "what they see as LIB; asked for by every compiler"},
};

inline constexpr ConfigKey<std::string ConfigSettings::*> kPathVariables[] = {
    {"EXPORT_LIB", &ConfigSettings::exportLib, "the folder of built targets"},
    {"EXPORT_TRANSLATED_INCLUDE", &ConfigSettings::exportTranslatedInclude,
     "the folder of exported translated headers"},
    {"EXPORT_UNTRANSLATED_INCLUDE", &ConfigSettings::exportUntranslatedInclude,
     "the folder of exported headers as written"},
};

struct ModeWord {
  std::string_view word;
  std::string_view help;
};
inline constexpr ModeWord kModes[] = {
    // by RunMode
    {"clean", "delete translated files and dependency files"},
    {"compile", "translate and compile one file, $COMPILE_FILE_PATH"},
    {"build", "translate what is stale, compile and link"},
    {"gen", "write the project files of the compiler"},
    {"show", "print where the translation of $COMPILE_FILE_PATH stands"},
};

inline constexpr std::string_view kRuntimes[] = {"none", "source", "built"};  // by RuntimeChoice
inline constexpr std::string_view kRuntimeHelp = "a root behind virtualTree: this tool's runtime, source or built";

}  // namespace qrex
