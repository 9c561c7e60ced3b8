@import "api/animal.h"
@import "api/meal.h"

vxDefineTarget({{NAME}}_core, 2)  // the number is the release that archives are written for

namespace animals
{

float64 Animal::FoodPerDay() const { return weight * (diet == Diet::Plants ? 0.05 : 0.02); }

}
