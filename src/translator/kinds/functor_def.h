// $functor: a callable value of an object pointer and a stub function.
#pragma once

#include "translator/emit/records.h"
#include "translator/types/type_code.h"

namespace qrex {

class FunctorDef : public RecordedElement {
 public:
  FunctorDef(ScannedFile& owner, const char* position) : RecordedElement(owner, position, Category::Functor) {
    traitsKind = TraitsKind::Functor;
    status = DeclStatus::Defined;
  }
  std::string_view GetKeyword() const override { return "functor"; }
  std::string_view GetReflectedKindName() const override { return "Functor"; }
  bool HaveSomethingToRegister() const override { return true; }
  void WriteReflectedDefinition(TextWriter& out) override;
  DeclStatus GetDeclStatus() const override { return DeclStatus::Defined; }
  void CollectReferences(std::vector<const NameSpaceElement*>& out) const override;
  bool ContainsMetaData() const override { return !metadata.empty() || SignatureHasMetadata(signature); }

  FunctionSignature signature;
};

}  // namespace qrex
