// The one family of exceptions. What it shares is not a message string but the ability to print itself, without a
// line end, into a TextWriter. Thrown by value, caught by reference.
#pragma once

#include <cstdint>
#include <string>

#include "platform/error.h"
#include "text/text_writer.h"

namespace qrex {

class IException {
 public:
  virtual ~IException() = default;
  virtual void Write(TextWriter& writer) const = 0;
};

std::string ExceptionText(const IException& exception);
std::string SystemErrorText(uint32_t code);  // "GetLastError() returned N" for a code without a sentence

class ExceptionBase : public IException {
 public:
  explicit ExceptionBase(std::string message) : message(std::move(message)) {}
  void Write(TextWriter& writer) const override;
  std::string message;
};

class DeserialisationException : public ExceptionBase {
 public:
  explicit DeserialisationException(std::string message = "Deserialisation error")
      : ExceptionBase(std::move(message)) {}
};

class SystemException : public IException {
 public:
  SystemException();  // the code of the last error
  explicit SystemException(uint32_t errorCode) : errorCode(errorCode) {}
  void Write(TextWriter& writer) const override;
  uint32_t errorCode;
};

void ReportSystemError(uint32_t code);  // a line of the trace log with the code and its sentence

class FileException : public SystemException {
 public:
  explicit FileException(std::string path) : path(std::move(path)) {}
  FileException(uint32_t errorCode, std::string path) : SystemException(errorCode), path(std::move(path)) {}
  void Write(TextWriter& writer) const override;
  std::string path;
};

void Require(platform::Result result, const std::string& path);  // raises FileException when it is a failure

class LiteralException : public IException {
 public:
  explicit LiteralException(std::string message) : message(std::move(message)) {}
  void Write(TextWriter& writer) const override;
  std::string message;
};

class StringConversionException : public IException {
 public:
  void Write(TextWriter& writer) const override;
};

class BufferOverflowException : public IException {
 public:
  void Write(TextWriter& writer) const override;
};

}  // namespace qrex
