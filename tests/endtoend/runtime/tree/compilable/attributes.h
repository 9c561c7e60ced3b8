@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace attributes
{


$model+ Size { int32 width; };
$interface+ IThing : vesk::IObject
{
    string8 name;
    const string8 title;
    int32 numbers[];
    int32 fixed[3];
    xvector<int32> vector;
    xmap<int32,string8> map;
    xset<int32> set;
    Size size;
    int32 plain;
    const int32 readOnly;
};

}
