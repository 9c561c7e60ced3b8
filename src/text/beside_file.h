// The file as which another one is written before it takes its place. Its name is random, so no two writers share one,
// and its writer holds it: a sweep (text/files.h) takes what nobody holds.
#pragma once

#include <string>
#include <string_view>

#include "platform/file_claim.h"

namespace qrex {

class BesideFile {
 public:
  explicit BesideFile(const std::string& path);  // makes it, empty, in the folder of `path`; raises FileException
  const std::string& Path() const { return m_path; }
  static bool IsNameOfOne(std::string_view name);

 private:
  std::string m_path;
  platform::FileClaim m_claim;  // ends behind the rename: this is to be kept until then
};

}  // namespace qrex
