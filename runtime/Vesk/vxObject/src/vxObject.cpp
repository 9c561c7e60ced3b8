// Registered things, archives and remote calls; the library's own registration, and the records of its interfaces.
// Programs need all of this.

@import "Vesk/vxObject/IObject.h"
@import "Vesk/vxObject/src/parts/text.h"
@import "Vesk/vxObject/src/parts/byte_code.h"
@import "Vesk/vxObject/src/parts/layout.h"
@import "Vesk/vxObject/src/parts/registry.h"
@import "Vesk/vxObject/src/parts/releases.h"
@import "Vesk/vxObject/src/parts/objects.h"
@import "Vesk/vxObject/src/parts/frames.h"
@import "Vesk/vxObject/src/parts/remote.h"

vxDefineTarget(Vesk_vxObject, 1)
