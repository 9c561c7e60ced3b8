#include "builder/tool_names.h"

#include "text/numbers.h"

namespace qrex {

std::string Quoted(CompilerKind compiler, std::string_view name) {
  std::string text(name);
  if (IsGccFamily(compiler)) ReplaceAllInPlace(text, "\\", "\\\\");
  return "\"" + text + "\"";
}

namespace {

bool BeginsAnOption(std::string_view path) { return path.starts_with('-') || path.starts_with('@'); }

// What no quoting helps against; empty: nothing.
std::string_view TroubleWith(CompilerKind compiler, std::string_view path) {
  if (path.find_first_of("\n\r") != path.npos) return "a line ends in it";
  if (path.find('"') != path.npos) return "a double quote stands in it";
  if (IsGccFamily(compiler)) return "";
  if (path.find('\\') != path.npos) return "a backslash parts folders there";
  if (BeginsAnOption(path)) return "it would be read as an option";
  return "";
}

}  // namespace

std::string AsInput(CompilerKind compiler, const std::string& path) {
  return IsGccFamily(compiler) && BeginsAnOption(path) ? "./" + path : path;
}

std::string QuotedInput(CompilerKind compiler, const std::string& path) {
  return Quoted(compiler, AsInput(compiler, path));
}

bool ToolsTake(ProjectBuilder& builder, std::initializer_list<std::string_view> paths) {
  for (const std::string_view path : paths) {
    const std::string_view trouble = TroubleWith(builder.settings.compiler, path);
    if (trouble.empty()) continue;
    TraceWriter() << "ERROR: No tool can be given the name " << path << " : " << trouble << "\n";
    ++builder.errorCount;
    return false;
  }
  return true;
}

}  // namespace qrex
