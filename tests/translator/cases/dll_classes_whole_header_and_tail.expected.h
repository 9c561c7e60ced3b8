#pragma once
#ifndef _app_src_t_h
#define _app_src_t_h

#include "Vesk/vxObject/IObject.h"
class Late;

class app_API Later;
app_API vesk::ReflectedClass const& _GetReflected(Later const*);
app_API vesk::TypeOps const& _GetTypeOps(Later const*);

namespace geo
{
struct Point;

} //geo
namespace vesk
{
template<> struct TypeTraits<geo::Point>
{
    static const bool is_exported = 0;
    static const bool is_reflected = 0;
    static const bool is_registered = 0;
    static const vesk::ETypeTraitKind kind = vesk::TTK_struct;
    static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<geo::Point>
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
namespace geo
{
struct Point
{ int x; vesk::int32 y; 
public:
    vesk::int32 Gety() const { return y; }
    void Sety(vesk::int32 _v) { y = _v; }
    
};


class Shape;

} //geo
namespace vesk
{
template<> struct TypeTraits<geo::Shape>
{
    static const bool is_exported = 1;
    static const bool is_reflected = 1;
    static const bool is_registered = 1;
    static const vesk::ETypeTraitKind kind = vesk::TTK_class;
    static const bool has_metadata = 1;
};
template<> struct ClassTypeTraits<geo::Shape>
{
    static const bool has_reflected_default_ctor = 1;
    static const bool has_reflected_dtor = 1;
    static const bool has_reflected_copy_ctor = 1;
    static const bool has_reflected_equality = 0;
    static const bool has_reflected_compare = 0;
    static const bool has_reflected_write_xostream = 0;
    static const bool has_reflected_serialise = 0;
    static const bool has_reflected_visit_IObjects = 0;
    static const bool has_reflected_visit_Prefs = 0;
    static const bool implements_IObject = 1;
    static const bool implements_IPersistable = 0;
    static const bool can_serialise_model = 0;
    static const bool has_model = 0;
    static const bool using_model_base_class = 0;
};
template<> struct directly_implements_interface<geo::Shape,vesk::IObject> { static const bool value = true; };
} // namespace vesk
namespace geo
{
class app_API Shape : public vesk::IObjectBaseMixin<Shape,vesk::EmptyBase>,Base,private other::Base<int>

{
public:
    typedef vesk::IObjectBaseMixin<Shape,vesk::EmptyBase> BaseClass;

public:
    Shape() : m_count(0) { }
    vesk::string8 name;
    vesk::Array<vesk::xvector<geo::Point const*>,2> points;
    Point const* at(int32 i, Late& late) const { return 0; }
    void clear();
private:
    int m_count;

public:
    vesk::string8 Getname() const { return name; }
    void Setname(vesk::string8 _v) { name = _v; }
    vesk::Array<vesk::xvector<geo::Point const*>,2> Getpoints() const { return points; }
    void Setpoints(vesk::Array<vesk::xvector<geo::Point const*>,2> _v) { points = _v; }
    
    static vesk::ptr<vesk::IObject> __stdcall sfnCreateInstance();
    friend app_API vesk::ReflectedClass const& _GetReflected(Shape const*);
    vesk::AnyInterface QueryInterface(const vesk::ReflectedInterface&);
    vesk::ReflectedClass const* GetReflectedClass() const;
};

app_API vesk::ReflectedClass const& _GetReflected(Shape const*);
app_API vesk::TypeOps const& _GetTypeOps(Shape const*);

inline geo::Point const* __stdcall at(Shape const* _self,vesk::int32 i,Late& late) { return _self->at(i,late); }
inline void __stdcall clear(Shape* _self) { _self->clear(); }
template <typename T, int N>
class Pair
{ public: T items[N]; 
public:
    
    friend vesk::ReflectedClass const& _GetReflected(Pair const*)
    {
        static const vesk::ReflectedClass Pair_class =
        {
            1,
            "geo::Pair",
            sizeof(Pair<T,N>),
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
                sizeof(Pair),
                0,
                0,
                0,
                (vesk::ConstructArrayFn) (void (*)( Pair*, vesk::ssize_t, vesk::ssize_t)) vesk::ConstructArray<Pair>,
                (vesk::CopyConstructArrayFn) (void (*)(Pair*, vesk::ssize_t, Pair const*, vesk::ssize_t, vesk::ssize_t)) vesk::CopyConstructArray<Pair>,
                (vesk::AssignArrayFn) (void (*)(Pair*, vesk::ssize_t, Pair const*, vesk::ssize_t, vesk::ssize_t)) vesk::AssignArray<Pair>,
                (vesk::DestructArrayFn) (void (*)( Pair*, vesk::ssize_t, vesk::ssize_t)) vesk::DestructArray<Pair>,
                0,
                0,
                0,
                0,
                0,
                0
            }
        };
        
        return Pair_class;
    }
};

template <typename T, int N> vesk::TypeOps const& _GetTypeOps(Pair<T,N> const*)
{
    return vesk::GetReflectedClass<Pair<T,N>>().m_ops;
}

}

#endif // include guard
