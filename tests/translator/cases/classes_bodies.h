@import "Vesk/vxObject/IObject.h"
$struct A
{$$() { $$ * p; if (x) { } }void f() { g($this, $this); h($new B(1)); }$std::map<int,int> m; /* $ } */$int f(int a) const { return "}"[a]; } $void g();};