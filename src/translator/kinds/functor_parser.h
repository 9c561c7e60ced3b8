// Reading $functor, and $makefunctor and $makeconstfunctor, which turn a block of code into a functor.
#pragma once

namespace qrex {

class QrexParser;

void ParseFunctor(QrexParser& parser, bool nested);
void ParseMakeFunctor(QrexParser& parser);  // the keyword tells the const form

}  // namespace qrex
