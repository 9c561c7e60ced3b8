// `Qrex --where`: positions in generated text, as tools write them, become those in the sources; with `--there` those
// in sources become those in generated text.
//
//   qrexsource/x64/Debug/app/a.h:12:3: warning: ...      file:line and file:line:column
//   qrexsource/x64/Debug/app/a.h(12,3): ...              file(line) and file(line,column)
//
// A file is known by the path that a build gives it, from the folder of the run on or absolute: of generated text also
// by that of its exported copy. All else in a line stays as it is. A line with a position whose text is older than what
// it was made of ends in " (stale)".
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "driver/followed_files.h"

namespace qrex {

enum class Follow { Back, Forth };  // to sources, to generated text

bool IsPosition(std::string_view argument);  // FILE:LINE or FILE:LINE:COLUMN

class PositionFilter {
 public:
  PositionFilter(Workspace& workspace, Follow follow);
  // The line with its positions followed, or nothing where it has none that is known.
  std::optional<std::string> Rewritten(std::string_view line);
  // Each line of standard input to standard output, as they come.
  void Run();

 private:
  struct Mention {
    size_t begin = 0, end = 0;
    bool isAbsolute = false, isInParentheses = false;
    int64_t line = 0, column = 0;
  };
  struct Hit {
    size_t begin, pathBegin;  // of the prefix, and behind it
    const std::string* root;  // the tree's root, where the prefix is one
  };
  std::optional<Hit> NextHit(std::string_view line, size_t from);
  bool Follows(std::string_view line, const Hit& hit, Mention& mention, FollowedPlace& place);
  bool BeginsPath(std::string_view line, size_t prefix, Mention& mention) const;
  std::string Printed(const Mention& mention, const FollowedPlace& place) const;
  void AddPrefix(std::string prefix, const std::string& root);
  std::string WithLinesFollowed(std::string_view lines);

  struct Prefix {
    std::string text, root;
    size_t next = 0;  // where it stands in the line at hand
  };
  const Workspace& m_workspace;
  const Follow m_follow;
  FollowedFiles m_files;
  std::vector<Prefix> m_prefixes;
  std::string m_folder;  // of the run, with a slash at the end
};

}  // namespace qrex
