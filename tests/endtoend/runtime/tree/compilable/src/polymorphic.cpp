@import "compilable/polymorphic.h"
@import "compilable/src/row.h"

$warning(disable: 1009)

namespace polymorphic
{

ROW
{
    Shape shape;
    shape = vesk::float64(6.5);
    CHECK(Area(shape), 6);
}

}
