template <typename BC>
struct M : public BC {
    typedef BC BaseClass;
//
void _calc_f_input(vesk::string8& in) const {
    in = name()
}
void _calc_f(vesk::xvector<vesk::int32>& out,vesk::string8 in) const
{ }


struct _depnode_f : public vesk::DGAsyncNodeOnInput<_depnode_f,M,vesk::string8,vesk::xvector<vesk::int32>> {
    typedef vesk::DGAsyncNodeOnInput<_depnode_f,M,vesk::string8,vesk::xvector<vesk::int32>> base;
    using typename base::output_type;
    using typename base::input_type;
    _depnode_f() { SetFlag(vesk::DF_ASYNC_IO); }
    static void CalcOutput(const M* _self, output_type& _output, const input_type& _input) {
        _self->_calc_f(_output,_input);
    }
    static void CalcInput(const M* _self, input_type& _input) {
        _self->_calc_f_input(_input);
    }
    M const* _GetSelf() const { return CONST_ATTRIB_CAST(M,_dn_f); }
    const typename BC::FinalClass* _GetFinalSelf() const { return static_cast<const typename BC::FinalClass*>(_GetSelf()); }
    virtual vesk::xstring Name() const { return "M::f()"; }
} _dn_f;
vesk::xvector<vesk::int32> const& f() const {
    return _dn_f.read();
}
vesk::int32 _calc_g(vesk::string8 const& k="") const
{ }


struct _depnode_g : public vesk::DGKeyedAsyncIndepNode<_depnode_g,M,vesk::string8,vesk::int32> {
    typedef vesk::DGKeyedAsyncIndepNode<_depnode_g,M,vesk::string8,vesk::int32> base;
    using typename base::key_type;
    using typename base::output_type;
    using typename base::map_type;
    static void CalcOutput(const M* _self, output_type& _output, const key_type& _key) {
        _output = _self->_calc_g(_key);
    }
    virtual vesk::xstring Name() const {
        return vxMakeString("M::g(" << _GetKey() << ')');
    }
    map_type& _GetMap() const { return _self->_map_g; }
    const typename BC::FinalClass* _GetFinalSelf() const { return static_cast<const typename BC::FinalClass*>(_self); }
};
mutable typename _depnode_g::map_type _map_g;
vesk::int32 const& g(vesk::string8 const& k="") const {
    return _map_g[k].read(this);
}
int end;

public:
    void EvictDgsNodes() const {
        BaseClass::EvictDgsNodes();
        _dn_f.TryEvict(false);
        vesk::TryEvict(_map_g);
    }
    
};


