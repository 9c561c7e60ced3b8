#include "workspace/compilers.h"

#include <iterator>

namespace qrex {

namespace {

constexpr bool RowsAreByKind() {
  for (const Compiler& row : kCompilers) {
    if (&row - kCompilers != static_cast<std::ptrdiff_t>(row.kind)) return false;
  }
  return true;
}
static_assert(RowsAreByKind());

}  // namespace

std::optional<CompilerKind> FindCompiler(std::string_view keyword) {
  for (const Compiler& row : kCompilers) {
    if (row.keyword == keyword) return row.kind;
  }
  return std::nullopt;
}

std::string CompilerWords() {
  std::string words;
  for (const Compiler& row : kCompilers) words.append(words.empty() ? "" : " ").append(row.keyword);
  return words;
}

}  // namespace qrex
