@import "compilable/classes.h"
@import "rows/rows.h"

$warning(disable: 1009)

namespace nested_kinds {

static vesk::int32 __stdcall Sum(void*, vesk::int32 a, vesk::string8 const& b) { return a + vesk::int32(b.size()); }

ROW(nested_kinds) {
    Outer::Value value(vesk::int32(5)), read;
    CHECK(read.as<vesk::int32>(), 2);
    Copy(value, read);
    CHECK(read.as<vesk::int32>(), 5);
    CHECK(value == read, true);
    value = Outer::Value::boxed("text", vesk::xvector<vesk::int32>{1, 2});
    CHECK(read < value, true);
    Copy(value, read);
    CHECK(read.as<Outer::Value::boxed>().b[1], 2);
    CHECK(vxMakeString(read), vxMakeString(value));
    CHECK(vxMakeString(Outer::Value(vesk::string8("s"))), "s");
    value = Outer::Value::far("away");
    read = value;
    CHECK(read.as<Outer::Value::far>(), "away");
    Outer::Shown shown, back;
    shown = vesk::xvector<vesk::int32>{1, 2};
    Copy(shown, back);
    CHECK(back == shown, true);
    Outer outer;
    CHECK(outer.state.is<Outer::State::off>(), true);
    Outer::Callback callback(nullptr, &Sum);
    CHECK(callback(2, "abc"), 5);
    CHECK(callback == Outer::Callback(), false);
    CHECK(vxMakeString(Outer::Action()).substr(0, 7), "Action(");
    Holder holder;
    holder.deep.choice = vesk::int32(1);
    CHECK(holder.deep.choice.is<vesk::int32>(), true);
    CHECK(vxMakeString(holder.deep.choice), "1");
    CHECK(bool(holder.deep.pick), false);
    Box<vesk::int32> box;
    box.held = Box<vesk::int32>::Held::text("in a template");
    CHECK(vxMakeString(box.held), "text(in a template)");
    CHECK(vxMakeString(Box<char>::Changed()).substr(0, 8), "Changed(");
}

}

namespace nested_models {

static void CheckValues() {
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
static void CheckOld() {
    const vesk::xvector<vesk::octet_t> bytes = {1, 5, 0, 0, 0};
    vesk::InputArchive input(bytes);
    Outer::Old old;
    input >> old;
    CHECK(old.a, 5);
    CHECK(old.b, 7);
    CHECK(Copied(old) == old, true);
}

// Its record is there, though nothing registers it.
static void CheckPersistable() {
    Outer::Persistable object;
    object.kept = 6;
    CHECK(vxMakeString(object), "Persistable(6)");
    CHECK(Copied(object).kept, 6);
    vesk::ptr<vesk::IPersistable> pointer(&object);
    CHECK(pointer->GetReflectedClass()->m_numModelFields, 1);
    CHECK(static_cast<bool>(pointer->GetReflectedClass()->m_create()), true);
}

ROW(nested_models) {
    CheckValues();
    CheckOld();
    CheckPersistable();
}

}

namespace mixin_visits {

struct Counter : vesk::IObjectVisitor {
    void VisitObject(vesk::ptr<vesk::IObject> const& object) override { count += object ? 1 : 0; }
    int count = 0;
};

ROW(mixin_visits) {
    Holds holds;
    holds.a = 3;
    CHECK(holds.a, 3);
    vesk::ReflectedClass const& record = vesk::GetReflectedClass<Holds>();
    CHECK(record.m_numModelFields, 5);
    CHECK(*reinterpret_cast<vesk::int32 const*>(reinterpret_cast<char const*>(&holds) + record.m_modelFields[0].m_offset), 3);
    Uses uses;
    uses.m_seen = vesk::ptr<vesk::IObject>(&holds);
    Counter counter;
    vesk::ptr<vesk::IObject>(&uses)->VisitObjects(counter);
    CHECK(counter.count, 1);
    Lists lists;
    lists.small = 2;
    CHECK(lists.small, 2);
}

}

namespace templates {

ROW(templates) {
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

namespace template_methods {

ROW(template_methods) {
    Uses uses;
    uses.Reset();
    CHECK(uses.Count(2), 2);
    uses.shown = 4;
    CHECK(uses.Twice(), 8);
    CHECK(uses.Size(1), 4);
    Cell<vesk::int32> cell;
    cell.Set(5);
    CHECK(cell.Get(2), 10);
    Registered<vesk::int32> registered;
    registered.n = 6;
    CHECK(registered.Get(), 6);
}

}

namespace template_mixin_fields {

ROW(template_mixin_fields) {
    Holds<int> holds;
    holds.a = 3;
    CHECK(holds.a, 3);
    Reflects<int> reflects;
    reflects.a = 4;
    reflects.value = 5;
    CHECK(reflects.a + reflects.value, 9);
}

}
