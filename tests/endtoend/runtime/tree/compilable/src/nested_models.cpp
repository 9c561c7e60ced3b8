@import "compilable/nested_models.h"
@import "compilable/src/row.h"

$warning(disable: 1009)

namespace nested_models
{

template <typename T>
static T Copied(T const& from)
{
    T to;
    Copy(from, to);
    return to;
}

static void CheckValues()
{
    Outer::Size size;
    size.width = 3;
    size.model().name = "a";
    CHECK(Copied(size).width, 3);
    CHECK(Copied(size) == size, true);
    CHECK(vxMakeString(size), "Size(3,a)");
    Outer::Part part;
    part.items.push_back(4);
    CHECK(Copied(part).items.model()[0], 4);
    Outer::Deep::Inner inner;
    inner.a = 5;
    CHECK(Copied(inner).a, 5);
    CHECK(vxMakeString(inner), "Inner(5)");
    Outer::Body body;
    body.inBody = 6;
    body.text = "b";
    CHECK(Copied(body).inBody, 6);
    CHECK(Copied(body).text, "b");
    Outer::Referring referring;
    referring.shared = 8;
    CHECK(Copied(referring).shared, 8);
    CHECK(vxMakeString(referring), "Base(8)");
    Outer::Listing listing;
    listing.listed = 1;
    listing.Setcounter(2);
    CHECK(listing.Twice() + listing.listed, 5);
    CHECK(Twice(&listing), 4);
    CHECK(Copied(listing.model()).listed, 1);
    Outer::Several several;
    several.a = 9;
    several.inner.a = 1;
    CHECK(Copied(several).a, 9);
    Outer::Printed printed;
    printed.x = 2;
    CHECK(vxMakeString(Copied(printed)), "x=2");
    Outer::Generic<vesk::string8> generic;
    generic.count = 3;
    CHECK(vxMakeString(Copied(generic)), "Generic(3)");
    InTemplate<int>::Inner inTemplate;
    inTemplate.a = 4;
    CHECK(vxMakeString(Copied(inTemplate)), "Inner(4)");
}

// It was archived by the first release of the project.
static void CheckOld()
{
    const vesk::xvector<vesk::octet_t> bytes = {1, 5, 0, 0, 0};
    vesk::InputArchive input(bytes);
    Outer::Old old;
    input >> old;
    CHECK(old.a, 5);
    CHECK(old.b, 7);
    CHECK(Copied(old) == old, true);
}

// Its record is there, though nothing registers it.
static void CheckPersistable()
{
    Outer::Persistable object;
    object.kept = 6;
    CHECK(vxMakeString(object), "Persistable(6)");
    CHECK(Copied(object).kept, 6);
    vesk::ptr<vesk::IPersistable> pointer(&object);
    CHECK(pointer->GetReflectedClass()->m_numModelFields, 1);
    CHECK(static_cast<bool>(pointer->GetReflectedClass()->m_create()), true);
}

ROW
{
    CheckValues();
    CheckOld();
    CheckPersistable();
}

}
