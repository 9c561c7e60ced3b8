// The release of an archive is the archive's own: what one archive says changes nothing in how another one is read.
@import "rows/rows.h"
@import "kinds/models.h"
@import "kinds/remote.h"

using namespace kinds;

namespace {

// A Doc of the first release: its number, title, pages, count.
const vesk::xvector<vesk::octet_t> g_oldDoc = {1, 1, 'T', 2, 0, 0, 0, 9, 0, 0, 0};

// A Size of the first release (width, height), and a current one.
const vesk::xvector<vesk::octet_t> g_oldSize = {20, 0, 0, 0, 7, 0, 0, 0};
const vesk::xvector<vesk::octet_t> g_newSize = {20, 0, 0, 0, 7, 0, 0, 0, 0, 1};

vesk::xvector<vesk::octet_t> Joined(vesk::xvector<vesk::octet_t> a, vesk::xvector<vesk::octet_t> const& b) {
    a.insert(a.end(), b.begin(), b.end());
    return a;
}

template <typename Read>
vesk::xstring SizeText(vesk::InputArchive& input, Read read) {
    Size size;
    read(input, size);
    return vxMakeString(size << ' ' << input.Remaining());
}

// Between two sizes it reads a current Doc from elsewhere.
struct ReadsAnother {
    void Deserialise(vesk::InputArchive& ar) {
        ar >> first;
        vesk::Archive written;
        written << Doc();
        vesk::InputArchive another(written);
        Doc doc;
        another >> doc;
        ar >> second;
    }
    Size first, second;
};

// Its model is of one release and has scalars only.
void ReadOldScalars() {
    vesk::InputArchive input(vesk::xvector<vesk::octet_t>{1, 5, 0, 0, 0, 6, 0, 0, 0});
    Multi multi;
    multi.Deserialise(input);
}

}

ROW(Releases) {
    auto extract = [](vesk::InputArchive& ar, Size& size) { ar >> size; };
    auto call = [](vesk::InputArchive& ar, Size& size) { size.Deserialise(ar); };
    vesk::InputArchive waiting(g_newSize);
    Doc doc;

    vesk::InputArchive old(Joined(g_oldDoc, g_oldSize));
    old >> doc;
    CHECK(doc.lines.read(), "[0,0]");
    vesk::InputArchive current(g_newSize);
    CHECK(SizeText(current, extract), "Size(20,7,Red,Mid) 0");
    CHECK(SizeText(old, extract), "Size(20,7,Green,High) 0");

    vesk::InputArchive called(Joined(g_oldDoc, g_oldSize));
    doc.Deserialise(called);
    CHECK(doc.lines.read(), "[0,0]");
    current = vesk::InputArchive(g_newSize);
    CHECK(SizeText(current, call), "Size(20,7,Red,Mid) 0");
    CHECK(SizeText(called, extract), "Size(20,7,Green,High) 0");
    ReadOldScalars();
    CHECK(SizeText(waiting, call), "Size(20,7,Red,Mid) 0");

    vesk::InputArchive outer(Joined(g_oldDoc, Joined(g_oldSize, g_oldSize)));
    ReadsAnother both;
    outer >> doc >> both;
    CHECK(vxMakeString(both.first << both.second << outer.Remaining()), "Size(20,7,Green,High)Size(20,7,Green,High)0");

    Calc calc;
    vesk::LocalChannel channel;
    vesk::Server server(channel.Server());
    vesk::ClientConnection client(channel.Client(), [&] { server.Serve(); });
    const auto stub = vesk::Import<ICalc>(client, server.Export(vesk::ptr<ICalc>(&calc)));
    vesk::InputArchive again(g_oldDoc);
    doc.Deserialise(again);
    Size size(100);
    vesk::ptr<ICalc>(stub->Interface())->Take(&size);
    server.Serve();
    CHECK(calc.notified, 100);
}
