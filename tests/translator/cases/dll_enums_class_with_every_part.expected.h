#pragma once
#ifndef _app_src_t_h
#define _app_src_t_h

#include "Vesk/vxObject/IObject.h"
class Level : public vesk::EnumBaseForRefinedLabels<Level>
{
    public:
    enum Enum : int
    {
        low=0,
        mid=1,
        high=10,
        top=11
    };
    Level(Enum _v) : EnumBaseForRefinedLabels(_v) {}
    explicit Level(int _v = 1) : EnumBaseForRefinedLabels(_v) {}
    enum { LEN = 4 };
    static vesk::ConstStringZ const * stringArray()
    {
        static vesk::ConstStringZ const _s[] = 
        {
            "low",
            "mid",
            "high",
            "top",
        };
        return _s;
    }
    static const vesk::int32* valueArray()
    {
        static const vesk::int32 _s[] = 
        {
            0,
            1,
            10,
            11,
        };
        return _s;
    }
    static const bool* enabledArray()
    {
        static const bool _s[] = 
        {
            true,
            false,
            true,
            true,
        };
        return _s;
    }
};
app_API vesk::ReflectedEnum const& _GetReflected(Level const*);
inline vesk::TypeOps const& _GetTypeOps(Level const*) { return vesk::GetTypeOps<vesk::int32>(); }

namespace vesk
{
template<> struct TypeTraits<Level>
{
    static const bool is_exported = 1;
    static const bool is_reflected = 1;
    static const bool is_registered = 1;
    static const vesk::ETypeTraitKind kind = vesk::TTK_enum;
    static const bool has_metadata = 1;
};
} // namespace vesk


#endif // include guard
