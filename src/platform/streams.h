// Streams of the C library on files of the system below.
#pragma once

#include <cstdio>
#include <memory>
#include <string>

namespace qrex::platform {

struct CloseStream {
  void operator()(std::FILE* stream) const { std::fclose(stream); }
};
using CStream = std::unique_ptr<std::FILE, CloseStream>;

CStream OpenStream(const std::string& path, const char* mode);  // bytes go through as they are; null: LastError
CStream OpenTemporary();                                        // a file without a name, to be written and read

}  // namespace qrex::platform
