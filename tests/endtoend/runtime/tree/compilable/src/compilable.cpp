@import "compilable/compilable.h"
@import "rows/rows.h"

$warning(disable: 1009)

vxDefineTarget(compilable, 4)
void Register_Project_compilable();

namespace nested_kinds {

static vesk::int32 __stdcall Sum(void*, vesk::int32 a, vesk::string8 const& b) { return a + vesk::int32(b.size()); }

ROW(nested_kinds) {
    Outer::Value value(vesk::int32(5)), read;
    CHECK(read.as<vesk::int32>() == 2 && Copied(value) == value, true);
    value = Outer::Value::boxed("text", vesk::xvector<vesk::int32>{1, 2});
    CHECK(read < value, true);
    Copy(value, read);
    CHECK(read, value);
    value = Outer::Value::far("away");
    read = value;
    CHECK(read.as<Outer::Value::far>(), "away");
    CHECK(Through<Outer::Shown>([](auto& v) { v = vesk::xvector<vesk::int32>{1, 2}; }), "[1,2]");
    CHECK(Outer().state.is<Outer::State::off>(), true);
    Outer::Callback callback(nullptr, &Sum);
    CHECK(vxMakeString(callback(2, "abc") << (callback == Outer::Callback())), "5false");
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
    CHECK(vxMakeString(size << (Copied(size) == size)), "Size(3,a)true");
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
    const auto old = ReadAs<Outer::Old>({1, 5, 0, 0, 0});
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
    CHECK(Written(box).size(), 1 + 4 + 2);

    const auto old = ReadAs<Old<int>>({1, 5, 0, 0, 0});
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
    uses.shown = 4;
    CHECK(vxMakeString(uses.Count(2) << uses.Twice() << uses.Size(1)), "284");
    Cell<vesk::int32> cell;
    cell.Set(5);
    Registered<vesk::int32> registered;
    registered.n = 6;
    CHECK(vxMakeString(cell.Get(2) << ' ' << registered.Get()), "10 6");
}

}

namespace template_mixin_fields {

ROW(template_mixin_fields) {
    Holds<int> holds;
    Reflects<int> reflects;
    holds.a = 3;
    reflects.a = 4;
    reflects.value = 5;
    CHECK(vxMakeString(holds.a << reflects.a << reflects.value), "345");
}

}

namespace attributes {

ROW(attributes) {
    Thing object;
    vesk::ptr<IThing> thing(&object);
    thing->name = "a";
    CHECK(vxMakeString(vesk::string8(thing->name) << vesk::string8(thing->title)), "atitle of a");
    vesk::Array<vesk::int32, 3> fixed{};
    fixed[2] = 6;
    thing->fixed = fixed;
    fixed = thing->fixed;
    CHECK(fixed[2], 6);
    thing->map = vesk::xmap<vesk::int32, vesk::string8>();
    vesk::xset<vesk::int32> set = thing->set;
    set.Insert(3);
    thing->set = set;
    CHECK(object.Getset().size(), 1u);
    thing->whole = vesk::xvector<vesk::int32>{1, 2};
    CHECK(vesk::xvector<vesk::int32>(thing->whole)[1], 2);
    thing->moved = 5;
    thing->colour = green;
    CHECK(thing->readOnly == 6 && thing->colour == green, true);
    thing->Setsizewidth(8);
    CHECK(thing->plain + 0, 8);
}

}

namespace ipc {

ROW(ipc) {
    Counter counter;
    Wire wire;
    const Far<ICounter> far(wire, counter);
    far->Add(4);
    vesk::int32 n = 0;
    far->Get(3, n);
    vesk::string8 full = "a";
    far->Name("b", full);
    CHECK(vxMakeString(n << full), "12ab");
    CHECK(Throws([&] { far->Get(-1, n); }), true);
    for (Bytes const& message : {Bytes{1, 0, 0, 5, 0}, Bytes{1, 0, 0, 5, 0, 0, 0, 9}, Bytes{1, 7, 0}}) {
        wire.channel.Client().Send(message);
        wire.server.Serve();
    }
    CHECK(wire.errors, "[times,read beyond the end of an archive,bytes behind the arguments,no such remote method]");
    CHECK(counter.total, 9);
}

}

namespace metadata {

$var+ int32 g_count : [ "variable" ] = 3;

ROW(metadata) {
    Shows shows;
    shows.a = 2;
    CHECK(vxMakeString(shows.Add(3) << g_count), "53");
}

}

namespace short_bodies {

ROW(short_bodies) {
    Doubles doubles;
    doubles.b = 4;
    doubles.later(1);
    vesk::RunAsyncCalculations();
    CHECK(vxMakeString(doubles.a << ' ' << doubles.twice << ' ' << doubles.later(1)), "5 10 10");
}

}

namespace array_typedef {

ROW(array_typedef) {
    Holds holds, read;
    holds.triple[1] = 4;
    holds.grid[1][2] = 5;
    holds.any.model().resize(2);
    holds.any[1] = 6;
    Copy(holds, read);
    CHECK(vxMakeString(read.triple[1] << read.grid[1][2] << read.any[1] << (holds == read)), "456true");
    Triple triple;
    triple[2] = 3;
    holds.triple.model() = triple;
    CHECK(holds.triple[2], 3);
    Grid grid{};
    CHECK(sizeof(grid) / sizeof(grid[0]), 2u);
}

}

namespace const_fields {

ROW(const_fields) {
    Fixed fixed;
    fixed.Setc(1);
    CHECK(vxMakeString(fixed.Geta() << fixed.Getb() << fixed.c << fixed.Getd() << fixed.Gettext()), "4517text");
    const vesk::int32 pointed = 3;
    Plain plain;
    plain.Setpointer(&pointed);
    CHECK(*plain.Getpointer(), 3);
    CHECK(vxMakeString(Lists().Getm() << Holds<int>().Getm() << Holds<int>().Getown()), "770");

    // Objects that can't be assigned are made anew.
    Fixed other(2);
    vesk::GetReflectedClass<Fixed>().m_ops.m_assign(&fixed, 0, &other, 0, 1);
    CHECK(std::launder(&fixed)->Geta(), 2);
}

}

namespace whole_fields {

ROW(whole_fields) {
    // Operations have no write().
    Doc doc;
    doc.vector.push_back(4);
    doc.grid[1][1] = 9;
    doc.cells[1][0].a = 5;
    CHECK(vxMakeString(doc.vector.read()[0] << doc.grid[1][1] << doc.grid[1][1].model() << doc.cells[1][0].a.read()), "4995");
    CHECK(vesk::PathText(vesk::GetReflectedClass<Doc>(), doc.grid[1][0].path()), "grid[1][0]");

    Plain plain;
    plain.vector.write().push_back(1);
    plain.fixed.write()[2] = 8;
    plain.fixed[1].write() = 7;
    CHECK(vxMakeString(plain.vector.read()[0] << plain.fixed[2] << plain.fixed[1].read()), "187");
    plain.map.write()[1] = "one";
    plain.set.write().Insert(3);
    CHECK(plain.map.read().size() + plain.set.read().size(), 2u);
    plain.grid.write()[0][1] = 2;
    plain.grid[1].write()[0] = 3;
    plain.grid[1][1].write() = 4;
    CHECK(vxMakeString(plain.grid[0][1] << plain.grid[1][0].model() << plain.grid[1][1].read()), "234");
    plain.cells[1][1].a = 5;
    plain.cells[1][1].a.write() += 1;
    plain.part.write().a = 7;
    plain.sum += 2;
    plain.sum.write() += 7;
    CHECK(vxMakeString(plain.cells[1][1].a << plain.part.a << plain.sum + 0), "679");
    plain.names[1][0].push_back('x');
    plain.names[1][0].write() += "y";
    CHECK(plain.names[1][0].read(), "xy");
    plain.deep.write()[1][2] = "deep";
    plain.deep[1][2].write() += "er";
    CHECK(plain.deep[1][2].model(), "deeper");
}

}

namespace scalar_items {

ROW(scalar_items) {
    Items items(green), read;
    CHECK(items.as<Colour>() == green && read.as<vesk::int32>() == 7, true);
    read = items;
    CHECK(read.as<Colour>() == green, true);
    read = Items(two);
    CHECK(read.as<Plain>() == two, true);
    Shown shown(red), other;
    Copy(shown, other);
    CHECK(other.as<Colour>() == red, true);

    // Strings and containers in place are destroyed, whatever names them.
    const vesk::string8 longText(100, 'x');
    items = Items(longText);
    items = Items(Items::both(longText, vesk::xvector<vesk::int32>{1, 2}));
    Items copy(items);
    CHECK(copy.as<Items::both>().a == longText && copy.as<Items::both>().b.size() == 2, true);
    copy = Items(Items::text(std::string(longText.c_str())));
    CHECK(copy.as<Items::text>().size(), 100u);
    copy = Items(Items::alias(two));
    CHECK(copy.as<Items::alias>() == two, true);
}

}

namespace empty_items {

ROW(empty_items) {
    Command command{Command::boxed()}, read;
    CHECK(read.is<Command::stop>(), true);
    Copy(command, read);
    CHECK(read.is<Command::boxed>() && read == command && !(read < command || command < read), true);
    CHECK(Command(Command::stop()), "stop()");
}

}

namespace exceptions {

static vesk::int32 __stdcall Twice(void*, vesk::int32 a) { return 2 * a; }

ROW(exceptions) {
    // Whatever fails, the old value stays.
    const vesk::string8 before(100, 'b');
    for (Held const& other : {Held(Held::inPlace(100)), Held(Held::onHeap(100))}) {
        Held held = before;
        const Bytes bytes = Written(other);
        vesk::InputArchive reads(bytes), makes(bytes);
        CHECK(Throws([&] { reads >> held; }), true);
        Fragile::s_fails = true;
        CHECK(Throws([&] { held = other; }), true);
        CHECK(Throws([&] { makes >> held; }), true);
        Fragile::s_fails = false;
        CHECK(held.as<vesk::string8>(), before);
        held = other;
        CHECK(held == other, true);
        Held moved = std::move(held);
        CHECK(moved == other, true);
        held = moved;
        CHECK(held == other, true);
    }
    static_assert(std::is_nothrow_move_constructible<Held>::value, "a vector of them moves them");

    // A part of the old value.
    Tree tree = Tree::node({Tree(vesk::string8(100, 'a')), Tree(Tree::node({Tree(vesk::string8(100, 'c'))}))});
    tree = tree.as<Tree::node>().branches[1];
    tree = std::move(tree.as<Tree::node>().branches[0]);
    CHECK(tree.as<Tree::leaf>()[0], 'c');

    CHECK(Callback(nullptr, &Twice)(4), 8);
    CHECK(Throws([] { Callback()(4); }) && Throws([] { Action()(); }), true);
    CHECK(vesk::GetReflectedFunctor<Callback>().m_name, "exceptions::Callback");

    // Dropped fields that the archive is too old for.
    const auto keeper = ReadAs<Keeper>({1, 5, 0, 0, 0});
    CHECK(vxMakeString(keeper.first << keeper.third), "50");
}

}

namespace polymorphic {

ROW(polymorphic) {
    const vesk::xvector<Shape> shapes = {vesk::float64(6.5), Shape::side(3), Shape::name("four"), Shape::point(2, 4), Shape::boxed(6)};
    vesk::xvector<vesk::int32> areas;
    for (Shape const& shape : shapes) areas.push_back(Area(shape));
    CHECK(areas, "[6,9,4,8,7]");
    vesk::string8 met;
    Meet(Left(Left::a(1)), Left(Left::b("x")), met);
    CHECK(met, "ab");
}

}

int main() {
    Register_Project_compilable();
    return RunRows();
}
