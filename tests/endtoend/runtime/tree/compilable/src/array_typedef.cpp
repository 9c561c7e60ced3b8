@import "compilable/array_typedef.h"
@import "compilable/src/row.h"

$warning(disable: 1009)

namespace array_typedef
{

ROW
{
    Holds holds, read;
    holds.triple[1] = 4;
    Copy(holds, read);
    CHECK(read.triple[1], 4);
    CHECK(holds == read, true);
}

}
