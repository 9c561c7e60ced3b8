@import "compilable/ipc.h"
@import "compilable/src/row.h"

$warning(disable: 1009)

namespace ipc
{

ROW
{
    Counter counter;
    vesk::LocalChannel channel;
    vesk::Server server(channel.Server());
    vesk::ClientConnection client(channel.Client(), [&] { server.Serve(); });
    const auto stub = vesk::Import<ICounter>(client, server.Export(vesk::ptr<ICounter>(&counter)));
    const vesk::ptr<ICounter> far(stub->Interface());
    far->Add(4);
    vesk::int32 n = 0;
    far->Get(n);
    CHECK(n, 4);
    vesk::string8 full = "a";
    far->Name("b", full);
    CHECK(full, "ab");
}

}
