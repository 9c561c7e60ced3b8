#include "builder/dependency_file.h"

#include <algorithm>
#include <vector>

#include "text/files.h"
#include "text/numbers.h"
#include "text/payload.h"

namespace qrex {

namespace {

constexpr uint32_t kMagic = 0x2AEF78F1;

void AppendRegistry(std::string& out, const DeclarationRegistry& registry) {
  AppendCompactLength(out, registry.entries.size());
  for (const auto& [path, names] : registry.entries) {
    AppendCompactString(out, path);
    AppendCompactLength(out, names.size());
    for (const std::string& name : names) AppendCompactString(out, name);
  }
}

void ReadRegistry(PayloadReader& reader, DeclarationRegistry& registry) {
  registry.entries.clear();
  registry.dirty = false;
  for (uint64_t files = reader.Length(); files > 0; --files) {
    std::vector<std::string>& names = registry.entries[std::string(reader.String())];
    for (uint64_t count = reader.Length(); count > 0; --count) names.emplace_back(reader.String());
  }
}

ScannedFile* FindScanned(BuildFiles& builder, std::string_view path) {
  const auto known = builder.scannedByPath.find(path);
  if (known != builder.scannedByPath.end()) return known->second.get();
  ProjectFile* file = builder.FindFile(path);
  if (file) return &builder.GetScannedFile(*file);
  TraceWriter() << "*** Cannot find file " << path << "\n";
  return nullptr;
}

bool IsImported(const BuildFiles& builder, const ProjectFile& file) {
  return std::any_of(builder.scannedByPath.begin(), builder.scannedByPath.end(), [&](const auto& entry) {
    const auto& imports = entry.second->imports;
    return std::any_of(imports.begin(), imports.end(), [&](const auto* import) { return &import->file == &file; });
  });
}

// Whether what was read is of this project, as far as its paths tell: else the main source would register for good what
// another project declares.
bool FitsProject(const BuildFiles& builder) {
  const auto isOwn = [&](const ProjectFile& file) { return file.project == &builder.project; };
  const auto fits = [&](const DeclarationRegistry& registry) {
    return std::all_of(registry.entries.begin(), registry.entries.end(), [&](const auto& entry) {
      const ProjectFile* file = builder.FindFile(entry.first);
      return file && (isOwn(*file) || IsImported(builder, *file));
    });
  };
  const bool hasOwn = std::any_of(builder.scannedByPath.begin(), builder.scannedByPath.end(),
                                  [&](const auto& entry) { return isOwn(entry.second->file); });
  return (hasOwn || builder.scannedByPath.empty()) && fits(builder.registerMap) && fits(builder.unregisterMap);
}

}  // namespace

std::string DependencyPayload(const BuildFiles& builder) {
  std::vector<const ScannedFile*> files;
  for (const auto& [path, file] : builder.scannedByPath) files.push_back(file.get());
  std::sort(files.begin(), files.end(),
            [](const ScannedFile* a, const ScannedFile* b) { return a->file.path < b->file.path; });
  std::string payload;
  for (const ScannedFile* file : files) {
    AppendCompactString(payload, file->file.path);
    AppendNumber(payload, static_cast<uint64_t>(file->times.translation), 8);
    AppendNumber(payload, file->imports.size(), 4);
    for (const ScannedFile* import : file->imports) AppendCompactString(payload, import->file.path);
    payload += file->hasDeclarations ? '\1' : '\0';
  }
  AppendCompactString(payload, "");
  AppendRegistry(payload, builder.registerMap);
  AppendRegistry(payload, builder.unregisterMap);
  return payload;
}

bool ParseDependencyPayload(BuildFiles& builder, std::string_view payload) {
  PayloadReader reader(payload);
  for (std::string_view path; !(path = reader.String()).empty();) {
    ScannedFile* file = FindScanned(builder, path);
    if (!file) return false;
    file->times.translation = static_cast<int64_t>(reader.Number(8));
    for (uint64_t count = reader.Number(4); count > 0; --count) {
      ScannedFile* import = FindScanned(builder, reader.String());
      if (!import) return false;
      file->imports.push_back(import);
    }
    file->hasDeclarations = reader.Number(1) != 0;
  }
  ReadRegistry(reader, builder.registerMap);
  ReadRegistry(reader, builder.unregisterMap);
  return FitsProject(builder);
}

bool LoadDependencyFile(BuildFiles& builder, const std::string& path) {
  std::string payload;
  if (!ReadCheckedFile(kMagic, payload, path)) return false;
  bool loaded = false;
  try {
    loaded = ParseDependencyPayload(builder, payload);
  } catch (const IException& exception) {
    TraceWriter() << "*** Error reading " << path << " : " << exception << "\n";
  }
  builder.dependencyFileLoaded = loaded;
  if (!loaded) {
    builder.scanned.clear();
    builder.scannedByPath.clear();
    builder.registerMap.entries.clear();
    builder.unregisterMap.entries.clear();
  }
  return loaded;
}

void SaveDependencyFile(BuildFiles& builder, const std::string& path) {
  CreateDirectories(path, false);
  builder.settings.leftovers.Beside(path);
  try {
    WriteCheckedFile(kMagic, DependencyPayload(builder), path);
    builder.registerMap.dirty = builder.unregisterMap.dirty = false;
  } catch (const FileException&) {
    TraceWriter() << "*** Couldn't save dependency file " << path << "\n";
  }
}

}  // namespace qrex
