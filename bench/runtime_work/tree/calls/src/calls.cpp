// Remote calls, each of which waits for its answer: over TCP to another thread, beside messages of the same sizes there
// and back by hand.
@import "Vesk/vxObject/IObject.h"
@import "Vesk/vxObject/SocketChannel.h"

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

void Remote()
{
    Sum sum;
    vesk::SocketServer server(0, [&sum](vesk::Server& client) { client.Export(vesk::ptr<ISum>(&sum)); });
    std::thread serving([&server] { server.ServeUntil([] { return false; }); });
    {
        const auto channel = vesk::SocketChannel::Connect("127.0.0.1", server.Port());
        vesk::ClientConnection connection(*channel);
        const auto stub = vesk::Import<ISum>(connection, 1);
        const vesk::ptr<ISum> remote(stub->Interface());
        int32 total = 0;
        Measure("calls", [&] {
            for (int i = 0; i < kCalls; ++i) remote->Add(1, total);
        });
        g_kept = &total;
    }
    server.Stop();
    serving.join();
}

// A length of four bytes and as many as a call and its answer have.
void ByHand()
{
    boost::asio::io_context io;
    Tcp::acceptor acceptor(io, Tcp::endpoint(boost::asio::ip::address_v4::loopback(), 0));
    Tcp::socket here(io), there(io);
    here.connect(acceptor.local_endpoint());
    acceptor.accept(there);
    for (Tcp::socket* socket : {&here, &there}) socket->set_option(Tcp::no_delay(true));
    char call[11] = {}, answer[10] = {};
    std::thread serving([&there] {
        char bytes[11];
        boost::system::error_code error;
        while (boost::asio::read(there, boost::asio::buffer(bytes, 11), error) == 11) {
            boost::asio::write(there, boost::asio::buffer(bytes, 10));
        }
    });
    Measure("calls_hand", [&] {
        for (int i = 0; i < kCalls; ++i)
        {
            boost::asio::write(here, boost::asio::buffer(call));
            boost::asio::read(here, boost::asio::buffer(answer));
        }
    });
    here.close();
    serving.join();
}

int main()
{
    Register_Project_calls();
    Remote();
    ByHand();
}
