// How generated and exported files reach the disk: only what differs is written, read-only flags are kept, and each
// action has its line on the trace log.
#pragma once

#include <boost/container/vector.hpp>
#include <optional>
#include <string>

#include "text/beside_file.h"
#include "text/files.h"
#include "text/text_writer.h"

namespace qrex {

// Writes the text with CR LF line ends unless the file holds it already (line ends folded): "Skipping " or "Writing "
// and the path. A file that cannot be written costs an "Error: " line.
enum class FileUpdate { Skipped, Written, Failed };
FileUpdate UpdateFile(LeftoverSweep& leftovers, MemoryTextWriter& writer, const std::string& path,
                      ReadOnlyTarget readOnly = ReadOnlyTarget::Refuse);
// The same: 1 when written, else 0.
int WriteIfChanged(LeftoverSweep& leftovers, MemoryTextWriter& writer, const std::string& path);

// The text with each line feed as CR LF: the form of every generated file on disk.
std::string WithCarriageReturns(std::string_view text);

// A generated file while it is composed, with CR LF line ends. It replaces the target as a whole when it is committed;
// without that it leaves no trace. A long text goes to the file beside the target as it comes and is not kept in
// memory. Writers flush in their destructors, so Write never raises: what it could not write fails Text and Commit.
class GeneratedFile : public IOutputStream {
 public:
  GeneratedFile(LeftoverSweep& leftovers, std::string path) : m_leftovers(leftovers), m_path(std::move(path)) {}
  ~GeneratedFile() override;
  void Write(const void* data, size_t length) override {
    WriteIndented({static_cast<const char*>(data), length}, 0, false);
  }
  void WriteIndented(std::string_view text, size_t blanks, bool atLineStart) override;
  void Flush() override {}
  std::string Text();  // all that was written; raises FileException
  void Commit();       // raises FileException. A read-only target is replaced like any other

 private:
  void Spill();  // what is in memory to the file beside the target
  template <typename Step>
  void Try(Step step);
  void RaiseFailure() const;
  std::string_view InMemory() const { return {m_buffer.data(), m_used}; }
  char* MakeRoom(size_t length);  // behind what is in memory; the length is that of a part of a line

  LeftoverSweep& m_leftovers;
  const std::string m_path;
  boost::container::vector<char> m_buffer;  // grows without being cleared first
  size_t m_used = 0;
  File m_beside;
  std::optional<BesideFile> m_spilled;  // what m_beside writes to
  std::optional<uint32_t> m_failure;    // the error code of the first step that failed
};

// Copies when `from` is newer than `to` (a missing file has time 0), and stamps the copy with the present time. Where
// the stamps are too near to each other to tell, the contents decide.
bool CopyIfNewer(LeftoverSweep& leftovers, const std::string& from, const std::string& to, bool readOnly);

// As SetReadOnly; an existing file that refuses gets a "Failure setting/clearing read only status" line.
void ChangeReadOnly(const std::string& path, bool readOnly);

// Clears the read-only flag and deletes; false when no file was deleted.
platform::Result DeleteThoughReadOnly(const std::string& path);

// The same, and writes "Deleting " and the path when a file was deleted; false, with a message, when one stays.
bool DeleteReporting(const std::string& path);

// Where a tool is about to write: a link goes, so that what it leads to stays as it is. Raises FileException.
void RemoveLink(const std::string& path);

}  // namespace qrex
