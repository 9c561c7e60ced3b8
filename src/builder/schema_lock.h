// The file of the key schemaLock: which releases of models are recorded. A run reads it once, asks it for each model
// that it translates, and adds what is new. Made to be committed and merged: a line each, sorted, for
//
//   PROJECT MODEL RELEASE = -DROPPED +ADDED:TYPE ...
//   PROJECT NAME enum = LABEL:NUMBER ...            what such models hold: an enumeration,
//   PROJECT NAME variant = ITEM:TYPE ...            a variant,
//   PROJECT NAME model = FIELD:TYPE ...             and a model without $schema
//
// A line that begins with # tells nothing. No line is ever taken out: that is left to who knows that the archives are
// gone.
#pragma once

#include <map>
#include <set>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "translator/file/schema_lines.h"
#include "workspace/config_settings.h"

namespace qrex {

class SchemaLock {
 public:
  // Reads the file, if there is one. Raises a LexScannerException at a line that is none, or that contradicts another,
  // a FileException where the file can't be read.
  explicit SchemaLock(ConfigSettings& settings);

  // What in the model goes against the recorded lines; empty: nothing, and what was new of it is recorded.
  std::string Fault(const ClassDef& def);
  // The lines of a project as the run found them, and as they are now.
  std::string FoundLines(const std::string& project) const;
  std::string Lines(const std::string& project) const;
  int64_t LastRelease(const std::string& project) const;  // -1: none
  struct Gone {
    std::string name;
    int64_t line;
  };
  std::vector<Gone> GoneModels(const std::string& project) const;  // of those recorded, that no one has asked for
  const std::string& Path() const { return m_path; }
  // Writes the file if it lacks something; what another run has written meanwhile is kept. Raises as the constructor.
  void Write();

 private:
  struct Recorded {
    std::vector<std::string> words;
    int64_t line = 0;  // in the file; 0: of this run
  };
  using Records = std::map<SchemaKey, Recorded>;

  void Read(Records& records, std::string& text) const;
  std::pair<SchemaKey, Recorded> Parsed(std::string_view text, int64_t line) const;
  [[noreturn]] void Fail(int64_t line, const std::string& why) const;
  std::string LinesOf(const Records& records, const std::string* project) const;
  std::string Place(const Recorded& recorded) const;
  std::string ReleaseFault(const ClassDef& def, const SchemaLine& line, const Recorded* recorded, int64_t next) const;
  std::string HeldFault(const ClassDef& def, const SchemaLine& line, const Recorded& recorded) const;
  std::string MissingFault(const ClassDef& def, const std::vector<SchemaLine>& lines, int64_t next) const;
  std::string ModelFault(const ClassDef& def, const std::vector<SchemaLine>& lines) const;
  int64_t LastRelease(const SchemaKey& ofModel) const;

  ConfigSettings& m_settings;
  const std::string m_path;
  std::string m_text;  // of the file, as it was read last
  Records m_found, m_records;
  std::set<std::pair<std::string, std::string>> m_seen;  // project and model
};

}  // namespace qrex
