#include "builder/fingerprints.h"

#include <algorithm>
#include <cstring>

#include "text/paths.h"
#include "text/payload.h"
#include "text/text_writer.h"

namespace qrex {

namespace {

constexpr uint32_t kMagic = 0x2AEF78F3;

constexpr size_t kBytes = 8;  // of a number

void Append(std::string& out, const FileStamp& stamp) {
  AppendNumber(out, static_cast<uint64_t>(stamp.time), kBytes);
  AppendNumber(out, stamp.size, kBytes);
}

void Append(std::string& out, const OutputPrint& made) {
  AppendNumber(out, made.print, kBytes);
  Append(out, made.stamp);
}

FileStamp ReadStamp(PayloadReader& reader) {
  const uint64_t time = reader.Number(kBytes);
  return {static_cast<int64_t>(time), reader.Number(kBytes)};
}

OutputPrint ReadPrint(PayloadReader& reader) {
  const uint64_t print = reader.Number(kBytes);
  return {print, ReadStamp(reader)};
}

}  // namespace

PrintMixer& PrintMixer::Add(std::string_view text) {
  Add(text.size());
  for (; !text.empty(); text.remove_prefix(std::min<size_t>(text.size(), 8))) {
    uint64_t word = 0;
    std::memcpy(&word, text.data(), std::min<size_t>(text.size(), 8));
    Add(word);
  }
  return *this;
}

void Fingerprints::Load(BuildFiles& builder, const std::string& path) {
  std::string payload;
  if (!ReadCheckedFile(kMagic, payload, path)) return;
  m_files.resize(builder.FileCount());
  try {
    PayloadReader reader(payload);
    m_keys = reader.String();
    m_command = reader.String();
    for (uint64_t count = reader.Number(kBytes); count > 0; --count) {
      const auto file = builder.scannedByPath.find(reader.String());
      File known;
      known.source = ReadStamp(reader);
      known.translation = ReadPrint(reader);
      known.object = ReadPrint(reader);
      if (file != builder.scannedByPath.end()) At(*file->second) = known;
    }
    for (uint64_t count = reader.Number(kBytes); count > 0; --count) {
      std::string output(reader.String());
      m_others[std::move(output)] = ReadPrint(reader);
    }
  } catch (const DeserialisationException&) {
    m_files.clear();
    m_others.clear();
  }
}

void Fingerprints::Save(BuildFiles& builder, const std::string& path) {
  if (!m_hasChanged) return;
  std::vector<const ScannedFile*> files(builder.scanned.begin(), builder.scanned.end());
  std::sort(files.begin(), files.end(), [](const auto* a, const auto* b) { return a->file.path < b->file.path; });
  std::string payload;
  AppendCompactString(payload, m_keys);
  AppendCompactString(payload, m_command);
  AppendNumber(payload, files.size(), kBytes);
  for (const ScannedFile* file : files) {
    const File& known = Of(*file);
    AppendCompactString(payload, file->file.path);
    Append(payload, known.source);
    Append(payload, known.translation);
    Append(payload, known.object);
  }
  AppendNumber(payload, m_others.size(), kBytes);
  for (const auto& [output, made] : m_others) {
    AppendCompactString(payload, output);
    Append(payload, made);
  }
  CreateDirectories(path, false);
  builder.settings.leftovers.Beside(path);
  try {
    WriteCheckedFile(kMagic, payload, path);
    m_hasChanged = false;
  } catch (const FileException&) {
    TraceWriter() << "*** Couldn't save fingerprints " << path << "\n";
  }
}

const Fingerprints::File& Fingerprints::Of(const ScannedFile& file) const {
  static const File kUnknown;
  return file.index < m_files.size() ? m_files[file.index] : kUnknown;
}

const OutputPrint& Fingerprints::Of(const std::string& output) const {
  static const OutputPrint kUnknown;
  const auto known = m_others.find(output);
  return known == m_others.end() ? kUnknown : known->second;
}

Fingerprints::File& Fingerprints::At(const ScannedFile& file) {
  if (file.index >= m_files.size()) m_files.resize(file.index + 1);
  return m_files[file.index];
}

void Fingerprints::Note(const ScannedFile& file, const FileStamp& source, const OutputPrint& translation) {
  Set(At(file).source, source);
  Set(At(file).translation, translation);
}

void Fingerprints::NoteObject(const ScannedFile& file, const OutputPrint& object) { Set(At(file).object, object); }

void Fingerprints::Note(const std::string& output, const OutputPrint& made) { Set(m_others[output], made); }

void Fingerprints::SetTexts(const std::string& keys, const std::string& command) {
  Set(m_keys, keys);
  Set(m_command, command);
}

std::string FingerprintPath(const std::string& dependencyFile) {
  std::string path;
  ReplaceExtension(dependencyFile, "qrexprint", path);
  return path;
}

}  // namespace qrex
