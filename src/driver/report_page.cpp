#include "driver/report_page.h"

#include "questions/overview.h"
#include "report/page.h"
#include "text/files.h"
#include "text/version.h"

namespace qrex {

namespace {

PageHeading HeadingOf(const ConfigSettings& settings) {
  std::string names;
  for (const std::string& name : settings.workspaces) names += (names.empty() ? "" : ", ") + name;
  return {.title = names,
          .subtitle = settings.config + " | " + settings.platform + " | Qrex " + std::string(Version())};
}

}  // namespace

std::string BuildPage(const ConfigSettings& settings, const BuildRecord& record, bool completed, Workspace* loaded) {
  PageHeading heading = HeadingOf(settings);
  heading.completed = completed;
  return PageText(record, heading, loaded ? OverviewOf(*loaded, nullptr).json : std::string());
}

bool WriteWorkspacePage(Workspace& workspace, const std::string& path) {
  ConfigSettings& settings = workspace.settings;
  MessageConsumer* const messages = settings.macroWorld.messages;
  const Overview overview = OverviewOf(workspace, messages);
  BuildRecord record(*messages);  // of nothing
  record.End();
  PageHeading heading = HeadingOf(settings);
  heading.built = false;
  return WriteReport(settings, path, PageText(record, heading, overview.json)) && overview.isWhole;
}

bool WriteReport(ConfigSettings& settings, const std::string& path, const std::string& text) {
  try {
    CreateDirectories(path, false);
    settings.leftovers.Beside(path);
    ReplaceFile(path, text);
    return true;
  } catch (const IException& exception) {
    settings.Tell(Message(Severity::Error, "Error: ", ExceptionText(exception)));
    return false;
  }
}

}  // namespace qrex
