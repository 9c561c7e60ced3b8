#include "t.h"

//### $struct+ S
namespace vesk { XTarget* app_GetXTarget(); }
    vesk::ReflectedClass const& _GetReflected(S const*) {
        static const vesk::octet_t S_w[] = { 0x35,0x04 };
        static const vesk::octet_t S_f[] = { 0x10 };
        static const vesk::ReflectedField S_fields[] = { { "w", offsetof(S,w), S_w }, { "f", offsetof(S,f), S_f }, };
        static const vesk::octet_t S_c[] = { 0x04 };
        static const vesk::octet_t S_a[] = { 0x10 };
        static const vesk::ReflectedDepField S_depfields[] = { { "c", offsetof(S,_c_), S_c, offsetof(S,c) }, { "d", 0, 0, offsetof(S,d) }, { "a", offsetof(S,_a_), S_a, offsetof(S,a) }, };
        static const vesk::ReflectedClass S_class = {
            0,
            "S",
            sizeof(S),
            0,
            S_fields,2,
            0,0,
            S_depfields,3,
            0,0,
            0,
            0,0,0,
            0,
            0,
            { sizeof(S), 0, 0, 0, ConstructArray, CopyConstructArray, AssignArray, DestructArray, 0, 0, 0, 0, 0, 0 }
        };
        
        return S_class;
    }
    vesk::TypeOps const& _GetTypeOps(S const*) {
        return vesk::GetReflectedClass<S>().m_ops;
    }
    
    // Registration of $struct+ S
    void _Register_S() {
        vxVerify(vesk::RegisterReflectedClass(&_GetReflected( (S*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }
