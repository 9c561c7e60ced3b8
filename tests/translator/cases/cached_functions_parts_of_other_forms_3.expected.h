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
void _calc_f_input(vesk::string8& in,vesk::int32 a,bool b) const

{ in = S; } 

vesk::int32 _calc_f(vesk::int32 a,bool b,vesk::string8 in) const
{ return size(in); }


struct _depnode_f : public vesk::DGKeyedAsyncNodeOnInput<_depnode_f,S,std::pair<vesk::int32,bool>,vesk::string8,vesk::int32>
{
    typedef vesk::DGKeyedAsyncNodeOnInput<_depnode_f,S,std::pair<vesk::int32,bool>,vesk::string8,vesk::int32> base;
    using typename base::key_type;
    using typename base::output_type;
    using typename base::map_type;
    using typename base::input_type;
    static void CalcOutput(const S* _self, output_type& _output, const key_type& _key, const input_type& _input)
    {
        _output = _self->_calc_f(_key.first,_key.second,_input);
    }
    static void CalcInput(const S* _self, input_type& _input, const key_type& _key)
    {
        _self->_calc_f_input(_input,_key.first,_key.second);
    }
    virtual vesk::xstring Name() const
    {
        std::pair<vesk::int32,bool> const& _key = _GetKey();
        return vxMakeString("S::f(" << _key.first << ',' << _key.second << ')');
    }
    map_type& _GetMap() const { return _self->_map_f; }
    S const* _GetFinalSelf() const { return _self; }
};
mutable typename _depnode_f::map_type _map_f;
vesk::int32 const& f(vesk::int32 a,bool b) const
{
    return _map_f[std::make_pair(a,b)].read(this);
}
int end;

public:
    void EvictDgsNodes() const
    {
        vesk::TryEvict(_map_f);
    }
    
};



#endif // include guard
