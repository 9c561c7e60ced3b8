// Standard input, as bytes.
#pragma once

#include <string>

namespace qrex::platform {

// Adds what is there, waiting for it where there is nothing yet; false at the end.
bool ReadStdin(std::string& bytes);

}  // namespace qrex::platform
