struct R {
    
    R() {}
    void Serialise(vesk::Archive&) const;
    void Deserialise(vesk::InputArchive&);
    void EvictDgsNodes() const;
    void VisitObjects(vesk::IObjectVisitor& _v) const;
    void VisitPrefs(vesk::IPrefVisitor& _v) const;
    bool operator<(R const& _rhs) const {
        return true;
    }
    bool operator==(R const& _rhs) const {
        return true;
    }
    bool operator!=(R const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(R const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(R const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(R const& _rhs) const { return !operator<(_rhs); }
    
};
template <typename BC>
struct R_model_mixin : public BC {
    using typename BC::FinalClass;
    
    bool operator<(R_model_mixin const& _rhs) const {return _model_ < _rhs._model_;}
    bool operator==(R_model_mixin const& _rhs) const {return _model_ == _rhs._model_;}
    bool operator!=(R_model_mixin const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(R_model_mixin const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(R_model_mixin const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(R_model_mixin const& _rhs) const { return !operator<(_rhs); }
    void EvictDgsNodes() const {BC::EvictDgsNodes();_model_.EvictDgsNodes();}
    void VisitObjects(vesk::IObjectVisitor& _v) const {BC::VisitObjects(_v); _model_.VisitObjects(_v);}
    void VisitPrefs(vesk::IPrefVisitor& _v) const {BC::VisitPrefs(_v); _model_.VisitPrefs(_v);}
    typedef R model_type;
    R const& model() const { return _model_; }
    R& model() { return _model_; }
    R const& read() const { vesk::DataSourceReadBarrier(static_cast<const typename BC::FinalClass*>(this), vesk::null,"R"); return _model_; }
    R & write() { vesk::DataSourceWriteBarrier(static_cast<typename BC::FinalClass*>(this), vesk::null,"R"); return _model_; }
    R _model_;
};

inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,R const& _x) { _x.VisitObjects(_v); return _v; }
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,R const*) { return _v; }
inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,R const& _x) { _x.VisitPrefs(_v); return _v; }

template<typename Archive> inline void Serialise(Archive& _ar,R const& _x) { _x.Serialise(_ar); }

template<typename Archive> inline void Deserialise(Archive& _ar,R& _x) { _x.Deserialise(_ar); }
inline vesk::xostream& operator<<(vesk::xostream& _os,R const& _x) {
    _os << "R(" << ')';
    return _os;
}

namespace vesk {
template<> struct TypeTraits<R> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_model; static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<R> {
    static const bool has_reflected_default_ctor = 0; static const bool has_reflected_dtor = 0; static const bool has_reflected_copy_ctor = 0; static const bool has_reflected_equality = 0; static const bool has_reflected_compare = 0; static const bool has_reflected_write_xostream = 0; static const bool has_reflected_serialise = 0; static const bool has_reflected_visit_IObjects = 0; static const bool has_reflected_visit_Prefs = 0; static const bool implements_IObject = 0; static const bool implements_IPersistable = 0; static const bool can_serialise_model = 1; static const bool has_model = 1; static const bool using_model_base_class = 0;
};
} // namespace vesk

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
    typedef R model_type;
    R const& model() const { return _model_; }
    R& model() { return _model_; }
    R const& read() const { vesk::DataSourceReadBarrier(static_cast<const typename BC::FinalClass*>(this), vesk::null,"M"); return _model_; }
    R & write() { vesk::DataSourceWriteBarrier(static_cast<typename BC::FinalClass*>(this), vesk::null,"M"); return _model_; }
    R _model_;
};
template <typename BC>
struct M : public M_model_mixin<BC> {
    typedef M_model_mixin<BC> BaseClass;
 
public:
    
    void Serialise(vesk::Archive&) const;
    void Deserialise(vesk::InputArchive&);
};


template <typename BC>
struct A_model_mixin : public BC {
    using typename BC::FinalClass;
    
    bool operator<(A_model_mixin const& _rhs) const {return _model_ < _rhs._model_;}
    bool operator==(A_model_mixin const& _rhs) const {return _model_ == _rhs._model_;}
    bool operator!=(A_model_mixin const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(A_model_mixin const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(A_model_mixin const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(A_model_mixin const& _rhs) const { return !operator<(_rhs); }
    void EvictDgsNodes() const {BC::EvictDgsNodes();_model_.EvictDgsNodes();}
    void VisitObjects(vesk::IObjectVisitor& _v) const {BC::VisitObjects(_v); _model_.VisitObjects(_v);}
    void VisitPrefs(vesk::IPrefVisitor& _v) const {BC::VisitPrefs(_v); _model_.VisitPrefs(_v);}
    typedef R model_type;
    R const& model() const { return _model_; }
    R& model() { return _model_; }
    R const& read() const { vesk::DataSourceReadBarrier(static_cast<const typename BC::FinalClass*>(this), vesk::null,"A"); return _model_; }
    R & write() { vesk::DataSourceWriteBarrier(static_cast<typename BC::FinalClass*>(this), vesk::null,"A"); return _model_; }
    R _model_;
};
template <typename BC>
struct A : public A_model_mixin<BC> {
    typedef A_model_mixin<BC> BaseClass;
 
public:
    
    void Serialise(vesk::Archive&) const;
    void Deserialise(vesk::InputArchive&);
};

template <typename BC> 
template<typename Archive> inline void Serialise(Archive& _ar,A const& _x) { _x.Serialise(_ar); }
template <typename BC> 
template<typename Archive> inline void Deserialise(Archive& _ar,A& _x) { _x.Deserialise(_ar); }

