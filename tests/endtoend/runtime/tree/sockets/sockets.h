// Servers and clients over any transport: what tests of channels share. A transport is a struct as OverTcp in sockets.cpp.
#pragma once
@import "Vesk/vxObject/IObject.h"
@import "Vesk/vxObject/SocketChannel.h"

#include <sys/resource.h>
#include <ctime>
#include <thread>

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
extern std::atomic<std::size_t> g_held;
extern thread_local int t_untilFailure;

// The transports, each with all that is tried over it; what goes wrong is told with this name.
inline std::vector<void (*)()> g_rows;
inline const char* g_transport = "";

typedef std::chrono::steady_clock Clock;
typedef std::chrono::milliseconds Time;
typedef boost::asio::ip::tcp Tcp;
typedef vesk::xvector<vesk::octet_t> Bytes;

inline void Check(bool is, const char* what) {
    if (!is) vesk::xout() << g_transport << ": not so: " << what << '\n';
}
#define CHECK(is) Check(is, #is)
inline void CheckText(std::string const& got, std::string const& wanted) {
    if (got != wanted) vesk::xout() << g_transport << ": got " << got << ", not " << wanted << '\n';
}

template <typename Action>
std::string ErrorOf(Action const& action) {
    try {
        action();
    } catch (vesk::RemoteError const& error) {
        return error.what();
    }
    return "none";
}

struct Client {
    explicit Client(vesk::Channel& channel, std::function<void()> serve = nullptr)
        : connection(channel, std::move(serve)), stub(vesk::Import<ISum>(connection, 1)), sum(stub->Interface()) {}
    vesk::ClientConnection connection;
    std::unique_ptr<vesk::Stub> stub;
    vesk::ptr<ISum> sum;
};

// A server without a thread, which serves until `isDone` or for so long.
template <typename T>
struct Host {
    Host() : server(T::Listen([this](vesk::Server& client) { connect(client), ++connects; })) {
        server->OnError([this](std::string const& text) { ++errors, lastError = text; });
    }
    Time Serve(Time time, std::function<bool()> const& isDone = nullptr) {
        const auto begin = Clock::now();
        server->ServeUntil([&] { return Clock::now() - begin > time || (isDone && isDone()); });
        return std::chrono::duration_cast<Time>(Clock::now() - begin);
    }
    bool ServeUntilClients(std::size_t count) {
        Serve(Time(5000), [&] { return server->Clients() == count; });
        return server->Clients() == count;
    }
    Sum sum;
    std::function<void(vesk::Server&)> connect = [this](vesk::Server& client) { client.Export(vesk::ptr<ISum>(&sum)); };
    std::unique_ptr<typename T::Server> server;
    int connects = 0, errors = 0;
    std::string lastError;
};

// The same with a thread.
template <typename T>
struct Serving : Host<T> {
    explicit Serving(std::function<void(vesk::Server&)> prepare = nullptr) {
        if (prepare) this->connect = [this, prepare](vesk::Server& client) {
            client.Export(vesk::ptr<ISum>(&this->sum));
            prepare(client);
        };
        thread = std::thread([this] { this->server->ServeUntil([] { return false; }); });
    }
    void End() {
        this->server->Stop();
        if (thread.joinable()) thread.join();
    }
    ~Serving() { End(); }
    std::thread thread;
};

// No allocation fails meanwhile.
struct Spared {
    ~Spared() { t_untilFailure = untilFailure; }
    const int untilFailure = std::exchange(t_untilFailure, 0);
};

// A client that sends what it likes, in the thread of its server.
template <typename T>
struct Raw {
    explicit Raw(Host<T>& host, bool enters = true) : stream(T::Reach(io, *host.server)) {
        T::Begin(stream, [this](boost::system::error_code const& error) { isIn = !error; });
        const int before = host.connects;
        if (enters) host.Serve(Time(5000), [&] { return Has(T::Greeting) && host.connects > before; });
        came.clear();
    }
    ~Raw() { T::End(stream); }
    // Takes what has come, without waiting.
    Raw& Poll() {
        const Spared spared;
        boost::system::error_code error;
        if (!isIn) {
            io.restart();
            io.poll();
        }
        if (isIn) {
            vesk::octet_t bytes[1000];
            stream.lowest_layer().non_blocking(true, error);
            while (const std::size_t size = stream.read_some(boost::asio::buffer(bytes), error)) came.insert(came.end(), bytes, bytes + size);
            isGone = error != boost::asio::error::would_block;
            stream.lowest_layer().non_blocking(false, error);
        }
        return *this;
    }
    bool Has(std::size_t size) { return Poll().came.size() >= size; }
    void Write(Bytes const& bytes) {
        boost::system::error_code error;
        boost::asio::write(stream, boost::asio::buffer(bytes.data(), bytes.size()), error);
    }
    void Send(Bytes const& message, int times = 1) {
        const Spared spared;
        Bytes bytes;
        for (int i = 0; i < times; ++i) {
            bytes.insert(bytes.end(), {vesk::octet_t(message.size()), 0, 0, 0});
            bytes.insert(bytes.end(), message.begin(), message.end());
        }
        Write(bytes);
    }
    boost::asio::io_context io;
    typename T::Stream stream;
    bool isIn = false, isGone = false;
    Bytes came;
};
