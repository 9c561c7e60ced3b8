#include "text/streams.h"

#include <algorithm>
#include <cstring>

#include "platform/console.h"
#include "platform/file_system.h"
#include "text/stream_adapters.h"
#include "text/trace.h"

namespace qrex {

void IOutputStream::WriteIndented(std::string_view text, size_t blanks, bool atLineStart) {
  const std::string indentation(blanks, ' ');
  while (!text.empty()) {
    if (atLineStart) Write(indentation.data(), indentation.size());
    const size_t lineFeed = text.find('\n');
    atLineStart = lineFeed != std::string_view::npos;
    const size_t length = atLineStart ? lineFeed + 1 : text.size();
    Write(text.data(), length);
    text.remove_prefix(length);
  }
}

void PagedBuffer::SetSize(size_t size, bool shrink) {
  const size_t pages = (size + m_pageSize - 1) / m_pageSize;
  while (m_pages.size() < pages) m_pages.emplace_back(new char[m_pageSize]);  // not zeroed
  if (shrink) m_pages.resize(pages);
  m_size = size;
  m_writePosition = size;
}

void PagedBuffer::Write(const void* data, size_t length) {
  const char* source = static_cast<const char*>(data);
  size_t position = m_writePosition;
  if (position + length > m_size) SetSize(position + length, false);
  m_writePosition = position + length;
  while (length > 0) {
    const size_t offset = position % m_pageSize;
    const size_t count = std::min(length, m_pageSize - offset);
    std::memcpy(m_pages[position / m_pageSize].get() + offset, source, count);
    source += count;
    position += count;
    length -= count;
  }
}

void PagedBuffer::AppendTo(std::string& text) const {
  text.reserve(text.size() + m_size);
  for (size_t position = 0; position < m_size; position += m_pageSize) {
    text.append(m_pages[position / m_pageSize].get(), std::min(m_pageSize, m_size - position));
  }
}

size_t PagedBufferReader::Read(void* data, size_t length) {
  char* target = static_cast<char*>(data);
  const size_t pageSize = m_buffer.PageSize();
  size_t done = 0;
  while (done < length && m_position < m_buffer.Size()) {
    const size_t offset = m_position % pageSize;
    const size_t count = std::min({length - done, pageSize - offset, m_buffer.Size() - m_position});
    std::memcpy(target + done, m_buffer.Page(m_position / pageSize) + offset, count);
    done += count;
    m_position += count;
  }
  return done;
}

bool PagedBufferReader::Seek(int64_t position) {
  if (position < 0) return false;
  m_position = static_cast<size_t>(position);
  return m_position <= m_buffer.Size();
}

void BufferToOutputStreamAdapter::Write(const void* data, size_t length) {
  if (length > m_room) throw BufferOverflowException();
  std::copy_n(static_cast<const char*>(data), length, m_next);
  m_next += length;
  m_room -= length;
}

size_t BufferToInputStreamAdapter::Read(void* data, size_t length) {
  const size_t count = std::min(length, m_length - m_position);
  std::copy_n(m_block + m_position, count, static_cast<char*>(data));
  m_position += count;
  return count;
}

bool BufferToInputStreamAdapter::Seek(int64_t position) {
  if (position < 0 || static_cast<size_t>(position) > m_length) return false;
  m_position = static_cast<size_t>(position);
  return true;
}

void StdioOutputStream::Write(const void* data, size_t length) {
  WriteToConsole({static_cast<const char*>(data), length});
}

OFileStream::OFileStream(const std::string& path, bool textMode) : m_path(path), m_textMode(textMode) {
  if (!platform::IsValidUtf8(path)) throw StringConversionException();
  if (platform::IsReadOnlyFile(path)) throw FileException(platform::kErrorAccessDenied, path);
  Require(m_file.Open(path, "wb"), path);
}

void OFileStream::WriteBytes(std::string_view bytes) { Require(m_file.Write(bytes), m_path); }

void OFileStream::Write(const void* data, size_t length) {
  std::string_view rest(static_cast<const char*>(data), length);
  while (m_textMode) {
    const size_t lineFeed = rest.find('\n');
    if (lineFeed == std::string_view::npos) break;
    WriteBytes(rest.substr(0, lineFeed));
    WriteBytes("\r\n");
    rest.remove_prefix(lineFeed + 1);
  }
  WriteBytes(rest);
}

void OFileStream::Flush() { Require(m_file.Flush(), m_path); }

void OFileStream::Close() {
  std::unique_ptr<OFileStream> self(this);
  Require(m_file.Close(), m_path);
}

namespace {

template <typename Target>
int64_t CopyChunks(IInputStream& in, int64_t most, Target write) {
  char chunk[8192];
  int64_t copied = 0;
  while (copied < most) {
    const size_t wanted = static_cast<size_t>(std::min<int64_t>(sizeof chunk, most - copied));
    const size_t got = in.Read(chunk, wanted);
    if (got == 0) break;
    write(chunk, got);
    copied += static_cast<int64_t>(got);
  }
  return copied;
}

}  // namespace

int64_t CopyStream(IOutputStream& out, IInputStream& in, int64_t most) {
  return CopyChunks(in, most, [&](const char* data, size_t length) { out.Write(data, length); });
}

int64_t CopyStream(TextWriter& out, IInputStream& in, int64_t most) {
  return CopyChunks(in, most, [&](const char* data, size_t length) { out << std::string_view(data, length); });
}

}  // namespace qrex
