// Looks for many files of few directories: each directory is listed once.
#pragma once

#include <deque>
#include <memory_resource>
#include <string>
#include <string_view>
#include <unordered_map>
#include <unordered_set>
#include <vector>

namespace qrex {

class FileLookup {
 public:
  bool Exists(const std::string& path);

 private:
  struct Directory {
    std::string path;  // with a slash at the end
    std::vector<std::string> plainFiles;
    std::pmr::unordered_set<std::string_view> index;  // of these
  };
  const Directory& DirectoryOf(std::string_view path);

  std::pmr::monotonic_buffer_resource m_memory;  // of the indexes
  std::deque<Directory> m_directories;
  std::unordered_map<std::string_view, const Directory*> m_byPath;
  const Directory* m_last = nullptr;  // asked for
};

}  // namespace qrex
