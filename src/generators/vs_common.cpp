#include "generators/vs_common.h"

#include "builder/build_paths.h"
#include "generators/common.h"
#include "text/paths.h"
#include "workspace/linker_text.h"
#include "workspace/switch_blocks.h"

namespace qrex {

std::string IncludeList(const Project& project, const ProjectConfig& config, std::string_view value, Form form) {
  static constexpr std::string_view kTree = "$(VIRTUAL_TREE)";
  const bool isTranslated = IsTranslatedForm(project, form);
  const std::string base = isTranslated ? TranslationDirectory(config) : project.rootDir;
  std::string list = PathJoin(base, project.rootToProjDir) + ";" + PathJoin(base, project.sourceDir);
  if (isTranslated) list += ";" + base;
  for (const std::string& item : ListItems(std::string(value))) {
    if (!item.starts_with(kTree)) {
      list += ";" + item;
      continue;
    }
    for (const std::string& root : project.settings->virtualTree) list += ";" + root + item.substr(kTree.size());
  }
  return list;
}

OptionMap LinkerOptions(const Project& project, const ProjectConfig& config) {
  OptionMap options;
  if (project.targetType == TargetType::StaticLibrary) {
    ParseLibrarianText(project, config, options);
  } else {
    ParseLinkerText(project, config, options);
  }
  return options;
}

}  // namespace qrex
