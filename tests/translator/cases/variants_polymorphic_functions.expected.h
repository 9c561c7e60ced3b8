class A {
    public:
    
    struct n {
        enum { tag=1 };
        typedef void Value;
    };
    template<typename T> struct _mapvalue_ { enum { tag=T::tag }; typedef typename T::Value Value; };
    A(vesk::int32 const& _rhs) {
        _tag = 0;
        new (_data) vesk::int32(_rhs);
    }
    A(n const& _rhs) {
        _tag = 1;
    }
    A(A const& _rhs);
    ~A();
    A& operator=(A const& _rhs) {
        if (this != &_rhs) { this->~A(); new (this) A(_rhs); }
        return *this;
    }
    void VisitObjects(vesk::IObjectVisitor&) const;
    void VisitPrefs(vesk::IPrefVisitor&) const;
    vesk::int32 GetTag() const { return _tag; }
    bool operator==(A const& _rhs) const;
    bool operator!=(A const& _rhs) const { return !operator==(_rhs); }
    bool operator<(A const& _rhs) const;
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
    bool is(vesk::int32*) const { return _tag == 0; }
    bool is(n*) const { return _tag == 1; }
    vesk::int32 _tag;
    vesk::octet_t _data[VESK_MAX2(sizeof(vesk::int32),0)];
};
template <> struct A::_mapvalue_<vesk::int32 > { enum { tag=0 }; typedef vesk::int32 Value; };
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,A const& _x) { _x.VisitObjects(_v); return _v; }
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,A const*) { return _v; }
inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,A const& _x) { _x.VisitPrefs(_v); return _v; }
inline vesk::xostream& operator<<(vesk::xostream& _os,A const& _x) { _x.Write(_os); return _os; }
template<typename Archive> inline void Serialise(Archive& _ar,A const& _x) { _x.Serialise(_ar); }
template<typename Archive> inline void Deserialise(Archive& _ar,A & _x) { _x.Deserialise(_ar); }
inline A::A(A const& _rhs) {
    _tag = _rhs._tag;
    switch(_tag) {
        case 0 : new (_data) vesk::int32(_rhs.as<vesk::int32 >()); break;
    }
}
inline A::~A() {
}
inline bool A::operator==(A const& _rhs) const {
    if (_tag != _rhs._tag) return false;
    switch(_tag) {
        case 0 : return as<vesk::int32 >() == _rhs.as<vesk::int32 >();
    }
    return true;
}
inline bool A::operator<(A const& _rhs) const {
    if (_tag < _rhs._tag) return true;
    if (_tag > _rhs._tag) return false;
    switch(_tag) {
        case 0 : return as<vesk::int32 >() < _rhs.as<vesk::int32 >();
    }
    return false;
}
inline void A::Write(vesk::xostream& _os) const {
    switch(_tag) {
        case 0 : _os << as<vesk::int32 >(); break;
        case 1 : _os << "n"; break;
        default: vxAssert(0);
    }
}
inline void A::VisitObjects(vesk::IObjectVisitor& _v) const {
}
inline void A::VisitPrefs(vesk::IPrefVisitor& _v) const {
}
template<typename Archive> inline void A::Serialise(Archive& _ar) const {
    vesk::SerialiseVariableLengthUint(_ar,_tag);
    switch(_tag) {
        case 0 : _ar << as<vesk::int32 >(); break;
    }
}
template<typename Archive> inline void A::Deserialise(Archive& _ar) {
    vesk::DeserialiseVariableLengthUint(_ar,_tag);
    switch(_tag) {
        case 0 : new (_data) vesk::int32(); _ar >> as<vesk::int32 >(); break;
    }
}

namespace vesk {
template<> struct TypeTraits<A> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_variant; static const bool has_metadata = 0;
};
} // namespace vesk

class B {
    public:
    
    struct x {
        enum { tag=0 };
        typedef vesk::string8 Value;
        x(const Value& _v) : value(_v) {}
        Value value;
    };
    struct s {
        enum { tag=1 };
        s() {}
        s(bool const& f_) : f(f_) {}
        bool operator==(s const& _rhs) const { return true && f == _rhs.f; }
        bool operator<(s const& _rhs) const { return (f < _rhs.f); }
        void Write(vesk::xostream& _os) const { _os << "s(" << f << ')'; }
        template<typename Archive> void Serialise(Archive& _ar) const { _ar << f; }
        template<typename Archive> void Deserialise(Archive& _ar) { _ar >> f; }
        typedef s Value;
        bool f;
    };
    template<typename T> struct _mapvalue_ { enum { tag=T::tag }; typedef typename T::Value Value; };
    B(x const& _rhs) {
        _tag = 0;
        new (_data) x(_rhs);
    }
    B(s const& _rhs) {
        _tag = 1;
        new (_data) s(_rhs);
    }
    B(B const& _rhs);
    ~B();
    B& operator=(B const& _rhs) {
        if (this != &_rhs) { this->~B(); new (this) B(_rhs); }
        return *this;
    }
    void VisitObjects(vesk::IObjectVisitor&) const;
    void VisitPrefs(vesk::IPrefVisitor&) const;
    vesk::int32 GetTag() const { return _tag; }
    bool operator==(B const& _rhs) const;
    bool operator!=(B const& _rhs) const { return !operator==(_rhs); }
    bool operator<(B const& _rhs) const;
    template<typename T> bool is() const { return is((T*)0); }
    template<typename T> const typename _mapvalue_<T>::Value& as() const { return as((T*)0); }
    template<typename T> typename _mapvalue_<T>::Value& as() { return as((T*)0); }
    void Write(vesk::xostream&) const;
    template<typename Archive> void Serialise(Archive&) const;
    template<typename Archive> void Deserialise(Archive&);
    private:
    template<typename T> typename T::Value const& as(T*) const { vxAssert(is<T>()); return *(typename T::Value const*)_data; }
    template<typename T> typename T::Value& as(T*) { vxAssert(is<T>()); return *(typename T::Value*)_data; }
    bool is(x*) const { return _tag == 0; }
    bool is(s*) const { return _tag == 1; }
    vesk::int32 _tag;
    vesk::octet_t _data[VESK_MAX2(sizeof(x),sizeof(s))];
};
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,B const& _x) { _x.VisitObjects(_v); return _v; }
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,B const*) { return _v; }
inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,B const& _x) { _x.VisitPrefs(_v); return _v; }
inline vesk::xostream& operator<<(vesk::xostream& _os,B const& _x) { _x.Write(_os); return _os; }
template<typename Archive> inline void Serialise(Archive& _ar,B const& _x) { _x.Serialise(_ar); }
template<typename Archive> inline void Deserialise(Archive& _ar,B & _x) { _x.Deserialise(_ar); }
inline B::B(B const& _rhs) {
    _tag = _rhs._tag;
    switch(_tag) {
        case 0 : new (_data) x(_rhs.as<x >()); break;
        case 1 : new (_data) s(_rhs.as<s >()); break;
    }
}
inline B::~B() {
    switch(_tag) {
        case 0 : as<x >().vesk::string8::~basic_xstring(); break;
        case 1 : (*(s**)_data)->~s(); break;
    }
}
inline bool B::operator==(B const& _rhs) const {
    if (_tag != _rhs._tag) return false;
    switch(_tag) {
        case 0 : return as<x >() == _rhs.as<x >();
        case 1 : return as<s >() == _rhs.as<s >();
    }
    return true;
}
inline bool B::operator<(B const& _rhs) const {
    if (_tag < _rhs._tag) return true;
    if (_tag > _rhs._tag) return false;
    switch(_tag) {
        case 0 : return as<x >() < _rhs.as<x >();
        case 1 : return as<s >() < _rhs.as<s >();
    }
    return false;
}
inline void B::Write(vesk::xostream& _os) const {
    switch(_tag) {
        case 0 : _os << "x(" << as<x >() << ')'; break;
        case 1 : as<s >().Write(_os); break;
        default: vxAssert(0);
    }
}
inline void B::VisitObjects(vesk::IObjectVisitor& _v) const {
}
inline void B::VisitPrefs(vesk::IPrefVisitor& _v) const {
}
template<typename Archive> inline void B::Serialise(Archive& _ar) const {
    vesk::SerialiseVariableLengthUint(_ar,_tag);
    switch(_tag) {
        case 0 : _ar << as<x >(); break;
        case 1 : as<s >().Serialise(_ar); break;
    }
}
template<typename Archive> inline void B::Deserialise(Archive& _ar) {
    this->~B();
    vesk::DeserialiseVariableLengthUint(_ar,_tag);
    switch(_tag) {
        case 0 : new (_data) vesk::string8(); _ar >> as<x >(); break;
        case 1 : new (_data) s(); as<s >().Deserialise(_ar); break;
    }
}

namespace vesk {
template<> struct TypeTraits<B> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_variant; static const bool has_metadata = 0;
};
} // namespace vesk

vesk::int32 f(A a,bool flag=true,B const& b) {
        switch(a.GetTag()) {
        case 0 :
            switch(b.GetTag()) {
            case 0 : return f(a.as<vesk::int32>(),flag,b.as<x>());
            case 1 : return f(a.as<vesk::int32>(),flag,b.as<s>());
            default: vxAssertUnreachable();
            }
        case 1 :
            switch(b.GetTag()) {
            case 0 : return f(a.as<n>(),flag,b.as<x>());
            case 1 : return f(a.as<n>(),flag,b.as<s>());
            default: vxAssertUnreachable();
            }
        default: vxAssertUnreachable();
        }
}

inline void g(A& a) {
        switch(a.GetTag()) {
        case 0 : g(a.as<vesk::int32>()); break;
        case 1 : g(a.as<n>()); break;
        default: vxAssertUnreachable();
        }
}

