@import "compilable/short_bodies.h"
@import "compilable/src/row.h"

$warning(disable: 1009)

namespace short_bodies
{

ROW
{
    Doubles doubles;
    doubles.b = 4;
    CHECK(doubles.a, 5);
    CHECK(doubles.twice, 10);
    doubles.later(1);
    vesk::RunAsyncCalculations();
    CHECK(doubles.later(1), 10);
}

}
