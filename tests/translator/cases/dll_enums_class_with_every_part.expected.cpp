#include "t.h"

//### $enum+ Level
namespace vesk { XTarget* app_GetXTarget(); }
    app_API vesk::ReflectedEnum const& _GetReflected(Level const*)
    {
        static const vesk::octet_t Level_metadata[] =
        {
            0xe1,0xa4,0x00,0x00
        };
        static vesk::ConstStringZ Level_stringTable[] =
        {
            "doc",
        };
        static const vesk::ReflectedEnum Level_enum =
        {
            "Level",
            Level_metadata,
            Level_stringTable,
            4,
            Level::stringArray(),
            Level::valueArray(),
            Level::enabledArray()
        };
        return Level_enum;
    }
    
    // Registration of $enum+ Level
    void _Register_Level()
    {
        vxVerify(vesk::RegisterReflectedEnum(&_GetReflected( (Level*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }
