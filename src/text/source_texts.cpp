#include "text/source_texts.h"

#include <utility>

#include "text/files.h"

namespace qrex {

namespace {

class Disk : public SourceTexts {
 public:
  bool Read(std::string& out, const std::string& path, Form form) const override {
    return form == Form::Stream ? LoadStream(out, path) : LoadText(out, path, true);
  }
  bool Has(const std::string& path) const override { return FileExists(path); }
};

}  // namespace

const SourceTexts& DiskTexts() {
  static const Disk disk;
  return disk;
}

void OverlaidTexts::Lay(const std::string& path, std::string text) {
  FoldLineEnds(text);
  m_texts[path] = std::move(text);
}

bool OverlaidTexts::Read(std::string& out, const std::string& path, Form form) const {
  const auto found = m_texts.find(path);
  if (found == m_texts.end()) return m_below.Read(out, path, form);
  out = found->second;
  return true;
}

}  // namespace qrex
