// A generated text in memory, with the parts of it that were copied from the expanded text as they stand there.
#pragma once

#include <string>
#include <vector>

#include "lex/token.h"
#include "text/streams.h"

namespace qrex {

class KeptOutput : public IOutputStream {
 public:
  struct Copied {
    size_t at = 0;  // in the text
    TextRange expanded;
  };
  void Write(const void* data, size_t length) override { m_text.append(static_cast<const char*>(data), length); }
  void Flush() override {}
  void WillCopy(TextRange expanded) { m_copied.push_back({m_text.size(), expanded}); }  // ahead of writing it

  const std::string& Text() const { return m_text; }
  const std::vector<Copied>& CopiedParts() const { return m_copied; }

 private:
  std::string m_text;
  std::vector<Copied> m_copied;  // in the order of the text
};

}  // namespace qrex
