// The warnings of the translator, and which of them are on.
#pragma once

#include <bitset>
#include <cstdint>
#include <optional>
#include <vector>

namespace qrex {

// The numbers are those that users read and write.
enum class Warning {
  MetadataOfForward = 1000,
  MetadataUnreflected,
  ReferenceUnregistered,
  IsaNoIObject,
  RedundantQualifiers,
  DeprecatedMvector,
  InconsistentIObject,
  IObjectUnreflected,
  ExportedOutsidePublicHeader,
  UnexportedInPublicHeader,
  InconsistentSignatures,
  NotInlineInHeader,
  UndeclaredInLibrary,
  IsaUnreflected,
  ImplementedWithoutIsa,
  PushWithoutPop,
  IsaUndefined,
  DeprecatedExport,
  // Those of compilableText, without which `$warning` does not know them.
  CannotCompile,
  TwoModels,
  EarlierRelease,
};

class Warnings {
 public:
  static std::optional<Warning> OfCode(int64_t code, bool compilableText) {
    const Warning last = compilableText ? kLast : Warning::DeprecatedExport;
    if (code < static_cast<int>(kFirst) || code > static_cast<int>(last)) return std::nullopt;
    return static_cast<Warning>(code);
  }

  Warnings() { m_on.set(); }
  bool On(Warning warning) const { return m_on[Index(warning)]; }
  void Set(Warning warning, bool on) { m_on[Index(warning)] = on; }
  void Push() { m_saved.push_back(m_on); }
  void Pop() {  // only after a Push
    m_on = m_saved.back();
    m_saved.pop_back();
  }
  bool HasSaved() const { return !m_saved.empty(); }

 private:
  static constexpr Warning kFirst = Warning::MetadataOfForward, kLast = Warning::EarlierRelease;
  static constexpr size_t Index(Warning warning) { return static_cast<size_t>(warning) - static_cast<size_t>(kFirst); }
  using Flags = std::bitset<static_cast<size_t>(kLast) - static_cast<size_t>(kFirst) + 1>;

  Flags m_on;
  std::vector<Flags> m_saved;
};

}  // namespace qrex
