// A project that several modules of one process hold, each its own copy.
@import "Vesk/vxObject/IObject.h"

$interface+ ITwice : vesk::IObject {
    int32 Number() const;
};
$class+ Twice isa ITwice {
public:
    int32 Number() const { return 7; }
    $int32 number;
};
