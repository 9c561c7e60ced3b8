@import "Vesk/vxObject/IObject.h"
@print("printed ")
$interface+ IShape : vesk::IObject { float64 Area(int32 places = 2) const; };
$enum Side { left, right = 7 };
$struct Point { $int32:[ unit("mm"), "</script><i>" ] x; $xmap<string8,Side> sides; };
$model+ Note
{
    string8 title;
    float64 width : [ unit("mm") ];
    $dropped { string8 head; string8 name; int32 inches; }
    $schema { 1: +name +inches 2: -name +head 4: -inches -head +width +title }
    $evolve { head(name) { head = name; } title(head) { title = head; } width(inches) { width = inches * 25.4; } }
};
$class+ Page isa IShape : model Note { };
