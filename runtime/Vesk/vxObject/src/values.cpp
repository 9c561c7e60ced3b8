// Values by their types.

@import "Vesk/vxObject/src/parts/value_types.h"
@import "Vesk/vxObject/src/parts/containers.h"
@import "Vesk/vxObject/src/parts/access.h"
