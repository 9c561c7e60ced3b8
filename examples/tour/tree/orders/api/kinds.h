// The small kinds: enumerations, a variant, a functor, typedefs, functions and variables.

@import "Vesk/vxObject/IObject.h"

namespace orders
{

$enum+ Status : [ "of an order" ] { Open, Paid = 10, Sent, -Lost };
$enum+ class Priority { Low, default Normal, High };

// What a customer pays with: in place, on the heap, without a value, or nothing special.
$variant+ Payment
{
    void;
    { int32 digits; } card;
    *{ xvector<int32> coins; } purse;
    float64 transfer;
    void voucher;
};

// Dispatch goes by the items that have no name.
$variant+ Amount { int32; float64; };
inline vesk::string8 Describe(int32 pieces) { return vxMakeString(pieces << " pieces"); }
inline vesk::string8 Describe(float64 kilos) { return vxMakeString(kilos << " kg"); }
$polymorphic+ inline string8 Describe([Amount a]);

$functor+ float64 Discount(float64 price, int32 pieces);

$typedef+ xmap<string8,int32> Stock;
$type+ xmap<string8,int32>;
$type+ xvector<string8>;

$function+ float64 WithTax(float64 price, float64 rate = 0.2);
$function+ inline int32 Dozens(int32 n) { return 12 * n; }

}
