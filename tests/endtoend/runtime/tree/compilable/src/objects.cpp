@import "compilable/objects.h"
@import "rows/rows.h"

$warning(disable: 1009)

namespace attributes {

ROW(attributes) {
    Thing object;
    vesk::ptr<IThing> thing(&object);
    thing->name = "a";
    CHECK(vesk::string8(thing->name), "a");
    CHECK(vesk::string8(thing->title), "title of a");
    vesk::Array<vesk::int32, 3> fixed{};
    fixed[2] = 6;
    thing->fixed = fixed;
    fixed = thing->fixed;
    CHECK(fixed[2], 6);
    thing->map = vesk::xmap<vesk::int32, vesk::string8>();
    vesk::xset<vesk::int32> set = thing->set;
    set.Insert(3);
    thing->set = set;
    CHECK(object.Getset().size(), 1u);
    thing->whole = vesk::xvector<vesk::int32>{1, 2};
    CHECK(vesk::xvector<vesk::int32>(thing->whole)[1], 2);
    thing->moved = 5;
    CHECK(thing->readOnly + 0, 6);
    thing->colour = green;
    CHECK(thing->colour == green, true);
    thing->Setsizewidth(8);
    CHECK(thing->plain + 0, 8);
}

}

namespace ipc {

ROW(ipc) {
    Counter counter;
    vesk::LocalChannel channel;
    vesk::Server server(channel.Server());
    std::string errors;
    server.OnError([&](std::string const& error) { errors += error + '\n'; });
    vesk::ClientConnection client(channel.Client(), [&] { server.Serve(); });
    const auto stub = vesk::Import<ICounter>(client, server.Export(vesk::ptr<ICounter>(&counter)));
    const vesk::ptr<ICounter> far(stub->Interface());
    far->Add(4);
    vesk::int32 n = 0;
    far->Get(3, n);
    CHECK(n, 12);
    vesk::string8 full = "a";
    far->Name("b", full);
    CHECK(full, "ab");
    CHECK(Throws([&] { far->Get(-1, n); }), true);
    typedef vesk::xvector<vesk::octet_t> Bytes;
    for (Bytes const& message : {Bytes{1, 0, 0, 5, 0}, Bytes{1, 0, 0, 5, 0, 0, 0, 9}, Bytes{1, 7, 0}}) {
        channel.Client().Send(message);
        server.Serve();
    }
    CHECK(errors, "times\nread beyond the end of an archive\nbytes behind the arguments\nno such remote method\n");
    CHECK(counter.total, 9);
}

}

namespace metadata {

$var+ int32 g_count : [ "variable" ] = 3;

ROW(metadata) {
    Shows shows;
    shows.a = 2;
    CHECK(shows.Add(3), 5);
    CHECK(g_count, 3);
}

}

namespace short_bodies {

ROW(short_bodies) {
    Doubles doubles;
    doubles.b = 4;
    CHECK(doubles.a, 5);
    CHECK(doubles.twice, 10);
    doubles.later(1);
    vesk::RunAsyncCalculations();
    CHECK(doubles.later(1), 10);
}

}
