enum E : int {
    e1
};
template<typename Archive> inline void Serialise(Archive& _ar,E _x) { vesk::SerialiseVariableLengthUint(_ar, (int)_x); }
template<typename Archive> inline void Deserialise(Archive& _ar,E& _x) { vesk::DeserialiseVariableLengthUint(_ar, (int&)_x); }

namespace vesk {
template<> struct TypeTraits<E> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_enum; static const bool has_metadata = 0;
};
} // namespace vesk
 struct M {
    explicit M(bool* f)  : flag(f) { n = 1; }
    M(int a, int b) { }
    
    M() : flag(0),kind((E)0),n(0) {}
    M(bool* const& flag_,E const& kind_,vesk::uint8 const& n_,vesk::pref<vesk::IObject> const& v_) : flag(flag_),kind(kind_),n(n_),v(v_) {}
    void EvictDgsNodes() const;
    void VisitObjects(vesk::IObjectVisitor& _v) const;
    void VisitPrefs(vesk::IPrefVisitor& _v) const;
    bool operator<(M const& _rhs) const {
        return (flag < _rhs.flag || (flag == _rhs.flag &&
        (kind < _rhs.kind || (kind == _rhs.kind &&
        (n < _rhs.n || (n == _rhs.n &&
        (v < _rhs.v)))))));
    }
    bool operator==(M const& _rhs) const {
        return flag == _rhs.flag &&
        kind == _rhs.kind &&
        n == _rhs.n &&
        v == _rhs.v;
    }
    bool operator!=(M const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(M const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(M const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(M const& _rhs) const { return !operator<(_rhs); }
    
    static void GetflagPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetflagPath() { vesk::Path _path; GetflagPath(_path); return _path; }
    bool* const& _model__flag() const { return flag; }
    bool*& _model__flag() { return flag; }
    bool* const& Getflag() const { return flag; }
    bool*& Writeflag() {  return flag; }
    void Setflag(bool* const& _v) { flag = _v; }
    
    static void GetkindPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=1; }
    static vesk::Path GetkindPath() { vesk::Path _path; GetkindPath(_path); return _path; }
    E const& _model__kind() const { return kind; }
    E& _model__kind() { return kind; }
    E const& Getkind() const { return kind; }
    E& Writekind() {  return kind; }
    void Setkind(E const& _v) { kind = _v; }
    
    static void GetnPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=2; }
    static vesk::Path GetnPath() { vesk::Path _path; GetnPath(_path); return _path; }
    vesk::uint8 const& _model__n() const { return n; }
    vesk::uint8& _model__n() { return n; }
    vesk::uint8 const& Getn() const { return n; }
    void Offsetn(vesk::uint8 const& _v) { n += _v; }
    
    static void GetvPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=3; }
    static vesk::Path GetvPath() { vesk::Path _path; GetvPath(_path); return _path; }
    vesk::pref<vesk::IObject> const& _model__v() const { return v; }
    vesk::pref<vesk::IObject>& _model__v() { return v; }
    vesk::pref<vesk::IObject> const& Getv() const { return v; }
    vesk::pref<vesk::IObject>& Writev() {  return v; }
    void Setv(vesk::pref<vesk::IObject> const& _v) { v = _v; }
    
    bool* flag;
    E kind;
    vesk::uint8 n;
    vesk::pref<vesk::IObject> v;
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
    
    static void GetflagPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetflagPath() { vesk::Path _path; GetflagPath(_path); return _path; }
    bool* const& _model__flag() const { return _model_.flag; }
    bool*& _model__flag() { return _model_.flag; }
    bool* const& Getflag() const { vesk::DataSourceReadBarrier(&_model_.flag,vesk::null,"M::_model_.flag"); return _model_.flag; }
    bool*& Writeflag() { vesk::DataSourceWriteBarrier(&_model_.flag,vesk::null,"M::_model_.flag");  return _model_.flag; }
    void Setflag(bool* const& _v) { vesk::DataSourceWriteBarrier(&_model_.flag,vesk::null,"M::_model_.flag"); _model_.flag = _v; }
    
    static void GetkindPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=1; }
    static vesk::Path GetkindPath() { vesk::Path _path; GetkindPath(_path); return _path; }
    E const& _model__kind() const { return _model_.kind; }
    E& _model__kind() { return _model_.kind; }
    E const& Getkind() const { vesk::DataSourceReadBarrier(&_model_.kind,vesk::null,"M::_model_.kind"); return _model_.kind; }
    E& Writekind() { vesk::DataSourceWriteBarrier(&_model_.kind,vesk::null,"M::_model_.kind");  return _model_.kind; }
    void Setkind(E const& _v) { vesk::DataSourceWriteBarrier(&_model_.kind,vesk::null,"M::_model_.kind"); _model_.kind = _v; }
    
    static void GetnPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=2; }
    static vesk::Path GetnPath() { vesk::Path _path; GetnPath(_path); return _path; }
    vesk::uint8 const& _model__n() const { return _model_.n; }
    vesk::uint8& _model__n() { return _model_.n; }
    vesk::uint8 const& Getn() const { vesk::DataSourceReadBarrier(&_model_.n,vesk::null,"M::_model_.n"); return _model_.n; }
    void Offsetn(vesk::uint8 const& _v) { vesk::DataSourceWriteBarrier(&_model_.n,vesk::null,"M::_model_.n"); _model_.n += _v; }
    
    static void GetvPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=3; }
    static vesk::Path GetvPath() { vesk::Path _path; GetvPath(_path); return _path; }
    vesk::pref<vesk::IObject> const& _model__v() const { return _model_.v; }
    vesk::pref<vesk::IObject>& _model__v() { return _model_.v; }
    vesk::pref<vesk::IObject> const& Getv() const { vesk::DataSourceReadBarrier(&_model_.v,vesk::null,"M::_model_.v"); return _model_.v; }
    vesk::pref<vesk::IObject>& Writev() { vesk::DataSourceWriteBarrier(&_model_.v,vesk::null,"M::_model_.v");  return _model_.v; }
    void Setv(vesk::pref<vesk::IObject> const& _v) { vesk::DataSourceWriteBarrier(&_model_.v,vesk::null,"M::_model_.v"); _model_.v = _v; }
    union {
        struct {
            operator bool* const&() const { return CONST_ATTRIB_CAST(M_model_mixin,flag)->Getflag(); }
            bool* const& read() const { return CONST_ATTRIB_CAST(M_model_mixin,flag)->Getflag(); }
            bool* & write() { return ATTRIB_CAST(M_model_mixin,flag)->Writeflag(); }
            bool* const& model() const { return CONST_ATTRIB_CAST(M_model_mixin,flag)->_model__flag(); }
            bool*& model() { return ATTRIB_CAST(M_model_mixin,flag)->_model__flag(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(M_model_mixin,flag)->GetflagPath(); }
            bool* operator->() const { return CONST_ATTRIB_CAST(M_model_mixin,flag)->Getflag(); }
            void operator=(bool* const& _v) { ATTRIB_CAST(M_model_mixin,flag)->Setflag(_v); }
        } flag;
        struct {
            operator E const&() const { return CONST_ATTRIB_CAST(M_model_mixin,kind)->Getkind(); }
            E const& read() const { return CONST_ATTRIB_CAST(M_model_mixin,kind)->Getkind(); }
            E & write() { return ATTRIB_CAST(M_model_mixin,kind)->Writekind(); }
            E const& model() const { return CONST_ATTRIB_CAST(M_model_mixin,kind)->_model__kind(); }
            E& model() { return ATTRIB_CAST(M_model_mixin,kind)->_model__kind(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(M_model_mixin,kind)->GetkindPath(); }
            void operator=(E const& _v) { ATTRIB_CAST(M_model_mixin,kind)->Setkind(_v); }
        } kind;
        struct {
            operator vesk::uint8() const { return CONST_ATTRIB_CAST(M_model_mixin,n)->Getn(); }
            vesk::uint8 const& read() const { return CONST_ATTRIB_CAST(M_model_mixin,n)->Getn(); }
            vesk::uint8 & write() { return ATTRIB_CAST(M_model_mixin,n)->Writen(); }
            vesk::uint8 const& model() const { return CONST_ATTRIB_CAST(M_model_mixin,n)->_model__n(); }
            vesk::uint8& model() { return ATTRIB_CAST(M_model_mixin,n)->_model__n(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(M_model_mixin,n)->GetnPath(); }
            void operator+=(vesk::uint8 const& n) { ATTRIB_CAST(M_model_mixin,n)->Offsetn(n); }
            void operator-=(vesk::uint8 const& n) { ATTRIB_CAST(M_model_mixin,n)->Offsetn(-(vesk::int8)n); }
        } n;
        struct {
            operator vesk::pref<vesk::IObject> const&() const { return CONST_ATTRIB_CAST(M_model_mixin,v)->Getv(); }
            vesk::pref<vesk::IObject> const& read() const { return CONST_ATTRIB_CAST(M_model_mixin,v)->Getv(); }
            vesk::pref<vesk::IObject> & write() { return ATTRIB_CAST(M_model_mixin,v)->Writev(); }
            vesk::pref<vesk::IObject> const& model() const { return CONST_ATTRIB_CAST(M_model_mixin,v)->_model__v(); }
            vesk::pref<vesk::IObject>& model() { return ATTRIB_CAST(M_model_mixin,v)->_model__v(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(M_model_mixin,v)->GetvPath(); }
            vesk::pref<vesk::IObject> operator->() const { return CONST_ATTRIB_CAST(M_model_mixin,v)->Getv(); }
            vesk::IObject operator*() const { return *CONST_ATTRIB_CAST(M_model_mixin,v)->Getv(); }
            vesk::ptr<vesk::IObject > Get() const { return CONST_ATTRIB_CAST(M_model_mixin,v)->Getv().Get(); }
            void operator=(vesk::pref<vesk::IObject> const& _v) { ATTRIB_CAST(M_model_mixin,v)->Setv(_v); }
        } v;
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
inline vesk::xostream& operator<<(vesk::xostream& _os,M const& _x) {
    _os << "M(" << _x.flag << ',' << _x.kind << ',' << _x.n << ',' << _x.v << ')';
    return _os;
}

namespace vesk {
template<> struct TypeTraits<M> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_model; static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<M> {
    static const bool has_reflected_default_ctor = 0; static const bool has_reflected_dtor = 0; static const bool has_reflected_copy_ctor = 0; static const bool has_reflected_equality = 0; static const bool has_reflected_compare = 0; static const bool has_reflected_write_xostream = 0; static const bool has_reflected_serialise = 0; static const bool has_reflected_visit_IObjects = 0; static const bool has_reflected_visit_Prefs = 0; static const bool implements_IObject = 0; static const bool implements_IPersistable = 0; static const bool can_serialise_model = 0; static const bool has_model = 1; static const bool using_model_base_class = 0;
};
} // namespace vesk

