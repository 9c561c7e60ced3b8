#include "server/own_language.h"

#include <algorithm>
#include <cctype>

#include "questions/declarations.h"
#include "text/files.h"
#include "text/paths.h"
#include "text/text_writer.h"

namespace qrex::server {

namespace {

constexpr size_t kMostSymbols = 2000;
constexpr size_t kMostShown = 4000;  // bytes of an expansion

// Of the symbol kinds of the protocol.
int SymbolKindOf(const NameSpaceElement& element) {
  switch (element.category) {
    case Category::NameSpace:
      return 3;
    case Category::Interface:
      return 11;
    case Category::Enum:
      return 10;
    case Category::GlobalFunction:
      return 12;
    case Category::GlobalVar:
      return 13;
    case Category::Functor:
      return 12;
    case Category::Variant:
      return 23;
    case Category::Typedef:
      return 26;
    case Category::Class:
      break;
  }
  return element.GetKeyword() == "struct" ? 23 : 5;
}

std::string_view LineAt(std::string_view text, size_t offset, size_t& begin) {
  begin = offset == 0 ? 0 : text.rfind('\n', offset - 1) + 1;
  return text.substr(begin, text.find('\n', begin) - begin);
}

std::string Fenced(std::string_view code) { return "```cpp\n" + std::string(code) + "\n```"; }

bool ContainsLetters(std::string_view name, std::string_view query) {  // in their order, whatever their case
  const auto lower = [](char c) { return std::tolower(static_cast<unsigned char>(c)); };
  auto at = query.begin();
  for (const char c : name) {
    if (at != query.end() && lower(*at) == lower(c)) ++at;
  }
  return at == query.end();
}

}  // namespace

// --- What stands at a place

std::optional<std::string> OwnLanguage::ImportAt(ProjectFile& file, size_t offset) const {
  size_t begin = 0;
  const std::string_view line = LineAt(m_world.TranslationOf(file).source.Text(), offset, begin);
  const size_t word = line.find_first_not_of(" \t");
  if (word == std::string_view::npos) return std::nullopt;
  const std::string_view rest = line.substr(word);
  if (!rest.starts_with("@import") && !rest.starts_with("#include")) return std::nullopt;
  const size_t open = line.find('"'), close = open == std::string_view::npos ? open : line.find('"', open + 1);
  if (close == std::string_view::npos || offset - begin > close) return std::nullopt;
  return std::string(line.substr(open + 1, close - open - 1));
}

std::optional<Json> OwnLanguage::LocationOf(ScannedFile& file, const char* position, size_t length) {
  SourcePlace place;
  if (!position || !file.host.FindSourcePlace(position, place)) return std::nullopt;
  std::string full;
  FullPathOf(place.file, full);
  ProjectFile* const owner = m_world.FindFile(CollapseDots(full));
  if (!owner) return std::nullopt;
  const auto begin = static_cast<size_t>(place.begin);
  const TextIndex& text = m_world.TranslationOf(*owner).source;
  return Json{{"uri", m_mapping.SourceUri(*owner)},
              {"range", RangeJson(text, begin, begin + length, m_mapping.columns)}};
}

LSVariable* OwnLanguage::FindMacro(ProjectFile& file, size_t offset) {
  ScannedFile* const scanned = m_world.ScannedOf(file);
  if (!scanned) return nullptr;
  const std::string& text = m_world.TranslationOf(file).source.Text();
  const WordPlace word = WordAt(text, offset);
  if (word.begin == word.end) return nullptr;
  return scanned->frame.Find(std::string_view(text).substr(word.begin, word.end - word.begin), nullptr);
}

// By the last words of the name as it stands there, among what the file sees; one that it is within is preferred.
const NameSpaceElement* OwnLanguage::FindDeclared(ProjectFile& file, size_t offset) {
  ScannedFile* const scanned = m_world.ScannedOf(file);
  if (!scanned) return nullptr;
  const std::string& text = m_world.TranslationOf(file).source.Text();
  const WordPlace word = WordAt(text, offset);
  if (word.begin == word.end) return nullptr;
  size_t begin = word.begin;
  while (begin > 2 && text.compare(begin - 2, 2, "::") == 0 && IsWordByte(text[begin - 3]))
    begin = WordAt(text, begin - 2).begin;
  const std::string asked = text.substr(begin, word.end - begin);
  const NameSpaceElement* found = nullptr;
  std::vector<ProjectFile*> files = m_world.ImportsOf(file);
  files.push_back(&file);
  for (ProjectFile* seen : files) {
    const ScannedFile& its = static_cast<BuildFiles&>(scanned->host).GetScannedFile(*seen);
    if (its.state != TranslationState::Done) continue;
    for (const Declared& declared : DeclarationsOf(its)) {
      const std::string& name = declared.element->GetQualifiedName();
      const bool fits = name == asked || name.ends_with("::" + asked);
      if (fits && (!found || declared.element->owner.file.path == file.path)) found = declared.element;
    }
  }
  return found;
}

Json OwnLanguage::Definition(ProjectFile& file, size_t offset) {
  Json locations = Json::array();
  ScannedFile* const scanned = m_world.ScannedOf(file);
  if (!scanned) return locations;
  if (const auto import = ImportAt(file, offset)) {
    const ProjectFile* const imported = scanned->ResolveImport(*import);
    const Json top = {{"line", 0}, {"character", 0}};
    if (imported)
      locations.push_back({{"uri", m_mapping.SourceUri(*imported)}, {"range", {{"start", top}, {"end", top}}}});
    return locations;
  }
  if (const LSVariable* macro = FindMacro(file, offset)) {
    if (auto location = LocationOf(*scanned, macro->name.begin, macro->name.Size()))
      locations.push_back(std::move(*location));
  } else if (const NameSpaceElement* element = FindDeclared(file, offset)) {
    auto location = LocationOf(*scanned, element->position, 0);
    if (location) locations.push_back(std::move(*location));
  }
  return locations;
}

// Of the outermost call that stands there.
std::string OwnLanguage::ExpansionAt(const ScannedFile& file, const char* position) const {
  if (!file.text.map.calls) return {};
  for (const SourceMap::Call& call : *file.text.map.calls) {
    if (call.source != position) continue;
    const std::string_view expanded = file.text.expanded;
    const auto begin = static_cast<size_t>(call.begin);
    return std::string(expanded.substr(begin, std::min(static_cast<size_t>(call.end) - begin, kMostShown)));
  }
  return {};
}

std::string OwnLanguage::Hover(ProjectFile& file, size_t offset) {
  ScannedFile* const scanned = m_world.ScannedOf(file);
  if (!scanned) return {};
  const std::string& text = m_world.TranslationOf(file).source.Text();
  if (const auto import = ImportAt(file, offset)) {
    const ProjectFile* const imported = scanned->ResolveImport(*import);
    return imported ? SourceWorld::SourcePathOf(*imported) + ", project " + imported->project->name : std::string();
  }
  if (const LSVariable* macro = FindMacro(file, offset)) {
    MemoryTextWriter definition;
    macro->WriteDefinition(definition);
    std::string shown = Fenced(definition.TakeText().substr(0, kMostShown));
    const std::string expansion = ExpansionAt(*scanned, scanned->text.source.data() + WordAt(text, offset).begin);
    if (!expansion.empty()) shown += "\n\nhere it gives\n\n" + Fenced(expansion);
    return shown;
  }
  const NameSpaceElement* const element = FindDeclared(file, offset);
  if (!element) return {};
  SourcePlace place;
  element->owner.host.FindSourcePlace(element->position, place);
  return Fenced(PrintedElement(*element)) + "\n\n" + place.file + ", line " + std::to_string(place.line);
}

// --- Symbols

void OwnLanguage::AddSymbols(ScannedFile& file, const std::string& query, Json& out) {
  const auto add = [&](const Declared& declared, const std::string& container) {
    const std::string& name = declared.element->name;
    if (out.size() >= kMostSymbols || name.empty() || !ContainsLetters(name, query)) return;
    auto location = LocationOf(file, declared.element->position, 0);
    if (!location) return;
    out.push_back({{"name", name},
                   {"kind", SymbolKindOf(*declared.element)},
                   {"location", std::move(*location)},
                   {"containerName", container}});
  };
  for (const Declared& declared : DeclarationsOf(file)) {
    const NameSpace* const parent = declared.element->parent;
    add(declared, parent ? parent->GetQualifiedName() : std::string());
    if (declared.element->category != Category::Class) continue;
    for (const Declared& nested : NestedDeclarationsOf(static_cast<const ClassDef&>(*declared.element))) {
      add(nested, declared.element->GetQualifiedName());
    }
  }
}

Json OwnLanguage::DocumentSymbols(ProjectFile& file) {
  Json symbols = Json::array(), own = Json::array();
  ScannedFile* const scanned = m_world.ScannedOf(file);
  if (!scanned || scanned->state != TranslationState::Done) return own;
  AddSymbols(*scanned, "", symbols);
  for (Json& symbol : symbols) {
    if (TextAt(symbol, "location/uri") == m_mapping.SourceUri(file)) own.push_back(std::move(symbol));
  }
  return own;
}

Json OwnLanguage::WorkspaceSymbols(const std::string& query) {
  Json symbols = Json::array();
  for (const auto& project : m_world.Loaded().projects) {
    project->CollectFiles();
    for (ProjectFile* file : project->files) {
      ScannedFile* const scanned = m_world.ScannedOf(*file);
      if (scanned && scanned->state == TranslationState::Done) AddSymbols(*scanned, query, symbols);
    }
  }
  return symbols;
}

}  // namespace qrex::server
