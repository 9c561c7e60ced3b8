// What the tool tells of a text, as a value: an error, a warning, or a note that belongs to one. It goes to a consumer;
// the trace log is one.
#pragma once

#include <cstdint>
#include <string>
#include <utility>
#include <vector>

#include "text/text_writer.h"

namespace qrex {

struct SourcePlace {
  std::string file;  // empty: no place is known
  int64_t line = -1;
  int64_t begin = -1, end = -1;  // bytes in the text of the file, with its line ends folded; -1 while unknown
};

// A note stands behind the warning that it belongs to, and ahead of the error.
enum class Severity { Note, Warning, Error };

struct Message {
  Message(Severity severity, std::string label, std::string text)
      : severity(severity), label(std::move(label)), text(std::move(text)) {}
  Message&& At(SourcePlace where) && {
    place = std::move(where);
    return std::move(*this);
  }
  Message&& WithHint(std::string hint) && {
    hints.push_back(std::move(hint));
    return std::move(*this);
  }
  Message&& Apart() && {
    isApart = true;
    return std::move(*this);
  }

  Severity severity;
  int code = 0;       // the number of a warning; 0: it has none, and is not counted
  std::string label;  // how it is headed in the log, behind the place: "error : "
  std::string text;
  SourcePlace place;
  std::string element;             // the declaration that it is about, as printed; often empty
  std::vector<std::string> hints;  // for a terminal
  bool isApart = false;            // the log has a blank line ahead of it
};

class MessageConsumer {
 public:
  virtual ~MessageConsumer() = default;
  virtual void Take(const Message& message) = 0;
};

void WriteMessage(TextWriter& writer, const Message& message);  // with the line end, as the log has it
MessageConsumer& TraceMessages();                               // writes each to the trace log

}  // namespace qrex
