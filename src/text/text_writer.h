// Text output with an indentation that is applied at line starts, and the trace log built on it.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <type_traits>

#include "text/streams.h"

namespace qrex {

class IException;
class IndentingOutputStreamToOStream;

// What the whole system writes to. Bytes gather in a 4096-byte array; indentation is applied when they leave it.
class TextWriter {
 public:
  explicit TextWriter(IOutputStream& target);
  virtual ~TextWriter();
  TextWriter(const TextWriter&) = delete;
  TextWriter& operator=(const TextWriter&) = delete;

  TextWriter& operator<<(std::string_view text);
  TextWriter& operator<<(const char* text) { return *this << std::string_view(text); }
  TextWriter& operator<<(const std::string& text) { return *this << std::string_view(text); }
  TextWriter& operator<<(char c);
  TextWriter& operator<<(double value);  // general format, 6 significant digits
  TextWriter& operator<<(const IException& exception);
  template <typename T, typename = std::enable_if_t<std::is_integral_v<T> && !std::is_same_v<T, char>>>
  TextWriter& operator<<(T value) {
    if constexpr (std::is_signed_v<T>)
      return WriteSigned(value);
    else
      return WriteUnsigned(value);
  }

  void Flush();
  void EndLine();  // a line feed, then a flush
  int64_t Indent() const;
  void AddIndent(int64_t columns);  // flush first: text already in the array takes the new amount (IndentScope does)
  bool SetAtLineStart(bool value);  // flush first; the answer is what held before

 private:
  TextWriter& WriteSigned(int64_t value);
  TextWriter& WriteUnsigned(uint64_t value);
  std::unique_ptr<IndentingOutputStreamToOStream> m_stream;
};

// A TextWriter over a PagedBuffer of its own: messages and generated fragments are composed in these.
struct MemoryTextTarget;
class MemoryTextWriter : public TextWriter {
 public:
  MemoryTextWriter();
  ~MemoryTextWriter() override;
  std::string TakeText(bool clear = true);  // flushes
  PagedBuffer& Buffer();                    // flush first to see all

 private:
  explicit MemoryTextWriter(std::unique_ptr<MemoryTextTarget> target);
  std::unique_ptr<MemoryTextTarget> m_target;
};

// Composed for one message; prints it through the trace sink at its end. `TraceWriter() << "x" << n;`
class TraceWriter : public MemoryTextWriter {
 public:
  ~TraceWriter() override;
};

class IndentScope {
 public:
  IndentScope(TextWriter& writer, int64_t columns) : m_writer(writer), m_columns(columns) {
    m_writer.Flush();
    m_writer.AddIndent(columns);
  }
  ~IndentScope() {
    m_writer.Flush();
    m_writer.AddIndent(-m_columns);
  }
  IndentScope(const IndentScope&) = delete;
  IndentScope& operator=(const IndentScope&) = delete;

 private:
  TextWriter& m_writer;
  int64_t m_columns;
};

// An IndentScope that opens within a line: the further lines are indented, what is left of this one isn't.
class LineRestScope {
 public:
  LineRestScope(TextWriter& writer, int64_t columns) : m_writer(writer), m_columns(columns) {
    m_writer.Flush();
    m_writer.AddIndent(columns);
    m_wasAtLineStart = m_writer.SetAtLineStart(false);
  }
  ~LineRestScope() {
    m_writer.Flush();
    m_writer.AddIndent(-m_columns);
    // Without indentation the writer doesn't follow the line starts: the next scope opens at one.
    if (m_writer.Indent() < 1) m_writer.SetAtLineStart(m_wasAtLineStart);
  }
  LineRestScope(const LineRestScope&) = delete;
  LineRestScope& operator=(const LineRestScope&) = delete;

 private:
  TextWriter& m_writer;
  int64_t m_columns;
  bool m_wasAtLineStart;
};

}  // namespace qrex
