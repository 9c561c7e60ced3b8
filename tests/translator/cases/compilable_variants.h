@import "Vesk/vxObject/IObject.h"
$enum E { a };
$variant V { default int32(1); int32; E; { } none; { string8 t; } text; };
$polymorphic void F([V v], [V w]);
$struct S
{
    $variant N { void; string8; *{ E e; } far; };
    $functor void G();
};
