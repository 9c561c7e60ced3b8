#include "translator/kinds/variant_def.h"

#include <algorithm>

#include "translator/emit/byte_code.h"
#include "translator/symbols/scanned_file.h"

namespace qrex {

std::string VariantItem::MangledTagName() const {
  std::string mangled = "tag_";
  for (char c : EffectiveName()) {
    switch (c) {
      case '*':
        mangled += "_ptr_";
        break;
      case '&':
        mangled += "_ref_";
        break;
      case '<':
        mangled += "_6_";
        break;
      case '>':
        mangled += "_9_";
        break;
      case ':':
        mangled += "_8_";
        break;
      case ',':
        mangled += "_";
        break;
      case ' ':
        break;
      default:
        mangled += c;
        break;
    }
  }
  return mangled;
}

void VariantDef::CollectReferences(std::vector<const NameSpaceElement*>& out) const {
  for (const auto& item : m_items) {
    if (!item->isStruct) CollectNamedTypes(item->type, *owner.rootNameSpace, out);
  }
}

bool VariantDef::ContainsMetaData() const {
  return !metadata.empty() || std::any_of(m_items.begin(), m_items.end(), [](const auto& item) {
    return item->isStruct ? std::any_of(item->fields.begin(), item->fields.end(),
                                        [](const ClassField& field) { return HasMetadata(field.type); })
                          : HasMetadata(item->type);
  });
}

bool VariantDef::AllVoid() const {
  return std::all_of(m_items.begin(), m_items.end(), [](const auto& item) { return item->isVoid; });
}

// An item under test counts as passing, so a recursive variant terminates.
bool VariantDef::HasSerialise() const {
  if (m_qualifiers.ar != TriState::Unset) return m_qualifiers.ar == TriState::On;
  if (m_hasSerialise == Memo::NotComputed) {
    m_hasSerialise = Memo::BeingComputed;
    NameSpace& root = *owner.rootNameSpace;
    const bool can = std::all_of(m_items.begin(), m_items.end(), [&](const auto& item) {
      if (item->isVoid) return true;
      if (!item->isStruct) return IsSerialisable(item->type, root);
      return std::all_of(item->fields.begin(), item->fields.end(),
                         [&](const ClassField& field) { return IsSerialisable(field.type, root); });
    });
    m_hasSerialise = can ? Memo::Yes : Memo::No;
  }
  return m_hasSerialise != Memo::No;
}

bool VariantDef::CanSerialise() const { return OnOr(m_qualifiers.ser, HasSerialise()); }

bool VariantDef::ItemVisits(const VariantItem& item, bool (*test)(TypeView, NameSpace&)) const {
  NameSpace& root = *owner.rootNameSpace;
  if (!item.isStruct) return test(item.type, root);
  return std::any_of(item.fields.begin(), item.fields.end(),
                     [&](const ClassField& field) { return test(field.type, root); });
}

bool VariantDef::AnyItemVisits(Memo& memo, bool (*test)(TypeView, NameSpace&)) const {
  if (memo == Memo::NotComputed) {
    memo = Memo::BeingComputed;
    const bool any =
        std::any_of(m_items.begin(), m_items.end(), [&](const auto& item) { return ItemVisits(*item, test); });
    memo = any ? Memo::Yes : Memo::No;
  }
  return memo == Memo::Yes;
}

bool VariantDef::IsIObjectVisitable() const { return AnyItemVisits(m_visitsObjects, NeedsVisitObjects); }
bool VariantDef::IsPrefVisitable() const { return AnyItemVisits(m_visitsPrefs, NeedsVisitPrefs); }

std::string_view VariantDef::NamedVoidItem() const {
  for (const auto& item : m_items) {
    if (item->isVoid && item->IsNamed()) return item->name;
  }
  return {};
}

uint32_t VariantDef::TypeOpsBits() const {
  uint32_t bits = kOpsDestruct;
  if (m_qualifiers.compare != TriState::Off) bits |= kOpsEqual | kOpsLess;
  if (m_qualifiers.print != TriState::Off) bits |= kOpsPrint;
  if (CanSerialise()) bits |= kOpsSerialise;
  if (m_hasDefault) bits |= kOpsConstruct;
  if (m_qualifiers.copy != TriState::Off) bits |= kOpsCopy;
  if (IsIObjectVisitable()) bits |= kOpsVisitObjects;
  if (IsPrefVisitable()) bits |= kOpsVisitPrefs;
  return bits;
}

}  // namespace qrex
