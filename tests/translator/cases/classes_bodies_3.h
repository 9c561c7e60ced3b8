@import "Vesk/vxObject/IObject.h"
$struct A
{$std::map<int,int> m; /* $ } */};