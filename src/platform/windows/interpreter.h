// How a program is called on Windows: by one text, which the program takes apart.
#pragma once

#include <string>
#include <vector>

namespace qrex::platform {

// Of the command interpreter: as long as that reads, with what has a meaning to it and none in lines (platform/
// interpreter.h) made text.
std::string ForInterpreter(const std::string& line);
std::string AsOneLine(const std::vector<std::string>& words);  // which programs take apart to these words again

struct Call {
  std::string program;  // the file; empty: none was found
  std::string text;     // of the call, with the program's name
  bool isInterpreted = false;
  bool isUnknown = false;  // the interpreter is to say that there is no such program
};
Call CallOfLine(const std::string& line);
Call CallOfWords(const std::vector<std::string>& words);

constexpr size_t kLongestCall = 32766;  // in UTF-16
constexpr size_t kLongestInterpreted = 8190;

}  // namespace qrex::platform
