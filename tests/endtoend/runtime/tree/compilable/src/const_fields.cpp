@import "compilable/const_fields.h"
@import "compilable/src/row.h"

$warning(disable: 1009)

namespace const_fields
{

ROW
{
    Fixed fixed;
    CHECK(fixed.a + fixed.b + fixed.c, 15);
    Lists lists;
    CHECK(lists.m, 7);
}

}
