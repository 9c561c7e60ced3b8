// What all reflection records share: where their text goes and how it is wrapped.
#pragma once

#include <string>
#include <vector>

#include "translator/emit/byte_code.h"
#include "translator/emit/emit.h"
#include "translator/symbols/name_space.h"

namespace qrex {

// Base of all kinds but name spaces: the common shape of a tail's entry.
class RecordedElement : public NameSpaceElement {
 public:
  using NameSpaceElement::NameSpaceElement;
  void WriteReflection(TextWriter& out, RegistrationLists& lists) override;  // comment, name spaces, record, function
};

// --- Pieces of RecordedElement::WriteReflection, for kinds that vary the common shape.
void WriteReflectionHead(TextWriter& out, const NameSpaceElement& element);  // "\n//### ..." and the target declaration
void WriteRegistration(TextWriter& out, const NameSpaceElement& element, RegistrationLists& lists);  // if m_registered

// The byte code arrays of a signature, PREFIX_metadata, PREFIX_return, PREFIX_arg each, and the table PREFIX_args.
void WriteSignatureArrays(TextWriter& out, const std::string& prefix, const FunctionSignature& signature,
                          StringTable& strings, std::string_view infix = "_");
// What the records of functors and functions tell of these, from the qualified name to the string table.
void WriteSignatureRows(TextWriter& out, const NameSpaceElement& element, const FunctionSignature& signature,
                        const StringTable& strings);

// --- At the place of a declaration: closes the open name spaces, writes the TypeTraits block, reopens them.
void WriteTypeTraits(TextWriter& out, const NameSpaceElement& element);

}  // namespace qrex
