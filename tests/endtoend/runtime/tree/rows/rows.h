// A list of checks that fills itself.
#pragma once
@import "Vesk/vxObject/IObject.h"

#include <cstdio>

inline int g_checks = 0;
inline int g_failures = 0;

// As texts: numbers of different types are equal then.
template <typename Got, typename Expected>
void Compare(Got const& got, Expected const& expected, const char* what, const char* file, int line) {
    ++g_checks;
    const vesk::xstring text = vxMakeString(got);
    if (text == vxMakeString(expected)) return;
    ++g_failures;
    std::printf("%s(%d): %s is %s\n", file, line, what, text.c_str());
}
#define CHECK(got, expected) Compare(got, expected, #got, __FILE__, __LINE__)

struct Row {
    explicit Row(void (*check)()) : check(check), next(s_first) { s_first = this; }
    void (*check)();
    Row* next;
    static inline Row* s_first = nullptr;
};
#define ROW(name) static void Check_##name(); static const Row s_row_##name(Check_##name); static void Check_##name()

inline int RunRows() {
    for (Row const* row = Row::s_first; row; row = row->next) row->check();
    std::printf("%d checks, %d failures\n", g_checks, g_failures);
    return g_failures > 0;
}

// What the action answers, or the error that comes of it says.
template <typename Error = std::exception, typename Action>
vesk::xstring Outcome(Action action) {
    try {
        return action();
    } catch (Error const& error) {
        return error.what();
    }
}
template <typename Error = std::exception, typename Action>
vesk::xstring ErrorOf(Action action) { return Outcome<Error>([&] { return action(), "none"; }); }
template <typename Action>
bool Throws(Action action) { return ErrorOf(action) != "none"; }

typedef vesk::xvector<vesk::octet_t> Bytes;

template <typename... T>
Bytes Written(T const&... values) {
    vesk::Archive ar;
    (void)(ar << ... << values);
    return ar.m_bytes;
}

inline Bytes Joined(Bytes a, Bytes const& b, Bytes const& c = {}, Bytes const& d = {}) {
    for (Bytes const* more : {&b, &c, &d}) a.insert(a.end(), more->begin(), more->end());
    return a;
}

// With each `from` as `by`.
inline vesk::xstring Replaced(vesk::xstring text, vesk::xstring const& from, vesk::xstring const& by) {
    for (std::size_t at = 0; (at = text.find(from, at)) != text.npos; at += by.size()) text.replace(at, from.size(), by);
    return text;
}

template <typename T>
void Read(Bytes const& bytes, T& to) {
    vesk::InputArchive input(bytes);
    input >> to;
}
template <typename T>
T ReadAs(Bytes const& bytes) {
    T to;
    Read(bytes, to);
    return to;
}

// Through an archive.
template <typename T>
void Copy(T const& from, T& to) { Read(Written(from), to); }
template <typename T>
T Copied(T const& from) { return ReadAs<T>(Written(from)); }

// What comes out of an archive of a value that `set` has filled.
template <typename T, typename Set>
T Through(Set set) {
    T value;
    set(value);
    return Copied(value);
}

// A client and a server in one thread; what the server was told of goes to `errors`.
struct Wire {
    Wire() : server(channel.Server()), client(channel.Client(), [this] { server.Serve(); }) {
        server.OnError([this](std::string const& text) { errors.push_back(text); });
    }
    vesk::LocalChannel channel;
    vesk::Server server;
    vesk::ClientConnection client;
    vesk::xvector<vesk::xstring> errors;
};

// An object of a server, as a client has it.
template <typename I>
struct Far {
    Far(vesk::ClientConnection& client, vesk::uint32 number) : number(number), stub(vesk::Import<I>(client, number)), object(stub->Interface()) {}
    template <typename Object>
    Far(Wire& wire, Object& object) : Far(wire.client, wire.server.Export(vesk::ptr<I>(&object))) {}
    vesk::ptr<I> const& operator->() const { return object; }
    const vesk::uint32 number;
    const std::unique_ptr<vesk::Stub> stub;
    const vesk::ptr<I> object;
};
