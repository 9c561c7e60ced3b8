#include "driver/followed_files.h"

#include <algorithm>

#include "builder/dependency_file.h"
#include "builder/make_reason.h"
#include "driver/depfile.h"
#include "text/files.h"
#include "text/text_writer.h"
#include "translator/file/translate_file.h"

namespace qrex {

// --- Lines and columns

TextLines::TextLines(const std::string& path) {
  LoadText(m_text, path, true);
  m_starts.push_back(0);
  for (size_t end = 0; (end = m_text.find('\n', end)) != std::string::npos;) m_starts.push_back(++end);
  if (m_starts.back() < m_text.size()) m_starts.push_back(m_text.size() + 1);  // no line feed ends the last line
}

std::string_view TextLines::Line(int64_t number) const {
  if (number < 1 || number > Count()) return {};
  const size_t begin = m_starts[static_cast<size_t>(number) - 1], end = m_starts[static_cast<size_t>(number)];
  return std::string_view(m_text).substr(begin, end - begin - 1);
}

namespace {

bool StandsInWord(char c) {
  return c == '_' || (c >= '0' && c <= '9') || (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c & 0x80) != 0;
}

size_t IndentOf(std::string_view line) { return std::min(line.find_first_not_of(" \t"), line.size()); }

// The next place of the word, by itself, from `at` on; npos if there is none.
size_t FindWord(std::string_view line, std::string_view word, size_t at) {
  for (; (at = line.find(word, at)) != std::string_view::npos; ++at) {
    const size_t end = at + word.size();
    if ((at == 0 || !StandsInWord(line[at - 1])) && (end == line.size() || !StandsInWord(line[end]))) break;
  }
  return at;
}

}  // namespace

int64_t FollowColumn(std::string_view from, int64_t column, std::string_view to) {
  if (from == to) return column;
  const size_t fromIndent = IndentOf(from), toIndent = IndentOf(to);
  const size_t at = static_cast<size_t>(column) - 1;
  if (at >= fromIndent && from.substr(fromIndent) == to.substr(toIndent)) {
    return static_cast<int64_t>(at - fromIndent + toIndent + 1);
  }
  if (at < from.size() && StandsInWord(from[at])) {
    size_t begin = at, end = at;
    while (begin > 0 && StandsInWord(from[begin - 1])) --begin;
    while (end < from.size() && StandsInWord(from[end])) ++end;
    const std::string_view word = from.substr(begin, end - begin);
    size_t found = FindWord(to, word, 0);
    for (size_t before = FindWord(from, word, 0); before < begin; before = FindWord(from, word, before + 1)) {
      const size_t next = found == std::string_view::npos ? found : FindWord(to, word, found + 1);
      if (next == std::string_view::npos) break;
      found = next;
    }
    if (found != std::string_view::npos) return static_cast<int64_t>(found + (at - begin) + 1);
  }
  return static_cast<int64_t>(toIndent + 1);
}

// --- Files

const TextLines& FollowedFiles::LinesOf(const std::string& path) {
  std::unique_ptr<TextLines>& lines = m_texts[path];
  if (!lines) lines = std::make_unique<TextLines>(path);
  return *lines;
}

// Null where the project lacks the configuration of the run.
FollowedFiles::ReadProject* FollowedFiles::ProjectOf(Project& project) {
  const auto [entry, isNew] = m_projects.try_emplace(&project);
  ConfigSettings& settings = *project.settings;
  ProjectConfig* const config = isNew ? project.FindConfig(settings.config, settings.platform) : nullptr;
  if (config) {
    project.CollectFiles();
    entry->second = std::make_unique<ReadProject>(settings, project, *config);
    const std::string dependencyFile = DependencyFilePath(project, *config);
    LoadDependencyFile(entry->second->files, dependencyFile);
    if (settings.fingerprints) entry->second->prints.emplace(entry->second->files, dependencyFile);
  }
  return entry->second.get();
}

std::unique_ptr<FollowedFiles::Followed> FollowedFiles::Make(const std::string& path) {
  ProjectFile* const file = m_workspace.FindFile(path);
  if (!file || !IsTranslated(*file->project) || !IsTranslated(*file)) return nullptr;
  ReadProject* const project = ProjectOf(*file->project);
  if (!project) return nullptr;
  ScannedFile& scanned = project->files.GetScannedFile(*file);
  auto followed = std::make_unique<Followed>();
  followed->scanned = &scanned;
  followed->generatedPath = project->files.paths.Translated(*file);
  // Asked ahead of the translation, which learns of other imports than those that the text was made with.
  const ProjectPrints* const prints = project->prints ? &*project->prints : nullptr;
  followed->isStale = !project->files.dependencyFileLoaded || MustTranslate(project->files, scanned, prints);
  try {
    followed->map = MapOf(*project, scanned, LinesOf(followed->generatedPath).Text());
  } catch (const FaultyFileException&) {
    return nullptr;  // it has been told
  } catch (const IException& exception) {
    project->files.settings.Tell(ErrorOf(exception));
    return nullptr;
  }
  return followed;
}

PositionMap FollowedFiles::MapOf(ReadProject& project, ScannedFile& file, std::string_view generated) {
  if (!IsTranslatedKind(file.file.kind)) return PositionMap::OfCopy(file.SourcePath());
  const auto kept = PositionMap::Load(project.files.paths.Translated(file.file), generated);
  if (kept) return *kept;
  BringUpToDate(file);
  const std::string& text = project.files.OutputOf(file).Text();
  PositionMap map = PositionMap::OfTranslation(file, text);
  return text == generated ? map : map.RealignedTo(generated, text, file.frame.dialect);
}

FollowedFiles::Followed* FollowedFiles::Find(const std::string& file) {
  const auto [entry, isNew] = m_files.try_emplace(file);
  if (isNew) entry->second = Make(file);
  return entry->second.get();
}

bool FollowedFiles::Back(const std::string& file, int64_t line, int64_t column, FollowedPlace& place) {
  const Followed* const followed = Find(file);
  if (!followed) return false;
  const TextLines& generated = LinesOf(followed->generatedPath);
  if (line < 1 || line > generated.Count()) return false;
  const SourceLineView source = followed->map.Find(line);
  place.path = source.path;
  place.line = std::max<int64_t>(source.line, 1);
  place.isStale = followed->isStale;
  place.column = column == 0 ? 0 : FollowColumn(generated.Line(line), column, LinesOf(place.path).Line(place.line));
  return true;
}

void FollowedFiles::Index(Followed& followed) {
  followed.isIndexed = true;
  const std::string own = followed.scanned->SourcePath();
  const TextLines& generated = LinesOf(followed.generatedPath);
  for (int64_t line = 1; line <= generated.Count(); ++line) {
    if (followed.scanned->HasLineDirectives() && generated.Line(line).starts_with("#line ")) continue;
    const SourceLineView source = followed.map.Find(line);
    if (source.line != 0 && source.path == own) followed.firstGenerated.emplace(source.line, line);
  }
}

bool FollowedFiles::Forth(const std::string& file, int64_t line, int64_t column, FollowedPlace& place) {
  Followed* const followed = Find(file);
  if (!followed) return false;
  const TextLines& source = LinesOf(followed->scanned->SourcePath());
  if (line < 1 || line > source.Count()) return false;
  if (!followed->isIndexed) Index(*followed);
  auto found = followed->firstGenerated.upper_bound(line);
  if (found == followed->firstGenerated.begin()) return false;
  --found;
  place = {followed->generatedPath, found->second, 0, followed->isStale};
  if (column != 0) {
    const std::string_view to = LinesOf(place.path).Line(place.line);
    place.column = FollowColumn(found->first == line ? source.Line(line) : std::string_view(), column, to);
  }
  return true;
}

}  // namespace qrex
