// What a message names as its cure, as edits that the editor can make: a word that was meant, a missing `@import`, a
// missing line of a project.
#pragma once

#include <set>
#include <string>
#include <string_view>

#include "server/mapping.h"
#include "server/source_world.h"

namespace qrex::server {

class QuickFixes {
 public:
  // `file`: of the document, or null for one of settings.
  QuickFixes(SourceWorld& world, Mapping& mapping, const SourceTexts& texts)
      : m_world(world), m_mapping(mapping), m_texts(texts) {}
  // Actions of the protocol, each of one of the diagnostics.
  Json Of(const std::string& uri, const TextIndex& text, ProjectFile* file, const Json& diagnostics);

 private:
  struct Asked;
  void Add(const Asked& asked, const std::string& title, const std::string& uri, const Json& edit);
  void AddMeantWord(const Asked& asked);
  std::set<std::string> KnownWords(const Asked& asked);
  void AddImports(const Asked& asked);
  void AddImport(const Asked& asked, const std::string& path);
  void AddImportForInclude(const Asked& asked);
  void AddProjectLines(const Asked& asked);
  void AddListing(const Asked& asked);
  void EditProject(const Asked& asked, const std::string& path, const std::string& words,
                   size_t (*place)(std::string_view));
  bool Declares(ProjectFile& header, const std::string& name);

  SourceWorld& m_world;
  Mapping& m_mapping;
  const SourceTexts& m_texts;
  Json m_actions;
};

}  // namespace qrex::server
