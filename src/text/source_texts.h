// Where the texts come from that the tool reads as sources: the disk, or texts in memory laid over it.
#pragma once

#include <map>
#include <string>

namespace qrex {

class SourceTexts {
 public:
  enum class Form { File, Stream };  // a stream may also be a pipe or a device
  virtual ~SourceTexts() = default;
  virtual bool Read(std::string& out, const std::string& path,
                    Form form = Form::File) const = 0;  // line ends folded
  virtual bool Has(const std::string& path) const = 0;
};

const SourceTexts& DiskTexts();

// Texts by the paths by which the tool asks for them. Where there is none, the layer below is asked.
class OverlaidTexts : public SourceTexts {
 public:
  explicit OverlaidTexts(const SourceTexts& below = DiskTexts()) : m_below(below) {}
  void Lay(const std::string& path,
           std::string text);  // in place of an earlier one
  void Lift(const std::string& path) { m_texts.erase(path); }
  bool Read(std::string& out, const std::string& path, Form form) const override;
  bool Has(const std::string& path) const override { return m_texts.contains(path) || m_below.Has(path); }

 private:
  const SourceTexts& m_below;
  std::map<std::string, std::string> m_texts;
};

}  // namespace qrex
