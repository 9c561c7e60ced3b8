// Standard output and UTF-8.
#pragma once

#include <string>
#include <string_view>

namespace qrex::platform {

bool IsValidUtf8(std::string_view text);
std::string WidenBytes(std::string_view text);  // each byte that is no part of valid UTF-8 as its own character
bool StdoutIsTerminal();
void WriteStdout(std::string_view bytes);  // at once, unbuffered; what can't be written is lost

}  // namespace qrex::platform
