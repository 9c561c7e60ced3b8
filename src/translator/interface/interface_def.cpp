#include "translator/interface/interface_def.h"

#include <algorithm>

#include "translator/symbols/scanned_file.h"
#include "translator/symbols/type_predicates.h"

namespace qrex {

bool InterfaceDef::HaveSomethingToRegister() const {
  return status == DeclStatus::Defined && (m_reflected || m_isIpc || m_isRmi);
}

void InterfaceDef::CollectReferences(std::vector<const NameSpaceElement*>& out) const {
  out.insert(out.end(), m_bases.begin(), m_bases.end());
  for (const FunctionSignature& method : m_methods) CollectNamedTypes(method, *owner.rootNameSpace, out);
}

bool InterfaceDef::ContainsMetaData() const {
  return !metadata.empty() || std::any_of(m_methods.begin(), m_methods.end(), SignatureHasMetadata) ||
         std::any_of(m_attributes.begin(), m_attributes.end(),
                     [](const AttributeDef& attribute) { return HasMetadata(attribute.type); });
}

std::vector<InterfaceDef::FlatBase> InterfaceDef::FlattenedBases() const {
  std::vector<FlatBase> flat;
  AddFlattenedBases(flat, "");
  return flat;
}

void InterfaceDef::AddFlattenedBases(std::vector<FlatBase>& flat, const std::string& path) const {
  for (const InterfaceDef* base : m_bases) {
    const bool isKnown =
        std::any_of(flat.begin(), flat.end(), [&](const FlatBase& known) { return known.base == base; });
    if (isKnown) continue;  // and so are its own bases
    const std::string basePath = path + "_" + base->name;
    base->AddFlattenedBases(flat, basePath + ".");
    flat.push_back({base, basePath});
  }
}

bool InterfaceDef::InheritsFrom(std::string_view qualifiedName) const {
  return GetQualifiedName() == qualifiedName || std::any_of(m_bases.begin(), m_bases.end(), [&](const auto* base) {
           return base->InheritsFrom(qualifiedName);
         });
}

size_t InterfaceDef::InheritedMethodCount() const {
  size_t count = 0;
  for (const InterfaceDef* base : m_bases) count += base->m_methods.size() + base->InheritedMethodCount();
  return count;
}

}  // namespace qrex
