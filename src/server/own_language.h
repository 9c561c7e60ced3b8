// What the editor asks about the languages of this system: `@` directives and macros, `$` declarations, imports.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "server/mapping.h"
#include "server/source_world.h"

namespace qrex::server {

class OwnLanguage {
 public:
  OwnLanguage(SourceWorld& world, Mapping& mapping) : m_world(world), m_mapping(mapping) {}

  // At an offset in the source of the file. Empty: nothing of ours stands there.
  Json Definition(ProjectFile& file, size_t offset);  // an array of locations
  std::string Hover(ProjectFile& file, size_t offset);
  Json DocumentSymbols(ProjectFile& file);
  Json WorkspaceSymbols(const std::string& query);

 private:
  const NameSpaceElement* FindDeclared(ProjectFile& file, size_t offset);
  LSVariable* FindMacro(ProjectFile& file, size_t offset);
  std::optional<std::string> ImportAt(ProjectFile& file, size_t offset) const;
  std::optional<Json> LocationOf(ScannedFile& file, const char* position, size_t length);
  std::string ExpansionAt(const ScannedFile& file, const char* position) const;
  void AddSymbols(ScannedFile& file, const std::string& query, Json& out);

  SourceWorld& m_world;
  Mapping& m_mapping;
};

// --- Of a text alone
Json CompletionInSource(std::string_view text, size_t offset);  // behind `@`, `$` and in `<< >>`; null elsewhere
Json CompletionInProject(const std::string& path, std::string_view text, size_t offset);
std::string HoverInProject(const std::string& path, std::string_view text, size_t offset);  // of a key: what it does
std::vector<std::string> TokenTypes();
Json SemanticTokens(const TextIndex& text, Columns columns);  // `data` of the protocol
Json FoldingRanges(const TextIndex& text);

}  // namespace qrex::server
