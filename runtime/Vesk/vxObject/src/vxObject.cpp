// Registered things and archives; the library's own registration, and the records of its interfaces.

@import "Vesk/vxObject/IObject.h"
@import "Vesk/vxObject/src/parts/text.h"
@import "Vesk/vxObject/src/parts/byte_code.h"
@import "Vesk/vxObject/src/parts/layout.h"
@import "Vesk/vxObject/src/parts/registry.h"
@import "Vesk/vxObject/src/parts/releases.h"
@import "Vesk/vxObject/src/parts/objects.h"

vxDefineTarget(Vesk_vxObject, 1)
