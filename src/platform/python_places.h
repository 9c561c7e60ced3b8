// Where this system keeps Python 2.7.
#pragma once

#include <string>

namespace qrex::platform {

std::string PythonLibraryName();  // of its shared library, for LoadDynamicLibrary
// The folder that the standard library which lies beside a shared library belongs to; empty: none lies there.
std::string PythonHomeOf(const std::string& library);

}  // namespace qrex::platform
