@import "rows/rows.h"
@import "kinds/models.h"
@import "kinds/kinds.h"

using namespace kinds;

template <typename T>
vesk::xvector<vesk::octet_t> Written(T const& value) {
    vesk::Archive ar;
    ar << value;
    return ar.m_bytes;
}

ROW(Archives) {
    for (vesk::uint32 v : {0u, 127u, 128u, 16383u, 16384u, 2097151u, 2097152u, 268435455u, 268435456u, 4294967295u}) {
        vesk::Archive ar;
        vesk::SerialiseVariableLengthUint(ar, v);
        vesk::InputArchive input(ar);
        vesk::uint32 read;
        vesk::DeserialiseVariableLengthUint(input, read);
        CHECK(read, v);
        CHECK(input.Remaining(), 0);
    }
    CHECK(Written(vesk::string8("ab")), "[2,97,98]");
    CHECK(Written(vesk::string8(200, 'x')).size(), 202);
    CHECK(Written(vesk::string8(200, 'x'))[0], 128);
    CHECK(Written(vesk::int16(258)), "[2,1]");
    CHECK(Written(shapes::Green), "[5]");
    CHECK(Written(vesk::xvector<vesk::int8>{1, 2}), "[2,1,2]");
    CHECK(Throws([] {
        vesk::InputArchive input(vesk::xvector<vesk::octet_t>{5, 97});
        vesk::string8 text;
        input >> text;
    }), true);

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
    Everything read;
    vesk::InputArchive input(Written(all));
    input >> read;
    CHECK(read.reference->width, 4);
    delete read.reference.Get();
    read.reference = &shared;
    CHECK(read == all, true);
    CHECK(read < all || all < read, false);
    CHECK(read.i128, -5);
    CHECK(read.s16, "\xc3\xa9\xc3\xa9");
    CHECK(read.any.as<vesk::string8>(), "any");
    read.i8 = 0;
    CHECK(all < read && read != all, true);
}

ROW(Schemas) {
    // The project writes release 3. The archive of a Doc says which release its bytes are of.
    Doc1 old;
    old.title = "T";
    old.pages = 2;
    old.count = 9;
    vesk::xvector<vesk::octet_t> bytes = Written(old);
    CHECK(bytes[0], 3);
    bytes[0] = 1;
    Doc doc;
    vesk::InputArchive input(bytes);
    input >> doc;
    CHECK(vxMakeString(doc.title << doc.count << doc.lines << doc.total), "T9[0,0]9");
    CHECK(input.Remaining(), 0);
    bytes[0] = 4;
    CHECK(Throws([&] { vesk::InputArchive later(bytes); later >> doc; }), true);

    // Objects that refer to each other.
    Doc next;
    next.title = "N";
    next.next = &doc;
    doc.next = &next;
    doc.list.push_back(vesk::pref<IDoc>(&doc));
    vesk::xvector<vesk::octet_t> whole = vesk::WriteObject(vesk::ptr<IDoc>(&next));
    const vesk::ptr<IDoc> copy = vesk::ReadObject<IDoc>(whole);
    Doc& read = *static_cast<Doc*>(copy.Object());
    Doc& second = *static_cast<Doc*>(read.next.Get().Object());
    CHECK(vxMakeString(read.title << second.title), "NT");
    CHECK(second.next.Get() == copy, true);
    CHECK(second.list.read()[0] == second.next.read(), false);
    CHECK(second.list.read()[0].Object() == &second, true);
    second.DestroyObject();
    read.DestroyObject();

    // Behind a mark and the version of the form; what was written without them is read as well.
    CHECK(vesk::xvector<vesk::octet_t>(whole.begin(), whole.begin() + 4), "[255,118,120,2]");
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
    CHECK(doc.lines.read(), "[5]");
    CHECK(taken(), "[1title,3lines,3lines,4lines]");
    doc.marks[2] = 7;
    doc.wide[299] = 1;
    doc.grid[1][0] = 3;
    doc.notes[300].push_back('n');
    doc.bytes[int8(-2)] = 5;
    CHECK(taken(), "[1marks[2],1wide[299],1grid[1][0],3notes[300],1bytes[-2]]");
    doc.sizes["k"].width = 8;
    doc.sizes["k"].height += 2;
    CHECK(doc.sizes.read(), "[(k,Size(8,2,Red,Low))]");
    CHECK(taken(), "[1sizes[k].width,2sizes[k].height]");
    CHECK(doc.tags.Insert(9) && !doc.tags.Insert(9), true);
    CHECK(doc.tags.Delete(9), true);
    CHECK(taken(), "[3tags[9],3tags[9],4tags[9]]");
    doc.size.colour = shapes::Green;
    doc.total += 5;
    doc.total -= 2;
    CHECK(doc.total.read(), 3);
    CHECK(taken(), "[1size.colour,2total,2total]");
    doc.next = vesk::pref<IDoc>(&doc);
    CHECK(doc.docs.Insert(doc.next), true);
    CHECK(doc.fixedDocs.Insert(doc.next) && doc.fixedDocs.read().Contains(doc.next), true);
    CHECK(Doc::GetfixedDocsElementPath(doc.next).Size(), 9);
    CHECK(taken().size(), 3);
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
    CHECK(sized.Area(), 12);
    CHECK(taken(), "[1width,2height]");
    Multi multi;
    multi.a = 1;
    CHECK(multi, "Multi\n{\n    a = 1\n    b = 0\n}\n");
    Direct direct;
    direct.a = 2;
    direct.b = "b";
    CHECK(direct.Getb(), "b");
    RawAndModel both;
    both.x = 1;
    both.q = 2;
    CHECK(vxMakeString(both.x << both.q), "12");
}
