// What tools are about to write is noted in a file while they run: a run that is killed leaves word of what may be
// half-written, and the next run deletes it. Stamps cannot tell: half an object is younger than its source.
//
// It begins with the magic 0x2AEF78F4, little-endian. Behind that, each record is a byte and a path, relative to the
// folder of the run, as a compact length and its bytes: `+` ahead of a tool, `-` once its output is known to be whole.
// A record goes behind those that are there: to replace the file for each tool cost more than to start the tool. One
// that is cut off was never acted upon. The file is gone when no tool runs. Whoever reads or writes it holds the
// folder's lock, so that no such tool runs any more when it is read.
#pragma once

#include <set>
#include <string>
#include <vector>

#include "text/files.h"

namespace qrex {

class OutputNotes {
 public:
  explicit OutputNotes(std::string path) : m_path(std::move(path)) {}

  // Deletes what an earlier run left noted. False, with a message, when that fails: what is left would pass for good.
  bool DeleteNoted();
  void Add(LeftoverSweep& leftovers, const std::vector<std::string>& paths);  // ahead of the tool; raises FileException
  void Remove(const std::vector<std::string>& paths);                         // known to be whole, or to be gone

 private:
  void Save(char mark, const std::vector<std::string>& paths);
  std::string WholeText() const;

  const std::string m_path;
  std::multiset<std::string> m_noted;
  size_t m_size = 0;  // of the file; 0: to be written as a whole
};

}  // namespace qrex
