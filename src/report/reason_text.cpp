#include "report/reason_text.h"

namespace qrex {

std::string ReasonText(const MakeReason& why) {
  switch (why.cause) {
    case MakeReason::Cause::RebuildAll:
      return "all is rebuilt";
    case MakeReason::Cause::NothingKnown:
      return "no earlier build of it is known";
    case MakeReason::Cause::Missing:
      return "it was missing";
    case MakeReason::Cause::Changed:
      return why.file + " was newer";
    case MakeReason::Cause::InputMissing:
      return why.file + " was missing";
    case MakeReason::Cause::Ahead:
      return "its time was still to come";
    case MakeReason::Cause::RecordsMove:
      return "records of a header moved to it or from it";
    case MakeReason::Cause::Differs:
      return "its command, a key or an input was another one";
    case MakeReason::Cause::OthersRegister:
      return "what the other sources register has changed";
  }
  return {};
}

}  // namespace qrex
