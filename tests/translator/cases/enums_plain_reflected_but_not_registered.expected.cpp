#include "t.h"

//### $enum a::E
namespace vesk { XTarget* app_GetXTarget(); }
namespace a {
    vesk::ReflectedEnum const& _GetReflected(E const*) {
        static const vesk::octet_t E_metadata[] = { 0xe1,0xa4,0x00,0x00 };
        static vesk::ConstStringZ E_stringTable[] = { "doc", };
        static vesk::ConstStringZ E_strings[] = { "a", "b", };
        static const vesk::int32 E_values[] = { 0, 7, }; static const bool E_enabled[] = { true, false, };
        static const vesk::ReflectedEnum E_enum = {
            "a::E",
            E_metadata,
            E_stringTable,
            2,
            E_strings,
            E_values,
            E_enabled
        };
        return E_enum;
    }
} // a
