// Messages of tools in the colours that compilers give them on a terminal. The compiler itself is not asked for them:
// its command would be another one then, to caches and to what is kept of commands, and compilers that lack the option
// fail.
#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace qrex {

// `message`: where in the line "error" or "warning" of its first message begins. A line with colours stays as it is.
std::string ColouredLine(std::string_view line, std::optional<size_t> message);

}  // namespace qrex
