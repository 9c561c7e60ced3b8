// Error numbers are those of Windows, whatever the system below: messages and files carry them.
#pragma once

#include <cstdint>
#include <string>

namespace qrex::platform {

constexpr intptr_t kNoHandle = -1;  // of the system below: a descriptor, or a HANDLE

constexpr uint32_t kErrorFileNotFound = 2;
constexpr uint32_t kErrorPathNotFound = 3;
constexpr uint32_t kErrorAccessDenied = 5;
constexpr uint32_t kErrorWriteFault = 29;
constexpr uint32_t kErrorFileExists = 80;

inline bool IsNotFound(uint32_t code) { return code == kErrorFileNotFound || code == kErrorPathNotFound; }

// How an operation ended: well, or with the code of what was in its way.
class Result {
 public:
  Result() = default;
  static Result Failure(uint32_t code) { return Result(code); }
  static Result OfSystem(int error);  // a number of the system below; 0: well
  static Result OfCall(bool isWell);  // a system call that was just made
  explicit operator bool() const { return m_code == 0; }
  uint32_t Code() const { return m_code; }  // 0: well
  bool IsNotFound() const { return platform::IsNotFound(m_code); }

 private:
  explicit Result(uint32_t code) : m_code(code) {}
  uint32_t m_code = 0;
};

uint32_t LastError();                                  // of the last failed system call of this thread
bool ErrorSentence(uint32_t code, std::string& text);  // false: the code has no text

}  // namespace qrex::platform
