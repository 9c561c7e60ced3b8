@import "Vesk/vxObject/IObject.h"
$struct S { };
namespace a { namespace b {
$type+ const S*;
$type<<register>> xvector<int32>; } }
$type <<reflect>> bool ; int x;
