#include "t.h"

//### $interface+ I
namespace vesk { XTarget* app_GetXTarget(); }
    vesk::ReflectedInterface const& _GetReflected(I const*) {
        static vesk::ConstStringZ I_bases[] = { "vesk::IObject", };
        static const vesk::octet_t I_f_return[] = { 0x04 };
        static const vesk::octet_t I_f_a[] = { 0x04 };
        static const vesk::ReflectedArg I_f_args[] = { { "a", I_f_a }, };
        static const vesk::ReflectedInterfaceMethod I_methods[] = { {"f",{I_f_return},I_f_args,1,0}, {"g",{0},0,0,0}, };
        static const vesk::ReflectedInterface I_interface = {
            "I",
            0,
            I_bases,1,
            0,
            I_methods,2,
            0,0,
            0
        };
        return I_interface;
    }
    
    // Registration of $interface+ I
    void _Register_I() {
        vxVerify(vesk::RegisterReflectedInterface(&_GetReflected( (I*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }

//### $class K
namespace vesk { XTarget* app_GetXTarget(); }
    
    vesk::AnyInterface K::QueryInterface(const vesk::ReflectedInterface& _ri) {
        if (&_ri == &vesk::GetReflectedInterface<vesk::IObject >()) { vesk::ptr<vesk::IObject> p(this); return reinterpret_cast<vesk::AnyInterface&>(p); }
        if (&_ri == &vesk::GetReflectedInterface<I >()) { vesk::ptr<I> p(this); return reinterpret_cast<vesk::AnyInterface&>(p); }
        return vesk::AnyInterface();
    }
    vesk::ReflectedClass const* K::GetReflectedClass() const {
        return NULL;
    }
