// All declarations of a workspace, for `Qrex --reflect`: docs/reflect.md has the form of the JSON.
#pragma once

#include <string>

#include "questions/asked_files.h"

namespace qrex {

std::string ReflectionJson(const Workspace& workspace, const std::vector<ScannedFile*>& files);
std::string ReflectionList(const std::vector<ScannedFile*>& files);  // a line for each, to be read and searched

}  // namespace qrex
