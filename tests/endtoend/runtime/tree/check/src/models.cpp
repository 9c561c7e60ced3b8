@import "rows/rows.h"
@import "kinds/models.h"
@import "kinds/kinds.h"
@import "kinds/remote.h"

using namespace kinds;

ROW(Archives) {
    for (vesk::uint32 v : {0u, 127u, 128u, 16383u, 16384u, 2097151u, 2097152u, 268435455u, 268435456u, 4294967295u}) {
        vesk::Archive ar;
        vesk::SerialiseVariableLengthUint(ar, v);
        vesk::InputArchive input(ar);
        vesk::uint32 read;
        vesk::DeserialiseVariableLengthUint(input, read);
        CHECK(read == v && input.Remaining() == 0, true);
    }
    CHECK(Written(vesk::string8("ab"), vesk::int16(258), shapes::Green, vesk::xvector<vesk::int8>{1, 2}), "[2,97,98,2,1,5,2,1,2]");
    const Bytes longText = Written(vesk::string8(200, 'x'));
    CHECK(longText.size() == 202 && longText[0] == 128, true);

    Everything all;
    all.i8 = -3;
    all.i128 = -5;
    all.s16 = vesk::string16(2, vesk::char16(0xe9));
    all.bools = {true, false};
    all.texts[1] = "t";
    all.dynamic = {1, 2, 3};
    all.maps[2]["k"] = 2.5;
    all.names.Insert("n");
    all.assigned = vesk::xvector<int32>{7};
    all.any = vesk::string8("any");
    all.size.width = 2;
    all.grid[1][2].height = 6;
    Size shared(4);
    all.reference = &shared;
    Everything read = Copied(all);
    CHECK(read.reference->width, 4);
    delete read.reference.Get();
    read.reference = &shared;
    CHECK(read == all && !(read < all) && !(all < read), true);
    CHECK(vxMakeString(read.i128 << read.s16 << read.any.as<vesk::string8>()), "-5\xc3\xa9\xc3\xa9" "any");
    read.i8 = 0;
    CHECK(all < read && read != all, true);
}

ROW(Schemas) {
    // The project writes release 3. The archive of a Doc says which release its bytes are of.
    Doc1 old;
    old.title = "T";
    old.pages = 2;
    old.count = 9;
    Bytes bytes = Written(old);
    CHECK(bytes[0], 3);
    bytes[0] = 1;
    Doc doc;
    vesk::InputArchive input(bytes);
    input >> doc;
    CHECK(vxMakeString(doc.title << doc.count << doc.lines << doc.total << input.Remaining()), "T9[0,0]90");
    bytes[0] = 4;
    CHECK(Throws([&] { Read(bytes, doc); }), true);

    // Objects that refer to each other.
    Doc next;
    next.title = "N";
    next.next = &doc;
    doc.next = &next;
    doc.list.push_back(vesk::pref<IDoc>(&doc));
    Bytes whole = vesk::WriteObject(vesk::ptr<IDoc>(&next));
    const vesk::ptr<IDoc> copy = vesk::ReadObject<IDoc>(whole);
    Doc& read = *static_cast<Doc*>(copy.Object());
    Doc& second = *static_cast<Doc*>(read.next.Get().Object());
    CHECK(vxMakeString(read.title << second.title), "NT");
    CHECK(second.next.Get() == copy && second.list.read()[0].Object() == &second, true);
    second.DestroyObject();
    read.DestroyObject();

    // Behind a mark and the version of the form; what was written without them is read as well.
    CHECK(Bytes(whole.begin(), whole.begin() + 4), "[255,118,120,2]");
    Doc alone;
    const vesk::ptr<IDoc> unmarked = vesk::ReadObject<IDoc>(Written(vesk::pref<IDoc>(&alone)));
    CHECK(bool(unmarked), true);
    unmarked->DestroyObject();
    whole[3] = 3;
    CHECK(Throws([&] { vesk::ReadObject<IDoc>(whole); }), true);
}

ROW(Changes) {
    vesk::xvector<vesk::xstring> changes;
    vesk::ModelHook hook([&changes](vesk::ModelChange const& change) {
        changes.push_back(vxMakeString(int(change.m_kind) << change.PathText()));
    });
    auto taken = [&changes] { return std::exchange(changes, {}); };
    Doc doc;
    doc.title = "T";
    doc.lines.push_back(4);
    doc.lines.push_front(5);
    doc.lines.pop_back();
    CHECK(vxMakeString(doc.lines.read() << taken()), "[5][1title,3lines,3lines,4lines]");
    doc.marks[2] = 7;
    doc.wide[299] = 1;
    doc.grid[1][0] = 3;
    doc.notes[300].push_back('n');
    doc.bytes[int8(-2)] = 5;
    CHECK(taken(), "[1marks[2],1wide[299],1grid[1][0],3notes[300],1bytes[-2]]");
    doc.sizes["k"].width = 8;
    doc.sizes["k"].height += 2;
    CHECK(vxMakeString(doc.sizes.read() << taken()), "[(k,Size(8,2,Red,Low))][1sizes[k].width,2sizes[k].height]");
    CHECK(doc.tags.Insert(9) && !doc.tags.Insert(9) && doc.tags.Delete(9), true);
    CHECK(taken(), "[3tags[9],3tags[9],4tags[9]]");
    doc.size.colour = shapes::Green;
    doc.total += 5;
    doc.total -= 2;
    CHECK(vxMakeString(doc.total.read() << taken()), "3[1size.colour,2total,2total]");
    doc.next = vesk::pref<IDoc>(&doc);
    CHECK(doc.docs.Insert(doc.next) && doc.fixedDocs.Insert(doc.next) && doc.fixedDocs.read().Contains(doc.next), true);
    CHECK(vxMakeString(Doc::GetfixedDocsElementPath(doc.next).Size() << taken().size()), "93");
    CHECK(doc.marks[2] == 7 && doc.grid[1][0] == 3, true);
    CHECK(doc.size.path() == Doc::GetsizePath() && doc.size.path().Holds(doc.size.colour.path()), true);

    NoOps plain;
    plain.a = 1;
    plain.fixed[2] = 3;
    plain.text.push_back('x');
    plain.map[1] = 2;
    plain.set.Insert(3);
    plain.size.width = 4;
    plain.a.write() = 5;
    CHECK(taken(),
          "[0NoOps::_model_.a,0NoOps::_model_.fixed[_k0],0NoOps::_model_.text,0NoOps::_model_.map[_k0],"
          "0NoOps::_model_.set,0NoOps::_model_.size.width,0NoOps::_model_.a]");
    CHECK(plain.model().a, 5);

    CHECK(Plain() == Plain(), true);
    Sized sized;
    sized.width = 3;
    sized.height += 4;
    CHECK(vxMakeString(sized.Area() << taken()), "12[1width,2height]");
    Multi multi;
    multi.a = 1;
    Direct direct;
    direct.b = "b";
    CHECK(vxMakeString(multi << direct.Getb()), "Multi\n{\n    a = 1\n    b = 0\n}\nb");
    RawAndModel both;
    both.x = 1;
    both.q = 2;
    CHECK(vxMakeString(both.x << both.q), "12");
}

namespace {

// A Doc of the first release: its number, title, pages, count.
const Bytes g_oldDoc = {1, 1, 'T', 2, 0, 0, 0, 9, 0, 0, 0};

// A Size of the first release (width, height), and a current one.
const Bytes g_oldSize = {20, 0, 0, 0, 7, 0, 0, 0};
const Bytes g_newSize = {20, 0, 0, 0, 7, 0, 0, 0, 0, 1};

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
        vesk::InputArchive another(Written(Doc()));
        Doc doc;
        another >> doc;
        ar >> second;
    }
    Size first, second;
};

// Its model is of one release and has scalars only.
void ReadOldScalars() {
    vesk::InputArchive input(Bytes{1, 5, 0, 0, 0, 6, 0, 0, 0});
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

    vesk::InputArchive outer(Joined(g_oldDoc, g_oldSize, g_oldSize));
    ReadsAnother both;
    outer >> doc >> both;
    CHECK(vxMakeString(both.first << both.second << outer.Remaining()), "Size(20,7,Green,High)Size(20,7,Green,High)0");

    Calc calc;
    Wire wire;
    vesk::InputArchive again(g_oldDoc);
    doc.Deserialise(again);
    Size size(100);
    Far<ICalc>(wire, calc)->Take(&size);
    wire.server.Serve();
    CHECK(calc.notified, 100);
}
