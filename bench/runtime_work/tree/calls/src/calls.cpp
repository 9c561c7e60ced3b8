// Remote calls, each of which waits for its answer: over TCP, Unix sockets and TLS to another thread, each beside messages of
// the same sizes there and back by hand.
@import "Vesk/vxObject/IObject.h"
@import "Vesk/vxObject/LocalSocketChannel.h"
@import "Vesk/vxObject/SocketChannel.h"
#if __has_include(<openssl/ssl.h>)
@import "Vesk/vxObject/TlsChannel.h"
#endif

#include "timing.h"

#include <thread>

vxDefineTarget(calls, 1)
void Register_Project_calls();

constexpr int kCalls = 10000;

$interface+ rmi ISum : vesk::IObject {
    void Add([in] int32 n, [out] int32& sum);
};
$class+ Sum isa ISum {
public:
    void Add(int32 n, int32& sum) { sum = m_sum += n; }

private:
    int32 m_sum = 0;
};

typedef boost::asio::ip::tcp Tcp;
typedef boost::asio::local::stream_protocol Local;

const char kPath[] = "calls.socket";

Sum g_sum;
void Export(vesk::Server& client) { client.Export(vesk::ptr<ISum>(&g_sum)); }

template <typename Server, typename Connect>
void Remote(const char* name, Server& server, Connect connect)
{
    std::thread serving([&server] { server.ServeUntil([] { return false; }); });
    {
        const auto channel = connect();
        vesk::ClientConnection connection(*channel);
        const auto stub = vesk::Import<ISum>(connection, 1);
        const vesk::ptr<ISum> remote(stub->Interface());
        int32 total = 0;
        Measure(name, [&] {
            for (int i = 0; i < kCalls; ++i) remote->Add(1, total);
        });
        g_kept = &total;
    }
    server.Stop();
    serving.join();
}

// A length of four bytes and as many as a call and its answer have.
template <typename Stream>
void ByHand(const char* name, Stream& here, Stream& there)
{
    char call[11] = {}, answer[10] = {};
    std::thread serving([&there] {
        char bytes[11];
        boost::system::error_code error;
        while (boost::asio::read(there, boost::asio::buffer(bytes, 11), error) == 11) {
            boost::asio::write(there, boost::asio::buffer(bytes, 10));
        }
    });
    Measure(name, [&] {
        for (int i = 0; i < kCalls; ++i)
        {
            boost::asio::write(here, boost::asio::buffer(call));
            boost::asio::read(here, boost::asio::buffer(answer));
        }
    });
    here.lowest_layer().shutdown(boost::asio::socket_base::shutdown_both);
    serving.join();
}

template <typename Acceptor, typename Socket>
void Join(Acceptor acceptor, Socket& here, Socket& there)
{
    here.connect(acceptor.local_endpoint());
    acceptor.accept(there);
}
void JoinTcp(boost::asio::io_context& io, Tcp::socket& here, Tcp::socket& there)
{
    Join(Tcp::acceptor(io, Tcp::endpoint(boost::asio::ip::address_v4::loopback(), 0)), here, there);
    for (Tcp::socket* socket : {&here, &there}) socket->set_option(Tcp::no_delay(true));
}

#if __has_include(<openssl/ssl.h>)
void OverTls()
{
    const vesk::TlsFiles files = {"calls.pem", "calls.key", "calls.pem"};
    vesk::TlsServer server(0, files, Export);
    Remote("calls_tls", server, [&] { return vesk::TlsChannel::Connect("localhost", server.Port(), files); });

    boost::asio::io_context io;
    vesk::TlsTransport::Context contexts[] = {vesk::TlsTransport::MakeContext(files, false), vesk::TlsTransport::MakeContext(files, true)};
    vesk::TlsTransport::Stream here(io, *contexts[0]), there(io, *contexts[1]);
    JoinTcp(io, here.next_layer(), there.next_layer());
    std::thread joining([&there] { there.handshake(boost::asio::ssl::stream_base::server); });
    here.handshake(boost::asio::ssl::stream_base::client);
    joining.join();
    ByHand("calls_tls_hand", here, there);
}
#else
void OverTls() {}
#endif

int main()
{
    Register_Project_calls();
    boost::asio::io_context io;
    {
        vesk::SocketServer server(0, Export);
        Remote("calls", server, [&] { return vesk::SocketChannel::Connect("127.0.0.1", server.Port()); });
        Tcp::socket here(io), there(io);
        JoinTcp(io, here, there);
        ByHand("calls_hand", here, there);
    }
    {
        vesk::LocalSocketServer server(kPath, Export);
        Remote("calls_local", server, [] { return vesk::LocalSocketChannel::Connect(kPath); });
    }
    {
        Local::socket here(io), there(io);
        Join(Local::acceptor(io, kPath), here, there);
        ByHand("calls_local_hand", here, there);
        ::unlink(kPath);
    }
    OverTls();
}
