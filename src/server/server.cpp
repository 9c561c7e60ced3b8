#include "server/server.h"

#include "platform/console.h"
#include "platform/standard_input.h"
#include "text/exceptions.h"
#include "text/text_writer.h"
#include "text/version.h"

namespace qrex::server {

namespace {

constexpr int kInvalidRequest = -32600, kMethodNotFound = -32601, kInvalidParams = -32602, kInternalError = -32603;
constexpr int kNotInitialised = -32002, kRequestFailed = -32803;

Json ServerCapabilities(Columns columns) {
  return {{"positionEncoding", columns == Columns::Utf8 ? "utf-8" : "utf-16"},
          {"textDocumentSync", {{"openClose", true}, {"change", 2}, {"save", true}}},
          {"hoverProvider", true},
          {"completionProvider", {{"triggerCharacters", {".", ">", ":", "@", "$", "<"}}, {"resolveProvider", true}}},
          {"signatureHelpProvider", {{"triggerCharacters", {"(", ","}}}},
          {"definitionProvider", true},
          {"declarationProvider", true},
          {"typeDefinitionProvider", true},
          {"implementationProvider", true},
          {"referencesProvider", true},
          {"documentHighlightProvider", true},
          {"documentSymbolProvider", true},
          {"workspaceSymbolProvider", true},
          {"renameProvider", {{"prepareProvider", true}}},
          {"inlayHintProvider", true},
          {"codeActionProvider", {{"codeActionKinds", {"quickfix"}}}},
          {"foldingRangeProvider", true},
          {"semanticTokensProvider",
           {{"legend", {{"tokenTypes", TokenTypes()}, {"tokenModifiers", Json::array()}}}, {"full", true}}},
          {"executeCommandProvider", {{"commands", {"qrex.showGenerated", "qrex.hideGenerated"}}}}};
}

}  // namespace

// --- What arrives

void Mailbox::Put(Item item) {
  const std::lock_guard lock(m_mutex);
  m_items.push_back(std::move(item));
  m_arrived.notify_one();
}

Mailbox::Item Mailbox::Take() {
  std::unique_lock lock(m_mutex);
  m_arrived.wait(lock, [this] { return !m_items.empty(); });
  Item item = std::move(m_items.front());
  m_items.pop_front();
  return item;
}

bool Mailbox::IsEmpty() {
  const std::lock_guard lock(m_mutex);
  return m_items.empty();
}

int Server::Run() {
  std::thread reader([this] {
    FrameReader frames;
    for (std::string bytes; platform::ReadStdin(bytes); bytes.clear()) {
      frames.Add(bytes);
      while (auto body = frames.Next()) m_mailbox.Put({true, 0, std::move(body)});
    }
    m_mailbox.Put({true, 0, std::nullopt});
  });
  reader.detach();  // it may wait for input for as long as there is somebody to give some
  while (!m_isOver) {
    if (!m_unmirrored.empty() && m_clangd && m_mailbox.IsEmpty()) {
      MirrorNext();
      continue;
    }
    const Mailbox::Item item = m_mailbox.Take();
    if (!item.isOfEditor) {
      if (m_clangd) m_clangd->Take(item.generation, item.body, [this](const Json& message) { FromClangd(message); });
    } else if (item.body) {
      Handle(*item.body);
    } else {
      m_isOver = true;
    }
    // Edits that wait are all made ahead of the next translation.
    if (!m_isOver && m_isInitialised && m_mailbox.IsEmpty()) BringUpToDate();
  }
  m_clangd.reset();
  return m_isShutDown ? 0 : 1;
}

void Server::Send(const Json& message) {
  platform::WriteStdout(Framed(message));
  platform::FlushStdout();
}

void Server::Tell(const std::string& method, Json params) {
  Send({{"jsonrpc", "2.0"}, {"method", method}, {"params", std::move(params)}});
}

void Server::Fail(const Json& id, int code, const std::string& message) {
  Send({{"jsonrpc", "2.0"}, {"id", id}, {"error", {{"code", code}, {"message", message}}}});
}

void Server::Log(int type, const std::string& message, bool isShown) {
  Tell(isShown ? "window/showMessage" : "window/logMessage", {{"type", type}, {"message", message}});
}

void Server::Handle(const std::string& body) {
  const Json message = Json::parse(body, nullptr, false);
  if (message.is_discarded() || !message.is_object()) return Fail(nullptr, kInvalidRequest, "no JSON object");
  const std::string method = TextAt(message, "method");
  if (method.empty()) return;  // an answer
  const bool isRequest = message.contains("id");
  try {
    isRequest ? HandleRequest(method, message["id"], At(message, "params"))
              : HandleNotification(method, At(message, "params"));
  } catch (const Json::exception& exception) {
    if (isRequest) Fail(message["id"], kInvalidParams, exception.what());
  } catch (const IException& exception) {
    if (isRequest) Fail(message["id"], kInternalError, ExceptionText(exception));
  }
}

void Server::HandleRequest(const std::string& method, const Json& id, const Json& params) {
  if (method == "initialize") return Initialize(id, params);
  if (!m_isInitialised) return Fail(id, kNotInitialised, "initialize comes first");
  if (m_isShutDown) return Fail(id, kInvalidRequest, "the server is shut down");
  if (method == "shutdown") {
    m_isShutDown = true;
    m_clangd.reset();
    return Send({{"jsonrpc", "2.0"}, {"id", id}, {"result", nullptr}});
  }
  for (const Feature* feature = kFeatures; feature->handle; ++feature) {
    if (feature->method != method) continue;
    BringUpToDate();
    m_requestAtHand = id.dump();
    const Reply reply = [this, id](Json result) {
      m_askedOfClangd.erase(id.dump());
      if (result.is_object() && result.contains("refused")) return Fail(id, kRequestFailed, TextAt(result, "refused"));
      Send({{"jsonrpc", "2.0"}, {"id", id}, {"result", std::move(result)}});
    };
    return (this->*feature->handle)(params, reply);
  }
  Fail(id, kMethodNotFound, method);
}

void Server::HandleNotification(const std::string& method, const Json& params) {
  if (method == "exit") {
    m_isOver = true;
  } else if (method == "$/cancelRequest") {
    const auto asked = m_askedOfClangd.find(At(params, "id").dump());
    if (asked != m_askedOfClangd.end() && m_clangd) m_clangd->Cancel(asked->second);
  } else if (!m_isInitialised || m_isShutDown) {
    return;
  } else if (method == "textDocument/didOpen") {
    Open(params);
  } else if (method == "textDocument/didChange") {
    Change(params);
  } else if (method == "textDocument/didClose") {
    Close(params);
  } else if (method == "textDocument/didSave") {
    Saved(PathOfUri(TextAt(params, "textDocument/uri")));
  } else if (method == "workspace/didChangeWatchedFiles") {
    for (const Json& change : At(params, "changes")) Saved(PathOfUri(TextAt(change, "uri")));
  }
}

void Server::Initialize(const Json& id, const Json& params) {
  if (m_isInitialised) return Fail(id, kInvalidRequest, "initialized already");
  m_isInitialised = true;
  for (const Json& encoding : At(params, "capabilities/general/positionEncodings")) {
    if (encoding == "utf-8") m_columns = Columns::Utf8;
  }
  const Json& item = At(params, "capabilities/textDocument/completion/completionItem");
  m_completionItem = item.is_object() ? item : Json::object();
  m_rootFolder = PathOfUri(TextAt(params, "rootUri"));
  const Json& folders = At(params, "workspaceFolders");
  if (m_rootFolder.empty() && folders.is_array() && !folders.empty())
    m_rootFolder = PathOfUri(TextAt(folders[0], "uri"));
  const Json& options = At(params, "initializationOptions");
  m_configuration = TextAt(options, "configuration");
  if (!m_configuration.empty() && m_configuration.front() != '/')
    m_configuration = m_rootFolder + "/" + m_configuration;
  for (const Json& line : At(options, "arguments")) {
    if (line.is_string()) m_lines.emplace_back(line.get<std::string>());
  }
  const Json& clangd = At(options, "clangd");
  m_clangdWords = {clangd.is_string() ? clangd.get<std::string>() : "clangd-19"};
  if (clangd.is_null()) m_clangdWords.emplace_back("clangd");  // tried where there is none of the first name
  Send({{"jsonrpc", "2.0"},
        {"id", id},
        {"result",
         {{"capabilities", ServerCapabilities(m_columns)},
          {"serverInfo", {{"name", "qrex-lsp"}, {"version", std::string(Version())}}}}}});
}

}  // namespace qrex::server
