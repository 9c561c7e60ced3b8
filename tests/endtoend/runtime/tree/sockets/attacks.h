// What is tried over each transport: a server in one thread and clients in others; clients that leave, stall, flood and
// lie; and what methods do to their own server.
#pragma once
@import "sockets/sockets.h"

// Calls of the first object: a stub's bytes.
const Bytes kTell = {1, 1, 0, 1, 0, 0, 0};
const Bytes kSay = {1, 2, 9, 2, 0, 0, 0};
const Bytes kNest = {1, 3, 9};
const std::size_t kSaid = 9;

const int kClients = 4;
const int kCalls = 25;

// How many calls gave what they must.
template <typename T>
int Call(typename T::Server& server) {
    int right = 0;
    const auto channel = T::Connect(server);
    Client client(*channel);
    client.connection.SetTimeout(Time::max());
    channel->SetTimeout(Time::max());
    int32 length = 0;
    for (int i = 0; i < kCalls; ++i) {
        client.sum->Add(1, vesk::string8(i * 1000, 'x'), length);
        right += length == i * 1000;
    }
    right += ErrorOf([&] { client.sum->Add(-1, "", length); }) == "negative";

    // Answers that are too long for this client alone.
    channel->SetMessageLimit(5000);
    vesk::string8 text;
    for (int size : {5000, 1000000, 100}) {
        const std::string error = ErrorOf([&] { client.sum->Say(size, text); });
        const int bytes = size + (size > 5000 ? 5 : 4);  // with the number, the kind and the text's length
        right += error == (size == 100 ? std::string("none") : vesk::TooLongText(bytes, 5000));
    }
    return right;
}

template <typename T>
void CheckCalls() {
    Serving<T> host;
    int right[kClients] = {};
    std::thread clients[kClients];
    for (int i = 0; i < kClients; ++i) clients[i] = std::thread([&, i] { right[i] = Call<T>(*host.server); });
    for (std::thread& client : clients) client.join();
    host.End();
    for (int count : right) CHECK(count == kCalls + 4);
    CHECK(host.sum.sum == kClients * kCalls);
}

// Who ends its sending gets its answers; who leaves is served, but for what leads to nothing.
template <typename T>
void CheckLeaving() {
    Host<T> host;
    {
        Raw<T> raw(host);
        raw.Send(kSay, 2);
        T::End(raw.stream);
        host.Serve(Time(5000), [&] { return raw.Has(2 * kSaid); });
        CHECK(raw.came == (Bytes{5, 0, 0, 0, 9, 0, 2, 'x', 'x', 5, 0, 0, 0, 9, 0, 2, 'x', 'x'}));
        CHECK(host.ServeUntilClients(0));
    }
    Raw<T>(host).Send(kTell, 300);
    host.Serve(Time(5000), [&] { return host.sum.told == 300; });
    Raw<T>(host).Send({}, 20000);
    host.Serve(Time(20000), [&] { return host.errors > 0 && host.server->Clients() == 0; });
    CHECK(host.sum.told == 300 && host.errors > 0 && host.errors < 1000 && host.server->Clients() == 0);
}

// The end is kept, others are served and memory is bounded while one client sends more than can be carried out, and
// another one reads none of 32 MB of answers.
template <typename T>
void CheckFlood() {
    Host<T> host;
    host.server->SetMessageLimit(100000);
    Raw<T> other(host), flood(host), deaf(host);
    const std::size_t before = g_held;
    std::size_t most = 0;
    deaf.Send({1, 2, 9, 0, 64, 0, 0}, 2000);
    std::thread sending([&flood] {
        for (int i = 0; i < 1000; ++i) flood.Send(kTell, 1000);  // 11 MB
    });
    other.Send(kSay);
    host.Serve(Time(5000), [&] { return host.sum.told > 0 && other.Has(kSaid); });
    CHECK(host.sum.told < 1000);
    auto measure = [&] {
        most = std::max<std::size_t>(most, g_held);
        return false;
    };
    host.Serve(Time(20000), [&] { return measure() || most - before > 100000; });  // until the flood is there
    CHECK(host.Serve(Time(600), measure) < Time(2000));
    CHECK(most - before > 100000 && most - before < 600000);
    CHECK(host.server->Clients() == 3);
    shutdown(flood.stream.lowest_layer().native_handle(), SHUT_RDWR);
    sending.join();
}

// At the limit of descriptors the clients that are there are served, those that wait later, and nothing spins.
template <typename T>
void CheckDescriptors() {
    Host<T> host;
    Raw<T> first(host), second(host, false), third(host, false);
    rlimit limit;
    getrlimit(RLIMIT_NOFILE, &limit);
    const rlimit none = {0, limit.rlim_max};
    setrlimit(RLIMIT_NOFILE, &none);
    const std::clock_t before = std::clock();
    first.Send(kSay);
    CHECK(host.Serve(Time(500)) < Time(1500));
    CHECK(std::clock() - before < CLOCKS_PER_SEC / 4);
    CHECK(first.Has(kSaid) && host.server->Clients() == 1);
    setrlimit(RLIMIT_NOFILE, &limit);
    host.Serve(Time(5000), [&] { return second.Poll().isIn && third.Poll().isIn && host.server->Clients() == 3; });
    CHECK(host.server->Clients() == 3);
}

// Where memory runs out, at whatever place, a client may be lost; the server serves the next one.
template <typename T>
void CheckMemory() {
    Host<T> host;
    bool hasFailed = true;
    int runs = 0;
    for (; hasFailed; ++runs) {
        {
            Raw<T> raw(host, false);
            bool isServing = false, isSent = false, isServed = false;
            auto lost = Clock::time_point::max();
            host.Serve(Time(5000), [&] {
                if (!std::exchange(isServing, true)) t_untilFailure = runs + 1;
                if (t_untilFailure <= 0) lost = std::min(lost, Clock::now() + Time(50));
                if (raw.Poll().isIn && !std::exchange(isSent, true)) raw.Send(kSay);
                isServed = raw.Has(T::Greeting + kSaid);
                return isServed || Clock::now() > lost;
            });
            hasFailed = t_untilFailure <= 0;
            t_untilFailure = 0;
            CHECK(hasFailed || isServed);
        }
        Raw<T> next(host);
        next.Send(kSay);
        host.Serve(Time(5000), [&] { return next.Has(kSaid); });
        CHECK(next.came.size() == kSaid);
    }
    CHECK(runs > 5);
    CHECK(host.ServeUntilClients(0));
}

// Methods that serve while they are called by a client that leaves, and that call their own server.
template <typename T>
void CheckNesting() {
    Host<T> host;
    Raw<T>(host).Send(kNest);
    host.sum.nest = [&] { host.Serve(Time(200)); };
    host.Serve(Time(500));
    CHECK(host.server->Clients() == 0);

    std::unique_ptr<typename T::Channel> channel;
    std::atomic<bool> isConnected = false;
    std::thread connecting([&] { channel = T::Connect(*host.server), isConnected = true; });
    host.Serve(Time(5000), [&] { return isConnected.load(); });
    connecting.join();
    Client own(*channel);
    vesk::string8 text;
    vesk::xvector<vesk::xstring> errors;
    host.sum.nest = [&] {
        errors.push_back(ErrorOf([&] { own.sum->Say(1, text); }));
        errors.push_back(ErrorOf([&] { own.sum->Tell(1); }));
        vesk::ClientConnection serving(*channel, [&] { host.Serve(Time(200)); });
        const auto stub = vesk::Import<ISum>(serving, 1);
        errors.push_back(ErrorOf([&] { vesk::ptr<ISum>(stub->Interface())->Say(2, text); }));
    };
    Raw<T> raw(host);
    raw.Send(kNest);
    CHECK(host.Serve(Time(5000), [&] { return errors.size() == 3; }) < Time(4000));
    CheckText(vxMakeString(errors << text << host.sum.told), "[the object is served by the thread that calls it,none,none]xx1");
}

// Clients that send half of a message, or nothing: others are served meanwhile, and they go when their time is over.
template <typename T>
void CheckSlow() {
    Host<T> host;
    host.server->SetIdleTime(Time(600));
    Raw<T> half(host), head(host), silent(host), busy(host);
    std::this_thread::sleep_for(Time(800));  // as a long call of another client does: nobody is late for that
    half.Write({100, 0, 0, 0, 1});
    head.Write({7});
    int answers = 0, sent = 0;
    const auto begin = Clock::now();
    host.Serve(Time(2000), [&] {
        if (busy.Has(answers * kSaid) && Clock::now() - begin > Time(100) * answers) ++answers, busy.Send(kSay);
        if (Clock::now() - begin > Time(50) * sent) ++sent, half.Write({0});  // a byte now and then keeps nobody there
        return false;
    });
    CHECK(host.server->Clients() == 1 && answers > 5 && !busy.isGone);
    CHECK(half.Poll().isGone && head.Poll().isGone && silent.Poll().isGone);
}

// Who has given no token: so many clients, for so long.
template <typename T>
void CheckEntry() {
    Host<T> host;
    host.connect = [&](vesk::Server& client) {
        client.AddToken("of sixteen bytes or more");
        client.Export(vesk::ptr<ISum>(&host.sum));
    };
    host.server->SetEntryLimits(2, Time(1500));
    std::list<Raw<T>> raws;
    for (int i = 0; i < 4; ++i) host.Serve(Time(50)), raws.emplace_back(host);
    host.Serve(Time(100));
    auto gone = [&] {
        int count = 0;
        for (Raw<T>& raw : raws) count += raw.Poll().isGone;
        return count;
    };
    CHECK(gone() == 2 && raws.front().isGone && !raws.back().isGone);
    raws.back().Send(kSay, 20);
    host.Serve(Time(5000), [&] { return raws.back().Poll().isGone; });
    CheckText(host.lastError, "the server asks for a token first");
    Bytes const& came = raws.back().came;
    CHECK(came.size() > kSaid && came.size() == came[0] + 4u && came[5] == vesk::AN_ERROR);  // one try
    host.Serve(Time(5000), [&] { return gone() == 4; });
    CHECK(gone() == 4 && host.server->Clients() == 0);
    CHECK(host.lastError.find(" did not prove in time who it is") != std::string::npos);
    // A long message of somebody who has not given a token is not kept.
    Raw<T> large(host);
    large.Write({0, 32, 0, 0});
    host.Serve(Time(500), [&] { return large.Poll().isGone; });
    CHECK(large.isGone);
}

// A server whose answers have wrong numbers, and come twice: the client takes those that it waits for.
template <typename T>
void CheckLies() {
    typedef typename T::Server::Protocol Protocol;
    const auto io = std::make_shared<boost::asio::io_context>();
    typename Protocol::acceptor acceptor(*io, T::AnyPlace());
    std::thread lying([&] {
        auto context = T::LiarContext();
        auto stream = T::Transport::Make(acceptor.accept(), context);
        T::Accept(stream);
        vesk::StreamChannel<typename T::Transport> channel(io, std::move(stream), false);
        if (T::Greeting) channel.Send({});
        Bytes call;
        for (vesk::octet_t letter : {'x', 'z'}) {
            CHECK(channel.ReceiveWithin(call, Time(5000)));
            const vesk::octet_t number = call[2];
            channel.Send({vesk::octet_t(number + 1), vesk::AN_VALUES, 1, 'a'});
            channel.Send({number, vesk::AN_VALUES, 1, letter});
            channel.Send({number, vesk::AN_VALUES, 1, 'b'});
        }
        CHECK(channel.ReceiveWithin(call, Time(5000)));
        channel.Send({call[2], vesk::AN_VALUES, 255, 255, 255, 255, 15, 'c'});
        channel.Receive(call);
    });
    const auto channel = T::ConnectTo(acceptor.local_endpoint());
    Client client(*channel);
    vesk::string8 text;
    for (const char* letter : {"x", "z"}) {
        client.sum->Say(1, text);
        CHECK(text == letter);
    }
    CheckText(ErrorOf([&] { client.sum->Say(1, text); }).substr(0, 12), "bad answer: ");
    CheckText(ErrorOf([&] { client.sum->Say(1, text); }), "the other side is gone");
    lying.join();
}

// What is the same over LocalChannel: who may call what, and numbers that are wrong or come twice.
template <typename Talk>
void CheckTalk() {
    const std::string token = "of sixteen bytes or more";
    std::string asked;
    Talk talk([&](vesk::Server& server) {
        CHECK(ErrorOf([&] { server.AddToken("short"); }) == "a token has at least 16 bytes");
        server.AddToken(token, "writer");
        server.AddToken("another of sixteen bytes", "reader");
        server.Authorize([&](std::string interface, std::string method, vesk::Peer const& peer) {
            if (method == "Tell") throw std::runtime_error("not on Fridays");
            asked += interface + "." + method + " " + peer.m_token + ";";
            Talk::CheckPeer(peer);
            return method != "Nest";
        });
    });
    vesk::string8 text;
    int32 n = 0;
    for (bool isWrong : {false, true}) {
        const auto channel = talk.Connect();
        Client client(*channel, talk);
        CheckText(ErrorOf([&] { isWrong ? client.connection.GiveToken(token + " ") : client.sum->Say(2, text); }),
                  isWrong ? "not a token of the server" : "the server asks for a token first");
        if (!Talk::IsOneThread) CheckText(ErrorOf([&] { client.sum->Say(2, text); }), "the other side is gone");
    }
    const auto channel = talk.Connect();
    Client client(*channel, talk);
    client.connection.GiveToken(token);
    client.sum->Say(2, text);
    CHECK(text == "xx");
    const std::string refused = ErrorOf([&] { client.sum->Nest(n); });
    CHECK(refused.find(" with the token writer may not call ISum.Nest") != std::string::npos);
    client.sum->Tell(1);  // nobody hears why not
    const auto lost = vesk::Import<ISum>(client.connection, 9);
    CheckText(ErrorOf([&] { vesk::ptr<ISum>(lost->Interface())->Say(1, text); }), "no such remote object");
    // A call that is sent again is carried out again; answers that nobody waits for are dropped.
    for (int i = 0; i < 3; ++i) channel->Send({1, 0, 1, 5, 0, 0, 0, 0});
    channel->Send({1, 9, 2});
    client.sum->Add(1, "abc", n);
    CHECK(n == 3);
    talk.End();
    CheckText(asked, "ISum.Say writer;ISum.Nest writer;ISum.Add writer;ISum.Add writer;ISum.Add writer;ISum.Add writer;");
    CHECK(talk.sum.sum == 16 && talk.sum.told == 0);
}

// Over a transport.
template <typename T>
struct SocketTalk : Serving<T> {
    static constexpr bool IsOneThread = false;
    using Serving<T>::Serving;
    auto Connect() { return T::Connect(*this->server); }
    static void CheckPeer(vesk::Peer const& peer) { T::CheckPeer(peer); }
    operator std::function<void()>() const { return nullptr; }
};

template <typename T>
void CheckTransport() {
    g_transport = T::Name;
    CheckCalls<T>();
    CheckLeaving<T>();
    CheckFlood<T>();
    CheckDescriptors<T>();
    CheckMemory<T>();
    CheckNesting<T>();
    CheckSlow<T>();
    CheckEntry<T>();
    CheckLies<T>();
    CheckTalk<SocketTalk<T>>();
}
