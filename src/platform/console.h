// Standard output and UTF-8.
#pragma once

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
void FlushAllStreams();  // of the C library, into which others in this process write, such as Python

}  // namespace qrex::platform
