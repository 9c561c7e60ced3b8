// What all reflection records share: where their text goes, how it is wrapped, and how registration functions of things
// end in one function per project.
#pragma once

#include <string>
#include <vector>

#include "translator/emit/byte_code.h"
#include "translator/emit/emit.h"
#include "translator/symbols/name_space.h"
#include "translator/symbols/scanned_file.h"

namespace qrex {

class QrexParser;

// --- Pieces of NameSpaceElement::WriteReflection, for kinds that vary the common shape.
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

// --- $type
void ParseType(QrexParser& parser);

// --- Tails
// Writes the tails of the imports that this .cpp must register and its own, and stores the lists in the registries.
void WriteReflectionTails(ScannedFile& file, TextWriter& out);
// Register_Project_P or Unregister_Project_P.
void WriteProjectRegistration(const ScannedFile& mainFile, const DeclarationRegistry& registry, TextWriter& out);

}  // namespace qrex
