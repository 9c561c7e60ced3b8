// The body of a $polymorphic function: switches over the tags of its variant arguments, with a call in each leaf.
#pragma once

namespace qrex {

class GlobalFunctionDef;
class QrexParser;

// Fails at the current token when an argument in [ ] is no defined variant.
void WriteDispatchBody(QrexParser& parser, const GlobalFunctionDef& def);

}  // namespace qrex
