#include "macro/mpfw_parser.h"

#include <algorithm>

#include "lex/literals.h"
#include "platform/console.h"
#include "platform/system.h"
#include "text/paths.h"

namespace qrex {

bool MpfwParser::ImportPath(const std::string& path, const char*) {
  std::string expanded = path;
  SubstituteVariables(expanded);
  context.importPaths.push_back(NormalisePath(expanded));
  return true;
}

bool MpfwParser::Import(LSFrame&, const std::string& path, const char* position) {
  std::string expanded = path;
  SubstituteVariables(expanded);
  std::string found;
  if (!ResolveImport(expanded, found)) {
    throw LexScannerException("Couldn't open file " + expanded, position).WithHint(ImportHint(expanded));
  }
  if (m_importDepth == 0) m_isTooDeep = m_isTooDeepTold = false;
  if (m_importDepth >= kMaxImportDepth || platform::IsStackShort()) {
    m_isTooDeep = true;
    throw LexScannerException("Imports nested too deeply" + CycleText(found), position);
  }
  ++m_importDepth;
  m_imports.push_back(found);
  const bool loaded = LoadSourceFile(found) != nullptr;
  m_imports.pop_back();
  --m_importDepth;
  if (loaded) m_isTooDeep = false;
  return loaded;
}

// " : a imports b imports a", of the files under expansion; nothing when `path` is none of them.
std::string MpfwParser::CycleText(const std::string& path) const {
  const auto last = std::find(m_imports.rbegin(), m_imports.rend(), path);
  if (last == m_imports.rend()) return {};
  std::string text = " : ";
  for (auto open = last.base() - 1; open != m_imports.end(); ++open) text += *open + " imports ";
  return text + path;
}

std::string MpfwParser::PlaceOf(const char* position) const {
  std::string path;
  int64_t line;
  return FindSourceLine(context.sourceFiles, position, path, line) ? path + "(" + std::to_string(line) + ")" : "";
}

std::unique_ptr<MpfwSourceFile> MpfwParser::CreateSourceFile() { return std::make_unique<MpfwSourceFile>(); }

MpfwSourceFile* MpfwParser::LoadSourceFile(const std::string& path, const std::string& extraText) {
  std::string text;
  // What is looked up is a plain file; a configuration may also come through a pipe.
  if (!context.rootFrame.World().sources->Read(text, path, SourceTexts::Form::Stream))
    throw LexScannerException("Couldn't open file " + path, current);
  std::unique_ptr<MpfwSourceFile> made = CreateSourceFile();
  MpfwSourceFile& file = *made;
  file.path = path;
  file.text = std::move(text);
  if (!extraText.empty() && !file.text.empty() && file.text.back() != '\n') file.text += '\n';  // lines of their own
  if (!extraText.empty()) file.addedText = file.text.size();
  file.text += extraText;
  context.sourceFiles.push_back(std::move(made));  // ahead of the expansion, so that its errors are found in it
  return ExpandSourceFile(file) ? &file : nullptr;
}

bool MpfwParser::ExpandSourceFile(MpfwSourceFile& file) {
  try {
    file.expansion =
        ExpandToStringWithMap(this, context.rootFrame, TextRange(std::string_view(file.text)), 0, 0, file.map);
    return true;
  } catch (const LexScannerException& exception) {
    // One message for all files that led too deep.
    if (!m_isTooDeep || !m_isTooDeepTold) {
      context.rootFrame.World().messages->Take(ParseErrorOf(context.sourceFiles, exception));
    }
    m_isTooDeepTold = m_isTooDeep;
    return false;
  }
}

void MpfwParser::SubstituteVariables(std::string& text) const { context.rootFrame.Substitute(text); }

void MpfwParser::ReadString(std::string& out) {
  if (current.kind != kSingleQuoted && current.kind != kDoubleQuoted) {
    throw LexScannerException("Expected quoted string when read " + Printed(current), current);
  }
  DecodeString(current, out);
  SubstituteVariables(out);
}

void MpfwParser::RequireNoQuote(const std::string& name, const LexToken& token) {
  if (name.find('"') == std::string::npos) return;
  throw LexScannerException("A double quote can't stand in " + Printed(token), token);
}

namespace {

void CheckPath(const std::string& path, const LexToken& token) {
  if (path.find('\\') != std::string::npos) {
    throw LexScannerException("Forward slashes must be used in " + Printed(token), token);
  }
  if (!platform::IsValidUtf8(path)) throw LexScannerException("Path is not valid UTF-8 : " + Printed(token), token);
  MpfwParser::RequireNoQuote(path, token);
}

}  // namespace

void MpfwParser::ReadPath(std::string& out) {
  ReadString(out);
  CheckPath(out, current);
}

void MpfwParser::ReadStringOrExpression(std::string& out) {
  if (current.kind != kOpenParen) {
    ReadString(out);
    Advance();
    return;
  }
  Advance();
  out = ReadStringValue();
  Expect(kCloseParen, ")");
  SubstituteVariables(out);
}

void MpfwParser::ReadNamedString(const std::string& name, std::string& out) {
  auto fail = [&](const std::string& expected) {
    throw LexScannerException("Expected " + expected + " when read " + Printed(current), current);
  };
  if (current.kind != kDollar) fail("'$'");
  Advance();
  if (current.kind != kIdentifier || !current.Is(name)) fail("'" + name + "'");
  Advance();
  Expect(kAssign, "=");
  if (current.kind != kDoubleQuoted) fail("quoted string");
  DecodeString(current, out);
}

void MpfwParser::ReadNamedPath(const std::string& name, std::string& out) {
  ReadNamedString(name, out);
  const LexToken path = current;
  Advance();
  CheckPath(out, path);
  if (!out.empty() && out.back() == '/') {
    throw LexScannerException("Path can't end with a trailing slash : " + Printed(path), path);
  }
}

bool MpfwParser::ParseImportStatement() {
  if (current.kind != kAt) return false;
  m_importBegin = current.text.begin;
  Advance();
  if (!current.Is("import")) throw LexScannerException("Syntax error: @" + Printed(current), current);
  Advance();
  std::string path, found;
  ReadString(path);
  if (!ResolveImport(path, found)) {
    throw LexScannerException("Couldn't open file " + path, previous).WithHint(ImportHint(path));
  }
  if (MpfwSourceFile* file = FindLoaded(found)) OnImportedFile(*file);
  Advance();
  return true;
}

// A file that several texts import was loaded, and expanded, for each of them; the one wanted here follows its
// importer. A statement that the macro layer did not see loads nothing: it means the file as an earlier one loaded it.
MpfwSourceFile* MpfwParser::FindLoaded(const std::string& path) const {
  const auto& files = context.sourceFiles;
  auto isWanted = [&](const auto& candidate) { return EqualIgnoringCase(candidate->path, path); };
  auto importer = std::find_if(files.begin(), files.end(), [&](const auto& file) {
    return TextRange(std::string_view(file->expansion)).Contains(current.text.begin);
  });
  auto file = std::find_if(importer == files.end() ? importer : importer + 1, files.end(), isWanted);
  if (file == files.end()) file = std::find_if(files.begin(), files.end(), isWanted);
  return file == files.end() ? nullptr : file->get();
}

bool MpfwParser::ParseVariableStatement(std::string* name, std::string* value) {
  if (current.kind != kDollar) return false;
  Advance();
  const std::string variable = ReadIdentifier();
  Expect(kAssign, "=");
  std::string text;
  if (current.Is("path")) {
    Advance();
    ReadStringOrExpression(text);
    text = NormalisePath(text);
  } else {
    ReadStringOrExpression(text);
  }
  context.rootFrame.DefineSubstitution(variable, text);
  if (name) *name = variable;
  if (value) *value = text;
  return true;
}

void MpfwParser::ParseImported(MpfwSourceFile& file, MpfwParser& parser, void (*parse)(MpfwParser& parser)) {
  if (m_importDepth >= kMaxImportDepth || platform::IsStackShort())
    throw LexScannerException("Imports nested too deeply", m_importBegin);
  parser.m_importDepth = m_importDepth + 1;
  const TextRange expansion{std::string_view(file.expansion)};
  const LexToken leftover = [&] {
    try {
      parser.SetInput(expansion);
      parse(parser);
      return parser.current;
    } catch (LexScannerException& exception) {
      MapErrorPosition(file.map, expansion, exception);
      context.rootFrame.World().messages->Take(ParseErrorOf(context.sourceFiles, exception));
      throw LexScannerException("while processing @import of " + file.path, m_importBegin);
    }
  }();
  if (leftover.kind != kEndOfText) {
    throw LexScannerException("Syntax error when read '" + Printed(leftover) + "' in " + file.path, m_importBegin);
  }
}

}  // namespace qrex
