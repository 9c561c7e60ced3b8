@import "compilable/exceptions.h"
@import "compilable/src/row.h"

$warning(disable: 1009)

namespace exceptions
{

static vesk::int32 __stdcall Twice(void*, vesk::int32 a) { return 2 * a; }

template <typename Action>
bool Throws(Action action)
{
    try { action(); }
    catch (std::exception const&) { return true; }
    return false;
}

ROW
{
    // Whatever fails, the old value stays.
    const vesk::string8 before(100, 'b');
    for (Held const& other : {Held(Held::inPlace(100)), Held(Held::onHeap(100))})
    {
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
