#include "text/exceptions.h"

namespace qrex {

std::string ExceptionText(const IException& exception) {
  MemoryTextWriter text;
  exception.Write(text);
  return text.TakeText();
}

std::string SystemErrorText(uint32_t code) {
  std::string text;
  if (!platform::ErrorSentence(code, text)) text = "GetLastError() returned " + std::to_string(code);
  return text;
}

void ReportSystemError(uint32_t code) {
  std::string text;
  if (platform::ErrorSentence(code, text)) {
    TraceWriter() << "ERROR : GetLastError() returned " << code << " : " << text << "\n";
  } else {
    TraceWriter() << "ERROR: FormatMessage() failed   GetLastError returned " << code << "\n";
  }
}

SystemException::SystemException() : errorCode(platform::LastError()) {}

void Require(platform::Result result, const std::string& path) {
  if (!result) throw FileException(result.Code(), path);
}

void ExceptionBase::Write(TextWriter& writer) const { writer << message; }
void LiteralException::Write(TextWriter& writer) const { writer << message; }
void SystemException::Write(TextWriter& writer) const {
  writer << "Operating system error : " << SystemErrorText(errorCode);
}
void FileException::Write(TextWriter& writer) const {
  writer << "File error (" << path << ") : " << SystemErrorText(errorCode);
}
void StringConversionException::Write(TextWriter& writer) const { writer << "String conversion failed"; }
void BufferOverflowException::Write(TextWriter& writer) const { writer << "Buffer overflow"; }

}  // namespace qrex
