// $type: makes a type that has no declaration of its own, such as a container, known to the registry.
#pragma once

#include "text/text_writer.h"
#include "translator/symbols/scanned_file.h"

namespace qrex {

class QrexParser;

void ParseType(QrexParser& parser);
void CheckNestedRecord(QrexParser& parser, const NameSpaceElement& element);  // W1018 at what is reflected in a class
void WriteTypeRegistration(TextWriter& out, const TypeRegistration& registration,
                           RegistrationLists& lists);  // in a tail

}  // namespace qrex
