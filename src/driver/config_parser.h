// The configuration file: statements that fill a ConfigSettings. Its text goes through the macro layer first.
#pragma once

#include <string>

#include "workspace/config_settings.h"

namespace qrex {

// Loads the file with `extraText` at its end. False after an error, which is reported.
bool LoadConfiguration(ConfigSettings& settings, const std::string& path, const std::string& extraText);

// The first problem of the settings, with its line end; empty when they are complete for their mode.
std::string ValidateSettings(const ConfigSettings& settings);

}  // namespace qrex
