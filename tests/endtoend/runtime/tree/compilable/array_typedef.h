@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace array_typedef
{

$typedef int32 Triple[3];
$typedef+ string8 Pair[2];
$typedef int32 Grid[2][3];
$typedef int32 Any[];
$model Uses { Triple triple; Pair pair; int32 n; };
$struct Holds : model { Triple triple; Grid grid; Any any; } { };

}
