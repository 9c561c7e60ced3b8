#include "t.h"

//### $enum+ P
namespace vesk { XTarget* app_GetXTarget(); }
    vesk::ReflectedEnum const& _GetReflected(P const*) {
        static const vesk::ReflectedEnum P_enum = {
            "P",
            0,
            0,
            0,
            0,
            0,
            0
        };
        return P_enum;
    }
