#include "server/quick_fixes.h"

#include <algorithm>
#include <optional>
#include <vector>

#include "questions/declarations.h"
#include "server/each_token.h"
#include "server/own_language.h"
#include "text/files.h"
#include "text/paths.h"
#include "text/spelling.h"
#include "translator/types/type_code.h"

namespace qrex::server {

namespace {

constexpr size_t kMostImports = 10;  // that are offered for one name
constexpr std::string_view kRuntimeHeader = "Vesk/vxObject/IObject.h";

// What stands in the message between two texts; empty where they do not.
std::string_view Between(std::string_view message, std::string_view ahead, std::string_view behind) {
  const size_t at = message.find(ahead);
  if (at == std::string_view::npos) return {};
  const size_t begin = at + ahead.size(), end = message.find(behind, begin);
  return end == std::string_view::npos ? std::string_view() : message.substr(begin, end - begin);
}

// The name that a message of ours, or of clangd, does not know.
std::string UnknownName(std::string_view message) {
  if (const size_t at = message.find("Unrecognised identifier : "); at != std::string_view::npos) {
    const WordPlace word = WordAt(message, message.find(':', at) + 2);
    return std::string(message.substr(word.begin, word.end - word.begin));
  }
  for (const std::string_view words : {"nknown type name '", "se of undeclared identifier '", "o type named '",
                                       "o member named '", "o template named '"}) {
    if (const std::string_view name = Between(message, words, "'"); !name.empty()) return std::string(name);
  }
  return {};
}

// With what follows it as a name within it.
std::string WithNamesBehind(std::string name, std::string_view text, size_t at) {
  if (text.substr(std::min(at, text.size()), name.size()) != name) return name;
  size_t end = at + name.size();
  while (text.substr(end, 2) == "::") {
    const WordPlace word = WordAt(text, end + 2);
    if (word.begin != end + 2 || word.end == word.begin) break;
    name += text.substr(end, word.end - end);
    end = word.end;
  }
  return name;
}

bool HasWord(std::string_view text, std::string_view word) {
  for (size_t at = text.find(word); at != std::string_view::npos; at = text.find(word, at + 1)) {
    const size_t end = at + word.size();
    if ((at == 0 || !IsWordByte(text[at - 1])) && (end == text.size() || !IsWordByte(text[end]))) return true;
  }
  return false;
}

std::string UriOf(const std::string& path) {
  std::string full;
  FullPathOf(path, full);
  return UriOfPath(CollapseDots(full));
}

std::vector<std::string> FoldersBelow(std::string_view path, std::string_view root) {
  std::vector<std::string> folders;
  std::string_view rest = path.substr(root.size() + 1);
  for (size_t slash; (slash = rest.find('/')) != std::string_view::npos; rest.remove_prefix(slash + 1))
    folders.emplace_back(rest.substr(0, slash));
  return folders;
}

size_t BehindLine(std::string_view text, size_t at) {
  const size_t end = text.find('\n', at);
  return end == std::string_view::npos ? text.size() : end + 1;
}

// Behind the imports at the head of a source.
size_t ImportPlace(std::string_view text) {
  size_t place = 0;
  int depth = 0;
  ForEachToken(text, [&](int32_t kind, size_t begin, size_t end) {
    if (kind == kOpenBrace) ++depth;
    if (kind == kCloseBrace) --depth;
    const std::string_view rest = text.substr(begin);
    const bool isImport = rest.starts_with("@import") || rest.starts_with("#include");
    if (!isImport || depth > 0) return end;
    place = BehindLine(text, begin);
    return place;
  });
  return place;
}

// --- Places in the text of a project, where words can be written. npos: there is none.

struct Token {
  int32_t kind;
  std::string_view text;
  size_t end;
};

std::vector<Token> TokensOf(std::string_view text) {
  std::vector<Token> tokens;
  ForEachToken(text, [&](int32_t kind, size_t begin, size_t end) {
    tokens.push_back({kind, text.substr(begin, end - begin), end});
    return end;
  });
  return tokens;
}

size_t SubprojectsPlace(std::string_view text) {
  const std::vector<Token> tokens = TokensOf(text);
  for (size_t i = 1; i < tokens.size(); ++i) {
    if (tokens[i].kind == kOpenBrace && tokens[i - 1].text == "subproj") return tokens[i].end;
  }
  return std::string_view::npos;
}

size_t StatementPlace(std::string_view text) {
  const size_t at = text.find("$ROOT_TO_PROJDIR");
  return at == std::string_view::npos ? 0 : BehindLine(text, at);
}

// In the braces of a folder of files, or of as much of its way as is there: `folders` keeps those that are to be
// written.
size_t ListingPlace(std::string_view text, std::vector<std::string>& folders) {
  const std::vector<Token> tokens = TokensOf(text);
  const auto opens = [&](size_t i) { return i < tokens.size() && tokens[i].kind == kOpenBrace; };
  const auto isFolder = [&](size_t i) { return i < tokens.size() && tokens[i].text.starts_with('"') && opens(i + 1); };
  size_t at = 0;
  while (at < tokens.size() && !(opens(at) && isFolder(at + 1))) ++at;
  if (at == tokens.size()) return std::string_view::npos;
  size_t place = tokens[at].end;
  int depth = 0;
  for (size_t i = at + 1; i < tokens.size() && depth >= 0 && !folders.empty(); ++i) {
    if (depth == 0 && isFolder(i) && tokens[i].text == '"' + folders.front() + '"') {
      folders.erase(folders.begin());
      place = tokens[++i].end;
    } else if (opens(i)) {
      ++depth;
    } else if (tokens[i].kind == kCloseBrace) {
      --depth;
    }
  }
  return place;
}

}  // namespace

struct QuickFixes::Asked {
  const std::string& uri;
  const TextIndex& text;
  ProjectFile* const file;
  const Json& diagnostic;
  const std::string message;
};

Json QuickFixes::Of(const std::string& uri, const TextIndex& text, ProjectFile* file, const Json& diagnostics) {
  m_actions = Json::array();
  for (const Json& diagnostic : diagnostics) {
    const Asked asked{uri, text, file, diagnostic, TextAt(diagnostic, "message")};
    if (TextAt(diagnostic, "source") == "qrex") {
      AddMeantWord(asked);
      AddProjectLines(asked);
      AddListing(asked);
      AddImportForInclude(asked);
    }
    AddImports(asked);
  }
  return std::move(m_actions);
}

void QuickFixes::Add(const Asked& asked, const std::string& title, const std::string& uri, const Json& edit) {
  Json action = {{"title", title},
                 {"kind", "quickfix"},
                 {"diagnostics", {asked.diagnostic}},
                 {"edit", {{"changes", {{uri, {edit}}}}}}};
  if (std::find(m_actions.begin(), m_actions.end(), action) == m_actions.end()) m_actions.push_back(std::move(action));
}

// The words that could stand there and are almost the one that does.
void QuickFixes::AddMeantWord(const Asked& asked) {
  const std::string& text = asked.text.Text();
  const size_t begin = asked.text.OffsetOf(PositionFrom(At(asked.diagnostic, "range/start")), m_mapping.columns);
  const WordPlace place = WordAt(text, begin);
  const std::string word = text.substr(place.begin, place.end - place.begin);
  constexpr size_t kShortest = 3;  // of less, much is almost the same
  if (word.size() < kShortest || asked.message.find(word) == std::string::npos) return;
  for (const std::string& other : KnownWords(asked)) {
    if (other == word || !IsAlmost(word, other)) continue;
    Add(asked, "write " + other, asked.uri,
        {{"range", RangeJson(asked.text, place.begin, place.end, m_mapping.columns)}, {"newText", other}});
  }
}

std::set<std::string> QuickFixes::KnownWords(const Asked& asked) {
  std::set<std::string> words;
  const auto addLabels = [&](const Json& items) {
    for (const Json& item : items) words.insert(TextAt(item, "label"));
  };
  if (!asked.file) {
    addLabels(CompletionInProject(PathOfUri(asked.uri), "", 0));
    return words;
  }
  for (const std::string_view ahead : {"@", "$", "<<"}) addLabels(CompletionInSource(ahead, ahead.size()));
  for (int op = kOpVoid; op <= kOpString16; ++op) words.emplace(BuiltInTypeName(static_cast<TypeOp>(op)));
  std::vector<ProjectFile*> seen = m_world.ImportsOf(*asked.file);
  seen.push_back(asked.file);
  for (ProjectFile* file : seen) {
    const ScannedFile* const scanned = m_world.ScannedOf(*file);
    if (!scanned || scanned->state != TranslationState::Done) continue;
    for (const Declared& declared : DeclarationsOf(*scanned)) words.insert(declared.element->name);
  }
  return words;
}

// --- Imports

void QuickFixes::AddImports(const Asked& asked) {
  if (!asked.file) return;
  if (asked.message.find("@import of IObject.h required") != std::string::npos)
    return AddImport(asked, std::string(kRuntimeHeader));
  std::string name = UnknownName(asked.message);
  if (name.empty()) return;
  const Position begin = PositionFrom(At(asked.diagnostic, "range/start"));
  name = WithNamesBehind(std::move(name), asked.text.Text(), asked.text.OffsetOf(begin, m_mapping.columns));
  std::vector<ProjectFile*> seen = m_world.ImportsOf(*asked.file);
  seen.push_back(asked.file);
  size_t count = 0;
  for (const auto& project : m_world.Loaded().projects) {
    if (!project->usesQrex) continue;
    project->CollectFiles();
    for (ProjectFile* header : project->files) {
      const bool isCandidate = header->kind == FileKind::H && std::find(seen.begin(), seen.end(), header) == seen.end();
      if (!isCandidate || !Declares(*header, name)) continue;
      const bool isBeside = FolderOf(header->path) == FolderOf(asked.file->path);
      AddImport(asked, isBeside ? std::string(FileNameOf(header->path)) : header->path);
      if (++count == kMostImports) return;
    }
  }
}

// `name` may be within others. Few headers have its last word at all: the others are not translated.
bool QuickFixes::Declares(ProjectFile& header, const std::string& name) {
  const size_t last = name.rfind(':') + 1;  // 0 where there is none
  std::string text;
  if (!m_texts.Read(text, SourceWorld::SourcePathOf(header), SourceTexts::Form::File)) return false;
  if (!HasWord(text, std::string_view(name).substr(last))) return false;
  const ScannedFile* const scanned = m_world.ScannedOf(header);
  if (!scanned || scanned->state != TranslationState::Done) return false;
  const std::vector<Declared> declared = DeclarationsOf(*scanned);
  return std::any_of(declared.begin(), declared.end(), [&](const Declared& one) {
    const std::string& qualified = one.element->GetQualifiedName();
    return qualified == name || qualified.ends_with("::" + name);
  });
}

void QuickFixes::AddImport(const Asked& asked, const std::string& path) {
  const std::string line = "@import \"" + path + "\"";
  const size_t place = ImportPlace(asked.text.Text());
  const bool isAtEnd = place > 0 && asked.text.Text()[place - 1] != '\n';
  Add(asked, "add " + line, asked.uri,
      {{"range", RangeJson(asked.text, place, place, m_mapping.columns)},
       {"newText", isAtEnd ? "\n" + line : line + "\n"}});
}

void QuickFixes::AddImportForInclude(const Asked& asked) {
  if (asked.message.find("#include should be replaced by @import") == std::string::npos) return;
  const std::string& text = asked.text.Text();
  const size_t at = asked.text.OffsetOf(PositionFrom(At(asked.diagnostic, "range/start")), m_mapping.columns);
  const size_t begin = text.rfind("#include", at);
  if (begin == std::string::npos || BehindLine(text, begin) < at) return;
  constexpr size_t kLength = std::string_view("#include").size();
  Add(asked, "write @import", asked.uri,
      {{"range", RangeJson(asked.text, begin, begin + kLength, m_mapping.columns)}, {"newText", "@import"}});
}

// --- Lines of projects

void QuickFixes::EditProject(const Asked& asked, const std::string& path, const std::string& words,
                             size_t (*place)(std::string_view)) {
  std::string text;
  if (!m_texts.Read(text, path, SourceTexts::Form::File)) return;
  const TextIndex index(text);
  const size_t at = place(index.Text());
  if (at == std::string_view::npos) return;
  Add(asked, "write " + words + " in " + path, UriOf(path),
      {{"range", RangeJson(index, at, at, m_mapping.columns)},
       {"newText", place == StatementPlace ? words + "\n" : " " + words}});
}

// Of a hint that says which project lacks what.
void QuickFixes::AddProjectLines(const Asked& asked) {
  const std::string qrex(Between(asked.message, "write qrex in ", ", or"));
  if (!qrex.empty()) EditProject(asked, qrex, "qrex", StatementPlace);
  const std::string used(Between(asked.message, "write \"", "\" in subproj { } of "));
  const std::string user(Between(asked.message, "in subproj { } of ", ", and it is built first"));
  if (used.empty() || user.empty()) return;
  std::string text;
  m_texts.Read(text, user, SourceTexts::Form::File);
  const bool hasList = SubprojectsPlace(text) != std::string_view::npos;
  const std::string word = '"' + used + '"';
  EditProject(asked, user, hasList ? word : "subproj { " + word + " }", hasList ? SubprojectsPlace : StatementPlace);
}

// A file that is there, but that no project lists.
void QuickFixes::AddListing(const Asked& asked) {
  std::string rest(Between(asked.message + "\n", "no project lists ", "\n"));
  while (!rest.empty() && m_world.IsLoaded()) {
    const size_t end = std::min(rest.find(" or "), rest.size());
    const std::string path = rest.substr(0, end);
    rest.erase(0, std::min(end + std::string_view(" or ").size(), rest.size()));
    for (const auto& project : m_world.Loaded().projects) {
      if (!path.starts_with(project->rootToProjDir + "/") || !FileExists(PathJoin(project->rootDir, path))) continue;
      std::vector<std::string> folders = FoldersBelow(path, project->rootToProjDir);
      std::string words = '"' + std::string(FileNameOf(path)) + '"';
      std::string text;
      if (!m_texts.Read(text, project->filePath, SourceTexts::Form::File)) continue;
      const TextIndex index(text);
      const size_t at = ListingPlace(index.Text(), folders);
      if (at == std::string_view::npos) continue;
      for (auto folder = folders.rbegin(); folder != folders.rend(); ++folder)
        words = '"' + *folder + "\" { " + words + " }";
      Add(asked, "list " + path + " in " + project->filePath, UriOf(project->filePath),
          {{"range", RangeJson(index, at, at, m_mapping.columns)}, {"newText", " " + words}});
    }
  }
}

}  // namespace qrex::server
