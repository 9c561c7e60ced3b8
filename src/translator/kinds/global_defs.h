// $function, $polymorphic, $var, $typedef: declarations at name-space level that are no types of their own (but a
// typedef).
#pragma once

#include "translator/symbols/name_space.h"
#include "translator/symbols/type_predicates.h"
#include "translator/types/type_code.h"

namespace qrex {

// Their record is local to the registration function: there is no _GetReflected.
class GlobalDef : public NameSpaceElement {
 public:
  using NameSpaceElement::NameSpaceElement;
  void WriteReflection(TextWriter& out, RegistrationLists& lists) override;
};

class GlobalFunctionDef : public GlobalDef {
 public:
  GlobalFunctionDef(ScannedFile& owner, const char* position) : GlobalDef(owner, position, Category::GlobalFunction) {}
  std::string_view GetKeyword() const override { return "function"; }
  std::string_view GetReflectedKindName() const override { return "GlobalFunction"; }
  bool HaveSomethingToRegister() const override { return status == DeclStatus::Defined && m_registered; }
  void WriteReflectedDefinition(TextWriter& out) override;
  DeclStatus GetDeclStatus() const override { return status; }
  void CollectReferences(std::vector<const NameSpaceElement*>& out) const override;
  bool ContainsMetaData() const override { return !metadata.empty() || SignatureHasMetadata(signature); }

  FunctionSignature signature;
};

class GlobalVarDef : public GlobalDef {
 public:
  GlobalVarDef(ScannedFile& owner, const char* position) : GlobalDef(owner, position, Category::GlobalVar) {}
  std::string_view GetKeyword() const override { return "var"; }
  std::string_view GetReflectedKindName() const override { return "GlobalVariable"; }
  bool HaveSomethingToRegister() const override { return m_registered; }
  void WriteReflectedDefinition(TextWriter& out) override;
  DeclStatus GetDeclStatus() const override { return DeclStatus::Defined; }
  void CollectReferences(std::vector<const NameSpaceElement*>&) const override {}
  bool ContainsMetaData() const override { return !metadata.empty() || HasMetadata(type); }

  TypeCode type;
};

class TypedefDef : public GlobalDef, public TypedefTarget {
 public:
  TypedefDef(ScannedFile& owner, const char* position) : GlobalDef(owner, position, Category::Typedef) {}
  std::string_view GetKeyword() const override { return "typedef"; }
  std::string_view GetReflectedKindName() const override { return "Typedef"; }
  bool HaveSomethingToRegister() const override { return m_reflected; }
  void WriteReflectedDefinition(TextWriter& out) override;
  DeclStatus GetDeclStatus() const override { return DeclStatus::Defined; }
  void CollectReferences(std::vector<const NameSpaceElement*>&) const override {}
  bool ContainsMetaData() const override { return !metadata.empty() || HasMetadata(type); }
  const TypeCode& TargetType() const override { return type; }

  TypeCode type;
};

}  // namespace qrex
