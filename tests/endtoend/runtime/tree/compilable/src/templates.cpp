@import "compilable/templates.h"
@import "compilable/src/row.h"

$warning(disable: 1009)

namespace templates
{

template <typename T>
static T Copied(T const& from)
{
    T to;
    Copy(from, to);
    return to;
}

ROW
{
    Box<vesk::int32> box;
    box.model().name = "7";
    box.count = 2;
    CHECK(Copied(box) == box, true);
    CHECK(vxMakeString(Copied(box)), "Box(2,7)");
    CHECK(Copied(box.model()) == box.model(), true);
    Archived<vesk::string8> text;
    text.model().item = "x";
    CHECK(vxMakeString(Copied(text)), "item x");
    Referring<int> referring;
    referring.shared = 3;
    CHECK(vxMakeString(Copied(referring)), "Base(3)");
    Printed<vesk::int32, vesk::string8> printed;
    printed.model().map[1] = "one";
    CHECK(Copied(printed) == printed, true);
    CHECK(vxMakeString(printed).empty(), false);
    Body<int> body;
    body.a = 4;
    body.text = "b";
    CHECK(Copied(body).a, 4);
    CHECK(Copied(body).text, "b");
    Derived<vesk::int32> derived;
    derived.a = 5;
    CHECK(Copied(derived).a, 5);
    Lists<int> lists;
    lists.added = 6;
    CHECK(Copied(lists).added, 6);
    Concrete concrete;
    concrete.added = 7;
    CHECK(Copied(concrete).added + concrete.plain, 7);

    // A class writes the release of its project ahead of its model.
    vesk::Archive ar;
    ar << box;
    CHECK(ar.m_bytes.size(), 1 + 4 + 2);

    const vesk::xvector<vesk::octet_t> firstRelease = {1, 5, 0, 0, 0};
    vesk::InputArchive input(firstRelease);
    Old<int> old;
    input >> old;
    CHECK(old.a, 5);
    CHECK(old.b, 6);

    Kept<vesk::int32> kept;
    kept.item = 4;
    CHECK(Copied(kept).item, 4);
    vesk::ReflectedClass const& record = *vesk::ptr<vesk::IPersistable>(&kept)->GetReflectedClass();
    CHECK(record.m_numModelFields, 1);
    vesk::ptr<vesk::IObject> made = record.m_create();
    CHECK(made->GetReflectedClass() == &record, true);
    made->DestroyObject();
}

}
