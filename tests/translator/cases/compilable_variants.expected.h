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

class V {
    public:
    V() {
        new (this) V(int32(1));
    }
    
    struct none {
        enum { tag=2 };
        none() {}
        bool operator==(none const& _rhs) const { return true; }
        bool operator<(none const& _rhs) const { return false; }
        void Write(vesk::xostream& _os) const { _os << "none(" << ')'; }
        template<typename Archive> void Serialise(Archive& _ar) const { (void)_ar; }
        template<typename Archive> void Deserialise(Archive& _ar) { (void)_ar; }
        typedef none Value;
    };
    struct text {
        enum { tag=3 };
        text() {}
        text(vesk::string8 const& t_) : t(t_) {}
        bool operator==(text const& _rhs) const { return true && t == _rhs.t; }
        bool operator<(text const& _rhs) const { return (t < _rhs.t); }
        void Write(vesk::xostream& _os) const { _os << "text(" << t << ')'; }
        template<typename Archive> void Serialise(Archive& _ar) const { _ar << t; }
        template<typename Archive> void Deserialise(Archive& _ar) { _ar >> t; }
        typedef text Value;
        vesk::string8 t;
    };
    template<typename T> struct _mapvalue_ { enum { tag=T::tag }; typedef typename T::Value Value; };
    V(vesk::int32 const& _rhs) {
        _tag = 0;
        new (_data) vesk::int32(_rhs);
    }
    V(E const& _rhs) {
        _tag = 1;
        new (_data) E(_rhs);
    }
    V(none const& _rhs) {
        _tag = 2;
        new (_data) none(_rhs);
    }
    V(text const& _rhs) {
        _tag = 3;
        new (_data) text(_rhs);
    }
    V(V const& _rhs);
    V(V&& _rhs) noexcept(std::is_nothrow_move_constructible<vesk::int32 >::value && std::is_nothrow_move_constructible<E >::value && std::is_nothrow_move_constructible<none >::value && std::is_nothrow_move_constructible<text >::value);
    ~V();
    V& operator=(V const& _rhs) {
        if (this != &_rhs) { V _value(_rhs); this->~V(); new (this) V(std::move(_value)); }
        return *this;
    }
    V& operator=(V&& _rhs) noexcept(std::is_nothrow_move_constructible<vesk::int32 >::value && std::is_nothrow_move_constructible<E >::value && std::is_nothrow_move_constructible<none >::value && std::is_nothrow_move_constructible<text >::value) {
        if (this != &_rhs) { V _value(std::move(_rhs)); this->~V(); new (this) V(std::move(_value)); }
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
    E const& as(E*) const { vxAssert((is<E >())); return *(E const*) _data; }
    E& as(E*) { vxAssert((is<E >())); return *(E*) _data; }
    bool is(vesk::int32*) const { return _tag == 0; }
    bool is(E*) const { return _tag == 1; }
    bool is(none*) const { return _tag == 2; }
    bool is(text*) const { return _tag == 3; }
    V(vesk::int32 _new,vesk::NullInterface);
    vesk::int32 _tag;
    vesk::octet_t _data[VESK_MAX4(sizeof(vesk::int32),sizeof(E),sizeof(none),sizeof(text))];
};
template <> struct V::_mapvalue_<vesk::int32 > { enum { tag=0 }; typedef vesk::int32 Value; };
template <> struct V::_mapvalue_<E > { enum { tag=1 }; typedef E Value; };
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,V const& _x) { _x.VisitObjects(_v); return _v; }
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,V const*) { return _v; }
inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,V const& _x) { _x.VisitPrefs(_v); return _v; }
inline vesk::xostream& operator<<(vesk::xostream& _os,V const& _x) { _x.Write(_os); return _os; }
template<typename Archive> inline void Serialise(Archive& _ar,V const& _x) { _x.Serialise(_ar); }
template<typename Archive> inline void Deserialise(Archive& _ar,V & _x) { _x.Deserialise(_ar); }
inline V::V(V const& _rhs) {
    _tag = _rhs._tag;
    switch(_tag) {
        case 0 : new (_data) vesk::int32(_rhs.as<vesk::int32 >()); break;
        case 1 : new (_data) E(_rhs.as<E >()); break;
        case 2 : new (_data) none(_rhs.as<none >()); break;
        case 3 : new (_data) text(_rhs.as<text >()); break;
    }
}
inline V::~V() {
    switch(_tag) {
        case 2 : as<none >().~none(); break;
        case 3 : as<text >().~text(); break;
    }
}
inline V::V(V&& _rhs) noexcept(std::is_nothrow_move_constructible<vesk::int32 >::value && std::is_nothrow_move_constructible<E >::value && std::is_nothrow_move_constructible<none >::value && std::is_nothrow_move_constructible<text >::value) {
    const vesk::int32 _new = _rhs._tag;
    _tag = -1;
    switch(_new) {
        case 0 : new (_data) vesk::int32(std::move(_rhs.as<vesk::int32 >())); break;
        case 1 : new (_data) E(std::move(_rhs.as<E >())); break;
        case 2 : new (_data) none(std::move(_rhs.as<none >())); break;
        case 3 : new (_data) text(std::move(_rhs.as<text >())); break;
    }
    _tag = _new;
}
inline V::V(vesk::int32 _new,vesk::NullInterface) {
    _tag = -1;
    switch(_new) {
        case 0 : new (_data) vesk::int32(); break;
        case 1 : new (_data) E(); break;
        case 2 : new (_data) none(); break;
        case 3 : new (_data) text(); break;
    }
    _tag = _new;
}
inline bool V::operator==(V const& _rhs) const {
    if (_tag != _rhs._tag) return false;
    switch(_tag) {
        case 0 : return as<vesk::int32 >() == _rhs.as<vesk::int32 >();
        case 1 : return as<E >() == _rhs.as<E >();
        case 2 : return as<none >() == _rhs.as<none >();
        case 3 : return as<text >() == _rhs.as<text >();
    }
    return true;
}
inline bool V::operator<(V const& _rhs) const {
    if (_tag < _rhs._tag) return true;
    if (_tag > _rhs._tag) return false;
    switch(_tag) {
        case 0 : return as<vesk::int32 >() < _rhs.as<vesk::int32 >();
        case 1 : return as<E >() < _rhs.as<E >();
        case 2 : return as<none >() < _rhs.as<none >();
        case 3 : return as<text >() < _rhs.as<text >();
    }
    return false;
}
inline void V::Write(vesk::xostream& _os) const {
    switch(_tag) {
        case 0 : _os << as<vesk::int32 >(); break;
        case 1 : _os << as<E >(); break;
        case 2 : as<none >().Write(_os); break;
        case 3 : as<text >().Write(_os); break;
        default: vxAssert(0);
    }
}
inline void V::VisitObjects(vesk::IObjectVisitor& _v) const {
}
inline void V::VisitPrefs(vesk::IPrefVisitor& _v) const {
}
template<typename Archive> inline void V::Serialise(Archive& _ar) const {
    vesk::SerialiseVariableLengthUint(_ar,_tag);
    switch(_tag) {
        case 0 : _ar << as<vesk::int32 >(); break;
        case 1 : _ar << as<E >(); break;
        case 2 : as<none >().Serialise(_ar); break;
        case 3 : as<text >().Serialise(_ar); break;
    }
}
template<typename Archive> inline void V::Deserialise(Archive& _ar) {
    vesk::int32 _new;
    vesk::DeserialiseVariableLengthUint(_ar,_new);
    V _value(_new,vesk::null);
    switch(_new) {
        case 0 : _ar >> _value.as<vesk::int32 >(); break;
        case 1 : _ar >> _value.as<E >(); break;
        case 2 : _value.as<none >().Deserialise(_ar); break;
        case 3 : _value.as<text >().Deserialise(_ar); break;
    }
    *this = std::move(_value);
}

namespace vesk {
template<> struct TypeTraits<V> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_variant; static const bool has_metadata = 0;
};
} // namespace vesk

void F(V v,V w) {
        switch(v.GetTag()) {
        case 0 :
            switch(w.GetTag()) {
            case 0 : F(v.as<vesk::int32>(),w.as<vesk::int32>()); break;
            case 1 : F(v.as<vesk::int32>(),w.as<E>()); break;
            case 2 : F(v.as<vesk::int32>(),w.as<V::none>()); break;
            case 3 : F(v.as<vesk::int32>(),w.as<V::text>()); break;
            default: vxAssertUnreachable();
            }
            break;
        case 1 :
            switch(w.GetTag()) {
            case 0 : F(v.as<E>(),w.as<vesk::int32>()); break;
            case 1 : F(v.as<E>(),w.as<E>()); break;
            case 2 : F(v.as<E>(),w.as<V::none>()); break;
            case 3 : F(v.as<E>(),w.as<V::text>()); break;
            default: vxAssertUnreachable();
            }
            break;
        case 2 :
            switch(w.GetTag()) {
            case 0 : F(v.as<V::none>(),w.as<vesk::int32>()); break;
            case 1 : F(v.as<V::none>(),w.as<E>()); break;
            case 2 : F(v.as<V::none>(),w.as<V::none>()); break;
            case 3 : F(v.as<V::none>(),w.as<V::text>()); break;
            default: vxAssertUnreachable();
            }
            break;
        case 3 :
            switch(w.GetTag()) {
            case 0 : F(v.as<V::text>(),w.as<vesk::int32>()); break;
            case 1 : F(v.as<V::text>(),w.as<E>()); break;
            case 2 : F(v.as<V::text>(),w.as<V::none>()); break;
            case 3 : F(v.as<V::text>(),w.as<V::text>()); break;
            default: vxAssertUnreachable();
            }
            break;
        default: vxAssertUnreachable();
        }
}

struct S;

namespace vesk {
template<> struct TypeTraits<S> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_struct; static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<S> {
    static const bool has_reflected_default_ctor = 0; static const bool has_reflected_dtor = 0; static const bool has_reflected_copy_ctor = 0; static const bool has_reflected_equality = 0; static const bool has_reflected_compare = 0; static const bool has_reflected_write_xostream = 0; static const bool has_reflected_serialise = 0; static const bool has_reflected_visit_IObjects = 0; static const bool has_reflected_visit_Prefs = 0; static const bool implements_IObject = 0; static const bool implements_IPersistable = 0; static const bool can_serialise_model = 0; static const bool has_model = 0; static const bool using_model_base_class = 0;
};
} // namespace vesk
struct S {
    class N {
    public:
    
    struct far {
        enum { tag=2 };
        far() {}
        far(E const& e_) : e(e_) {}
        bool operator==(far const& _rhs) const { return true && e == _rhs.e; }
        bool operator<(far const& _rhs) const { return (e < _rhs.e); }
        void Write(vesk::xostream& _os) const { _os << "far(" << e << ')'; }
        template<typename Archive> void Serialise(Archive& _ar) const { _ar << e; }
        template<typename Archive> void Deserialise(Archive& _ar) { _ar >> e; }
        typedef far Value;
        E e;
    };
    template<typename _T,typename=void> struct _mapvalue_ { enum { tag=_T::tag }; typedef typename _T::Value Value; };
    template <typename _Any> struct _mapvalue_<void ,_Any> { enum { tag=0 }; typedef void Value; };
    template <typename _Any> struct _mapvalue_<vesk::string8 ,_Any> { enum { tag=1 }; typedef vesk::string8 Value; };
    N() {
        _tag = 0;
    }
    N(vesk::string8 const& _rhs) {
        _tag = 1;
        new (_data) vesk::string8(_rhs);
    }
    N(far const& _rhs) {
        _tag = 2;
        *(far**)_data = new far(_rhs);
    }
    N& operator=(N const& _rhs) {
        if (this != &_rhs) { N _value(_rhs); this->~N(); new (this) N(std::move(_value)); }
        return *this;
    }
    N& operator=(N&& _rhs) noexcept(std::is_nothrow_move_constructible<vesk::string8 >::value) {
        if (this != &_rhs) { N _value(std::move(_rhs)); this->~N(); new (this) N(std::move(_value)); }
        return *this;
    }
    vesk::int32 GetTag() const { return _tag; }
    bool operator!=(N const& _rhs) const { return !operator==(_rhs); }
    template<typename _T> bool is() const { return is((_T*)0); }
    template<typename _T> const typename _mapvalue_<_T>::Value& as() const { return as((_T*)0); }
    template<typename _T> typename _mapvalue_<_T>::Value& as() { return as((_T*)0); }
    N(N const& _rhs) {
        _tag = _rhs._tag;
        switch(_tag) {
            case 1 : new (_data) vesk::string8(_rhs.as<vesk::string8 >()); break;
            case 2 : *(far**)_data = new far(_rhs.as<far >()); break;
        }
    }
    ~N() {
        switch(_tag) {
            case 1 : { typedef vesk::string8 _Item; as<vesk::string8 >().~_Item(); } break;
            case 2 : delete *(far**)_data; break;
        }
    }
    N(N&& _rhs) noexcept(std::is_nothrow_move_constructible<vesk::string8 >::value) {
        const vesk::int32 _new = _rhs._tag;
        _tag = -1;
        switch(_new) {
            case 1 : new (_data) vesk::string8(std::move(_rhs.as<vesk::string8 >())); break;
            case 2 : *(far**)_data = *(far**)_rhs._data; _rhs._tag = -1; break;
        }
        _tag = _new;
    }
    N(vesk::int32 _new,vesk::NullInterface) {
        _tag = -1;
        switch(_new) {
            case 1 : new (_data) vesk::string8(); break;
            case 2 : *(far**)_data = new far(); break;
        }
        _tag = _new;
    }
    bool operator==(N const& _rhs) const {
        if (_tag != _rhs._tag) return false;
        switch(_tag) {
            case 1 : return as<vesk::string8 >() == _rhs.as<vesk::string8 >();
            case 2 : return as<far >() == _rhs.as<far >();
        }
        return true;
    }
    bool operator<(N const& _rhs) const {
        if (_tag < _rhs._tag) return true;
        if (_tag > _rhs._tag) return false;
        switch(_tag) {
            case 1 : return as<vesk::string8 >() < _rhs.as<vesk::string8 >();
            case 2 : return as<far >() < _rhs.as<far >();
        }
        return false;
    }
    void Write(vesk::xostream& _os) const {
        switch(_tag) {
            case 0 : _os << "void"; break;
            case 1 : _os << as<vesk::string8 >(); break;
            case 2 : as<far >().Write(_os); break;
            default: vxAssert(0);
        }
    }
    void VisitObjects(vesk::IObjectVisitor& _v) const {
    }
    void VisitPrefs(vesk::IPrefVisitor& _v) const {
    }
    template<typename Archive> void Serialise(Archive& _ar) const {
        vesk::SerialiseVariableLengthUint(_ar,_tag);
        switch(_tag) {
            case 1 : _ar << as<vesk::string8 >(); break;
            case 2 : as<far >().Serialise(_ar); break;
        }
    }
    template<typename Archive> void Deserialise(Archive& _ar) {
        vesk::int32 _new;
        vesk::DeserialiseVariableLengthUint(_ar,_new);
        N _value(_new,vesk::null);
        switch(_new) {
            case 1 : _ar >> _value.as<vesk::string8 >(); break;
            case 2 : _value.as<far >().Deserialise(_ar); break;
        }
        *this = std::move(_value);
    }
    private:
    template<typename _T> typename _T::Value const& as(_T*) const { vxAssert(is<_T>()); return *(typename _T::Value const*)_data; }
    template<typename _T> typename _T::Value& as(_T*) { vxAssert(is<_T>()); return *(typename _T::Value*)_data; }
    vesk::string8 const& as(vesk::string8*) const { vxAssert((is<vesk::string8 >())); return *(vesk::string8 const*) _data; }
    vesk::string8& as(vesk::string8*) { vxAssert((is<vesk::string8 >())); return *(vesk::string8*) _data; }
    far const& as(far*) const { vxAssert((is<far >())); return ** (far const**) _data; }
    far& as(far*) { vxAssert((is<far >())); return ** (far**) _data; }
    bool is(void*) const { return _tag == 0; }
    bool is(vesk::string8*) const { return _tag == 1; }
    bool is(far*) const { return _tag == 2; }
    vesk::int32 _tag;
    vesk::octet_t _data[VESK_MAX3(0,sizeof(vesk::string8),sizeof(void*))];
};
friend inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,N const& _x) { _x.VisitObjects(_v); return _v; }
friend inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,N const*) { return _v; }
friend inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,N const& _x) { _x.VisitPrefs(_v); return _v; }
friend inline vesk::xostream& operator<<(vesk::xostream& _os,N const& _x) { _x.Write(_os); return _os; }
template<typename Archive> friend inline void Serialise(Archive& _ar,N const& _x) { _x.Serialise(_ar); }
template<typename Archive> friend inline void Deserialise(Archive& _ar,N & _x) { _x.Deserialise(_ar); }

    class G {
public:
    typedef void (__stdcall *STUB_FN)(void* _self);
    G() : m_self(nullptr), m_stubFn(nullptr) {}
    G(void* _self, STUB_FN _stubFn) : m_self(_self), m_stubFn(_stubFn) {}
    G(G const& _rhs) : m_self(_rhs.m_self), m_stubFn(_rhs.m_stubFn) {}
    G& operator=(G const& _rhs) { m_self = _rhs.m_self; m_stubFn = _rhs.m_stubFn; return *this; }
    bool operator==(G const& _rhs) const { return m_self == _rhs.m_self && m_stubFn == _rhs.m_stubFn; }
    bool operator<(G const& _rhs) const { return m_self < _rhs.m_self || (m_self == _rhs.m_self && m_stubFn < _rhs.m_stubFn); }
    bool operator<=(G const& _rhs) const { return m_self < _rhs.m_self || (m_self == _rhs.m_self && m_stubFn <= _rhs.m_stubFn); }
    bool operator!=(G const& _rhs) const { return !operator==(_rhs); }
    bool operator>(G const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(G const& _rhs) const { return _rhs.operator<=(*this); }
    typedef void (G::*bool_type)() const;
    void bool_type_mem_fn() const {}
    operator bool_type() const { return m_stubFn ? &G::bool_type_mem_fn : 0; }
    G& operator=(vesk::NullInterface) { m_self = nullptr; m_stubFn = nullptr; return *this; }
    void operator()() { if (!m_stubFn) throw std::logic_error("call of a null G"); m_stubFn(m_self); }
    void write(vesk::xostream& os) const { os << "G(" << m_self << ',' << (void*)m_stubFn << ')'; }
private:
    void* m_self;
    STUB_FN m_stubFn;
};
friend inline vesk::xostream& operator<<(vesk::xostream& os, G f) { f.write(os); return os; }
;

public:
    
};


