#include "driver/run_hints.h"

#include <algorithm>
#include <array>

#include "generators/common.h"
#include "text/files.h"
#include "text/paths.h"
#include "text/trace.h"

namespace qrex {

namespace {

// What other tools take for C++; here it is copied as it is.
bool IsForeignExtension(const std::string& extension) {
  static constexpr std::array<std::string_view, 7> kForeign = {"cc", "cxx", "c++", "hh", "hpp", "hxx", "h++"};
  return std::find(kForeign.begin(), kForeign.end(), extension) != kForeign.end();
}

}  // namespace

void TellCopiedSources(const Project& project) {
  std::string first;
  size_t count = 0;
  for (const ProjectFile* file : project.files) {
    if (!IsForeignExtension(file->extension)) continue;
    if (count++ == 0) first = file->path;
  }
  if (count == 0) return;
  const std::string more = count == 1 ? " is" : " and " + std::to_string(count - 1) + " more are";
  const std::string text =
      first + more + " only copied: what is compiled ends in .cpp or .c, a header with declarations in .h";
  const std::string hint = Hint(text);
  if (!hint.empty()) {
    TraceWriter() << hint;
  } else if (project.settings->diagnostics) {
    TraceWriter() << text << "\n";
  }
}

void HintAtCallOfMake(const Workspace& workspace) {
  const ConfigSettings& settings = workspace.settings;
  if (!CompilerOf(settings.compiler).Writes(ProjectFormat::Make) || !AnyProjectUsesQrex(workspace)) return;
  const std::string called = workspace.name + ".qrex";
  const std::string& path = settings.sourceFiles.front()->path;  // of the configuration: all else is loaded through it
  if (CollapseDots(path) != called) {
    if (FileExists(called)) return;
    TraceWriter() << Hint("make translates by Qrex " + called + ", which is not there: name " + path + " so, or \"" +
                          workspace.name + "\" in the workspace file otherwise");
  } else if (settings.fileMode == RunMode::Gen) {
    TraceWriter() << Hint("make translates by Qrex " + called +
                          ", and mode = gen stands there: write mode = build, and " + "call Qrex " + called +
                          " mode=gen for the make files");
  }
}

}  // namespace qrex
