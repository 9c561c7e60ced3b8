// The compilers that a run may be for: one row each, and every question about a compiler is a field of its row. A new
// kind is an enumerator, a row, and what is truly new about it.
#pragma once

#include <algorithm>
#include <optional>
#include <span>
#include <string>
#include <string_view>

namespace qrex {

enum class CompilerKind { vc6, vc8, vc9, vc10, vc11, vc12, vc14, gcc, winegcc, clang };

enum class CompilerFamily { VisualCpp, Gcc };
// Each is written for projects, workspaces or both.
enum class ProjectFormat { Dsp, Vcproj, Vcxproj, Make, Ninja, CodeBlocks, Geany };

namespace formats {
inline constexpr ProjectFormat kVc6[] = {ProjectFormat::Dsp};
inline constexpr ProjectFormat kVc8[] = {ProjectFormat::Vcproj};
inline constexpr ProjectFormat kVc10[] = {ProjectFormat::Vcxproj};
inline constexpr ProjectFormat kGcc[] = {ProjectFormat::Make, ProjectFormat::Ninja, ProjectFormat::CodeBlocks,
                                         ProjectFormat::Geany};
}  // namespace formats

struct Compiler {
  CompilerKind kind;
  std::string_view keyword;  // in configurations, and in the block heads of projects
  CompilerFamily family = CompilerFamily::VisualCpp;
  std::span<const ProjectFormat> formats = {};  // of the files that `gen` writes, in this order

  // A build
  std::string_view compile = "";  // these take a response file
  std::string_view link = "";
  std::string_view archive = "";
  bool compilesResources = false;
  bool embedsManifest = false;
  std::string_view precompiledPrefix = "";  // of the name of the precompiled header
  bool takesBuiltRuntime = false;           // what it makes can be linked with what g++ and libstdc++ made

  // Projects and their files
  bool keepsRawSwitches = false;  // the text of switches is passed on; else it is read into options
  bool keepsGuids = true;         // in projects.guids
  std::string_view projectVersion = "";
  std::string_view toolset = "";
  std::string_view solutionHeader = "";  // format version and product
  bool buildsWithMSBuild = false;        // a whole solution; else by devenv

  // Make files
  std::string_view makeTools = "";      // the lines of its variables
  std::string_view librarySuffix = "";  // behind the name of a library that is linked
  bool namesLibraries = false;          // by -soname

  constexpr bool Writes(ProjectFormat format) const {
    return std::find(formats.begin(), formats.end(), format) != formats.end();
  }
};

// What the compilers of a family, or of a part of it, share. A tool that a row names itself stays.
constexpr void SetIfEmpty(std::string_view& field, std::string_view shared) {
  if (field.empty()) field = shared;
}

constexpr Compiler VisualStudio(Compiler row) {
  row.family = CompilerFamily::VisualCpp;
  SetIfEmpty(row.compile, "cl /c");
  SetIfEmpty(row.link, "link.exe");
  SetIfEmpty(row.archive, "lib.exe");
  row.compilesResources = row.embedsManifest = row.kind != CompilerKind::vc6;
  row.buildsWithMSBuild = row.Writes(ProjectFormat::Vcxproj);
  return row;
}

constexpr Compiler GccLike(Compiler row) {
  row.family = CompilerFamily::Gcc;
  if (row.formats.empty()) row.formats = formats::kGcc;
  SetIfEmpty(row.compile, "gcc-4 -c");
  SetIfEmpty(row.archive, "ar rcs");
  row.keepsRawSwitches = true;
  row.buildsWithMSBuild = true;
  return row;
}

// By CompilerKind.
inline constexpr Compiler kCompilers[] = {
    VisualStudio({
        .kind = CompilerKind::vc6,
        .keyword = "vc6",
        .formats = formats::kVc6,
        .precompiledPrefix = "build_",
        .keepsRawSwitches = true,
        .keepsGuids = false,
    }),
    VisualStudio({
        .kind = CompilerKind::vc8,
        .keyword = "vc8",
        .formats = formats::kVc8,
        .projectVersion = "8.00",
        .solutionHeader = "Microsoft Visual Studio Solution File, Format Version 9.00\n# Visual Studio 2005\n",
    }),
    VisualStudio({
        .kind = CompilerKind::vc9,
        .keyword = "vc9",
        .formats = formats::kVc8,
        .projectVersion = "9.00",
        .solutionHeader = "Microsoft Visual Studio Solution File, Format Version 10.00\n# Visual Studio 2008\n",
    }),
    VisualStudio({
        .kind = CompilerKind::vc10,
        .keyword = "vc10",
        .formats = formats::kVc10,
        .projectVersion = "4.0",
        .solutionHeader = "Microsoft Visual Studio Solution File, Format Version 11.00\n# Visual Studio 2010\n",
    }),
    VisualStudio({
        .kind = CompilerKind::vc11,
        .keyword = "vc11",
        .formats = formats::kVc10,
        .projectVersion = "4.0",
        .toolset = "v110",
        .solutionHeader = "Microsoft Visual Studio Solution File, Format Version 12.00\n# Visual Studio 2012\n",
    }),
    VisualStudio({
        .kind = CompilerKind::vc12,
        .keyword = "vc12",
        .formats = formats::kVc10,
        .projectVersion = "12.0",
        .toolset = "v120",
        .solutionHeader = "Microsoft Visual Studio Solution File, Format Version 12.00\n# Visual Studio 2013\n",
    }),
    VisualStudio({
        .kind = CompilerKind::vc14,
        .keyword = "vc14",
        .formats = formats::kVc10,
        .projectVersion = "14.0",
        .toolset = "v140",
        .solutionHeader = "Microsoft Visual Studio Solution File, Format Version 12.00\n# Visual Studio 2013\n",
    }),
    GccLike({
        .kind = CompilerKind::gcc,
        .keyword = "gcc",
        .link = "g++",
        .takesBuiltRuntime = true,
        .makeTools = "CC = gcc\nCXX = g++\nAR = ar\n",
        .namesLibraries = true,
    }),
    GccLike({
        .kind = CompilerKind::winegcc,
        .keyword = "winegcc",
        .link = "wineg++",
        .makeTools = "CC = winegcc\nCXX = wineg++\nRC = wrc\nAR = ar\n",
        .librarySuffix = ".dll",
    }),
    GccLike({
        .kind = CompilerKind::clang,
        .keyword = "clang",
        .link = "clang++",
        .takesBuiltRuntime = true,
        .makeTools = "CC = clang\nCXX = clang++\nAR = libtool -static\n",
    }),
};

constexpr const Compiler& CompilerOf(CompilerKind kind) { return kCompilers[static_cast<size_t>(kind)]; }
constexpr bool IsVisualCpp(CompilerKind kind) { return CompilerOf(kind).family == CompilerFamily::VisualCpp; }
constexpr bool IsGccFamily(CompilerKind kind) { return CompilerOf(kind).family == CompilerFamily::Gcc; }

std::optional<CompilerKind> FindCompiler(std::string_view keyword);
std::string CompilerWords();  // the keywords, with blanks between them

}  // namespace qrex
