// Byte streams and the page-wise memory buffer. All text that the tool produces, generated source as well as messages,
// is composed in memory through these and compared with or written to disk only when it is complete.
#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace qrex {

class IOutputStream {
 public:
  virtual ~IOutputStream() = default;
  virtual void Write(const void* data, size_t length) = 0;
  virtual void Flush() = 0;
  // Writes the text with blanks ahead of each byte that begins a line, as the first does if `atLineStart`. By pieces,
  // through Write, where a stream has no quicker way.
  virtual void WriteIndented(std::string_view text, size_t blanks, bool atLineStart);
};

// Close() closes the underlying object and destroys the stream itself: do not touch it afterwards.
class ICloseableOutputStream : public IOutputStream {
 public:
  virtual void Close() = 0;
};

class IInputStream {
 public:
  virtual ~IInputStream() = default;
  virtual size_t Read(void* buffer, size_t length) = 0;  // bytes delivered, 0 at the end
};

class ISeekableInputStream : public IInputStream {
 public:
  virtual int64_t Length() = 0;
  virtual int64_t Position() = 0;
  virtual bool Seek(int64_t position) = 0;
};

// A growable byte buffer in pages; its content never moves.
class PagedBuffer {
 public:
  static constexpr size_t kDefaultPageSize = 4096;
  explicit PagedBuffer(size_t pageSize = kDefaultPageSize) : m_pageSize(pageSize) {}

  void Write(const void* data, size_t length);  // at the write position; grows when needed
  void SetSize(size_t size, bool shrink);       // moves the write position; frees pages only when `shrink`
  void Clear() { SetSize(0, true); }

  size_t PageSize() const { return m_pageSize; }
  size_t PageCount() const { return m_pages.size(); }
  const char* Page(size_t index) const { return m_pages[index].get(); }
  size_t Size() const { return m_size; }
  void AppendTo(std::string& text) const;

 private:
  size_t m_pageSize;
  std::vector<std::unique_ptr<char[]>> m_pages;
  size_t m_size = 0;
  size_t m_writePosition = 0;
};

}  // namespace qrex
