// Remote calls over TLS 1.3: encrypted, the server's name proved by its certificate, and the client's by one of its own
// or by a token. It needs Boost.Asio and OpenSSL (Debian's libboost-dev and libssl-dev; -lssl -lcrypto), and nothing
// else includes it.
//
//   vesk::TlsServer server(4711, {"server.pem", "server.key", "authority.pem"}, [&](vesk::Server& client) {
//     client.Authorize([](auto interface, auto method, vesk::Peer const& peer) { return peer.m_subject == "CN=ada"; });
//     client.Export(board);
//   });
//   const auto channel = vesk::TlsChannel::Connect("example.org", 4711, {"ada.pem", "ada.key", "authority.pem"});
//
// When a client has shown its certificate, it does not know yet whether that is taken: a server that lets it in says so
// by an empty message. Sessions are not resumed, so that each connection is judged anew.

@import "Vesk/vxObject/SocketChannel.h"

#include <boost/asio/ssl.hpp>
#include <fstream>

namespace vesk {

// Files in the PEM format.
struct TlsFiles {
  std::string m_certificate;  // of this side, behind it what is between it and the authority; a client may have none
  std::string m_key;          // its private key
  std::string m_authority;    // whose certificates the other side may have; a server that has none asks for a token
};

struct TlsTransport : TcpAddresses {
  typedef boost::asio::ssl::stream<Protocol::socket> Stream;
  typedef std::shared_ptr<boost::asio::ssl::context> Context;
  static constexpr bool kHandshakes = true;
  static constexpr bool kIsSocket = false;
  static constexpr auto Server = boost::asio::ssl::stream_base::server;

  // RemoteError for a file that cannot be used.
  static Context MakeContext(TlsFiles const& files, bool isServer);
  static Stream Make(Protocol::socket socket, Context& context) { return Stream(std::move(socket), *context); }
  static void SetUp(Stream& stream) { TcpAddresses::SetUp(stream.next_layer()); }
  static bool IsAt(Protocol::endpoint const& server, Stream& stream) {
    return TcpAddresses::IsAt(server, stream.next_layer());
  }
  template <typename Handler>
  static void BeginEnd(Stream& stream, Handler&& handler) {
    stream.async_shutdown(std::forward<Handler>(handler));
  }
  static Peer PeerOf(Stream& stream);
  static std::string TextOf(boost::system::error_code const& error, Stream& stream);

 private:
  static std::string SubjectOf(Stream& stream);
};

inline TlsTransport::Context TlsTransport::MakeContext(TlsFiles const& files, bool isServer) {
  typedef boost::asio::ssl::context Tls;
  const auto context = std::make_shared<Tls>(isServer ? Tls::tls_server : Tls::tls_client);
  boost::system::error_code error;
  auto load = [&](std::string const& file, ConstStringZ what, auto function) {
    if (file.empty()) return;
    if (!std::ifstream(file)) throw RemoteError(std::string("cannot open the ") + what + " " + file);
    function(file);
    if (error) throw RemoteError(std::string("cannot use the ") + what + " " + file + ": " + error.message());
  };
  if (isServer ? files.m_certificate.empty() : files.m_authority.empty()) {
    throw RemoteError(isServer ? "a TLS server needs a certificate" : "a TLS client needs the server's authority");
  }
  load(files.m_certificate, "certificate", [&](auto& file) { context->use_certificate_chain_file(file, error); });
  load(files.m_key, "key", [&](auto& file) { context->use_private_key_file(file, Tls::pem, error); });
  load(files.m_authority, "authority", [&](auto& file) { context->load_verify_file(file, error); });
  SSL_CTX* const native = context->native_handle();
  if (!files.m_certificate.empty() && SSL_CTX_check_private_key(native) != 1) {
    throw RemoteError("the key " + files.m_key + " is not that of the certificate " + files.m_certificate);
  }
  SSL_CTX_set_min_proto_version(native, TLS1_3_VERSION);
  SSL_CTX_set_session_cache_mode(native, SSL_SESS_CACHE_OFF);
  SSL_CTX_set_num_tickets(native, 0);
  const bool asks = !files.m_authority.empty();
  context->set_verify_mode(asks ? SSL_VERIFY_PEER | SSL_VERIFY_FAIL_IF_NO_PEER_CERT : SSL_VERIFY_NONE);
  return context;
}

inline std::string TlsTransport::SubjectOf(Stream& stream) {
  SSL* const native = stream.native_handle();
  const std::unique_ptr<X509, void (*)(X509*)> certificate(SSL_get1_peer_certificate(native), X509_free);
  const std::unique_ptr<BIO, int (*)(BIO*)> out(BIO_new(BIO_s_mem()), BIO_free);
  if (!certificate || !out) return "";
  // Commas and the like within a name are escaped, so that no name looks like two.
  X509_NAME_print_ex(out.get(), X509_get_subject_name(certificate.get()), 0, XN_FLAG_RFC2253 & ~ASN1_STRFLGS_ESC_MSB);
  char* text = nullptr;
  const long size = BIO_get_mem_data(out.get(), &text);
  return std::string(text, static_cast<std::size_t>(size));
}

inline Peer TlsTransport::PeerOf(Stream& stream) {
  Peer peer;
  peer.m_kind = PK_TLS;
  peer.m_address = TcpAddresses::TextOf(stream.next_layer());
  if (SSL_get_verify_mode(stream.native_handle()) & SSL_VERIFY_PEER) peer.m_subject = SubjectOf(stream);
  return peer;
}

inline std::string TlsTransport::TextOf(boost::system::error_code const& error, Stream& stream) {
  struct Row {
    int m_reason;
    ConstStringZ m_text;
  };
  static constexpr Row kRows[] = {
      {SSL_R_PEER_DID_NOT_RETURN_A_CERTIFICATE, "it has no certificate"},
      {SSL_R_HTTP_REQUEST, "it does not speak TLS"},
      {SSL_R_WRONG_VERSION_NUMBER, "it does not speak TLS"},
      {SSL_R_PACKET_LENGTH_TOO_LONG, "it does not speak TLS"},
      {SSL_R_UNSUPPORTED_PROTOCOL, "it does not speak TLS 1.3"},
      {SSL_R_TLSV1_ALERT_PROTOCOL_VERSION, "it does not speak TLS 1.3"},
      {SSL_R_TLSV13_ALERT_CERTIFICATE_REQUIRED, "it asks for a certificate"},
      {SSL_R_TLSV1_ALERT_UNKNOWN_CA, "it does not know the authority of this side's certificate"},
      {SSL_R_SSLV3_ALERT_CERTIFICATE_EXPIRED, "this side's certificate has expired"},
      {SSL_R_SSLV3_ALERT_BAD_CERTIFICATE, "it does not take this side's certificate"},
      {SSL_R_SSLV3_ALERT_UNSUPPORTED_CERTIFICATE, "this side's certificate is not for that"},
  };
  std::string text = error.message();
  const bool isTls = error.category() == boost::asio::error::get_ssl_category();
  const int reason = isTls ? ERR_GET_REASON(static_cast<unsigned long>(error.value())) : 0;
  const auto row = std::find_if(std::begin(kRows), std::end(kRows), [=](Row const& r) { return r.m_reason == reason; });
  if (isTls && row != std::end(kRows)) text = row->m_text;
  const long judged = SSL_get_verify_result(stream.native_handle());
  if (isTls && reason == SSL_R_CERTIFICATE_VERIFY_FAILED) {
    text = std::string("its certificate is not taken: ") + X509_verify_cert_error_string(judged);
  }
  const std::string address = TcpAddresses::TextOf(stream.next_layer());
  return (address.empty() ? "the other side" : address) + ": " + text;
}

class TlsChannel : public StreamChannel<TlsTransport> {
 public:
  using StreamChannel::StreamChannel;

  // RemoteError when nobody listens there, the server has another name than `host`, or does not take the certificate;
  // RemoteTimeout when it does not say so within the time, which begins when it is reached.
  static std::unique_ptr<TlsChannel> Connect(std::string const& host, uint16 port, TlsFiles const& files,
                                             std::chrono::milliseconds time = std::chrono::seconds(10)) {
    const auto context = TlsTransport::MakeContext(files, false);
    const auto io = std::make_shared<boost::asio::io_context>();
    Stream stream(TcpAddresses::Connect(*io, host, port), *context);
    AskForName(stream, host);
    auto channel = std::make_unique<TlsChannel>(io, std::move(stream), true);
    channel->Enter(host, EndOf(time));
    return channel;
  }

 private:
  static void AskForName(Stream& stream, std::string const& host) {
    boost::system::error_code error;
    boost::asio::ip::make_address(host, error);
    SSL* const native = stream.native_handle();
    X509_VERIFY_PARAM* const asked = SSL_get0_param(native);
    X509_VERIFY_PARAM_set_hostflags(asked, X509_CHECK_FLAG_NEVER_CHECK_SUBJECT | X509_CHECK_FLAG_NO_PARTIAL_WILDCARDS);
    const bool isAsked = error ? X509_VERIFY_PARAM_set1_host(asked, host.data(), host.size()) == 1 &&
                                     SSL_set_tlsext_host_name(native, host.c_str()) == 1
                               : X509_VERIFY_PARAM_set1_ip_asc(asked, host.c_str()) == 1;
    if (!isAsked) throw RemoteError("cannot connect to " + host + ": not a name");
  }
  // Waits until the server says that it lets this side in.
  void Enter(std::string const& host, Clock::time_point end) {
    StartHandshake(boost::asio::ssl::stream_base::client);
    xvector<octet_t> message;
    while (IsOpen() && !HasMessage()) {
      if (!RunOneUntil(end)) throw RemoteTimeout("cannot connect to " + host + ": no TLS handshake in time");
    }
    const bool has = Receive(message);
    if (has && message.empty()) return;
    const std::string why = Failure().empty() ? "refused" : Failure();
    throw RemoteError("cannot connect to " + host + ": " + (has ? "it does not serve remote calls" : why));
  }
};

class TlsServer : public StreamServer<TlsTransport> {
 public:
  // Port 0: any that is free. RemoteError when the port is taken, or a file cannot be used. Without an authority, the
  // connect function must ask each client for a token.
  TlsServer(uint16 port, TlsFiles const& files, ConnectFunction connect,
            boost::asio::ip::address const& address = boost::asio::ip::address_v4::loopback())
      : StreamServer(WithProof(std::move(connect), files), TlsTransport::MakeContext(files, true)) {
    Listen(Protocol::endpoint(address, port), vxMakeString("port " << port));
  }
  uint16 Port() const { return Endpoint().port(); }

 private:
  static ConnectFunction WithProof(ConnectFunction connect, TlsFiles const& files) {
    if (!files.m_authority.empty()) return connect;
    return [connect = std::move(connect)](Server& client) {
      connect(client);
      if (!client.WaitsForToken()) throw RemoteError("the server asks for neither a certificate nor a token");
    };
  }
};

}  // namespace vesk
