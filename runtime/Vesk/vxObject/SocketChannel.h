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
// and anyone who reaches its port can call what it exports. A message longer than the limit, a client that sends faster
// than it is served or does not read its answers holds no memory beyond the limit: it is disconnected or waits.
// A channel or server, and all that is connected to it, belongs to one thread; Stop may come from any.

@import "Vesk/vxObject/Remote.h"

#include <atomic>
#include <boost/asio.hpp>

namespace vesk {

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

  // A connected socket. `waits`: Send waits until the message is on its way; otherwise that goes on during Receive.
  SocketChannel(std::shared_ptr<boost::asio::io_context> io, Tcp::socket socket, bool waits)
      : m_io(std::move(io)), m_state(std::make_shared<State>(std::move(socket))), m_waits(waits) {
    boost::system::error_code ignored;
    m_state->m_socket.set_option(Tcp::no_delay(true), ignored);
    m_state->StartRead();
  }
  ~SocketChannel() override { Close(); }
  SocketChannel(SocketChannel const&) = delete;
  void operator=(SocketChannel const&) = delete;

  // Of a message, in bytes; of those that wait as well.
  void SetMessageLimit(std::size_t bytes) { m_state->m_limit = bytes; }
  // How long Send waits.
  void SetTimeout(std::chrono::milliseconds timeout) { m_timeout = timeout; }
  void Close() { m_state->Close(); }

  // ChannelClosed when the other side is gone, or does not read what it is sent.
  void Send(xvector<octet_t> const& message) override {
    CheckMessageSize(message.size(), m_state->m_limit);
    if (!m_state->m_socket.is_open()) throw ChannelClosed("the other side is gone");
    m_state->Queue(message);
    if (!m_state->m_socket.is_open()) throw ChannelClosed("the other side does not read");
    const auto end = Clock::now() + m_timeout;
    while (m_waits && !m_state->m_out.empty() && m_state->m_socket.is_open()) {
      if (!RunOneUntil(end)) {
        Close();
        throw ChannelClosed("the other side does not read");
      }
    }
  }
  bool Receive(xvector<octet_t>& message) override {
    m_io->restart();
    m_io->poll();
    return m_state->Take(message);
  }
  bool ReceiveWithin(xvector<octet_t>& message, std::chrono::milliseconds time) override {
    const auto end = Clock::now() + time;
    while (!m_state->Take(message)) {
      if (!m_state->m_socket.is_open() || !RunOneUntil(end)) return m_state->Take(message);
    }
    return true;
  }
  // Messages that came before the other side went can still be received.
  bool IsOpen() const override { return m_state->m_socket.is_open() || !m_state->m_in.empty(); }

 private:
  // Lives as long as an operation of the socket is under way.
  struct State : std::enable_shared_from_this<State> {
    explicit State(Tcp::socket socket) : m_socket(std::move(socket)) {}

    void Close() {
      boost::system::error_code ignored;
      m_socket.close(ignored);
    }

    // Nothing is read while as much waits as one message may hold.
    void StartRead() {
      if (m_isReading || !m_socket.is_open() || m_inBytes > m_limit) return;
      m_isReading = true;
      m_socket.async_read_some(boost::asio::buffer(m_buffer),
                               [self = shared_from_this()](boost::system::error_code const& error, std::size_t size) {
                                 self->m_isReading = false;
                                 if (error || !self->Append(size)) return self->Close();
                                 self->StartRead();
                               });
    }
    // The memory for a message grows with what has come of it. False for one that is too long.
    bool Append(std::size_t size) {
      m_partial.insert(m_partial.end(), m_buffer, m_buffer + size);
      std::size_t at = 0;
      while (m_partial.size() - at >= kLengthBytes) {
        std::size_t length = 0;
        for (std::size_t i = 0; i < kLengthBytes; ++i) length |= static_cast<std::size_t>(m_partial[at + i]) << 8 * i;
        if (length > m_limit) return false;
        if (m_partial.size() - at - kLengthBytes < length) break;
        const auto begin = m_partial.begin() + static_cast<ssize_t>(at + kLengthBytes);
        m_in.emplace_back(begin, begin + static_cast<ssize_t>(length));
        m_inBytes += length + kLengthBytes;
        at += kLengthBytes + length;
      }
      m_partial.erase(0, static_cast<ssize_t>(at));
      return true;
    }
    bool Take(xvector<octet_t>& message) {
      if (m_in.empty()) return false;
      message = std::move(m_in.front());
      m_in.pop_front();
      m_inBytes -= message.size() + kLengthBytes;
      StartRead();
      return true;
    }

    void Queue(xvector<octet_t> const& message) {
      m_outBytes += message.size() + kLengthBytes;
      if (m_outBytes > 2 * (m_limit + kLengthBytes)) return Close();
      xvector<octet_t> frame;
      frame.reserve(kLengthBytes + message.size());
      for (std::size_t i = 0; i < kLengthBytes; ++i) frame.push_back(static_cast<octet_t>(message.size() >> 8 * i));
      frame.insert(frame.end(), message.begin(), message.end());
      m_out.push_back(std::move(frame));
      if (m_out.size() == 1) StartWrite();
    }
    void StartWrite() {
      boost::asio::async_write(m_socket, boost::asio::buffer(m_out.front().data(), m_out.front().size()),
                               [self = shared_from_this()](boost::system::error_code const& error, std::size_t) {
                                 self->m_outBytes -= self->m_out.front().size();
                                 self->m_out.pop_front();
                                 if (error) return self->Close();
                                 if (!self->m_out.empty()) self->StartWrite();
                               });
    }

    static constexpr std::size_t kLengthBytes = 4;
    Tcp::socket m_socket;
    std::size_t m_limit = kMessageLimit;
    octet_t m_buffer[16384];
    xvector<octet_t> m_partial;
    std::deque<xvector<octet_t>> m_in, m_out;
    std::size_t m_inBytes = 0, m_outBytes = 0;
    bool m_isReading = false;
  };

  // False when the time is over.
  bool RunOneUntil(Clock::time_point end) {
    m_io->restart();
    return m_io->run_one_until(end) > 0;
  }

  std::shared_ptr<boost::asio::io_context> m_io;
  std::shared_ptr<State> m_state;
  bool m_waits;
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
    StartAccept();
  }

  uint16 Port() const { return m_acceptor.local_endpoint().port(); }
  std::size_t Clients() const { return m_clients.size(); }
  // So many at once, 1000 unless told otherwise; who comes then is disconnected.
  void SetClientLimit(std::size_t count) { m_clientLimit = count; }
  // Of each message of the clients to come.
  void SetMessageLimit(std::size_t bytes) { m_messageLimit = bytes; }
  void OnError(Server::ErrorFunction function) { m_onError = std::move(function); }

  // Serves until `isDone`, which is asked at each event and ten times a second, or until Stop.
  void ServeUntil(std::function<bool()> const& isDone) {
    while (!m_stops && !isDone()) {
      m_io->restart();
      m_io->run_one_for(std::chrono::milliseconds(100));
      for (auto at = m_clients.begin(); at != m_clients.end();) {
        at->m_server.Serve();
        at = at->m_channel.IsOpen() ? std::next(at) : m_clients.erase(at);
      }
    }
  }
  // Ends ServeUntil; from any thread.
  void Stop() { m_stops = true; }

 private:
  struct Client {
    Client(std::shared_ptr<boost::asio::io_context> io, Tcp::socket socket)
        : m_channel(std::move(io), std::move(socket), false), m_server(m_channel) {}
    SocketChannel m_channel;
    Server m_server;
  };

  void StartAccept() {
    m_acceptor.async_accept([this](boost::system::error_code const& error, Tcp::socket socket) {
      if (error == boost::asio::error::operation_aborted) return;
      if (!error && m_clients.size() < m_clientLimit) Add(std::move(socket));
      StartAccept();
    });
  }
  void Add(Tcp::socket socket) {
    Client& client = m_clients.emplace_back(m_io, std::move(socket));
    try {
      client.m_channel.SetMessageLimit(m_messageLimit);
      client.m_server.SetMessageLimit(m_messageLimit);
      client.m_server.OnError(m_onError);
      m_connect(client.m_server);
    } catch (std::exception const& error) {
      if (m_onError) m_onError(error.what());
      client.m_channel.Close();
    }
  }

  std::shared_ptr<boost::asio::io_context> m_io;
  Tcp::acceptor m_acceptor;
  ConnectFunction m_connect;
  Server::ErrorFunction m_onError;
  std::size_t m_clientLimit = 1000;
  std::size_t m_messageLimit = kMessageLimit;
  std::atomic<bool> m_stops{false};
  std::list<Client> m_clients;
};

}  // namespace vesk
