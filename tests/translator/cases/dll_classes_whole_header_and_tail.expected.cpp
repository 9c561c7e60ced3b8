#include "t.h"

//### $class geo::Pair
namespace vesk { XTarget* app_GetXTarget(); }
namespace geo
{
} // geo

//### $class+ geo::Shape
namespace vesk { XTarget* app_GetXTarget(); }
namespace geo
{
    vesk::ptr<vesk::IObject> __stdcall Shape::sfnCreateInstance()
    {
        return static_cast<vesk::ptr<vesk::IObject> >(new Shape());
    }
    app_API vesk::ReflectedClass const& _GetReflected(Shape const*)
    {
        static const vesk::octet_t Shape_metadata[] =
        {
            0xe2,0xa2,0x07,0x00,0x00,0x00,0xa4,0x00,0x00
        };
        static const vesk::octet_t Shape_name[] =
        {
            0xe1,0xc1,0x01,0x00,0xa2,0x01,0x00,0x00,0x00,0x10
        };
        static const vesk::octet_t Shape_points[] =
        {
            0x50,0x02,0x00,0x00,0x00,0x44,0x35,0x31,0x20,0x02,0x00
        };
        static const vesk::ReflectedField Shape_fields[] =
        {
            { "name", offsetof(Shape,name), Shape_name },
            { "points", offsetof(Shape,points), Shape_points },
        };
        static const vesk::octet_t Shape_at_return[] =
        {
            0x35,0x31,0x20,0x02,0x00
        };
        static const vesk::octet_t Shape_at_i[] =
        {
            0x04
        };
        static const vesk::octet_t Shape_at_late[] =
        {
            0x36,0x20,0x03,0x00
        };
        static const vesk::ReflectedArg Shape_at_args[] =
        {
            { "i", Shape_at_i },
            { "late", Shape_at_late },
        };
        static const vesk::ReflectedClassMethod Shape_methods[] =
        {
            {"at",{Shape_at_return},Shape_at_args,2,0,true,(vesk::FunctionPointer)(geo::Point const* (__stdcall *)(Shape const* _self,vesk::int32 i,Late& late))&geo::at},
            {"clear",{0},0,0,0,false,(vesk::FunctionPointer)(void (__stdcall *)(Shape* _self))&geo::clear},
        };
        static vesk::ConstStringZ Shape_stringTable[] =
        {
            "meta",
            "colour",
            "geo::Point",
            "Late",
        };
        static vesk::ConstStringZ Shape_interfaces[] =
        {
            "vesk::IObject",
        };
        static const vesk::ReflectedClass Shape_class =
        {
            1,
            "geo::Shape",
            sizeof(Shape),
            Shape_metadata,
            Shape_fields,2,
            0,0,
            0,0,
            Shape_methods,2,
            Shape_stringTable,
            Shape_interfaces,0,1,
            &vesk::IObject::Stubs<Shape>::GetTable(),
            &Shape::sfnCreateInstance,
            {
                sizeof(Shape),
                0,
                0,
                0,
                (vesk::ConstructArrayFn) (void (*)( Shape*, vesk::ssize_t, vesk::ssize_t)) vesk::ConstructArray<Shape>,
                (vesk::CopyConstructArrayFn) (void (*)(Shape*, vesk::ssize_t, Shape const*, vesk::ssize_t, vesk::ssize_t)) vesk::CopyConstructArray<Shape>,
                (vesk::AssignArrayFn) (void (*)(Shape*, vesk::ssize_t, Shape const*, vesk::ssize_t, vesk::ssize_t)) vesk::AssignArray<Shape>,
                (vesk::DestructArrayFn) (void (*)( Shape*, vesk::ssize_t, vesk::ssize_t)) vesk::DestructArray<Shape>,
                0,
                0,
                0,
                0,
                0,
                0
            }
        };
        
        return Shape_class;
    }
    app_API vesk::TypeOps const& _GetTypeOps(Shape const*)
    {
        return vesk::GetReflectedClass<Shape>().m_ops;
    }
    
    vesk::AnyInterface geo::Shape::QueryInterface(const vesk::ReflectedInterface& _ri)
    {
        if (&_ri == &vesk::GetReflectedInterface<vesk::IObject >()) { vesk::ptr<vesk::IObject> p(this); return reinterpret_cast<vesk::AnyInterface&>(p); }
        return vesk::AnyInterface();
    }
    vesk::ReflectedClass const* geo::Shape::GetReflectedClass() const
    {
        return &_GetReflected( (geo::Shape*) 0);
    }
    
    // Registration of $class+ geo::Shape
    void _Register_Shape()
    {
        vxVerify(vesk::RegisterReflectedClass(&_GetReflected( (Shape*) 0),vesk::app_GetXTarget()) == vesk::NSE_OK);
    }
} // geo
