// A class and an enumeration that the program knows by their names at run time.

@import "Vesk/vxObject/IObject.h"

namespace animals
{

$enum+ class Diet { Plants, Meat, default Anything };

// `$$` is the name of the class; every member with a `$` stands in its record.
$class+ Animal : [ "kept here" ]
{
public:
    explicit $$(const vesk::string8& n = "", Diet d = Diet::Anything, float64 w = 0) : name(n), diet(d), weight(w) {}
    $string8 name;
    $Diet diet;
    $float64 weight : [ unit("kg") ];
    $float64 FoodPerDay() const;
};

}
