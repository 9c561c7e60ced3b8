@import "Vesk/vxObject/IObject.h"
$struct A
{void f() { g($this, $this); h($new B(1)); }};