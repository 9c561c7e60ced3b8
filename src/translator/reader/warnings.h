// The warnings of the translator: which of them are on.
#pragma once

#include <bitset>
#include <cstdint>
#include <vector>

namespace qrex {

class Warnings {
 public:
  static constexpr int kFirst = 1000, kLast = 1020;
  // Those of compilableText, without which `$warning` does not know them.
  static constexpr int kCannotCompile = 1018;
  static constexpr int kTwoModels = 1019;
  static constexpr int kEarlierRelease = 1020;
  static bool IsCode(int64_t code, bool compilableText) {
    return code >= kFirst && code <= kLast && (code < kCannotCompile || compilableText);
  }

  Warnings() { m_on.set(); }
  bool On(int code) const { return m_on[Index(code)]; }
  void Set(int code, bool on) { m_on[Index(code)] = on; }
  void Push() { m_saved.push_back(m_on); }
  void Pop() {  // only after a Push
    m_on = m_saved.back();
    m_saved.pop_back();
  }
  bool HasSaved() const { return !m_saved.empty(); }

 private:
  using Flags = std::bitset<kLast - kFirst + 1>;
  static size_t Index(int code) { return static_cast<size_t>(code - kFirst); }

  Flags m_on;
  std::vector<Flags> m_saved;
};

}  // namespace qrex
