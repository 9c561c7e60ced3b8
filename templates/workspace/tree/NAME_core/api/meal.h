// Data with a history: archives of both releases can be read.

@import "Vesk/vxObject/IObject.h"

namespace animals
{

$model+ Meal
{
    string8 eater;
    float64 kilos;

    $dropped { float64 pounds; }
    $schema
    {
        1: +eater +pounds
        2: -pounds +kilos
    }
    $evolve
    {
        kilos(pounds) { kilos = pounds * 0.45; }
    }
};

$class+ Feeding : model Meal
{
};

}
