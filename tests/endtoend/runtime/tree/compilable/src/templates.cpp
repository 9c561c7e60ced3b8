@import "compilable/templates.h"
@import "compilable/src/row.h"

$warning(disable: 1009)

namespace templates
{

ROW
{
    Box<vesk::int32> box, other;
    box.name = "7";
    box.count = 2;
    Copy(box, other);
    CHECK(other.name, "7");
    CHECK(vxMakeString(box), vxMakeString(other));
    Archived<vesk::string8> text, read;
    text.item = "x";
    Copy(text, read);
    CHECK(read.item, "x");
    Referring<int> referring, back;
    referring.shared = 3;
    Copy(referring, back);
    CHECK(back.shared, 3);
    Kept<vesk::int32> kept;
    kept.item = 4;
    CHECK(kept.item, 4);
    Printed<vesk::int32, vesk::string8> printed;
    CHECK(vxMakeString(printed).empty(), false);
}

}
