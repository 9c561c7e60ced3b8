// What an @import does to the file under expansion.
#pragma once

#include <string>

#include "macro/expand.h"
#include "translator/symbols/scanned_file.h"

namespace qrex {

// Brings what the file imports up to date, and makes its macros visible.
class Importer : public ImportHandler {
 public:
  explicit Importer(ScannedFile& file) : m_file(file) {}
  bool Import(LSFrame& frame, const std::string& path, const char* position) override;
  std::string ImportHint(const std::string& path) const override { return m_file.ImportHint(path); }
  std::string PlaceOf(const char* position) const override;

 private:
  void ReportCycle(const ScannedFile& imported) const;
  ScannedFile& m_file;
};

}  // namespace qrex
