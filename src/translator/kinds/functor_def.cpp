#include "translator/kinds/functor_def.h"

#include "translator/symbols/scanned_file.h"
#include "translator/symbols/type_predicates.h"

namespace qrex {

void FunctorDef::CollectReferences(std::vector<const NameSpaceElement*>& out) const {
  CollectNamedTypes(m_signature, *owner.rootNameSpace, out);
}

}  // namespace qrex
