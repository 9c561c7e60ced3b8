#include "text/file_lookup.h"

#include <utility>

#include "platform/file_system.h"
#include "text/files.h"

namespace qrex {

bool FileLookup::Exists(const std::string& path) {
  const size_t slash = path.rfind('/');
  const size_t nameBegin = slash == std::string::npos ? 0 : slash + 1;
  const Directory& directory = DirectoryOf(std::string_view(path).substr(0, nameBegin));
  return directory.index.contains(std::string_view(path).substr(nameBegin)) || FileExists(path);
}

const FileLookup::Directory& FileLookup::DirectoryOf(std::string_view path) {
  if (m_last && m_last->path == path) return *m_last;
  const auto found = m_byPath.find(path);
  if (found != m_byPath.end()) return *(m_last = found->second);
  std::vector<std::string> names = platform::PlainFileNames(std::string(path));
  Directory& directory = m_directories.emplace_back(
      Directory{std::string(path), std::move(names), std::pmr::unordered_set<std::string_view>(&m_memory)});
  directory.index.insert(directory.plainFiles.begin(), directory.plainFiles.end());
  m_byPath.emplace(directory.path, &directory);
  return *(m_last = &directory);
}

}  // namespace qrex
