@import "Vesk/vxObject/IObject.h"
$struct S
{//
$cache <<queue(1 + 2) visit>> inline int32 f() const
{
    return 1; 
}
int end;
};
