#include "t.h"

//### $struct+ A
namespace vesk { XTarget* app_GetXTarget(); }
    vesk::ReflectedClass const& _GetReflected(A const*) {
        static const vesk::octet_t A_x[] = { 0x04 };
        static const vesk::ReflectedField A_fields[] = { { "x", offsetof(A,x), A_x }, };
        static const vesk::ReflectedClassMethod A_methods[] = { {"f",{0},0,0,0,false,(vesk::FunctionPointer)(void (__stdcall *)(A* _self))&::f}, };
        static const vesk::ReflectedClass A_class = {
            0,
            "A",
            sizeof(A),
            0,
            A_fields,1,
            0,0,
            0,0,
            A_methods,1,
            0,
            0,0,0,
            0,
            0,
            { sizeof(A), 0, 0, 0, ConstructArray, CopyConstructArray, AssignArray, DestructArray, 0, 0, 0, 0, 0, 0 }
        };
        
        return A_class;
    }
    vesk::TypeOps const& _GetTypeOps(A const*) {
        return vesk::GetReflectedClass<A>().m_ops;
    }
    
    // Registration of $struct+ A
    void _Register_A() {
        vxVerify(vesk::RegisterReflectedClass(&_GetReflected( (A*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }
