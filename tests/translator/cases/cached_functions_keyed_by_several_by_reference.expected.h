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
void _calc_f(bool& out,vesk::int32 a,vesk::string8 const& b,vesk::float64 c) const
{ }


struct _depnode_f : public vesk::DGKeyedSyncDepNode<_depnode_f,S,std::pair<vesk::int32,std::pair<vesk::string8,vesk::float64>>,bool>
{
    typedef vesk::DGKeyedSyncDepNode<_depnode_f,S,std::pair<vesk::int32,std::pair<vesk::string8,vesk::float64>>,bool> base;
    using typename base::key_type;
    using typename base::output_type;
    using typename base::map_type;
    _depnode_f() { SetFlag(vesk::DF_PROPAGATE_HARD_DIRTINESS); }
    virtual bool RecalcCache() const
    {
        std::pair<vesk::int32,std::pair<vesk::string8,vesk::float64>> const& _key = _GetKey();
        _self->_calc_f(_output,_key.first,_key.second.first,_key.second.second);
        if (vesk::TypeHasAdditionalSize<output_type>()) UpdateByteSize();
        return true;
    }
    virtual vesk::xstring Name() const
    {
        std::pair<vesk::int32,std::pair<vesk::string8,vesk::float64>> const& _key = _GetKey();
        return vxMakeString("S::f(" << _key.first << ',' << _key.second.first << ',' << _key.second.second << ')');
    }
    virtual vesk::ssize_t EvictionQueueIndex() const { return 7; }
    map_type& _GetMap() const { return _self->_map_f; }
    S const* _GetFinalSelf() const { return _self; }
};
mutable typename _depnode_f::map_type _map_f;
bool const& f(vesk::int32 a,vesk::string8 const& b,vesk::float64 c) const
{
    return _map_f[std::make_pair(a,std::make_pair(b,c))].read(this);
}
int end;

public:
    void EvictDgsNodes() const
    {
        vesk::TryEvict(_map_f);
    }
    
};



#endif // include guard
