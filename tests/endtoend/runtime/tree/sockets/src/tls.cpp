// TLS, and what is of it alone: certificates that are not taken, and other sides that speak something else.
@import "sockets/attacks.h"
@import "Vesk/vxObject/TlsChannel.h"

namespace {

const vesk::TlsFiles kServer = {"server.pem", "server.key", "authority.pem"};
const vesk::TlsFiles kAda = {"ada.pem", "ada.key", "authority.pem"};

struct OverTls {
    static constexpr const char* Name = "TLS";
    static constexpr std::size_t Greeting = 4;
    typedef vesk::TlsServer Server;
    typedef vesk::TlsChannel Channel;
    typedef vesk::TlsTransport Transport;
    typedef Transport::Stream Stream;
    static auto Listen(Server::ConnectFunction connect) {
        return std::make_unique<Server>(0, kServer, std::move(connect));
    }
    static auto Connect(Server& server) { return Channel::Connect("localhost", server.Port(), kAda); }
    static Tcp::endpoint AnyPlace() { return {boost::asio::ip::address_v4::loopback(), 0}; }
    static auto ConnectTo(Tcp::endpoint const& place) { return Channel::Connect("localhost", place.port(), kAda); }
    static Transport::Context LiarContext() { return Transport::MakeContext(kServer, true); }
    static void Accept(Stream& stream) { stream.handshake(Transport::Server); }
    static Stream Reach(boost::asio::io_context& io, Server& server) {
        static Transport::Context context = Transport::MakeContext(kAda, false);
        Stream stream(io, *context);
        stream.next_layer().connect(Tcp::endpoint(boost::asio::ip::address_v4::loopback(), server.Port()));
        return stream;
    }
    template <typename Handler>
    static void Begin(Stream& stream, Handler handler) {
        stream.async_handshake(boost::asio::ssl::stream_base::client, handler);
    }
    static void End(Stream& stream) {
        const Spared spared;
        stream.async_shutdown([](boost::system::error_code const&) {});
    }
    static void CheckPeer(vesk::Peer const& peer) {
        CHECK(peer.m_kind == vesk::PK_TLS && peer.m_subject == "CN=ada");
        CHECK(peer.m_address.compare(0, 10, "127.0.0.1:") == 0);
    }
};

vesk::TlsFiles FilesOf(std::string const& name) { return {name + ".pem", name + ".key", "authority.pem"}; }

// A server with other files.
vesk::TlsFiles g_files;
struct WithFiles : OverTls {
    static auto Listen(Server::ConnectFunction connect) {
        return std::make_unique<Server>(0, g_files, std::move(connect));
    }
};

// What a client hears, and what the server does, without addresses.
struct Heard {
    std::string m_client, m_server;
};
template <typename Connect>
Heard Hear(vesk::TlsFiles const& files, Connect const& connect) {
    g_files = files;
    Host<WithFiles> host;
    Heard heard;
    std::atomic<bool> isDone = false;
    std::thread client([&] {
        heard.m_client = ErrorOf([&] { connect(host.server->Port()); });
        isDone = true;
    });
    host.Serve(Time(10000), [&] { return isDone && (host.errors > 0 || heard.m_client == "none"); });
    client.join();
    heard.m_server = host.lastError;
    for (std::string* text : {&heard.m_client, &heard.m_server}) {
        const std::size_t at = text->find("127.0.0.1:");
        if (at != std::string::npos) text->erase(at, text->find(": ", at) + 2 - at);
    }
    return heard;
}

void CheckCertificates() {
    const std::string refused = "cannot connect to localhost: ", notTaken = "its certificate is not taken: ";
    const struct {
        std::string server, name, client;
        Heard heard;
    } kRows[] = {
        {"server", "localhost", "ada", {"none", ""}},
        {"server", "127.0.0.1", "ada", {"none", ""}},
        {"other", "localhost", "ada", {refused + notTaken + "hostname mismatch", "it does not take this side's certificate"}},
        {"late", "localhost", "ada", {refused + notTaken + "certificate has expired", "this side's certificate has expired"}},
        {"foreign", "localhost", "ada",
         {refused + notTaken + "self-signed certificate", "it does not know the authority of this side's certificate"}},
        {"stranger", "localhost", "ada",
         {refused + notTaken + "unable to get local issuer certificate", "it does not know the authority of this side's certificate"}},
        {"ada", "localhost", "ada",
         {refused + notTaken + "unsuitable certificate purpose", "this side's certificate is not for that"}},
        {"server", "localhost", "", {refused + "it asks for a certificate", "it has no certificate"}},
        {"server", "localhost", "late",
         {refused + "this side's certificate has expired", notTaken + "certificate has expired"}},
        {"server", "localhost", "foreign",
         {refused + "it does not know the authority of this side's certificate", notTaken + "self-signed certificate"}},
        {"server", "localhost", "server",
         {refused + "this side's certificate is not for that", notTaken + "unsuitable certificate purpose"}},
    };
    for (auto const& row : kRows) {
        const vesk::TlsFiles files = row.client.empty() ? vesk::TlsFiles{"", "", "authority.pem"} : FilesOf(row.client);
        const Heard heard = Hear(FilesOf(row.server), [&](vesk::uint16 port) { vesk::TlsChannel::Connect(row.name, port, files); });
        CheckText(heard.m_client, row.heard.m_client);
        CheckText(heard.m_server, row.heard.m_server);
    }
    // Files that cannot be used, and a server that anyone could call.
    auto errorOf = [](vesk::TlsFiles const& files) { return ErrorOf([&] { vesk::TlsServer(0, files, nullptr); }); };
    CheckText(errorOf({"none.pem", "", ""}), "cannot open the certificate none.pem");
    CheckText(errorOf({"server.pem", "ada.key", ""}), "cannot use the key ada.key: key values mismatch");
    CheckText(errorOf({"", "", "authority.pem"}), "a TLS server needs a certificate");
    CheckText(ErrorOf([] { vesk::TlsChannel::Connect("localhost", 1, {}); }), "a TLS client needs the server's authority");
    const Heard open = Hear({"server.pem", "server.key", ""}, [&](vesk::uint16 port) {
        vesk::TlsChannel::Connect("localhost", port, {"", "", "authority.pem"});
    });
    CheckText(open.m_server, "the server asks for neither a certificate nor a token");
}

// Those that do not speak TLS 1.3.
void CheckOthers() {
    CheckText(Hear(kServer, [](vesk::uint16 port) {
        const auto channel = vesk::SocketChannel::Connect("localhost", port);
        Client client(*channel);
        vesk::string8 text;
        client.sum->Say(1, text);
    }).m_server, "it does not speak TLS");
    CheckText(Hear(kServer, [](vesk::uint16 port) {
        boost::asio::io_context io;
        boost::asio::ssl::context context(boost::asio::ssl::context::tlsv12_client);
        OverTls::Stream stream(io, context);
        stream.next_layer().connect(Tcp::endpoint(boost::asio::ip::address_v4::loopback(), port));
        boost::system::error_code error;
        stream.handshake(boost::asio::ssl::stream_base::client, error);
        if (error) throw vesk::RemoteError(error.message());
    }).m_server, "it does not speak TLS 1.3");
    vesk::SocketServer plain(0, [](vesk::Server&) {});
    std::thread serving([&] { plain.ServeUntil([] { return false; }); });
    CheckText(ErrorOf([&] { vesk::TlsChannel::Connect("localhost", plain.Port(), kAda, Time(300)); }),
              "cannot connect to localhost: no TLS handshake in time");
    plain.Stop();
    serving.join();
}

// Those that never finish their handshake keep nobody out, and go.
void CheckSilent() {
    Host<OverTls> host;
    host.server->SetEntryLimits(3, Time(3000));
    boost::asio::io_context io;
    std::list<Tcp::socket> silent;
    for (int i = 0; i < 10; ++i) {
        silent.emplace_back(io).connect({boost::asio::ip::address_v4::loopback(), host.server->Port()});
        if (i % 2) boost::asio::write(silent.back(), boost::asio::buffer("\x16\x03\x01\x02", 4));
    }
    const auto begin = Clock::now();
    Raw<OverTls> raw(host);
    raw.Send(kSay);
    host.Serve(Time(5000), [&] { return raw.Has(kSaid); });
    CHECK(raw.Has(kSaid) && Clock::now() - begin < Time(2500));
    host.Serve(Time(6000), [&] { return host.errors >= 2; });
    for (Tcp::socket& socket : silent) {
        char byte;
        boost::system::error_code error;
        socket.non_blocking(true);
        socket.read_some(boost::asio::buffer(&byte, 1), error);
        CHECK(error && error != boost::asio::error::would_block);
    }
    CHECK(host.server->Clients() == 1);
}

// Who leaves says so: it does not look cut off.
void CheckFarewell() {
    const auto io = std::make_shared<boost::asio::io_context>();
    Tcp::acceptor acceptor(*io, OverTls::AnyPlace());
    std::thread leaving([&] { OverTls::ConnectTo(acceptor.local_endpoint()); });
    auto context = OverTls::LiarContext();
    auto stream = OverTls::Transport::Make(acceptor.accept(), context);
    OverTls::Accept(stream);
    vesk::StreamChannel<OverTls::Transport> channel(io, std::move(stream), false);
    channel.Send({});
    Bytes message;
    CHECK(!channel.ReceiveWithin(message, Time(5000)));
    CHECK(channel.HasEnded() && channel.Failure().empty());
    leaving.join();
}

// Who has a token needs no certificate.
void CheckToken() {
    g_files = {"server.pem", "server.key", ""};
    Serving<WithFiles> host([](vesk::Server& server) { server.AddToken("of sixteen bytes or more"); });
    const auto channel = vesk::TlsChannel::Connect("localhost", host.server->Port(), {"", "", "authority.pem"});
    Client client(*channel);
    client.connection.GiveToken("of sixteen bytes or more");
    vesk::string8 text;
    client.sum->Say(2, text);
    CHECK(text == "xx");
}

}

static const bool s_isThere = (g_rows.push_back([] {
    CheckTransport<OverTls>();
    CheckCertificates();
    CheckOthers();
    CheckToken();
    CheckSilent();
    CheckFarewell();
}), true);
