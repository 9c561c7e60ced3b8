// The one source of the library: its registration, and the records of its interfaces.

@import "Vesk/vxObject/IObject.h"

vxDefineTarget(Vesk_vxObject, 1)
