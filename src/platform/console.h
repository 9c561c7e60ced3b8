// Standard output, UTF-8, and the status line of a terminal.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace qrex::platform {

bool IsValidUtf8(std::string_view text);
std::string WidenBytes(std::string_view text);  // each byte that is no part of valid UTF-8 as its own character
// A standard handle that the caller closed leads nowhere from now on: else the next file that is opened would take its
// number, and what is printed.
void FillStandardHandles();
bool StdoutIsTerminal();
void WriteStdout(std::string_view bytes);  // at once, unless buffered; what can't be written is lost
// From now on, lines that follow each other within moments go out together, unless a terminal shows them. Others that
// write to the same output (commands, Python) come after FlushStdout, and so does the end of the process.
void BufferStdout();
void FlushStdout();

// How wide a terminal is on which a line can be taken back; 0: the output is none, or TERM says that it can't.
size_t StatusColumns();
bool StdoutTakesColours();                // a terminal does, unless NO_COLOR is set or TERM says that it can't
size_t ColumnsOf(std::string_view text);  // that valid UTF-8 takes there, or fewer

// A line at the bottom of the terminal while this object lives: what is written meanwhile stands above it. It is gone
// at the end, also where a signal ends the process. There is one at a time; it is made where StatusColumns is not 0.
class StatusLine {
 public:
  StatusLine();
  ~StatusLine();
  StatusLine(const StatusLine&) = delete;
  StatusLine& operator=(const StatusLine&) = delete;

  void Show(std::string line);  // of fewer columns than there are, without control characters
};
void HideStatusLine();  // ahead of what others write there, until it is shown again

void FlushAllStreams();  // of the C library, into which others in this process write, such as Python

}  // namespace qrex::platform
