// The macro parser: copies a text to a sink token by token and acts on @ directives, macro and variable names, and
// $(name) in double-quoted strings. One routine calls itself for every nested body; there is no tree.
#pragma once

#include <string>

#include "macro/frame.h"
#include "macro/source_map.h"

namespace qrex {

class ImportHandler {
 public:
  virtual bool ImportPath(const std::string& path, const char* position);                  // false: not supported here
  virtual bool Import(LSFrame& frame, const std::string& path, const char* position) = 0;  // false: not found
  // What to tell on a terminal when a file was not found: where it was looked for.
  virtual std::string ImportHint(const std::string& path) const;
  virtual std::string PlaceOf(const char* position) const;  // "file(line)" of a place in a source, or nothing
  virtual ~ImportHandler() = default;
};

void Expand(ImportHandler* handler, LSFrame& frame, const TextRange& text, int64_t stripIndent, int64_t outIndent,
            ExpansionSink& sink);
std::string ExpandToString(ImportHandler* handler, LSFrame& frame, const TextRange& text, int64_t stripIndent = 0,
                           int64_t outIndent = 0);
// The entries for whole files. The second doesn't copy a text in which nothing is to be changed: the answer is `text`
// itself then, else what it put into `storage`.
std::string ExpandToStringWithMap(ImportHandler* handler, LSFrame& frame, const TextRange& text, int64_t stripIndent,
                                  int64_t outIndent, SourceMap& map);
// Keeps the calls if the map that it is given does.
TextRange ExpandWithMap(ImportHandler* handler, LSFrame& frame, const TextRange& text, int64_t stripIndent,
                        int64_t outIndent, std::string& storage, SourceMap& map);
std::string EvaluateAsText(LSFrame& frame, const TextRange& text, VarType type);

}  // namespace qrex
