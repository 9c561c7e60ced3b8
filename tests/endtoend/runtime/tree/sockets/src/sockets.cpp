// A server over TCP in one thread and clients in others, each with a connection of its own; the server is stopped from
// outside. Prints what went wrong, and the sum of all calls.
@import "Vesk/vxObject/IObject.h"
@import "Vesk/vxObject/SocketChannel.h"

#include <thread>

vxDefineTarget(sockets, 1)
void Register_Project_sockets();

$interface+ rmi ISum : vesk::IObject
{
    void Add([in] int32 n, [in] const string8& text, [out] int32& length);
};
$class+ Sum isa ISum
{
public:
    void Add(int32 n, const vesk::string8& text, int32& length)
    {
        if (n < 0) throw std::invalid_argument("negative");
        sum += n;
        length = int32(text.size());
    }
    int32 sum = 0;
};

const int kClients = 4;
const int kCalls = 25;

// How many calls gave what they must.
int Call(vesk::uint16 port)
{
    int right = 0;
    const auto channel = vesk::SocketChannel::Connect("127.0.0.1", port);
    vesk::ClientConnection connection(*channel);
    const auto stub = vesk::Import<ISum>(connection, 1);
    const vesk::ptr<ISum> sum(stub->Interface());
    for (int i = 0; i < kCalls; ++i)
    {
        int32 length = 0;
        sum->Add(1, vesk::string8(i * 1000, 'x'), length);
        right += length == i * 1000;
    }
    try
    {
        int32 length = 0;
        sum->Add(-1, "", length);
    }
    catch (vesk::RemoteError const& error)
    {
        right += error.what() == vesk::xstring("negative");
    }
    return right;
}

int main()
{
    Register_Project_sockets();
    Sum sum;
    vesk::SocketServer server(0, [&sum](vesk::Server& client) { client.Export(vesk::ptr<ISum>(&sum)); });
    const vesk::uint16 port = server.Port();
    std::thread serving([&server] { server.ServeUntil([] { return false; }); });
    int right[kClients] = {};
    std::thread clients[kClients];
    for (int i = 0; i < kClients; ++i) clients[i] = std::thread([&right, i, port] { right[i] = Call(port); });
    for (std::thread& client : clients) client.join();
    server.Stop();
    serving.join();
    for (int count : right)
    {
        if (count != kCalls + 1) vesk::xout() << count << " calls of a client went well\n";
    }
    vesk::xout() << sum.sum << '\n';
}
