#include "workspace/workspace.h"

#include <cstring>
#include <tuple>

#include "platform/error.h"
#include "platform/file_names.h"
#include "platform/system.h"
#include "text/files.h"
#include "text/numbers.h"
#include "text/paths.h"
#include "text/trace.h"
#include "workspace/project_parser.h"

namespace qrex {

namespace {

constexpr char kGuidFile[] = "projects.guids";

std::string StemOrEmpty(std::string_view path) {
  std::string stem;
  StemOf(path, stem);
  return stem;
}

std::string_view KeptIn(std::pmr::memory_resource& memory, const std::string& text) {
  char* const kept = static_cast<char*>(memory.allocate(text.size() + 1, 1));
  std::memcpy(kept, text.c_str(), text.size() + 1);
  return {kept, text.size()};
}

}  // namespace

std::string ProjectPathOf(const std::string& entry) {
  const std::string_view last = FileNameOf(entry);
  if (HasExtension(entry, "qrpj") || last.empty()) return entry;
  return entry + "/src/" + std::string(last) + ".qrpj";
}

Workspace::Workspace(ConfigSettings& settings) : settings(settings), context(settings.context) {}

Project* Workspace::FindProjectByName(std::string_view projectName) const {
  if (const auto known = m_byName.find(projectName); known != m_byName.end()) return known->second;
  for (const auto& project : projects) {
    if (project->name == projectName) return project.get();
  }
  return nullptr;
}

Project* Workspace::FindSubproject(std::string_view path) const { return FindProjectByName(StemOrEmpty(path)); }

ProjectFile* Workspace::FindFile(std::string_view path) const {
  auto found = fileMap.find(path);
  if (found == fileMap.end() && platform::kNamesFoldCase) found = fileMap.find(platform::FoldCase(path));
  return found == fileMap.end() ? nullptr : found->second;
}

Project* Workspace::LoadProject(const std::string& path) {
  const std::string stem = StemOrEmpty(path);
  if (Project* loaded = FindProjectByName(stem)) return loaded;
  projects.push_back(std::make_unique<Project>(*this));
  Project& project = *projects.back();
  project.rootFolder.name = stem;
  const bool isRead = LoadProjectFile(project, path);
  m_byName.emplace(project.name, &project);
  if (!isRead) return nullptr;
  if (m_loadDepth >= kMaxLoadDepth || platform::IsStackShort()) {
    settings.Tell(Message(Severity::Error, "Error: ", "Subprojects nested too deeply at " + path));
    return nullptr;
  }
  ++m_loadDepth;
  bool allLoaded = true;
  for (size_t i = 0; i < project.subprojects.size() && allLoaded; ++i) {
    allLoaded = LoadProject(project.subprojects[i]) != nullptr;
  }
  --m_loadDepth;
  return allLoaded ? &project : nullptr;
}

// --- Order

namespace {

enum class Mark { White, Grey, Black };

class Sorter {
 public:
  explicit Sorter(const std::vector<std::unique_ptr<Project>>& projects) {
    for (size_t i = 0; i < projects.size(); ++i) m_byName.emplace(projects[i]->name, i);
    m_marks.resize(projects.size());
    for (size_t i = 0; i < projects.size(); ++i) Visit(projects, i);
  }
  const std::vector<size_t>& Order() const { return m_order; }

 private:
  void Visit(const std::vector<std::unique_ptr<Project>>& projects, size_t index) {
    const Project& project = *projects[index];
    if (m_marks[index] == Mark::Grey) {
      WriteToConsole("*** Warning : cycle detected involving project " + project.name + "\n");
      return;
    }
    if (m_marks[index] == Mark::Black) return;
    m_marks[index] = Mark::Grey;
    for (const std::string& path : project.subprojects) {
      const std::string stem = StemOrEmpty(path);
      auto found = m_byName.find(stem);
      if (found == m_byName.end()) {
        WriteToConsole("*** Warning : Subproject " + stem + " not found\n");
      } else {
        Visit(projects, found->second);
      }
    }
    m_marks[index] = Mark::Black;
    m_order.push_back(index);
  }

  std::map<std::string, size_t> m_byName;  // the first project of each name
  std::vector<Mark> m_marks;
  std::vector<size_t> m_order;
};

}  // namespace

void Workspace::SortProjects() {
  const Sorter sorter(projects);
  if (sorter.Order().size() != projects.size()) {
    WriteToConsole("*** Warning : Topological sort of projects in workspace failed\n");
    return;
  }
  std::vector<std::unique_ptr<Project>> sorted;
  for (size_t index : sorter.Order()) sorted.push_back(std::move(projects[index]));
  projects = std::move(sorted);
  m_byName.clear();
  for (const auto& project : projects) m_byName.emplace(project->name, project.get());
}

// --- Identifiers: count, then per name in byte order its length, its bytes, 16 bytes of identifier.

namespace {

using GuidMap = std::map<std::string, guid>;

GuidMap ParseGuids(std::string_view bytes) {
  GuidMap guids;
  uint64_t count;
  if (!ReadCompactLength(bytes, count)) throw DeserialisationException();
  for (; count > 0; --count) {
    std::string_view name;
    guid id;
    if (!ReadCompactString(bytes, name) || bytes.size() < id.bytes.size()) throw DeserialisationException();
    std::memcpy(id.bytes.data(), bytes.data(), id.bytes.size());
    bytes.remove_prefix(id.bytes.size());
    guids[std::string(name)] = id;
  }
  return guids;
}

std::string GuidBytes(const GuidMap& guids) {
  std::string bytes;
  AppendCompactLength(bytes, guids.size());
  for (const auto& [name, id] : guids) {
    AppendCompactString(bytes, name);
    bytes.append(reinterpret_cast<const char*>(id.bytes.data()), id.bytes.size());
  }
  return bytes;
}

}  // namespace

void Workspace::SyncProjectGuids() {
  GuidMap guids;
  std::string bytes;
  try {
    const platform::Result read = ReadWholeFile(bytes, kGuidFile);
    if (read) {
      guids = ParseGuids(bytes);
    } else if (read.Code() != platform::kErrorFileNotFound && LastWriteTime(kGuidFile) != 0) {
      Require(read, kGuidFile);  // it is there, but can't be read
    }
    for (const auto& project : projects) {
      auto found = guids.find(project->name);
      if (found != guids.end()) project->guid = found->second;
    }
  } catch (const IException& exception) {
    TraceWriter() << "Error reading " << kGuidFile << " : " << exception << "\n";
    guids.clear();
  }
  for (const auto& project : projects) guids[project->name] = project->guid;
  settings.leftovers.Beside(kGuidFile);
  try {
    const std::string made = GuidBytes(guids);
    const bool isAsRead = made == bytes && !platform::IsLink(kGuidFile) && TouchFile(kGuidFile, false);
    if (!isAsRead) ReplaceFile(kGuidFile, made);
  } catch (const FileException&) {
    TraceWriter() << "Error : Couldn't write " << kGuidFile << "\n";
  }
}

// --- Files

namespace {

void AddStaticDefine(Project& project, const std::string& libraryName) {
  for (const auto& config : project.configs) {
    std::string& definitions = config->compilerOptions["PreprocessorDefinitions"];
    if (!definitions.empty()) definitions += ';';
    definitions += libraryName + "_STATIC_LIBRARY";
  }
}

}  // namespace

bool Workspace::CheckFileReferences() {
  for (const auto& project : projects) {
    if (project->targetType == TargetType::StaticLibrary) AddStaticDefine(*project, project->name);
    for (const std::string& path : project->subprojects) {
      const Project* subproject = FindSubproject(path);
      if (subproject && subproject->targetType == TargetType::StaticLibrary)
        AddStaticDefine(*project, subproject->name);
    }
  }
  size_t fileCount = 0;
  for (const auto& project : projects) fileCount += project->filesByPath.size();
  fileMap.reserve(fileCount);
  for (const auto& project : projects) {
    project->CollectFiles();
    for (ProjectFile* file : project->files) {
      auto [entry, isNew] = fileMap.emplace(file->path, file);
      if (isNew && platform::kNamesFoldCase) {
        const std::string_view folded = KeptIn(nodeMemory, platform::FoldCase(file->path));
        if (folded != file->path) std::tie(entry, isNew) = fileMap.emplace(folded, file);
      }
      if (isNew) continue;
      const Project& other = *entry->second->project;
      const std::string text =
          &other == project.get()
              ? "Project " + other.rootToProjDir + " contains duplicate reference to file " + file->path
              : "Projects " + other.rootToProjDir + " and " + project->rootToProjDir + " both reference file " +
                    file->path;
      settings.Tell(Message(Severity::Error, "ERROR:  ", text));
      return false;
    }
  }
  return true;
}

}  // namespace qrex
