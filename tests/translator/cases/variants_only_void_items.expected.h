class E {
    public:
    
    struct a {
        enum { tag=0 };
        typedef void Value;
    };
    template<typename T> struct _mapvalue_ { enum { tag=T::tag }; typedef typename T::Value Value; };
    E(a const& _rhs) {
        _tag = 0;
    }
    E() {
        _tag = 1;
    }
    E(E const& _rhs);
    ~E();
    E& operator=(E const& _rhs) {
        if (this != &_rhs) { this->~E(); new (this) E(_rhs); }
        return *this;
    }
    void VisitObjects(vesk::IObjectVisitor&) const;
    void VisitPrefs(vesk::IPrefVisitor&) const;
    vesk::int32 GetTag() const { return _tag; }
    bool operator==(E const& _rhs) const;
    bool operator!=(E const& _rhs) const { return !operator==(_rhs); }
    bool operator<(E const& _rhs) const;
    template<typename T> bool is() const { return is((T*)0); }
    private:
    bool is(a*) const { return _tag == 0; }
    bool is(void*) const { return _tag == 1; }
    vesk::int32 _tag;
};
template <> struct E::_mapvalue_<void > { enum { tag=1 }; typedef void Value; };
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,E const& _x) { _x.VisitObjects(_v); return _v; }
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,E const*) { return _v; }
inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,E const& _x) { _x.VisitPrefs(_v); return _v; }
inline E::E(E const& _rhs) {
    _tag = _rhs._tag;
}
inline E::~E() {
}
inline bool E::operator==(E const& _rhs) const {
    if (_tag != _rhs._tag) return false;
    return true;
}
inline bool E::operator<(E const& _rhs) const {
    if (_tag < _rhs._tag) return true;
    if (_tag > _rhs._tag) return false;
    return false;
}
inline void E::VisitObjects(vesk::IObjectVisitor& _v) const {
}
inline void E::VisitPrefs(vesk::IPrefVisitor& _v) const {
}

namespace vesk {
template<> struct TypeTraits<E> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_variant; static const bool has_metadata = 0;
};
} // namespace vesk

