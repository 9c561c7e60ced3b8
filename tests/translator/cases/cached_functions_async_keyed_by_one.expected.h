#pragma once
#ifndef _app_src_t_h
#define _app_src_t_h

#include "Vesk/vxObject/IObject.h"
template <typename BC>
struct M : public BC
{
    typedef BC BaseClass;
//
vesk::int32 _calc_f(vesk::string8 const& k="") const
{ }


struct _depnode_f : public vesk::DGKeyedAsyncIndepNode<_depnode_f,M,vesk::string8,vesk::int32>
{
    typedef vesk::DGKeyedAsyncIndepNode<_depnode_f,M,vesk::string8,vesk::int32> base;
    using typename base::key_type;
    using typename base::output_type;
    using typename base::map_type;
    static void CalcOutput(const M* _self, output_type& _output, const key_type& _key)
    {
        _output = _self->_calc_f(_key);
    }
    virtual vesk::xstring Name() const
    {
        return vxMakeString("M::f(" << _GetKey() << ')');
    }
    map_type& _GetMap() const { return _self->_map_f; }
    const typename BC::FinalClass* _GetFinalSelf() const { return static_cast<const typename BC::FinalClass*>(_self); }
};
mutable typename _depnode_f::map_type _map_f;
vesk::int32 const& f(vesk::string8 const& k="") const
{
    return _map_f[k].read(this);
}
int end;

public:
    void EvictDgsNodes() const
    {
        BaseClass::EvictDgsNodes();
        vesk::TryEvict(_map_f);
    }
    
};



#endif // include guard
