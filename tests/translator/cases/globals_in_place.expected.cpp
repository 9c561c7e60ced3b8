#include "t.h"

//### $typedef+ T
namespace vesk { XTarget* app_GetXTarget(); }
    void _Register_T() {
        static const vesk::octet_t T_type[] = { 0x51,0x04,0x10 };
        static const vesk::ReflectedTypedef T_typedef = {
            "T",
            T_type,
            0
        };
        vxVerify(vesk::RegisterReflectedTypedef(&T_typedef,vesk::app_GetXTarget()) == vesk::NSE_OK);
    }

//### $var+ p
namespace vesk { XTarget* app_GetXTarget(); }
    void _Register_p() {
        static const vesk::octet_t p_type[] = { 0x50,0x03,0x00,0x00,0x00,0x42,0x21,0x00,0x00 };
        static vesk::ConstStringZ p_stringTable[] = { "vesk::IObject", };
        static const vesk::ReflectedGlobalVariable p_var = {
            "p",
            &p,
            p_type,
            p_stringTable
        };
        vxVerify(vesk::RegisterReflectedGlobalVariable(&p_var,vesk::app_GetXTarget()) == vesk::NSE_OK);
    }
