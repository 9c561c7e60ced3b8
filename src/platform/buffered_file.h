// A file that is read and written through a buffer.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "platform/error.h"
#include "platform/streams.h"

namespace qrex::platform {

class BufferedFile {
 public:
  BufferedFile() = default;
  ~BufferedFile() { Close(); }
  BufferedFile(const BufferedFile&) = delete;
  BufferedFile& operator=(const BufferedFile&) = delete;

  // "r", "w", "a", "rb", ...; what was open is closed. The bytes go through as they are, also where text files have
  // line ends of their own.
  Result Open(const std::string& path, const char* mode);
  bool IsOpen() const { return m_stream != nullptr; }
  size_t Read(void* buffer, size_t length);
  Result Write(std::string_view bytes);
  Result Flush();
  Result Close();  // a failure: bytes got lost; it is closed all the same
  int64_t Position() const;
  bool Seek(int64_t position);

 private:
  CStream m_stream;
};

}  // namespace qrex::platform
