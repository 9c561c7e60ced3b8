@import "compilable/mixin_visits.h"
@import "compilable/src/row.h"

$warning(disable: 1009)

namespace mixin_visits
{

ROW
{
    Holds holds;
    holds.a = 3;
    CHECK(holds.a, 3);
    Lists lists;
    lists.small = 2;
    CHECK(lists.small, 2);
}

}
