@import "compilable/scalar_items.h"
@import "compilable/src/row.h"

$warning(disable: 1009)

namespace scalar_items
{

ROW
{
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
