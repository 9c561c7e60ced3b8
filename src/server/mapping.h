// Places in generated texts, as clangd tells them, and places in sources, as the editor does: each way, of whole
// answers.
#pragma once

#include <map>
#include <optional>
#include <string>

#include "server/source_world.h"
#include "server/text_index.h"

namespace qrex::server {

class Mapping {
 public:
  explicit Mapping(SourceWorld& world) : m_world(world) {}
  Columns columns = Columns::Utf16;                         // of the editor
  std::map<const ProjectFile*, std::string> openAddresses;  // as the editor writes them

  // A place of the editor in a file, as clangd counts. Nothing: it has none in the generated text.
  std::optional<Position> ToGenerated(ProjectFile& file, Position position);
  struct SourceRange {
    size_t begin = 0, end = 0;  // in the source
    bool isExact = false;       // all of it was copied
  };
  SourceRange ToSource(ProjectFile& file, const Json& range);
  Json RangeOf(ProjectFile& file, const SourceRange& range);
  // The file whose generated text, or source, is at the address; or null.
  ProjectFile* FileAt(const std::string& uri) const;
  std::string SourceUri(const ProjectFile& file) const;

  // Answers in which places of the file, or of addresses in them, become those of sources. Edits that would change
  // generated text fail: false, and nothing is to be done.
  Json Locations(const Json& answer);
  Json WithRanges(ProjectFile& file, const Json& answer);  // `range` and the like, in whatever depth, are of this file
  bool Edits(const Json& answer, Json& mapped);
  std::optional<Json> Edit(ProjectFile& file, const Json& edit);

 private:
  Json Location(const Json& location);
  SourceWorld& m_world;
};

}  // namespace qrex::server
