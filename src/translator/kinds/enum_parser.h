// Reading an $enum.
#pragma once

namespace qrex {

class ClassDef;
class QrexParser;

void ParseEnum(QrexParser& parser, ClassDef* enclosing);  // `enclosing`: null at file level

}  // namespace qrex
