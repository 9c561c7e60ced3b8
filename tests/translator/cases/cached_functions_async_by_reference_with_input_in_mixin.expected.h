#pragma once
#ifndef _app_src_t_h
#define _app_src_t_h

#include "Vesk/vxObject/IObject.h"
template <typename BC>
struct M : public BC
{
    typedef BC BaseClass;
//
void _calc_f_input(vesk::string8& in) const
{
    in = name()
}
void _calc_f(vesk::xvector<vesk::int32>& out,vesk::string8 in) const
{ }


struct _depnode_f : public vesk::DGAsyncNodeOnInput<_depnode_f,M,vesk::string8,vesk::xvector<vesk::int32>>
{
    typedef vesk::DGAsyncNodeOnInput<_depnode_f,M,vesk::string8,vesk::xvector<vesk::int32>> base;
    using typename base::output_type;
    using typename base::input_type;
    _depnode_f() { SetFlag(vesk::DF_ASYNC_IO); }
    static void CalcOutput(const M* _self, output_type& _output, const input_type& _input)
    {
        _self->_calc_f(_output,_input);
    }
    static void CalcInput(const M* _self, input_type& _input)
    {
        _self->_calc_f_input(_input);
    }
    M const* _GetSelf() const { return CONST_ATTRIB_CAST(M,_dn_f); }
    const typename BC::FinalClass* _GetFinalSelf() const { return static_cast<const typename BC::FinalClass*>(_GetSelf()); }
    virtual vesk::xstring Name() const { return "M::f()"; }
} _dn_f;
vesk::xvector<vesk::int32> const& f() const
{
    return _dn_f.read();
}
int end;

public:
    void EvictDgsNodes() const
    {
        BaseClass::EvictDgsNodes();
        _dn_f.TryEvict(false);
    }
    
};



#endif // include guard
