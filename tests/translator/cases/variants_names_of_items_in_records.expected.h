class V {
    public:
    
    template<typename T> struct _mapvalue_ { enum { tag=T::tag }; typedef typename T::Value Value; };
    V(vesk::xmap<vesk::int32,vesk::string8 > const& _rhs) {
        _tag = 0;
        new (_data) vesk::xmap<vesk::int32,vesk::string8 >(_rhs);
    }
    V(vesk::int32 const* const& _rhs) {
        _tag = 1;
        new (_data) vesk::int32 const*(_rhs);
    }
    V(vesk::ptr<vesk::ptr<vesk::IObject> >& const& _rhs) {
        _tag = 2;
        new (_data) vesk::ptr<vesk::ptr<vesk::IObject> >&(_rhs);
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
    vesk::xmap<vesk::int32,vesk::string8 > const& as(vesk::xmap<vesk::int32,vesk::string8 >*) const { vxAssert((is<vesk::xmap<vesk::int32,vesk::string8 > >())); return *(vesk::xmap<vesk::int32,vesk::string8 > const*) _data; }
    vesk::xmap<vesk::int32,vesk::string8 >& as(vesk::xmap<vesk::int32,vesk::string8 >*) { vxAssert((is<vesk::xmap<vesk::int32,vesk::string8 > >())); return *(vesk::xmap<vesk::int32,vesk::string8 >*) _data; }
    vesk::int32 const* const& as(vesk::int32 const**) const { vxAssert((is<vesk::int32 const* >())); return *(vesk::int32 const* const*) _data; }
    vesk::int32 const*& as(vesk::int32 const**) { vxAssert((is<vesk::int32 const* >())); return *(vesk::int32 const**) _data; }
    vesk::ptr<vesk::ptr<vesk::IObject> >& const& as(vesk::ptr<vesk::ptr<vesk::IObject> >&*) const { vxAssert((is<vesk::ptr<vesk::ptr<vesk::IObject> >& >())); return *(vesk::ptr<vesk::ptr<vesk::IObject> >& const*) _data; }
    vesk::ptr<vesk::ptr<vesk::IObject> >&& as(vesk::ptr<vesk::ptr<vesk::IObject> >&*) { vxAssert((is<vesk::ptr<vesk::ptr<vesk::IObject> >& >())); return *(vesk::ptr<vesk::ptr<vesk::IObject> >&*) _data; }
    bool is(vesk::xmap<vesk::int32,vesk::string8 >*) const { return _tag == 0; }
    bool is(vesk::int32 const**) const { return _tag == 1; }
    bool is(vesk::ptr<vesk::ptr<vesk::IObject> >&*) const { return _tag == 2; }
    vesk::int32 _tag;
    vesk::octet_t _data[VESK_MAX3(sizeof(vesk::xmap<vesk::int32,vesk::string8 >),sizeof(vesk::int32 const*),sizeof(vesk::ptr<vesk::ptr<vesk::IObject> >&))];
};
template <> struct V::_mapvalue_<vesk::xmap<vesk::int32,vesk::string8 > > { enum { tag=0 }; typedef vesk::xmap<vesk::int32,vesk::string8 > Value; };
template <> struct V::_mapvalue_<vesk::int32 const* > { enum { tag=1 }; typedef vesk::int32 const* Value; };
template <> struct V::_mapvalue_<vesk::ptr<vesk::ptr<vesk::IObject> >& > { enum { tag=2 }; typedef vesk::ptr<vesk::ptr<vesk::IObject> >& Value; };
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,V const& _x) { _x.VisitObjects(_v); return _v; }
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,V const*) { return _v; }
inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,V const& _x) { _x.VisitPrefs(_v); return _v; }
inline vesk::xostream& operator<<(vesk::xostream& _os,V const& _x) { _x.Write(_os); return _os; }
vesk::ReflectedVariant const& _GetReflected(V const*);
vesk::TypeOps const& _GetTypeOps(V const*);
inline V::V(V const& _rhs) {
    _tag = _rhs._tag;
    switch(_tag) {
        case 0 : new (_data) vesk::xmap<vesk::int32,vesk::string8 >(_rhs.as<vesk::xmap<vesk::int32,vesk::string8 > >()); break;
        case 1 : new (_data) vesk::int32 const*(_rhs.as<vesk::int32 const* >()); break;
        case 2 : new (_data) vesk::ptr<vesk::ptr<vesk::IObject> >&(_rhs.as<vesk::ptr<vesk::ptr<vesk::IObject> >& >()); break;
    }
}
inline V::~V() {
    switch(_tag) {
        case 0 : as<vesk::xmap<vesk::int32,vesk::string8 > >().vesk::xmap<vesk::int32,vesk::string8 >::~xmap(); break;
    }
}
inline bool V::operator==(V const& _rhs) const {
    if (_tag != _rhs._tag) return false;
    switch(_tag) {
        case 0 : return as<vesk::xmap<vesk::int32,vesk::string8 > >() == _rhs.as<vesk::xmap<vesk::int32,vesk::string8 > >();
        case 1 : return as<vesk::int32 const* >() == _rhs.as<vesk::int32 const* >();
        case 2 : return as<vesk::ptr<vesk::ptr<vesk::IObject> >& >() == _rhs.as<vesk::ptr<vesk::ptr<vesk::IObject> >& >();
    }
    return true;
}
inline bool V::operator<(V const& _rhs) const {
    if (_tag < _rhs._tag) return true;
    if (_tag > _rhs._tag) return false;
    switch(_tag) {
        case 0 : return as<vesk::xmap<vesk::int32,vesk::string8 > >() < _rhs.as<vesk::xmap<vesk::int32,vesk::string8 > >();
        case 1 : return as<vesk::int32 const* >() < _rhs.as<vesk::int32 const* >();
        case 2 : return as<vesk::ptr<vesk::ptr<vesk::IObject> >& >() < _rhs.as<vesk::ptr<vesk::ptr<vesk::IObject> >& >();
    }
    return false;
}
inline void V::Write(vesk::xostream& _os) const {
    switch(_tag) {
        case 0 : _os << as<vesk::xmap<vesk::int32,vesk::string8 > >(); break;
        case 1 : _os << as<vesk::int32 const* >(); break;
        case 2 : _os << as<vesk::ptr<vesk::ptr<vesk::IObject> >& >(); break;
        default: vxAssert(0);
    }
}
inline void V::VisitObjects(vesk::IObjectVisitor& _v) const {
    switch(_tag) {
        case 0 : _v << as<vesk::xmap<vesk::int32,vesk::string8 > >(); break;
        case 1 : _v << as<vesk::int32 const* >(); break;
        case 2 : _v << as<vesk::ptr<vesk::ptr<vesk::IObject> >& >(); break;
    }
}
inline void V::VisitPrefs(vesk::IPrefVisitor& _v) const {
    switch(_tag) {
        case 0 : _v << as<vesk::xmap<vesk::int32,vesk::string8 > >(); break;
    }
}

namespace vesk {
template<> struct TypeTraits<V> {
    static const bool is_exported = 1; static const bool is_reflected = 1; static const bool is_registered = 1; static const vesk::ETypeTraitKind kind = vesk::TTK_variant; static const bool has_metadata = 0;
};
} // namespace vesk
