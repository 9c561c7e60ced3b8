// Remote calls between processes over TCP.
//
//   SocketServer server(0, [&](vesk::Server& client) { client.Export(board); });   // in one process
//   server.ServeUntil([&] { return isDone; });
//
//   const auto channel = vesk::SocketChannel::Connect("localhost", port);          // in another
//   vesk::ClientConnection connection(*channel);
//   const auto stub = vesk::Import<IBoard>(connection, 1);
//
// There is no encryption and no proof of who calls: a server listens on this machine alone unless it is told otherwise,
// and anyone who reaches its port can call what it exports, where it asks for no token. LocalSocketChannel.h and
// TlsChannel.h let in only who belongs.
// A channel or server, and all that is connected to it, belongs to one thread; Stop may come from any.

@import "Vesk/vxObject/StreamServer.h"

namespace vesk {

struct TcpAddresses {
  typedef boost::asio::ip::tcp Protocol;

  // Of the other side; empty when it is gone.
  static std::string TextOf(Protocol::socket const& socket) {
    boost::system::error_code error;
    const Protocol::endpoint peer = socket.remote_endpoint(error);
    const std::string address = error ? "" : peer.address().to_string();
    return error ? "" : (peer.address().is_v6() ? '[' + address + ']' : address) + ':' + std::to_string(peer.port());
  }
  // RemoteError when nobody listens there.
  static Protocol::socket Connect(boost::asio::io_context& io, std::string const& host, uint16 port) {
    Protocol::socket socket(io);
    boost::system::error_code error;
    const auto places = Protocol::resolver(io).resolve(host, std::to_string(port), error);
    if (!error) boost::asio::connect(socket, places, error);
    if (error) throw RemoteError("cannot connect to " + host + ": " + error.message());
    return socket;
  }
  static void SetUp(Protocol::socket& socket) {
    boost::system::error_code ignored;
    socket.set_option(Protocol::no_delay(true), ignored);
  }
  static bool IsAt(Protocol::endpoint const& server, Protocol::socket const& socket) {
    boost::system::error_code error, ignored;
    const Protocol::endpoint peer = socket.remote_endpoint(error), own = socket.local_endpoint(ignored);
    if (error || server.port() != peer.port()) return false;
    const bool isHere = peer.address().is_loopback() || peer.address() == own.address();
    return server.address() == peer.address() || (server.address().is_unspecified() && isHere);
  }
};

struct TcpTransport : PlainTransport, TcpAddresses {
  typedef Protocol::socket Stream;
  static Peer PeerOf(Stream const& socket) {
    Peer peer;
    peer.m_kind = PK_TCP;
    peer.m_address = TextOf(socket);
    return peer;
  }
};

class SocketChannel : public StreamChannel<TcpTransport> {
 public:
  typedef TcpTransport::Protocol Tcp;
  using StreamChannel::StreamChannel;

  // RemoteError when nobody listens there.
  static std::unique_ptr<SocketChannel> Connect(std::string const& host, uint16 port) {
    const auto io = std::make_shared<boost::asio::io_context>();
    return std::make_unique<SocketChannel>(io, TcpAddresses::Connect(*io, host, port), true);
  }
};

class SocketServer : public StreamServer<TcpTransport> {
 public:
  typedef TcpTransport::Protocol Tcp;

  // Port 0: any that is free. RemoteError when the port is taken.
  SocketServer(uint16 port, ConnectFunction connect,
               boost::asio::ip::address const& address = boost::asio::ip::address_v4::loopback())
      : StreamServer(std::move(connect)) {
    Listen(Tcp::endpoint(address, port), vxMakeString("port " << port));
  }
  uint16 Port() const { return Endpoint().port(); }
};

}  // namespace vesk
