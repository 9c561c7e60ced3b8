// The way between the characters of a source and those of its generated text. What was copied leads both ways exactly.
// The rest goes by what it stands between: of two copied parts that follow each other, the source between them became
// the text between them, in which its words are looked for.
#pragma once

#include <cstddef>
#include <optional>
#include <string_view>
#include <vector>

#include "translator/reader/kept_output.h"
#include "translator/symbols/scanned_file.h"

namespace qrex::server {

struct CopiedPart {
  size_t source = 0, generated = 0, length = 0;
};

struct Mapped {
  size_t offset = 0;
  bool isExact = false;  // it was copied; else the word that it is in was found, or the declaration it came of
};

class CharacterMap {
 public:
  CharacterMap() = default;
  explicit CharacterMap(std::vector<CopiedPart> parts);  // in the order of the generated text
  static CharacterMap OfTranslation(const ScannedFile& file, const KeptOutput& output);
  static CharacterMap OfCopy(size_t length);

  // Of an offset in a copied part, or at its end.
  std::optional<size_t> ExactSource(size_t generated) const;
  std::optional<size_t> ExactGenerated(size_t source) const;
  // The texts are those that the map is of.
  Mapped ToSource(size_t generated, std::string_view sourceText, std::string_view generatedText) const;
  std::optional<Mapped> ToGenerated(size_t source, std::string_view sourceText, std::string_view generatedText) const;
  const std::vector<CopiedPart>& Parts() const { return m_parts; }

 private:
  struct Gap {
    size_t sourceBegin, sourceEnd, generatedBegin, generatedEnd;
  };
  Gap GapAtGenerated(size_t generated, size_t sourceSize, size_t generatedSize) const;
  Gap GapAtSource(size_t source, size_t sourceSize, size_t generatedSize) const;

  std::vector<CopiedPart> m_parts;
  std::vector<size_t> m_bySource;  // indexes of parts
};

// Whether the whole word stands there, and the next place from `from` on where it does; npos: none.
size_t FindWholeWord(std::string_view text, std::string_view word, size_t from, size_t end);

}  // namespace qrex::server
