#include "t.h"

//### $struct+ S
namespace vesk { XTarget* app_GetXTarget(); }
    vesk::ReflectedClass const& _GetReflected(S const*)
    {
        static const vesk::octet_t S_d[] =
        {
            0x10
        };
        static const vesk::ReflectedField S_fields[] =
        {
            { "d", offsetof(S,d), S_d },
        };
        static const vesk::octet_t S_a[] =
        {
            0x04
        };
        static const vesk::ReflectedDepField S_depfields[] =
        {
            { "a", offsetof(S,_a_), S_a, offsetof(S,a) },
            { "b", 0, 0, offsetof(S,b) },
        };
        static const vesk::ReflectedClass S_class =
        {
            0,
            "S",
            sizeof(S),
            0,
            S_fields,1,
            0,0,
            S_depfields,2,
            0,0,
            0,
            0,0,0,
            0,
            0,
            {
                sizeof(S),
                0,
                0,
                0,
                (vesk::ConstructArrayFn) (void (*)( S*, vesk::ssize_t, vesk::ssize_t)) vesk::ConstructArray<S>,
                (vesk::CopyConstructArrayFn) (void (*)(S*, vesk::ssize_t, S const*, vesk::ssize_t, vesk::ssize_t)) vesk::CopyConstructArray<S>,
                (vesk::AssignArrayFn) (void (*)(S*, vesk::ssize_t, S const*, vesk::ssize_t, vesk::ssize_t)) vesk::AssignArray<S>,
                (vesk::DestructArrayFn) (void (*)( S*, vesk::ssize_t, vesk::ssize_t)) vesk::DestructArray<S>,
                0,
                0,
                0,
                0,
                0,
                0
            }
        };
        
        return S_class;
    }
    vesk::TypeOps const& _GetTypeOps(S const*)
    {
        return vesk::GetReflectedClass<S>().m_ops;
    }
    
    // Registration of $struct+ S
    void _Register_S()
    {
        vxVerify(vesk::RegisterReflectedClass(&_GetReflected( (S*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }
