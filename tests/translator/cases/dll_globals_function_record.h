@import "Vesk/vxObject/IObject.h"
