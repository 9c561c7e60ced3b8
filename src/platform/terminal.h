// The console as the system below has it, for console.cpp.
#pragma once

#include <csignal>
#include <cstddef>
#include <string_view>

namespace qrex::platform {

void WriteToOutput(std::string_view bytes);  // to standard output, at once; what can't be written is lost
bool TakesControlSequences();                // a terminal, and not one whose TERM says that it can't
size_t TerminalColumns();                    // 0: it tells of none

constexpr std::string_view kTakeBack = "\r\x1b[K";
extern volatile std::sig_atomic_t isStatusDrawn;
// Between these two what ends the process takes a status line back first.
void WatchEnds();
void UnwatchEnds();

}  // namespace qrex::platform
