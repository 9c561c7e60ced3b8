struct M {
    M() { s.Insert(7); }
    
    explicit M(vesk::xset<vesk::int32> const& s_) : s(s_) {}
    void Serialise(vesk::Archive&) const;
    void Deserialise(vesk::InputArchive&);
    void EvictDgsNodes() const;
    void VisitObjects(vesk::IObjectVisitor& _v) const;
    void VisitPrefs(vesk::IPrefVisitor& _v) const;
    bool operator<(M const& _rhs) const {
        return (s < _rhs.s);
    }
    bool operator==(M const& _rhs) const {
        return s == _rhs.s;
    }
    bool operator!=(M const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(M const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(M const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(M const& _rhs) const { return !operator<(_rhs); }
    
    static void GetsPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetsPath() { vesk::Path _path; GetsPath(_path); return _path; }
    vesk::xset<vesk::int32> const& _model__s() const { return s; }
    vesk::xset<vesk::int32>& _model__s() { return s; }
    vesk::xset<vesk::int32> const& Gets() const { return s; }
    static void GetsElementPath(vesk::Path& _path,vesk::int32 const& _k0) { vesk::octet_t* p=_path.InitLocalBuffer(5); p[0]=0; *(vesk::int32*)(p+1)=_k0; }
    static vesk::Path GetsElementPath(vesk::int32 const& _k0) { vesk::Path _path; GetsElementPath(_path,_k0); return _path; }
    bool InsertIntos(vesk::int32 const& _k0) { return s.Insert(_k0); }
    bool DeleteFroms(vesk::int32 const& _k0) { return s.Delete(_k0); }
    
    vesk::xset<vesk::int32> s;
};
template <typename BC>
struct M_model_mixin : public BC {
    using typename BC::FinalClass;
    
    bool operator<(M_model_mixin const& _rhs) const {return _model_ < _rhs._model_;}
    bool operator==(M_model_mixin const& _rhs) const {return _model_ == _rhs._model_;}
    bool operator!=(M_model_mixin const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(M_model_mixin const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(M_model_mixin const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(M_model_mixin const& _rhs) const { return !operator<(_rhs); }
    void EvictDgsNodes() const {BC::EvictDgsNodes();_model_.EvictDgsNodes();}
    void VisitObjects(vesk::IObjectVisitor& _v) const {BC::VisitObjects(_v); _model_.VisitObjects(_v);}
    void VisitPrefs(vesk::IPrefVisitor& _v) const {BC::VisitPrefs(_v); _model_.VisitPrefs(_v);}
    
    static void GetsPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetsPath() { vesk::Path _path; GetsPath(_path); return _path; }
    vesk::xset<vesk::int32> const& _model__s() const { return _model_.s; }
    vesk::xset<vesk::int32>& _model__s() { return _model_.s; }
    vesk::xset<vesk::int32> const& Gets() const { vesk::DataSourceReadBarrier(&_model_.s,vesk::null,"M::_model_.s"); return _model_.s; }
    static void GetsElementPath(vesk::Path& _path,vesk::int32 const& _k0) { vesk::octet_t* p=_path.InitLocalBuffer(5); p[0]=0; *(vesk::int32*)(p+1)=_k0; }
    static vesk::Path GetsElementPath(vesk::int32 const& _k0) { vesk::Path _path; GetsElementPath(_path,_k0); return _path; }
    bool InsertIntos(vesk::int32 const& _k0) { vesk::DataSourceWriteBarrier(&_model_.s,vesk::null,"M::_model_.s"); return _model_.s.Insert(_k0); }
    bool DeleteFroms(vesk::int32 const& _k0) { vesk::DataSourceWriteBarrier(&_model_.s,vesk::null,"M::_model_.s"); return _model_.s.Delete(_k0); }
    union {
        struct {
            operator vesk::xset<vesk::int32> const&() const { return CONST_ATTRIB_CAST(M_model_mixin,s)->Gets(); }
            vesk::xset<vesk::int32> const& read() const { return CONST_ATTRIB_CAST(M_model_mixin,s)->Gets(); }
            vesk::xset<vesk::int32> & write() { return ATTRIB_CAST(M_model_mixin,s)->Writes(); }
            vesk::xset<vesk::int32> const& model() const { return CONST_ATTRIB_CAST(M_model_mixin,s)->_model__s(); }
            vesk::xset<vesk::int32>& model() { return ATTRIB_CAST(M_model_mixin,s)->_model__s(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(M_model_mixin,s)->GetsPath(); }
            bool Insert(vesk::int32 const& _key) {
                return ATTRIB_CAST(M_model_mixin,s)->InsertIntos(_key);
            }
            bool Delete(vesk::int32 const& _key) {
                return ATTRIB_CAST(M_model_mixin,s)->DeleteFroms(_key);
            }
        } s;
    };
    typedef M model_type;
    M const& model() const { return _model_; }
    M& model() { return _model_; }
    M const& read() const { vesk::DataSourceReadBarrier(static_cast<const typename BC::FinalClass*>(this), vesk::null,"M"); return _model_; }
    M & write() { vesk::DataSourceWriteBarrier(static_cast<typename BC::FinalClass*>(this), vesk::null,"M"); return _model_; }
    M _model_;
};

inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,M const& _x) { _x.VisitObjects(_v); return _v; }
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,M const*) { return _v; }
inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,M const& _x) { _x.VisitPrefs(_v); return _v; }

template<typename Archive> inline void Serialise(Archive& _ar,M const& _x) { _x.Serialise(_ar); }

template<typename Archive> inline void Deserialise(Archive& _ar,M& _x) { _x.Deserialise(_ar); }
inline vesk::xostream& operator<<(vesk::xostream& _os,M const& _x) {
    _os << "M(" << _x.s << ')';
    return _os;
}

namespace vesk {
template<> struct TypeTraits<M> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_model; static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<M> {
    static const bool has_reflected_default_ctor = 0; static const bool has_reflected_dtor = 0; static const bool has_reflected_copy_ctor = 0; static const bool has_reflected_equality = 0; static const bool has_reflected_compare = 0; static const bool has_reflected_write_xostream = 0; static const bool has_reflected_serialise = 0; static const bool has_reflected_visit_IObjects = 0; static const bool has_reflected_visit_Prefs = 0; static const bool implements_IObject = 0; static const bool implements_IPersistable = 0; static const bool can_serialise_model = 1; static const bool has_model = 1; static const bool using_model_base_class = 0;
};
} // namespace vesk

template <typename BC>
struct K_model_mixin : public BC {
    using typename BC::FinalClass;
    
    bool operator<(K_model_mixin const& _rhs) const {return _model_ < _rhs._model_;}
    bool operator==(K_model_mixin const& _rhs) const {return _model_ == _rhs._model_;}
    bool operator!=(K_model_mixin const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(K_model_mixin const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(K_model_mixin const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(K_model_mixin const& _rhs) const { return !operator<(_rhs); }
    void EvictDgsNodes() const {BC::EvictDgsNodes();_model_.EvictDgsNodes();}
    void VisitObjects(vesk::IObjectVisitor& _v) const {BC::VisitObjects(_v); _model_.VisitObjects(_v);}
    void VisitPrefs(vesk::IPrefVisitor& _v) const {BC::VisitPrefs(_v); _model_.VisitPrefs(_v);}
    
    static void GetsPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetsPath() { vesk::Path _path; GetsPath(_path); return _path; }
    vesk::xset<vesk::int32> const& _model__s() const { return _model_.s; }
    vesk::xset<vesk::int32>& _model__s() { return _model_.s; }
    vesk::xset<vesk::int32> const& Gets() const { vesk::DataSourceReadBarrier(&_model_.s,vesk::null,"M::_model_.s"); return _model_.s; }
    static void GetsElementPath(vesk::Path& _path,vesk::int32 const& _k0) { vesk::octet_t* p=_path.InitLocalBuffer(5); p[0]=0; *(vesk::int32*)(p+1)=_k0; }
    static vesk::Path GetsElementPath(vesk::int32 const& _k0) { vesk::Path _path; GetsElementPath(_path,_k0); return _path; }
    bool InsertIntos(vesk::int32 const& _k0) { vesk::DataSourceWriteBarrier(&_model_.s,vesk::null,"M::_model_.s"); return _model_.s.Insert(_k0); }
    bool DeleteFroms(vesk::int32 const& _k0) { vesk::DataSourceWriteBarrier(&_model_.s,vesk::null,"M::_model_.s"); return _model_.s.Delete(_k0); }
    union {
        struct {
            operator vesk::xset<vesk::int32> const&() const { return CONST_ATTRIB_CAST(K_model_mixin,s)->Gets(); }
            vesk::xset<vesk::int32> const& read() const { return CONST_ATTRIB_CAST(K_model_mixin,s)->Gets(); }
            vesk::xset<vesk::int32> & write() { return ATTRIB_CAST(K_model_mixin,s)->Writes(); }
            vesk::xset<vesk::int32> const& model() const { return CONST_ATTRIB_CAST(K_model_mixin,s)->_model__s(); }
            vesk::xset<vesk::int32>& model() { return ATTRIB_CAST(K_model_mixin,s)->_model__s(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(K_model_mixin,s)->GetsPath(); }
            bool Insert(vesk::int32 const& _key) {
                return ATTRIB_CAST(K_model_mixin,s)->InsertIntos(_key);
            }
            bool Delete(vesk::int32 const& _key) {
                return ATTRIB_CAST(K_model_mixin,s)->DeleteFroms(_key);
            }
        } s;
    };
    typedef M model_type;
    M const& model() const { return _model_; }
    M& model() { return _model_; }
    M const& read() const { vesk::DataSourceReadBarrier(static_cast<const typename BC::FinalClass*>(this), vesk::null,"K"); return _model_; }
    M & write() { vesk::DataSourceWriteBarrier(static_cast<typename BC::FinalClass*>(this), vesk::null,"K"); return _model_; }
    M _model_;
};
class K;

namespace vesk {
template<> struct TypeTraits<K> {
    static const bool is_exported = 1; static const bool is_reflected = 1; static const bool is_registered = 1; static const vesk::ETypeTraitKind kind = vesk::TTK_class; static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<K> {
    static const bool has_reflected_default_ctor = 1; static const bool has_reflected_dtor = 1; static const bool has_reflected_copy_ctor = 1; static const bool has_reflected_equality = 1; static const bool has_reflected_compare = 1; static const bool has_reflected_write_xostream = 1; static const bool has_reflected_serialise = 1; static const bool has_reflected_visit_IObjects = 0; static const bool has_reflected_visit_Prefs = 0; static const bool implements_IObject = 0; static const bool implements_IPersistable = 0; static const bool can_serialise_model = 0; static const bool has_model = 0; static const bool using_model_base_class = 1;
};
} // namespace vesk
class K : public K_model_mixin<vesk::BaseMixin<K,vesk::EmptyBase>> {
public:
    typedef K_model_mixin<vesk::BaseMixin<K,vesk::EmptyBase>> BaseClass;

    int more;

public:
    
    void Serialise(vesk::Archive&) const;
    void Deserialise(vesk::InputArchive&);
    friend vesk::ReflectedClass const& _GetReflected(K const*);
};

vesk::ReflectedClass const& _GetReflected(K const*);
vesk::TypeOps const& _GetTypeOps(K const*);

inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,K const& _x) { _x.VisitObjects(_v); return _v; }
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,K const*) { return _v; }
inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,K const& _x) { _x.VisitPrefs(_v); return _v; }

template<typename Archive> inline void Serialise(Archive& _ar,K const& _x) { _x.Serialise(_ar); }

template<typename Archive> inline void Deserialise(Archive& _ar,K& _x) { _x.Deserialise(_ar); }

inline vesk::xostream& operator<<(vesk::xostream& _os,K const& _x) { _os << _x._model_; return _os; }

