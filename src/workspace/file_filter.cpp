#include "workspace/file_filter.h"

#include <algorithm>

#include "text/paths.h"

namespace qrex {

// Only the last `*` met needs to be taken back: whatever an earlier one could take, this one can as well.
bool MatchesPattern(std::string_view name, std::string_view pattern) {
  size_t n = 0, p = 0, star = std::string_view::npos, starName = 0;
  while (n < name.size()) {
    if (p < pattern.size() && pattern[p] == '*') {
      star = p++;
      starName = n;
    } else if (p < pattern.size() &&
               (pattern[p] == '?' || EqualIgnoringCase(pattern.substr(p, 1), name.substr(n, 1)))) {
      ++p;
      ++n;
    } else if (star != std::string_view::npos) {
      p = star + 1;
      n = ++starName;
    } else {
      return false;
    }
  }
  return pattern.find_first_not_of('*', p) == std::string_view::npos;
}

bool FileFilter::Passes(std::string_view name) const {
  const bool matches = std::any_of(patterns.begin(), patterns.end(),
                                   [&](const std::string& pattern) { return MatchesPattern(name, pattern); });
  return matches == include;
}

}  // namespace qrex
