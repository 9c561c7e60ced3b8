// The road of a whole run: loads what the settings name, checks it, and does what the mode says.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "driver/question.h"
#include "driver/where.h"
#include "workspace/workspace.h"

namespace qrex {

// False for a failure to load, a missing configuration or a translation error; a run that counted compile errors is
// true.
// `loaded`, unless null, gets all that the run made, for a caller that ends soon: to take a large workspace apart would
// cost a tenth of the run.
bool RunWorkspace(ConfigSettings& settings, std::shared_ptr<void>* loaded = nullptr);

// Loads the same for who asks about it, as far as that is possible; null, with messages told, where it is not.
std::shared_ptr<Workspace> LoadToAsk(ConfigSettings& settings);

// Loads the same, and tells of it in the form of driver/listing.h. False, with a message, where something cannot be
// loaded.
bool ListWorkspace(ConfigSettings& settings, std::string& list);

// Loads the same, and follows these positions, or those in the lines of standard input where there are none. False,
// with a message, where something cannot be loaded or a position is none that is known.
bool FollowPositions(ConfigSettings& settings, Follow follow, const std::vector<std::string>& positions);

// Loads the same, and answers the question on standard output. False, with messages, where something cannot be loaded
// or translated, or the question is about nothing that is there.
bool AnswerQuestion(ConfigSettings& settings, const Question& question);

}  // namespace qrex
