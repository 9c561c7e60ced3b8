enum E : int {
    a
};
template<typename Archive> inline void Serialise(Archive& _ar,E _x) { vesk::SerialiseVariableLengthUint(_ar, (int)_x); }
template<typename Archive> inline void Deserialise(Archive& _ar,E& _x) { vesk::DeserialiseVariableLengthUint(_ar, (int&)_x); }

namespace vesk {
template<> struct TypeTraits<E> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_enum; static const bool has_metadata = 0;
};
} // namespace vesk
 namespace n { typedef vesk::xvector<vesk::int32> T;
inline vesk::ConstStringZ GetTypedefName_T() {
    return "n::T";
}
 }
class V {
    public:
    
    struct t {
        enum { tag=1 };
        typedef n::T Value;
        t(const Value& _v) : value(_v) {}
        Value value;
    };
    struct m {
        enum { tag=2 };
        typedef vesk::xmap<vesk::int32,bool > Value;
        m(const Value& _v) : value(_v) {}
        Value value;
    };
    struct s {
        enum { tag=3 };
        typedef std::map<int, std::string> Value;
        s(const Value& _v) : value(_v) {}
        Value value;
    };
    struct d {
        enum { tag=4 };
        typedef A<b::C>::D Value;
        d(const Value& _v) : value(_v) {}
        Value value;
    };
    template<typename T> struct _mapvalue_ { enum { tag=T::tag }; typedef typename T::Value Value; };
    V(E const& _rhs) {
        _tag = 0;
        new (_data) E(_rhs);
    }
    V(t const& _rhs) {
        _tag = 1;
        new (_data) t(_rhs);
    }
    V(m const& _rhs) {
        _tag = 2;
        new (_data) m(_rhs);
    }
    V(s const& _rhs) {
        _tag = 3;
        new (_data) s(_rhs);
    }
    V(d const& _rhs) {
        _tag = 4;
        new (_data) d(_rhs);
    }
    V(vesk::int8 const& _rhs) {
        _tag = 5;
        new (_data) vesk::int8(_rhs);
    }
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
    private:
    template<typename T> typename T::Value const& as(T*) const { vxAssert(is<T>()); return *(typename T::Value const*)_data; }
    template<typename T> typename T::Value& as(T*) { vxAssert(is<T>()); return *(typename T::Value*)_data; }
    E const& as(E*) const { vxAssert((is<E >())); return *(E const*) _data; }
    E& as(E*) { vxAssert((is<E >())); return *(E*) _data; }
    vesk::int8 const& as(vesk::int8*) const { vxAssert((is<vesk::int8 >())); return *(vesk::int8 const*) _data; }
    vesk::int8& as(vesk::int8*) { vxAssert((is<vesk::int8 >())); return *(vesk::int8*) _data; }
    bool is(E*) const { return _tag == 0; }
    bool is(t*) const { return _tag == 1; }
    bool is(m*) const { return _tag == 2; }
    bool is(s*) const { return _tag == 3; }
    bool is(d*) const { return _tag == 4; }
    bool is(vesk::int8*) const { return _tag == 5; }
    vesk::int32 _tag;
    vesk::octet_t _data[VESK_MAX6(sizeof(E),sizeof(t),sizeof(m),sizeof(s),sizeof(d),sizeof(vesk::int8))];
};
template <> struct V::_mapvalue_<E > { enum { tag=0 }; typedef E Value; };
template <> struct V::_mapvalue_<vesk::int8 > { enum { tag=5 }; typedef vesk::int8 Value; };
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,V const& _x) { _x.VisitObjects(_v); return _v; }
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,V const*) { return _v; }
inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,V const& _x) { _x.VisitPrefs(_v); return _v; }
inline vesk::xostream& operator<<(vesk::xostream& _os,V const& _x) { _x.Write(_os); return _os; }
inline V::V(V const& _rhs) {
    _tag = _rhs._tag;
    switch(_tag) {
        case 0 : new (_data) E(_rhs.as<E >()); break;
        case 1 : new (_data) t(_rhs.as<t >()); break;
        case 2 : new (_data) m(_rhs.as<m >()); break;
        case 3 : new (_data) s(_rhs.as<s >()); break;
        case 4 : new (_data) d(_rhs.as<d >()); break;
        case 5 : new (_data) vesk::int8(_rhs.as<vesk::int8 >()); break;
    }
}
inline V::~V() {
    switch(_tag) {
        case 0 : as<E >().E::~E(); break;
        case 1 : as<t >().n::T::~T(); break;
        case 2 : as<m >().vesk::xmap<vesk::int32,bool >::~xmap(); break;
        case 3 : as<s >().std::map<int, std::string>::~map<int, std::string>(); break;
        case 4 : as<d >().A<b::C>::D::~D(); break;
    }
}
inline bool V::operator==(V const& _rhs) const {
    if (_tag != _rhs._tag) return false;
    switch(_tag) {
        case 0 : return as<E >() == _rhs.as<E >();
        case 1 : return as<t >() == _rhs.as<t >();
        case 2 : return as<m >() == _rhs.as<m >();
        case 3 : return as<s >() == _rhs.as<s >();
        case 4 : return as<d >() == _rhs.as<d >();
        case 5 : return as<vesk::int8 >() == _rhs.as<vesk::int8 >();
    }
    return true;
}
inline bool V::operator<(V const& _rhs) const {
    if (_tag < _rhs._tag) return true;
    if (_tag > _rhs._tag) return false;
    switch(_tag) {
        case 0 : return as<E >() < _rhs.as<E >();
        case 1 : return as<t >() < _rhs.as<t >();
        case 2 : return as<m >() < _rhs.as<m >();
        case 3 : return as<s >() < _rhs.as<s >();
        case 4 : return as<d >() < _rhs.as<d >();
        case 5 : return as<vesk::int8 >() < _rhs.as<vesk::int8 >();
    }
    return false;
}
inline void V::Write(vesk::xostream& _os) const {
    switch(_tag) {
        case 0 : _os << as<E >(); break;
        case 1 : _os << "t(" << as<t >() << ')'; break;
        case 2 : _os << "m(" << as<m >() << ')'; break;
        case 3 : _os << "s(" << as<s >() << ')'; break;
        case 4 : _os << "d(" << as<d >() << ')'; break;
        case 5 : _os << as<vesk::int8 >(); break;
        default: vxAssert(0);
    }
}
inline void V::VisitObjects(vesk::IObjectVisitor& _v) const {
    switch(_tag) {
        case 2 : _v << as<m >(); break;
    }
}
inline void V::VisitPrefs(vesk::IPrefVisitor& _v) const {
    switch(_tag) {
        case 2 : _v << as<m >(); break;
    }
}

namespace vesk {
template<> struct TypeTraits<V> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_variant; static const bool has_metadata = 0;
};
} // namespace vesk
