// A class whose fields are known by their names at run time.

@import "Vesk/vxObject/IObject.h"

namespace goods
{

$class+ Item
{
public:
    explicit $$(const vesk::string8& n = "", float64 l = 0) : name(n), length(l) {}
    $string8 name;
    $float64 length : [ unit("m") ];
    $float64 Price() const;
};

}
