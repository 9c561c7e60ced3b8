// Serves any number of clients over streams in one thread. Each has a Server of its own, so that its numbers mean
// nothing to others. A client that must prove who it is, by a handshake or a token, has a while for it; there is room
// for so many such clients, and another one takes the place of the oldest, so that none keeps others out.
//
// Messages that wait are kept as the bytes that came, so that a client's take no memory beyond the limit: one that
// sends faster than it is served, or does not read its answers, waits; one that sends a longer message is disconnected.
// An answer that is too long for a client is an error of the call that it belongs to.

@import "Vesk/vxObject/StreamChannel.h"

#include <atomic>
#include <list>

namespace vesk {

template <typename Transport>
class StreamServer {
 public:
  typedef typename Transport::Protocol Protocol;
  typedef std::chrono::milliseconds Time;
  // Exports what a new client may call, and says by Server::Authorize and Server::AddToken who may. A client for which
  // it throws is disconnected.
  typedef std::function<void(Server&)> ConnectFunction;

  StreamServer(StreamServer const&) = delete;
  void operator=(StreamServer const&) = delete;

  std::size_t Clients() const { return m_clients.size(); }
  // So many at once, 1000 unless told otherwise; who comes then is disconnected.
  void SetClientLimit(std::size_t count) { m_clientLimit = count; }
  // How many clients at once may have to prove who they are, and for how long: 64, and 10 seconds.
  void SetEntryLimits(std::size_t count, Time time) {
    m_entryLimit = count;
    m_entryTime = time;
  }
  // Of each message of the clients to come.
  void SetMessageLimit(std::size_t bytes) { m_messageLimit = bytes; }
  // Who sends no whole message for so long, and has no call under way, is disconnected; at 0, as at first, nobody is.
  void SetIdleTime(Time time) {
    m_idleTime = time;
    for (Client& client : m_clients) client.m_since = Clock::now();
  }
  void OnError(Server::ErrorFunction function) { m_onError = std::move(function); }

  // Serves until `isDone`, which is asked at each event and message and ten times a second, or until Stop. A method may
  // serve as well: the client that it works for stays.
  void ServeUntil(std::function<bool()> const& isDone) {
    const Serving serving(*this);
    bool waits = false;
    while (!m_stops && !isDone()) {
      StartAccept();
      RunEvents(waits);
      LetIn();
      EndLate();
      if (!ServeClients(m_entering, isDone) || !ServeClients(m_clients, isDone)) return;
      waits = CannotServe(m_entering) && CannotServe(m_clients);
    }
  }
  // Ends ServeUntil; from any thread.
  void Stop() { m_stops = true; }

 protected:
  StreamServer(ConnectFunction connect, typename Transport::Context context = {})
      : m_io(std::make_shared<boost::asio::io_context>()),
        m_work(m_io->get_executor()),
        m_acceptor(*m_io),
        m_connect(std::move(connect)),
        m_context(std::move(context)) {}
  ~StreamServer() {}

  // RemoteError when the place is taken. `prepare` is called with the socket before it has an address.
  template <typename Prepare>
  void Listen(typename Protocol::endpoint const& endpoint, std::string const& name, Prepare prepare) {
    try {
      m_acceptor.open(endpoint.protocol());
      m_acceptor.set_option(boost::asio::socket_base::reuse_address(true));
      prepare(m_acceptor);
      m_acceptor.bind(endpoint);
      m_acceptor.listen();
    } catch (boost::system::system_error const& error) {
      throw RemoteError("cannot listen on " + name + ": " + error.what());
    }
  }
  void Listen(typename Protocol::endpoint const& endpoint, std::string const& name) {
    Listen(endpoint, name, [](auto&) {});
  }
  typename Protocol::endpoint Endpoint() const { return m_acceptor.local_endpoint(); }

 private:
  typedef std::chrono::steady_clock Clock;
  // At most so many, until others have their turn.
  enum { kEventsInTurn = 100, kMessagesInTurn = 100 };
  // Of a message with a token, in bytes.
  static constexpr std::size_t kTokenLimit = 4096;

  struct Client {
    Client(std::shared_ptr<boost::asio::io_context> io, typename Transport::Stream stream)
        : m_channel(std::move(io), std::move(stream), false), m_server(m_channel) {}
    StreamChannel<Transport> m_channel;
    Server m_server;
    int m_depth = 0;                           // of methods that it waits for
    bool m_isIntroduced = false;               // the handshake is done, and its objects are exported
    Clock::time_point m_since = Clock::now();  // when it came, or was last active
  };
  typedef std::list<Client> ClientList;

  struct Serving : ServingHere<Protocol> {
    explicit Serving(StreamServer& server) : ServingHere<Protocol>{server.Endpoint(), t_servingHere<Protocol>} {
      t_servingHere<Protocol> = this;
    }
    ~Serving() { t_servingHere<Protocol> = this->m_outer; }
    Serving(Serving const&) = delete;
    void operator=(Serving const&) = delete;
  };
  struct Busy {
    explicit Busy(Client& client) : m_client(client) { ++client.m_depth; }
    ~Busy() { --m_client.m_depth; }
    Busy(Busy const&) = delete;
    void operator=(Busy const&) = delete;
    Client& m_client;
  };

  // --- Clients that come

  // One client at a time. Where there are no descriptors or no memory for one, the next try is a while later.
  void StartAccept() {
    if (m_isAccepting || Clock::now() < m_acceptAgain) return;
    auto accepted = [this](boost::system::error_code const& error, typename Protocol::socket socket) {
      m_isAccepting = false;
      if (error) {
        m_acceptAgain = Clock::now() + Time(100);
      } else if (m_clients.size() < m_clientLimit) {
        Add(std::move(socket));
      }
    };
    try {
      m_isAccepting = true;
      m_acceptor.async_accept(std::move(accepted));
    } catch (std::exception const& error) {
      EndAccept(error.what());
    }
  }
  void EndAccept(ConstStringZ error) {
    boost::system::error_code ignored;
    m_acceptor.cancel(ignored);
    m_isAccepting = false;
    m_acceptAgain = Clock::now() + Time(100);
    Report(error);
  }
  void Add(typename Protocol::socket socket) {
    try {
      m_entering.emplace_back(m_io, Transport::Make(std::move(socket), m_context));
    } catch (std::exception const& error) {
      return Report(error.what());
    }
    if constexpr (Transport::kHandshakes) m_entering.back().m_channel.StartHandshake(Transport::Server);
    MakeRoom();
  }
  // The oldest goes.
  void MakeRoom() {
    std::size_t count = 0;
    for (Client const& client : m_entering) count += client.m_channel.IsOpen();
    for (auto at = m_entering.begin(); count > m_entryLimit && at != m_entering.end(); ++at) {
      if (at->m_depth > 0 || !at->m_channel.IsOpen()) continue;
      at->m_channel.Drop();
      --count;
    }
  }
  void Introduce(Client& client) {
    const Busy busy(client);
    client.m_isIntroduced = true;
    try {
      client.m_server.SetMessageLimit(m_messageLimit);
      client.m_server.OnError(m_onError);
      m_connect(client.m_server);
      const std::size_t limit = client.m_server.WaitsForToken() ? kTokenLimit : m_messageLimit;
      client.m_channel.SetMessageLimit(std::min(limit, m_messageLimit));
      // A client must hear that its certificate is taken.
      if constexpr (Transport::kHandshakes) client.m_channel.Send({});
    } catch (std::exception const& error) {
      Report(error.what());
      client.m_channel.Drop();
    }
  }
  // Those who have proved who they are.
  void LetIn() {
    for (auto at = m_entering.begin(); at != m_entering.end();) {
      const auto client = at;
      if (!client->m_isIntroduced && client->m_channel.IsOpen() && !client->m_channel.IsEntering()) Introduce(*client);
      at = std::next(client);
      if (client->m_depth > 0) continue;
      if (!client->m_channel.IsOpen()) {
        if (!client->m_channel.Failure().empty()) Report(client->m_channel.Failure().c_str());
        m_entering.erase(client);
      } else if (client->m_isIntroduced && !client->m_server.WaitsForToken()) {
        if (m_clients.size() >= m_clientLimit) client->m_channel.Drop();
        client->m_channel.SetMessageLimit(m_messageLimit);
        client->m_since = Clock::now();
        m_clients.splice(m_clients.end(), m_entering, client);
      }
    }
  }
  // Drops who has not entered in time, and who is idle. For as long as this thread did something else, nobody is late.
  void EndLate() {
    if (m_entering.empty() && m_idleTime == Time(0)) {
      m_lastLook = Clock::time_point();
      return;
    }
    const auto now = Clock::now();
    const auto before = std::exchange(m_lastLook, now);
    const bool wasAway = before != Clock::time_point() && now - before > Time(300);
    for (ClientList* clients : {&m_clients, &m_entering}) {
      for (auto at = clients->begin(); wasAway && at != clients->end(); ++at) at->m_since += now - before;
    }
    for (Client& client : m_entering) {
      if (client.m_depth > 0 || now - client.m_since < m_entryTime || !client.m_channel.IsOpen()) continue;
      Report((PeerText(client.m_server.GetPeer()) + " did not prove in time who it is").c_str());
      client.m_channel.Drop();
    }
    if (m_idleTime == Time(0)) return;
    for (Client& client : m_clients) {
      if (client.m_depth == 0 && !client.m_channel.CanServe() && now - client.m_since >= m_idleTime) {
        client.m_channel.Drop();
      }
    }
  }

  // --- Clients that are there

  void RunEvents(bool waits) {
    m_io->restart();
    try {
      std::size_t ran = waits ? m_io->run_one_for(Time(100)) : m_io->poll_one();
      for (int i = 1; i < kEventsInTurn && ran > 0 && !IsQuiet(); ++i) ran = m_io->poll_one();
    } catch (std::exception const& error) {
      EndAccept(error.what());  // no other operation throws
    }
  }
  // There is one client, whose message has come: to ask for other events would cost it time.
  bool IsQuiet() const {
    return m_clients.size() == 1 && m_entering.empty() && !m_clients.front().m_channel.IsReading();
  }
  // Both are false when all is done.
  bool ServeClients(ClientList& clients, std::function<bool()> const& isDone) {
    for (auto at = clients.begin(); at != clients.end();) {
      if (at->m_isIntroduced && !ServeClient(*at, isDone)) return false;
      at = at->m_depth == 0 && !at->m_channel.IsOpen() ? clients.erase(at) : std::next(at);
    }
    return true;
  }
  // Of a client that is gone, only what can be carried out is.
  bool ServeClient(Client& client, std::function<bool()> const& isDone) {
    const Busy busy(client);
    for (int i = 0; i < kMessagesInTurn; ++i) {
      const EServed served = client.m_server.ServeNext();
      if (served == EServed::Nothing) break;
      if (m_idleTime != Time(0)) client.m_since = Clock::now();
      if (served == EServed::NoToken) client.m_channel.Finish();
      if (served == EServed::NotAnswered || (served == EServed::NoCall && client.m_channel.HasEnded())) {
        client.m_channel.Drop();
      }
      if (m_stops || isDone()) return false;
    }
    client.m_channel.Listen();
    return true;
  }
  static bool CannotServe(ClientList const& clients) {
    return std::none_of(clients.begin(), clients.end(), [](Client const& c) { return c.m_channel.CanServe(); });
  }
  void Report(ConstStringZ error) const {
    try {
      if (m_onError) m_onError(error);
    } catch (...) {
    }
  }

  std::shared_ptr<boost::asio::io_context> m_io;
  // So that events are waited for where there are no clients and none can be accepted.
  boost::asio::executor_work_guard<boost::asio::io_context::executor_type> m_work;
  typename Protocol::acceptor m_acceptor;
  ConnectFunction m_connect;
  typename Transport::Context m_context;
  Server::ErrorFunction m_onError;
  std::size_t m_clientLimit = 1000;
  std::size_t m_entryLimit = 64;
  std::size_t m_messageLimit = kMessageLimit;
  Time m_entryTime = std::chrono::seconds(10);
  Time m_idleTime = Time(0);
  std::atomic<bool> m_stops{false};
  bool m_isAccepting = false;
  Clock::time_point m_acceptAgain;
  Clock::time_point m_lastLook;  // for who is late; none while nobody can be
  ClientList m_clients;
  ClientList m_entering;  // in the order in which they came
};

}  // namespace vesk
