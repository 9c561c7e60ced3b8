// HTTP and WebSocket for the inspector, on Boost.Beast. It listens on this machine alone. Its address has a random
// token in its path; the page is at /TOKEN/, its WebSocket at /TOKEN/live, and nothing else is anywhere. What comes
// with another Host, a web page of another origin, or another token gets 403 and nothing said about why.
//
// Ahead of a right token a client has 8 KiB and 10 seconds for its request; where all connections are taken the oldest
// of these makes room. A page that reads slowly is told nothing while 256 KiB wait for it, and not read while 1 MiB do;
// one that asks more often than a page does is disconnected.
//
// All of it happens within Poll, in the thread of the caller.

@import "Vesk/vxObject/InspectorSession.h"

#include <boost/asio.hpp>
#include <boost/beast.hpp>
#include <optional>
#include <random>

namespace vesk {

struct InspectorServerLimits {
  std::size_t m_connections = 32;  // pages among them
  std::size_t m_pages = 8;
  std::size_t m_request = 8 << 10;   // bytes of a request ahead of a page
  std::size_t m_message = 16 << 20;  // bytes of a message of a page
  int m_messages = 200;              // of a page in a second, and as many at once
  std::chrono::milliseconds m_time = std::chrono::seconds(10);
};

class InspectorServer {
 public:
  typedef boost::asio::ip::tcp Tcp;
  typedef std::chrono::steady_clock Clock;
  typedef std::function<xstring(xstring const& nonce)> PageFunction;

  InspectorServer(InspectorShared& shared, PageFunction page) : m_shared(shared), m_page(std::move(page)) {}
  InspectorServer(InspectorServer const&) = delete;
  void operator=(InspectorServer const&) = delete;

  // Port 0: any that is free. InspectorError when the port is taken.
  void Listen(uint16 port) {
    boost::system::error_code error;
    const Tcp::endpoint endpoint(boost::asio::ip::address_v4::loopback(), port);
    m_acceptor.open(endpoint.protocol(), error);
    if (!error) m_acceptor.set_option(Tcp::acceptor::reuse_address(true), error);
    if (!error) m_acceptor.bind(endpoint, error);
    if (!error) m_acceptor.listen(boost::asio::socket_base::max_listen_connections, error);
    if (error) {
      boost::system::error_code ignored;
      m_acceptor.close(ignored);
      throw InspectorError(vxMakeString("cannot listen on port " << port << ": " << error.message()));
    }
    m_port = m_acceptor.local_endpoint().port();
    m_token = RandomText();
    Accept();
  }
  bool IsListening() const { return m_acceptor.is_open(); }
  uint16 Port() const { return m_port; }
  xstring Address() const { return vxMakeString("http://127.0.0.1:" << m_port << '/' << m_token << '/'); }
  std::size_t Pages() const { return m_pages; }
  InspectorServerLimits& Limits() { return m_limits; }

  // Does what there is to do, as long as `time` at most, and tells pages what has changed.
  void Poll(Clock::duration time) {
    const auto end = Clock::now() + time;
    m_io.restart();
    try {
      while (m_io.poll_one() > 0 && Clock::now() < end) {
      }
      Tick();
    } catch (std::bad_alloc const&) {  // the connection that wanted it is given up
    }
  }
  // The same, waiting for something to do.
  void Wait(Clock::duration time) {
    m_io.restart();
    try {
      m_io.run_one_for(time);
    } catch (std::bad_alloc const&) {
    }
    Poll(time);
  }

 private:
  typedef boost::beast::http::request<boost::beast::http::empty_body> Request;
  typedef boost::beast::http::response<boost::beast::http::string_body> Response;
  typedef boost::beast::http::status Status;
  typedef boost::beast::http::verb Verb;
  typedef boost::beast::http::field Field;
  typedef boost::beast::error_code Error;

  static xstring RandomText() {
    std::random_device random;
    xstring text;
    for (int i = 0; i < 32; ++i) text += "0123456789abcdef"[random() & 15];
    return text;
  }
  // In a time that tells nothing of how much was right.
  static bool IsSame(std::string_view given, std::string_view secret) {
    if (given.empty()) return false;
    int difference = given.size() != secret.size();
    for (std::size_t i = 0; i < secret.size(); ++i) difference |= secret[i] ^ given[i % given.size()];
    return difference == 0;
  }

  // One connection: a request at a time, until one of them makes it a page's.
  class Connection : public std::enable_shared_from_this<Connection> {
   public:
    Connection(InspectorServer& server, Tcp::socket socket)
        : m_server(server), m_stream(std::move(socket)), m_buffer(server.m_limits.m_request + kRoom) {}
    ~Connection() {
      m_server.m_pages -= m_session != nullptr;
      m_server.m_connections.remove(this);
    }
    Connection(Connection const&) = delete;
    void operator=(Connection const&) = delete;

    bool IsPage() const { return m_session != nullptr; }
    void Close() {
      Error ignored;
      boost::beast::get_lowest_layer(m_stream).socket().close(ignored);
    }
    // A page that does not read what it is told is told no more.
    bool IsReading() const { return m_queued < kMostTold; }
    InspectorSession* Session() { return m_isOpen ? m_session.get() : nullptr; }

    void ReadRequest() {
      m_parser.emplace();
      m_parser->header_limit(static_cast<uint32>(m_server.m_limits.m_request));
      m_parser->body_limit(0);
      Tcp1().expires_after(m_server.m_limits.m_time);
      boost::beast::http::async_read(Tcp1(), m_buffer, *m_parser,
                                     [self = shared_from_this()](Error error, std::size_t) {
                                       if (error) return self->Close();
                                       self->Serve(self->m_parser->release());
                                     });
    }

   private:
    static constexpr std::size_t kRoom = 1024;
    static constexpr std::size_t kMostTold = 256 << 10, kMostAnswered = 1 << 20;

    boost::beast::tcp_stream& Tcp1() { return boost::beast::get_lowest_layer(m_stream); }

    void Serve(Request const& request) {
      const std::string_view target(request.target().data(), request.target().size());
      const std::size_t slash = target.find('/', 1);
      const std::string_view token = target.substr(std::min<std::size_t>(1, target.size()), slash - 1);
      const bool isLive = boost::beast::websocket::is_upgrade(request);
      if (!IsSame(token, m_server.m_token) || !IsHere(request) || !IsOwnOrigin(request, isLive)) {
        return Answer(request, Status::forbidden, "This is not for you.\n", xstring());
      }
      const std::string_view place = slash == std::string_view::npos ? std::string_view() : target.substr(slash);
      if (place == "/live" && isLive && request.method() == Verb::get) return Open(request);
      if (request.method() != Verb::get && request.method() != Verb::head) {
        return Answer(request, Status::method_not_allowed, "Only GET and HEAD.\n", xstring());
      }
      if (place != "/") return Answer(request, Status::not_found, "Nothing is here.\n", xstring());
      const xstring nonce = RandomText();
      Answer(request, Status::ok, m_server.m_page(nonce), nonce);
    }
    // A name that leads here by a DNS of others is no name of this machine.
    bool IsHere(Request const& request) const {
      const auto host = request[Field::host];
      for (ConstStringZ name : {"127.0.0.1", "localhost"}) {
        if (host == vxMakeString(name << ':' << m_server.m_port)) return true;
      }
      return false;
    }
    // A browser says whose page it is that asks. Only the page itself may open the WebSocket.
    bool IsOwnOrigin(Request const& request, bool isLive) const {
      const auto origin = request.find(Field::origin);
      if (origin == request.end()) return !isLive;
      const auto host = request[Field::host];
      return origin->value() == "http://" + std::string(host.data(), host.size());
    }

    void Answer(Request const& request, Status status, xstring body, xstring const& nonce) {
      auto response = std::make_shared<Response>(status, request.version());
      response->set(Field::content_type, nonce.empty() ? "text/plain; charset=utf-8" : "text/html; charset=utf-8");
      response->set(Field::cache_control, "no-store");
      response->set("Content-Security-Policy", Policy(nonce));
      response->set("X-Content-Type-Options", "nosniff");
      response->set("X-Frame-Options", "DENY");
      response->set("Referrer-Policy", "no-referrer");
      response->set("Cross-Origin-Opener-Policy", "same-origin");
      response->set("Cross-Origin-Resource-Policy", "same-origin");
      response->keep_alive(request.keep_alive() && status == Status::ok);
      response->body() = std::move(body);
      const auto length = response->body().size();
      if (request.method() == Verb::head) response->body().clear();
      response->content_length(length);
      Tcp1().expires_after(m_server.m_limits.m_time);
      boost::beast::http::async_write(Tcp1(), *response,
                                      [self = shared_from_this(), response](Error error, std::size_t) {
                                        if (error || !response->keep_alive()) return self->Close();
                                        self->ReadRequest();
                                      });
    }
    // Scripts and styles of the page alone, nothing from elsewhere, no text that becomes HTML.
    xstring Policy(xstring const& nonce) const {
      const xstring host = vxMakeString("ws://127.0.0.1:" << m_server.m_port << " ws://localhost:" << m_server.m_port);
      const xstring own = nonce.empty() ? xstring()
                                        : vxMakeString("script-src 'nonce-" << nonce << "'; style-src 'nonce-" << nonce
                                                                            << "'; connect-src " << host << "; ");
      return "default-src 'none'; " + own +
             "img-src data:; base-uri 'none'; form-action 'none'; frame-ancestors 'none'; "
             "require-trusted-types-for 'script'; trusted-types 'none'";
    }

    // --- A page

    void Open(Request const& request) {
      if (m_server.m_pages >= m_server.m_limits.m_pages) {
        return Answer(request, Status::service_unavailable, "Too many pages.\n", xstring());
      }
      ++m_server.m_pages;
      m_session = std::make_unique<InspectorSession>(m_server.m_shared, [this](xstring const& text) { Send(text); });
      m_buffer = boost::beast::flat_buffer(m_server.m_limits.m_message + kRoom);
      Tcp1().expires_after(m_server.m_limits.m_time);
      m_stream.auto_fragment(false);
      m_stream.read_message_max(m_server.m_limits.m_message);
      m_stream.async_accept(request, [self = shared_from_this()](Error error) {
        if (error) return self->Close();
        self->Tcp1().expires_never();
        self->m_isOpen = true;
        self->m_left = self->m_server.m_limits.m_messages;
        self->ReadMessage();
      });
    }
    void ReadMessage() {
      if (m_isMessageAwaited || m_queued > kMostAnswered) return;
      m_isMessageAwaited = true;
      m_stream.async_read(m_buffer, [self = shared_from_this()](Error error, std::size_t) {
        self->m_isMessageAwaited = false;
        if (error || !self->TakeTurn()) return self->End();
        const auto data = self->m_buffer.cdata();
        self->m_session->Receive(std::string_view(static_cast<char const*>(data.data()), data.size()),
                                 self->m_stream.got_text());
        self->m_buffer.consume(self->m_buffer.size());
        if (self->m_buffer.capacity() > kMostAnswered) self->m_buffer.shrink_to_fit();
        self->ReadMessage();
      });
    }
    // So many at once, and so many a second: a bucket that fills again.
    bool TakeTurn() {
      const auto now = Clock::now();
      const float64 most = m_server.m_limits.m_messages;
      m_left = std::min(most, m_left + most * std::chrono::duration<float64>(now - m_lastTurn).count()) - 1;
      m_lastTurn = now;
      return m_left >= 0;
    }
    void End() {
      m_isOpen = false;
      Close();
    }
    void Send(xstring const& text) {
      m_queued += text.size();
      m_queue.push_back(text);
      if (m_queue.size() == 1) Write();
    }
    void Write() {
      m_stream.text(true);
      m_stream.async_write(boost::asio::buffer(m_queue.front()), [self = shared_from_this()](Error error, std::size_t) {
        if (error) return self->End();
        self->m_queued -= self->m_queue.front().size();
        self->m_queue.pop_front();
        if (!self->m_queue.empty()) self->Write();
        if (self->m_isOpen) self->ReadMessage();
      });
    }

    InspectorServer& m_server;
    boost::beast::websocket::stream<boost::beast::tcp_stream> m_stream;
    boost::beast::flat_buffer m_buffer;
    std::optional<boost::beast::http::request_parser<boost::beast::http::empty_body>> m_parser;
    std::unique_ptr<InspectorSession> m_session;
    xdeque<xstring> m_queue;
    std::size_t m_queued = 0;  // bytes of it
    float64 m_left = 0;        // messages that it may send now
    Clock::time_point m_lastTurn;
    bool m_isOpen = false;
    bool m_isMessageAwaited = false;
  };

  void Accept() {
    m_acceptor.async_accept([this](Error error, Tcp::socket socket) {
      if (error == boost::asio::error::operation_aborted) return;
      if (error) {  // no descriptors, no memory
        m_pause.expires_after(std::chrono::milliseconds(100));
        m_pause.async_wait([this](Error ended) {
          if (!ended) Accept();
        });
        return;
      }
      Add(std::move(socket));
      Accept();
    });
  }
  void Add(Tcp::socket socket) {
    if (m_connections.size() >= m_limits.m_connections) {
      const auto oldest =
          std::find_if(m_connections.begin(), m_connections.end(), [](auto* c) { return !c->IsPage(); });
      if (oldest == m_connections.end()) return;
      (*oldest)->Close();
    }
    const auto connection = std::make_shared<Connection>(*this, std::move(socket));
    m_connections.push_back(connection.get());
    connection->ReadRequest();
  }

  void Tick() {
    m_shared.m_log.Listen(m_pages > 0);
    if (m_pages == 0) m_shared.m_graph.Forget();
    xvector<std::shared_ptr<Connection>> open, due;
    for (Connection* connection : m_connections) {
      if (!connection->Session()) continue;
      open.push_back(connection->shared_from_this());
      if (connection->IsReading() && connection->Session()->IsTime()) due.push_back(open.back());
    }
    if (due.empty()) return;
    if (!m_shared.m_log.IsEmpty()) {
      InspectorWriter out;
      out.Open('{');
      m_shared.m_log.Put(out);
      const xstring log = out.Close('}').Take();
      for (auto const& connection : open) connection->Session()->Hear(log);
    }
    for (auto const& connection : due) {
      if (connection->Session()) connection->Session()->Tick();
    }
  }

  InspectorShared& m_shared;
  PageFunction m_page;
  InspectorServerLimits m_limits;
  uint16 m_port = 0;
  xstring m_token;
  std::list<Connection*> m_connections;  // which live as long as something is awaited of them
  std::size_t m_pages = 0;
  boost::asio::io_context m_io{1};
  Tcp::acceptor m_acceptor{m_io};
  boost::asio::steady_timer m_pause{m_io};
};

}  // namespace vesk
