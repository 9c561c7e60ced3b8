#include "driver/init.h"

#include <algorithm>
#include <vector>

#include "driver/data_folder.h"
#include "platform/file_system.h"
#include "text/files.h"
#include "text/numbers.h"
#include "text/paths.h"
#include "text/trace.h"

namespace qrex {

namespace {

// In the names and the texts of templates.
constexpr char kNameInPaths[] = "NAME";
constexpr char kNameInTexts[] = "{{NAME}}";
constexpr char kHiddenName[] = "dot.";  // begins the name of a file that is to begin with a dot
constexpr char kTemplates[] = "templates/workspace";
constexpr char kBesideEnd[] = ".qrex-init.part";  // of the folder in which a workspace is laid out

bool Complain(const std::string& message) {
  WriteToConsole("Error: " + message + "\n");
  return false;
}

// It names files, projects and what is generated for them.
bool IsIdentifier(const std::string& name) {
  const auto isLetter = [](char c) { return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || c == '_'; };
  const auto isDigit = [](char c) { return c >= '0' && c <= '9'; };
  return !name.empty() && isLetter(name.front()) &&
         std::all_of(name.begin(), name.end(), [&](char c) { return isLetter(c) || isDigit(c); });
}

struct LaidOutFile {
  std::string path;
  std::string text;
};

class Layout {
 public:
  Layout(const std::string& name, const std::string& folder, const std::string& data) : m_name(name) {
    Add(data + "/" + kTemplates, folder);
  }
  const std::vector<LaidOutFile>& Files() const { return m_files; }

 private:
  void Add(const std::string& from, const std::string& to) {
    FileOrDirIterator entries(from + "/*");
    if (entries.FailureCode() != 0) throw FileException(entries.FailureCode(), from);
    while (const IFileOrDirInfo* entry = entries.Next()) {
      const std::string source = entry->Name();
      if (source == "." || source == "..") continue;
      if (entries.EntryFailure() != 0) throw FileException(entries.EntryFailure(), from + "/" + source);
      const std::string target = to + "/" + TargetName(source);
      if (entry->IsDirectory()) {
        Add(from + "/" + source, target);
        continue;
      }
      LaidOutFile& file = m_files.emplace_back();
      file.path = target;
      Require(ReadWholeFile(file.text, from + "/" + source), from + "/" + source);
      ReplaceAllInPlace(file.text, kNameInTexts, m_name);
    }
  }

  std::string TargetName(std::string name) const {
    if (name.starts_with(kHiddenName)) name.erase(0, sizeof kHiddenName - 2);
    ReplaceAllInPlace(name, kNameInPaths, m_name);
    return name;
  }

  std::string m_name;
  std::vector<LaidOutFile> m_files;
};

enum class Place { Free, Ours, Taken };

// What is there already where the file is to go. One with its very text is of an earlier call, which did not come to
// its end.
Place PlaceOf(const LaidOutFile& file) {
  std::string there;
  const platform::Result read = ReadWholeFile(there, file.path);
  if (read) return there == file.text ? Place::Ours : Place::Taken;
  if (read.IsNotFound()) return Place::Free;
  platform::FileInfo info;
  if (!platform::Stat(file.path, info)) Require(read, file.path);
  return Place::Taken;
}

void Write(LeftoverSweep& leftovers, const std::string& path, const std::string& text) {
  CreateDirectories(path, false);
  leftovers.Beside(path);
  ReplaceFile(path, text);
}

// The folder comes to be as a whole.
void LayOutBeside(const std::vector<LaidOutFile>& files, const std::string& folder) {
  const std::string beside = folder + kBesideEnd;
  Require(platform::RemoveTree(beside), beside);  // of a call that was killed
  try {
    LeftoverSweep leftovers;
    for (const LaidOutFile& file : files) Write(leftovers, beside + file.path.substr(folder.size()), file.text);
    Require(platform::RenameFile(beside, folder), folder);
  } catch (...) {
    platform::RemoveTree(beside);
    throw;
  }
}

bool IsMissing(const std::string& folder) {
  platform::FileInfo info;
  return platform::Stat(folder, info).Code() == platform::kErrorFileNotFound;
}

bool LayOut(const std::string& calledAs, const std::string& name, const std::string& folder) {
  if (!IsIdentifier(name)) return Complain(name + " can't name a workspace: letters, digits and _, a letter first");
  std::string tried;
  const auto data = FindDataFolder(calledAs, {{kTemplates, kRuntimePart}}, tried);
  if (!data) return Complain("No " + std::string(kTemplates) + " and " + kRuntimePart + " in any of" + tried);
  const Layout layout(name, folder, *data);
  std::vector<LaidOutFile> missing;
  for (const LaidOutFile& file : layout.Files()) {
    const Place place = PlaceOf(file);
    if (place == Place::Taken) return Complain(file.path + " is there already; nothing was written");
    if (place == Place::Free) missing.push_back(file);
  }
  if (missing.empty()) return Complain("All of " + folder + " is there already; nothing was written");
  if (IsMissing(folder)) {
    LayOutBeside(missing, folder);
  } else {
    LeftoverSweep leftovers;
    for (const LaidOutFile& file : missing) Write(leftovers, file.path, file.text);
  }
  for (const LaidOutFile& file : missing) WriteToConsole(file.path + "\n");
  WriteToConsole("\nTo build and run it:\n    cd " + folder + "\n    Qrex " + name + ".qrex\n    out/lib/x64/Debug/" +
                 name + "_app\n");
  return true;
}

}  // namespace

bool InitWorkspace(const std::string& calledAs, const std::string& name, const std::string& folder) {
  try {
    return LayOut(calledAs, name, folder);
  } catch (const FileException& exception) {
    return Complain(ExceptionText(exception));
  }
}

}  // namespace qrex
