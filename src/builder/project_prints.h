// The fingerprints of a project in a configuration: of its translated files, objects and target.
#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <string_view>
#include <vector>

#include "builder/build_files.h"
#include "builder/fingerprints.h"

namespace qrex {

class ProjectPrints {
 public:
  ProjectPrints(BuildFiles& builder, const std::string& dependencyFile);

  // Whether an output is not what was noted, or was made from something else than what there is now.
  bool DiffersTranslated(ScannedFile& file) const;
  bool DiffersObject(ScannedFile& file, const FileStamp& stamp) const;
  bool Differs(const std::string& output, uint64_t print, const FileStamp& stamp) const;

  // What it is of these two, as far as is known: a file among those that it is made from, by the path of its source,
  // or else a text.
  struct Difference {
    std::string source, text;
  };
  Difference OfTranslation(ScannedFile& file) const;
  Difference OfObject(ScannedFile& file, const FileStamp& stamp) const;

  uint64_t ObjectPrint(ScannedFile& file) const;
  uint64_t ResourcePrint(const FileStamp& source) const;
  // Of a link: what its command has beside the inputs, and those.
  uint64_t TargetPrint(std::string_view command, const std::vector<std::string>& inputs,
                       const std::function<FileStamp(const std::string&)>& stampOf) const;

  // Print 0: it could not be made.
  void Made(const ScannedFile& file, const OutputPrint& object) { m_known.NoteObject(file, object); }
  void Made(const std::string& output, const OutputPrint& made) { m_known.Note(output, made); }
  void Save();  // with what has been translated

 private:
  uint64_t TranslationPrint(ScannedFile& file) const;
  uint64_t CommandPrint(const ProjectFile& file) const;
  std::string OtherInput(ScannedFile& file, bool (ProjectPrints::*isOther)(ScannedFile&) const) const;
  bool IsOtherSource(ScannedFile& file) const;
  bool IsOtherTranslation(ScannedFile& file) const;

  BuildFiles& m_builder;
  const std::string m_path;
  Fingerprints m_known;
  std::string m_keysBefore, m_commandBefore;  // as they were noted last
  uint64_t m_keys = 0, m_command = 0;
};

}  // namespace qrex
