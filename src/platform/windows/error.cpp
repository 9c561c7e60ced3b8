#include "platform/error.h"

#include "platform/windows/api.h"

namespace qrex::platform {

Result Result::OfSystem(int error) { return Result(static_cast<uint32_t>(error)); }
Result Result::OfCall(bool isWell) { return isWell ? Result() : Failure(LastError()); }

// What the C library refuses itself has no code of the system.
uint32_t LastError() { return GetLastError() == 0 ? ERROR_GEN_FAILURE : GetLastError(); }

bool ErrorSentence(uint32_t code, std::string& text) {
  constexpr DWORD kFlags = FORMAT_MESSAGE_ALLOCATE_BUFFER | FORMAT_MESSAGE_FROM_SYSTEM | FORMAT_MESSAGE_IGNORE_INSERTS;
  wchar_t* message = nullptr;
  const DWORD length = FormatMessageW(kFlags, nullptr, code, 0, reinterpret_cast<wchar_t*>(&message), 0, nullptr);
  if (length == 0) return false;
  text = Narrow({message, length});
  LocalFree(message);
  text.erase(text.find_last_not_of("\r\n") + 1);
  return true;
}

}  // namespace qrex::platform
