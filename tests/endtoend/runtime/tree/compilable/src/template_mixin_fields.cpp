@import "compilable/template_mixin_fields.h"
@import "compilable/src/row.h"

$warning(disable: 1009)

namespace template_mixin_fields
{

ROW
{
    Holds<int> holds;
    holds.a = 3;
    CHECK(holds.a, 3);
    Reflects<int> reflects;
    reflects.a = 4;
    reflects.value = 5;
    CHECK(reflects.a + reflects.value, 9);
}

}
