struct S;

namespace vesk {
template<> struct TypeTraits<S> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_struct; static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<S> {
    static const bool has_reflected_default_ctor = 0; static const bool has_reflected_dtor = 0; static const bool has_reflected_copy_ctor = 0; static const bool has_reflected_equality = 0; static const bool has_reflected_compare = 0; static const bool has_reflected_write_xostream = 0; static const bool has_reflected_serialise = 0; static const bool has_reflected_visit_IObjects = 0; static const bool has_reflected_visit_Prefs = 0; static const bool implements_IObject = 0; static const bool implements_IPersistable = 0; static const bool can_serialise_model = 0; static const bool has_model = 0; static const bool using_model_base_class = 0;
};
} // namespace vesk
struct S
{//
inline vesk::int32 _calc_f() const {
    return 1; 
}


struct _depnode_f : public vesk::DGSyncDepNode<_depnode_f,S,vesk::int32> {
    typedef vesk::DGSyncDepNode<_depnode_f,S,vesk::int32> base;
    using typename base::output_type;
    virtual bool RecalcCache() const {
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
inline vesk::int32 const& f() const {
    return _dn_f.read();
}
void _calc_g(bool& b) const
{ }


struct _depnode_g : public vesk::DGSyncDepNode<_depnode_g,S,bool> {
    typedef vesk::DGSyncDepNode<_depnode_g,S,bool> base;
    using typename base::output_type;
    _depnode_g() { SetFlag(vesk::DF_PROPAGATE_HARD_DIRTINESS); }
    virtual bool RecalcCache() const {
        _GetSelf()->_calc_g(_output);
        if (vesk::TypeHasAdditionalSize<output_type>()) UpdateByteSize();
        return true;
    }
    S const* _GetSelf() const { return CONST_ATTRIB_CAST(S,_dn_g); }
    S const* _GetFinalSelf() const { return _GetSelf(); }
    virtual vesk::xstring Name() const { return "S::g()"; }
} _dn_g;
bool const& g() const {
    return _dn_g.read();
}
vesk::int32 _calc_h(vesk::int32 const& a) const
{ }


struct _depnode_h : public vesk::DGKeyedSyncDepNode<_depnode_h,S,vesk::int32,vesk::int32> {
    typedef vesk::DGKeyedSyncDepNode<_depnode_h,S,vesk::int32,vesk::int32> base;
    using typename base::key_type;
    using typename base::output_type;
    using typename base::map_type;
    virtual bool RecalcCache() const {
        auto _prev = _output;
        _output = _self->_calc_h(_GetKey());
        if (vesk::TypeHasAdditionalSize<output_type>()) UpdateByteSize();
        return _prev != _output;
    }
    virtual vesk::xstring Name() const {
        return vxMakeString("S::h(" << _GetKey() << ')');
    }
    map_type& _GetMap() const { return _self->_map_h; }
    S const* _GetFinalSelf() const { return _self; }
};
mutable typename _depnode_h::map_type _map_h;
vesk::int32 const& h(vesk::int32 const& a) const {
    return _map_h[a].read(this);
}
void _calc_i_input(vesk::string8& in,vesk::int32 a,bool b) const

{ in = S; } 

vesk::int32 _calc_i(vesk::int32 a,bool b,vesk::string8 in) const
{ return size(in); }


struct _depnode_i : public vesk::DGKeyedAsyncNodeOnInput<_depnode_i,S,std::pair<vesk::int32,bool>,vesk::string8,vesk::int32> {
    typedef vesk::DGKeyedAsyncNodeOnInput<_depnode_i,S,std::pair<vesk::int32,bool>,vesk::string8,vesk::int32> base;
    using typename base::key_type;
    using typename base::output_type;
    using typename base::map_type;
    using typename base::input_type;
    static void CalcOutput(const S* _self, output_type& _output, const key_type& _key, const input_type& _input) {
        _output = _self->_calc_i(_key.first,_key.second,_input);
    }
    static void CalcInput(const S* _self, input_type& _input, const key_type& _key) {
        _self->_calc_i_input(_input,_key.first,_key.second);
    }
    virtual vesk::xstring Name() const {
        std::pair<vesk::int32,bool> const& _key = _GetKey();
        return vxMakeString("S::i(" << _key.first << ',' << _key.second << ')');
    }
    map_type& _GetMap() const { return _self->_map_i; }
    S const* _GetFinalSelf() const { return _self; }
};
mutable typename _depnode_i::map_type _map_i;
vesk::int32 const& i(vesk::int32 a,bool b) const {
    return _map_i[std::make_pair(a,b)].read(this);
}
void _calc_k(bool& out,vesk::int32 a,vesk::string8 const& b,vesk::float64 c) const
{ }


struct _depnode_k : public vesk::DGKeyedSyncDepNode<_depnode_k,S,std::pair<vesk::int32,std::pair<vesk::string8,vesk::float64>>,bool> {
    typedef vesk::DGKeyedSyncDepNode<_depnode_k,S,std::pair<vesk::int32,std::pair<vesk::string8,vesk::float64>>,bool> base;
    using typename base::key_type;
    using typename base::output_type;
    using typename base::map_type;
    _depnode_k() { SetFlag(vesk::DF_PROPAGATE_HARD_DIRTINESS); }
    virtual bool RecalcCache() const {
        std::pair<vesk::int32,std::pair<vesk::string8,vesk::float64>> const& _key = _GetKey();
        _self->_calc_k(_output,_key.first,_key.second.first,_key.second.second);
        if (vesk::TypeHasAdditionalSize<output_type>()) UpdateByteSize();
        return true;
    }
    virtual vesk::xstring Name() const {
        std::pair<vesk::int32,std::pair<vesk::string8,vesk::float64>> const& _key = _GetKey();
        return vxMakeString("S::k(" << _key.first << ',' << _key.second.first << ',' << _key.second.second << ')');
    }
    virtual vesk::ssize_t EvictionQueueIndex() const { return 7; }
    map_type& _GetMap() const { return _self->_map_k; }
    S const* _GetFinalSelf() const { return _self; }
};
mutable typename _depnode_k::map_type _map_k;
bool const& k(vesk::int32 a,vesk::string8 const& b,vesk::float64 c) const {
    return _map_k[std::make_pair(a,std::make_pair(b,c))].read(this);
}
int end;

public:
    void EvictDgsNodes() const {
        _dn_f.TryEvict(false);
        _dn_g.TryEvict(false);
        vesk::TryEvict(_map_h);
        vesk::TryEvict(_map_i);
        vesk::TryEvict(_map_k);
    }
    
};


