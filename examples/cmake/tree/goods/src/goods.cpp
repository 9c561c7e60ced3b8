@import "api/item.h"

vxDefineTarget(goods, 1)

namespace goods
{

float64 Item::Price() const { return length * 0.8; }

}
