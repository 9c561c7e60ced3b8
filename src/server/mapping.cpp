#include "server/mapping.h"

#include <algorithm>

namespace qrex::server {

namespace {

// Where an offset of one text stands in another that differs in one stretch.
size_t Moved(std::string_view from, std::string_view to, size_t offset) {
  if (from == to) return offset;
  const size_t shorter = std::min(from.size(), to.size());
  const auto ahead = static_cast<size_t>(
      std::mismatch(from.begin(), from.begin() + static_cast<std::ptrdiff_t>(shorter), to.begin()).first -
      from.begin());
  if (offset <= ahead) return offset;
  size_t behind = 0;
  while (behind < shorter - ahead && from[from.size() - 1 - behind] == to[to.size() - 1 - behind]) ++behind;
  if (offset >= from.size() - behind) return offset + to.size() - from.size();
  return std::min(offset, to.size() - behind);
}

}  // namespace

ProjectFile* Mapping::FileAt(const std::string& uri) const {
  const std::string path = PathOfUri(uri);
  if (ProjectFile* const generated = m_world.FindGenerated(path)) return generated;
  return m_world.FindFile(path);
}

std::string Mapping::SourceUri(const ProjectFile& file) const {
  const auto open = openAddresses.find(&file);
  return open != openAddresses.end() ? open->second : UriOfPath(m_world.SourceFullPathOf(file));
}

std::optional<Position> Mapping::ToGenerated(ProjectFile& file, Position position) {
  const Translated& translated = m_world.TranslationOf(file);
  const std::string& madeFrom = translated.madeFrom.Text();
  const size_t source = Moved(translated.source.Text(), madeFrom, translated.source.OffsetOf(position, columns));
  const auto mapped = translated.map.ToGenerated(source, madeFrom, translated.generated.Text());
  if (!mapped) return std::nullopt;
  return translated.generated.PositionOf(mapped->offset, Columns::Utf8);
}

Mapping::SourceRange Mapping::ToSource(ProjectFile& file, const Json& range) {
  const Translated& translated = m_world.TranslationOf(file);
  const std::string &madeFrom = translated.madeFrom.Text(), &generated = translated.generated.Text();
  const size_t begin = translated.generated.OffsetOf(PositionFrom(At(range, "start")), Columns::Utf8);
  const size_t end = std::max(begin, translated.generated.OffsetOf(PositionFrom(At(range, "end")), Columns::Utf8));
  const Mapped first = translated.map.ToSource(begin, madeFrom, generated);
  const auto last = translated.map.ExactSource(end);
  SourceRange found{first.offset, first.offset, false};
  if (first.isExact && last && *last >= first.offset) {
    found.end = *last;
    // What stands between may have been left out.
    found.isExact = *last - first.offset == end - begin;
  } else {
    const WordPlace word = WordAt(madeFrom, first.offset);
    found.end = std::max(first.offset, word.end);
  }
  const std::string& source = translated.source.Text();
  found.begin = Moved(madeFrom, source, found.begin);
  found.end = std::max(found.begin, Moved(madeFrom, source, found.end));
  found.isExact =
      found.isExact && source.substr(found.begin, found.end - found.begin) == generated.substr(begin, end - begin);
  return found;
}

Json Mapping::RangeOf(ProjectFile& file, const SourceRange& range) {
  return RangeJson(m_world.TranslationOf(file).source, range.begin, range.end, columns);
}

// --- Answers

Json Mapping::Location(const Json& location) {
  const bool isLink = location.contains("targetUri");
  const std::string uri = TextAt(location, isLink ? "targetUri" : "uri");
  const Json& range = At(location, isLink ? "targetSelectionRange" : "range");
  ProjectFile* const file = FileAt(uri);
  if (!file) return {{"uri", uri}, {"range", range}};
  return {{"uri", SourceUri(*file)}, {"range", RangeOf(*file, ToSource(*file, range))}};
}

Json Mapping::Locations(const Json& answer) {
  if (answer.is_object()) return Location(answer);
  Json mapped = Json::array();
  if (!answer.is_array()) return mapped;
  for (const Json& location : answer) {
    Json one = Location(location);
    if (std::find(mapped.begin(), mapped.end(), one) == mapped.end()) mapped.push_back(std::move(one));
  }
  return mapped;
}

Json Mapping::WithRanges(ProjectFile& file, const Json& answer) {
  if (answer.is_array()) {
    Json mapped = Json::array();
    for (const Json& item : answer) mapped.push_back(WithRanges(file, item));
    return mapped;
  }
  if (!answer.is_object()) return answer;
  Json mapped = Json::object();
  for (const auto& [key, value] : answer.items()) {
    const bool isRange = value.is_object() && value.contains("start") && value.contains("end");
    const bool isPosition = value.is_object() && value.contains("line") && value.contains("character");
    if (isRange) {
      mapped[key] = RangeOf(file, ToSource(file, value));
    } else if (isPosition) {
      const SourceRange at = ToSource(file, {{"start", value}, {"end", value}});
      mapped[key] = ToJson(m_world.TranslationOf(file).source.PositionOf(at.begin, columns));
    } else if (key == "location") {
      mapped[key] = Location(value);
    } else {
      mapped[key] = WithRanges(file, value);
    }
  }
  return mapped;
}

std::optional<Json> Mapping::Edit(ProjectFile& file, const Json& edit) {
  const SourceRange range = ToSource(file, At(edit, "range"));
  if (!range.isExact) return std::nullopt;
  return Json{{"range", RangeOf(file, range)}, {"newText", TextAt(edit, "newText")}};
}

bool Mapping::Edits(const Json& answer, Json& mapped) {
  Json changes = Json::object();
  for (const auto& [uri, edits] : At(answer, "changes").items()) {
    ProjectFile* const file = FileAt(uri);
    for (const Json& edit : edits) {
      const auto one = file ? Edit(*file, edit) : std::optional<Json>(edit);
      if (!one) return false;
      Json& its = changes[file ? SourceUri(*file) : uri];
      const bool isKnown = std::find(its.begin(), its.end(), *one) != its.end();  // the argument of a macro, used twice
      if (!isKnown) its.push_back(*one);
    }
  }
  mapped = {{"changes", std::move(changes)}};
  return true;
}

}  // namespace qrex::server
