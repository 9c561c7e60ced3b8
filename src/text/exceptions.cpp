#include "text/exceptions.h"

#include "platform/error.h"

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

void ReportSystemError(const SystemException& exception) {
  std::string text;
  if (platform::ErrorSentence(exception.errorCode, text)) {
    TraceWriter() << "ERROR : GetLastError() returned " << exception.errorCode << " : " << text << "\n";
  } else {
    TraceWriter() << "ERROR: FormatMessage() failed   GetLastError returned " << exception.errorCode << "\n";
  }
}

SystemException::SystemException() : errorCode(platform::LastError()) {}

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
