// A workspace as the server sees it: loaded once, its files translated in memory from the texts of the editor or the
// disk. The process stays in the folder of the configuration, where a run would be. The tree and the outputs of builds
// are left alone.
#pragma once

#include <map>
#include <memory>
#include <set>
#include <string>
#include <unordered_map>
#include <vector>

#include "builder/keeping_files.h"
#include "server/character_map.h"
#include "server/text_index.h"
#include "text/source_texts.h"
#include "workspace/workspace.h"

namespace qrex::server {

// What is known of a file that was translated, or is copied.
struct Translated {
  TextIndex source, generated;  // the generated text is the last one that could be made
  TextIndex madeFrom;           // of which source: another one while there are errors
  CharacterMap map;             // of these two
  bool isFaulty = false;
  bool IsUnknown() const { return isFaulty && madeFrom.Text().empty(); }  // it never could be made
};

class SourceWorld : private MessageConsumer {
 public:
  // Texts in memory are laid over those of the disk by their paths as the tool has them. `mirror`: the folder in which
  // clangd finds generated texts, under the paths that a build gives them.
  SourceWorld(OverlaidTexts& texts, std::string mirror) : m_texts(texts), m_mirror(std::move(mirror)) {}
  ~SourceWorld() override;

  // Loads the configuration, whose path has a folder that the process has gone to, with further lines of settings.
  // False: what it says is among the messages.
  bool Load(const std::string& configuration, const std::vector<std::string>& lines, const std::string& program);
  bool IsLoaded() const { return m_workspace != nullptr; }
  const ConfigSettings& Settings() const { return *m_settings; }
  Workspace& Loaded() { return *m_workspace; }

  ProjectFile* FindFile(const std::string& path) const;       // by the absolute path of the source; or null
  ProjectFile* FindGenerated(const std::string& path) const;  // by that of its translation
  static std::string SourcePathOf(const ProjectFile& file);   // as messages name it
  static std::string SourceFullPathOf(const ProjectFile& file);
  std::string GeneratedPathOf(const ProjectFile& file) const;  // in the mirror; of what is not translated, its source

  // Takes back what the file has declared, and all that imports it: they are translated anew when they are asked for.
  void Changed(ProjectFile& file);
  const Translated& TranslationOf(ProjectFile& file);
  void Mirror(ProjectFile& file);  // writes the generated text there, if it differs
  // The same of a file that nobody looks at: nothing of it is kept beyond its project, nothing told.
  void MirrorApart(ProjectFile& file);
  void EndMirroring() { m_apart.reset(); }
  ScannedFile* ScannedOf(ProjectFile& file);  // in its own project, translated if that is possible; or null
  std::vector<ProjectFile*> ImportsOf(ProjectFile& file);  // of all it sees, as far as is known

  // By path, as messages name files. Those without a place are under "".
  const std::vector<Message>& MessagesOf(const std::string& path) const;
  std::set<std::string> TakeTouched();  // paths whose messages have changed since it was asked last

 private:
  void Take(const Message& message) override;
  SourcePlace PlaceOfImport(ProjectFile& file, const std::string& text);
  KeepingFiles* FilesOf(Project& project);
  void Translate(ProjectFile& file, Translated& translated);
  void ForgetMessages(const std::string& path);
  void TakeBack(KeepingFiles& files, const ProjectFile& changed);
  void WriteMirrored(const ProjectFile& file, const std::string& text) const;

  OverlaidTexts& m_texts;
  const std::string m_mirror;
  std::unique_ptr<ConfigSettings> m_settings;
  std::shared_ptr<Workspace> m_workspace;
  std::unordered_map<const Project*, std::unique_ptr<KeepingFiles>> m_projects;  // null: lacks the configuration
  std::unordered_map<const ProjectFile*, std::unique_ptr<Translated>> m_translated;
  std::unique_ptr<KeepingFiles> m_apart;  // of the project that is mirrored
  bool m_isApart = false;
  ProjectFile* m_underway = nullptr;       // which is translated, and told of
  std::set<const ProjectFile*> m_current;  // of these, what is still so
  std::map<std::string, std::vector<Message>> m_messages;
  std::set<std::string> m_touched;
  std::unordered_map<std::string, ProjectFile*> m_bySource, m_byGenerated;
};

}  // namespace qrex::server
