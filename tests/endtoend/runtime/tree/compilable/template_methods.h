@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace template_methods
{

$mixin Counts
{
    $int32 counter;
    $int32 Count(int32 by) { counter += by; return counter; }
    $void Reset() { counter = 0; }
};
$mixin Typed<typename T>
{
    $int32 Size(int32 by) const { return by * int32(sizeof(T)); }
};
$mixin Shown <<reflect>>
{
    $int32 shown;
    $int32 Twice() const { return 2 * shown; }
};
$class+ Uses isa vesk::IObject : mixin [ Counts Typed<int32> Shown ] { };
$struct Cell<typename T>
{
    T item;
    $int32 n;
    $int32 Get(int32 by) const { return n * by; }
    $void Set(int32 value) { n = value; }
};
$struct+ Registered<typename T> { T item; $int32 n; $int32 Get() const { return n; } };
$struct Reflected<typename T> <<reflect>> { $int32 n; };

}
