// What the outputs of a project were made from, for the key `fingerprints`: whatever differs is made again, also where
// it is older. Beside the dependency file, PROJECT.qrexprint.
//
// A checked file (text/files.h) with the magic 0x2AEF78F3. Payload; strings are a compact length and their bytes, all
// numbers have 8 bytes, a stamp is a write time and a size:
//   the keys and variables that decide on translations, as text; the command of the compilers, as text;
//   number of files, and for each its path, the stamp of its source, the print and stamp of its translation, those of
//     its object;
//   number of other outputs (the target, objects of resources), and for each its path, print and stamp.
// A print is a hash of all that an output is made from: command or keys, and stamps of its inputs; 0: it is not known.
#pragma once

#include <cstdint>
#include <map>
#include <string>
#include <string_view>
#include <vector>

#include "builder/build_files.h"
#include "text/files.h"

namespace qrex {

class PrintMixer {
 public:
  PrintMixer& Add(uint64_t value) {  // the finaliser of SplitMix64: each bit reaches all of the value
    uint64_t mixed = m_value + value + kGolden;
    mixed = (mixed ^ (mixed >> 30)) * 0xBF58476D1CE4E5B9;
    mixed = (mixed ^ (mixed >> 27)) * 0x94D049BB133111EB;
    m_value = mixed ^ (mixed >> 31);
    return *this;
  }
  PrintMixer& Add(std::string_view text);
  PrintMixer& Add(const FileStamp& stamp) { return Add(static_cast<uint64_t>(stamp.time)).Add(stamp.size); }
  uint64_t Value() const { return m_value == 0 ? 1 : m_value; }

 private:
  static constexpr uint64_t kGolden = 0x9E3779B97F4A7C15;
  uint64_t m_value = kGolden;
};

struct OutputPrint {
  uint64_t print = 0;
  FileStamp stamp;
  bool operator==(const OutputPrint&) const = default;
};

// As they were noted last.
class Fingerprints {
 public:
  struct File {
    FileStamp source;
    OutputPrint translation, object;
  };

  void Load(BuildFiles& builder, const std::string& path);  // what is damaged or missing tells nothing
  void Save(BuildFiles& builder, const std::string& path);  // if anything has changed
  const File& Of(const ScannedFile& file) const;
  const OutputPrint& Of(const std::string& output) const;  // of an output that is of no single file
  void Note(const ScannedFile& file, const FileStamp& source, const OutputPrint& translation);
  void NoteObject(const ScannedFile& file, const OutputPrint& object);
  void Note(const std::string& output, const OutputPrint& made);
  const std::string& Keys() const { return m_keys; }
  const std::string& Command() const { return m_command; }
  void SetTexts(const std::string& keys, const std::string& command);

 private:
  template <typename Value>
  void Set(Value& known, const Value& value) {
    m_hasChanged = m_hasChanged || !(known == value);
    known = value;
  }
  File& At(const ScannedFile& file);

  std::string m_keys, m_command;
  std::vector<File> m_files;  // by their index
  std::map<std::string, OutputPrint> m_others;
  bool m_hasChanged = false;
};

std::string FingerprintPath(const std::string& dependencyFile);

}  // namespace qrex
