// A set of small numbers as bits: what a file sees among thousands of others.
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

namespace qrex {

class IndexSet {
 public:
  void Add(size_t index) {
    if (m_words.size() <= index / 64) m_words.resize(index / 64 + 1);
    m_words[index / 64] |= uint64_t{1} << (index % 64);
  }
  void Add(const IndexSet& other) {
    if (m_words.size() < other.m_words.size()) m_words.resize(other.m_words.size());
    for (size_t i = 0; i < other.m_words.size(); ++i) m_words[i] |= other.m_words[i];
  }
  bool Has(size_t index) const { return index / 64 < m_words.size() && (m_words[index / 64] >> (index % 64) & 1) != 0; }
  bool Empty() const { return m_words.empty(); }

 private:
  std::vector<uint64_t> m_words;
};

}  // namespace qrex
