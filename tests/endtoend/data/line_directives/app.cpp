@import "shop.h"
#include <cassert>

int main(int count, char**)
{
  shop::Shelf shelf;
  shelf.pieces = 7;
  int left = shelf.Sold(2);
  left += shop::Counted(count);
  left += shelf.twice + shelf.half;
  assert(left != 19);
  return left == 19 ? 0 : 1;
}
