// A server over TCP in one thread and clients in others, each with a connection of its own; the server is stopped from
// outside. Then clients that leave, flood and lie, and what methods do to their own server. Prints what went wrong, and
// the sum of all calls.
@import "Vesk/vxObject/IObject.h"
@import "Vesk/vxObject/SocketChannel.h"

#include <malloc.h>
#include <sys/resource.h>
#include <ctime>
#include <thread>

vxDefineTarget(sockets, 1)
void Register_Project_sockets();

$interface+ rmi ISum : vesk::IObject {
    void Add([in] int32 n, [in] const string8& text, [out] int32& length);
    void Tell([in] int32 n);
    void Say([in] int32 size, [out] string8& text);
    void Nest([out] int32& n);
};
$class+ Sum isa ISum {
public:
    void Add(int32 n, const vesk::string8& text, int32& length) {
        if (n < 0) throw std::invalid_argument("negative");
        sum += n;
        length = int32(text.size());
    }
    void Tell(int32 n) {
        told += n;
        std::this_thread::sleep_for(std::chrono::microseconds(50));
    }
    void Say(int32 size, vesk::string8& text) { text.assign(size, 'x'); }
    void Nest(int32& n) {
        if (nest) nest();
        n = 1;
    }
    int32 sum = 0;
    int32 told = 0;
    std::function<void()> nest;
};

// What the program holds, and which of this thread's allocations fails.
std::atomic<std::size_t> g_held;
thread_local int t_untilFailure = 0;

void* operator new(std::size_t size) {
    void* const memory = t_untilFailure > 0 && --t_untilFailure == 0 ? nullptr : std::malloc(size);
    if (!memory) throw std::bad_alloc();
    g_held += malloc_usable_size(memory);
    return memory;
}
void operator delete(void* memory) noexcept {
    g_held -= malloc_usable_size(memory);
    std::free(memory);
}
void operator delete(void* memory, std::size_t) noexcept { operator delete(memory); }

typedef std::chrono::steady_clock Clock;
typedef std::chrono::milliseconds Time;
typedef boost::asio::ip::tcp Tcp;
typedef vesk::xvector<vesk::octet_t> Bytes;

void Check(bool is, const char* what) {
    if (!is) vesk::xout() << "not so: " << what << '\n';
}
#define CHECK(is) Check(is, #is)

vesk::xstring ErrorOf(std::function<void()> const& action) {
    try {
        action();
    } catch (vesk::RemoteError const& error) {
        return error.what();
    }
    return "none";
}

const int kClients = 4;
const int kCalls = 25;

struct Client {
    explicit Client(vesk::uint16 port)
        : channel(vesk::SocketChannel::Connect("127.0.0.1", port)), connection(*channel),
          stub(vesk::Import<ISum>(connection, 1)), sum(stub->Interface()) {
        connection.SetTimeout(Time::max());
        channel->SetTimeout(Time::max());
    }
    std::unique_ptr<vesk::SocketChannel> channel;
    vesk::ClientConnection connection;
    std::unique_ptr<vesk::Stub> stub;
    vesk::ptr<ISum> sum;
};

// How many calls gave what they must.
int Call(vesk::uint16 port) {
    int right = 0;
    Client client(port);
    int32 length = 0;
    for (int i = 0; i < kCalls; ++i) {
        client.sum->Add(1, vesk::string8(i * 1000, 'x'), length);
        right += length == i * 1000;
    }
    right += ErrorOf([&] { client.sum->Add(-1, "", length); }) == "negative";

    // Answers that are too long for this client alone.
    client.channel->SetMessageLimit(5000);
    vesk::string8 text;
    for (int size : {5000, 1000000, 100}) {
        const vesk::xstring error = ErrorOf([&] { client.sum->Say(size, text); });
        const int bytes = size + (size > 5000 ? 5 : 4);  // with the number, the kind and the text's length
        right += error == (size == 100 ? vesk::xstring("none") : vesk::TooLongText(bytes, 5000));
    }
    return right;
}

// A server without a thread, which serves until `isDone` or for so long.
struct Host {
    Host() : server(0, [this](vesk::Server& client) { client.Export(vesk::ptr<ISum>(&sum)); }) {
        server.OnError([this](std::string const& text) { ++errors, lastError = text; });
    }
    Time Serve(Time time, std::function<bool()> const& isDone = nullptr) {
        const auto begin = Clock::now();
        server.ServeUntil([&] { return Clock::now() - begin > time || (isDone && isDone()); });
        return std::chrono::duration_cast<Time>(Clock::now() - begin);
    }
    Sum sum;
    vesk::SocketServer server;
    int errors = 0;
    std::string lastError;
};

// A client that sends what it likes.
struct Raw {
    explicit Raw(Host& host) : socket(io) {
        socket.connect(Tcp::endpoint(boost::asio::ip::address_v4::loopback(), host.server.Port()));
    }
    void Send(Bytes const& message, int times = 1) {
        Bytes bytes;
        for (int i = 0; i < times; ++i) {
            bytes.insert(bytes.end(), {vesk::octet_t(message.size()), 0, 0, 0});
            bytes.insert(bytes.end(), message.begin(), message.end());
        }
        boost::system::error_code error;
        boost::asio::write(socket, boost::asio::buffer(bytes.data(), bytes.size()), error);
    }
    void End() { socket.shutdown(Tcp::socket::shutdown_send); }
    // All that comes until the server closes.
    Bytes Rest() {
        Bytes bytes(1000);
        boost::system::error_code error;
        bytes.resize(boost::asio::read(socket, boost::asio::buffer(bytes.data(), bytes.size()), error));
        return bytes;
    }
    boost::asio::io_context io;
    Tcp::socket socket;
};

// Calls of the first object: a stub's bytes.
const Bytes kTell = {1, 1, 0, 1, 0, 0, 0};
const Bytes kSay = {1, 2, 9, 2, 0, 0, 0};
const Bytes kNest = {1, 3, 9};

// Who ends its sending gets its answers; who leaves is served, but for what leads to nothing.
void CheckLeaving() {
    Host host;
    {
        Raw raw(host);
        raw.Send(kSay, 2);
        raw.End();
        host.Serve(Time(5000), [&] { return host.server.Clients() == 1; });
        host.Serve(Time(5000), [&] { return host.server.Clients() == 0; });
        CHECK(raw.Rest() == (Bytes{5, 0, 0, 0, 9, 0, 2, 'x', 'x', 5, 0, 0, 0, 9, 0, 2, 'x', 'x'}));
    }
    {
        Raw raw(host);
        raw.Send(kTell, 300);
    }
    host.Serve(Time(5000), [&] { return host.sum.told == 300; });
    {
        Raw raw(host);
        raw.Send({}, 100000);
    }
    host.Serve(Time(500));
    CHECK(host.sum.told == 300 && host.errors > 0 && host.errors < 1000 && host.server.Clients() == 0);
}

// The end is kept, others are served and memory is bounded while one client sends more than can be carried out.
void CheckFlood() {
    Host host;
    host.server.SetMessageLimit(100000);
    Raw flood(host);
    const std::size_t before = g_held;
    std::size_t most = 0;
    std::thread sending([&flood] {
        for (int i = 0; i < 1000; ++i) flood.Send(kTell, 1000);  // 11 MB
    });
    Raw other(host);
    other.Send(kSay);
    host.Serve(Time(5000), [&] { return host.sum.told > 0 && other.socket.available() > 0; });
    CHECK(host.sum.told < 1000);
    auto measure = [&] {
        most = std::max<std::size_t>(most, g_held);
        return false;
    };
    CHECK(host.Serve(Time(600), measure) < Time(2000));
    CHECK(most - before > 100000 && most - before < 400000);
    CHECK(host.server.Clients() == 2);
    flood.socket.shutdown(Tcp::socket::shutdown_both);
    sending.join();
}

// At the limit of descriptors the clients that are there are served, those that wait later, and nothing spins.
void CheckDescriptors() {
    Host host;
    Raw first(host);
    host.Serve(Time(5000), [&] { return host.server.Clients() == 1; });
    Raw second(host), third(host);
    rlimit limit;
    getrlimit(RLIMIT_NOFILE, &limit);
    const rlimit none = {0, limit.rlim_max};
    setrlimit(RLIMIT_NOFILE, &none);
    const std::clock_t before = std::clock();
    first.Send(kSay);
    CHECK(host.Serve(Time(500)) < Time(1500));
    CHECK(std::clock() - before < CLOCKS_PER_SEC / 4);
    CHECK(first.socket.available() == 9 && host.server.Clients() == 1);
    setrlimit(RLIMIT_NOFILE, &limit);
    host.Serve(Time(5000), [&] { return host.server.Clients() == 3; });
    CHECK(host.server.Clients() == 3);
}

// Where memory runs out, at whatever place, a client may be lost; the server serves the next one.
void CheckMemory() {
    Host host;
    bool hasFailed = true;
    int runs = 0;
    for (; hasFailed; ++runs) {
        {
            Raw raw(host);
            raw.Send(kSay);
            bool isServing = false, isServed = false;
            host.Serve(Time(50), [&] {
                if (!std::exchange(isServing, true)) t_untilFailure = runs + 1;
                return isServed = raw.socket.available() > 0;
            });
            hasFailed = t_untilFailure <= 0;
            t_untilFailure = 0;
            CHECK(hasFailed || isServed);
        }
        Raw next(host);
        next.Send(kSay);
        host.Serve(Time(5000), [&] { return next.socket.available() > 0; });
        CHECK(next.socket.available() == 9);
    }
    CHECK(runs > 5);
    host.Serve(Time(5000), [&] { return host.server.Clients() == 0; });
    CHECK(host.server.Clients() == 0);
}

// Methods that serve while they are called by a client that leaves, and that call their own server.
void CheckNesting() {
    Host host;
    {
        Raw raw(host);
        raw.Send(kNest);
    }
    host.sum.nest = [&] { host.Serve(Time(200)); };
    host.Serve(Time(500));
    CHECK(host.server.Clients() == 0);

    Client own(host.server.Port());
    vesk::string8 text;
    vesk::xvector<vesk::xstring> errors;
    host.sum.nest = [&] {
        errors.push_back(ErrorOf([&] { own.sum->Say(1, text); }));
        errors.push_back(ErrorOf([&] { own.sum->Tell(1); }));
        vesk::ClientConnection serving(*own.channel, [&] { host.Serve(Time(200)); });
        const auto stub = vesk::Import<ISum>(serving, 1);
        errors.push_back(ErrorOf([&] { vesk::ptr<ISum>(stub->Interface())->Say(2, text); }));
    };
    Raw raw(host);
    raw.Send(kNest);
    CHECK(host.Serve(Time(5000), [&] { return errors.size() == 3; }) < Time(4000));
    CHECK(vxMakeString(errors << text << host.sum.told) ==
          "[the object is served by the thread that calls it,none,none]xx1");
}

int main() {
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
    for (int count : right) {
        if (count != kCalls + 4) vesk::xout() << count << " calls of a client went well\n";
    }
    CheckLeaving();
    CheckFlood();
    CheckDescriptors();
    CheckMemory();
    CheckNesting();
    vesk::xout() << sum.sum << '\n';
}
