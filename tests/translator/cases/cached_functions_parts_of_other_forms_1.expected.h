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
void _calc_f(bool& b) const
{ }


struct _depnode_f : public vesk::DGSyncDepNode<_depnode_f,S,bool>
{
    typedef vesk::DGSyncDepNode<_depnode_f,S,bool> base;
    using typename base::output_type;
    _depnode_f() { SetFlag(vesk::DF_PROPAGATE_HARD_DIRTINESS); }
    virtual bool RecalcCache() const
    {
        _GetSelf()->_calc_f(_output);
        if (vesk::TypeHasAdditionalSize<output_type>()) UpdateByteSize();
        return true;
    }
    S const* _GetSelf() const { return CONST_ATTRIB_CAST(S,_dn_f); }
    S const* _GetFinalSelf() const { return _GetSelf(); }
    virtual vesk::xstring Name() const { return "S::f()"; }
} _dn_f;
bool const& f() const
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
