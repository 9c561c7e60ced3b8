@import "compilable/whole_fields.h"
@import "compilable/src/row.h"

$warning(disable: 1009)

namespace whole_fields
{

ROW
{
    Doc doc;
    doc.vector.write().push_back(4);
    CHECK(doc.vector[0], 4);
    doc.map.write()[1] = "one";
    CHECK(doc.map.read().size(), 1u);
    doc.fixed.write()[1] = 3;
    CHECK(doc.fixed[1], 3);
    doc.grid[1][1] = 9;
    CHECK(doc.grid[1][1], 9);
    Plain plain;
    plain.vector.write().push_back(1);
    plain.fixed.write()[2] = 8;
    CHECK(plain.fixed[2], 8);
}

}
