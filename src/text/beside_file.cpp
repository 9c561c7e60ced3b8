#include "text/beside_file.h"

#include <functional>

#include "platform/file_system.h"
#include "platform/system.h"
#include "text/exceptions.h"

namespace qrex {

namespace {

constexpr std::string_view kMark = ".qrex-";  // then the random part
constexpr std::string_view kEnd = ".part";

std::string RandomMark() {
  static constexpr char kDigits[] = "0123456789abcdef";
  std::string mark(kMark);
  for (const uint8_t byte : platform::MakeUuid()) mark.append({kDigits[byte >> 4], kDigits[byte & 15]});
  return mark.append(kEnd);
}

// Where the name would be too long, a number replaces the file's.
std::string NameBeside(const std::string& path) {
  const std::string folder = path.substr(0, path.rfind('/') + 1);
  const std::string name = path.substr(folder.size()), mark = RandomMark();
  if (name.size() + mark.size() <= platform::kLongestName) return path + mark;
  return folder + std::to_string(std::hash<std::string>()(name)) + mark;
}

}  // namespace

BesideFile::BesideFile(const std::string& path) {
  platform::Result made;
  do {
    m_path = NameBeside(path);
    made = m_claim.Make(m_path);
  } while (made.Code() == platform::kErrorFileExists);
  Require(made, path);
}

bool BesideFile::IsNameOfOne(std::string_view name) {
  if (!name.ends_with(kEnd)) return false;
  name.remove_suffix(kEnd.size());
  const size_t mark = name.rfind(kMark);
  if (mark == std::string_view::npos) return false;
  name.remove_prefix(mark + kMark.size());
  return !name.empty() && name.find_first_not_of("0123456789abcdef") == std::string_view::npos;
}

}  // namespace qrex
