// All transports, and what is of one of them. Prints what went wrong, and the number of transports.
@import "sockets/sockets.h"
@import "sockets/attacks.h"
@import "Vesk/vxObject/LocalSocketChannel.h"

#include <malloc.h>
#include <sys/wait.h>

vxDefineTarget(sockets, 1)
void Register_Project_sockets();

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

struct PlainStream {
    static constexpr std::size_t Greeting = 0;
    static vesk::PlainTransport::Context LiarContext() { return {}; }
    template <typename Stream>
    static void Accept(Stream&) {}
    template <typename Stream, typename Handler>
    static void Begin(Stream&, Handler handler) {
        handler(boost::system::error_code());
    }
    template <typename Stream>
    static void End(Stream& stream) {
        boost::system::error_code ignored;
        stream.shutdown(boost::asio::socket_base::shutdown_send, ignored);
    }
};

struct OverTcp : PlainStream {
    static constexpr const char* Name = "TCP";
    typedef vesk::SocketServer Server;
    typedef vesk::SocketChannel Channel;
    typedef vesk::TcpTransport Transport;
    typedef Tcp::socket Stream;
    static auto Listen(Server::ConnectFunction connect) { return std::make_unique<Server>(0, std::move(connect)); }
    static auto Connect(Server& server) { return Channel::Connect("127.0.0.1", server.Port()); }
    static Tcp::endpoint AnyPlace() { return {boost::asio::ip::address_v4::loopback(), 0}; }
    static auto ConnectTo(Tcp::endpoint const& place) { return Channel::Connect("127.0.0.1", place.port()); }
    static Stream Reach(boost::asio::io_context& io, Server& server) {
        Stream stream(io);
        stream.connect(Tcp::endpoint(boost::asio::ip::address_v4::loopback(), server.Port()));
        return stream;
    }
    static void CheckPeer(vesk::Peer const& peer) {
        CHECK(peer.m_kind == vesk::PK_TCP && peer.m_address.compare(0, 10, "127.0.0.1:") == 0 && peer.m_user == -1);
    }
};

struct OverLocalSocket : PlainStream {
    static constexpr const char* Name = "Unix sockets";
    typedef vesk::LocalSocketServer Server;
    typedef vesk::LocalSocketChannel Channel;
    typedef vesk::LocalSocketTransport Transport;
    typedef Transport::Stream Stream;
    static auto Listen(Server::ConnectFunction connect) { return std::make_unique<Server>("a.socket", std::move(connect)); }
    static auto Connect(Server& server) { return Channel::Connect(server.Path()); }
    static auto AnyPlace() {
        unlink("liar.socket");
        return "liar.socket";
    }
    static auto ConnectTo(Transport::Protocol::endpoint const& place) { return Channel::Connect(place.path()); }
    static Stream Reach(boost::asio::io_context& io, Server& server) {
        Stream stream(io);
        stream.connect(server.Path());
        return stream;
    }
    static void CheckPeer(vesk::Peer const& peer) {
        CHECK(peer.m_kind == vesk::PK_LOCAL && peer.m_user == getuid() && peer.m_process == getpid());
    }
};

// The same talk within this thread.
struct ThreadTalk {
    static constexpr bool IsOneThread = true;
    explicit ThreadTalk(std::function<void(vesk::Server&)> prepare) : server(ends.Server()) {
        server.Export(vesk::ptr<ISum>(&sum));
        prepare(server);
    }
    vesk::Channel* Connect() { return &ends.Client(); }
    void End() { server.Serve(); }
    static void CheckPeer(vesk::Peer const& peer) { CHECK(peer.m_kind == vesk::PK_THREAD); }
    operator std::function<void()>() {
        return [this] { server.Serve(); };
    }
    vesk::LocalChannel ends;
    vesk::Server server;
    Sum sum;
};

// --- The file of a Unix socket

vesk::LocalSocketServer::ConnectFunction NoObjects() {
    return [](vesk::Server&) {};
}
int ModeOf(const char* path) {
    struct stat there;
    return lstat(path, &there) == 0 ? there.st_mode & 0777 : -1;
}

// Whoever looks at it sees one mode, whatever the mask is; at the end nothing is left.
void CheckMode() {
    const mode_t mask = umask(0);
    std::atomic<bool> isDone = false;
    std::atomic<int> seen = 0, others = 0;
    std::thread looking([&] {
        while (!isDone) {
            const int mode = ModeOf("mode.socket");
            seen += mode == 0600;
            others += mode != 0600 && mode != -1;
        }
    });
    const auto end = Clock::now() + Time(20000);
    for (int i = 0; i < 500 || (seen < 20 && Clock::now() < end); ++i) vesk::LocalSocketServer("mode.socket", NoObjects());
    isDone = true;
    looking.join();
    umask(mask);
    CHECK(seen > 0);
    CHECK(others == 0);
    CHECK(ModeOf("mode.socket") == -1 && ModeOf("mode.socket.lock") == -1);
}

// A process that listens and is killed, or is told to go on.
struct OtherProcess {
    explicit OtherProcess(bool lives) {
        int ready[2];
        CHECK(pipe(ready) == 0);
        child = fork();
        if (child == 0) {
            vesk::LocalSocketServer server("taken.socket", NoObjects());
            CHECK(write(ready[1], "", 1) == 1);
            for (;;) pause();
        }
        char byte;
        CHECK(read(ready[0], &byte, 1) == 1);
        close(ready[0]), close(ready[1]);
        if (!lives) End();
    }
    ~OtherProcess() { End(); }
    void End() {
        if (child <= 0) return;
        kill(child, SIGKILL);
        waitpid(std::exchange(child, 0), nullptr, 0);
    }
    pid_t child;
};

std::string ErrorOfListening(const char* path) {
    return ErrorOf([path] { vesk::LocalSocketServer(path, NoObjects()); });
}

void CheckTakingOver() {
    {
        const OtherProcess living(true);
        CheckText(ErrorOfListening("taken.socket"), "another server listens on taken.socket");
        unlink("taken.socket.lock");  // one without a lock is asked
        CheckText(ErrorOfListening("taken.socket"), "another server listens on taken.socket");
    }
    CHECK(ModeOf("taken.socket") == 0600);
    CheckText(ErrorOf([] { vesk::LocalSocketChannel::Connect("taken.socket"); }),
              "cannot connect to taken.socket: Connection refused");
    {
        const OtherProcess killed(false);
        CHECK(ModeOf("taken.socket") == 0600 && ModeOf("taken.socket.lock") == 0600);
        vesk::LocalSocketServer server("taken.socket", NoObjects());
        CheckText(ErrorOfListening("taken.socket"), "another server listens on taken.socket");
        CHECK(vesk::LocalSocketChannel::Connect("taken.socket")->GetPeer().m_process == getpid());
    }
    CHECK(ModeOf("taken.socket") == -1 && ModeOf("taken.socket.lock") == -1);
    std::fclose(std::fopen("plain.socket", "w"));
    CheckText(ErrorOfListening("plain.socket"), "cannot listen on plain.socket: it is not a socket");
    CheckText(ErrorOfListening((std::string(200, 'x') + "/a").c_str()).substr(0, 11), "cannot open");

    // Of servers that start and end at once, none has the place while another one does.
    std::atomic<int> here = 0, most = 0, started = 0;
    std::vector<std::thread> threads;
    for (int i = 0; i < 4; ++i) threads.emplace_back([&] {
        for (int k = 0; k < 2000; ++k) {
            try {
                vesk::LocalSocketServer server("raced.socket", NoObjects());
                most = std::max<int>(most, ++here);
                ++started;
                CHECK(ModeOf("raced.socket") == 0600);
                --here;
            } catch (vesk::RemoteError const&) {
            }
        }
    });
    for (std::thread& thread : threads) thread.join();
    CHECK(most == 1 && started > 100);
}

// Where a token differs from what is given does not change the time: of a comparison that ends there, one would take a
// thousandth of the other.
void CheckConstantTime() {
    const std::string secret(1 << 20, 'a');
    double least[2] = {1e9, 1e9};
    for (int i = 0; i < 20; ++i) {
        for (int isLast : {0, 1}) {
            std::string given = secret;
            given[isLast ? given.size() - 1 : 0] = 'b';
            const auto begin = Clock::now();
            CHECK(!vesk::IsEqualInConstantTime(given, secret));
            least[isLast] = std::min(least[isLast], std::chrono::duration<double>(Clock::now() - begin).count());
        }
    }
    CHECK(least[0] > least[1] / 3 && least[1] > least[0] / 3);
    CHECK(vesk::IsEqualInConstantTime(secret, secret) && !vesk::IsEqualInConstantTime(secret + "a", secret));
    CHECK(!vesk::IsEqualInConstantTime("", secret) && !vesk::IsEqualInConstantTime("", ""));
}

int main() {
    Register_Project_sockets();
    g_transport = "a thread";
    CheckTalk<ThreadTalk>();
    CheckConstantTime();
    g_rows.push_back(CheckTransport<OverTcp>);
    g_rows.push_back(CheckTransport<OverLocalSocket>);
    g_rows.push_back(CheckMode);
    g_rows.push_back(CheckTakingOver);
    for (auto row : g_rows) row();
    vesk::xout() << g_rows.size() << '\n';
}
