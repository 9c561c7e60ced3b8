// Reading a $variant.
#pragma once

namespace qrex {

class ClassDef;
class QrexParser;

void ParseVariant(QrexParser& parser, ClassDef* enclosing);  // `enclosing`: null at file level

}  // namespace qrex
