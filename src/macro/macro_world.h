// What all frames and expansions of one run share. Frames of different worlds never meet, so a process may hold several
// runs. Not safe for use by several threads.
#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "text/message.h"
#include "text/source_texts.h"

namespace qrex {

class ExpansionSink;
class LSVariable;

// A Bloom filter over all defined names: by first byte the lengths that occur, and a bit for some more of a name's
// bytes. False means certainly undefined; most words of a text are settled here without searching the frames.
class NamesInUse {
 public:
  bool MayHold(std::string_view name) const {
    if ((m_lengths[FirstOf(name)] >> (name.size() % 64) & 1) == 0) return false;
    const size_t bit = BitOf(name);
    return (m_bits[bit / 64] >> (bit % 64) & 1) != 0;
  }
  void Add(std::string_view name) {
    if (MayHold(name)) return;
    m_lengths[FirstOf(name)] |= uint64_t{1} << (name.size() % 64);
    const size_t bit = BitOf(name);
    m_bits[bit / 64] |= uint64_t{1} << (bit % 64);
    ++m_changes;
  }
  uint64_t Changes() const { return m_changes; }  // as long as it stays, so do the answers

 private:
  static constexpr size_t kBits = 16384;
  static unsigned char ByteOf(std::string_view name, size_t at) { return static_cast<unsigned char>(name[at]); }
  static unsigned char FirstOf(std::string_view name) { return name.empty() ? 0 : ByteOf(name, 0); }
  static size_t BitOf(std::string_view name) {
    if (name.empty()) return 0;
    const size_t last = name.size() - 1;
    return ((ByteOf(name, 0) * size_t{31} + ByteOf(name, last)) * 31 + ByteOf(name, last / 2) * 7 + last) % kBits;
  }
  uint64_t m_lengths[256] = {};
  uint64_t m_bits[kBits / 64] = {};
  uint64_t m_changes = 0;
};

// The definitions of each name in all file frames.
class DefinitionTable {
 public:
  struct Entry {
    size_t frame;
    LSVariable* variable;
  };

  // The table's own text of the name; it stays until the entry is removed.
  std::string_view Enter(std::string_view name, size_t frame, LSVariable* variable);
  void Replace(std::string_view name, size_t frame, LSVariable* variable);
  void Remove(std::string_view name, size_t frame);
  const std::vector<Entry>* Find(std::string_view name) const {
    auto found = m_entries.find(name);
    return found == m_entries.end() ? nullptr : &found->second;
  }

 private:
  struct Hash : std::hash<std::string_view> {
    using is_transparent = void;
  };
  std::unordered_map<std::string, std::vector<Entry>, Hash, std::equal_to<>> m_entries;
};

// Bounds on one text with all that it calls: macros that multiply end with a message before time and memory do.
struct ExpansionLimits {
  int64_t parts = 100'000'000;       // bodies, blocks, arguments and conditions
  int64_t bytes = int64_t{1} << 30;  // of all texts in progress, with their maps
  int64_t iterations = 1'000'000;    // of one @while
};

struct MacroWorld {
  const SourceTexts* sources = &DiskTexts();     // where all texts of the run are read
  MessageConsumer* messages = &TraceMessages();  // takes what is to be told of them
  NamesInUse names;
  DefinitionTable definitions;
  size_t fileFrames = 0;  // made so far
  ExpansionLimits limits;
  ExpansionSink* sink = nullptr;  // of the innermost expansion
  int nesting = 0;                // of expansions that run
  int importDepth = 0;            // of files that are brought up to date for others
  int64_t parts = 0;              // of the text at nesting 0
};

}  // namespace qrex
