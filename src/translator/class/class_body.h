// The scanner of class bodies: plain C++ is copied through, `$` items are taken out and replaced.
#pragma once

namespace qrex {

class ClassDef;
class QrexParser;

void ParseClassBody(QrexParser& parser, ClassDef& def);  // on `{`; afterwards on the matching `}`
void ParseFieldOrMethod(QrexParser& parser, ClassDef& def);
void ParseThis(QrexParser& parser, ClassDef& def);  // on the word; afterwards behind it

}  // namespace qrex
