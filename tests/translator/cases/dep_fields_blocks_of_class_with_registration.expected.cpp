#include "t.h"

//### $class+ n::S
namespace vesk { XTarget* app_GetXTarget(); }
namespace n {
    vesk::ptr<vesk::IObject> __stdcall S::sfnCreateInstance() {
        return static_cast<vesk::ptr<vesk::IObject> >(new S());
    }
    vesk::ReflectedClass const& _GetReflected(S const*) {
        static vesk::ConstStringZ S_interfaces[] = { "vesk::IObject", };
        static const vesk::ReflectedClass S_class = {
            1,
            "n::S",
            sizeof(S),
            0,
            0,0,
            0,0,
            0,0,
            0,0,
            0,
            S_interfaces,0,1,
            &vesk::IObject::Stubs<S>::GetTable(),
            &S::sfnCreateInstance,
            { sizeof(S), 0, 0, 0, ConstructArray, CopyConstructArray, AssignArray, DestructArray, 0, 0, VisitObjectsInArray, 0, 0, 0 }
        };
        
        return S_class;
    }
    vesk::TypeOps const& _GetTypeOps(S const*) {
        return vesk::GetReflectedClass<S>().m_ops;
    }
    
    vesk::AnyInterface n::S::QueryInterface(const vesk::ReflectedInterface& _ri) {
        if (&_ri == &vesk::GetReflectedInterface<vesk::IObject >()) { vesk::ptr<vesk::IObject> p(this); return reinterpret_cast<vesk::AnyInterface&>(p); }
        return vesk::AnyInterface();
    }
    vesk::ReflectedClass const* n::S::GetReflectedClass() const {
        return &_GetReflected( (n::S*) 0);
    }
    void n::S::EvictDgsNodes_extra() const {
        drop();
    }
    void n::S::VisitObjects(vesk::IObjectVisitor& v) const {
        BaseClass::VisitObjects(v);
        v << x;
        v << y;
    }
    
    // Registration of $class+ n::S
    void _Register_S() {
        vxVerify(vesk::RegisterReflectedClass(&_GetReflected( (S*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }
} // n
