// The file tree of a project file: folders, names, searches with wildcards, and options of files.

#include <algorithm>

#include "lex/literals.h"
#include "platform/console.h"
#include "platform/file_names.h"
#include "platform/system.h"
#include "text/files.h"
#include "text/numbers.h"
#include "text/paths.h"
#include "workspace/project_parser.h"
#include "workspace/switch_blocks.h"

namespace qrex {

namespace {

constexpr size_t kMaxNesting = 1000;

bool HoldsWildcard(const LexToken& token) {
  const std::string_view text = token.text.View();
  return token.kind == kDoubleQuoted && (text.find('*') != text.npos || text.find('?') != text.npos);
}

}  // namespace

void ProjectParser::ParseTree(ProjectFolder& folder, const std::string& directory) {
  if (++m_depth > kMaxNesting || platform::IsStackShort())
    throw LexScannerException("Blocks nested too deeply", current);
  RequireBrace();
  while (current.kind != kCloseBrace) ParseEntry(folder, directory);
  --m_depth;
  if (m_depth > 0) Advance();  // behind the last block the text need not be readable
}

void ProjectParser::ParseEntry(ProjectFolder& folder, const std::string& directory) {
  m_entry = current.text.begin;
  if (current.Is("directories")) {
    ParseDirectories();
  } else if (IsFilterNext()) {
    ParseSearch(folder, directory);
  } else {
    ParseName(folder, directory);
  }
}

// --- Filters

bool ProjectParser::IsFilterNext() const {
  return HoldsWildcard(current) || current.kind == kOpenBracket || current.kind == kPlus || current.kind == kMinus;
}

void ProjectParser::ReadPatterns(FileFilter& filter) {
  Advance();
  while (current.kind != kCloseBracket) {
    ReadString(filter.patterns.emplace_back());
    Advance();
  }
  Advance();
}

FileFilter ProjectParser::ReadFilter() {
  FileFilter filter;
  if (current.kind == kDoubleQuoted) {
    ReadString(filter.patterns.emplace_back());
    Advance();
    return filter;
  }
  const bool hasSign = current.kind != kOpenBracket;
  if (hasSign) {
    filter.include = current.kind == kPlus;
    Advance();
  }
  if (current.kind == kOpenBracket) {
    ReadPatterns(filter);
  } else if (current.kind == kDoubleQuoted) {
    ReadString(filter.patterns.emplace_back());
    Advance();
  } else {
    throw LexScannerException("Expected [ after + or - when read " + Printed(current), current);
  }
  return filter;
}

void ProjectParser::ParseDirectories() {
  Advance();
  if (!IsFilterNext()) {
    throw LexScannerException("Expected '[', '+' or '-' when read " + Printed(current), current);
  }
  FileFilter filter = ReadFilter();
  m_directoryFilter.include = filter.include;
  m_directoryFilter.patterns.insert(m_directoryFilter.patterns.end(), filter.patterns.begin(), filter.patterns.end());
}

// --- Search

void ProjectParser::ParseSearch(ProjectFolder& folder, const std::string& directory) {
  Search search;
  search.filter = ReadFilter();
  if (current.Is("flat")) {
    search.flat = true;
    Advance();
    if (current.kind != kStar) FailExpected("*");
  }
  if (current.kind == kStar) {
    search.recurse = true;
    Advance();
  }
  Find(search, folder, directory);
  if (current.kind == kColon) ParseFileOptions({search.matched.begin(), search.matched.end()});
}

// A directory that one root holds is searched under all of them; once, however many roots hold it.
void ProjectParser::Find(Search& search, ProjectFolder& folder, const std::string& directory) {
  if (!search.searched.insert(directory).second) return;
  RequireInTree(directory, m_entry);
  for (const std::string& root : m_project.settings->virtualTree) FindUnder(root, search, folder, directory);
}

void ProjectParser::FindUnder(const std::string& root, Search& search, ProjectFolder& folder,
                              const std::string& directory) {
  std::string searched = PathJoin(root, directory), realPath;
  if (searched.empty()) searched = ".";  // the folder of the run
  if (const platform::Result found = RealPathOf(searched, realPath); !found) {
    if (!found.IsNotFound()) FailSearch(searched, found.Code());
    return;
  }
  if (std::find(search.open.begin(), search.open.end(), realPath) != search.open.end()) return;  // a link to itself
  if (search.open.size() >= kMaxNesting || platform::IsStackShort())
    throw LexScannerException("Directories nested too deeply", current);
  search.open.push_back(realPath);
  m_project.settings->listedFolders.insert(searched);
  std::vector<std::string> names;
  FileOrDirIterator entries(searched + "/*");
  if (entries.FailureCode() != 0) FailSearch(searched, entries.FailureCode());
  while (const IFileOrDirInfo* entry = entries.Next()) {
    const std::string name = entry->Name();
    if (name == "." || name == ".." || entry->IsHidden() || entry->IsSystem()) continue;
    const bool isWantedFolder = search.recurse && m_directoryFilter.Passes(name);
    const bool isWantedFile = search.filter.Passes(name);
    if (entries.EntryFailure() != 0 && (isWantedFolder || isWantedFile)) {
      throw LexScannerException(
          "Couldn't read " + PathJoin(searched, name) + " : " + SystemErrorText(entries.EntryFailure()), current);
    }
    if (!(entry->IsDirectory() ? isWantedFolder : isWantedFile)) continue;
    if (!platform::IsValidUtf8(name)) {
      throw LexScannerException("Path is not valid UTF-8 : " + PathJoin(directory, name), current);
    }
    if (name.find('"') != std::string::npos) {
      throw LexScannerException("A double quote can't stand in " + PathJoin(directory, name), current);
    }
    if (entry->IsDirectory()) {
      FindInSubdirectory(search, folder, directory, name);
    } else {
      names.push_back(name);
    }
  }
  for (const std::string& name : names) {
    search.matched.insert(&AddFile(folder, PathJoin(directory, name), name));
  }
  search.open.pop_back();
}

void ProjectParser::FailSearch(const std::string& folder, uint32_t code) const {
  throw LexScannerException("Couldn't list folder " + folder + " : " + SystemErrorText(code), current);
}

void ProjectParser::FindInSubdirectory(Search& search, ProjectFolder& folder, const std::string& directory,
                                       const std::string& name) {
  const std::string subdirectory = PathJoin(directory, name);
  if (search.flat) return Find(search, folder, subdirectory);
  bool isNew = false;
  ProjectFolder& subfolder = FolderNamed(folder, name, &isNew);
  Find(search, subfolder, subdirectory);
  if (isNew && subfolder.files.empty() && subfolder.subfolders.empty()) folder.subfolders.pop_back();
}

// --- Names

void ProjectParser::ParseName(ProjectFolder& folder, const std::string& directory) {
  std::string name, displayName;
  ReadPath(name);
  Advance();
  const bool hasDisplayName = current.Is("as");
  if (hasDisplayName) {
    Advance();
    ReadString(displayName);
    RequireNoQuote(displayName, current);
    Advance();
  }
  if (current.kind == kOpenBrace) {
    return ParseNestedBlock(folder, directory, name, hasDisplayName ? &displayName : nullptr);
  }
  ProjectFile& file = AddFile(folder, PathJoin(directory, name), hasDisplayName ? displayName : name);
  if (current.kind == kColon) ParseFileOptions({&file});
}

void ProjectParser::ParseNestedBlock(ProjectFolder& folder, const std::string& directory, const std::string& name,
                                     const std::string* displayName) {
  const std::string nested = name.empty() ? directory : PathJoin(directory, name);
  std::string folderName = displayName ? *displayName : name;
  if (!displayName && name.compare(0, 2, "..") == 0) folderName = nested.empty() ? "$" : nested;
  ParseTree(folderName.empty() ? folder : FolderNamed(folder, folderName), nested);
}

ProjectFolder& ProjectParser::FolderNamed(ProjectFolder& parent, const std::string& name, bool* isNew) {
  for (const auto& subfolder : parent.subfolders) {
    if (subfolder->name == name) return *subfolder;
  }
  if (isNew) *isNew = true;
  parent.subfolders.push_back(std::make_unique<ProjectFolder>());
  ProjectFolder& made = *parent.subfolders.back();
  made.project = &m_project;
  made.name = name;
  return made;
}

// What is made of a file has its path, below the folders of outputs.
void ProjectParser::RequireInTree(const std::string& path, const char* position) const {
  if (LeadsAbove(path)) throw LexScannerException("Path leads out of the tree : " + path, position);
  if (m_project.usesQrex && IsAbsolutePath(path)) {
    throw LexScannerException("Path of a translated file must be relative : " + path, position);
  }
}

// A file that is named again stays in its first folder.
ProjectFile& ProjectParser::AddFile(ProjectFolder& folder, const std::string& path, const std::string& displayName) {
  const auto place = m_project.filesByPath.lower_bound(path);
  if (place != m_project.filesByPath.end() && place->first == path) return *place->second;
  if (platform::kNamesFoldCase) {
    if (const auto known = m_foldedPaths.find(platform::FoldCase(path)); known != m_foldedPaths.end())
      return *known->second;
  }
  RequireInTree(path, m_entry);
  auto made = std::make_unique<ProjectFile>();
  ProjectFile& file = *made;
  file.project = &m_project;
  file.path = path;
  m_project.filesByPath.emplace_hint(place, file.path, std::move(made));
  if (platform::kNamesFoldCase) m_foldedPaths.emplace(platform::FoldCase(path), &file);
  file.listedAt = m_entry;
  file.name = displayName;
  if (!StemOf(displayName, file.stem)) file.stem = std::string(FileNameOf(displayName));
  const size_t dot = displayName.rfind('.');
  if (dot != std::string::npos) file.extension = displayName.substr(dot + 1);
  ToLower(file.extension);
  file.kind = FileKindOf(file.extension);
  file.isMainSource = file.kind == FileKind::Cpp && file.stem == m_project.name;
  file.isPublicHeader = file.kind == FileKind::H && IsLibrary(m_project.targetType) &&
                        path.compare(0, m_project.sourceDir.size(), m_project.sourceDir) != 0;
  folder.files.push_back(&file);
  return file;
}

// --- Options of files

void ProjectParser::ParseFileOptions(const Files& files) {
  do {
    Advance();
    ParseFileOption(files);
  } while (current.kind == kComma);
}

void ProjectParser::ParseExclude(const Files& files) {
  Advance();
  if (current.kind != kOpenParen) {
    for (ProjectFile* file : files) file->excluded = true;
    return;
  }
  for (ProjectConfig* config : ReadScope().configs) {
    for (ProjectFile* file : files) file->RecordOf(*config).excluded = true;
  }
}

void ProjectParser::ParseFileOption(const Files& files) {
  if (current.Is("exclude")) return ParseExclude(files);
  if (current.kind != kPlus && current.kind != kMinus) {
    throw LexScannerException("Unknown option : " + Printed(current), current)
        .WithHint("an option of a file is one of exclude, +cpp, -cpp");
  }
  const bool add = current.kind == kPlus;
  Advance();
  if (!current.Is("cpp")) throw LexScannerException("Expected 'cpp' when read " + Printed(current), current);
  Advance();
  const Scope scope = ReadScope();
  ReadBlockOf(scope, [&] { ReadSwitchesOf(files, scope.configs, add); });
}

void ProjectParser::ReadSwitchesOf(const Files& files, const Configs& configs, bool add) {
  if (KeepsRawText()) {
    const std::string block = ReadRawBlock();
    for (ProjectConfig* config : configs) {
      for (ProjectFile* file : files) {
        FileConfigRecord& record = file->RecordOf(*config);
        std::string& text = add ? record.addText : record.removeText;
        text = ForConfig(text + " " + block, *config);
      }
    }
    return;
  }
  const SwitchChanges changes = ReadCompilerSwitches(*this, !add);
  for (ProjectConfig* config : configs) {
    for (ProjectFile* file : files) {
      FileConfigRecord& record = file->RecordOf(*config);
      if (add) {
        changes.Apply(record.options);
      } else {
        changes.ApplyToFile(record.options, config->compilerOptions);
      }
      SubstituteInOptions(record.options, *config);
    }
  }
}

}  // namespace qrex
