// Prints a timing line at its end: the label padded with dots to 88 columns, then milliseconds.
#pragma once

#include <cstdint>

#include "text/text_writer.h"

namespace qrex {

// Present time as a 64-bit file time: the system time is read once per process, the performance counter goes on from
// it.
int64_t CurrentFileTime();

class ScopeTimer {
 public:
  explicit ScopeTimer(bool autoStop = false);
  ~ScopeTimer();
  void Stop(bool restart = false);  // then write the label into Label()
  MemoryTextWriter& Label() { return m_label; }

 private:
  void Flush();
  MemoryTextWriter m_label;
  bool m_autoStop;
  int64_t m_start;
  bool m_pending = false;
  int64_t m_elapsed = 0;
};

}  // namespace qrex
