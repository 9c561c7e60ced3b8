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
  GlobalFunctionDef(ScannedFile& owner, const char* position) : GlobalDef(owner, position, DeclKind::Function) {}
  bool HaveSomethingToRegister() const override { return status == DeclStatus::Defined && m_registered; }
  void WriteReflectedDefinition(TextWriter& out) override;
  void CollectReferences(std::vector<const NameSpaceElement*>& out) const override;
  bool ContainsMetaData() const override { return !metadata.empty() || SignatureHasMetadata(m_signature); }

  FunctionSignature m_signature;
};

class GlobalVarDef : public GlobalDef {
 public:
  GlobalVarDef(ScannedFile& owner, const char* position) : GlobalDef(owner, position, DeclKind::Var) {
    status = DeclStatus::Defined;
  }
  bool HaveSomethingToRegister() const override { return m_registered; }
  void WriteReflectedDefinition(TextWriter& out) override;
  void CollectReferences(std::vector<const NameSpaceElement*>&) const override {}
  bool ContainsMetaData() const override { return !metadata.empty() || HasMetadata(m_type); }

  TypeCode m_type;
};

class TypedefDef : public GlobalDef, public TypedefTarget {
 public:
  TypedefDef(ScannedFile& owner, const char* position) : GlobalDef(owner, position, DeclKind::Typedef) {
    status = DeclStatus::Defined;
  }
  bool HaveSomethingToRegister() const override { return m_reflected; }
  void WriteReflectedDefinition(TextWriter& out) override;
  void CollectReferences(std::vector<const NameSpaceElement*>&) const override {}
  bool ContainsMetaData() const override { return !metadata.empty() || HasMetadata(m_type); }
  const TypeCode& TargetType() const override { return m_type; }

  TypeCode m_type;
};

}  // namespace qrex
