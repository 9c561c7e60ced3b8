#include "server/character_map.h"

#include <algorithm>
#include <numeric>

#include "server/text_index.h"

namespace qrex::server {

namespace {

constexpr size_t kNone = std::string_view::npos;

// Splits what was copied of the expanded text into what the expansion had copied of the source itself.
class PartFinder {
 public:
  explicit PartFinder(const ScannedFile& file)
      : m_source(std::string_view(file.text.source)),
        m_expanded(std::string_view(file.text.expanded)),
        m_map(file.text.map),
        m_calls(file.text.map.calls.get()),
        m_cursor(file.text.map) {}

  void Add(const KeptOutput::Copied& copied) {
    const char* at = copied.expanded.begin;
    if (m_expanded.Empty()) {  // nothing was to be expanded: it is the source itself
      return AddPart(static_cast<size_t>(at - m_source.begin), copied.at, copied.expanded.Size());
    }
    if (at < m_last) m_cursor = MapCursor(m_map);  // text that is copied a second time
    while (at < copied.expanded.end) {
      const int64_t offset = at - m_expanded.begin;
      const char* const source = m_cursor.Map(offset);
      const size_t length = std::min<size_t>(static_cast<size_t>(m_cursor.RunEnd() - offset),
                                             static_cast<size_t>(copied.expanded.end - at));
      if (source && m_cursor.IsVerbatim() && IsOwn(offset, source)) {
        AddPart(static_cast<size_t>(source - m_source.begin),
                copied.at + static_cast<size_t>(at - copied.expanded.begin), length);
      }
      at += length;
    }
    m_last = at;
  }
  std::vector<CopiedPart> Take() { return std::move(m_parts); }

 private:
  // What a call gave is copied, too, where it is an argument; what comes of the macro's body stands elsewhere.
  bool IsOwn(int64_t offset, const char* source) {
    if (!m_source.Contains(source)) return false;
    if (!m_calls) return true;
    const auto isAhead = [](int64_t at, const SourceMap::Call& call) { return at < call.begin; };
    const auto next = std::upper_bound(m_calls->begin(), m_calls->end(), offset, isAhead);
    if (next == m_calls->begin() || offset >= (next - 1)->end) return true;
    const SourceMap::Call& call = *(next - 1);
    if (!m_source.Contains(call.source) || source < call.source) return false;
    const char* const lineEnd = std::find(call.source, m_source.end, '\n');
    return source < lineEnd;
  }

  void AddPart(size_t source, size_t generated, size_t length) {
    if (length == 0) return;
    if (!m_parts.empty()) {
      CopiedPart& last = m_parts.back();
      if (last.source + last.length == source && last.generated + last.length == generated) {
        last.length += length;
        return;
      }
    }
    m_parts.push_back({source, generated, length});
  }

  const TextRange m_source, m_expanded;
  const SourceMap& m_map;
  const std::vector<SourceMap::Call>* const m_calls;
  MapCursor m_cursor;
  const char* m_last = nullptr;
  std::vector<CopiedPart> m_parts;
};

bool IsAffix(char c) { return c == '_' || (c >= 'A' && c <= 'Z'); }

// How much of a generated name a source's word explains: `radius` all of Getradius but its prefix, nothing of
// `radiuses`.
size_t ShareOf(std::string_view word, std::string_view generated) {
  const size_t at = generated.find(word);
  if (at == kNone || word.empty()) return 0;
  const size_t end = at + word.size();
  const bool fits = end == generated.size() || IsAffix(generated[end]);
  return fits ? word.size() : 0;
}

// The word of this part of the source that the generated word was made of.
size_t FindOrigin(std::string_view source, size_t begin, size_t end, std::string_view generated) {
  size_t found = kNone, share = 0;
  for (size_t at = begin; at < end;) {
    if (!IsWordByte(source[at])) {
      ++at;
      continue;
    }
    const WordPlace word = WordAt(source, at);
    const size_t length = std::min(word.end, end) - at;
    const size_t its = ShareOf(source.substr(at, length), generated);
    if (its > share) {
      share = its;
      found = at;
    }
    at = std::max(word.end, at + 1);
  }
  return found;
}

}  // namespace

size_t FindWholeWord(std::string_view text, std::string_view word, size_t from, size_t end) {
  end = std::min(end, text.size());
  for (size_t at = from; (at = text.find(word, at)) != kNone && at + word.size() <= end; ++at) {
    const bool begins = at == 0 || !IsWordByte(text[at - 1]);
    const size_t behind = at + word.size();
    if (begins && (behind == text.size() || !IsWordByte(text[behind]))) return at;
  }
  return kNone;
}

CharacterMap::CharacterMap(std::vector<CopiedPart> parts) : m_parts(std::move(parts)), m_bySource(m_parts.size()) {
  std::iota(m_bySource.begin(), m_bySource.end(), size_t{0});
  std::stable_sort(m_bySource.begin(), m_bySource.end(),
                   [&](size_t a, size_t b) { return m_parts[a].source < m_parts[b].source; });
}

CharacterMap CharacterMap::OfTranslation(const ScannedFile& file, const KeptOutput& output) {
  PartFinder finder(file);
  for (const KeptOutput::Copied& copied : output.CopiedParts()) finder.Add(copied);
  return CharacterMap(finder.Take());
}

CharacterMap CharacterMap::OfCopy(size_t length) { return CharacterMap({{0, 0, length}}); }

std::optional<size_t> CharacterMap::ExactSource(size_t generated) const {
  const auto isAhead = [](size_t offset, const CopiedPart& part) { return offset < part.generated; };
  const auto next = std::upper_bound(m_parts.begin(), m_parts.end(), generated, isAhead);
  if (next == m_parts.begin()) return std::nullopt;
  const CopiedPart& part = *(next - 1);
  if (generated - part.generated <= part.length) return part.source + (generated - part.generated);
  return std::nullopt;
}

std::optional<size_t> CharacterMap::ExactGenerated(size_t source) const {
  const auto isAhead = [this](size_t offset, size_t part) { return offset < m_parts[part].source; };
  const auto next = std::upper_bound(m_bySource.begin(), m_bySource.end(), source, isAhead);
  if (next == m_bySource.begin()) return std::nullopt;
  const CopiedPart& part = m_parts[*(next - 1)];
  if (source - part.source <= part.length) return part.generated + (source - part.source);
  return std::nullopt;
}

CharacterMap::Gap CharacterMap::GapAtGenerated(size_t generated, size_t sourceSize, size_t generatedSize) const {
  const auto isAhead = [](size_t offset, const CopiedPart& part) { return offset < part.generated; };
  const auto next = std::upper_bound(m_parts.begin(), m_parts.end(), generated, isAhead);
  Gap gap{0, sourceSize, 0, generatedSize};
  if (next != m_parts.begin()) {
    gap.sourceBegin = (next - 1)->source + (next - 1)->length;
    gap.generatedBegin = (next - 1)->generated + (next - 1)->length;
  }
  if (next != m_parts.end()) {
    gap.generatedEnd = next->generated;
    gap.sourceEnd = next->source;
  }
  if (gap.sourceEnd < gap.sourceBegin) gap.sourceEnd = gap.sourceBegin;
  return gap;
}

CharacterMap::Gap CharacterMap::GapAtSource(size_t source, size_t sourceSize, size_t generatedSize) const {
  const auto isAhead = [this](size_t offset, size_t part) { return offset < m_parts[part].source; };
  const auto next = std::upper_bound(m_bySource.begin(), m_bySource.end(), source, isAhead);
  Gap gap{0, sourceSize, 0, generatedSize};
  if (next != m_bySource.begin()) {
    const CopiedPart& part = m_parts[*(next - 1)];
    gap.sourceBegin = part.source + part.length;
    gap.generatedBegin = part.generated + part.length;
  }
  if (next != m_bySource.end()) {
    gap.sourceEnd = m_parts[*next].source;
    gap.generatedEnd = m_parts[*next].generated;
  }
  if (gap.generatedEnd < gap.generatedBegin) gap.generatedEnd = generatedSize;
  return gap;
}

Mapped CharacterMap::ToSource(size_t generated, std::string_view sourceText, std::string_view generatedText) const {
  if (const auto exact = ExactSource(generated)) return {*exact, true};
  const Gap gap = GapAtGenerated(generated, sourceText.size(), generatedText.size());
  const WordPlace word = WordAt(generatedText, generated);
  const std::string_view name = generatedText.substr(word.begin, word.end - word.begin);
  size_t found = FindWholeWord(sourceText, name, gap.sourceBegin, gap.sourceEnd);
  if (found == kNone) found = FindOrigin(sourceText, gap.sourceBegin, gap.sourceEnd, name);
  if (found == kNone && !name.empty()) found = FindWholeWord(sourceText, name, 0, sourceText.size());
  if (found == kNone) {  // the declaration: what is first between the copied parts
    const size_t first = sourceText.find_first_not_of(" \t\n", gap.sourceBegin);
    found = first < gap.sourceEnd ? first : std::min(gap.sourceBegin, sourceText.size());
  }
  return {found, false};
}

std::optional<Mapped> CharacterMap::ToGenerated(size_t source, std::string_view sourceText,
                                                std::string_view generatedText) const {
  if (const auto exact = ExactGenerated(source)) return Mapped{*exact, true};
  const Gap gap = GapAtSource(source, sourceText.size(), generatedText.size());
  const WordPlace word = WordAt(sourceText, source);
  const std::string_view name = sourceText.substr(word.begin, word.end - word.begin);
  if (name.empty()) return std::nullopt;
  // The declaration of a field is preferred to what is generated ahead of it.
  size_t found = kNone;
  for (size_t at = gap.generatedBegin; (at = FindWholeWord(generatedText, name, at, gap.generatedEnd)) != kNone; ++at) {
    if (found == kNone) found = at;
    const size_t behind = generatedText.find_first_not_of(' ', at + name.size());
    if (behind == kNone || generatedText[behind] != ';') continue;
    const size_t ahead = at == 0 ? kNone : generatedText.find_last_not_of(' ', at - 1);
    const bool isDeclared = ahead != kNone && (IsWordByte(generatedText[ahead]) || generatedText[ahead] == '>');
    const bool isStatement = generatedText.substr(0, ahead + 1).ends_with("return");
    if (!isDeclared || isStatement) continue;
    found = at;
    break;
  }
  if (found == kNone) found = FindWholeWord(generatedText, name, 0, generatedText.size());
  if (found == kNone) return std::nullopt;
  return Mapped{found + (std::min(source, word.end) - word.begin), false};
}

}  // namespace qrex::server
