#include "server/clangd.h"

#include <utility>

#include "server/text_index.h"

namespace qrex::server {

namespace {

constexpr int kMostIdleDeaths = 5;

Json Capabilities(const Json& completionItem) {
  return {{"offsetEncoding", {"utf-8"}},
          {"textDocument",
           {{"completion", {{"completionItem", completionItem}}},
            {"hover", {{"contentFormat", {"markdown", "plaintext"}}}},
            {"definition", {{"linkSupport", false}}},
            {"documentSymbol", {{"hierarchicalDocumentSymbolSupport", true}}},
            {"rename", {{"prepareSupport", true}}},
            {"codeAction", {{"codeActionLiteralSupport", {{"codeActionKind", {{"valueSet", {"quickfix"}}}}}}}},
            {"signatureHelp", {{"signatureInformation", {{"documentationFormat", {"markdown"}}}}}},
            {"publishDiagnostics", {{"relatedInformation", true}}}}}};
}

}  // namespace

Clangd::Clangd(std::vector<std::string> words, std::string folder, Json completionItem, Arrive arrive)
    : m_words(std::move(words)),
      m_folder(std::move(folder)),
      m_completionItem(std::move(completionItem)),
      m_arrive(std::move(arrive)) {
  Start();
}

Clangd::~Clangd() { Stop(); }

void Clangd::Start() {
  m_peer = std::make_unique<platform::PeerProcess>(m_words);
  if (!m_peer->IsStarted()) {
    m_peer.reset();
    m_hasGivenUp = true;
    return;
  }
  m_hasAnswered = false;
  const int generation = ++m_generation;
  m_reader = std::thread([this, generation, peer = m_peer.get()] {
    FrameReader frames;
    for (std::string bytes; peer->Read(bytes); bytes.clear()) {
      frames.Add(bytes);
      while (auto body = frames.Next()) m_arrive(generation, std::move(body));
    }
    m_arrive(generation, std::nullopt);
  });
  m_isReady = false;
  const Json params = {
      {"processId", nullptr}, {"rootUri", UriOfPath(m_folder)}, {"capabilities", Capabilities(m_completionItem)}};
  const int64_t id = m_nextId++;
  const auto begin = [this](const Json&) {
    m_isReady = true;
    Send({{"jsonrpc", "2.0"}, {"method", "initialized"}, {"params", Json::object()}});
    for (auto& [path, shown] : m_shown) Open(path, shown);
    for (const Json& message : std::exchange(m_waiting, {})) Send(message);
  };
  m_asked[id] = {begin, {}, true};
  m_peer->Write(Framed({{"jsonrpc", "2.0"}, {"id", id}, {"method", "initialize"}, {"params", params}}));
}

void Clangd::Stop() {
  if (m_peer) m_peer->CloseStreams();
  if (m_reader.joinable()) m_reader.join();
  m_peer.reset();
}

void Clangd::Restart() {
  Stop();
  m_idleDeaths = m_hasAnswered ? 1 : m_idleDeaths + 1;
  m_waiting.clear();
  m_hasGivenUp = m_idleDeaths > kMostIdleDeaths;
  std::vector<Asked> lost;
  std::erase_if(m_asked, [&](auto& asked) {
    const bool isLost = asked.second.isRepeated || m_hasGivenUp;
    if (isLost && !asked.second.message.is_null()) lost.push_back(std::move(asked.second));
    return isLost;
  });
  for (auto& [id, asked] : m_asked) {
    asked.isRepeated = true;
    m_waiting.push_back(asked.message);
  }
  if (!m_hasGivenUp) Start();
  for (const Asked& asked : lost) asked.answer(nullptr);
}

// What is asked ahead of the answer to `initialize` waits for it. Texts are opened then as they are.
void Clangd::Send(const Json& message) {
  if (!m_peer) return;
  if (m_isReady) {
    m_peer->Write(Framed(message));  // what is lost is answered when its end is met
  } else {
    m_waiting.push_back(message);
  }
}

int64_t Clangd::Ask(const std::string& method, Json params, Answer answer) {
  const int64_t id = m_nextId++;
  if (!m_peer) {
    answer(nullptr);
    return id;
  }
  const Json message = {{"jsonrpc", "2.0"}, {"id", id}, {"method", method}, {"params", std::move(params)}};
  m_asked[id] = {std::move(answer), message, false};
  Send(message);
  return id;
}

void Clangd::AnswerAll() {
  std::vector<Answer> answers;
  std::erase_if(m_asked, [&](auto& asked) {
    if (asked.second.message.is_null()) return false;  // `initialize`
    answers.push_back(std::move(asked.second.answer));
    return true;
  });
  for (const Answer& answer : answers) answer(nullptr);
}

void Clangd::Cancel(int64_t id) {
  if (m_asked.contains(id)) Tell("$/cancelRequest", {{"id", id}});
}

void Clangd::Tell(const std::string& method, Json params) {
  Send({{"jsonrpc", "2.0"}, {"method", method}, {"params", std::move(params)}});
}

void Clangd::Take(int generation, const std::optional<std::string>& body,
                  const std::function<void(const Json&)>& other) {
  if (generation != m_generation) return;
  if (!body) return Restart();
  const Json message = Json::parse(*body, nullptr, false);
  if (message.is_discarded() || !message.is_object()) return;
  if (message.contains("method")) return other(message);
  const auto asked = m_asked.find(NumberAt(message, "id", -1));
  if (asked == m_asked.end()) return;
  const Answer answer = std::move(asked->second.answer);
  m_asked.erase(asked);
  m_hasAnswered |= m_isReady;
  answer(At(message, "result"));
}

// --- Texts

void Clangd::Open(const std::string& path, Shown& shown) {
  const char* const language = shown.isCpp ? "cpp" : "c";
  Send({{"jsonrpc", "2.0"},
        {"method", "textDocument/didOpen"},
        {"params",
         {{"textDocument",
           {{"uri", UriOfPath(path)}, {"languageId", language}, {"version", shown.version}, {"text", shown.text}}}}}});
}

void Clangd::Show(const std::string& path, const std::string& text, bool isCpp) {
  const auto [entry, isNew] = m_shown.try_emplace(path);
  Shown& shown = entry->second;
  if (!isNew && shown.text == text) return;
  shown.text = text;
  shown.isCpp = isCpp;
  ++shown.version;
  if (!m_isReady) return;
  if (isNew) return Open(path, shown);
  Tell("textDocument/didChange", {{"textDocument", {{"uri", UriOfPath(path)}, {"version", shown.version}}},
                                  {"contentChanges", Json::array({{{"text", text}}})}});
}

void Clangd::Hide(const std::string& path) {
  if (m_shown.erase(path) > 0 && m_isReady)
    Tell("textDocument/didClose", {{"textDocument", {{"uri", UriOfPath(path)}}}});
}

void Clangd::TellSaved(const std::string& path) {
  if (m_isReady) Tell("textDocument/didSave", {{"textDocument", {{"uri", UriOfPath(path)}}}});
}

}  // namespace qrex::server
