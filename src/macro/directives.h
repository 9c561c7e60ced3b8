// The words behind `@`, and how each treats the line that it is on.
#pragma once

#include <span>
#include <string_view>

#include "macro/expansion_context.h"

namespace qrex {

struct Directive {
  enum class Line {
    Kept,          // what is ahead of it on its line goes out first: its output comes at that column
    Dropped,       // the blanks ahead of it are dropped
    DroppedWhole,  // as well as the rest of its line: it leaves no trace
    OfItsOwn,      // nothing of either: it settles and drops by itself
  };
  std::string_view word;
  Line line;
  void (ExpansionContext::*run)();
  void Run(ExpansionContext& context) const { (context.*run)(); }

  static std::span<const Directive> All();
  static const Directive* Find(std::string_view word);
};

inline const Directive* FindDirective(std::string_view word) { return Directive::Find(word); }

}  // namespace qrex
