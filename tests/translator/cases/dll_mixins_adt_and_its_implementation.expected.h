#pragma once
#ifndef _app_src_t_h
#define _app_src_t_h

#include "Vesk/vxObject/IObject.h"
struct A;
app_API vesk::ReflectedClass const& _GetReflected(A const*);
app_API vesk::TypeOps const& _GetTypeOps(A const*);

app_API vesk::int32 __stdcall get(A const* _self,vesk::int32 i);
app_API void __stdcall set(A* _self,vesk::string8 const& s);
namespace vesk
{
template<> struct TypeTraits<A>
{
    static const bool is_exported = 1;
    static const bool is_reflected = 1;
    static const bool is_registered = 1;
    static const vesk::ETypeTraitKind kind = vesk::TTK_adt;
    static const bool has_metadata = 1;
};
template<> struct ClassTypeTraits<A>
{
    static const bool has_reflected_default_ctor = 0;
    static const bool has_reflected_dtor = 0;
    static const bool has_reflected_copy_ctor = 0;
    static const bool has_reflected_equality = 0;
    static const bool has_reflected_compare = 0;
    static const bool has_reflected_write_xostream = 0;
    static const bool has_reflected_serialise = 0;
    static const bool has_reflected_visit_IObjects = 0;
    static const bool has_reflected_visit_Prefs = 0;
    static const bool implements_IObject = 0;
    static const bool implements_IPersistable = 0;
    static const bool can_serialise_model = 0;
    static const bool has_model = 0;
    static const bool using_model_base_class = 0;
};
} // namespace vesk


#endif // include guard
