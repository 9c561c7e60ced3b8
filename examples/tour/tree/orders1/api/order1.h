// The library as it was in its first release. Only archives remember it.

@import "Vesk/vxObject/IObject.h"

namespace orders1
{

$struct+ Order : model
{
    string8 customer;
    int32 pieces;
    float64 price;
}
{
};

}
