// Names in command lines and response files: each stays one word there, and a name. Nothing but the tools that a build
// names may run, whatever its files and folders are called.
#pragma once

#include <initializer_list>
#include <string>
#include <string_view>
#include <vector>

#include "builder/project_builder.h"

namespace qrex {

// In double quotes, for a response file. GNU tools take `\` for an escape.
std::string Quoted(CompilerKind compiler, std::string_view name);
// The words that a tool reads in the text of a response file.
std::vector<std::string> ResponseWords(CompilerKind compiler, std::string_view text);
// A path that is a word of its own: GNU tools must not take it for an option or for a response file.
std::string AsInput(CompilerKind compiler, const std::string& path);
std::string QuotedInput(CompilerKind compiler, const std::string& path);

// False for a path that the tools of the compiler cannot be given: an error that names it is counted.
bool ToolsTake(ProjectBuilder& builder, std::initializer_list<std::string_view> paths);

}  // namespace qrex
