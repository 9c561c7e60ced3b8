#include "platform/buffered_file.h"

namespace qrex::platform {

Result BufferedFile::Open(const std::string& path, const char* mode) {
  Close();
  m_stream = OpenStream(path, mode);
  return Result::OfCall(IsOpen());
}

size_t BufferedFile::Read(void* buffer, size_t length) {
  return IsOpen() ? std::fread(buffer, 1, length, m_stream.get()) : 0;
}

Result BufferedFile::Write(std::string_view bytes) {
  if (!IsOpen()) return Result::Failure(kErrorWriteFault);
  return Result::OfCall(std::fwrite(bytes.data(), 1, bytes.size(), m_stream.get()) == bytes.size());
}

Result BufferedFile::Flush() { return Result::OfCall(!IsOpen() || std::fflush(m_stream.get()) == 0); }

Result BufferedFile::Close() {
  std::FILE* const stream = m_stream.release();
  return Result::OfCall(!stream || std::fclose(stream) == 0);
}

int64_t BufferedFile::Position() const { return IsOpen() ? std::ftell(m_stream.get()) : 0; }
bool BufferedFile::Seek(int64_t position) { return IsOpen() && std::fseek(m_stream.get(), position, SEEK_SET) == 0; }

}  // namespace qrex::platform
