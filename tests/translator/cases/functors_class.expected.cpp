#include "t.h"

//### $functor+ F
namespace vesk { XTarget* app_GetXTarget(); }
    vesk::ReflectedFunctor const& _GetReflected(F const*) {
        static const vesk::octet_t F_metadata[] = { 0xe1,0xa2,0x07,0x00,0x00,0x00 };
        static const vesk::octet_t F_return[] = { 0x01 };
        static const vesk::octet_t F_a[] = { 0x04 };
        static const vesk::octet_t F_b[] = { 0x36,0x31,0x10 };
        static const vesk::ReflectedArg F_args[] = { { "a", F_a }, { "b", F_b }, };
        static const vesk::ReflectedFunctor F_functor = {
            "F",
            {F_return},
            F_args,2,
            F_metadata,
            0,
        };
        return F_functor;
    }
    
    // Registration of $functor+ F
    void _Register_F() {
        vxVerify(vesk::RegisterReflectedFunctor(&_GetReflected( (F*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }
