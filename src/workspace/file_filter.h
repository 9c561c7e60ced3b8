// Which names of a directory listing are taken: wildcard patterns, compared without case.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace qrex {

bool MatchesPattern(std::string_view name, std::string_view pattern);  // `?` one character, `*` any run

struct FileFilter {
  bool caseSensitive = false;
  bool include = true;
  std::vector<std::string> patterns;
  bool Passes(std::string_view name) const;  // matches any and includes, or matches none and excludes
};

}  // namespace qrex
