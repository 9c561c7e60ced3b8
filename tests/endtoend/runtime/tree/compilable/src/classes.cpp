@import "compilable/classes.h"
@import "rows/rows.h"

$warning(disable: 1009)

namespace nested_kinds {

static vesk::int32 __stdcall Sum(void*, vesk::int32 a, vesk::string8 const& b) { return a + vesk::int32(b.size()); }

ROW(nested_kinds) {
    Outer::Value value(vesk::int32(5)), read;
    CHECK(read.as<vesk::int32>(), 2);
    CHECK(Copied(value) == value, true);
    value = Outer::Value::boxed("text", vesk::xvector<vesk::int32>{1, 2});
    CHECK(read < value, true);
    Copy(value, read);
    CHECK(read.as<Outer::Value::boxed>().b[1], 2);
    CHECK(vxMakeString(read), vxMakeString(value));
    value = Outer::Value::far("away");
    read = value;
    CHECK(read.as<Outer::Value::far>(), "away");
    CHECK(Through<Outer::Shown>([](auto& v) { v = vesk::xvector<vesk::int32>{1, 2}; }), "[1,2]");
    CHECK(Outer().state.is<Outer::State::off>(), true);
    Outer::Callback callback(nullptr, &Sum);
    CHECK(callback(2, "abc"), 5);
    CHECK(callback == Outer::Callback(), false);
    CHECK(vxMakeString(Outer::Action()).substr(0, 7), "Action(");
    Holder holder;
    holder.deep.choice = vesk::int32(1);
    CHECK(vxMakeString(holder.deep.choice << bool(holder.deep.pick)), "1false");
    Box<vesk::int32> box;
    box.held = Box<vesk::int32>::Held::text("in a template");
    CHECK(box.held, "text(in a template)");
    CHECK(vxMakeString(Box<char>::Changed()).substr(0, 8), "Changed(");
}

}

namespace nested_models {

ROW(nested_models) {
    const Outer::Size size = Through<Outer::Size>([](auto& s) { s.width = 3; s.model().name = "a"; });
    CHECK(size, "Size(3,a)");
    CHECK(Copied(size) == size, true);
    CHECK(Through<Outer::Part>([](auto& p) { p.items.push_back(4); }).items.model()[0], 4);
    CHECK(Through<Outer::Deep::Inner>([](auto& i) { i.a = 5; }), "Inner(5)");
    const Outer::Body body = Through<Outer::Body>([](auto& b) { b.inBody = 6; b.text = "b"; });
    CHECK(vxMakeString(body.inBody << body.text), "6b");
    CHECK(Through<Outer::Referring>([](auto& r) { r.shared = 8; }), "Base(8)");
    Outer::Listing listing;
    listing.listed = 1;
    listing.Setcounter(2);
    CHECK(vxMakeString(listing.Twice() << Twice(&listing) << Copied(listing.model()).listed), "441");
    CHECK(Through<Outer::Several>([](auto& s) { s.a = 9; s.inner.a = 1; }).a, 9);
    CHECK(Through<Outer::Printed>([](auto& p) { p.x = 2; }), "x=2");
    CHECK(Through<Outer::Generic<vesk::string8>>([](auto& g) { g.count = 3; }), "Generic(3)");
    CHECK(Through<InTemplate<int>::Inner>([](auto& i) { i.a = 4; }), "Inner(4)");

    // One that was archived by the first release of the project.
    vesk::InputArchive input(vesk::xvector<vesk::octet_t>{1, 5, 0, 0, 0});
    Outer::Old old;
    input >> old;
    CHECK(vxMakeString(old.a << old.b << (Copied(old) == old)), "57true");

    // Its record is there, though nothing registers it.
    Outer::Persistable object;
    object.kept = 6;
    CHECK(Copied(object), "Persistable(6)");
    vesk::ReflectedClass const& record = *vesk::ptr<vesk::IPersistable>(&object)->GetReflectedClass();
    CHECK(record.m_numModelFields == 1 && record.m_create(), true);
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
    const Box<vesk::int32> box = Through<Box<vesk::int32>>([](auto& b) { b.model().name = "7"; b.count = 2; });
    CHECK(box, "Box(2,7)");
    CHECK(Copied(box) == box && Copied(box.model()) == box.model(), true);
    CHECK(Through<Archived<vesk::string8>>([](auto& a) { a.model().item = "x"; }), "item x");
    CHECK(Through<Referring<int>>([](auto& r) { r.shared = 3; }), "Base(3)");
    Printed<vesk::int32, vesk::string8> printed;
    printed.model().map[1] = "one";
    CHECK(Copied(printed) == printed && !vxMakeString(printed).empty(), true);
    const Body<int> body = Through<Body<int>>([](auto& b) { b.a = 4; b.text = "b"; });
    CHECK(vxMakeString(body.a << body.text), "4b");
    CHECK(Through<Derived<vesk::int32>>([](auto& d) { d.a = 5; }).a, 5);
    CHECK(Through<Lists<int>>([](auto& l) { l.added = 6; }).added, 6);
    const Concrete concrete = Through<Concrete>([](auto& c) { c.added = 7; });
    CHECK(concrete.added + concrete.plain, 7);

    // A class writes the release of its project ahead of its model.
    vesk::Archive ar;
    ar << box;
    CHECK(ar.m_bytes.size(), 1 + 4 + 2);

    vesk::InputArchive input(vesk::xvector<vesk::octet_t>{1, 5, 0, 0, 0});
    Old<int> old;
    input >> old;
    CHECK(vxMakeString(old.a << old.b), "56");

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
