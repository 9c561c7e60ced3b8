class V {
    public:
    V() {
        new (this) V(x("a"));
    }
    
    struct x {
        enum { tag=1 };
        typedef vesk::string8 Value;
        x(const Value& _v) : value(_v) {}
        Value value;
    };
    struct none {
        enum { tag=2 };
        typedef void Value;
    };
    struct ref {
        enum { tag=3 };
        typedef vesk::pref<vesk::IObject> Value;
        ref(const Value& _v) : value(_v) {}
        Value value;
    };
    struct s {
        enum { tag=4 };
        s() {}
        s(vesk::int32 const& a_,vesk::string8 const& b_) : a(a_),b(b_) {}
        bool operator==(s const& _rhs) const { return true && a == _rhs.a && b == _rhs.b; }
        bool operator<(s const& _rhs) const { return (a < _rhs.a || a == _rhs.a &&
        (b < _rhs.b)); }
        void Write(vesk::xostream& _os) const { _os << "s(" << a << ',' << b << ')'; }
        template<typename Archive> void Serialise(Archive& _ar) const { _ar << a << b; }
        template<typename Archive> void Deserialise(Archive& _ar) { _ar >> a >> b; }
        typedef s Value;
        vesk::int32 a;
        vesk::string8 b;
    };
    struct h;
    template<typename T> struct _mapvalue_ { enum { tag=T::tag }; typedef typename T::Value Value; };
    V(vesk::int32 const& _rhs) {
        _tag = 0;
        new (_data) vesk::int32(_rhs);
    }
    V(x const& _rhs) {
        _tag = 1;
        new (_data) x(_rhs);
    }
    V(none const& _rhs) {
        _tag = 2;
    }
    V(ref const& _rhs) {
        _tag = 3;
        *(ref**)_data = new ref(_rhs);
    }
    V(s const& _rhs) {
        _tag = 4;
        new (_data) s(_rhs);
    }
    V(h const& _rhs);
    V(V const& _rhs);
    ~V();
    V& operator=(V const& _rhs) {
        if (this != &_rhs) { this->~V(); new (this) V(_rhs); }
        return *this;
    }
    void VisitObjects(vesk::IObjectVisitor&) const;
    void VisitPrefs(vesk::IPrefVisitor&) const;
    vesk::int32 GetTag() const { return _tag; }
    bool operator==(V const& _rhs) const;
    bool operator!=(V const& _rhs) const { return !operator==(_rhs); }
    bool operator<(V const& _rhs) const;
    template<typename T> bool is() const { return is((T*)0); }
    template<typename T> const typename _mapvalue_<T>::Value& as() const { return as((T*)0); }
    template<typename T> typename _mapvalue_<T>::Value& as() { return as((T*)0); }
    void Write(vesk::xostream&) const;
    template<typename Archive> void Serialise(Archive&) const;
    template<typename Archive> void Deserialise(Archive&);
    private:
    template<typename T> typename T::Value const& as(T*) const { vxAssert(is<T>()); return *(typename T::Value const*)_data; }
    template<typename T> typename T::Value& as(T*) { vxAssert(is<T>()); return *(typename T::Value*)_data; }
    vesk::int32 const& as(vesk::int32*) const { vxAssert((is<vesk::int32 >())); return *(vesk::int32 const*) _data; }
    vesk::int32& as(vesk::int32*) { vxAssert((is<vesk::int32 >())); return *(vesk::int32*) _data; }
    ref::Value const& as(ref*) const { vxAssert((is<ref >())); return ** (ref::Value const**) _data; }
    ref::Value& as(ref*) { vxAssert((is<ref >())); return ** (ref::Value**) _data; }
    h const& as(h*) const { vxAssert((is<h >())); return ** (h const**) _data; }
    h& as(h*) { vxAssert((is<h >())); return ** (h**) _data; }
    bool is(vesk::int32*) const { return _tag == 0; }
    bool is(x*) const { return _tag == 1; }
    bool is(none*) const { return _tag == 2; }
    bool is(ref*) const { return _tag == 3; }
    bool is(s*) const { return _tag == 4; }
    bool is(h*) const { return _tag == 5; }
    vesk::int32 _tag;
    vesk::octet_t _data[VESK_MAX6(sizeof(vesk::int32),sizeof(x),0,sizeof(void*),sizeof(s),sizeof(void*))];
};
template <> struct V::_mapvalue_<vesk::int32 > { enum { tag=0 }; typedef vesk::int32 Value; };
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,V const& _x) { _x.VisitObjects(_v); return _v; }
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,V const*) { return _v; }
inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,V const& _x) { _x.VisitPrefs(_v); return _v; }
inline vesk::xostream& operator<<(vesk::xostream& _os,V const& _x) { _x.Write(_os); return _os; }
vesk::ReflectedVariant const& _GetReflected(V const*);
vesk::TypeOps const& _GetTypeOps(V const*);
template<typename Archive> inline void Serialise(Archive& _ar,V const& _x) { _x.Serialise(_ar); }
template<typename Archive> inline void Deserialise(Archive& _ar,V & _x) { _x.Deserialise(_ar); }
struct V::h {
    enum { tag=5 };
    h() {}
    h(vesk::pref<vesk::IObject> const& p_) : p(p_) {}
    bool operator==(h const& _rhs) const { return true && p == _rhs.p; }
    bool operator<(h const& _rhs) const { return (p < _rhs.p); }
    void Write(vesk::xostream& _os) const { _os << "h(" << p << ')'; }
    template<typename Archive> void Serialise(Archive& _ar) const { _ar << p; }
    template<typename Archive> void Deserialise(Archive& _ar) { _ar >> p; }
    typedef h Value;
    vesk::pref<vesk::IObject> p;
};
inline V::V(h const& _x) {
    _tag = 5;
    *(h**)_data = new h(_x);
}
inline V::V(V const& _rhs) {
    _tag = _rhs._tag;
    switch(_tag) {
        case 0 : new (_data) vesk::int32(_rhs.as<vesk::int32 >()); break;
        case 1 : new (_data) x(_rhs.as<x >()); break;
        case 3 : *(ref**)_data = new ref(_rhs.as<ref >()); break;
        case 4 : new (_data) s(_rhs.as<s >()); break;
        case 5 : *(h**)_data = new h(_rhs.as<h >()); break;
    }
}
inline V::~V() {
    switch(_tag) {
        case 1 : as<x >().vesk::string8::~basic_xstring(); break;
        case 3 : delete *(ref**)_data; break;
        case 4 : (*(s**)_data)->~s(); break;
        case 5 : delete *(h**)_data; break;
    }
}
inline bool V::operator==(V const& _rhs) const {
    if (_tag != _rhs._tag) return false;
    switch(_tag) {
        case 0 : return as<vesk::int32 >() == _rhs.as<vesk::int32 >();
        case 1 : return as<x >() == _rhs.as<x >();
        case 3 : return as<ref >() == _rhs.as<ref >();
        case 4 : return as<s >() == _rhs.as<s >();
        case 5 : return as<h >() == _rhs.as<h >();
    }
    return true;
}
inline bool V::operator<(V const& _rhs) const {
    if (_tag < _rhs._tag) return true;
    if (_tag > _rhs._tag) return false;
    switch(_tag) {
        case 0 : return as<vesk::int32 >() < _rhs.as<vesk::int32 >();
        case 1 : return as<x >() < _rhs.as<x >();
        case 3 : return as<ref >() < _rhs.as<ref >();
        case 4 : return as<s >() < _rhs.as<s >();
        case 5 : return as<h >() < _rhs.as<h >();
    }
    return false;
}
inline void V::Write(vesk::xostream& _os) const {
    switch(_tag) {
        case 0 : _os << as<vesk::int32 >(); break;
        case 1 : _os << "x(" << as<x >() << ')'; break;
        case 2 : _os << "none"; break;
        case 3 : _os << "ref(" << as<ref >() << ')'; break;
        case 4 : as<s >().Write(_os); break;
        case 5 : as<h >().Write(_os); break;
        default: vxAssert(0);
    }
}
inline void V::VisitObjects(vesk::IObjectVisitor& _v) const {
    switch(_tag) {
        case 3 : _v << as<ref >(); break;
        case 5 : _v << as<h >(); break;
    }
}
inline void V::VisitPrefs(vesk::IPrefVisitor& _v) const {
    switch(_tag) {
        case 3 : _v << as<ref >(); break;
        case 5 : _v << as<h >(); break;
    }
}
template<typename Archive> inline void V::Serialise(Archive& _ar) const {
    vesk::SerialiseVariableLengthUint(_ar,_tag);
    switch(_tag) {
        case 0 : _ar << as<vesk::int32 >(); break;
        case 1 : _ar << as<x >(); break;
        case 3 : _ar << as<ref >(); break;
        case 4 : as<s >().Serialise(_ar); break;
        case 5 : as<h >().Serialise(_ar); break;
    }
}
template<typename Archive> inline void V::Deserialise(Archive& _ar) {
    this->~V();
    vesk::DeserialiseVariableLengthUint(_ar,_tag);
    switch(_tag) {
        case 0 : new (_data) vesk::int32(); _ar >> as<vesk::int32 >(); break;
        case 1 : new (_data) vesk::string8(); _ar >> as<x >(); break;
        case 3 : *(vesk::pref<vesk::IObject>**)_data = new vesk::pref<vesk::IObject>(); _ar >> as<ref >(); break;
        case 4 : new (_data) s(); as<s >().Deserialise(_ar); break;
        case 5 : *(h**)_data = new h(); as<h >().Deserialise(_ar); break;
    }
}

namespace vesk {
template<> struct TypeTraits<V> {
    static const bool is_exported = 1; static const bool is_reflected = 1; static const bool is_registered = 1; static const vesk::ETypeTraitKind kind = vesk::TTK_variant; static const bool has_metadata = 1;
};
} // namespace vesk

