// How generated and exported files reach the disk: only what differs is written, read-only flags are kept, and each
// action has its line on the trace log.
#pragma once

#include <string>

#include "text/text_writer.h"

namespace qrex {

// Writes the text with CR LF line ends unless the file holds it already (line ends folded): "Skipping " or "Writing "
// and the path. A file that cannot be written costs an "Error: " line. 1 when written, else 0.
int WriteIfChanged(MemoryTextWriter& writer, const std::string& path);

// The text with each line feed as CR LF: how every generated file stands on disk.
std::string WithCarriageReturns(std::string_view text);

// Copies when `from` is newer than `to` (a missing file has time 0), and stamps the copy with the present time.
bool CopyIfNewer(const std::string& from, const std::string& to, bool readOnly);

// As SetReadOnly; an existing file that refuses gets a "Failure setting/clearing read only status" line.
void ChangeReadOnly(const std::string& path, bool readOnly);

// Clears the read-only flag, deletes, and writes "Deleting " and the path when a file was deleted.
void DeleteReporting(const std::string& path);

}  // namespace qrex
