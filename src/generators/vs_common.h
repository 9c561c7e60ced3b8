// What the project formats of Visual Studio share.
#pragma once

#include <string>
#include <string_view>

#include "generators/form.h"
#include "workspace/project_model.h"

namespace qrex {

inline std::string ConfigSpec(const ProjectConfig& config) { return config.name + "|" + config.platform; }

// The content of an include property whose option value is `value`: the project's own directories ahead of its items,
// and for an item that begins with $(VIRTUAL_TREE) one entry for each root.
std::string IncludeList(const Project& project, const ProjectConfig& config, std::string_view value, Form form);

// The properties of the librarian (for a static library) or of the linker.
OptionMap LinkerOptions(const Project& project, const ProjectConfig& config);

}  // namespace qrex
