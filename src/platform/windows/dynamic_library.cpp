#include "platform/dynamic_library.h"

#include <algorithm>

#include "platform/error.h"
#include "platform/windows/api.h"

namespace qrex::platform {

namespace {

bool HasFolder(const std::string& path) { return path.find_first_of("/\\") != std::string::npos; }

}  // namespace

// What a library with a path needs may lie beside it.
void* LoadDynamicLibrary(const std::string& nameOrPath, std::string& error) {
  std::wstring path = Wide(nameOrPath);
  std::replace(path.begin(), path.end(), L'/', L'\\');
  const DWORD flags = HasFolder(nameOrPath) ? LOAD_WITH_ALTERED_SEARCH_PATH : 0;
  void* const library = LoadLibraryExW(path.c_str(), nullptr, flags);
  if (library) return library;
  std::string sentence = "error " + std::to_string(LastError());
  ErrorSentence(LastError(), sentence);
  error = nameOrPath + ": " + sentence;
  return nullptr;
}

void* FindSymbol(void* library, const char* name) {
  return reinterpret_cast<void*>(GetProcAddress(static_cast<HMODULE>(library), name));
}

std::string LibraryPathOf(const void* symbol) {
  constexpr DWORD kFlags = GET_MODULE_HANDLE_EX_FLAG_FROM_ADDRESS | GET_MODULE_HANDLE_EX_FLAG_UNCHANGED_REFCOUNT;
  HMODULE library = nullptr;
  if (!GetModuleHandleExW(kFlags, static_cast<const wchar_t*>(symbol), &library)) return {};
  std::wstring path(32768, L'\0');
  path.resize(GetModuleFileNameW(library, path.data(), static_cast<DWORD>(path.size())));
  return PathFrom(path);
}

}  // namespace qrex::platform
