// The files of a workspace with the way between their sources and their generated text, as far as they are asked for:
// as it was kept beside the text, or else each is translated in memory, with what it imports. Nothing is written.
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>

#include "builder/keeping_files.h"
#include "builder/project_prints.h"
#include "translator/file/position_map.h"
#include "workspace/workspace.h"

namespace qrex {

// A text by its lines, which count from 1.
class TextLines {
 public:
  explicit TextLines(const std::string& path);  // empty if it cannot be read
  int64_t Count() const { return static_cast<int64_t>(m_starts.size()) - 1; }
  const std::string& Text() const { return m_text; }
  std::string_view Line(int64_t number) const;  // without its end; empty if there is none

 private:
  std::string m_text;
  std::vector<size_t> m_starts;
};

// Where the character at a column of a line stands in the line that it came from or went to: columns count bytes from
// 1. Of lines with the same text it is the same one, else that of the same word, else that where the line begins.
int64_t FollowColumn(std::string_view from, int64_t column, std::string_view to);

struct FollowedPlace {
  std::string path;
  int64_t line = 0, column = 0;
  bool isStale = false;  // the generated text is older than what it was made of
};

class FollowedFiles {
 public:
  explicit FollowedFiles(Workspace& workspace) : m_workspace(workspace) {}
  // Of a file by its path in the tree. False: it has no such line, or is none that a build translates. A column of 0 is
  // none. Forth leads to the first generated line that came of this one, or of the last before it that has any.
  bool Back(const std::string& file, int64_t line, int64_t column, FollowedPlace& place);
  bool Forth(const std::string& file, int64_t line, int64_t column, FollowedPlace& place);

 private:
  struct ReadProject {
    ReadProject(ConfigSettings& settings, Project& project, ProjectConfig& config) : files(settings, project, config) {}
    KeepingFiles files;
    std::optional<ProjectPrints> prints;  // with the key fingerprints
  };
  struct Followed {
    const ScannedFile* scanned = nullptr;
    std::string generatedPath;
    PositionMap map;
    bool isStale = false;
    bool isIndexed = false;
    std::map<int64_t, int64_t> firstGenerated;  // by line of the source
  };
  Followed* Find(const std::string& file);
  std::unique_ptr<Followed> Make(const std::string& file);
  PositionMap MapOf(ReadProject& project, ScannedFile& file, std::string_view generated);
  ReadProject* ProjectOf(Project& project);
  void Index(Followed& followed);
  const TextLines& LinesOf(const std::string& path);

  Workspace& m_workspace;
  std::unordered_map<const Project*, std::unique_ptr<ReadProject>> m_projects;
  std::unordered_map<std::string, std::unique_ptr<Followed>> m_files;
  std::unordered_map<std::string, std::unique_ptr<TextLines>> m_texts;
};

}  // namespace qrex
