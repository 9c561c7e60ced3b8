@import "compilable/polymorphic.h"
@import "compilable/src/row.h"

$warning(disable: 1009)

namespace polymorphic
{

ROW
{
    CHECK(Area(Shape(vesk::float64(6.5))), 6);
    CHECK(Area(Shape(Shape::side(3))), 9);
    CHECK(Area(Shape(Shape::name("four"))), 4);
    CHECK(Area(Shape(Shape::point(2, 4))), 8);
    CHECK(Area(Shape(Shape::boxed(6))), 7);
    vesk::string8 met;
    Meet(Left(Left::a(1)), Left(Left::b("x")), met);
    CHECK(met, "ab");
}

}
