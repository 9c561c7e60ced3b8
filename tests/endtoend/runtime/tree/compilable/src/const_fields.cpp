@import "compilable/const_fields.h"
@import "compilable/src/row.h"

$warning(disable: 1009)

namespace const_fields
{

ROW
{
    Fixed fixed;
    CHECK(fixed.Geta() + fixed.Getb() + fixed.Getc() + fixed.Getd(), 22);
    CHECK(fixed.Gettext(), "text");
    fixed.Setc(1);
    CHECK(fixed.c, 1);
    const vesk::int32 pointed = 3;
    Plain plain;
    plain.Setpointer(&pointed);
    CHECK(*plain.Getpointer(), 3);
    Lists lists;
    CHECK(lists.Getm(), 7);
    CHECK(Holds<int>().Getm() + Holds<int>().Getown(), 7);

    // Objects that can't be assigned are made anew.
    Fixed other(2);
    vesk::GetReflectedClass<Fixed>().m_ops.m_assign(&fixed, 0, &other, 0, 1);
    CHECK(std::launder(&fixed)->Geta(), 2);
}

}
