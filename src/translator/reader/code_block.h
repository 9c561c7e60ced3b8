// A block of C++ behind a section word or a signature in a class body, copied with what `$` means in it.
#pragma once

#include <string>
#include <string_view>

#include "translator/types/type_view.h"

namespace qrex {

class ClassDef;
class QrexParser;

// On the `{`. Copies through the matching `}` and up to the next token, which is current afterwards, and ends the line.
void CopyCodeBlock(QrexParser& parser, ClassDef& def);
// Text that does not stay where it is written: with marks for its lines where `#line` is wanted.
std::string MarkedText(const QrexParser& parser, const char* begin, const char* end);
// Behind a `=`: a block in braces and a `;`, or an expression up to `;`, as "name = expression" without a `;` of its
// own. The current token is the `;` afterwards, and the text is dropped from the source.
std::string ReadShortBody(QrexParser& parser, const ClassDef& def, const std::string& name);
// The text between the braces; the current token is the closing one afterwards.
std::string ReadBraceContent(QrexParser& parser, const ClassDef& def);

// By value are numbers, characters and pointers; " const&" for all other types.
std::string_view PassingSuffix(TypeView type);

// The marks before a cached or dependent declaration: `-`, `^`.
struct NodeHead {
  bool reflected = false;
  bool hard = false;
};
NodeHead ReadNodeHead(QrexParser& parser, const ClassDef& def);

}  // namespace qrex
