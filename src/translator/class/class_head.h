// The part of a class statement between its qualifiers and its body: interfaces, bases, model, mixin list, and the C++
// head they make.
#pragma once

#include <vector>

#include "translator/declared/class_def.h"

namespace qrex {

class QrexParser;

void ParseIsaList(QrexParser& parser, ClassDef& def);
// One comma-separated list of bases; those that resolve to a class of this file's view are appended.
void ParseBaseList(QrexParser& parser, std::vector<ClassDef*>& bases);
// True when the TypeTraits block has been written here, ahead of the class text.
bool ParseClassHead(QrexParser& parser, ClassDef& def, bool isFinal);

}  // namespace qrex
