@import "compilable/scalar_items.h"
@import "compilable/src/row.h"

$warning(disable: 1009)

namespace scalar_items
{

ROW
{
    Items items(green), read;
    CHECK(items.as<Colour>() == green, true);
    Copy(items, read);
    CHECK(read.as<Colour>() == green, true);
}

}
