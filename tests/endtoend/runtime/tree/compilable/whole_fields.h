@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace whole_fields
{


$model Part { int32 a; };
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
$struct Plain : model { int32 fixed[3]; xvector<int32> vector; xmap<int32,string8> map; int32 grid[2][2]; Part cells[2][2]; }
{
};

}
