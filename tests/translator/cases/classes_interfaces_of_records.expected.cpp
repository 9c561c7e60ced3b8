#include "t.h"

//### $struct A
namespace vesk { XTarget* app_GetXTarget(); }
    vesk::ptr<vesk::IObject> __stdcall A::sfnCreateInstance() {
        return static_cast<vesk::ptr<K> >(new A());
    }
    vesk::ReflectedClass const& _GetReflected(A const*) {
        static vesk::ConstStringZ A_interfaces[] = { "vesk::IObject", "J", "vesk::IObject", "vesk::IPersistable", "K", "I", };
        static const vesk::ReflectedClass A_class = {
            0,
            "A",
            sizeof(A),
            0,
            0,0,
            0,0,
            0,0,
            0,0,
            0,
            A_interfaces,4,2,
            &vesk::IObject::Stubs<A>::GetTable(),
            &A::sfnCreateInstance,
            { sizeof(A), 0, 0, 0, ConstructArray, CopyConstructArray, AssignArray, DestructArray, 0, 0, 0, 0, 0, 0 }
        };
        
        return A_class;
    }
    vesk::TypeOps const& _GetTypeOps(A const*) {
        return vesk::GetReflectedClass<A>().m_ops;
    }
    
    vesk::AnyInterface A::QueryInterface(const vesk::ReflectedInterface& _ri) {
        if (&_ri == &vesk::GetReflectedInterface<vesk::IObject >()) { vesk::ptr<vesk::IObject> p(this); return reinterpret_cast<vesk::AnyInterface&>(p); }
        if (&_ri == &vesk::GetReflectedInterface<K >()) { vesk::ptr<K> p(this); return reinterpret_cast<vesk::AnyInterface&>(p); }
        if (&_ri == &vesk::GetReflectedInterface<vesk::IObject >()) { vesk::ptr<vesk::IObject> p(this); return reinterpret_cast<vesk::AnyInterface&>(p); }
        if (&_ri == &vesk::GetReflectedInterface<vesk::IPersistable >()) { vesk::ptr<vesk::IPersistable> p(this); return reinterpret_cast<vesk::AnyInterface&>(p); }
        if (&_ri == &vesk::GetReflectedInterface<I >()) { vesk::ptr<I> p(this); return reinterpret_cast<vesk::AnyInterface&>(p); }
        return vesk::AnyInterface();
    }
    vesk::ReflectedClass const* A::GetReflectedClass() const {
        return &_GetReflected( (A*) 0);
    }
    
    // Registration of $struct A
    void _Register_A() {
        vxVerify(vesk::RegisterReflectedClass(&_GetReflected( (A*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }

//### $interface+ I
namespace vesk { XTarget* app_GetXTarget(); }
    vesk::ReflectedInterface const& _GetReflected(I const*) {
        static vesk::ConstStringZ I_bases[] = { "vesk::IPersistable", };
        static const vesk::ReflectedInterface I_interface = {
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
    void _Register_I() {
        vxVerify(vesk::RegisterReflectedInterface(&_GetReflected( (I*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }

//### $interface+ K
namespace vesk { XTarget* app_GetXTarget(); }
    vesk::ReflectedInterface const& _GetReflected(K const*) {
        static vesk::ConstStringZ K_bases[] = { "J", };
        static const vesk::ReflectedInterface K_interface = {
            "K",
            0,
            K_bases,1,
            0,
            0,0,
            0,0,
            0
        };
        return K_interface;
    }
    
    // Registration of $interface+ K
    void _Register_K() {
        vxVerify(vesk::RegisterReflectedInterface(&_GetReflected( (K*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }
