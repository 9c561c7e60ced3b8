// A greenhouse that grows while one looks: models with metadata, a variant, `$indep` and `$dep` values, methods.

@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace greenhouse
{

$enum+ Species : [ "what is grown" ] { Tomato, Pepper, Basil, Orchid };

$interface+ IPlant : vesk::IPersistable
{
    void Grow(float64 rate);
};

$class+ Plant isa IPlant : model
{
    assignable<string8> name : [ "how the gardener calls it" ];
    Species species;
    float64 height : [ unit("cm"), range(0, 400) ];
    int32 water : [ unit("%"), range(0, 100), help("Below 20 it stops growing") ];
    int32 color : [ color(0), "of its flowers" ];
    $schema
    {
        1: + name + species + height
        2: + water + color
    }
}
{
public:
    $void Grow(float64 rate)
    {
        if (water >= 20) height = height + rate / 10;
        if (++m_minutes % 16 == 0 && water > 0) water = water - 1;
    }
    $string8 Describe(bool withWater) const
    {
        return vxMakeString(name << " is " << height << " cm high" << (withWater ? vxMakeString(", at " << water << " %") : ""));
    }

private:
    int m_minutes = 0;
};

$variant+ Weather : [ "outside" ]
{
    void;
    float64 sun;
    float64 rain;
};

// What the controls are set to, and what comes of it.
$class+ Climate isa vesk::IObject
{
public:
    $indep float64 outside : [ unit("C"), range(-30, 50) ] create { outside = 12; };
    $indep float64 heating : [ unit("kW"), range(0, 20) ] create { heating = 4; };
    $indep bool window create { window = false; };
    $dep float64 loss = { loss = window ? 0.9 : 0.35; };
    $dep float64 inside = { inside = outside + heating * (1 - loss) * 4; };
    $dep float64 growth = { growth = inside < 8 || inside > 38 ? 0 : 1 - (inside - 24) * (inside - 24) / 400; };
    $dep string8 advice = { advice = inside < 15 ? "heat more" : inside > 32 ? "open the window" : "leave it"; };
};

$class+ House isa vesk::IObject : model
{
    assignable<string8> name;
    xvector<pref<IPlant>> plants;
    xmap<string8,float64> supplies : [ unit("kg") ];
    xvector<string8> notes;
    Weather weather;
    int64 minutes : [ unit("min") ];
}
{
public:
    $xvector<float64> readings : [ unit("C"), "of the last days, one a second" ];
    $float64 Average(int32 first, int32 count) const;
    $void WaterAll(int32 percent);
};

}
