// The files of a project for who asks about them: the texts that translations give in memory are kept.
#pragma once

#include <unordered_map>

#include "builder/build_files.h"
#include "translator/reader/kept_output.h"

namespace qrex {

class KeepingFiles : public BuildFiles {
 public:
  using BuildFiles::BuildFiles;
  KeptOutput* TextKeeper(const ScannedFile& file) override { return &(m_texts[&file] = KeptOutput()); }
  const KeptOutput& OutputOf(const ScannedFile& file) const { return m_texts.at(&file); }  // of one that is translated

 private:
  std::unordered_map<const ScannedFile*, KeptOutput> m_texts;
};

}  // namespace qrex
