#include "workspace/project_parser.h"

#include <algorithm>

#include "lex/literals.h"
#include "text/files.h"
#include "text/numbers.h"
#include "text/paths.h"
#include "text/trace.h"
#include "workspace/switch_blocks.h"
#include "workspace/workspace.h"

namespace qrex {

bool LoadProjectFile(Project& project, const std::string& path) {
  auto made = std::make_unique<MpfwSourceFile>();
  MpfwSourceFile& file = *made;
  if (!FindInTree(*project.settings, path, project.rootDir, project.filePath) ||
      !project.settings->macroWorld.sources->Read(file.text, project.filePath)) {
    project.settings->Tell(Message(Severity::Error, "Error: ", "Couldn't open project file " + path)
                               .WithHint(TriedInTree(*project.settings, path)));
    return false;
  }
  file.path = project.filePath;
  project.settings->sourceFiles.push_back(std::move(made));
  FileFilter directoryFilter;
  directoryFilter.include = false;  // no patterns: every directory passes
  ProjectParser parser(project, directoryFilter);
  project.hasFaultyFile = true;
  if (!parser.ExpandSourceFile(file)) return false;
  const TextRange expansion{std::string_view(file.expansion)};
  try {
    parser.SetInput(expansion);
    parser.ParseProject();
    project.hasFaultyFile = false;
  } catch (LexScannerException& exception) {
    MapErrorPosition(file.map, expansion, exception);
    if (exception.hint.empty() && parser.MayLackBrace()) exception.hint = parser.BlockHint();
    project.settings->macroWorld.messages->Take(ParseErrorOf(project.settings->sourceFiles, exception));
    project.Empty();
  }
  return !project.hasFaultyFile;
}

bool ProjectParser::ResolveImport(const std::string& path, std::string& found) {
  return FindImport(*m_project.settings, path, found);
}

std::string ProjectParser::ImportHint(const std::string& path) const { return TriedImports(*m_project.settings, path); }

void ProjectParser::OnImportedFile(MpfwSourceFile& file) {
  ProjectParser parser(m_project, m_directoryFilter);
  ParseImported(file, parser, [](MpfwParser& imported) { static_cast<ProjectParser&>(imported).ParseStatements(); });
}

void ProjectParser::ParseProject() {
  ParseHeads();
  ParseStatements();
  ParseTree(m_project.rootFolder, m_project.rootToProjDir);
}

// --- Heads

void ProjectParser::ReadHead(const std::string& name, std::string& out) {
  ReadNamedPath(name, out);
  SubstituteVariables(out);
}

void ProjectParser::ParseHeads() {
  std::string targetType;
  ReadHead("TARGET_TYPE", targetType);
  SetTargetType(targetType);
  ReadHead("ROOT_TO_PROJDIR", m_project.rootToProjDir);
  const std::string& directory = m_project.rootToProjDir;
  RequireInTree(directory, previous.text.begin);
  m_project.sourceDir = PathJoin(directory, "src");
  if (current.kind == kDollar) {
    ReadHead("PROJDIR_TO_ROOT", m_project.projDirToRoot);
  } else {
    m_project.projDirToRoot = "..";
    for (auto count = std::count(directory.begin(), directory.end(), '/'); count > 0; --count) {
      m_project.projDirToRoot += "/..";
    }
  }
  m_project.name = std::string(FileNameOf(directory));
  m_project.rootFolder.name = m_project.name;
  LSFileFrame& frame = context.rootFrame;
  frame.DefineSubstitution("TARGET_TYPE", targetType);
  frame.DefineSubstitution("ROOT_TO_PROJDIR", directory);
  frame.DefineSubstitution("PROJDIR_TO_ROOT", m_project.projDirToRoot);
  frame.DefineSubstitution("PROJNAME", m_project.name);
  frame.DefineSubstitution("TGT_EXTENSION", std::string(TargetTypeExtension(m_project.targetType)));
}

void ProjectParser::SetTargetType(const std::string& text) {
  if (text == "Library") {
    m_project.libraryIsStatic = !m_project.settings->defaultToDll;
    m_project.targetType = m_project.libraryIsStatic ? TargetType::StaticLibrary : TargetType::DynamicLinkLibrary;
    return;
  }
  std::string names;
  for (int i = 0; i <= static_cast<int>(TargetType::UtilityProject); ++i) {
    const auto type = static_cast<TargetType>(i);
    if (text == TargetTypeName(type)) {
      m_project.targetType = type;
      return;
    }
    names += (i > 0 ? ",\"" : "\"") + std::string(TargetTypeName(type)) + "\"";
  }
  throw LexScannerException("Only target types " + names + " supported", previous);
}

// --- Statements

void ProjectParser::ParseStatements() {
  while (ParseStatement()) {
  }
}

bool ProjectParser::ParseStatement() {
  static constexpr struct {
    std::string_view word;
    BuildEvent ProjectConfig::*event;
  } kEvents[] = {{"prebuildevent", &ProjectConfig::preBuildEvent},
                 {"prelinkevent", &ProjectConfig::preLinkEvent},
                 {"postbuildevent", &ProjectConfig::postBuildEvent}};
  if (current.Is("directories")) {
    ParseDirectories();
  } else if (current.kind == kDollar) {
    std::string name, value;
    ParseVariableStatement(&name, &value);
    TraceWriter() << "$" << name << " = " << value << "\n";
  } else if (current.Is("config")) {
    ParseConfig();
  } else if (current.Is("subproj")) {
    ParseSubprojects();
  } else if (current.Is("toolfiles")) {
    ParseToolFiles();
  } else if (current.Is("general")) {
    ParseGeneral();
  } else if (current.Is("qrex")) {
    m_project.usesQrex = true;
    Advance();
  } else if (current.Is("export")) {
    m_project.exported = true;
    Advance();
  } else if (current.kind == kPlus || current.kind == kMinus) {
    return ParseOptions(current.kind == kPlus);
  } else if (current.kind == kAt) {
    return ParseImportStatement();
  } else {
    for (const auto& [word, event] : kEvents) {
      if (!current.Is(word)) continue;
      ParseBuildEvent(event);
      return true;
    }
    return false;
  }
  return true;
}

void ProjectParser::RequireBrace() {
  if (current.kind != kOpenBrace) {
    throw LexScannerException("Expected { when read " + Printed(current), current);
  }
  Advance();
}

ProjectConfig& ProjectParser::AddConfig() {
  std::string specifier;
  ReadString(specifier);
  const size_t bar = specifier.find('|');
  if (bar == std::string::npos || specifier.find('|', bar + 1) != std::string::npos) {
    throw LexScannerException("Config specifier " + Printed(current) + " must be of the form name|platform", current);
  }
  RequireNoQuote(specifier, current);
  m_project.configs.push_back(std::make_unique<ProjectConfig>());
  ProjectConfig& config = *m_project.configs.back();
  config.name = specifier.substr(0, bar);
  config.platform = specifier.substr(bar + 1);
  Advance();
  return config;
}

void ProjectParser::ParseConfig() {
  Advance();
  RequireBrace();
  while (current.kind != kCloseBrace) {
    ProjectConfig& config = AddConfig();
    if (current.kind != kOpenBracket) continue;
    Advance();
    while (current.kind != kCloseBracket) {
      ReadString(config.tags.emplace_back());
      Advance();
    }
    Advance();
  }
  Advance();
}

void ProjectParser::ParseSubprojects() {
  Advance();
  RequireBrace();
  while (current.kind != kCloseBrace) {
    std::string path;
    ReadPath(path);
    m_project.AddSubproject(ProjectPathOf(path));
    Advance();
  }
  Advance();
}

void ProjectParser::ParseToolFiles() {
  Advance();
  RequireBrace();
  while (current.kind != kCloseBrace) {
    ReadPath(m_project.toolFiles.emplace_back());
    Advance();
  }
  Advance();
}

void ProjectParser::ParseBuildEvent(BuildEvent ProjectConfig::*event) {
  Advance();
  const Configs configs = ReadScope().configs;
  RequireBrace();
  BuildEvent read;
  read.present = true;
  ReadString(read.description);
  Advance();
  ReadString(read.commandLine);
  Advance();
  Expect(kCloseBrace, "}");
  for (ProjectConfig* config : configs) config->*event = read;
}

namespace {

constexpr std::string_view kGeneralKeys[] = {"OutputDirectory",
                                             "IntermediateDirectory",
                                             "DeleteExtensionsOnClean",
                                             "BuildLogFile",
                                             "InheritedPropertySheets",
                                             "ConfigurationType",
                                             "UseOfMFC",
                                             "UseOfATL",
                                             "ATLMinimizesCRunTimeLibraryUsage",
                                             "CharacterSet",
                                             "ManagedExtensions",
                                             "WholeProgramOptimization"};
constexpr std::string_view kToolsetKey = "PlatformToolset";

}  // namespace

std::string ProjectParser::ReadGeneralKey() {
  if (current.kind != kIdentifier) {
    throw LexScannerException("Expected identifier when read " + Printed(current), current);
  }
  std::string key = current.text.Text();
  const bool isToolset = key == kToolsetKey;
  if (isToolset ? m_project.settings->platformToolset.empty()
                : std::find(std::begin(kGeneralKeys), std::end(kGeneralKeys), key) == std::end(kGeneralKeys)) {
    throw LexScannerException("Invalid key " + Printed(current), current)
        .WithHint(isToolset ? "a key where the configuration sets platformToolset" : "");
  }
  Advance();
  return key;
}

void ProjectParser::ParseGeneral() {
  Advance();
  const Configs configs = ReadScope().configs;
  RequireBrace();
  while (current.kind != kCloseBrace) {
    const std::string key = ReadGeneralKey();
    Expect(kAssign, "=");
    std::string value;
    ReadString(value);
    Advance();
    for (ProjectConfig* config : configs) {
      (key == kToolsetKey ? config->platformToolset : config->generalOptions[key]) = ForConfig(value, *config);
    }
  }
  Advance();
}

// --- Scopes and options

ProjectParser::Scope ProjectParser::ReadScope() {
  Scope scope;
  if (current.kind != kOpenParen) {
    for (const auto& config : m_project.configs) scope.configs.push_back(config.get());
    return scope;
  }
  std::vector<std::string> specs;
  do {
    Advance();
    ReadString(specs.emplace_back());
    Advance();
  } while (current.kind == kComma);
  if (current.kind != kCloseParen) {
    throw LexScannerException("Expected comma or right parenthesis when read " + Printed(current), current);
  }
  Advance();
  for (const auto& config : m_project.configs) {
    if (std::any_of(specs.begin(), specs.end(), [&](const std::string& spec) { return IsSelected(*config, spec); })) {
      scope.configs.push_back(config.get());
    }
  }
  scope.isForOtherCompilers =
      std::all_of(specs.begin(), specs.end(), [&](const std::string& spec) { return NeedsOtherCompiler(spec); });
  return scope;
}

bool ProjectParser::IsSelected(const ProjectConfig& config, std::string_view spec) const {
  for (;;) {
    const size_t bar = spec.find('|');
    const std::string_view part = spec.substr(0, bar);
    const bool fits = part == TargetTypeName(m_project.targetType) ||
                      part == CompilerOf(m_project.settings->compiler).keyword || part == config.name ||
                      part == config.platform ||
                      std::find(config.tags.begin(), config.tags.end(), part) != config.tags.end();
    if (!fits) return false;
    if (bar == std::string_view::npos) return true;
    spec.remove_prefix(bar + 1);
  }
}

// A part of it is the keyword of another compiler, and no configuration has something of that name.
bool ProjectParser::NeedsOtherCompiler(std::string_view spec) const {
  std::vector<std::string> parts;
  SplitString(spec, parts, "|");
  return std::any_of(parts.begin(), parts.end(), [&](const std::string& part) {
    const auto compiler = FindCompiler(part);
    return compiler && *compiler != m_project.settings->compiler &&
           std::none_of(m_project.configs.begin(), m_project.configs.end(),
                        [&](const auto& config) { return IsSelected(*config, part); });
  });
}

bool ProjectParser::KeepsRawText() const { return CompilerOf(m_project.settings->compiler).keepsRawSwitches; }

std::string ProjectParser::ForConfig(std::string text, const ProjectConfig& config) const {
  ReplaceAllInPlace(text, "$(PLATFORM)", config.platform);
  ReplaceAllInPlace(text, "$(CONFIG)", config.name);
  return text;
}

void ProjectParser::SubstituteInOptions(OptionMap& options, const ProjectConfig& config) const {
  for (auto& [name, value] : options) value = ForConfig(std::move(value), config);
}

// The block of switches at hand, or the last one that holds a brace, which may be that of what follows it.
std::string ProjectParser::BlockHint() const {
  std::string path;
  int64_t line;
  const char* const block = m_blockWithBrace ? m_blockWithBrace : m_block;
  if (!FindExpandedLine(context.sourceFiles, block, path, line)) return {};
  return "is there a } missing? A block of switches begins at " + path + "(" + std::to_string(line) + ")";
}

// Any tokens in braces. What was apart gets one blank, what was adjacent stays so.
std::string ProjectParser::ReadRawBlock() {
  RequireBrace();
  std::string text;
  const char* lastEnd = current.text.begin;
  for (; current.kind != kCloseBrace; Advance()) {
    if (current.kind == kOpenBrace) m_blockWithBrace = m_block;
    if (current.kind == kEndOfText) throw LexScannerException("Unexpected end of file", current);
    std::string token = current.text.Text();
    SubstituteVariables(token);
    if (current.text.begin != lastEnd) text += ' ';
    text += token;
    lastEnd = current.text.end;
  }
  Advance();
  return text;
}

// A block of switches, which `read` reads. What another compiler's switches look like is not known here: where they
// can't be read they are tokens, as in a raw block.
void ProjectParser::ReadBlockOf(const Scope& scope, const std::function<void()>& read) {
  const ParserBase before = *this;
  m_block = current.text.begin;
  try {
    read();
  } catch (LexScannerException& exception) {
    if (current.kind == kEndOfText || exception.message.starts_with("Expected '}'")) exception.hint = BlockHint();
    static_cast<ParserBase&>(*this) = before;
    if (!scope.isForOtherCompilers || current.kind != kOpenBrace) throw;
    while (current.kind != kCloseBrace) {
      if (current.kind == kEndOfText) throw;
      Advance();
    }
    Advance();
  }
}

void ProjectParser::AppendRawBlock(const Configs& configs, std::string ProjectConfig::*text) {
  const std::string block = ReadRawBlock();
  for (ProjectConfig* config : configs) config->*text = ForConfig(config->*text + " " + block, *config);
}

// False when a `-` begins no statement: it is then the current token again.
bool ProjectParser::ParseOptions(bool add) {
  const LexToken sign = current;
  const LexToken before = previous;
  const LexScanner behindSign = scanner;
  Advance();
  if (current.kind != kIdentifier) {
    throw LexScannerException("Expected identifier when read " + Printed(current), current);
  }
  const bool isCpp = current.Is("cpp"), isRc = current.Is("rc"), isLink = current.Is("link");
  if (!isCpp && !isRc && !isLink) {
    if (add) throw LexScannerException("Expected 'cpp' or 'link' when read " + Printed(current), current);
    current = sign;
    previous = before;
    scanner = behindSign;
    return false;
  }
  Advance();
  const Scope scope = ReadScope();
  ReadBlockOf(scope, [&] {
    if (isLink) return AppendRawBlock(scope.configs, &ProjectConfig::linkerText);
    if (isCpp && add && KeepsRawText()) return AppendRawBlock(scope.configs, &ProjectConfig::compilerText);
    const SwitchChanges changes = isCpp ? ReadCompilerSwitches(*this, !add) : ReadResourceSwitches(*this, !add);
    for (ProjectConfig* config : scope.configs) {
      OptionMap& options = isCpp ? config->compilerOptions : config->resourceOptions;
      changes.Apply(options);
      SubstituteInOptions(options, *config);
    }
  });
  return true;
}

}  // namespace qrex
