@import "Vesk/vxObject/IObject.h"
$struct A<class T> <<os ar>> { $T* f(T t, xmap<T,T> m); };