// Error numbers are those of Windows, whatever the system below: messages and files carry them.
#pragma once

#include <cstdint>
#include <string>

namespace qrex::platform {

constexpr uint32_t kErrorFileNotFound = 2;
constexpr uint32_t kErrorPathNotFound = 3;
constexpr uint32_t kErrorAccessDenied = 5;
constexpr uint32_t kErrorWriteFault = 29;

inline bool IsNotFound(uint32_t code) { return code == kErrorFileNotFound || code == kErrorPathNotFound; }

uint32_t LastError();                                  // of the last failed system call of this thread
void SetLastError(uint32_t code);                      // for failures that this layer finds itself
bool ErrorSentence(uint32_t code, std::string& text);  // false: the code has no text

}  // namespace qrex::platform
