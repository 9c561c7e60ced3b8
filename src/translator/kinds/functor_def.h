// $functor: a callable value of an object pointer and a stub function.
#pragma once

#include "translator/emit/records.h"
#include "translator/types/type_code.h"

namespace qrex {

class FunctorDef : public RecordedElement {
 public:
  FunctorDef(ScannedFile& owner, const char* position) : RecordedElement(owner, position, DeclKind::Functor) {
    status = DeclStatus::Defined;
  }
  bool HaveSomethingToRegister() const override { return true; }
  void WriteReflectedDefinition(TextWriter& out) override;
  void CollectReferences(std::vector<const NameSpaceElement*>& out) const override;
  bool ContainsMetaData() const override { return !metadata.empty() || SignatureHasMetadata(m_signature); }

  FunctionSignature m_signature;
};

}  // namespace qrex
