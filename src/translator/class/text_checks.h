// Warnings of declarations whose text can't compile or loses something, whatever it is like.
#pragma once

namespace qrex {

class ClassDef;
class QrexParser;

void CheckTextOfClass(QrexParser& parser, const ClassDef& def);  // a whole one
void CheckTextOfMethod(QrexParser& parser, const ClassDef& def, bool isPrivate,
                       const char* position);  // the last method, which begins there

}  // namespace qrex
