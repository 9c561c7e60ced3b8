// Reading an $interface, and expanding its attributes to methods.
#pragma once

namespace qrex {

class ClassDef;
class QrexParser;

void ParseInterface(QrexParser& parser, ClassDef* enclosing);  // `enclosing`: null at file level

}  // namespace qrex
