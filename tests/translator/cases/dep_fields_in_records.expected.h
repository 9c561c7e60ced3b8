#pragma once
#ifndef _app_src_t_h
#define _app_src_t_h

#include "Vesk/vxObject/IObject.h"
struct S;

namespace vesk
{
template<> struct TypeTraits<S>
{
    static const bool is_exported = 1;
    static const bool is_reflected = 1;
    static const bool is_registered = 1;
    static const vesk::ETypeTraitKind kind = vesk::TTK_struct;
    static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<S>
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
    static const bool implements_IObject = 0;
    static const bool implements_IPersistable = 0;
    static const bool can_serialise_model = 0;
    static const bool has_model = 0;
    static const bool using_model_base_class = 0;
};
} // namespace vesk
struct S
{
    void a_calc(vesk::int32& a) const
{
    a = 1
}
mutable vesk::int32 _a_;
struct Depnode_a : vesk::DGDepNode
{
    typedef vesk::int32 value_type;
    Depnode_a() : vesk::DGDepNode(vesk::DF_SYNC_DEP) {}
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
        auto _prev = _self->_a_;
        _self->a_calc(_self->_a_);
        if (vesk::TypeHasAdditionalSize<value_type>()) UpdateByteSize();
        return _prev != _self->_a_;
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

    void b_calc() const
{
    
}
struct Depnode_b : vesk::DGDepNode
{
    typedef void value_type;
    Depnode_b() : vesk::DGDepNode(vesk::DF_SYNC_DEP|vesk::DF_PROPAGATE_HARD_DIRTINESS) {}
    virtual vesk::ssize_t ByteSize() const
    {
        return 0;
    }
    virtual vesk::xstring Name() const { return "S::b"; }
    virtual void VisitContainingObject(vesk::IObjectVisitor& _v) const
    {
    }
    virtual bool RecalcCache() const
    {
        S const* _self = CONST_ATTRIB_CAST(S,b);
        _self->b_calc();
        return true;
    }
    virtual bool IsEvictable() const
    {
        return true;
    }
    void read() const { ReadBarrier(); }
    void operator()() const { ReadBarrier(); }
} b;

    void c_calc(bool& c) const
{
    c = true
}
mutable bool _c_;
struct Depnode_c : vesk::DGDepNode
{
    typedef bool value_type;
    Depnode_c() : vesk::DGDepNode(vesk::DF_SYNC_DEP) {}
    virtual vesk::ssize_t ByteSize() const
    {
        S const* _self = CONST_ATTRIB_CAST(S,c);
        return vesk::CacheValueAdditionalSize(_self->_c_);
    }
    virtual vesk::xstring Name() const { return "S::c"; }
    virtual void VisitContainingObject(vesk::IObjectVisitor& _v) const
    {
        S const* _self = CONST_ATTRIB_CAST(S,c);
        _v << _self->_c_;
    }
    virtual bool RecalcCache() const
    {
        S const* _self = CONST_ATTRIB_CAST(S,c);
        auto _prev = _self->_c_;
        _self->c_calc(_self->_c_);
        if (vesk::TypeHasAdditionalSize<value_type>()) UpdateByteSize();
        return _prev != _self->_c_;
    }
    virtual bool IsEvictable() const
    {
        S const* _self = CONST_ATTRIB_CAST(S,c);
        return vesk::CacheValueIsEvictable(_self->_c_);
    }
    virtual void OnEvict() const
    {
        S const* _self = CONST_ATTRIB_CAST(S,c);
        vesk::OnEvictCacheValue(_self->_c_); vesk::ClearCacheValue(_self->_c_);
    }
    value_type read() const { return CONST_ATTRIB_CAST(S,c)->Getc(); }
    operator value_type() const { return CONST_ATTRIB_CAST(S,c)->Getc(); }
} c;
bool Getc() const { c.ReadBarrier(); return _c_; }

    vesk::string8 _d_;
struct Indepnode_d : vesk::DGIndepNode
{
    typedef vesk::string8 value_type;
    virtual vesk::ssize_t ByteSize() const { return 0; }
    virtual vesk::xstring Name() const { return "S::d"; }
    virtual void VisitContainingObject(vesk::IObjectVisitor& _v) const
    {
        S const* _self = CONST_ATTRIB_CAST(S,d);
        _v << _self->_d_;
    }
    value_type const& read() const { ReadBarrier(); return CONST_ATTRIB_CAST(S,d)->_d_; }
    value_type& write() { OnChange(); return ATTRIB_CAST(S,d)->_d_; }
    operator value_type const&() const { return CONST_ATTRIB_CAST(S,d)->Getd(); }
    void operator=(value_type const& _v) { write() = _v; }
} d;
vesk::string8 const& Getd() const { d.ReadBarrier(); return _d_; }
void Setd(vesk::string8 const& _v) { d.OnChange(); _d_ = _v; }


public:
    void EvictDgsNodes() const
    {
        a.TryEvict(false);
        b.TryEvict(false);
        c.TryEvict(false);
        d.TryEvict(false);
    }
    
    friend vesk::ReflectedClass const& _GetReflected(S const*);
};

vesk::ReflectedClass const& _GetReflected(S const*);
vesk::TypeOps const& _GetTypeOps(S const*);


#endif // include guard
