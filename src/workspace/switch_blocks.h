// Switch blocks of project files: what they add to or take from option maps, and option maps as command lines.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "macro/mpfw_parser.h"
#include "workspace/project_model.h"
#include "workspace/switch_tables.h"

namespace qrex {

// The entries that a block names, to be added or taken away.
struct SwitchChanges {
  OptionMap entries;
  bool isRemoval = false;
  std::span<const SwitchProperty> lists;  // the properties whose values are lists

  void Apply(OptionMap& options) const;  // of a configuration, or additions to one file
  // Takes from what a file inherits: its record can only add, so flags are turned, and a list stops inheriting.
  void ApplyToFile(OptionMap& record, const OptionMap& configOptions) const;

 private:
  bool IsList(std::string_view property) const { return FindProperty(lists, property) != nullptr; }
};

// The block `{ ... }` at the current token; the parser is behind it afterwards.
SwitchChanges ReadCompilerSwitches(MpfwParser& parser, bool isRemoval);
SwitchChanges ReadResourceSwitches(MpfwParser& parser, bool isRemoval);

void WriteCompilerSwitches(TextWriter& out, const ProjectFile& file, const ProjectConfig& config);
void WriteResourceSwitches(TextWriter& out, const ProjectConfig& config);
bool CreatesPrecompiledHeader(const ProjectFile& file);

// --- List values: items joined by `;`
std::vector<std::string> ListItems(const std::string& list);
void AppendItem(std::string& list, std::string_view item);
void AddMissingItems(std::string& list, const std::string& items);
bool HasItem(const std::string& list, std::string_view item);
void RemoveItems(std::string& list, const std::string& items);
bool ShareItem(const std::string& a, const std::string& b);

}  // namespace qrex
