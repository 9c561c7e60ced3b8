#include "builder/tool_colours.h"

#include <algorithm>

namespace qrex {

namespace {

constexpr std::string_view kBold = "\x1b[1m", kRed = "\x1b[1;31m", kMagenta = "\x1b[1;35m", kCyan = "\x1b[1;36m",
                           kGreen = "\x1b[1;32m", kPlain = "\x1b[m";

std::string In(std::string_view colour, std::string_view text) {
  if (text.empty()) return {};
  return std::string(colour).append(text).append(kPlain);
}

// The line that points at what stands above it: blanks, perhaps with a bar among them, then carets and tildes.
bool IsPointer(std::string_view line) {
  return line.find('^') != std::string_view::npos && line.find_first_not_of(" \t|^~") == std::string_view::npos;
}

}  // namespace

std::string ColouredLine(std::string_view line, std::optional<size_t> message) {
  constexpr std::string_view kNote = ": note:";
  if (line.find('\x1b') != std::string_view::npos) return std::string(line);
  std::string_view colour;
  if (message) {
    colour = line.substr(*message).starts_with("error") ? kRed : kMagenta;
  } else if (const size_t note = line.find(kNote); note != std::string_view::npos) {
    colour = kCyan;
    message = note + 2;
  } else if (IsPointer(line)) {
    const size_t begin = line.find_first_of("^~");
    return std::string(line.substr(0, begin)) + In(kGreen, line.substr(begin));
  } else {
    return std::string(line);
  }
  const size_t end = std::min(line.find_first_of(": ", *message), line.size());
  return In(kBold, line.substr(0, *message)) + In(colour, line.substr(*message, end - *message)) +
         std::string(line.substr(end));
}

}  // namespace qrex
