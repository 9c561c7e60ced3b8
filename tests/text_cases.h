// Cases of a data file: text in, text out.
#pragma once

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "text/files.h"

namespace qrex {

struct TextCase {
  std::string name, input, expected;
};

// The file is below `tests`. Each case begins with a line "=== NAME", and a line "---" stands ahead of what is
// expected; the line ends ahead of these lines are of no text.
inline std::vector<TextCase> TextCasesOf(const std::string& file) {
  std::string text;
  EXPECT_TRUE(ReadWholeFile(text, QREX_SOURCE_DIR "/tests/" + file)) << file;
  text = "\n" + text + "===";
  const auto between = [&text](size_t begin, size_t end) { return begin < end ? text.substr(begin, end - begin) : ""; };
  std::vector<TextCase> cases;
  for (size_t at = 0, end; at + 4 < text.size(); at = end) {
    const size_t name = text.find('\n', at + 1), mark = text.find("\n---\n", name);
    end = text.find("\n===", mark + 4);
    cases.push_back({between(at + 5, name), between(name + 1, mark), between(mark + 5, end)});
  }
  return cases;
}

}  // namespace qrex
