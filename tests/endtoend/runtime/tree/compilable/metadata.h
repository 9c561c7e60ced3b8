@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace metadata
{


$class+ Shows isa vesk::IObject
{
public:
    $int32 a : [ "field" ];
    $int32 Add(int32 n : [ "argument" ]) const : [ "method" ] { return a + n; }
    $void Reset() : [ "reset", 1 ] { a = 0; }
};
$typedef+ xvector<int32> Numbers : [ "typedef" ];

}
