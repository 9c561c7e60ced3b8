@import "compilable/array_typedef.h"
@import "compilable/src/row.h"

$warning(disable: 1009)

namespace array_typedef
{

ROW
{
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
