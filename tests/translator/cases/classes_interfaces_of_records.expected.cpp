#include "t.h"

//### $struct A
namespace vesk { XTarget* app_GetXTarget(); }
    vesk::ptr<vesk::IObject> __stdcall A::sfnCreateInstance()
    {
        return static_cast<vesk::ptr<J> >(new A());
    }
    vesk::ReflectedClass const& _GetReflected(A const*)
    {
        static vesk::ConstStringZ A_interfaces[] =
        {
            "vesk::IObject",
            "vesk::IObject",
            "vesk::IPersistable",
            "J",
            "I",
        };
        static const vesk::ReflectedClass A_class =
        {
            0,
            "A",
            sizeof(A),
            0,
            0,0,
            0,0,
            0,0,
            0,0,
            0,
            A_interfaces,3,2,
            &vesk::IObject::Stubs<A>::GetTable(),
            &A::sfnCreateInstance,
            {
                sizeof(A),
                0,
                0,
                0,
                (vesk::ConstructArrayFn) (void (*)( A*, vesk::ssize_t, vesk::ssize_t)) vesk::ConstructArray<A>,
                (vesk::CopyConstructArrayFn) (void (*)(A*, vesk::ssize_t, A const*, vesk::ssize_t, vesk::ssize_t)) vesk::CopyConstructArray<A>,
                (vesk::AssignArrayFn) (void (*)(A*, vesk::ssize_t, A const*, vesk::ssize_t, vesk::ssize_t)) vesk::AssignArray<A>,
                (vesk::DestructArrayFn) (void (*)( A*, vesk::ssize_t, vesk::ssize_t)) vesk::DestructArray<A>,
                0,
                0,
                0,
                0,
                0,
                0
            }
        };
        
        return A_class;
    }
    vesk::TypeOps const& _GetTypeOps(A const*)
    {
        return vesk::GetReflectedClass<A>().m_ops;
    }
    
    vesk::AnyInterface A::QueryInterface(const vesk::ReflectedInterface& _ri)
    {
        if (&_ri == &vesk::GetReflectedInterface<vesk::IObject >()) { vesk::ptr<vesk::IObject> p(this); return reinterpret_cast<vesk::AnyInterface&>(p); }
        if (&_ri == &vesk::GetReflectedInterface<vesk::IObject >()) { vesk::ptr<vesk::IObject> p(this); return reinterpret_cast<vesk::AnyInterface&>(p); }
        if (&_ri == &vesk::GetReflectedInterface<vesk::IPersistable >()) { vesk::ptr<vesk::IPersistable> p(this); return reinterpret_cast<vesk::AnyInterface&>(p); }
        if (&_ri == &vesk::GetReflectedInterface<I >()) { vesk::ptr<I> p(this); return reinterpret_cast<vesk::AnyInterface&>(p); }
        return vesk::AnyInterface();
    }
    vesk::ReflectedClass const* A::GetReflectedClass() const
    {
        return &_GetReflected( (A*) 0);
    }
    
    // Registration of $struct A
    void _Register_A()
    {
        vxVerify(vesk::RegisterReflectedClass(&_GetReflected( (A*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }

//### $interface+ I
namespace vesk { XTarget* app_GetXTarget(); }
    vesk::ReflectedInterface const& _GetReflected(I const*)
    {
        static vesk::ConstStringZ I_bases[] =
        {
            "vesk::IPersistable",
        };
        static const vesk::ReflectedInterface I_interface =
        {
            "I",
            0,
            I_bases,1,
            0,
            0,0,
            0,0,
            0
        };
        return I_interface;
    }
    
    // Registration of $interface+ I
    void _Register_I()
    {
        vxVerify(vesk::RegisterReflectedInterface(&_GetReflected( (I*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }
