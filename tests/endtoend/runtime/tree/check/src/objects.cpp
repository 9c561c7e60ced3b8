// Objects in archives and on the heap: long chains, what a refused archive leaves, archives of before, what $new made.
@import "rows/rows.h"
@import "check/src/nodes.h"

$function Kept* MakeKept() { return $new Kept(); }

namespace {

Bytes ChainBytes(int length) {
    vesk::xvector<Linked> chain(length);
    for (int i = 0; i < length; ++i) {
        chain[i].number = i;
        if (i + 1 < length) chain[i].next = &chain[i + 1];
    }
    return vesk::WriteObject(vesk::ptr<kinds::IDoc>(&chain[0]));
}

void Append(Bytes& bytes, std::string const& text) {
    bytes.insert(bytes.end(), text.begin(), text.end());
}

// As archives were written that have one object within the other.
Bytes NestedBytes(int length) {
    Bytes bytes;
    for (int i = 1; i <= length; ++i) {
        vesk::octet_t number[5];
        bytes.insert(bytes.end(), number, vesk::SerialiseVariableLengthInteger(number, i));
        Append(bytes, std::string("\x06Linked\x01"));
    }
    bytes.push_back(0);
    for (int i = 0; i < length; ++i) Append(bytes, std::string(5, '\0'));
    return bytes;
}

}

ROW(LinkedObjects) {
    const int length = 100000;
    Bytes bytes = ChainBytes(length);
    CHECK(Linked::s_count, 0);
    vesk::ptr<kinds::IDoc> at = vesk::ReadObject<kinds::IDoc>(bytes);
    CHECK(Linked::s_count, length);
    for (int i = 0; at; ++i) {
        Linked* object = static_cast<Linked*>(at.Object());
        if (object->number != i) CHECK(object->number.read(), i);
        at = object->next.read();
        object->DestroyObject();
    }
    CHECK(Linked::s_count, 0);

    // Whatever is missing, nothing is left behind; not even where objects destroy what they refer to.
    bytes = ChainBytes(20);
    Linked::ownsNext = true;
    for (std::size_t size = 0; size < bytes.size(); ++size) {
        const Bytes part(bytes.begin(), bytes.begin() + size);
        if (!Throws([&] { vesk::ReadObject<kinds::IDoc>(part); })) CHECK(size, "refused");
    }
    CHECK(Linked::s_count, 0);
    Linked::ownsNext = false;

    vesk::ptr<kinds::IDoc> nested = vesk::ReadObject<kinds::IDoc>(NestedBytes(2));
    CHECK(Linked::s_count, 2);
    static_cast<Linked*>(nested.Object())->next.read()->DestroyObject();
    nested->DestroyObject();
    CHECK(Throws([] { vesk::ReadObject<kinds::IDoc>(NestedBytes(1000000)); }), true);
    CHECK(Linked::s_count, 0);
}

// A later program wrote of a class that is not here, and of one that has lost what it refers to.
ROW(LaterPrograms) {
    Linked both[2];
    kinds::Size size;
    both[0].next = &both[1];
    both[1].size = &size;
    size.width = 77;
    size.colour = shapes::Green;
    const Bytes bytes = vesk::WriteObject(vesk::ptr<kinds::IDoc>(&both[0]));
    auto error = [&bytes](std::string const& what, vesk::octet_t instead) {
        Bytes later = bytes;
        const auto at = std::search(later.begin(), later.end(), what.begin(), what.end());
        at[ssize_t(what.size()) - 1] = instead;
        return ErrorOf<vesk::ArchiveError>([&] { vesk::ReadObject<kinds::IDoc>(later); });
    };
    CHECK(error("Linked", 'x'), "class is not registered: Linkex");
    CHECK(error(std::string("M\0\0\0\0\0\0\0\x05", 9), 4), "number without a label in an enumeration");
    CHECK(Linked::s_count, 2);
}

ROW(ReadClasses) {
    Unlike unlike;
    Linked linked;
    const Bytes bytes = vesk::WriteObject(vesk::ptr<kinds::IDoc>(&unlike));
    Unlike::s_wasMade = false;
    CHECK(Throws([&] { vesk::ReadObject<shapes::INamed>(bytes); }), true);
    CHECK(Throws([&] { vesk::ReadObject<kinds::IDoc>(bytes, {}, [](vesk::ReflectedClass const& record) {
        return vesk::xstring(record.m_name) == "Linked";
    }); }), true);
    vesk::InputArchive input(bytes);
    vesk::cref<Linked> reference;
    CHECK(Throws([&] { input >> reference; }) && !Unlike::s_wasMade, true);
    const vesk::ptr<kinds::IDoc> read = vesk::ReadObject<kinds::IDoc>(bytes, {}, [](auto const&) { return true; });
    CHECK(Unlike::s_wasMade, true);
    read->DestroyObject();

    // A struct and what it begins with have one address and are two objects.
    struct Outer : kinds::Size {
        void Serialise(vesk::Archive& ar) const { kinds::Size::Serialise(ar); }
        void Deserialise(vesk::InputArchive& ar) { kinds::Size::Deserialise(ar); }
    } outer;
    const Bytes three = Written(vesk::cref<Outer>(&outer), vesk::cref<kinds::Size>(&outer), vesk::cref<kinds::Size>(&outer));
    vesk::InputArchive back(three);
    vesk::cref<Outer> a;
    vesk::cref<kinds::Size> b, c;
    back >> a >> b >> c;
    CHECK(b == c && a.Object() != b.Object(), true);
    delete a.Get();
    delete b.Get();
    vesk::InputArchive other(three);
    other >> a >> b;
    CHECK(Throws([&] {
        vesk::cref<Outer> third;
        other >> third;
    }), true);
    delete a.Get();
    delete b.Get();
}

ROW(Heap) {
    vesk::ObjectHeap& heap = vesk::ObjectHeap::Get();
    heap.Collect({});
    CHECK(heap.Count(), 0);
    Kept* kept = MakeKept();
    kept->other = MakeKept();
    MakeKept();
    CHECK(vxMakeString(heap.Count() << heap.Collect({vesk::ptr<vesk::IObject>(kept)}) << Kept::s_count), "312");
    kept->DestroyObject();
    CHECK(heap.Count(), 1);
    heap.Collect({});
    // One destroys the other while both are collected.
    Kept* first = MakeKept();
    first->owned = MakeKept();
    CHECK(vxMakeString(heap.Collect({}) << heap.Count() << Kept::s_count), "100");
}
