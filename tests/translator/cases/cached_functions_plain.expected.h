#pragma once
#ifndef _app_src_t_h
#define _app_src_t_h

#include "Vesk/vxObject/IObject.h"
struct S;

namespace vesk
{
template<> struct TypeTraits<S>
{
    static const bool is_exported = 0;
    static const bool is_reflected = 0;
    static const bool is_registered = 0;
    static const vesk::ETypeTraitKind kind = vesk::TTK_struct;
    static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<S>
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
struct S
{//
inline vesk::int32 _calc_f() const
{
    return 1; 
}


struct _depnode_f : public vesk::DGSyncDepNode<_depnode_f,S,vesk::int32>
{
    typedef vesk::DGSyncDepNode<_depnode_f,S,vesk::int32> base;
    using typename base::output_type;
    virtual bool RecalcCache() const
    {
        vesk::int32 _prev = _output;
        _output = _GetSelf()->_calc_f();
        if (vesk::TypeHasAdditionalSize<output_type>()) UpdateByteSize();
        return _prev != _output;
    }
    S const* _GetSelf() const { return CONST_ATTRIB_CAST(S,_dn_f); }
    S const* _GetFinalSelf() const { return _GetSelf(); }
    virtual vesk::xstring Name() const { return "S::f()"; }
    virtual vesk::ssize_t EvictionQueueIndex() const { return 3; }
} _dn_f;
inline vesk::int32 const& f() const
{
    return _dn_f.read();
}
int end;

public:
    void EvictDgsNodes() const
    {
        _dn_f.TryEvict(false);
    }
    
};



#endif // include guard
