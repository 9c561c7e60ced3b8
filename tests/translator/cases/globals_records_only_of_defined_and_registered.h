@import "Vesk/vxObject/IObject.h"
$function+ void f(); $function <<reflect>> inline void g() { } $var <<reflect>> int32 v; $typedef+ <<-register>> int32 T;