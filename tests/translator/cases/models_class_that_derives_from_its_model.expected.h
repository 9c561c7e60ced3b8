struct I {
    struct FnTable {
        vesk::IObject::FnTable _IObject;
    };
    I(void* _self, const FnTable* table) : m_self(_self), m_table(table) {}
    
    void AssignFrom(I& _rhs) { m_self = _rhs.m_self; m_table = _rhs.m_table; }
    void AssignFrom(I const& _rhs) const { const_cast<I*>(this)->m_self = _rhs.m_self; const_cast<I*>(this)->m_table = _rhs.m_table; }
    
    template<typename T> struct Stubs {
        static const FnTable& GetTable() {
            static const FnTable t = { {
                },
            };
            return t;
        }
    };
    
    template<typename T> void CoerceFrom(T* _rhs) { m_self = _rhs; m_table = &Stubs<T>::GetTable(); }
    template<typename T> void CoerceFrom(const T* _rhs) const { const_cast<I*>(this)->m_self = const_cast<T*>(_rhs); const_cast<I*>(this)->m_table = &Stubs<T>::GetTable(); }
    
    
    operator vesk::IObject() const { return vesk::IObject(m_self, &m_table->_IObject); }
    
    union {
        void* m_self;
    };
    FnTable const* m_table;
};
template <typename BC>
struct IDelegatorMixin : public BC {
};

vesk::ReflectedInterface const& _GetReflected(I const*);

namespace vesk {
template<> struct TypeTraits<I> {
    static const bool is_exported = 1; static const bool is_reflected = 1; static const bool is_registered = 1; static const vesk::ETypeTraitKind kind = vesk::TTK_interface; static const bool has_metadata = 0;
};
template<> struct InterfaceTypeTraits<I> {
    static const bool is_ipc = false; static const bool is_rmi = false;
};
template<> struct _is_direct_superinterface_of<vesk::IObject,I> { static const bool value = true; };
} // namespace vesk

struct S;
struct S_model {
    
    S_model() : n(0) {}
    S_model(vesk::pref<I> const& p_,vesk::int32 const& n_) : p(p_),n(n_) {}
    void Serialise(vesk::Archive&) const;
    void Deserialise(vesk::InputArchive&);
    void VisitObjects(vesk::IObjectVisitor& _v) const;
    void VisitPrefs(vesk::IPrefVisitor& _v) const;
    bool operator<(S_model const& _rhs) const {
        return (p < _rhs.p || (p == _rhs.p &&
        (n < _rhs.n)));
    }
    bool operator==(S_model const& _rhs) const {
        return p == _rhs.p &&
        n == _rhs.n;
    }
    bool operator!=(S_model const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(S_model const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(S_model const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(S_model const& _rhs) const { return !operator<(_rhs); }
    
    static void GetpPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetpPath() { vesk::Path _path; GetpPath(_path); return _path; }
    vesk::pref<I> const& _model__p() const { return p; }
    vesk::pref<I>& _model__p() { return p; }
    vesk::pref<I> const& Getp() const { return p; }
    vesk::pref<I>& Writep() {  return p; }
    void Setp(vesk::pref<I> const& _v) { p = _v; }
    
    static void GetnPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=1; }
    static vesk::Path GetnPath() { vesk::Path _path; GetnPath(_path); return _path; }
    vesk::int32 const& _model__n() const { return n; }
    vesk::int32& _model__n() { return n; }
    vesk::int32 const& Getn() const { return n; }
    vesk::int32& Writen() {  return n; }
    void Setn(vesk::int32 const& _v) { n = _v; }
    
    vesk::pref<I> p;
    vesk::int32 n;
};
template <typename BC>
struct S_model_mixin : public BC {
    using typename BC::FinalClass;
    
    bool operator<(S_model_mixin const& _rhs) const {return _model_ < _rhs._model_;}
    bool operator==(S_model_mixin const& _rhs) const {return _model_ == _rhs._model_;}
    bool operator!=(S_model_mixin const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(S_model_mixin const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(S_model_mixin const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(S_model_mixin const& _rhs) const { return !operator<(_rhs); }
    void EvictDgsNodes() const {BC::EvictDgsNodes();vesk::EvictIndepFieldsUnderObject(static_cast<const typename BC::FinalClass*>(this));}
    void VisitObjects(vesk::IObjectVisitor& _v) const {BC::VisitObjects(_v); _model_.VisitObjects(_v);}
    void VisitPrefs(vesk::IPrefVisitor& _v) const {BC::VisitPrefs(_v); _model_.VisitPrefs(_v);}
    
    static void GetpPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetpPath() { vesk::Path _path; GetpPath(_path); return _path; }
    vesk::pref<I> const& _model__p() const { return _model_.p; }
    vesk::pref<I>& _model__p() { return _model_.p; }
    vesk::pref<I> const& Getp() const { vesk::IndepFieldReadBarrier(static_cast<const typename BC::FinalClass*>(this),GetpPath()); return _model_.p; }
    void Setp(vesk::pref<I> const& _v) { vesk::genop_Assign_VisitPrefs(static_cast<typename BC::FinalClass*>(this),GetpPath(),_model_.p,_v); }
    
    static void GetnPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=1; }
    static vesk::Path GetnPath() { vesk::Path _path; GetnPath(_path); return _path; }
    vesk::int32 const& _model__n() const { return _model_.n; }
    vesk::int32& _model__n() { return _model_.n; }
    vesk::int32 const& Getn() const { vesk::IndepFieldReadBarrier(static_cast<const typename BC::FinalClass*>(this),GetnPath()); return _model_.n; }
    void Setn(vesk::int32 const& _v) { vesk::genop_Assign(static_cast<typename BC::FinalClass*>(this),GetnPath(),_model_.n,_v); }
    union {
        struct {
            operator vesk::pref<I> const&() const { return CONST_ATTRIB_CAST(S_model_mixin,p)->Getp(); }
            vesk::pref<I> const& read() const { return CONST_ATTRIB_CAST(S_model_mixin,p)->Getp(); }
            vesk::pref<I> const& model() const { return CONST_ATTRIB_CAST(S_model_mixin,p)->_model__p(); }
            vesk::pref<I>& model() { return ATTRIB_CAST(S_model_mixin,p)->_model__p(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(S_model_mixin,p)->GetpPath(); }
            vesk::pref<I> operator->() const { return CONST_ATTRIB_CAST(S_model_mixin,p)->Getp(); }
            I operator*() const { return *CONST_ATTRIB_CAST(S_model_mixin,p)->Getp(); }
            vesk::ptr<I > Get() const { return CONST_ATTRIB_CAST(S_model_mixin,p)->Getp().Get(); }
            void operator=(vesk::pref<I> const& _v) { ATTRIB_CAST(S_model_mixin,p)->Setp(_v); }
        } p;
        struct {
            operator vesk::int32 const&() const { return CONST_ATTRIB_CAST(S_model_mixin,n)->Getn(); }
            vesk::int32 const& read() const { return CONST_ATTRIB_CAST(S_model_mixin,n)->Getn(); }
            vesk::int32 const& model() const { return CONST_ATTRIB_CAST(S_model_mixin,n)->_model__n(); }
            vesk::int32& model() { return ATTRIB_CAST(S_model_mixin,n)->_model__n(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(S_model_mixin,n)->GetnPath(); }
            void operator=(vesk::int32 const& _v) { ATTRIB_CAST(S_model_mixin,n)->Setn(_v); }
        } n;
    };
    typedef S_model model_type;
    S_model const& model() const { return _model_; }
    S_model& model() { return _model_; }
    S_model const& read() const { vesk::IndepFieldReadBarrier(static_cast<const typename BC::FinalClass*>(this), vesk::Path()); return _model_; }
    S_model _model_;
};

namespace vesk {
template<> struct TypeTraits<S> {
    static const bool is_exported = 1; static const bool is_reflected = 1; static const bool is_registered = 1; static const vesk::ETypeTraitKind kind = vesk::TTK_struct; static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<S> {
    static const bool has_reflected_default_ctor = 1; static const bool has_reflected_dtor = 1; static const bool has_reflected_copy_ctor = 1; static const bool has_reflected_equality = 1; static const bool has_reflected_compare = 1; static const bool has_reflected_write_xostream = 1; static const bool has_reflected_serialise = 1; static const bool has_reflected_visit_IObjects = 1; static const bool has_reflected_visit_Prefs = 1; static const bool implements_IObject = 1; static const bool implements_IPersistable = 0; static const bool can_serialise_model = 1; static const bool has_model = 1; static const bool using_model_base_class = 1;
};
template<> struct directly_implements_interface<S,I> { static const bool value = true; };
template<> struct indirectly_implements_interface<S,vesk::IObject> { static const bool value = true; };
} // namespace vesk
struct S : public S_model_mixin<vesk::IObjectBaseMixin<S,vesk::EmptyBase>> {
    typedef S_model_mixin<vesk::IObjectBaseMixin<S,vesk::EmptyBase>> BaseClass;
 
public:
    
    void Serialise(vesk::Archive&) const;
    void Deserialise(vesk::InputArchive&);
    static vesk::ptr<vesk::IObject> __stdcall sfnCreateInstance();
    friend vesk::ReflectedClass const& _GetReflected(S const*);
    vesk::AnyInterface QueryInterface(const vesk::ReflectedInterface&);
    vesk::ReflectedClass const* GetReflectedClass() const;
};

vesk::ReflectedClass const& _GetReflected(S const*);
vesk::TypeOps const& _GetTypeOps(S const*);

inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,S const& _x) { _x.VisitObjects(_v); return _v; }
inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,S const& _x) { _x.VisitPrefs(_v); return _v; }

template<typename Archive> inline void Serialise(Archive& _ar,S const& _x) { _x.Serialise(_ar); }

template<typename Archive> inline void Deserialise(Archive& _ar,S& _x) { _x.Deserialise(_ar); }
inline vesk::xostream& operator<<(vesk::xostream& _os,S const& _x) {
    _os << "S\n";
    vesk::ScopeWriter2 sw(_os);
    _os << "p = " << _x._model_.p << '\n';
    _os << "n = " << _x._model_.n << '\n';
    return _os;
}

