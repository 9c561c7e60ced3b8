@import "compilable/values.h"
@import "rows/rows.h"

$warning(disable: 1009)

namespace array_typedef {

ROW(array_typedef) {
    Holds holds, read;
    holds.triple[1] = 4;
    holds.grid[1][2] = 5;
    holds.any.model().resize(2);
    holds.any[1] = 6;
    Copy(holds, read);
    CHECK(read.triple[1], 4);
    CHECK(read.grid[1][2], 5);
    CHECK(read.any[1], 6);
    CHECK(holds == read, true);
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
    CHECK(fixed.Geta() + fixed.Getb() + fixed.Getc() + fixed.Getd(), 22);
    CHECK(fixed.Gettext(), "text");
    fixed.Setc(1);
    CHECK(fixed.c, 1);
    const vesk::int32 pointed = 3;
    Plain plain;
    plain.Setpointer(&pointed);
    CHECK(*plain.Getpointer(), 3);
    Lists lists;
    CHECK(lists.Getm(), 7);
    CHECK(Holds<int>().Getm() + Holds<int>().Getown(), 7);

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
    CHECK(items.as<Colour>() == green, true);
    CHECK(read.as<vesk::int32>(), 7);
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
    CHECK(copy.as<Items::both>().a, longText);
    CHECK(copy.as<Items::both>().b.size(), 2u);
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
    CHECK(read.is<Command::boxed>(), true);
    CHECK(read == command, true);
    CHECK(read < command || command < read, false);
    CHECK(vxMakeString(Command(Command::stop())), "stop()");
}

}

namespace exceptions {

static vesk::int32 __stdcall Twice(void*, vesk::int32 a) { return 2 * a; }

ROW(exceptions) {
    // Whatever fails, the old value stays.
    const vesk::string8 before(100, 'b');
    for (Held const& other : {Held(Held::inPlace(100)), Held(Held::onHeap(100))}) {
        Held held = before;
        vesk::Archive ar;
        ar << other;
        vesk::InputArchive reads(ar), makes(ar);
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
    vesk::InputArchive first(vesk::xvector<vesk::octet_t>{1, 5, 0, 0, 0});
    Keeper keeper;
    first >> keeper;
    CHECK(vxMakeString(keeper.first << keeper.third), "50");
}

}

namespace polymorphic {

ROW(polymorphic) {
    CHECK(Area(Shape(vesk::float64(6.5))), 6);
    CHECK(Area(Shape(Shape::side(3))), 9);
    CHECK(Area(Shape(Shape::name("four"))), 4);
    CHECK(Area(Shape(Shape::point(2, 4))), 8);
    CHECK(Area(Shape(Shape::boxed(6))), 7);
    vesk::string8 met;
    Meet(Left(Left::a(1)), Left(Left::b("x")), met);
    CHECK(met, "ab");
}

}
