// $enum: a C++ enumeration with a fixed underlying int, or a class over a base of the runtime that wraps one.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "translator/declared/qualifiers.h"
#include "translator/emit/records.h"

namespace qrex {

class EnumDef : public RecordedElement {
 public:
  EnumDef(ScannedFile& owner, const char* position) : RecordedElement(owner, position, DeclKind::Enum) {}
  bool HaveSomethingToRegister() const override { return status == DeclStatus::Defined; }
  void WriteReflectedDefinition(TextWriter& out) override;
  void CollectReferences(std::vector<const NameSpaceElement*>&) const override {}

  bool HasDisabledLabel() const;

  TriState m_extern{};
  bool m_isClass = false;
  std::vector<std::string> m_labels;
  size_t m_defaultIndex = 0;
  std::vector<int64_t> m_values;  // empty, or one per label
  std::vector<bool> m_enabled;    // one per label
};

}  // namespace qrex
