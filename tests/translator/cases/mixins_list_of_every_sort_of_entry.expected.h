template <typename BC>
struct M : public BC {
    typedef BC BaseClass;
 vesk::int32 a; 
public:
    vesk::int32 Geta() const { return a; }
    void Seta(vesk::int32 _v) { a = _v; }
    
};

template <typename BC> vesk::TypeOps const& _GetTypeOps(M const*) {
    return vesk::GetReflectedClass<M>().m_ops;
}

struct Pos {
    
    Pos() : y(0) {}
    explicit Pos(bool const& y_) : y(y_) {}
    void Serialise(vesk::Archive&) const;
    void Deserialise(vesk::InputArchive&);
    void EvictDgsNodes() const;
    void VisitObjects(vesk::IObjectVisitor& _v) const;
    void VisitPrefs(vesk::IPrefVisitor& _v) const;
    bool operator<(Pos const& _rhs) const {
        return (y < _rhs.y);
    }
    bool operator==(Pos const& _rhs) const {
        return y == _rhs.y;
    }
    bool operator!=(Pos const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(Pos const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(Pos const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(Pos const& _rhs) const { return !operator<(_rhs); }
    
    static void GetyPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetyPath() { vesk::Path _path; GetyPath(_path); return _path; }
    bool const& _model__y() const { return y; }
    bool& _model__y() { return y; }
    bool const& Gety() const { return y; }
    bool& Writey() {  return y; }
    void Sety(bool const& _v) { y = _v; }
    
    bool y;
};
template <typename BC>
struct Pos_model_mixin : public BC {
    using typename BC::FinalClass;
    
    bool operator<(Pos_model_mixin const& _rhs) const {return _model_ < _rhs._model_;}
    bool operator==(Pos_model_mixin const& _rhs) const {return _model_ == _rhs._model_;}
    bool operator!=(Pos_model_mixin const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(Pos_model_mixin const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(Pos_model_mixin const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(Pos_model_mixin const& _rhs) const { return !operator<(_rhs); }
    void EvictDgsNodes() const {BC::EvictDgsNodes();_model_.EvictDgsNodes();}
    void VisitObjects(vesk::IObjectVisitor& _v) const {BC::VisitObjects(_v); _model_.VisitObjects(_v);}
    void VisitPrefs(vesk::IPrefVisitor& _v) const {BC::VisitPrefs(_v); _model_.VisitPrefs(_v);}
    
    static void GetyPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetyPath() { vesk::Path _path; GetyPath(_path); return _path; }
    bool const& _model__y() const { return _model_.y; }
    bool& _model__y() { return _model_.y; }
    bool const& Gety() const { vesk::DataSourceReadBarrier(&_model_.y,vesk::null,"Pos::_model_.y"); return _model_.y; }
    bool& Writey() { vesk::DataSourceWriteBarrier(&_model_.y,vesk::null,"Pos::_model_.y");  return _model_.y; }
    void Sety(bool const& _v) { vesk::DataSourceWriteBarrier(&_model_.y,vesk::null,"Pos::_model_.y"); _model_.y = _v; }
    union {
        struct {
            operator bool const&() const { return CONST_ATTRIB_CAST(Pos_model_mixin,y)->Gety(); }
            bool const& read() const { return CONST_ATTRIB_CAST(Pos_model_mixin,y)->Gety(); }
            bool & write() { return ATTRIB_CAST(Pos_model_mixin,y)->Writey(); }
            bool const& model() const { return CONST_ATTRIB_CAST(Pos_model_mixin,y)->_model__y(); }
            bool& model() { return ATTRIB_CAST(Pos_model_mixin,y)->_model__y(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(Pos_model_mixin,y)->GetyPath(); }
            void operator=(bool const& _v) { ATTRIB_CAST(Pos_model_mixin,y)->Sety(_v); }
        } y;
    };
    typedef Pos model_type;
    Pos const& model() const { return _model_; }
    Pos& model() { return _model_; }
    Pos const& read() const { vesk::DataSourceReadBarrier(static_cast<const typename BC::FinalClass*>(this), vesk::null,"Pos"); return _model_; }
    Pos & write() { vesk::DataSourceWriteBarrier(static_cast<typename BC::FinalClass*>(this), vesk::null,"Pos"); return _model_; }
    Pos _model_;
};

inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,Pos const& _x) { _x.VisitObjects(_v); return _v; }
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,Pos const*) { return _v; }
inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,Pos const& _x) { _x.VisitPrefs(_v); return _v; }

template<typename Archive> inline void Serialise(Archive& _ar,Pos const& _x) { _x.Serialise(_ar); }

template<typename Archive> inline void Deserialise(Archive& _ar,Pos& _x) { _x.Deserialise(_ar); }
inline vesk::xostream& operator<<(vesk::xostream& _os,Pos const& _x) {
    _os << "Pos(" << _x.y << ')';
    return _os;
}

namespace vesk {
template<> struct TypeTraits<Pos> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_model; static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<Pos> {
    static const bool has_reflected_default_ctor = 0; static const bool has_reflected_dtor = 0; static const bool has_reflected_copy_ctor = 0; static const bool has_reflected_equality = 0; static const bool has_reflected_compare = 0; static const bool has_reflected_write_xostream = 0; static const bool has_reflected_serialise = 0; static const bool has_reflected_visit_IObjects = 0; static const bool has_reflected_visit_Prefs = 0; static const bool implements_IObject = 0; static const bool implements_IPersistable = 0; static const bool can_serialise_model = 1; static const bool has_model = 1; static const bool using_model_base_class = 0;
};
} // namespace vesk

namespace n { template <typename BC>
struct T : public BC {
    typedef BC BaseClass;
 
public:
    
};

 }
template <typename BC>
struct K_Mixin_0 : public BC {
    typedef BC BaseClass;
    using typename BC::FinalClass;
 bool b; int plain; 

};

struct K_Mixin_1_model {
    
    K_Mixin_1_model() : z(0) {}
    explicit K_Mixin_1_model(vesk::int8 const& z_) : z(z_) {}
    void Serialise(vesk::Archive&) const;
    void Deserialise(vesk::InputArchive&);
    void EvictDgsNodes() const {vesk::DataSourceEvict(&z);}
    void VisitObjects(vesk::IObjectVisitor& _v) const {}
    void VisitPrefs(vesk::IPrefVisitor& _v) const {}
    bool operator<(K_Mixin_1_model const& _rhs) const {
        return (z < _rhs.z);
    }
    bool operator==(K_Mixin_1_model const& _rhs) const {
        return z == _rhs.z;
    }
    bool operator!=(K_Mixin_1_model const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(K_Mixin_1_model const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(K_Mixin_1_model const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(K_Mixin_1_model const& _rhs) const { return !operator<(_rhs); }
    
    static void GetzPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetzPath() { vesk::Path _path; GetzPath(_path); return _path; }
    vesk::int8 const& _model__z() const { return z; }
    vesk::int8& _model__z() { return z; }
    vesk::int8 const& Getz() const { return z; }
    vesk::int8& Writez() {  return z; }
    void Setz(vesk::int8 const& _v) { z = _v; }
    
    vesk::int8 z;
};
template <typename BC>
struct K_Mixin_1_model_mixin : public BC {
    using typename BC::FinalClass;
    
    bool operator<(K_Mixin_1_model_mixin const& _rhs) const {return _model_ < _rhs._model_;}
    bool operator==(K_Mixin_1_model_mixin const& _rhs) const {return _model_ == _rhs._model_;}
    bool operator!=(K_Mixin_1_model_mixin const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(K_Mixin_1_model_mixin const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(K_Mixin_1_model_mixin const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(K_Mixin_1_model_mixin const& _rhs) const { return !operator<(_rhs); }
    void EvictDgsNodes() const {BC::EvictDgsNodes();_model_.EvictDgsNodes();}
    void VisitObjects(vesk::IObjectVisitor& _v) const {BC::VisitObjects(_v); _model_.VisitObjects(_v);}
    void VisitPrefs(vesk::IPrefVisitor& _v) const {BC::VisitPrefs(_v); _model_.VisitPrefs(_v);}
    
    static void GetzPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetzPath() { vesk::Path _path; GetzPath(_path); return _path; }
    vesk::int8 const& _model__z() const { return _model_.z; }
    vesk::int8& _model__z() { return _model_.z; }
    vesk::int8 const& Getz() const { vesk::DataSourceReadBarrier(&_model_.z,vesk::null,"K_Mixin_1::_model_.z"); return _model_.z; }
    vesk::int8& Writez() { vesk::DataSourceWriteBarrier(&_model_.z,vesk::null,"K_Mixin_1::_model_.z");  return _model_.z; }
    void Setz(vesk::int8 const& _v) { vesk::DataSourceWriteBarrier(&_model_.z,vesk::null,"K_Mixin_1::_model_.z"); _model_.z = _v; }
    union {
        struct {
            operator vesk::int8 const&() const { return CONST_ATTRIB_CAST(K_Mixin_1_model_mixin,z)->Getz(); }
            vesk::int8 const& read() const { return CONST_ATTRIB_CAST(K_Mixin_1_model_mixin,z)->Getz(); }
            vesk::int8 & write() { return ATTRIB_CAST(K_Mixin_1_model_mixin,z)->Writez(); }
            vesk::int8 const& model() const { return CONST_ATTRIB_CAST(K_Mixin_1_model_mixin,z)->_model__z(); }
            vesk::int8& model() { return ATTRIB_CAST(K_Mixin_1_model_mixin,z)->_model__z(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(K_Mixin_1_model_mixin,z)->GetzPath(); }
            void operator=(vesk::int8 const& _v) { ATTRIB_CAST(K_Mixin_1_model_mixin,z)->Setz(_v); }
        } z;
    };
    typedef K_Mixin_1_model model_type;
    K_Mixin_1_model const& model() const { return _model_; }
    K_Mixin_1_model& model() { return _model_; }
    K_Mixin_1_model const& read() const { vesk::DataSourceReadBarrier(static_cast<const typename BC::FinalClass*>(this), vesk::null,"K_Mixin_1"); return _model_; }
    K_Mixin_1_model & write() { vesk::DataSourceWriteBarrier(static_cast<typename BC::FinalClass*>(this), vesk::null,"K_Mixin_1"); return _model_; }
    K_Mixin_1_model _model_;
};
class K;

namespace vesk {
template<> struct TypeTraits<K> {
    static const bool is_exported = 1; static const bool is_reflected = 1; static const bool is_registered = 1; static const vesk::ETypeTraitKind kind = vesk::TTK_class; static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<K> {
    static const bool has_reflected_default_ctor = 1; static const bool has_reflected_dtor = 1; static const bool has_reflected_copy_ctor = 1; static const bool has_reflected_equality = 0; static const bool has_reflected_compare = 0; static const bool has_reflected_write_xostream = 0; static const bool has_reflected_serialise = 0; static const bool has_reflected_visit_IObjects = 0; static const bool has_reflected_visit_Prefs = 0; static const bool implements_IObject = 0; static const bool implements_IPersistable = 0; static const bool can_serialise_model = 0; static const bool has_model = 0; static const bool using_model_base_class = 0;
};
} // namespace vesk
class K : public K_Mixin_1_model_mixin<n::T<other::U <Pos_model_mixin<K_Mixin_0<M<vesk::BaseMixin<K,vesk::EmptyBase> > > >,int, 3 >,char > > {
public:
    typedef K_Mixin_1_model_mixin<n::T<other::U <Pos_model_mixin<K_Mixin_0<M<vesk::BaseMixin<K,vesk::EmptyBase> > > >,int, 3 >,char > > BaseClass;


public:
    vesk::int32 Geta() const { return a; }
    void Seta(vesk::int32 _v) { a = _v; }
    bool Getb() const { return b; }
    void Setb(bool _v) { b = _v; }
    
    friend vesk::ReflectedClass const& _GetReflected(K const*);
};

vesk::ReflectedClass const& _GetReflected(K const*);
vesk::TypeOps const& _GetTypeOps(K const*);

