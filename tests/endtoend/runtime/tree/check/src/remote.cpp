// Calls over a channel, and what each side makes of an end that fails, lies or goes away.
@import "rows/rows.h"
@import "kinds/remote.h"

using namespace kinds;

ROW(Remote) {
    Calc calc;
    Wire wire;
    const Far<ICalc> far(wire, calc);
    int32 sum = 0;
    far->Add(3, "four", sum);
    CHECK(sum, 7);
    vesk::string8 text = "a";
    int32 n = 5;
    far->Swap(text, n);
    CHECK(vxMakeString(text << n), "a!-5");
    far->Notify(3);
    CHECK(calc.notified, 0);
    far->Ping();
    Size size(100);
    far->Take(&size);
    vesk::xvector<int32> in = {5}, out;
    far->Vectors(in, out);
    CHECK(vxMakeString(calc.notified << out << bool(vesk::QueryInterface<ICalc>(far.object))), "104[5,1]true");
    CHECK(Throws([&] { Far<ICalc>(wire.client, 9)->Add(1, "", sum); }), true);
}

namespace {

// A message as a stub sends it.
template <typename... Values>
Bytes Message(vesk::uint32 object, vesk::uint32 method, vesk::uint32 answer, Values const&... values) {
    vesk::Archive ar;
    for (vesk::uint32 number : {object, method, answer}) vesk::SerialiseVariableLengthUint(ar, number);
    (void)(ar << ... << values);
    return ar.m_bytes;
}

template <typename Action>
vesk::xstring CallError(Action action) { return ErrorOf<vesk::RemoteError>(action); }

}

ROW(RemoteErrors) {
    Calc calc;
    Wire wire;
    calc.onSwap = [](vesk::string8& a) {
        if (a == "standard") throw std::logic_error("not today");
        if (a == "other") throw 7;
    };
    const Far<ICalc> far(wire, calc);
    int32 n = 1;
    auto swap = [&](vesk::string8 text) { return CallError([&] { far->Swap(text, n); }); };

    // What a method throws reaches its caller alone; the next call is served.
    CHECK(vxMakeString(swap("standard") << ',' << swap("other") << ',' << swap("fine") << n), "not today,remote method failed,none-1");
    CHECK(wire.errors, "[not today,remote method failed]");

    // Exports: null and names without a factory are refused and leave nothing behind.
    CHECK(CallError([&] { wire.server.Export(vesk::ptr<ICalc>()); }), "null cannot be exported");
    CHECK(CallError([&] { vesk::FactoryOf<vesk::ISkeletonFactory>("nobody"); }),
          "no remote interface of this name: nobody");
    const vesk::uint32 second = wire.server.Export(vesk::ptr<ICalc>(&calc));
    CHECK(second, far.number + 1);
    CHECK(wire.server.Unexport(second) && !wire.server.Unexport(second), true);
    vesk::string8 text = "a";
    CHECK(CallError([&] { Far<ICalc>(wire.client, second)->Swap(text, n); }), "no such remote object");

    // A method that takes its own object back.
    const Far<ICalc> leaving(wire, calc);
    calc.onSwap = [&](vesk::string8&) { wire.server.Unexport(leaving.number); };
    leaving->Swap(text, n);
    CHECK(text, "a!");
    CHECK(wire.server.Unexport(leaving.number), false);

    // A method that calls through its own stub.
    calc.onSwap = [&](vesk::string8& a) {
        if (a != "outer") return;
        int32 sum = 0;
        far->Add(1, "", sum);
        a += vxMakeString(sum);
    };
    text = "outer";
    far->Swap(text, n);
    CHECK(text, "outer1!");
}

ROW(RemoteMessages) {
    Calc calc;
    Wire wire;
    const Far<ICalc> far(wire, calc);
    const vesk::uint32 number = far.number;
    auto send = [&](Bytes const& message) {
        wire.errors.clear();
        wire.channel.Client().Send(message);
        wire.server.Serve();
        Bytes reply;
        wire.channel.Client().Receive(reply);
        return vxMakeString(wire.errors << reply.size());
    };
    for (Bytes const& message : {Bytes{}, Bytes{255}, Message(number, 2, 0, vesk::int16(3))}) {
        CHECK(send(message), "[read beyond the end of an archive]0");
    }
    CHECK(send(Message(0, 0, 0)), "[no such remote object]0");
    for (vesk::uint32 method : {6u, 4294967295u}) CHECK(send(Message(number, method, 0)), "[no such remote method]0");
    for (Bytes const& message : {Message(number, 2, 0, int32(3), vesk::int8(1)), Message(number, 3, 0, vesk::int8(1))}) {
        CHECK(send(message), "[bytes behind the arguments]0");
    }
    CHECK(calc.notified, 0);
    CHECK(vxMakeString(send(Message(number, 2, 0, int32(3))) << calc.notified), "[]03");
    CHECK(send(Message(number, 0, 9)), vxMakeString("[read beyond the end of an archive]" << 36));

    // Too large, either way.
    wire.server.SetMessageLimit(100);
    CHECK(send(Message(number, 0, 0, int32(1), vesk::string8(200, 'x'))), "[message of 209 bytes, the limit is 100]0");
    vesk::xvector<int32> in(24, 1), out;
    CHECK(CallError([&] { far->Vectors(in, out); }), "message of 103 bytes, the limit is 100");
    // An error's text is cut to the limit, between characters.
    calc.onSwap = [](vesk::string8& a) { throw std::runtime_error(a + vesk::string8(1000, 'x')); };
    int32 n = 0;
    for (vesk::string8 text : {"", "a", "ab\xC3\xA9"}) {
        const vesk::xstring begin = text;
        const vesk::xstring error = CallError([&] { far->Swap(text, n); });
        CHECK(error, begin + vesk::xstring(93 - begin.size(), 'x'));
    }
    calc.onSwap = [](vesk::string8&) { throw std::runtime_error(vesk::string8(92, 'x') + "\xC3\xA9 and more"); };
    vesk::string8 text;
    CHECK(CallError([&] { far->Swap(text, n); }), vesk::xstring(92, 'x'));
    wire.server.SetMessageLimit(0);
    CHECK(CallError([&] { far->Swap(text, n); }), "remote call failed");
    wire.server.SetMessageLimit(100);

    // An answer that is too long for the client is the error of the call that it belongs to, and of no other one.
    wire.client.SetMessageLimit(20);
    CHECK(CallError([&] { far->Vectors(in, out); }), "message of 100 bytes, the limit is 20");
    wire.channel.Server().Send(Bytes(30, 1));
    CHECK(CallError([&] { far->Vectors({}, out); }), "none");
    wire.channel.Server().Send({255});
    CHECK(CallError([&] { far->Vectors({}, out); }), "bad answer: read beyond the end of an archive");

    // What the error function throws stays in the server.
    wire.server.OnError([](std::string const&) { throw 1; });
    CHECK(CallError([&] { far->Swap(text, n); }), "message of 95 bytes, the limit is 20");
}

ROW(RemoteAnswers) {
    // A server that does nothing but send what it is told to.
    vesk::LocalChannel channel;
    Bytes reply;
    vesk::ClientConnection client(channel.Client(), [&] {
        if (!reply.empty()) channel.Server().Send(reply);
    });
    const Far<ICalc> far(client, 1);
    vesk::uint8 answer = 0;
    int32 kept = 0;
    auto add = [&](Bytes const& behind) {
        int32 sum = 0;
        reply = Joined({++answer}, behind);
        const vesk::xstring error = CallError([&] { far->Add(1, "", sum); });
        kept = sum;
        return error;
    };
    CHECK(vxMakeString(add({0, 7, 0, 0, 0}) << kept), "none7");
    for (Bytes const& bytes : {Bytes{}, Bytes{0, 7, 0}}) CHECK(add(bytes), "bad answer: read beyond the end of an archive");
    CHECK(add({0, 7, 0, 0, 0, 1}), "bad answer: bytes behind the values");
    CHECK(add({1, 2, 'n', 'o'}), "no");
    CHECK(add({1, 0}), "remote call failed");
    CHECK(add({1, 9, 'n'}).substr(0, 11), "bad answer:");

    // A call without an answer fails. Its answer comes during the next call, and finds nobody.
    reply.clear();
    ++answer;
    CHECK(CallError([&] { int32 sum = 0; far->Add(1, "", sum); }), "remote call without an answer");
    channel.Server().Send({answer, 0, 7, 0, 0, 0});
    CHECK(vxMakeString(add({0, 8, 0, 0, 0}) << kept), "none8");

    // A stub that nobody connected.
    const std::unique_ptr<vesk::Stub> loose(
        vesk::FactoryOf<vesk::IStubFactory>(vesk::GetIpcInterfaceName<ICalc>()).CreateStub());
    CHECK(CallError([&] { vesk::ptr<ICalc>(loose->Interface())->Ping(); }), "stub without a connection");
}

ROW(RemotePersistable) {
    Kept kept;
    Wire wire;
    const Far<IKept> far(wire, kept);
    far->Put(5);
    int32 n = 0;
    far->Take(1, n);
    CHECK(n, 6);

    // The stub itself holds nothing to be archived.
    vesk::Archive ar;
    CHECK(Throws([&] { far->Serialise(ar); }) && Throws([&] { vesk::WriteObject(far.object); }), true);
}
