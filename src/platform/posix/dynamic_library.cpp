#include "platform/dynamic_library.h"

#include <dlfcn.h>

namespace qrex::platform {

void* LoadDynamicLibrary(const std::string& nameOrPath, std::string& error) {
  void* library = dlopen(nameOrPath.c_str(), RTLD_NOW | RTLD_GLOBAL);
  if (!library) error = dlerror();
  return library;
}

void* FindSymbol(void* library, const char* name) { return dlsym(library, name); }

std::string LibraryPathOf(const void* symbol) {
  Dl_info info;
  return dladdr(symbol, &info) && info.dli_fname ? info.dli_fname : std::string();
}

}  // namespace qrex::platform
