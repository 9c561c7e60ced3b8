@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace whole_fields
{

$struct Point { int32 x; };
inline bool operator==(Point const& a, Point const& b) { return a.x == b.x; }
inline bool operator<(Point const& a, Point const& b) { return a.x < b.x; }
$model+ Part { int32 a; string8 name; int32 marks[2]; };
$class+ Doc isa vesk::IObject : model
{
    int32 fixed[3];
    xvector<int32> vector;
    xmap<int32,string8> map;
    int32 grid[2][2];
    xmap<int32,Part> parts;
    Part cells[2][2];
    xvector<Part> list;
}
{
};
$struct Plain : model
{
    int32 fixed[3];
    xvector<int32> vector;
    xmap<int32,string8> map;
    int32 grid[2][2];
    Part cells[2][2];
    Part part;
    offsettable<int32> sum;
    xset<int32> set;
    string8 names[2][2];
    xmap<int32,xmap<int32,string8>> deep;
}
{
};

}
