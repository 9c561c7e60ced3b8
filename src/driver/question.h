// `Qrex --graph`, `--why`, `--reflect` and `--report`: what is asked, and the text that answers, but of a page, which
// driver/report_page.h writes.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "workspace/workspace.h"

namespace qrex {

struct Question {
  enum class About { Graph, Why, Declarations, Page };
  About about = About::Graph;
  std::string graph = "projects";
  std::string file;    // that --why, or --of, is about, empty: everything; of a page, where it goes
  int64_t depth = -1;  // of --of; negative: without end
  bool asJson = false;
  std::string problem;  // of the arguments; empty: they can be understood
};

// Takes what belongs to the question out of the arguments, of which the second one is its option; the rest is a run's.
Question ReadQuestion(std::vector<std::string>& arguments);

// Of a workspace that is loaded. Nothing, with messages told, where there is no answer. May raise an IException.
std::optional<std::string> AnswerTo(const Question& question, Workspace& workspace);

}  // namespace qrex
