#include "text/text_writer.h"

#include <algorithm>
#include <charconv>
#include <ostream>
#include <streambuf>
#include <utility>

#include "text/exceptions.h"
#include "text/stream_adapters.h"
#include "text/trace.h"

namespace qrex {

// Indentation is applied when bytes leave the array: in front of a byte that follows a line feed, so that a text's end
// gets no trailing blanks.
class IndentingOutputStreamAsStreambuf : public std::streambuf {
 public:
  explicit IndentingOutputStreamAsStreambuf(IOutputStream& target) : m_target(target) {
    setp(m_array, m_array + sizeof m_array);
  }

  void Append(std::string_view text) {
    if (text.size() > static_cast<size_t>(epptr() - pptr())) {
      Empty();
      if (text.size() >= sizeof m_array) return Emit(text);
    }
    std::copy(text.begin(), text.end(), pptr());  // the text may be null
    pbump(static_cast<int>(text.size()));
  }

  void Empty() {
    Emit({pbase(), static_cast<size_t>(pptr() - pbase())});
    setp(m_array, m_array + sizeof m_array);
  }

  void Flush() {
    Empty();
    m_target.Flush();
  }

  int64_t indent = 0;
  bool atLineStart = true;

 protected:
  int overflow(int c) override {
    Empty();
    if (c != traits_type::eof()) sputc(static_cast<char>(c));
    return traits_type::not_eof(c);
  }
  std::streamsize xsputn(const char* data, std::streamsize length) override {
    Append({data, static_cast<size_t>(length)});
    return length;
  }
  int sync() override {
    Flush();
    return 0;
  }

 private:
  [[gnu::noinline]] void Emit(std::string_view text) {  // apart, so that Append stays small
    if (text.empty()) return;
    if (indent < 1) return m_target.Write(text.data(), text.size());
    m_target.WriteIndented(text, static_cast<size_t>(indent), atLineStart);
    atLineStart = text.back() == '\n';
  }

  IOutputStream& m_target;
  char m_array[4096];
};

class IndentingOutputStreamToOStream : public std::ostream {
 public:
  explicit IndentingOutputStreamToOStream(IOutputStream& target) : std::ostream(nullptr), buffer(target) {
    rdbuf(&buffer);
  }
  IndentingOutputStreamAsStreambuf buffer;
};

TextWriter::TextWriter(IOutputStream& target) : m_stream(std::make_unique<IndentingOutputStreamToOStream>(target)) {}
TextWriter::~TextWriter() = default;

TextWriter& TextWriter::operator<<(std::string_view text) {
  m_stream->buffer.Append(text);
  return *this;
}

TextWriter& TextWriter::operator<<(char c) {
  m_stream->buffer.sputc(c);
  return *this;
}

TextWriter& TextWriter::operator<<(double value) {
  *m_stream << value;
  return *this;
}

TextWriter& TextWriter::operator<<(const IException& exception) {
  exception.Write(*this);
  return *this;
}

TextWriter& TextWriter::WriteSigned(int64_t value) {
  char digits[24];
  return *this << std::string_view(digits, static_cast<size_t>(std::to_chars(digits, digits + 24, value).ptr - digits));
}

TextWriter& TextWriter::WriteUnsigned(uint64_t value) {
  char digits[24];
  return *this << std::string_view(digits, static_cast<size_t>(std::to_chars(digits, digits + 24, value).ptr - digits));
}

void TextWriter::Flush() { m_stream->buffer.Flush(); }

void TextWriter::EndLine() {
  *this << '\n';
  Flush();
}

int64_t TextWriter::Indent() const { return m_stream->buffer.indent; }
void TextWriter::AddIndent(int64_t columns) { m_stream->buffer.indent += columns; }
bool TextWriter::SetAtLineStart(bool value) { return std::exchange(m_stream->buffer.atLineStart, value); }

struct MemoryTextTarget {
  PagedBuffer buffer;
  PagedBufferToOutputStreamAdapter adapter{buffer};
};

MemoryTextWriter::MemoryTextWriter() : MemoryTextWriter(std::make_unique<MemoryTextTarget>()) {}
MemoryTextWriter::MemoryTextWriter(std::unique_ptr<MemoryTextTarget> target)
    : TextWriter(target->adapter), m_target(std::move(target)) {}
MemoryTextWriter::~MemoryTextWriter() = default;

std::string MemoryTextWriter::TakeText(bool clear) {
  Flush();
  std::string text;
  m_target->buffer.AppendTo(text);
  if (clear) m_target->buffer.Clear();
  return text;
}

PagedBuffer& MemoryTextWriter::Buffer() { return m_target->buffer; }

TraceWriter::~TraceWriter() { WriteToTrace(TakeText()); }

}  // namespace qrex
