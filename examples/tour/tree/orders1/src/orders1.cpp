@import "api/order1.h"

vxDefineTarget(orders1, 1)
