struct Record {
    
    Record() : c(0),f(0),e(0) {}
    Record(vesk::string8 const& a_,vesk::int32 const& c_,bool const& f_,vesk::float32 const& e_) : a(a_),c(c_),f(f_),e(e_) {}
    void Serialise(vesk::Archive&) const;
    void Deserialise(vesk::InputArchive&);
    void EvictDgsNodes() const;
    void VisitObjects(vesk::IObjectVisitor& _v) const;
    void VisitPrefs(vesk::IPrefVisitor& _v) const;
    bool operator<(Record const& _rhs) const {
        return (a < _rhs.a || (a == _rhs.a &&
        (c < _rhs.c || (c == _rhs.c &&
        (f < _rhs.f || (f == _rhs.f &&
        (e < _rhs.e)))))));
    }
    bool operator==(Record const& _rhs) const {
        return a == _rhs.a &&
        c == _rhs.c &&
        f == _rhs.f &&
        e == _rhs.e;
    }
    bool operator!=(Record const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(Record const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(Record const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(Record const& _rhs) const { return !operator<(_rhs); }
    
    static void GetaPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetaPath() { vesk::Path _path; GetaPath(_path); return _path; }
    vesk::string8 const& _model__a() const { return a; }
    vesk::string8& _model__a() { return a; }
    vesk::string8 const& Geta() const { return a; }
    void CreateIntoa(vesk::ssize_t _i,vesk::char8 const* _src,vesk::ssize_t _n) {
        a.insert(a.begin()+_i,_src,_src+_n);
    }
    void DeleteFroma(vesk::ssize_t _i1,vesk::ssize_t _i2) {
        a.erase(_i1,_i2-_i1);
    }
    
    static void GetcPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=2; }
    static vesk::Path GetcPath() { vesk::Path _path; GetcPath(_path); return _path; }
    vesk::int32 const& _model__c() const { return c; }
    vesk::int32& _model__c() { return c; }
    vesk::int32 const& Getc() const { return c; }
    vesk::int32& Writec() {  return c; }
    void Setc(vesk::int32 const& _v) { c = _v; }
    
    static void GetfPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=4; }
    static vesk::Path GetfPath() { vesk::Path _path; GetfPath(_path); return _path; }
    bool const& _model__f() const { return f; }
    bool& _model__f() { return f; }
    bool const& Getf() const { return f; }
    bool& Writef() {  return f; }
    void Setf(bool const& _v) { f = _v; }
    
    static void GetePath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=5; }
    static vesk::Path GetePath() { vesk::Path _path; GetePath(_path); return _path; }
    vesk::float32 const& _model__e() const { return e; }
    vesk::float32& _model__e() { return e; }
    vesk::float32 const& Gete() const { return e; }
    vesk::float32& Writee() {  return e; }
    void Sete(vesk::float32 const& _v) { e = _v; }
    
    vesk::string8 a;
    vesk::int32 c;
    bool f;
    vesk::float32 e;
};
vesk::ReflectedClass const& _GetReflected(Record const*);
vesk::TypeOps const& _GetTypeOps(Record const*);
template <typename BC>
struct Record_model_mixin : public BC {
    using typename BC::FinalClass;
    
    bool operator<(Record_model_mixin const& _rhs) const {return _model_ < _rhs._model_;}
    bool operator==(Record_model_mixin const& _rhs) const {return _model_ == _rhs._model_;}
    bool operator!=(Record_model_mixin const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(Record_model_mixin const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(Record_model_mixin const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(Record_model_mixin const& _rhs) const { return !operator<(_rhs); }
    void EvictDgsNodes() const {BC::EvictDgsNodes();_model_.EvictDgsNodes();}
    void VisitObjects(vesk::IObjectVisitor& _v) const {BC::VisitObjects(_v); _model_.VisitObjects(_v);}
    void VisitPrefs(vesk::IPrefVisitor& _v) const {BC::VisitPrefs(_v); _model_.VisitPrefs(_v);}
    
    static void GetaPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetaPath() { vesk::Path _path; GetaPath(_path); return _path; }
    vesk::string8 const& _model__a() const { return _model_.a; }
    vesk::string8& _model__a() { return _model_.a; }
    vesk::string8 const& Geta() const { vesk::DataSourceReadBarrier(&_model_.a,vesk::null,"Record::_model_.a"); return _model_.a; }
    void CreateIntoa(vesk::ssize_t _i,vesk::char8 const* _src,vesk::ssize_t _n) {
        vesk::DataSourceWriteBarrier(&_model_.a,vesk::null,"Record::_model_.a"); _model_.a.insert(_model_.a.begin()+_i,_src,_src+_n);
    }
    void DeleteFroma(vesk::ssize_t _i1,vesk::ssize_t _i2) {
        vesk::DataSourceWriteBarrier(&_model_.a,vesk::null,"Record::_model_.a"); _model_.a.erase(_i1,_i2-_i1);
    }
    
    static void GetcPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=2; }
    static vesk::Path GetcPath() { vesk::Path _path; GetcPath(_path); return _path; }
    vesk::int32 const& _model__c() const { return _model_.c; }
    vesk::int32& _model__c() { return _model_.c; }
    vesk::int32 const& Getc() const { vesk::DataSourceReadBarrier(&_model_.c,vesk::null,"Record::_model_.c"); return _model_.c; }
    vesk::int32& Writec() { vesk::DataSourceWriteBarrier(&_model_.c,vesk::null,"Record::_model_.c");  return _model_.c; }
    void Setc(vesk::int32 const& _v) { vesk::DataSourceWriteBarrier(&_model_.c,vesk::null,"Record::_model_.c"); _model_.c = _v; }
    
    static void GetfPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=4; }
    static vesk::Path GetfPath() { vesk::Path _path; GetfPath(_path); return _path; }
    bool const& _model__f() const { return _model_.f; }
    bool& _model__f() { return _model_.f; }
    bool const& Getf() const { vesk::DataSourceReadBarrier(&_model_.f,vesk::null,"Record::_model_.f"); return _model_.f; }
    bool& Writef() { vesk::DataSourceWriteBarrier(&_model_.f,vesk::null,"Record::_model_.f");  return _model_.f; }
    void Setf(bool const& _v) { vesk::DataSourceWriteBarrier(&_model_.f,vesk::null,"Record::_model_.f"); _model_.f = _v; }
    
    static void GetePath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=5; }
    static vesk::Path GetePath() { vesk::Path _path; GetePath(_path); return _path; }
    vesk::float32 const& _model__e() const { return _model_.e; }
    vesk::float32& _model__e() { return _model_.e; }
    vesk::float32 const& Gete() const { vesk::DataSourceReadBarrier(&_model_.e,vesk::null,"Record::_model_.e"); return _model_.e; }
    vesk::float32& Writee() { vesk::DataSourceWriteBarrier(&_model_.e,vesk::null,"Record::_model_.e");  return _model_.e; }
    void Sete(vesk::float32 const& _v) { vesk::DataSourceWriteBarrier(&_model_.e,vesk::null,"Record::_model_.e"); _model_.e = _v; }
    union {
        struct {
            operator vesk::string8 const&() const { return CONST_ATTRIB_CAST(Record_model_mixin,a)->Geta(); }
            vesk::string8 const& read() const { return CONST_ATTRIB_CAST(Record_model_mixin,a)->Geta(); }
            vesk::string8 & write() { return ATTRIB_CAST(Record_model_mixin,a)->Writea(); }
            vesk::string8 const& model() const { return CONST_ATTRIB_CAST(Record_model_mixin,a)->_model__a(); }
            vesk::string8& model() { return ATTRIB_CAST(Record_model_mixin,a)->_model__a(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(Record_model_mixin,a)->GetaPath(); }
            void insert(vesk::ssize_t _i,vesk::char8 const* _src,vesk::ssize_t _n) {
                ATTRIB_CAST(Record_model_mixin,a)->CreateIntoa(_i,_src,_n);
            }
            void insert(vesk::ssize_t _i,vesk::char8 const& _v) {
                insert(_i,&_v,1);
            }
            void push_front(vesk::char8 const& _v) {
                insert(0,_v);
            }
            void push_back(vesk::char8 const& _v) {
                insert(model().size(),_v);
            }
            void erase_range(vesk::ssize_t _i1,vesk::ssize_t _i2) {
                ATTRIB_CAST(Record_model_mixin,a)->DeleteFroma(_i1,_i2);
            }
            void erase(vesk::ssize_t _i) {
                erase_range(_i,_i+1);
            }
            void pop_front() {
                erase(0);
            }
            void pop_back() {
                erase(model().size()-1);
            }
            void clear() {
                erase_range(0,model().size());
            }
        } a;
        struct {
            operator vesk::int32 const&() const { return CONST_ATTRIB_CAST(Record_model_mixin,c)->Getc(); }
            vesk::int32 const& read() const { return CONST_ATTRIB_CAST(Record_model_mixin,c)->Getc(); }
            vesk::int32 & write() { return ATTRIB_CAST(Record_model_mixin,c)->Writec(); }
            vesk::int32 const& model() const { return CONST_ATTRIB_CAST(Record_model_mixin,c)->_model__c(); }
            vesk::int32& model() { return ATTRIB_CAST(Record_model_mixin,c)->_model__c(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(Record_model_mixin,c)->GetcPath(); }
            void operator=(vesk::int32 const& _v) { ATTRIB_CAST(Record_model_mixin,c)->Setc(_v); }
        } c;
        struct {
            operator bool const&() const { return CONST_ATTRIB_CAST(Record_model_mixin,f)->Getf(); }
            bool const& read() const { return CONST_ATTRIB_CAST(Record_model_mixin,f)->Getf(); }
            bool & write() { return ATTRIB_CAST(Record_model_mixin,f)->Writef(); }
            bool const& model() const { return CONST_ATTRIB_CAST(Record_model_mixin,f)->_model__f(); }
            bool& model() { return ATTRIB_CAST(Record_model_mixin,f)->_model__f(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(Record_model_mixin,f)->GetfPath(); }
            void operator=(bool const& _v) { ATTRIB_CAST(Record_model_mixin,f)->Setf(_v); }
        } f;
        struct {
            operator vesk::float32 const&() const { return CONST_ATTRIB_CAST(Record_model_mixin,e)->Gete(); }
            vesk::float32 const& read() const { return CONST_ATTRIB_CAST(Record_model_mixin,e)->Gete(); }
            vesk::float32 & write() { return ATTRIB_CAST(Record_model_mixin,e)->Writee(); }
            vesk::float32 const& model() const { return CONST_ATTRIB_CAST(Record_model_mixin,e)->_model__e(); }
            vesk::float32& model() { return ATTRIB_CAST(Record_model_mixin,e)->_model__e(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(Record_model_mixin,e)->GetePath(); }
            void operator=(vesk::float32 const& _v) { ATTRIB_CAST(Record_model_mixin,e)->Sete(_v); }
        } e;
    };
    typedef Record model_type;
    Record const& model() const { return _model_; }
    Record& model() { return _model_; }
    Record const& read() const { vesk::DataSourceReadBarrier(static_cast<const typename BC::FinalClass*>(this), vesk::null,"Record"); return _model_; }
    Record & write() { vesk::DataSourceWriteBarrier(static_cast<typename BC::FinalClass*>(this), vesk::null,"Record"); return _model_; }
    Record _model_;
};

inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,Record const& _x) { _x.VisitObjects(_v); return _v; }
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,Record const*) { return _v; }
inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,Record const& _x) { _x.VisitPrefs(_v); return _v; }

template<typename Archive> inline void Serialise(Archive& _ar,Record const& _x) { _x.Serialise(_ar); }

template<typename Archive> inline void Deserialise(Archive& _ar,Record& _x) { _x.Deserialise(_ar); }
inline vesk::xostream& operator<<(vesk::xostream& _os,Record const& _x) {
    _os << "Record(" << _x.a << ',' << _x.c << ',' << _x.f << ',' << _x.e << ')';
    return _os;
}

namespace vesk {
template<> struct TypeTraits<Record> {
    static const bool is_exported = 1; static const bool is_reflected = 1; static const bool is_registered = 1; static const vesk::ETypeTraitKind kind = vesk::TTK_model; static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<Record> {
    static const bool has_reflected_default_ctor = 1; static const bool has_reflected_dtor = 1; static const bool has_reflected_copy_ctor = 1; static const bool has_reflected_equality = 1; static const bool has_reflected_compare = 1; static const bool has_reflected_write_xostream = 1; static const bool has_reflected_serialise = 1; static const bool has_reflected_visit_IObjects = 0; static const bool has_reflected_visit_Prefs = 0; static const bool implements_IObject = 0; static const bool implements_IPersistable = 0; static const bool can_serialise_model = 1; static const bool has_model = 1; static const bool using_model_base_class = 0;
};
} // namespace vesk

