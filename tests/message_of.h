// The message of an error, where a test compares it.
#pragma once

#include <string>
#include <type_traits>

#include "lex/token.h"

namespace qrex {

// What `act` answers as a text, if it does; else the message of the error that it raises.
template <typename Act>
std::string MessageOf(Act act) {
  try {
    if constexpr (std::is_convertible_v<decltype(act()), std::string>) {
      return act();
    } else {
      act();
      return "no error";
    }
  } catch (const LexScannerException& exception) {
    return exception.message;
  }
}

}  // namespace qrex
