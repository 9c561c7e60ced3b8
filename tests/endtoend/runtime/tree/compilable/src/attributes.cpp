@import "compilable/attributes.h"
@import "compilable/src/row.h"

$warning(disable: 1009)

namespace attributes
{

ROW
{
    Thing object;
    vesk::ptr<IThing> thing(&object);
    thing->name = "a";
    CHECK(vesk::string8(thing->name), "a");
    CHECK(vesk::string8(thing->title), "title of a");
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
    CHECK(thing->readOnly + 0, 6);
    thing->colour = green;
    CHECK(thing->colour == green, true);
    thing->Setsizewidth(8);
    CHECK(thing->plain + 0, 8);
}

}
