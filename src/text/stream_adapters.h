// Streams over buffers, memory blocks, files and standard output.
#pragma once

#include <memory>
#include <string>

#include "platform/buffered_file.h"
#include "text/exceptions.h"
#include "text/streams.h"

namespace qrex {

class StdioOutputStream : public IOutputStream {
 public:
  void Write(const void* data, size_t length) override;  // through the console writer
  void Flush() override {}
};

// Replaces an existing file. In text mode each line feed is written as CR LF. All failures raise FileException. Made
// with new: Close() destroys it.
class OFileStream : public ICloseableOutputStream {
 public:
  OFileStream(const std::string& path, bool textMode);
  void Write(const void* data, size_t length) override;
  void Flush() override;
  void Close() override;

 private:
  void WriteBytes(std::string_view bytes);
  platform::BufferedFile m_file;
  std::string m_path;
  bool m_textMode;
};

// The two adapters below don't own their buffer.
class PagedBufferToOutputStreamAdapter : public IOutputStream {
 public:
  explicit PagedBufferToOutputStreamAdapter(PagedBuffer& buffer) : m_buffer(buffer) {}
  void Write(const void* data, size_t length) override { m_buffer.Write(data, length); }
  void Flush() override {}

 private:
  PagedBuffer& m_buffer;
};

class PagedBufferReader {
 public:
  explicit PagedBufferReader(const PagedBuffer& buffer) : m_buffer(buffer) {}
  size_t Read(void* data, size_t length);
  bool Seek(int64_t position);  // a position beyond the content leaves nothing to read
  int64_t Position() const { return static_cast<int64_t>(m_position); }

 private:
  const PagedBuffer& m_buffer;
  size_t m_position = 0;
};

class PagedBufferToInputStreamAdapter : public ISeekableInputStream {
 public:
  explicit PagedBufferToInputStreamAdapter(const PagedBuffer& buffer) : m_buffer(buffer), m_reader(buffer) {}
  size_t Read(void* data, size_t length) override { return m_reader.Read(data, length); }
  int64_t Length() override { return static_cast<int64_t>(m_buffer.Size()); }
  int64_t Position() override { return m_reader.Position(); }
  bool Seek(int64_t position) override { return m_reader.Seek(position); }

 private:
  const PagedBuffer& m_buffer;
  PagedBufferReader m_reader;
};

// Fills a block of the caller's; a write beyond its room raises BufferOverflowException and copies nothing.
class BufferToOutputStreamAdapter : public IOutputStream {
 public:
  BufferToOutputStreamAdapter(void* block, size_t length) : m_next(static_cast<char*>(block)), m_room(length) {}
  void Write(const void* data, size_t length) override;
  void Flush() override {}
  virtual size_t Room() const { return m_room; }

 private:
  char* m_next;
  size_t m_room;
};

class BufferToInputStreamAdapter : public ISeekableInputStream {
 public:
  BufferToInputStreamAdapter(const void* block, size_t length)
      : m_block(static_cast<const char*>(block)), m_length(length) {}
  size_t Read(void* data, size_t length) override;
  int64_t Length() override { return static_cast<int64_t>(m_length); }
  int64_t Position() override { return static_cast<int64_t>(m_position); }
  bool Seek(int64_t position) override;

 private:
  const char* m_block;
  size_t m_length;
  size_t m_position = 0;
};

// Copies until the input ends, or `most` bytes; the number of bytes copied.
int64_t CopyStream(IOutputStream& out, IInputStream& in, int64_t most = INT64_MAX);
int64_t CopyStream(TextWriter& out, IInputStream& in, int64_t most = INT64_MAX);

}  // namespace qrex
