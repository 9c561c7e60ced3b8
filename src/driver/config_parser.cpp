#include "driver/config_parser.h"

#include <algorithm>

#include "driver/config_keys.h"
#include "lex/literals.h"
#include "text/paths.h"

namespace qrex {

namespace {

template <typename Row, size_t n>
const Row* FindRow(const Row (&rows)[n], const LexToken& token) {
  for (const Row& row : rows) {
    if (token.Is(row.word)) return &row;
  }
  return nullptr;
}

std::string ModeWords() {
  std::string words;
  for (const ModeWord& mode : kModes) words.append(words.empty() ? "" : " ").append(mode.word);
  return words;
}

std::string RuntimeWords() {
  std::string words;
  for (const std::string_view word : kRuntimes) words.append(words.empty() ? "" : " ").append(word);
  return words;
}

class ConfigParser : public MpfwParser {
 public:
  explicit ConfigParser(ConfigSettings& settings) : MpfwParser(settings.context), m_settings(settings) {}

  bool ResolveImport(const std::string& path, std::string& found) override {
    return FindImport(m_settings, path, found) || FindBesideConfiguration(path, found);
  }
  std::string ImportHint(const std::string& path) const override { return TriedImports(m_settings, path); }
  void OnImportedFile(MpfwSourceFile& file) override {
    ConfigParser parser(m_settings);
    ParseImported(file, parser, [](MpfwParser& imported) { static_cast<ConfigParser&>(imported).ParseStatements(); });
  }

  void ParseStatements() {
    while (current.kind != kEndOfText) ParseStatement();
  }

 private:
  bool FindBesideConfiguration(const std::string& path, std::string& found) const;
  void ParseStatement();
  bool ParseChoice();
  bool ChooseCompiler(const std::string& word, const LexToken& token);
  bool ChooseMode(const std::string& word, const LexToken& token);
  bool ChooseRuntime(const std::string& word, const LexToken& token);
  void ParseVariable();
  void ParseEnvironment(std::string PlatformEnvironment::*field);
  void ParseList(std::vector<std::string>& list);
  void ParseCommand(std::vector<std::string>& words);
  void ReadListBody(std::vector<std::string>& list);  // behind its `{`
  void ParseNumberKey(int64_t& number);
  bool ReadAssignment();  // `=` or `+=`; true: the list starts anew
  std::string ReadWord();
  void ReadName(std::string& out);  // of what is put in quotes on command lines
  void SplitTargetDirectory(const std::string& path);

  ConfigSettings& m_settings;
};

// A run in another folder finds what stands in that of the configuration.
bool ConfigParser::FindBesideConfiguration(const std::string& path, std::string& found) const {
  const std::string& configuration = m_settings.sourceFiles.front()->path;
  const std::string folder = configuration.substr(0, configuration.rfind('/') + 1);
  if (folder.empty() || IsAbsolutePath(path)) return false;
  if (FindImport(m_settings, folder + path, found)) return true;
  for (const std::string& directory : m_settings.context.importPaths) {
    if (!IsAbsolutePath(directory) && FindImport(m_settings, folder + PathJoin(directory, path), found)) return true;
  }
  return false;
}

// A key that takes one of a few words.
bool ConfigParser::ParseChoice() {
  static constexpr struct {
    std::string_view key;
    std::string (*words)();
    bool (ConfigParser::*choose)(const std::string& word, const LexToken& token);
  } kChoices[] = {{"compiler", CompilerWords, &ConfigParser::ChooseCompiler},
                  {"mode", ModeWords, &ConfigParser::ChooseMode},
                  {"runtime", RuntimeWords, &ConfigParser::ChooseRuntime}};
  for (const auto& choice : kChoices) {
    if (!current.Is(choice.key)) continue;
    Advance();
    Expect(kAssign, "=");
    const LexToken token = current;
    if ((this->*choice.choose)(ReadWord(), token)) return true;
    throw LexScannerException("Invalid option : " + Printed(token), token).WithHint("one of " + choice.words());
  }
  return false;
}

bool ConfigParser::ChooseCompiler(const std::string& word, const LexToken&) {
  const auto compiler = FindCompiler(word);
  if (compiler) m_settings.compiler = *compiler;
  return compiler.has_value();
}

bool ConfigParser::ChooseMode(const std::string& word, const LexToken& token) {
  for (size_t i = 0; i < std::size(kModes); ++i) {
    if (word != kModes[i].word) continue;
    m_settings.mode = static_cast<RunMode>(i);
    if (!IsAddedText(m_settings.sourceFiles, token.text.begin)) m_settings.fileMode = m_settings.mode;
    return true;
  }
  return false;
}

bool ConfigParser::ChooseRuntime(const std::string& word, const LexToken&) {
  for (size_t i = 0; i < std::size(kRuntimes); ++i) {
    if (word != kRuntimes[i]) continue;
    m_settings.runtime = static_cast<RuntimeChoice>(i);
    return true;
  }
  return false;
}

void ConfigParser::ParseStatement() {
  if (ParseImportStatement()) return;
  if (ParseChoice()) return;
  if (current.kind == kDollar) return ParseVariable();
  if (const auto* key = FindRow(kEnvironmentKeys, current)) return ParseEnvironment(key->field);
  if (const auto* key = FindRow(kListKeys, current)) return ParseList(m_settings.*key->field);
  if (const auto* key = FindRow(kCommandKeys, current)) return ParseCommand(m_settings.*key->field);
  if (const auto* key = FindRow(kNumberKeys, current)) return ParseNumberKey(m_settings.*key->field);
  if (const auto* key = FindRow(kStringKeys, current)) {
    Advance();
    Expect(kAssign, "=");
    const bool isName = key->field == &ConfigSettings::config || key->field == &ConfigSettings::platform;
    return isName ? ReadName(m_settings.*key->field) : ReadStringOrExpression(m_settings.*key->field);
  }
  if (const auto* key = FindRow(kBoolKeys, current)) {
    Advance();
    Expect(kAssign, "=");
    std::string word = current.text.Text();
    SubstituteVariables(word);
    if (word != "true" && word != "false") FailExpected("false/true");
    m_settings.*key->field = word == "true";
    return Advance();
  }
  throw LexScannerException("Syntax error: " + Printed(current), current)
      .WithHint("no statement begins so; Qrex --help lists the keys");
}

std::string ConfigParser::ReadWord() {
  std::string word = current.text.Text();
  SubstituteVariables(word);
  Advance();
  return word;
}

void ConfigParser::ReadName(std::string& out) {
  const LexToken token = current;
  ReadStringOrExpression(out);
  RequireNoQuote(out, token);
}

void ConfigParser::ParseVariable() {
  std::string name, value;
  ParseVariableStatement(&name, &value);
  TraceWriter() << "$" << name << " = " << value << "\n";
  for (const auto& variable : kPathVariables) {
    if (name != variable.word) continue;
    RequireNoQuote(value, previous);
    m_settings.*variable.field = value;
  }
  if (name == "TARGET_DIR") RequireNoQuote(value, previous);
  if (name == "COMPILE_FILE_PATH") m_settings.compileFilePath = NormalisePath(value);
  if (name == "TARGET_DIR" && !value.empty()) SplitTargetDirectory(NormalisePath(value));
}

// The last two components of the path are the platform and the configuration; a path with fewer changes nothing.
void ConfigParser::SplitTargetDirectory(const std::string& path) {
  const size_t last = path.rfind('/');
  if (last == std::string::npos || last == 0) return;
  const size_t before = path.rfind('/', last - 1);
  if (before == std::string::npos) return;
  m_settings.config = path.substr(last + 1);
  m_settings.platform = path.substr(before + 1, last - before - 1);
}

bool ConfigParser::ReadAssignment() {
  const bool appends = current.kind == kPlusAssign;
  if (appends) {
    Advance();
  } else {
    Expect(kAssign, "=");
  }
  Expect(kOpenBrace, "{");
  return !appends;
}

void ConfigParser::ParseEnvironment(std::string PlatformEnvironment::*field) {
  Advance();
  Expect(kOpenParen, "(");
  if (current.kind != kDoubleQuoted) FailExpected("double quoted string");
  std::string platform;
  ReadString(platform);
  Advance();
  Expect(kCloseParen, ")");
  const bool startsAnew = ReadAssignment();
  std::string& list = m_settings.platformEnvironments[platform].*field;
  if (startsAnew) list.clear();
  while (current.kind != kCloseBrace) {
    std::string entry;
    ReadStringOrExpression(entry);
    if (!list.empty()) list += ';';
    list += entry;
  }
  Advance();
}

void ConfigParser::ParseNumberKey(int64_t& number) {
  constexpr size_t kMostDigits = 6;
  Advance();
  Expect(kAssign, "=");
  std::string word = current.text.Text();
  SubstituteVariables(word);
  const bool isNumber = !word.empty() && word.size() <= kMostDigits &&
                        std::all_of(word.begin(), word.end(), [](char c) { return c >= '0' && c <= '9'; });
  if (!isNumber) FailExpected("number");
  number = std::stoll(word);
  Advance();
}

void ConfigParser::ParseList(std::vector<std::string>& list) {
  Advance();
  if (ReadAssignment()) list.clear();
  ReadListBody(list);
}

void ConfigParser::ReadListBody(std::vector<std::string>& list) {
  while (current.kind != kCloseBrace) {
    std::string entry;
    ReadName(entry);
    list.push_back(std::move(entry));
  }
  Advance();
}

// A list of words, or one word; an empty one is no command.
void ConfigParser::ParseCommand(std::vector<std::string>& words) {
  Advance();
  Expect(kAssign, "=");
  words.clear();
  if (current.kind == kOpenBrace) {
    Advance();
    return ReadListBody(words);
  }
  std::string word;
  ReadName(word);
  if (!word.empty()) words.push_back(std::move(word));
}

void PlaceRoots(ConfigSettings& settings) {
  for (std::string& root : settings.virtualTree) {
    if (!IsAbsolutePath(root)) root = PathJoin(settings.sourceFolder, root);
  }
}

}  // namespace

bool LoadConfiguration(ConfigSettings& settings, const std::string& path, const std::string& extraText) {
  ConfigParser parser(settings);
  MpfwSourceFile* file = nullptr;
  try {
    file = parser.LoadSourceFile(path, extraText);
  } catch (const LexScannerException& exception) {
    TraceWriter() << "Exception: " << exception.message << "\n";
    return false;
  } catch (const IException& exception) {
    TraceWriter() << "Exception: " << exception << "\n";
    return false;
  }
  if (!file) {
    TraceWriter() << "    while processing qrex config file : " << path << "\n";
    return false;
  }
  const TextRange expansion{std::string_view(file->expansion)};
  try {
    parser.SetInput(expansion);
    parser.ParseStatements();
    if (!settings.sourceFolder.empty()) PlaceRoots(settings);
    return true;
  } catch (LexScannerException& exception) {
    MapErrorPosition(file->map, expansion, exception);
    settings.macroWorld.messages->Take(ParseErrorOf(settings.sourceFiles, exception));
    return false;
  }
}

std::string ValidateSettings(const ConfigSettings& settings) {
  auto missing = [](std::string_view what) {
    return "\nERROR:  Missing setting: " + std::string(what) + " not specified\n";
  };
  if (settings.virtualTree.empty()) return missing("'virtualTree'");
  if (settings.exportLib.empty()) return missing("$EXPORT_LIB");
  if (settings.exportTranslatedInclude.empty()) return missing("$EXPORT_TRANSLATED_INCLUDE");
  if (settings.exportUntranslatedInclude.empty()) return missing("$EXPORT_UNTRANSLATED_INCLUDE");
  if (settings.exportTranslatedInclude == settings.exportUntranslatedInclude) {
    return "\nERROR:  $EXPORT_TRANSLATED_INCLUDE and $EXPORT_UNTRANSLATED_INCLUDE both equal " +
           settings.exportTranslatedInclude + "\n";
  }
  if (settings.workspaces.empty()) return missing("'workspace'");
  if (settings.mode == RunMode::Gen) return {};
  if (settings.config.empty()) return missing("'config'");
  if (settings.platform.empty()) return missing("'platform'");
  const bool runsTools =
      settings.mode == RunMode::Compile || (settings.mode == RunMode::Build && !settings.translateOnly);
  if (!runsTools) return {};
  const PlatformEnvironment* environment = settings.Environment();
  if (!environment) return "\nERROR:  PATH, INCLUDE, LIB not set for platform " + settings.platform + "\n";
  for (const auto& key : kEnvironmentKeys) {
    if (!(environment->*key.field).empty()) continue;
    return "\nERROR:  " + std::string(key.word) + " not specified for platform " + settings.platform + "\n";
  }
  if (settings.mode == RunMode::Compile && settings.compileFilePath.empty()) return missing("'COMPILE_FILE_PATH'");
  return {};
}

}  // namespace qrex
