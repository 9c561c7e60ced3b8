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
void w_create(int*& w) const
{ } 
void w_destroy(int*& w) const
{ } 
bool w_evictable() const
{ return false; } 
void w_evict() const
{ } 
void w_visit(vesk::IObjectVisitor& _v) const
{ _v << S::shared; }
int* _w_;
struct Indepnode_w : vesk::DGIndepNode
{
    typedef int* value_type;
    Indepnode_w()
    {
        S* _self = ATTRIB_CAST(S,w);
        _self->w_create(_self->_w_);
    }
    ~Indepnode_w()
    {
        S* _self = ATTRIB_CAST(S,w);
        _self->w_destroy(_self->_w_);
    }
    virtual vesk::ssize_t ByteSize() const { return 0; }
    virtual vesk::xstring Name() const { return "S::w"; }
    virtual void VisitContainingObject(vesk::IObjectVisitor& _v) const
    {
        S const* _self = CONST_ATTRIB_CAST(S,w);
        _self->w_visit(_v);
    }
    virtual bool IsEvictable() const
    {
        S const* _self = CONST_ATTRIB_CAST(S,w);
        return _self->w_evictable();
    }
    virtual void OnEvict() const
    {
        S const* _self = CONST_ATTRIB_CAST(S,w);
        _self->w_evict();
    }
    value_type read() const { ReadBarrier(); return CONST_ATTRIB_CAST(S,w)->_w_; }
    value_type& write() { OnChange(); return ATTRIB_CAST(S,w)->_w_; }
    operator value_type() const { return CONST_ATTRIB_CAST(S,w)->Getw(); }
    void operator=(value_type _v) { write() = _v; }
} w;
int* Getw() const { w.ReadBarrier(); return _w_; }
void Setw(int* _v) { w.OnChange(); _w_ = _v; }

int end;

public:
    void EvictDgsNodes() const
    {
        w.TryEvict(false);
    }
    
};



#endif // include guard
