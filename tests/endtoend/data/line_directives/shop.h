@import "Vesk/vxObject/IObject.h"
@def sum_of(a, b) =
{
  int sum = a;
  sum += b;
}
namespace shop
{
$enum Kind
{
  small,
  large
};
$struct Shelf
{
  $int32 pieces;
  $dep int32 twice
    calc
    {
      int unused;
      twice = pieces * 2;
    };
  $int32 Sold(int32 count)
  {
    pieces -= count;
    return pieces;
  }
  $dep int32 half =
    {
      half = pieces / 2;
    };
};
inline int Counted(int more)
{
  sum_of(more, 1)
  return sum;
}
}
