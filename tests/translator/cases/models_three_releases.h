@import "Vesk/vxObject/IObject.h"
$model+ Record
{
    string8 a; int32 c; float32 e; bool f;
    $dropped { int32 b; int64 d; }
    $schema { 1: +a +b 3: -b +c +d +f 7: -d +e }
    $evolve
    {
        d(b) { d = b * 1000; // in pence
        }
        e(d, a)
        {
            e = float(d);
            Log(a);
        }
        f { // starts empty
        }
    }
};
