// What the editor has open: its texts, what comes of them, and what is told of it.
#include <algorithm>
#include <utility>

#include "driver/compile_commands.h"
#include "platform/file_system.h"
#include "platform/system.h"
#include "server/server.h"
#include "text/files.h"
#include "text/paths.h"

namespace qrex::server {

namespace {

constexpr int kError = 1, kWarning = 2, kInformation = 3;  // severities, and types of messages

bool IsProjectPath(const std::string& path) {
  return HasExtension(path, "qrex") || HasExtension(path, "qrws") || HasExtension(path, "qrpj") ||
         HasExtension(path, "inc");
}

// The configuration beside or above the path. Of several in a folder the first without a further dot.
std::string FindConfiguration(std::string path) {
  for (size_t slash; (slash = path.rfind('/')) != std::string::npos && slash > 0;) {
    path.resize(slash);
    std::vector<std::string> found = platform::PlainFileNames(path + "/");
    std::erase_if(found, [](const std::string& name) { return !HasExtension(name, "qrex"); });
    std::sort(found.begin(), found.end(), [](const std::string& a, const std::string& b) {
      return std::pair(std::count(a.begin(), a.end(), '.'), a) < std::pair(std::count(b.begin(), b.end(), '.'), b);
    });
    if (!found.empty()) return path + "/" + found.front();
  }
  return {};
}

// The path by which the tool reads it: from the folder that it works in, or absolute.
std::string ToolPath(const std::string& path, const std::string& folder) {
  return path.starts_with(folder + "/") ? path.substr(folder.size() + 1) : path;
}

int SeverityOf(const Message& message) {
  if (message.severity == Severity::Note) return kInformation;
  return message.severity == Severity::Error ? kError : kWarning;
}

std::string CacheFolder(const std::string& configuration) {
  std::string base;
  for (const auto& [name, folder] : {std::pair("XDG_CACHE_HOME", ""), {"LOCALAPPDATA", ""}, {"HOME", "/.cache"}}) {
    const auto value = platform::EnvironmentValue(name);
    if (base.empty() && value && !value->empty()) base = NormalisePath(*value) + folder;
  }
  if (base.empty()) base = "/tmp/.cache";
  return base + "/qrex-lsp/" + std::to_string(Crc32(configuration));
}

}  // namespace

// --- The workspace

void Server::LoadWorldFor(const std::string& path) {
  if (m_world) return;
  if (m_configuration.empty()) m_configuration = FindConfiguration(path);
  if (m_configuration.empty() && !m_rootFolder.empty()) m_configuration = FindConfiguration(m_rootFolder + "/.");
  if (!m_configuration.empty()) LoadWorld();
}

void Server::LoadWorld() {
  m_mustReload = false;
  platform::GoToFolder(FolderOf(m_configuration));
  if (m_clangd) m_clangd->AnswerAll();  // the answers would be about files of the workspace that goes
  for (auto& [uri, document] : m_documents) document.file = nullptr;
  m_changed.clear();
  m_unmirrored.clear();
  m_checkedImports.clear();
  m_own.reset();
  m_mapping.reset();
  m_mirror = CacheFolder(m_configuration);
  m_world = std::make_unique<SourceWorld>(m_texts, m_mirror);
  m_mapping = std::make_unique<Mapping>(*m_world);
  m_mapping->columns = m_columns;
  m_own = std::make_unique<OwnLanguage>(*m_world, *m_mapping);
  const std::string name = ToolPath(m_configuration, FolderOf(m_configuration));
  if (!m_world->Load(name, m_lines, m_program)) Log(kError, "cannot load " + m_configuration);
  for (auto& [uri, document] : m_documents) {
    FindFile(document);
    m_texts.Lay(TextPath(document), document.text.Text());
    if (document.file) m_changed.insert(document.file);
  }
  if (!m_world->IsLoaded()) return;
  for (const auto& project : m_world->Loaded().projects) {
    project->CollectFiles();
    for (ProjectFile* file : project->files) {
      if (!m_mirrored.contains(m_world->GeneratedPathOf(*file))) m_unmirrored.push_back(file);
    }
  }
  WriteCommands(false);
  if (!m_clangd) StartClangd();
}

// The commands of a build, of the texts in the mirror. clangd takes note of those that are new: `isWhole`, when all of
// the workspace is there for its index.
void Server::WriteCommands(bool isWhole) {
  Json commands = Json::parse(CompileCommandsOf(m_world->Loaded(), FolderOf(m_configuration)), nullptr, false);
  for (Json& command : commands) {
    for (Json& word : command["arguments"]) word = InMirror(word.get<std::string>());
    command["file"] = InMirror(TextAt(command, "file"));
  }
  const std::string text = commands.dump(1, ' ', false, Json::error_handler_t::replace) + (isWhole ? "\n" : "");
  const std::string path = m_mirror + "/compile_commands.json";
  std::string present;
  if (ReadWholeFile(present, path) && (present == text || present == text + "\n")) return;
  CreateDirectories(path, false);
  ReplaceFile(path, text);
}

// A word of a command that is, or names behind its switch, a place among the translated files.
std::string Server::InMirror(std::string word) const {
  const std::string folder = "qrexsource/";
  const size_t at = word.find(folder);
  const bool isPath = at == 0 || (at == 2 && word[0] == '-');
  return isPath ? word.insert(at, m_mirror + "/") : word;
}

// In idle moments, so that clangd's index comes to know what nobody has opened.
void Server::MirrorNext() {
  ProjectFile& file = *m_unmirrored.back();
  m_unmirrored.pop_back();
  m_mirrored.insert(m_world->GeneratedPathOf(file));
  try {
    if (!DocumentOf(&file)) m_world->MirrorApart(file);
  } catch (const IException& exception) {
    Log(kWarning, ExceptionText(exception));
    m_unmirrored.clear();
  }
  if (!m_unmirrored.empty()) return;
  m_world->EndMirroring();
  WriteCommands(true);
}

void Server::StartClangd() {
  if (m_clangdWords.front().empty()) return;
  std::string program;
  for (const std::string& name : m_clangdWords) {
    if (program.empty() && (name.find_first_of("/\\") != std::string::npos || !platform::FindProgram(name).empty()))
      program = name;
  }
  if (program.empty()) return Log(kWarning, "clangd is not installed: C++ itself is not known", true);
  m_clangd = std::make_unique<Clangd>(
      std::vector<std::string>{program, "--compile-commands-dir=" + m_mirror, "--use-dirty-headers", "--log=error",
                               "--header-insertion=never"},
      FolderOf(m_configuration), m_completionItem, [this](int generation, std::optional<std::string> body) {
        m_mailbox.Put({false, generation, std::move(body)});
      });
}

// --- Documents

bool Server::IsProjectText(const Document& document) const { return IsProjectPath(document.path); }

Server::Document* Server::FindDocument(const Json& params) {
  const auto found = m_documents.find(TextAt(params, "textDocument/uri"));
  return found == m_documents.end() ? nullptr : &found->second;
}

Server::Document* Server::DocumentOf(const ProjectFile* file) {
  const auto found = std::find_if(m_documents.begin(), m_documents.end(),
                                  [&](const auto& entry) { return file && entry.second.file == file; });
  return found == m_documents.end() ? nullptr : &found->second;
}

// The tool knows it by its path without links.
void Server::FindFile(Document& document) {
  if (!m_world || !m_world->IsLoaded()) return;
  document.file = m_world->FindFile(document.path);
  std::string real;
  if (!document.file && RealPathOf(document.path, real)) document.file = m_world->FindFile(real);
  if (document.file) m_mapping->openAddresses[document.file] = document.uri;
}

// Under the name by which the tool reads it.
std::string Server::TextPath(const Document& document) const {
  return document.file ? SourceWorld::SourcePathOf(*document.file) : ToolPath(document.path, FolderOf(m_configuration));
}

void Server::Open(const Json& params) {
  const std::string uri = TextAt(params, "textDocument/uri");
  const std::string path = PathOfUri(uri);
  if (path.empty()) return;
  Document& document = m_documents[uri] = Document();
  document.uri = uri;
  document.path = path;
  document.language = TextAt(params, "textDocument/languageId");
  document.version = NumberAt(params, "textDocument/version");
  document.text = TextIndex(TextAt(params, "textDocument/text"));
  LoadWorldFor(path);
  FindFile(document);
  TextChanged(document);
}

void Server::Change(const Json& params) {
  Document* const document = FindDocument(params);
  if (!document) return;
  document->version = NumberAt(params, "textDocument/version", document->version);
  for (const Json& change : At(params, "contentChanges")) {
    const std::string text = TextAt(change, "text");
    const Json& range = At(change, "range");
    if (range.is_null()) {
      document->text = TextIndex(text);
      continue;
    }
    std::string whole = document->text.Text();
    const size_t begin = document->text.OffsetOf(PositionFrom(At(range, "start")), m_columns);
    const size_t end = document->text.OffsetOf(PositionFrom(At(range, "end")), m_columns);
    whole.replace(begin, end > begin ? end - begin : 0, text);
    document->text = TextIndex(std::move(whole));
  }
  TextChanged(*document);
}

void Server::TextChanged(Document& document) {
  if (!m_world) return;
  m_texts.Lay(TextPath(document), document.text.Text());
  if (document.file) m_changed.insert(document.file);
  if (IsProjectText(document)) m_mustReload = true;
}

void Server::Close(const Json& params) {
  Document* const document = FindDocument(params);
  if (!document) return;
  const std::string path = TextPath(*document);
  ProjectFile* const file = document->file;
  if (m_mapping) m_mapping->openAddresses.erase(file);
  if (m_clangd && m_world && file) m_clangd->Hide(m_world->GeneratedPathOf(*file));
  Tell("textDocument/publishDiagnostics", {{"uri", document->uri}, {"diagnostics", Json::array()}});
  m_mustReload = m_mustReload || IsProjectText(*document);
  m_documents.erase(document->uri);
  if (m_world) m_texts.Lift(path);
  if (file) m_changed.insert(file);  // the disk counts again
}

// On the disk: of what is open, the editor's text counts.
void Server::Saved(const std::string& path) {
  if (!m_world || path.empty()) return;
  if (IsProjectPath(path)) m_mustReload = true;
  ProjectFile* const file = m_world->IsLoaded() ? m_world->FindFile(path) : nullptr;
  if (file && !DocumentOf(file)) m_changed.insert(file);
}

// --- Translation

void Server::BringUpToDate() {
  if (m_mustReload && m_world) {
    LoadWorld();
    for (auto& [uri, document] : m_documents) Publish(document);
  }
  if (!m_world || !m_world->IsLoaded()) return PublishTouched();
  std::set<ProjectFile*> headers;
  for (ProjectFile* file : m_changed) {
    m_world->Changed(*file);
    if (file->kind == FileKind::H) headers.insert(file);
    if (!DocumentOf(file)) m_unmirrored.push_back(file);  // the disk counts
  }
  const bool hasChanged = !m_changed.empty();
  m_changed.clear();
  if (hasChanged) {
    if (!headers.empty()) m_checkedImports.clear();
    for (auto& [uri, document] : m_documents) {
      if (!document.file) continue;
      m_world->TranslationOf(*document.file);
      ShowImports(document);
    }
    for (const bool isHeader : {true, false}) {  // who includes a text is to find it as it is now
      for (auto& [uri, document] : m_documents) {
        if (document.file && (document.file->kind == FileKind::H) == isHeader) ShowToClangd(document);
      }
    }
    for (ProjectFile* header : headers) {
      if (m_clangd) m_clangd->TellSaved(m_world->GeneratedPathOf(*header));
    }
  }
  PublishTouched();
}

void Server::ShowToClangd(Document& document) {
  const TextIndex& generated = m_world->TranslationOf(*document.file).generated;
  if (m_clangd && !m_world->TranslationOf(*document.file).IsUnknown())
    m_clangd->Show(m_world->GeneratedPathOf(*document.file), generated.Text(), document.file->kind != FileKind::C);
  if (document.isShown) Tell("qrex/generatedChanged", {{"uri", document.uri}, {"text", generated.Text()}});
}

// What is open has the text of the editor; the rest is read from the mirror.
void Server::ShowImports(Document& document) {
  if (!m_clangd) return;
  for (ProjectFile* import : m_world->ImportsOf(*document.file)) {
    const bool isNew = m_checkedImports.insert(import).second;
    if (isNew && !DocumentOf(import)) m_world->Mirror(*import);
  }
}

// --- Diagnostics

Json Server::DiagnosticsOf(Document& document) {
  Json all = Json::array();
  for (const Message& message : m_world->MessagesOf(TextPath(document))) {
    const bool isPlaced = message.place.begin >= 0;
    size_t begin = isPlaced ? static_cast<size_t>(message.place.begin) : 0;
    if (!isPlaced && message.place.line > 0) {
      begin = document.text.OffsetOf({message.place.line - 1, 0}, m_columns);
    }
    size_t end = message.place.end > message.place.begin ? static_cast<size_t>(message.place.end) : begin + 1;
    Json one = {{"range", RangeJson(document.text, begin, end, m_columns)},
                {"severity", SeverityOf(message)},
                {"source", "qrex"},
                {"message", message.text}};
    if (message.code != 0) one["code"] = message.code;
    for (const std::string& hint : message.hints) {
      if (!hint.empty()) one["message"] = TextAt(one, "message") + "\nhint: " + hint;
    }
    all.push_back(std::move(one));
  }
  if (!document.file) return all;
  for (const Json& diagnostic : document.clangdDiagnostics) {
    Json one = diagnostic;
    one["range"] = m_mapping->RangeOf(*document.file, m_mapping->ToSource(*document.file, At(diagnostic, "range")));
    one.erase("relatedInformation");
    for (const Json& related : At(diagnostic, "relatedInformation")) {
      one["relatedInformation"].push_back(
          {{"location", m_mapping->Locations(At(related, "location"))}, {"message", TextAt(related, "message")}});
    }
    if (std::find(all.begin(), all.end(), one) == all.end()) all.push_back(std::move(one));
  }
  return all;
}

void Server::Publish(Document& document) {
  Tell("textDocument/publishDiagnostics",
       {{"uri", document.uri}, {"version", document.version}, {"diagnostics", DiagnosticsOf(document)}});
}

void Server::PublishTouched() {
  if (!m_world) return;
  for (const std::string& touched : m_world->TakeTouched()) {
    const auto open = std::find_if(m_documents.begin(), m_documents.end(),
                                   [&](const auto& entry) { return TextPath(entry.second) == touched; });
    if (open != m_documents.end()) {
      Publish(open->second);
    } else if (touched.empty()) {
      for (const Message& message : m_world->MessagesOf(touched)) Log(kError, message.text);
    }
  }
}

void Server::FromClangd(const Json& message) {
  if (TextAt(message, "method") != "textDocument/publishDiagnostics" || !m_world || !m_world->IsLoaded()) return;
  Document* const document = DocumentOf(m_mapping->FileAt(TextAt(message, "params/uri")));
  if (!document) return;
  document->clangdDiagnostics = At(message, "params/diagnostics");
  Publish(*document);
}

}  // namespace qrex::server
