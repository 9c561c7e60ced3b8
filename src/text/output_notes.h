// What tools are about to write is noted in a file while they run: a run that is killed leaves word of what may be
// half-written, and the next run deletes it. Stamps cannot tell: half an object is younger than its source.
//
// A checked file (text/files.h) with the magic 0x2AEF78F2; its payload are the paths, relative to the folder of the
// run, as compact lengths and their bytes. It holds the outputs of all tools that run at the time, and is gone when
// none does. Whoever reads or writes it holds the folder's lock, so that no such tool runs any more when it is read.
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
  void Save();

  const std::string m_path;
  std::multiset<std::string> m_noted;
};

}  // namespace qrex
