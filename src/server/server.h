// The language server: between an editor, on standard input and output, and clangd, which sees generated texts alone.
// One thread works on what arrives; two others read what the editor and clangd write.
#pragma once

#include <condition_variable>
#include <deque>
#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <optional>
#include <set>
#include <string>
#include <thread>

#include "server/clangd.h"
#include "server/mapping.h"
#include "server/own_language.h"
#include "server/source_world.h"
#include "text/source_texts.h"

namespace qrex::server {

// What the two readers bring, in the order of its arrival.
class Mailbox {
 public:
  struct Item {
    bool isOfEditor = true;
    int generation = 0;               // of clangd
    std::optional<std::string> body;  // none: the stream has ended
  };
  void Put(Item item);
  Item Take();  // waits
  bool IsEmpty();

 private:
  std::mutex m_mutex;
  std::condition_variable m_arrived;
  std::deque<Item> m_items;
};

class Server {
 public:
  explicit Server(std::string program) : m_program(std::move(program)) {}
  int Run();  // until the editor says `exit`, or is gone; the exit status

 private:
  struct Document {
    std::string uri, path, language;
    int64_t version = 0;
    TextIndex text;
    ProjectFile* file = nullptr;  // of the workspace; or null
    bool isShown = false;         // its generated text is, and follows it
    Json clangdDiagnostics = Json::array();
  };
  // Answers later, or at once; null for none.
  using Reply = std::function<void(Json result)>;
  using Handler = void (Server::*)(const Json& params, const Reply& reply);
  struct Feature {
    std::string_view method;
    Handler handle;
  };
  static const Feature kFeatures[];

  // --- Talking (server.cpp)
  void Handle(const std::string& body);
  void HandleRequest(const std::string& method, const Json& id, const Json& params);
  void HandleNotification(const std::string& method, const Json& params);
  void FromClangd(const Json& message);
  void Send(const Json& message);
  void Tell(const std::string& method, Json params);
  void Fail(const Json& id, int code, const std::string& message);
  void Initialize(const Json& id, const Json& params);
  void Log(int type, const std::string& message, bool isShown = false);

  // --- Documents (documents.cpp)
  void Open(const Json& params);
  void Change(const Json& params);
  void Close(const Json& params);
  void Saved(const std::string& path);
  void LoadWorldFor(const std::string& path);
  void LoadWorld();
  void StartClangd();
  void WriteCommands(bool isWhole);
  std::string InMirror(std::string word) const;
  void MirrorNext();
  void TextChanged(Document& document);
  void BringUpToDate();  // translates what has changed, and tells both sides
  void ShowToClangd(Document& document);
  void ShowImports(Document& document);
  void Publish(Document& document);
  void PublishTouched();
  Json DiagnosticsOf(Document& document);
  void FindFile(Document& document);  // in the workspace
  Document* FindDocument(const Json& params);
  Document* DocumentOf(const ProjectFile* file);
  bool IsProjectText(const Document& document) const;
  std::string TextPath(const Document& document) const;

  // --- Features (features.cpp)
  struct Place {
    Document* document = nullptr;
    ProjectFile* file = nullptr;
    size_t offset = 0;
    std::optional<Position> generated;
  };
  std::optional<Place> PlaceOf(const Json& params);
  // Asks clangd about the place, with the other parameters of the request. Null where it has no generated one.
  void AskAt(const std::string& method, const Json& params, const Place& place, Clangd::Answer answer);
  void Hover(const Json& params, const Reply& reply);
  void Completion(const Json& params, const Reply& reply);
  void ResolveCompletion(const Json& params, const Reply& reply);
  void SignatureHelp(const Json& params, const Reply& reply);
  void Definition(const Json& params, const Reply& reply);
  void OtherLocations(const std::string& method, const Json& params, const Reply& reply);
  void Declaration(const Json& params, const Reply& reply) {
    OtherLocations("textDocument/declaration", params, reply);
  }
  void TypeDefinition(const Json& params, const Reply& reply) {
    OtherLocations("textDocument/typeDefinition", params, reply);
  }
  void Implementation(const Json& params, const Reply& reply) {
    OtherLocations("textDocument/implementation", params, reply);
  }
  void References(const Json& params, const Reply& reply) { OtherLocations("textDocument/references", params, reply); }
  void Highlights(const Json& params, const Reply& reply);
  void DocumentSymbols(const Json& params, const Reply& reply);
  void WorkspaceSymbols(const Json& params, const Reply& reply);
  void PrepareRename(const Json& params, const Reply& reply);
  void Rename(const Json& params, const Reply& reply);
  void InlayHints(const Json& params, const Reply& reply);
  void CodeActions(const Json& params, const Reply& reply);
  void SemanticTokensFull(const Json& params, const Reply& reply);
  void Folding(const Json& params, const Reply& reply);
  void ExecuteCommand(const Json& params, const Reply& reply);

  const std::string m_program;
  Mailbox m_mailbox;
  bool m_isInitialised = false, m_isShutDown = false, m_isOver = false;
  OverlaidTexts m_texts;
  std::unique_ptr<SourceWorld> m_world;
  std::unique_ptr<Mapping> m_mapping;
  std::unique_ptr<OwnLanguage> m_own;
  std::unique_ptr<Clangd> m_clangd;
  Columns m_columns = Columns::Utf16;
  Json m_completionItem;        // what the editor can do with one
  std::string m_configuration;  // absolute; empty: none was found yet
  std::vector<std::string> m_lines, m_clangdWords;
  std::string m_rootFolder;
  std::string m_mirror;                           // of this configuration
  std::vector<ProjectFile*> m_unmirrored;         // of the workspace
  std::set<std::string> m_mirrored;               // by path: those are there already
  std::map<std::string, Document> m_documents;    // by address
  std::set<ProjectFile*> m_changed;               // since the last translation
  std::set<const ProjectFile*> m_checkedImports;  // whose texts clangd sees as they are
  std::set<std::string> m_published;              // addresses of closed files with messages of ours
  bool m_mustReload = false, m_hasToldOfClangd = false;
  std::map<std::string, int64_t> m_askedOfClangd;  // by the id of a request of the editor
  std::string m_requestAtHand;
};

}  // namespace qrex::server
