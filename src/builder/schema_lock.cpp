#include "builder/schema_lock.h"

#include <algorithm>

#include "lex/token.h"
#include "text/files.h"
#include "text/numbers.h"
#include "translator/symbols/scanned_file.h"

namespace qrex {

namespace {

constexpr std::string_view kKinds[] = {"", "enum", "variant", "model"};  // by SchemaKind
constexpr char kHead[] = "# Releases of models whose archives can be read. Kept by Qrex, to be committed.\n";

std::string Joined(const std::vector<std::string>& words) {
  std::string text;
  for (const std::string& word : words) text += (text.empty() ? "" : " ") + word;
  return text;
}

// As $schema has it: without types.
std::string AsWritten(const std::vector<std::string>& words) {
  std::string text;
  for (const std::string& word : words) text += (text.empty() ? "" : " ") + word.substr(0, word.find(':'));
  return text;
}

bool IsNumber(std::string_view text) {
  return !text.empty() && text.size() <= 10 && text.find_first_not_of("0123456789") == std::string_view::npos;
}

bool HasAll(const std::vector<std::string>& words, const std::vector<std::string>& recorded) {
  return std::all_of(recorded.begin(), recorded.end(), [&](const std::string& word) {
    return std::find(words.begin(), words.end(), word) != words.end();
  });
}

bool BeginsWith(const std::vector<std::string>& words, const std::vector<std::string>& recorded) {
  return words.size() >= recorded.size() && std::equal(recorded.begin(), recorded.end(), words.begin());
}

// Archives that were written with the recorded words can be read with these.
bool Serves(SchemaKind kind, const std::vector<std::string>& words, const std::vector<std::string>& recorded) {
  switch (kind) {
    case SchemaKind::Enum:
      return HasAll(words, recorded);
    case SchemaKind::Variant:
      return BeginsWith(words, recorded);
    case SchemaKind::Release:
    case SchemaKind::Model:
      break;
  }
  return words == recorded;
}

}  // namespace

// --- The file

SchemaLock::SchemaLock(ConfigSettings& settings) : m_settings(settings), m_path(settings.schemaLock) {
  Read(m_records, m_text);
  m_found = m_records;
}

void SchemaLock::Fail(int64_t line, const std::string& why) const {
  LexScannerException exception(why, nullptr);
  exception.SetPlace({m_path, line});
  throw exception;
}

void SchemaLock::Read(Records& records, std::string& text) const {
  constexpr uint32_t kNoFile = 2, kNoFolder = 3;
  text.clear();
  const platform::Result read = ReadWholeFile(text, m_path);
  if (!read && (read.Code() == kNoFile || read.Code() == kNoFolder)) return;
  Require(read, m_path);
  FoldLineEnds(text);
  int64_t number = 0;
  for (std::string_view rest = text; !rest.empty();) {
    const size_t end = std::min(rest.find('\n'), rest.size());
    const std::string_view line = rest.substr(0, end);
    rest.remove_prefix(std::min(end + 1, rest.size()));
    ++number;
    if (line.empty() || line.front() == '#') continue;
    auto [key, recorded] = Parsed(line, number);
    const auto [known, isNew] = records.try_emplace(key, std::move(recorded));
    if (isNew || known->second.words == recorded.words) continue;
    const std::string first = Place(known->second);
    if (key.kind != SchemaKind::Release)
      Fail(number, key.name + " stands in " + first + " in another way: keep one of the lines");
    Fail(number, "Release " + std::to_string(key.release) + " of " + key.name + " stands in " + first +
                     " in another way: where two changes have added it, keep one, and give the other the next number");
  }
}

std::pair<SchemaKey, SchemaLock::Recorded> SchemaLock::Parsed(std::string_view text, int64_t line) const {
  for (const char* mark : {"<<<<<<<", "|||||||", "=======", ">>>>>>>"}) {
    if (text.starts_with(mark)) Fail(line, "A merge has left a conflict here: keep the lines of both sides");
  }
  std::vector<std::string> words;
  SplitString(text, words, " ");
  const auto kind = words.size() < 4 ? std::end(kKinds) : std::find(std::begin(kKinds), std::end(kKinds), words[2]);
  const bool isRelease = words.size() >= 4 && IsNumber(words[2]);
  if (words.size() < 4 || words[3] != "=" || (!isRelease && kind == std::end(kKinds))) {
    Fail(line, "PROJECT NAME RELEASE = CHANGES expected: take the line as it was committed last");
  }
  SchemaKey key{words[0], words[1], static_cast<SchemaKind>(isRelease ? 0 : kind - std::begin(kKinds)), 0};
  std::string error;
  if (isRelease) ParseNumber(words[2], key.release, error);
  words.erase(words.begin(), words.begin() + 4);
  return {std::move(key), Recorded{std::move(words), line}};
}

std::string SchemaLock::LinesOf(const Records& records, const std::string* project) const {
  std::string text;
  for (const auto& [key, recorded] : records) {
    if (project && key.project != *project) continue;
    const bool isRelease = key.kind == SchemaKind::Release;
    const std::string third =
        isRelease ? std::to_string(key.release) : std::string(kKinds[static_cast<size_t>(key.kind)]);
    text += key.project + " " + key.name + " " + third + " =";
    if (!recorded.words.empty()) text += " " + Joined(recorded.words);
    text += "\n";
  }
  return text;
}

std::string SchemaLock::FoundLines(const std::string& project) const { return LinesOf(m_found, &project); }
std::string SchemaLock::Lines(const std::string& project) const { return LinesOf(m_records, &project); }

void SchemaLock::Write() {
  if (m_records.empty()) return;
  Records present;
  std::string text;
  Read(present, text);
  if (text != m_text) {
    for (auto& [key, recorded] : present) {
      const auto [known, isNew] = m_records.try_emplace(key, recorded);
      if (isNew || Serves(key.kind, known->second.words, recorded.words)) continue;
      if (!Serves(key.kind, recorded.words, known->second.words))
        Fail(recorded.line, "Another run has just recorded this in another way than the sources have it");
      known->second = recorded;
    }
  }
  const std::string lines = kHead + LinesOf(m_records, nullptr);
  m_text = text;
  if (text == lines) return;
  CreateDirectories(m_path, false);
  m_settings.leftovers.Beside(m_path);
  ReplaceFile(m_path, lines);
  m_text = lines;
}

// --- Models

int64_t SchemaLock::LastRelease(const std::string& project) const {
  int64_t last = -1;
  for (auto at = m_records.lower_bound({project, {}, {}, 0}); at != m_records.end() && at->first.project == project;
       ++at) {
    if (at->first.kind == SchemaKind::Release) last = std::max(last, at->first.release);
  }
  return last;
}

int64_t SchemaLock::LastRelease(const SchemaKey& ofModel) const {
  int64_t last = -1;
  auto at = m_records.lower_bound({ofModel.project, ofModel.name, SchemaKind::Release, 0});
  for (; at != m_records.end() && at->first.project == ofModel.project && at->first.name == ofModel.name; ++at) {
    if (at->first.kind == SchemaKind::Release) last = at->first.release;
  }
  return last;
}

std::string SchemaLock::Place(const Recorded& recorded) const {
  return recorded.line == 0 ? "another source" : m_path + "(" + std::to_string(recorded.line) + ")";
}

std::string SchemaLock::ReleaseFault(const ClassDef& def, const SchemaLine& line, const Recorded* recorded,
                                     int64_t next) const {
  const std::string release = "Release " + std::to_string(line.key.release) + " of " + PrintedElement(def);
  const std::string number = std::to_string(next);
  if (recorded) {
    return release + " is \"" + Joined(recorded->words) + "\" in " + Place(*recorded) + " and \"" + Joined(line.words) +
           "\" here: archives of it and of later releases could not be read. Write it as it was, and what is new as "
           "release " +
           number;
  }
  return release + " is new, and archives of releases up to " + std::to_string(LastRelease(line.key.project)) +
         " may have been written without it: make it release " + number;
}

std::string SchemaLock::HeldFault(const ClassDef& def, const SchemaLine& line, const Recorded& recorded) const {
  const std::string held = PrintedElement(def) + " stores " + line.key.name + ", which is \"" + Joined(recorded.words) +
                           "\" in " + Place(recorded) + " and \"" + Joined(line.words) +
                           "\" now: archives of all releases could not be read. ";
  switch (line.key.kind) {
    case SchemaKind::Enum:
      return held + "Give the labels back with their numbers, and write new ones with others";
    case SchemaKind::Variant:
      return held + "Give the items back in their order, and write new ones behind them";
    case SchemaKind::Model:
    case SchemaKind::Release:
      break;
  }
  return held + "Give the fields back, or give it a $schema whose first release has them";
}

// Of recorded releases that $schema has no longer.
std::string SchemaLock::MissingFault(const ClassDef& def, const std::vector<SchemaLine>& lines, int64_t next) const {
  const std::string project = SchemaProject(def.owner.file.project->rootToProjDir), &name = def.GetQualifiedName();
  auto at = m_records.lower_bound({project, name, SchemaKind::Release, 0});
  for (; at != m_records.end() && at->first.project == project && at->first.name == name; ++at) {
    const auto& [key, recorded] = *at;
    const auto has = [&key = key](const SchemaLine& line) { return line.key == key; };
    if (key.kind != SchemaKind::Release || std::any_of(lines.begin(), lines.end(), has)) continue;
    return "Release " + std::to_string(key.release) + " of " + PrintedElement(def) + " stands in " + Place(recorded) +
           " and not here: archives of it could not be read. Write \"" + std::to_string(key.release) + ": " +
           AsWritten(recorded.words) + "\" again, and what is new as release " + std::to_string(next);
  }
  return {};
}

std::string SchemaLock::ModelFault(const ClassDef& def, const std::vector<SchemaLine>& lines) const {
  const SchemaKey model{SchemaProject(def.owner.file.project->rootToProjDir), def.GetQualifiedName(), {}, 0};
  const int64_t last = LastRelease(model), lastOfProject = LastRelease(model.project);
  const int64_t next = lastOfProject + 1;
  for (const SchemaLine& line : lines) {
    const auto found = m_records.find(line.key);
    const Recorded* const recorded = found == m_records.end() ? nullptr : &found->second;
    if (recorded && Serves(line.key.kind, line.words, recorded->words)) continue;
    if (line.key.kind == SchemaKind::Release) {
      const bool isBehind = !recorded && (last < 0 || (line.key.release > last && line.key.release >= lastOfProject));
      if (!isBehind) return ReleaseFault(def, line, recorded, next);
    } else if (recorded) {
      return HeldFault(def, line, *recorded);
    }
  }
  return last < 0 ? std::string() : MissingFault(def, lines, next);
}

// A model that others hold is recorded with them until it has a $schema: its first release must be what they hold.
std::string FirstReleaseFault(const ClassDef& def, const SchemaLine& first, const std::vector<std::string>& held) {
  std::vector<std::string> words;
  words.reserve(held.size());
  for (const std::string& word : held) words.push_back("+" + word);
  if (first.words == words) return {};
  return "The first release of " + PrintedElement(def) + " is \"" + Joined(first.words) +
         "\", and archives hold what it was without $schema: \"" + Joined(words) +
         "\". Write that as the first release";
}

std::string SchemaLock::Fault(const ClassDef& def) {
  const SchemaKey model{SchemaProject(def.owner.file.project->rootToProjDir), def.GetQualifiedName(), SchemaKind::Model,
                        0};
  const bool isRecorded = LastRelease(model) >= 0;
  if (!def.m_schemaPosition && !isRecorded) return {};
  m_seen.emplace(model.project, model.name);
  const std::vector<SchemaLine> lines = SchemaLinesOf(def);
  const auto held = m_records.find(model);
  if (held != m_records.end() && !isRecorded) {
    std::string fault = FirstReleaseFault(def, lines.front(), held->second.words);
    if (!fault.empty()) return fault;
  }
  std::string fault = ModelFault(def, lines);
  if (!fault.empty()) return fault;
  for (const SchemaLine& line : lines) {
    Recorded& recorded = m_records[line.key];
    if (recorded.words != line.words) recorded = {line.words, 0};
  }
  return {};
}

std::vector<SchemaLock::Gone> SchemaLock::GoneModels(const std::string& project) const {
  std::vector<Gone> gone;
  for (const auto& [key, recorded] : m_records) {
    const bool isSeen =
        key.project != project || key.kind != SchemaKind::Release || m_seen.contains({project, key.name});
    if (!isSeen && (gone.empty() || gone.back().name != key.name)) gone.push_back({key.name, recorded.line});
  }
  return gone;
}

}  // namespace qrex
