// clangd as a child: it knows the generated texts alone, and speaks in bytes. One that dies is started again, and asked
// again what it has not answered.
#pragma once

#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <thread>
#include <vector>

#include "platform/peer_process.h"
#include "server/json_rpc.h"

namespace qrex::server {

class Clangd {
 public:
  using Answer = std::function<void(const Json& result)>;  // null where it failed
  // Called from another thread: a message of the child of this generation, or none where that has ended.
  using Arrive = std::function<void(int generation, std::optional<std::string> body)>;

  // `completionItem`: what the editor can do with items of completion, in words of the protocol.
  Clangd(std::vector<std::string> words, std::string folder, Json completionItem, Arrive arrive);
  ~Clangd();

  bool IsRunning() const { return m_peer != nullptr; }
  bool HasGivenUp() const { return m_hasGivenUp; }  // it died again and again, or could not be started
  // Answers at once, with null, where it does not run.
  int64_t Ask(const std::string& method, Json params, Answer answer);
  void Cancel(int64_t id);
  void AnswerAll();  // with null: what was asked is of no use any more
  void Tell(const std::string& method, Json params);
  // What arrived. Notifications and requests of the child go to `other`.
  void Take(int generation, const std::optional<std::string>& body, const std::function<void(const Json&)>& other);

  // The text of a file as it is to be seen, whatever is on the disk; sent again to a new child.
  void Show(const std::string& path, const std::string& text, bool isCpp);
  void Hide(const std::string& path);
  bool Shows(const std::string& path) const { return m_shown.contains(path); }
  void TellSaved(const std::string& path);  // the others look at it again

 private:
  struct Shown {
    std::string text;
    bool isCpp = true;
    int64_t version = 0;
  };
  void Start();
  void Stop();
  void Restart();
  void Open(const std::string& path, Shown& shown);
  void Send(const Json& message);

  const std::vector<std::string> m_words;
  const std::string m_folder;
  const Json m_completionItem;
  const Arrive m_arrive;
  std::unique_ptr<platform::PeerProcess> m_peer;
  std::thread m_reader;
  int m_generation = 0;
  bool m_hasGivenUp = false;
  bool m_isReady = false;       // its answer to `initialize` has come
  std::vector<Json> m_waiting;  // for that
  bool m_hasAnswered = false;   // this one, anything else
  int m_idleDeaths = 0;         // in a row, of those that had not
  int64_t m_nextId = 0;
  struct Asked {
    Answer answer;
    Json message;
    bool isRepeated = false;  // to a second child: it is not asked a third time
  };
  std::map<int64_t, Asked> m_asked;
  std::map<std::string, Shown> m_shown;
};

}  // namespace qrex::server
