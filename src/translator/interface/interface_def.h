// Interfaces: handle structs with a function table, and what classes ask of them.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "translator/emit/records.h"
#include "translator/types/type_code.h"

namespace qrex {

struct AttributeDef {
  std::string name;
  TypeCode type;
};

class InterfaceDef : public RecordedElement {
 public:
  InterfaceDef(ScannedFile& owner, const char* position) : RecordedElement(owner, position, DeclKind::Interface) {}

  bool HaveSomethingToRegister() const override;
  void WriteReflectedDefinition(TextWriter& out) override;
  void WriteReflection(TextWriter& out, RegistrationLists& lists) override;
  void CollectReferences(std::vector<const NameSpaceElement*>& out) const override;
  bool ContainsMetaData() const override;
  void WriteExtraTraits(TextWriter& out) const override;

  // Deeper bases first, each once, with the path by which it was first reached ("_B._A").
  struct FlatBase {
    const InterfaceDef* base;
    std::string path;
  };
  std::vector<FlatBase> FlattenedBases() const;
  void AddFlattenedBases(std::vector<FlatBase>& flat, const std::string& path) const;
  bool InheritsFrom(std::string_view qualifiedName) const;  // is it, or has it among its bases
  bool SubtypesIObject() const { return InheritsFrom("vesk::IObject"); }
  size_t InheritedMethodCount() const;  // once per path

  bool m_isIpc = false;
  bool m_isRmi = false;
  std::vector<InterfaceDef*> m_bases;
  size_t m_numTables = 1;  // its own and those of its bases, which its function table embeds once per path
  std::vector<FunctionSignature> m_methods;  // declared ones, then those made from attributes
  std::vector<AttributeDef> m_attributes;
};

}  // namespace qrex
