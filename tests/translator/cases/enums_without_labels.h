@import "Vesk/vxObject/IObject.h"
$enum class C { };
$enum+ P <<-register extern>> { };
