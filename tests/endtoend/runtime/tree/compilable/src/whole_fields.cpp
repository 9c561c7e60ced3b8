@import "compilable/whole_fields.h"
@import "compilable/src/row.h"

$warning(disable: 1009)

namespace whole_fields
{

ROW
{
    // Operations have no write().
    Doc doc;
    doc.vector.push_back(4);
    CHECK(doc.vector.read()[0], 4);
    doc.grid[1][1] = 9;
    CHECK(doc.grid[1][1], 9);
    CHECK(doc.grid[1][1].model(), 9);
    doc.cells[1][0].a = 5;
    CHECK(doc.cells[1][0].a.read(), 5);
    CHECK(vesk::PathText(vesk::GetReflectedClass<Doc>(), doc.grid[1][0].path()), "grid[1][0]");

    Plain plain;
    plain.vector.write().push_back(1);
    CHECK(plain.vector.read()[0], 1);
    plain.fixed.write()[2] = 8;
    CHECK(plain.fixed[2], 8);
    plain.fixed[1].write() = 7;
    CHECK(plain.fixed[1].read(), 7);
    plain.map.write()[1] = "one";
    CHECK(plain.map.read().size(), 1u);
    plain.grid.write()[0][1] = 2;
    plain.grid[1].write()[0] = 3;
    plain.grid[1][1].write() = 4;
    CHECK(plain.grid[0][1], 2);
    CHECK(plain.grid[1][0].model(), 3);
    CHECK(plain.grid[1][1].read(), 4);
    plain.cells[1][1].a = 5;
    plain.cells[1][1].a.write() = 6;
    CHECK(plain.cells[1][1].a, 6);
    plain.part.write().a = 7;
    CHECK(plain.part.a, 7);
    plain.sum += 2;
    plain.sum.write() = 9;
    CHECK(plain.sum + 0, 9);
    plain.set.write().Insert(3);
    CHECK(plain.set.read().size(), 1u);
    plain.names[1][0].push_back('x');
    plain.names[1][0].write() += "y";
    CHECK(plain.names[1][0].read(), "xy");
    plain.deep.write()[1][2] = "deep";
    CHECK(plain.deep[1][2].read(), "deep");
    plain.deep[1][2].write() = "well";
    CHECK(plain.deep[1][2].model(), "well");
}

}
