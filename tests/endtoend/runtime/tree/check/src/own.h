// Models whose fields are given parts of themselves, and that hold models of another project.
@import "Vesk/vxObject/IObject.h"
@import "kinds/models.h"
@import "shapes/shapes.h"

$warning(disable: 1009)

// With operations and without.
$class+ Owns isa kinds::IDoc : model {
    xvector<string8> words;
    string8 text;
    xset<string8> names;
    xmap<string8,assignable<string8>> map;
    assignable<xvector<string8>> all;
} { };
$struct OwnsPlain : model {
    xvector<string8> words; string8 text; xset<string8> names; xmap<string8,assignable<string8>> map;
} { };

// Of this project, whose release is 1; a Size is of `kinds`, whose release is 3.
$class+ Holder isa kinds::IDoc : model { kinds::Size size; int32 behind; } { };
$class+ Refers isa kinds::IDoc : model kinds::Size {
};
