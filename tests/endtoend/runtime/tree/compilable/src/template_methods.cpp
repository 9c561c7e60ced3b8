@import "compilable/template_methods.h"
@import "compilable/src/row.h"

$warning(disable: 1009)

namespace template_methods
{

ROW
{
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
