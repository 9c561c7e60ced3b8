// The `$` items of a class body that have parsers of their own. Each is called with its word as the current token and
// leaves the current token on the last one of its declaration, unless it says otherwise.
#pragma once

#include "translator/declared/class_def.h"

namespace qrex {

class QrexParser;

void ParseDep(QrexParser& parser, ClassDef& def);
void ParseIndep(QrexParser& parser, ClassDef& def);
void ParseEvict(QrexParser& parser, ClassDef& def);  // advances by itself
void ParseVisit(QrexParser& parser, ClassDef& def);  // advances by itself
void ParseCache(QrexParser& parser, ClassDef& def);  // advances by itself: the token behind the body is examined

}  // namespace qrex
