#include "t.h"
namespace a
{
namespace b
{
vesk::ReflectionByteCode _GetReflected(S const* const*)
{
    static const vesk::octet_t bc[] =
    {
        0x35,0x31,0x20,0x00,0x00
    };
    static vesk::ConstStringZ _stringTable[] =
    {
        "S",
    };
    return vesk::ReflectionByteCode(bc,_stringTable);
}
vesk::TypeOps const& _GetTypeOps(S const* const*)
{
    static vesk::TypeOps typeOps =
    {
        sizeof(S const*),
        (vesk::CompareVariableFn) (bool (*)(S const* const*, S const* const*)) vesk::VariableEqual<S const*>,
        (vesk::CompareVariableFn) (bool (*)(S const* const*, S const* const*)) vesk::VariableLess<S const*>,
        (vesk::PrintVariableFn) (void (*)(vesk::xostream&, S const* const*)) vesk::PrintVariable<S const*>,
        (vesk::ConstructArrayFn) (void (*)( S const**, vesk::ssize_t, vesk::ssize_t)) vesk::ConstructArray<S const*>,
        (vesk::CopyConstructArrayFn) (void (*)(S const**, vesk::ssize_t, S const* const*, vesk::ssize_t, vesk::ssize_t)) vesk::CopyConstructArray<S const*>,
        (vesk::AssignArrayFn) (void (*)(S const**, vesk::ssize_t, S const* const*, vesk::ssize_t, vesk::ssize_t)) vesk::AssignArray<S const*>,
        (vesk::DestructArrayFn) (void (*)( S const**, vesk::ssize_t, vesk::ssize_t)) vesk::DestructArray<S const*>,
        (vesk::SerialiseArrayFn) (void (*)(vesk::Archive&, S const* const*, vesk::ssize_t, vesk::ssize_t)) vesk::SerialiseArray<S const*>,
        (vesk::DeserialiseArrayFn) (void (*)(vesk::InputArchive&, S const**, vesk::ssize_t, vesk::ssize_t)) vesk::DeserialiseArray<S const*>,
        (vesk::VisitObjectsInArrayFn) (void (*)(vesk::IObjectVisitor&, S const* const*, vesk::ssize_t, vesk::ssize_t)) vesk::VisitObjectsInArray<S const*>,
        (vesk::VisitPrefsInArrayFn) (void (*)(vesk::IPrefVisitor&, S const* const*, vesk::ssize_t, vesk::ssize_t)) vesk::VisitPrefsInArray<S const*>,
        (vesk::FindInArrayFn) (vesk::ssize_t (*)(S const* const*, vesk::ssize_t, vesk::ssize_t, S const* const*)) vesk::BinaryLowerBound<S const*>,
        (vesk::FindInArrayFn) (vesk::ssize_t (*)(S const* const*, vesk::ssize_t, vesk::ssize_t, S const* const*)) vesk::BinaryUpperBound<S const*>
    };
    return typeOps;
}
void _Register_ptr_S()
{
    vxVerify(vesk::RegisterTypeOps(vesk::ReflectionByteCodeValue(_GetReflected((S const**)0)),&_GetTypeOps((S const**)0)));
}
} // b
} // a
namespace a
{
namespace b
{
vesk::ReflectionByteCode _GetReflected(vesk::xvector<vesk::int32> const*)
{
    static const vesk::octet_t bc[] =
    {
        0x44,0x04
    };
    return vesk::ReflectionByteCode(bc,NULL);
}
vesk::TypeOps const& _GetTypeOps(vesk::xvector<vesk::int32> const*)
{
    static vesk::TypeOps typeOps =
    {
        sizeof(vesk::xvector<vesk::int32>),
        (vesk::CompareVariableFn) (bool (*)(vesk::xvector<vesk::int32> const*, vesk::xvector<vesk::int32> const*)) vesk::VariableEqual<vesk::xvector<vesk::int32>>,
        (vesk::CompareVariableFn) (bool (*)(vesk::xvector<vesk::int32> const*, vesk::xvector<vesk::int32> const*)) vesk::VariableLess<vesk::xvector<vesk::int32>>,
        (vesk::PrintVariableFn) (void (*)(vesk::xostream&, vesk::xvector<vesk::int32> const*)) vesk::PrintVariable<vesk::xvector<vesk::int32>>,
        (vesk::ConstructArrayFn) (void (*)( vesk::xvector<vesk::int32>*, vesk::ssize_t, vesk::ssize_t)) vesk::ConstructArray<vesk::xvector<vesk::int32>>,
        (vesk::CopyConstructArrayFn) (void (*)(vesk::xvector<vesk::int32>*, vesk::ssize_t, vesk::xvector<vesk::int32> const*, vesk::ssize_t, vesk::ssize_t)) vesk::CopyConstructArray<vesk::xvector<vesk::int32>>,
        (vesk::AssignArrayFn) (void (*)(vesk::xvector<vesk::int32>*, vesk::ssize_t, vesk::xvector<vesk::int32> const*, vesk::ssize_t, vesk::ssize_t)) vesk::AssignArray<vesk::xvector<vesk::int32>>,
        (vesk::DestructArrayFn) (void (*)( vesk::xvector<vesk::int32>*, vesk::ssize_t, vesk::ssize_t)) vesk::DestructArray<vesk::xvector<vesk::int32>>,
        (vesk::SerialiseArrayFn) (void (*)(vesk::Archive&, vesk::xvector<vesk::int32> const*, vesk::ssize_t, vesk::ssize_t)) vesk::SerialiseArray<vesk::xvector<vesk::int32>>,
        (vesk::DeserialiseArrayFn) (void (*)(vesk::InputArchive&, vesk::xvector<vesk::int32>*, vesk::ssize_t, vesk::ssize_t)) vesk::DeserialiseArray<vesk::xvector<vesk::int32>>,
        (vesk::VisitObjectsInArrayFn) (void (*)(vesk::IObjectVisitor&, vesk::xvector<vesk::int32> const*, vesk::ssize_t, vesk::ssize_t)) vesk::VisitObjectsInArray<vesk::xvector<vesk::int32>>,
        (vesk::VisitPrefsInArrayFn) (void (*)(vesk::IPrefVisitor&, vesk::xvector<vesk::int32> const*, vesk::ssize_t, vesk::ssize_t)) vesk::VisitPrefsInArray<vesk::xvector<vesk::int32>>,
        (vesk::FindInArrayFn) (vesk::ssize_t (*)(vesk::xvector<vesk::int32> const*, vesk::ssize_t, vesk::ssize_t, vesk::xvector<vesk::int32> const*)) vesk::BinaryLowerBound<vesk::xvector<vesk::int32>>,
        (vesk::FindInArrayFn) (vesk::ssize_t (*)(vesk::xvector<vesk::int32> const*, vesk::ssize_t, vesk::ssize_t, vesk::xvector<vesk::int32> const*)) vesk::BinaryUpperBound<vesk::xvector<vesk::int32>>
    };
    return typeOps;
}
void _Register_xvector_int32()
{
    vxVerify(vesk::RegisterTypeOps(vesk::ReflectionByteCodeValue(_GetReflected((vesk::xvector<vesk::int32>*)0)),&_GetTypeOps((vesk::xvector<vesk::int32>*)0)));
}
} // b
} // a
