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
void a_calc(vesk::int32& a) const
{
    a = 1
}
mutable vesk::int32 _a_;
struct Depnode_a : vesk::DGDepNode
{
    typedef vesk::int32 value_type;
    Depnode_a() : vesk::DGDepNode(vesk::DF_SYNC_DEP|vesk::DF_PROPAGATE_HARD_DIRTINESS) {}
    virtual vesk::ssize_t ByteSize() const
    {
        S const* _self = CONST_ATTRIB_CAST(S,a);
        return vesk::CacheValueAdditionalSize(_self->_a_);
    }
    virtual vesk::xstring Name() const { return "S::a"; }
    virtual void VisitContainingObject(vesk::IObjectVisitor& _v) const
    {
        S const* _self = CONST_ATTRIB_CAST(S,a);
        _v << _self->_a_;
    }
    virtual bool RecalcCache() const
    {
        S const* _self = CONST_ATTRIB_CAST(S,a);
        _self->a_calc(_self->_a_);
        if (vesk::TypeHasAdditionalSize<value_type>()) UpdateByteSize();
        return true;
    }
    virtual bool IsEvictable() const
    {
        S const* _self = CONST_ATTRIB_CAST(S,a);
        return vesk::CacheValueIsEvictable(_self->_a_);
    }
    virtual void OnEvict() const
    {
        S const* _self = CONST_ATTRIB_CAST(S,a);
        vesk::OnEvictCacheValue(_self->_a_); vesk::ClearCacheValue(_self->_a_);
    }
    value_type read() const { return CONST_ATTRIB_CAST(S,a)->Geta(); }
    operator value_type() const { return CONST_ATTRIB_CAST(S,a)->Geta(); }
} a;
vesk::int32 Geta() const { a.ReadBarrier(); return _a_; }

int end;

public:
    void EvictDgsNodes() const
    {
        a.TryEvict(false);
    }
    
};



#endif // include guard
