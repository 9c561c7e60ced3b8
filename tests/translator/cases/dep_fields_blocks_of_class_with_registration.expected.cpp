#include "t.h"

//### $class+ n::S
namespace vesk { XTarget* app_GetXTarget(); }
namespace n {
    vesk::ReflectedClass const& _GetReflected(S const*) {
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
            0,0,0,
            0,
            0,
            { sizeof(S), 0, 0, 0, ConstructArray, CopyConstructArray, AssignArray, DestructArray, 0, 0, VisitObjectsInArray, 0, 0, 0 }
        };
        
        return S_class;
    }
    vesk::TypeOps const& _GetTypeOps(S const*) {
        return vesk::GetReflectedClass<S>().m_ops;
    }
    void n::S::EvictDgsNodes_extra() const {
        drop();
    }
    void n::S::VisitObjects(vesk::IObjectVisitor& v) const {
        v << x;
        v << y;
    }
    
    // Registration of $class+ n::S
    void _Register_S() {
        vxVerify(vesk::RegisterReflectedClass(&_GetReflected( (S*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }
} // n
