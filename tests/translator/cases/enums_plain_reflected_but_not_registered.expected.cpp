#include "t.h"

//### $enum E
namespace vesk { XTarget* app_GetXTarget(); }
    vesk::ReflectedEnum const& _GetReflected(E const*)
    {
        static vesk::ConstStringZ E_strings[] =
        {
            "a",
            "b",
        };
        static const vesk::int32 E_values[] =
        {
            0,
            7,
        };
        static const bool E_enabled[] =
        {
            true,
            false,
        };
        static const vesk::ReflectedEnum E_enum =
        {
            "E",
            0,
            0,
            2,
            E_strings,
            E_values,
            E_enabled
        };
        return E_enum;
    }
