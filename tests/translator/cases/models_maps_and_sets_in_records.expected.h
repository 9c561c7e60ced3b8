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
{  vesk::int32 n; 
public:
    vesk::xmap<vesk::int32,vesk::xset<bool> > m;
    vesk::Array<vesk::xset<vesk::int8>,2> s;
    
    static void GetmPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetmPath() { vesk::Path _path; GetmPath(_path); return _path; }
    vesk::xmap<vesk::int32,vesk::xset<bool> > const& _model__m() const { return m; }
    vesk::xmap<vesk::int32,vesk::xset<bool> >& _model__m() { return m; }
    vesk::xmap<vesk::int32,vesk::xset<bool> > const& Getm() const { return m; }
    
    static void GetmElementPath(vesk::Path& _path,vesk::int32 const& _k0) { vesk::octet_t* p=_path.InitLocalBuffer(5); p[0]=0; *(vesk::int32*)(p+1)=_k0; }
    static vesk::Path GetmElementPath(vesk::int32 const& _k0) { vesk::Path _path; GetmElementPath(_path,_k0); return _path; }
    vesk::xset<bool> const& _model__mElement(vesk::int32 const& _k0) const { return m[_k0]; }
    vesk::xset<bool>& _model__mElement(vesk::int32 const& _k0) { return m[_k0]; }
    vesk::xset<bool> const& GetmElement(vesk::int32 const& _k0) const { return m[_k0]; }
    static void GetmElementElementPath(vesk::Path& _path,vesk::int32 const& _k0,bool const& _k1) { vesk::octet_t* p=_path.InitLocalBuffer(6); p[0]=0; *(vesk::int32*)(p+1)=_k0; *(bool*)(p+5)=_k1; }
    static vesk::Path GetmElementElementPath(vesk::int32 const& _k0,bool const& _k1) { vesk::Path _path; GetmElementElementPath(_path,_k0,_k1); return _path; }
    bool InsertIntomElement(vesk::int32 const& _k0,bool const& _k1) { return m[_k0].Insert(_k1); }
    bool DeleteFrommElement(vesk::int32 const& _k0,bool const& _k1) { return m[_k0].Delete(_k1); }
    
    static void GetsPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=1; }
    static vesk::Path GetsPath() { vesk::Path _path; GetsPath(_path); return _path; }
    vesk::Array<vesk::xset<vesk::int8>,2> const& _model__s() const { return s; }
    vesk::Array<vesk::xset<vesk::int8>,2>& _model__s() { return s; }
    vesk::Array<vesk::xset<vesk::int8>,2> const& Gets() const { return s; }
    
    static void GetsElementPath(vesk::Path& _path,vesk::ssize_t _k0) { vxAssert(0 <= _k0 && _k0 < 2); vesk::octet_t* p=_path.InitLocalBuffer(2); p[0]=1; p[1]=(vesk::octet_t)_k0; }
    static vesk::Path GetsElementPath(vesk::ssize_t _k0) { vesk::Path _path; GetsElementPath(_path,_k0); return _path; }
    vesk::xset<vesk::int8> const& _model__sElement(vesk::ssize_t _k0) const { return s[_k0]; }
    vesk::xset<vesk::int8>& _model__sElement(vesk::ssize_t _k0) { return s[_k0]; }
    vesk::xset<vesk::int8> const& GetsElement(vesk::ssize_t _k0) const { return s[_k0]; }
    vesk::xset<vesk::int8>& WritesElement(vesk::ssize_t _k0) {  return s[_k0]; }
    void SetsElement(vesk::ssize_t _k0,vesk::xset<vesk::int8> const& _v) { s[_k0] = _v; }
    vesk::int32 Getn() const { return n; }
    void Setn(vesk::int32 _v) { n = _v; }
    
    void Serialise(vesk::Archive&) const;
    void Deserialise(vesk::InputArchive&);
    void EvictDgsNodes() const;
    void VisitObjects(vesk::IObjectVisitor& _v) const;
    void VisitPrefs(vesk::IPrefVisitor& _v) const;
    friend vesk::ReflectedClass const& _GetReflected(S const*);
};

vesk::ReflectedClass const& _GetReflected(S const*);
vesk::TypeOps const& _GetTypeOps(S const*);

inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,S const& _x) { _x.VisitObjects(_v); return _v; }
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,S const*) { return _v; }
inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,S const& _x) { _x.VisitPrefs(_v); return _v; }

template<typename Archive> inline void Serialise(Archive& _ar,S const& _x) { _x.Serialise(_ar); }

template<typename Archive> inline void Deserialise(Archive& _ar,S& _x) { _x.Deserialise(_ar); }

