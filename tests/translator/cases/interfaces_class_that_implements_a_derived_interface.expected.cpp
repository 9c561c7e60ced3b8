#include "t.h"

//### $interface+ A
namespace vesk { XTarget* app_GetXTarget(); }
    vesk::ReflectedInterface const& _GetReflected(A const*)
    {
        static vesk::ConstStringZ A_bases[] =
        {
            "vesk::IObject",
        };
        static const vesk::ReflectedInterface A_interface =
        {
            "A",
            0,
            A_bases,1,
            0,
            0,0,
            0,0,
            0
        };
        return A_interface;
    }
    
    // Registration of $interface+ A
    void _Register_A()
    {
        vxVerify(vesk::RegisterReflectedInterface(&_GetReflected( (A*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }

//### $interface+ B
namespace vesk { XTarget* app_GetXTarget(); }
    vesk::ReflectedInterface const& _GetReflected(B const*)
    {
        static vesk::ConstStringZ B_bases[] =
        {
            "A",
        };
        static const vesk::ReflectedInterface B_interface =
        {
            "B",
            0,
            B_bases,1,
            0,
            0,0,
            0,0,
            0
        };
        return B_interface;
    }
    
    // Registration of $interface+ B
    void _Register_B()
    {
        vxVerify(vesk::RegisterReflectedInterface(&_GetReflected( (B*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }

//### $class+ K
namespace vesk { XTarget* app_GetXTarget(); }
    vesk::ptr<vesk::IObject> __stdcall K::sfnCreateInstance()
    {
        return static_cast<vesk::ptr<B> >(new K());
    }
    vesk::ReflectedClass const& _GetReflected(K const*)
    {
        static vesk::ConstStringZ K_interfaces[] =
        {
            "vesk::IObject",
            "A",
            "U",
            "B",
        };
        static const vesk::ReflectedClass K_class =
        {
            1,
            "K",
            sizeof(K),
            0,
            0,0,
            0,0,
            0,0,
            0,0,
            0,
            K_interfaces,2,2,
            &vesk::IObject::Stubs<K>::GetTable(),
            &K::sfnCreateInstance,
            {
                sizeof(K),
                0,
                0,
                0,
                (vesk::ConstructArrayFn) (void (*)( K*, vesk::ssize_t, vesk::ssize_t)) vesk::ConstructArray<K>,
                (vesk::CopyConstructArrayFn) (void (*)(K*, vesk::ssize_t, K const*, vesk::ssize_t, vesk::ssize_t)) vesk::CopyConstructArray<K>,
                (vesk::AssignArrayFn) (void (*)(K*, vesk::ssize_t, K const*, vesk::ssize_t, vesk::ssize_t)) vesk::AssignArray<K>,
                (vesk::DestructArrayFn) (void (*)( K*, vesk::ssize_t, vesk::ssize_t)) vesk::DestructArray<K>,
                0,
                0,
                0,
                0,
                0,
                0
            }
        };
        
        return K_class;
    }
    vesk::TypeOps const& _GetTypeOps(K const*)
    {
        return vesk::GetReflectedClass<K>().m_ops;
    }
    
    vesk::AnyInterface K::QueryInterface(const vesk::ReflectedInterface& _ri)
    {
        if (&_ri == &vesk::GetReflectedInterface<vesk::IObject >()) { vesk::ptr<vesk::IObject> p(this); return reinterpret_cast<vesk::AnyInterface&>(p); }
        if (&_ri == &vesk::GetReflectedInterface<A >()) { vesk::ptr<A> p(this); return reinterpret_cast<vesk::AnyInterface&>(p); }
        if (&_ri == &vesk::GetReflectedInterface<B >()) { vesk::ptr<B> p(this); return reinterpret_cast<vesk::AnyInterface&>(p); }
        return vesk::AnyInterface();
    }
    vesk::ReflectedClass const* K::GetReflectedClass() const
    {
        return &_GetReflected( (K*) 0);
    }
    
    // Registration of $class+ K
    void _Register_K()
    {
        vxVerify(vesk::RegisterReflectedClass(&_GetReflected( (K*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }
