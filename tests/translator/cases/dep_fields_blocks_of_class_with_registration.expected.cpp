#include "t.h"

//### $class+ n::S
namespace vesk { XTarget* app_GetXTarget(); }
namespace n
{
    vesk::ReflectedClass const& _GetReflected(S const*)
    {
        static const vesk::ReflectedClass S_class =
        {
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
                (vesk::VisitObjectsInArrayFn) (void (*)(vesk::IObjectVisitor&, S const*, vesk::ssize_t, vesk::ssize_t)) vesk::VisitObjectsInArray<S>,
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
    void n::S::EvictDgsNodes_extra() const
    {
        drop();
    }
    void n::S::VisitObjects(vesk::IObjectVisitor& v) const
    {
        v << x;
        v << y;
    }
    
    // Registration of $class+ n::S
    void _Register_S()
    {
        vxVerify(vesk::RegisterReflectedClass(&_GetReflected( (S*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }
} // n
