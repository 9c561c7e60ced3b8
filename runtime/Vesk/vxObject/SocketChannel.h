// Remote calls between processes: messages over TCP, each as its length in four bytes, little-endian, and its bytes. It
// needs Boost.Asio (Debian's libboost-dev, headers alone), and nothing else includes it.
//
//   SocketServer server(0, [&](vesk::Server& client) { client.Export(board); });   // in one process
//   server.ServeUntil([&] { return isDone; });
//
//   const auto channel = vesk::SocketChannel::Connect("localhost", port);          // in another
//   vesk::ClientConnection connection(*channel);
//   const auto stub = vesk::Import<IBoard>(connection, 1);
//
// There is no encryption and no proof of who calls: a server listens on this machine alone unless it is told otherwise,
// and anyone who reaches its port can call what it exports. Messages that wait are kept as the bytes that came, so that
// a client's take no memory beyond the limit: one that sends faster than it is served, or does not read its answers,
// waits; one that sends a longer message is disconnected. An answer that is too long for a client is an error of the
// call that it belongs to.
// A channel or server, and all that is connected to it, belongs to one thread; Stop may come from any.

@import "Vesk/vxObject/Remote.h"

#include <atomic>
#include <boost/asio.hpp>

namespace vesk {

// A server at work in this thread, and those around it.
struct ServingHere {
  boost::asio::ip::tcp::endpoint m_endpoint;
  ServingHere const* m_outer;
};
inline thread_local ServingHere const* t_servingHere = nullptr;

class SocketChannel : public Channel {
 public:
  typedef boost::asio::ip::tcp Tcp;
  typedef std::chrono::steady_clock Clock;

  // RemoteError when nobody listens there.
  static std::unique_ptr<SocketChannel> Connect(std::string const& host, uint16 port) {
    const auto io = std::make_shared<boost::asio::io_context>();
    Tcp::socket socket(*io);
    boost::system::error_code error;
    const auto places = Tcp::resolver(*io).resolve(host, std::to_string(port), error);
    if (!error) boost::asio::connect(socket, places, error);
    if (error) throw RemoteError("cannot connect to " + host + ": " + error.message());
    return std::make_unique<SocketChannel>(io, std::move(socket), true);
  }

  // A connected socket. `waits`: of who calls, whose Send waits until the message is on its way. Otherwise of who is
  // called: that goes on during Receive, and while the other side, which has ended its sending, still reads.
  SocketChannel(std::shared_ptr<boost::asio::io_context> io, Tcp::socket socket, bool waits)
      : m_io(std::move(io)), m_state(std::make_shared<State>(std::move(socket), waits)) {
    boost::system::error_code ignored;
    m_state->m_socket.set_option(Tcp::no_delay(true), ignored);
    m_state->StartRead();
  }
  ~SocketChannel() override { Close(); }
  SocketChannel(SocketChannel const&) = delete;
  void operator=(SocketChannel const&) = delete;

  // Of a message, in bytes; of those that wait as well.
  void SetMessageLimit(std::size_t bytes) { m_state->SetLimit(bytes); }
  // How long Send waits.
  void SetTimeout(std::chrono::milliseconds timeout) { m_timeout = timeout; }
  void Close() { m_state->Close(); }
  // Closes, and drops what waits.
  void Drop() { m_state->Drop(); }

  // ChannelClosed when the other side is gone, or does not read what it is sent.
  void Send(xvector<octet_t> const& message) override {
    CheckMessageSize(message.size(), m_state->m_limit);
    if (!m_state->m_socket.is_open()) throw ChannelClosed("the other side is gone");
    m_state->Queue(message);
    if (m_state->m_waits) WaitUntilSent();
    if (!m_state->m_socket.is_open() && m_state->IsSending()) throw ChannelClosed("the other side is gone");
  }
  bool Receive(xvector<octet_t>& message) override {
    m_io->restart();
    m_io->poll();
    return m_state->Take(message);
  }
  bool ReceiveWithin(xvector<octet_t>& message, std::chrono::milliseconds time) override {
    const auto end = EndOf(time);
    while (!m_state->Take(message)) {
      if (!IsOpen() || !RunOneUntil(end)) return m_state->Take(message);
    }
    return true;
  }
  // None while answers wait that the other side does not read.
  bool ReceiveArrived(xvector<octet_t>& message) override { return CanServe() && m_state->Take(message); }
  bool CanServe() const { return m_state->HasMessage() && m_state->m_out.size() < kMostUnread; }
  // Messages that came before the other side went can still be received, and their answers sent if it still reads.
  bool IsOpen() const override {
    return m_state->CanRead() || m_state->HasMessage() || (m_state->m_socket.is_open() && m_state->IsSending());
  }
  // The other side sends no more.
  bool HasEnded() const { return !m_state->CanRead(); }

  bool CanAnswer() const override {
    if (!m_state->m_waits || !t_servingHere) return true;
    boost::system::error_code error, ignored;
    const Tcp::endpoint peer = m_state->m_socket.remote_endpoint(error);
    const Tcp::endpoint own = m_state->m_socket.local_endpoint(ignored);
    if (error) return true;
    for (ServingHere const* server = t_servingHere; server; server = server->m_outer) {
      const boost::asio::ip::address& address = server->m_endpoint.address();
      const bool isHere = peer.address().is_loopback() || peer.address() == own.address();
      if (server->m_endpoint.port() != peer.port()) continue;
      if (address == peer.address() || (address.is_unspecified() && isHere)) return false;
    }
    return true;
  }

 private:
  // Lives as long as an operation of the socket is under way. One that cannot begin, for want of memory, closes it.
  struct State : std::enable_shared_from_this<State> {
    State(Tcp::socket socket, bool waits) : m_socket(std::move(socket)), m_waits(waits) {}

    void Close() {
      boost::system::error_code ignored;
      m_socket.close(ignored);
    }
    void Drop() {
      Close();
      m_in.clear();
      m_framed = m_tooLong = 0;
      m_out.clear();
    }
    // What a caller got already is still good; of who calls no more nothing is.
    void Fail() { m_waits ? Close() : Drop(); }

    bool CanRead() const { return m_socket.is_open() && !m_hasEnded; }
    bool HasMessage() const { return m_framed > 0 || m_tooLong > 0; }
    bool IsSending() const { return m_written < m_writing.size() || !m_out.empty(); }
    void SetLimit(std::size_t bytes) {
      m_limit = bytes;
      if (!FindMessages()) return Close();
      StartRead();
    }

    // Nothing is read while as much waits as one message may take: there is a whole one then.
    void StartRead() {
      if (m_isReading || !CanRead() || (m_skip == 0 && m_in.size() >= m_limit + kLengthBytes)) return;
      m_isReading = true;
      auto taken = [self = shared_from_this()](boost::system::error_code const& error, std::size_t size) {
        self->m_isReading = false;
        if (error == boost::asio::error::eof && !self->m_waits) {
          self->m_hasEnded = true;
        } else if (error) {
          self->Fail();
        } else if (self->Append(size)) {
          self->StartRead();
        } else {
          self->Close();
        }
      };
      try {
        m_socket.async_read_some(boost::asio::buffer(m_buffer), std::move(taken));
      } catch (std::exception const&) {
        m_isReading = false;
        Fail();
      }
    }
    // False for what cannot be taken.
    bool Append(std::size_t size) {
      const std::size_t skipped = std::min(size, m_skip);
      m_skip -= skipped;
      try {
        m_in.insert(m_in.end(), m_buffer + skipped, m_buffer + size);
      } catch (std::bad_alloc const&) {
        return false;
      }
      return FindMessages();
    }
    // Whole messages in what came. Of one that is too long a caller keeps the head; false for anyone else.
    bool FindMessages() {
      while (m_tooLong == 0 && m_in.size() - m_framed >= kLengthBytes) {
        const std::size_t length = LengthAt(m_framed);
        const std::size_t came = m_in.size() - m_framed - kLengthBytes;
        if (length > m_limit) {
          const std::size_t head = std::min(length, MessageTooLong::HeadBytes);
          if (!m_waits) return false;
          if (came < head) break;
          m_tooLong = length;
          const std::size_t rest = std::min(came, length) - head;
          const auto at = m_in.begin() + static_cast<ssize_t>(m_framed + kLengthBytes + head);
          m_in.erase(at, at + static_cast<ssize_t>(rest));
          m_skip = length - head - rest;
        } else {
          if (came < length) break;
          m_framed += kLengthBytes + length;
        }
      }
      return true;
    }
    std::size_t LengthAt(std::size_t at) const {
      std::size_t length = 0;
      for (std::size_t i = 0; i < kLengthBytes; ++i) length |= static_cast<std::size_t>(m_in[at + i]) << 8 * i;
      return length;
    }
    bool Take(xvector<octet_t>& message) {
      if (!HasMessage()) return false;
      const std::size_t tooLong = m_framed > 0 ? 0 : m_tooLong;
      const std::size_t length = tooLong > 0 ? std::min(tooLong, MessageTooLong::HeadBytes) : LengthAt(0);
      const auto begin = m_in.begin() + static_cast<ssize_t>(kLengthBytes);
      message.assign(begin, begin + static_cast<ssize_t>(length));
      m_in.erase(m_in.begin(), begin + static_cast<ssize_t>(length));
      if (tooLong > 0) {
        m_tooLong = 0;
        FindMessages();
      } else {
        m_framed -= kLengthBytes + length;
      }
      StartRead();
      if (tooLong > 0) throw MessageTooLong(tooLong, m_limit, std::move(message));
      return true;
    }

    void Queue(xvector<octet_t> const& message) {
      const std::size_t size = m_out.size() + kLengthBytes + message.size();
      if (size + m_writing.size() > 2 * (m_limit + kLengthBytes)) CloseUnread();
      if (size > m_out.capacity()) m_out.reserve(std::max(size, 2 * m_out.capacity()));
      for (std::size_t i = 0; i < kLengthBytes; ++i) m_out.push_back(static_cast<octet_t>(message.size() >> 8 * i));
      m_out.insert(m_out.end(), message.begin(), message.end());
      if (m_writing.empty()) StartWrite();
    }
    [[noreturn]] void CloseUnread() {
      Close();
      throw ChannelClosed("the other side does not read");
    }
    void StartWrite() {
      if (m_writing.empty()) m_writing.swap(m_out);
      auto written = [self = shared_from_this()](boost::system::error_code const& error, std::size_t size) {
        if (error) return self->Fail();
        self->m_written += size;
        if (self->m_written == self->m_writing.size()) {
          self->m_writing.clear();
          if (self->m_writing.capacity() > kMostUnread) self->m_writing.shrink_to_fit();
          self->m_written = 0;
        }
        if (self->IsSending()) self->StartWrite();
      };
      try {
        m_socket.async_write_some(boost::asio::buffer(m_writing.data() + m_written, m_writing.size() - m_written),
                                  std::move(written));
      } catch (std::exception const&) {
        Fail();
      }
    }

    static constexpr std::size_t kLengthBytes = 4;
    Tcp::socket m_socket;
    const bool m_waits;
    std::size_t m_limit = kMessageLimit;
    octet_t m_buffer[16384];
    std::deque<octet_t> m_in;   // whole messages, then perhaps the head of one that is too long, then a part of one
    std::size_t m_framed = 0;   // of m_in: the whole messages
    std::size_t m_tooLong = 0;  // how long the one behind them is, whose head stands there; 0 for none
    std::size_t m_skip = 0;     // so much of it is to come, and is dropped
    xvector<octet_t> m_out, m_writing;
    std::size_t m_written = 0;  // of m_writing
    bool m_isReading = false;
    bool m_hasEnded = false;  // the other side sends no more
  };

  // Answers may wait so long, in bytes, until the next message is served.
  static constexpr std::size_t kMostUnread = 65536;

  void WaitUntilSent() {
    if (!CanAnswer()) {  // nobody reads meanwhile
      m_io->restart();
      m_io->poll();
    }
    const auto end = EndOf(m_timeout);
    while (m_state->IsSending() && m_state->m_socket.is_open()) {
      if (!CanAnswer() || !RunOneUntil(end)) m_state->CloseUnread();
    }
  }
  // False when the time is over.
  bool RunOneUntil(Clock::time_point end) {
    m_io->restart();
    return m_io->run_one_until(end) > 0;
  }

  std::shared_ptr<boost::asio::io_context> m_io;
  std::shared_ptr<State> m_state;
  std::chrono::milliseconds m_timeout = std::chrono::seconds(30);
};

// Serves any number of clients in one thread. Each has a Server of its own, so that its numbers mean nothing to others.
class SocketServer {
 public:
  typedef SocketChannel::Tcp Tcp;
  // Exports what a new client may call. A client for which it throws is disconnected.
  typedef std::function<void(Server&)> ConnectFunction;

  // Port 0: any that is free. RemoteError when the port is taken.
  SocketServer(uint16 port, ConnectFunction connect,
               boost::asio::ip::address const& address = boost::asio::ip::address_v4::loopback())
      : m_io(std::make_shared<boost::asio::io_context>()), m_acceptor(*m_io), m_connect(std::move(connect)) {
    try {
      const Tcp::endpoint endpoint(address, port);
      m_acceptor.open(endpoint.protocol());
      m_acceptor.set_option(Tcp::acceptor::reuse_address(true));
      m_acceptor.bind(endpoint);
      m_acceptor.listen();
    } catch (boost::system::system_error const& error) {
      throw RemoteError(vxMakeString("cannot listen on port " << port << ": " << error.what()));
    }
  }

  uint16 Port() const { return m_acceptor.local_endpoint().port(); }
  std::size_t Clients() const { return m_clients.size(); }
  // So many at once, 1000 unless told otherwise; who comes then is disconnected.
  void SetClientLimit(std::size_t count) { m_clientLimit = count; }
  // Of each message of the clients to come.
  void SetMessageLimit(std::size_t bytes) { m_messageLimit = bytes; }
  void OnError(Server::ErrorFunction function) { m_onError = std::move(function); }

  // Serves until `isDone`, which is asked at each event and message and ten times a second, or until Stop. A method may
  // serve as well: the client that it works for stays.
  void ServeUntil(std::function<bool()> const& isDone) {
    const Serving serving(*this);
    bool waits = false;
    while (!m_stops && !isDone()) {
      StartAccept();
      RunEvents(waits);
      ServeClients(isDone);
      waits = std::none_of(m_clients.begin(), m_clients.end(), [](Client& c) { return c.m_channel.CanServe(); });
    }
  }
  // Ends ServeUntil; from any thread.
  void Stop() { m_stops = true; }

 private:
  typedef std::chrono::steady_clock Clock;
  // At most so many, until others have their turn.
  enum { kEventsInTurn = 100, kMessagesInTurn = 100 };

  struct Client {
    Client(std::shared_ptr<boost::asio::io_context> io, Tcp::socket socket)
        : m_channel(std::move(io), std::move(socket), false), m_server(m_channel) {}
    SocketChannel m_channel;
    Server m_server;
    int m_depth = 0;  // of methods that it waits for
  };
  struct Serving : ServingHere {
    explicit Serving(SocketServer& server) : ServingHere{server.m_acceptor.local_endpoint(), t_servingHere} {
      t_servingHere = this;
    }
    ~Serving() { t_servingHere = m_outer; }
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

  // One client at a time. Where there are no descriptors or no memory for one, the next try is a while later.
  void StartAccept() {
    if (m_isAccepting || Clock::now() < m_acceptAgain) return;
    auto accepted = [this](boost::system::error_code const& error, Tcp::socket socket) {
      m_isAccepting = false;
      if (error) {
        m_acceptAgain = Clock::now() + std::chrono::milliseconds(100);
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
    m_acceptAgain = Clock::now() + std::chrono::milliseconds(100);
    Report(error);
  }
  void Add(Tcp::socket socket) {
    try {
      m_clients.emplace_back(m_io, std::move(socket));
    } catch (std::exception const& error) {
      return Report(error.what());
    }
    Client& client = m_clients.back();
    const Busy busy(client);
    try {
      client.m_channel.SetMessageLimit(m_messageLimit);
      client.m_server.SetMessageLimit(m_messageLimit);
      client.m_server.OnError(m_onError);
      m_connect(client.m_server);
    } catch (std::exception const& error) {
      Report(error.what());
      client.m_channel.Drop();
    }
  }

  void RunEvents(bool waits) {
    m_io->restart();
    try {
      std::size_t ran = waits ? m_io->run_one_for(std::chrono::milliseconds(100)) : m_io->poll_one();
      for (int i = 1; i < kEventsInTurn && ran > 0; ++i) ran = m_io->poll_one();
    } catch (std::exception const& error) {
      EndAccept(error.what());  // no other operation throws
    }
  }
  void ServeClients(std::function<bool()> const& isDone) {
    for (auto at = m_clients.begin(); at != m_clients.end();) {
      if (!ServeClient(*at, isDone)) return;
      at = at->m_depth == 0 && !at->m_channel.IsOpen() ? m_clients.erase(at) : std::next(at);
    }
  }
  // False when all is done. Of a client that is gone, only what can be carried out is.
  bool ServeClient(Client& client, std::function<bool()> const& isDone) {
    const Busy busy(client);
    for (int i = 0; i < kMessagesInTurn; ++i) {
      const EServed served = client.m_server.ServeNext();
      if (served == EServed::Nothing) return true;
      if (served == EServed::NotAnswered || (served == EServed::NoCall && client.m_channel.HasEnded())) {
        client.m_channel.Drop();
      }
      if (m_stops || isDone()) return false;
    }
    return true;
  }
  void Report(ConstStringZ error) const {
    try {
      if (m_onError) m_onError(error);
    } catch (...) {
    }
  }

  std::shared_ptr<boost::asio::io_context> m_io;
  Tcp::acceptor m_acceptor;
  ConnectFunction m_connect;
  Server::ErrorFunction m_onError;
  std::size_t m_clientLimit = 1000;
  std::size_t m_messageLimit = kMessageLimit;
  std::atomic<bool> m_stops{false};
  bool m_isAccepting = false;
  Clock::time_point m_acceptAgain;
  std::list<Client> m_clients;
};

}  // namespace vesk
