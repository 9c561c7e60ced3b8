struct S;

namespace vesk {
template<> struct TypeTraits<S> {
    static const bool is_exported = 1; static const bool is_reflected = 1; static const bool is_registered = 1; static const vesk::ETypeTraitKind kind = vesk::TTK_struct; static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<S> {
    static const bool has_reflected_default_ctor = 1; static const bool has_reflected_dtor = 1; static const bool has_reflected_copy_ctor = 1; static const bool has_reflected_equality = 0; static const bool has_reflected_compare = 0; static const bool has_reflected_write_xostream = 0; static const bool has_reflected_serialise = 0; static const bool has_reflected_visit_IObjects = 0; static const bool has_reflected_visit_Prefs = 0; static const bool implements_IObject = 0; static const bool implements_IPersistable = 0; static const bool can_serialise_model = 0; static const bool has_model = 0; static const bool using_model_base_class = 0;
};
} // namespace vesk
struct S
{//
void c_calc(vesk::int32& c) const {
    c = 1
}
mutable vesk::int32 _c_;
struct Depnode_c : vesk::DGDepNode {
    typedef vesk::int32 value_type;
    Depnode_c() : vesk::DGDepNode(vesk::DF_SYNC_DEP|vesk::DF_PROPAGATE_HARD_DIRTINESS) {}
    virtual vesk::ssize_t ByteSize() const {
        S const* _self = CONST_ATTRIB_CAST(S,c);
        return vesk::CacheValueAdditionalSize(_self->_c_);
    }
    virtual vesk::xstring Name() const { return "S::c"; }
    virtual void VisitContainingObject(vesk::IObjectVisitor& _v) const {
        S const* _self = CONST_ATTRIB_CAST(S,c);
        _v << _self->_c_;
    }
    virtual bool RecalcCache() const {
        S const* _self = CONST_ATTRIB_CAST(S,c);
        _self->c_calc(_self->_c_);
        if (vesk::TypeHasAdditionalSize<value_type>()) UpdateByteSize();
        return true;
    }
    virtual bool IsEvictable() const {
        S const* _self = CONST_ATTRIB_CAST(S,c);
        return vesk::CacheValueIsEvictable(_self->_c_);
    }
    virtual void OnEvict() const {
        S const* _self = CONST_ATTRIB_CAST(S,c);
        vesk::OnEvictCacheValue(_self->_c_); vesk::ClearCacheValue(_self->_c_);
    }
    value_type read() const { return CONST_ATTRIB_CAST(S,c)->Getc(); }
    operator value_type() const { return CONST_ATTRIB_CAST(S,c)->Getc(); }
} c;
vesk::int32 Getc() const { c.ReadBarrier(); return _c_; }

void d_calc() const {
    go();
    done();
}
struct Depnode_d : vesk::DGDepNode {
    typedef void value_type;
    Depnode_d() : vesk::DGDepNode(vesk::DF_SYNC_DEP|vesk::DF_PROPAGATE_HARD_DIRTINESS) {}
    virtual vesk::ssize_t ByteSize() const {
        return 0;
    }
    virtual vesk::xstring Name() const { return "S::d"; }
    virtual void VisitContainingObject(vesk::IObjectVisitor& _v) const {
    }
    virtual bool RecalcCache() const {
        S const* _self = CONST_ATTRIB_CAST(S,d);
        _self->d_calc();
        return true;
    }
    virtual bool IsEvictable() const {
        return true;
    }
    void read() const { ReadBarrier(); }
    void operator()() const { ReadBarrier(); }
} d;

void w_create(vesk::int32*& w) const
{ } 
void w_destroy(vesk::int32*& w) const
{ } 
bool w_evictable() const
{ return false; } 
void w_evict() const
{ } 
void w_visit(vesk::IObjectVisitor& _v) const
{ _v << S::shared; }
vesk::int32* _w_;
struct Indepnode_w : vesk::DGIndepNode {
    typedef vesk::int32* value_type;
    Indepnode_w() {
        S* _self = ATTRIB_CAST(S,w);
        _self->w_create(_self->_w_);
    }
    ~Indepnode_w() {
        S* _self = ATTRIB_CAST(S,w);
        _self->w_destroy(_self->_w_);
    }
    virtual vesk::ssize_t ByteSize() const { return 0; }
    virtual vesk::xstring Name() const { return "S::w"; }
    virtual void VisitContainingObject(vesk::IObjectVisitor& _v) const {
        S const* _self = CONST_ATTRIB_CAST(S,w);
        _self->w_visit(_v);
    }
    virtual bool IsEvictable() const {
        S const* _self = CONST_ATTRIB_CAST(S,w);
        return _self->w_evictable();
    }
    virtual void OnEvict() const {
        S const* _self = CONST_ATTRIB_CAST(S,w);
        _self->w_evict();
    }
    value_type read() const { ReadBarrier(); return CONST_ATTRIB_CAST(S,w)->_w_; }
    value_type& write() { OnChange(); return ATTRIB_CAST(S,w)->_w_; }
    operator value_type() const { return CONST_ATTRIB_CAST(S,w)->Getw(); }
    void operator=(value_type _v) { write() = _v; }
} w;
vesk::int32* Getw() const { w.ReadBarrier(); return _w_; }
void Setw(vesk::int32* _v) { w.OnChange(); _w_ = _v; }

void a_calc(vesk::string8& a) const
{ a = name(); } 
void a_create(vesk::string8& a) const
{ make(a); } 
void a_destroy(vesk::string8& a) const
{ }

void a_visit(vesk::IObjectVisitor& _v) const
{ _v << S::shared; } 
bool a_evictable() const
{ return this->GetThisAsFinalClass()->free(); }

void a_evict() const
{ vesk::DollarNew(new X(1)); $other; } 
void a_invalidate() const {
    stale();
}

mutable vesk::string8 _a_;
struct Depnode_a : vesk::DGDepNode {
    typedef vesk::string8 value_type;
    Depnode_a() : vesk::DGDepNode(vesk::DF_SYNC_DEP) {
        S const* _self = CONST_ATTRIB_CAST(S,a);
        _self->a_create(_self->_a_);
    }
    ~Depnode_a() {
        S const* _self = CONST_ATTRIB_CAST(S,a);
        _self->a_destroy(_self->_a_);
    }
    virtual vesk::ssize_t ByteSize() const {
        S const* _self = CONST_ATTRIB_CAST(S,a);
        return vesk::CacheValueAdditionalSize(_self->_a_);
    }
    virtual vesk::xstring Name() const { return "S::a"; }
    virtual void VisitContainingObject(vesk::IObjectVisitor& _v) const {
        S const* _self = CONST_ATTRIB_CAST(S,a);
        _self->a_visit(_v);
    }
    virtual bool RecalcCache() const {
        S const* _self = CONST_ATTRIB_CAST(S,a);
        auto _prev = _self->_a_;
        _self->a_calc(_self->_a_);
        if (vesk::TypeHasAdditionalSize<value_type>()) UpdateByteSize();
        return _prev != _self->_a_;
    }
    virtual bool IsEvictable() const {
        S const* _self = CONST_ATTRIB_CAST(S,a);
        return _self->a_evictable();
    }
    virtual void OnEvict() const {
        S const* _self = CONST_ATTRIB_CAST(S,a);
        _self->a_evict();
    }
    virtual void OnInvalidate() const {
        S const* _self = CONST_ATTRIB_CAST(S,a);
        _self->a_invalidate();
    }
    value_type const& read() const { return CONST_ATTRIB_CAST(S,a)->Geta(); }
    operator value_type const&() const { return CONST_ATTRIB_CAST(S,a)->Geta(); }
} a;
vesk::string8 const& Geta() const { a.ReadBarrier(); return _a_; }

void e_calc(bool& e) const {
    e = true
}
mutable bool _e_;
struct Depnode_e : vesk::DGDepNode {
    typedef bool value_type;
    Depnode_e() : vesk::DGDepNode(vesk::DF_SYNC_DEP) {}
    virtual vesk::ssize_t ByteSize() const {
        S const* _self = CONST_ATTRIB_CAST(S,e);
        return vesk::CacheValueAdditionalSize(_self->_e_);
    }
    virtual vesk::xstring Name() const { return "S::e"; }
    virtual void VisitContainingObject(vesk::IObjectVisitor& _v) const {
        S const* _self = CONST_ATTRIB_CAST(S,e);
        _v << _self->_e_;
    }
    virtual bool RecalcCache() const {
        S const* _self = CONST_ATTRIB_CAST(S,e);
        auto _prev = _self->_e_;
        _self->e_calc(_self->_e_);
        if (vesk::TypeHasAdditionalSize<value_type>()) UpdateByteSize();
        return _prev != _self->_e_;
    }
    virtual bool IsEvictable() const {
        S const* _self = CONST_ATTRIB_CAST(S,e);
        return vesk::CacheValueIsEvictable(_self->_e_);
    }
    virtual void OnEvict() const {
        S const* _self = CONST_ATTRIB_CAST(S,e);
        vesk::OnEvictCacheValue(_self->_e_); vesk::ClearCacheValue(_self->_e_);
    }
    value_type read() const { return CONST_ATTRIB_CAST(S,e)->Gete(); }
    operator value_type() const { return CONST_ATTRIB_CAST(S,e)->Gete(); }
} e;
bool Gete() const { e.ReadBarrier(); return _e_; }

vesk::string8 _f_;
struct Indepnode_f : vesk::DGIndepNode {
    typedef vesk::string8 value_type;
    virtual vesk::ssize_t ByteSize() const { return 0; }
    virtual vesk::xstring Name() const { return "S::f"; }
    virtual void VisitContainingObject(vesk::IObjectVisitor& _v) const {
        S const* _self = CONST_ATTRIB_CAST(S,f);
        _v << _self->_f_;
    }
    value_type const& read() const { ReadBarrier(); return CONST_ATTRIB_CAST(S,f)->_f_; }
    value_type& write() { OnChange(); return ATTRIB_CAST(S,f)->_f_; }
    operator value_type const&() const { return CONST_ATTRIB_CAST(S,f)->Getf(); }
    void operator=(value_type const& _v) { write() = _v; }
} f;
vesk::string8 const& Getf() const { f.ReadBarrier(); return _f_; }
void Setf(vesk::string8 const& _v) { f.OnChange(); _f_ = _v; }

int end;

public:
    void EvictDgsNodes() const {
        c.TryEvict(false);
        d.TryEvict(false);
        w.TryEvict(false);
        a.TryEvict(false);
        e.TryEvict(false);
        f.TryEvict(false);
    }
    
    friend vesk::ReflectedClass const& _GetReflected(S const*);
};

vesk::ReflectedClass const& _GetReflected(S const*);
vesk::TypeOps const& _GetTypeOps(S const*);

