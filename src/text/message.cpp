#include "text/message.h"

#include "text/trace.h"

namespace qrex {

namespace {

class TraceConsumer : public MessageConsumer {
 public:
  void Take(const Message& message) override {
    TraceWriter trace;
    WriteMessage(trace, message);
  }
};

}  // namespace

void WriteMessage(TextWriter& writer, const Message& message) {
  const SourcePlace& place = message.place;
  if (message.isApart) writer << "\n";
  if (!place.file.empty()) {
    writer << place.file;
    if (place.line >= 0) writer << "(" << place.line << ")";
    writer << " : ";
  } else if (place.line >= 0) {
    writer << "Line " << place.line << ": ";
  }
  writer << message.label << message.text << "\n";
  for (const std::string& hint : message.hints) writer << Hint(hint);
}

MessageConsumer& TraceMessages() {
  static TraceConsumer consumer;
  return consumer;
}

}  // namespace qrex
