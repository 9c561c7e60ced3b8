#include "questions/why.h"

#include <map>
#include <memory>
#include <optional>
#include <unordered_set>

#include "builder/dependency_file.h"
#include "builder/make_reason.h"
#include "builder/reflection_tails.h"
#include "builder/staleness.h"
#include "translator/file/translate_file.h"

namespace qrex {

namespace {

using Cause = MakeReason::Cause;

// What would be made of a file, and why.
struct Answer {
  std::string what, reason;
  std::vector<const ScannedFile*> chain;  // from the file to the cause; one or none where it is the file's own
};

// A project as a build would find it.
class JudgedProject {
 public:
  JudgedProject(Project& project, ProjectConfig& config) : m_files(*project.settings, project, config) {
    const ConfigSettings& settings = *project.settings;
    if (!settings.translateOnly && settings.Environment()) ApplyEnvironment(*settings.Environment());
    project.CollectFiles();
    const std::string dependencyFile = DependencyFilePath(project, config);
    if (!settings.rebuildAll) LoadDependencyFile(m_files, dependencyFile);
    m_knownFiles = m_files.FileCount();
    for (ProjectFile* file : project.files) m_files.scanned.push_back(&m_files.GetScannedFile(*file));
    if (settings.fingerprints) m_prints.emplace(m_files, dependencyFile);
  }

  ScannedFile& Scanned(ProjectFile& file) { return m_files.GetScannedFile(file); }
  std::optional<Answer> Translation(ScannedFile& file);
  std::optional<Answer> Object(ScannedFile& file);  // of one whose translation, and those of its imports, are current
  std::optional<Answer> Moved(ScannedFile& file);   // of one whose translation is current by itself
  std::string Verb(const ScannedFile& file) const;

 private:
  const ProjectPrints* Prints() const { return m_prints ? &*m_prints : nullptr; }
  bool IsCompiled(const ScannedFile& file) const {
    return HasObject(file.file) && !m_files.project.exported && !m_files.settings.translateOnly;
  }
  std::string ReasonOf(const MakeReason& why, const std::string& output, std::string_view input,
                       const ScannedFile& file) const;
  Answer AnswerOf(const MakeReason& why, const ProjectPrints::Difference& difference, const ScannedFile& file,
                  const std::string& output, std::string_view input) const;

  BuildFiles m_files;
  std::optional<ProjectPrints> m_prints;
  size_t m_knownFiles = 0;
};

std::string JudgedProject::Verb(const ScannedFile& file) const {
  const FileKind kind = file.file.kind;
  const bool isText = HasObject(file.file) || kind == FileKind::H || kind == FileKind::Py;
  if (!isText) return "copied";
  if (!IsCompiled(file)) return "translated";
  return m_files.settings.writeTokenEquivalent ? "translated and compiled"
                                               : "translated, and compiled if that changes more than blanks";
}

// `input`: what the output is compared with, ahead of the path of a source.
std::string JudgedProject::ReasonOf(const MakeReason& why, const std::string& output, std::string_view input,
                                    const ScannedFile& file) const {
  switch (why.cause) {
    case Cause::RebuildAll:
      return "rebuildAll is set";
    case Cause::NothingKnown:
      return "no earlier build of it is known";
    case Cause::Missing:
      return output + " is missing";
    case Cause::Changed:
      if (input.empty() && why.file == file.SourcePath()) return "it is newer than " + output;
      return std::string(input) + why.file + " is newer than " + output;
    case Cause::InputMissing:
      return why.file + " is missing";
    case Cause::Ahead:
      return "the time of " + output + " is still to come";
    case Cause::RecordsMove:
      return "records of a header come to it or leave it";
    case Cause::OthersRegister:
      return "what the other sources register has changed";
    case Cause::Differs:
      break;
  }
  return output + " was made from something else";
}

Answer JudgedProject::AnswerOf(const MakeReason& why, const ProjectPrints::Difference& difference,
                               const ScannedFile& file, const std::string& output, std::string_view input) const {
  const bool differs = why.cause == Cause::Differs;
  std::string reason = ReasonOf(why, output, input, file);
  if (differs && !difference.text.empty()) reason += ": " + difference.text;
  if (differs && !difference.source.empty()) {
    reason = std::string(input) + difference.source + " is not the one that " + output + " was made from";
  }
  const std::string& cause = differs ? difference.source : why.file;
  return {Verb(file), std::move(reason), cause.empty() ? std::vector<const ScannedFile*>() : ImportChain(file, cause)};
}

std::optional<Answer> JudgedProject::Translation(ScannedFile& file) {
  if (!MustTranslate(m_files, file, Prints())) return std::nullopt;
  const MakeReason why = WhyTranslated(m_files, file);
  const bool isAsked = m_prints && why.cause == Cause::Differs;
  return AnswerOf(why, isAsked ? m_prints->OfTranslation(file) : ProjectPrints::Difference(), file,
                  m_files.paths.Translated(file.file), "");
}

std::optional<Answer> JudgedProject::Object(ScannedFile& file) {
  if (!IsCompiled(file)) return std::nullopt;
  const std::string path = m_files.paths.Object(file.file);
  const FileStamp stamp = StampOf(path);
  if (!MustCompile(m_files, file, stamp, Prints())) return std::nullopt;
  const MakeReason why = WhyCompiled(m_files, file, stamp.time);
  const bool isAsked = m_prints && why.cause == Cause::Differs;
  Answer answer = AnswerOf(why, isAsked ? m_prints->OfObject(file, stamp) : ProjectPrints::Difference(), file, path,
                           "the translation of ");
  answer.what = "compiled";
  return answer;
}

// A build in memory, up to this file: what the stale ones ahead of it declare tells whether it must follow.
std::optional<Answer> JudgedProject::Moved(ScannedFile& asked) {
  if (m_files.project.exported || asked.file.kind != FileKind::Cpp) return std::nullopt;
  std::unordered_set<const ScannedFile*> stale;
  for (ScannedFile* file : m_files.scanned) {
    if (MustTranslate(m_files, *file, Prints())) stale.insert(file);
  }
  if (stale.empty()) return std::nullopt;
  FindTailHolders(m_files, m_knownFiles);
  for (ScannedFile* file : m_files.scanned) {
    std::optional<Cause> moved;
    if (file->file.isMainSource && (m_files.registerMap.dirty || m_files.unregisterMap.dirty)) {
      moved = Cause::OthersRegister;
    } else if (file->file.kind == FileKind::Cpp && !stale.contains(file) && !file->HasBegun() && TailsMoved(*file)) {
      moved = Cause::RecordsMove;
    }
    if (file == &asked) {
      if (!moved) return std::nullopt;
      return AnswerOf({*moved}, {}, asked, m_files.paths.Translated(asked.file), "");
    }
    if (moved || stale.contains(file)) BringUpToDate(*file);
    if (file->file.kind == FileKind::Cpp && !file->HasBegun()) MarkRegistered(*file);
  }
  return std::nullopt;
}

class Judge {
 public:
  std::optional<std::string> TextOf(ProjectFile& file) {
    JudgedProject* const project = Of(*file.project);
    if (!project) return std::nullopt;
    ScannedFile& scanned = project->Scanned(file);
    std::optional<Answer> answer = project->Translation(scanned);
    if (!answer) answer = project->Moved(scanned);
    if (!answer) answer = StaleImport(scanned);
    if (!answer) answer = project->Object(scanned);
    const std::string path = scanned.SourcePath();
    if (!answer) return path + " is up to date\n";
    std::string text = path + " would be " + answer->what + ": " + answer->reason + "\n";
    if (answer->chain.size() < 2) return text;
    std::string chain;
    for (const ScannedFile* step : answer->chain) chain += (chain.empty() ? "    " : " -> ") + step->SourcePath();
    return text + chain + "\n";
  }

 private:
  JudgedProject* Of(Project& project) {
    std::unique_ptr<JudgedProject>& judged = m_projects[&project];
    ProjectConfig* const config = judged ? nullptr : project.ConfigOfRun();
    if (config) judged = std::make_unique<JudgedProject>(project, *config);
    return judged.get();
  }

  // The translation of an import is made again, perhaps in another project, ahead of the compilation.
  std::optional<Answer> StaleImport(const ScannedFile& file) {
    const Project& project = *file.file.project;
    if (!HasObject(file.file) || project.exported || project.settings->translateOnly) return std::nullopt;
    std::vector<const ScannedFile*> open{&file};
    std::unordered_set<const ScannedFile*> met{&file};
    for (size_t next = 0; next < open.size(); ++next) {
      ProjectFile& at = open[next]->file;
      JudgedProject* const owner = next == 0 || !IsTranslated(*at.project) ? nullptr : Of(*at.project);
      std::optional<Answer> stale = owner ? owner->Translation(owner->Scanned(at)) : std::nullopt;
      if (stale) {
        stale->what = "compiled";
        stale->reason = open[next]->SourcePath() + " would be translated: " + stale->reason;
        stale->chain = ImportChain(file, open[next]->SourcePath());
        return stale;
      }
      for (const ScannedFile* import : open[next]->imports) {
        if (met.insert(import).second) open.push_back(import);
      }
    }
    return std::nullopt;
  }

  std::map<const Project*, std::unique_ptr<JudgedProject>> m_projects;
};

}  // namespace

std::optional<std::string> WhyText(ProjectFile& file) { return Judge().TextOf(file); }

}  // namespace qrex
