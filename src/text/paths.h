// Path operations on text alone. Paths are UTF-8 with forward slashes and no trailing slash.
#pragma once

#include <string>
#include <string_view>

#include "text/text_writer.h"

namespace qrex {

// Whether a relative path leads, by its "..", above the folder that it begins in.
bool LeadsAbove(std::string_view path);
bool IsAbsolutePath(std::string_view path);
std::string_view DriveOf(std::string_view path);  // with its colon; none: empty
std::string_view FileNameOf(std::string_view path);
std::string FolderOf(std::string_view path);            // empty: it stands in none
bool StemOf(std::string_view path, std::string& stem);  // false, `stem` untouched: no '.', or an empty stem
std::string NormalisePath(std::string_view path);       // '\' to '/', one trailing '/' removed
std::string CollapseDots(std::string_view path);        // each "." is removed, each ".." with the folder ahead of it
bool HasExtension(std::string_view path, std::string_view extension);
bool ReplaceExtension(std::string_view path, std::string_view extension, std::string& out);
std::string PathJoin(std::string_view left, std::string_view right);
std::string PathJoin3(std::string_view a, std::string_view b, std::string_view c);
std::string RelativePath(std::string_view target, std::string_view base);
void ToBackslashes(TextWriter& writer, std::string_view path);
bool EqualIgnoringCase(std::string_view a, std::string_view b);
bool StartsWithIgnoringCase(std::string_view text, std::string_view prefix);

}  // namespace qrex
