// Reading $function, $polymorphic, $var and $typedef.
#pragma once

namespace qrex {

class QrexParser;

void ParseGlobalFunction(QrexParser& parser, bool polymorphic);
void ParseGlobalVar(QrexParser& parser);
void ParseTypedef(QrexParser& parser);

}  // namespace qrex
