@import "compilable/nested.h"
@import "compilable/src/row.h"

$warning(disable: 1009)

namespace nested
{

ROW
{
    Outer::Size size, other;
    size.width = 3;
    size.name = "a";
    Copy(size, other);
    CHECK(other.width, 3);
    CHECK(size == other, true);
    CHECK(vxMakeString(size), vxMakeString(other));
    Outer::Value value(vesk::int32(5)), read;
    Copy(value, read);
    CHECK(read.as<vesk::int32>(), 5);
    CHECK(value == read, true);
    Outer::Shown shown, back;
    shown = vesk::xvector<vesk::int32>{1, 2};
    Copy(shown, back);
    CHECK(back == shown, true);
    Outer::Part part, copy;
    part.items.push_back(4);
    Copy(part, copy);
    CHECK(copy.items[0], 4);
    Outer::Callback callback;
    CHECK(callback == Outer::Callback(), true);
    Holder::Choice choice(vesk::int32(1));
    CHECK(choice.is<vesk::int32>(), true);
}

}
