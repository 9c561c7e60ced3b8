// $variant: a tagged union of named or anonymous alternatives, with a complete set of value operations.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "translator/declared/class_def.h"
#include "translator/declared/qualifiers.h"
#include "translator/emit/records.h"
#include "translator/symbols/type_predicates.h"

namespace qrex {

struct VariantItem {
  bool isStruct = false;  // { ... } name
  std::vector<ClassField> fields;
  TypeCode type;
  std::string name;  // may be empty for a non-struct item
  bool onHeap = false;
  size_t tag = 0;
  std::string typeText;
  bool isVoid = false;

  bool IsNamed() const { return !name.empty(); }
  const std::string& EffectiveName() const { return IsNamed() ? name : typeText; }
  std::string MangledTagName() const;
};

class VariantDef : public RecordedElement, public TypeBehaviour {
 public:
  VariantDef(ScannedFile& owner, const char* position) : RecordedElement(owner, position, DeclKind::Variant) {}
  bool HaveSomethingToRegister() const override { return status == DeclStatus::Defined && m_reflected; }
  void WriteReflectedDefinition(TextWriter& out) override;
  void CollectReferences(std::vector<const NameSpaceElement*>& out) const override;
  bool ContainsMetaData() const override;

  bool HasSerialise() const;           // of its own
  bool CanSerialise() const override;  // as a type of items and fields
  bool HasDefaultValue() const override { return m_hasDefault; }
  std::string_view NamedVoidItem() const override;
  bool IsIObjectVisitable() const override;
  bool IsPrefVisitable() const override;
  bool ItemVisits(const VariantItem& item, bool (*test)(TypeView, NameSpace&)) const;
  bool AllVoid() const;
  bool WritesToStream() const { return m_qualifiers.os != TriState::Off; }
  uint32_t TypeOpsBits() const;
  // Where its members are defined. Behind a nested class there is no place for them but within the enclosing one.
  Placement MemberPlacement() const {
    return m_nested && WantsCompilableText() ? Placement::InClass : Placement::OutOfClass;
  }

  bool m_hasDefault = false;
  ClassQualifiers m_qualifiers;
  std::vector<std::unique_ptr<VariantItem>> m_items;

 private:
  enum class Memo { NotComputed, BeingComputed, No, Yes };
  mutable Memo m_hasSerialise = Memo::NotComputed;
  mutable Memo m_visitsObjects = Memo::NotComputed, m_visitsPrefs = Memo::NotComputed;
  bool AnyItemVisits(Memo& memo, bool (*test)(TypeView, NameSpace&)) const;
};

}  // namespace qrex
