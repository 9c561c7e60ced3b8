#include <algorithm>

#include "report/page.h"

namespace qrex {

// What a step needs has begun ahead of it, so that one walk in the order of the beginnings knows the longest chains.
std::vector<size_t> CriticalPath(const BuildRecord& record) {
  constexpr size_t kNone = ~size_t{0};
  struct Chain {
    int64_t length = 0;
    size_t before = kNone;
  };
  std::vector<Chain> chains(record.spans.size());
  std::unordered_map<std::string_view, size_t> makers;  // of outputs
  size_t last = kNone;
  for (size_t i = 0; i < record.spans.size(); ++i) {
    const Span& span = record.spans[i];
    Chain& chain = chains[i];
    const auto follow = [&](const std::string& input) {
      const auto maker = makers.find(input);
      if (maker == makers.end() || chains[maker->second].length <= chain.length) return;
      chain = {chains[maker->second].length, maker->second};
    };
    for (const std::string& input : span.task.inputs) follow(input);
    follow(span.task.output);  // of a tool that goes on with what another one has made of it
    chain.length += span.end - span.begin;
    if (span.kind == Span::Kind::Tool || span.writes) makers[span.task.output] = i;
    if (last == kNone || chain.length > chains[last].length) last = i;
  }
  std::vector<size_t> path;
  for (size_t at = last; at != kNone; at = chains[at].before) path.push_back(at);
  std::reverse(path.begin(), path.end());
  return path;
}

}  // namespace qrex
