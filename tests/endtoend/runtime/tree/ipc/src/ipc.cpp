// An object that a scion calls, with results. Prints what comes back, and what is made of a bad message.
@import "Vesk/vxObject/IObject.h"

vxDefineTarget(ipc, 1)
void Register_Project_ipc();

$interface+ ipc ICount : vesk::IObject {
    void Add([in] int32 n);
    void Get([in] int32 times, [out] int32& n, [inout] string8& text) const;
};

$class+ Count isa ICount {
public:
    void Add(int32 n) { total += n; }
    void Get(int32 times, int32& n, vesk::string8& text) const {
        if (times < 0) throw std::invalid_argument("times");
        n = times * total;
        text += "!";
    }
    int32 total = 0;
};

int main() {
    Register_Project_ipc();
    Count count;
    vesk::LocalChannel channel;
    vesk::Server server(channel.Server());
    server.OnError([](std::string const& error) { vesk::xout() << error << '\n'; });
    vesk::ClientConnection client(channel.Client(), [&] { server.Serve(); });
    const auto stub = vesk::Import<ICount>(client, server.Export(vesk::ptr<ICount>(&count)));
    const vesk::ptr<ICount> far(stub->Interface());
    far->Add(4);
    int32 n = 0;
    vesk::string8 text = "a";
    far->Get(3, n, text);
    vesk::xout() << n << ' ' << text << '\n';
    try {
        far->Get(-1, n, text);
    } catch (vesk::RemoteError const& error) {
        vesk::xout() << "caught " << error.what() << '\n';
    }
    typedef vesk::xvector<vesk::octet_t> Bytes;
    for (Bytes const& message : {Bytes{1, 0, 0, 5, 0}, Bytes{1, 0, 0, 5, 0, 0, 0, 9}, Bytes{1, 7, 0}}) {
        channel.Client().Send(message);
        server.Serve();
    }
    vesk::xout() << count.total << '\n';
}
