#pragma once
#ifndef _app_src_t_h
#define _app_src_t_h

#include "Vesk/vxObject/IObject.h"
struct R
{
    
    R() : a(0) {}
    explicit R(vesk::int32 const& a_) : a(a_) {}
    void Serialise(vesk::Archive&) const;
    void Deserialise(vesk::InputArchive&);
    void EvictDgsNodes() const;
    void VisitObjects(vesk::IObjectVisitor& _v) const;
    void VisitPrefs(vesk::IPrefVisitor& _v) const;
    bool operator<(R const& _rhs) const
    {
        return (a < _rhs.a);
    }
    bool operator==(R const& _rhs) const
    {
        return a == _rhs.a;
    }
    bool operator!=(R const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(R const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(R const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(R const& _rhs) const { return !operator<(_rhs); }
    
    static void GetaPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetaPath() { vesk::Path _path; GetaPath(_path); return _path; }
    vesk::int32 const& _model__a() const { return a; }
    vesk::int32& _model__a() { return a; }
    vesk::int32 const& Geta() const { return a; }
    vesk::int32& Writea() {  return a; }
    void Seta(vesk::int32 const& _v) { a = _v; }
    
    vesk::int32 a;
};
template <typename BC>
struct R_model_mixin : public BC
{
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
    
    static void GetaPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetaPath() { vesk::Path _path; GetaPath(_path); return _path; }
    vesk::int32 const& _model__a() const { return _model_.a; }
    vesk::int32& _model__a() { return _model_.a; }
    vesk::int32 const& Geta() const { vesk::DataSourceReadBarrier(&_model_.a,vesk::null,"R::_model_.a"); return _model_.a; }
    vesk::int32& Writea() { vesk::DataSourceWriteBarrier(&_model_.a,vesk::null,"R::_model_.a");  return _model_.a; }
    void Seta(vesk::int32 const& _v) { vesk::DataSourceWriteBarrier(&_model_.a,vesk::null,"R::_model_.a"); _model_.a = _v; }
    union
    {
        struct
        {
            operator vesk::int32 const&() const { return CONST_ATTRIB_CAST(R_model_mixin,a)->Geta(); }
            vesk::int32 const& read() const { return CONST_ATTRIB_CAST(R_model_mixin,a)->Geta(); }
            vesk::int32 & write() { return ATTRIB_CAST(R_model_mixin,a)->Writea(); }
            vesk::int32 const& model() const { return CONST_ATTRIB_CAST(R_model_mixin,a)->_model__a(); }
            vesk::int32& model() { return ATTRIB_CAST(R_model_mixin,a)->_model__a(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(R_model_mixin,a)->GetaPath(); }
            void operator=(vesk::int32 const& _v) { ATTRIB_CAST(R_model_mixin,a)->Seta(_v); }
        } a;
    };
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
inline vesk::xostream& operator<<(vesk::xostream& _os,R const& _x)
{
    _os << "R(" << _x.a << ')';
    return _os;
}

namespace vesk
{
template<> struct TypeTraits<R>
{
    static const bool is_exported = 0;
    static const bool is_reflected = 0;
    static const bool is_registered = 0;
    static const vesk::ETypeTraitKind kind = vesk::TTK_model;
    static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<R>
{
    static const bool has_reflected_default_ctor = 0;
    static const bool has_reflected_dtor = 0;
    static const bool has_reflected_copy_ctor = 0;
    static const bool has_reflected_equality = 0;
    static const bool has_reflected_compare = 0;
    static const bool has_reflected_write_xostream = 0;
    static const bool has_reflected_serialise = 0;
    static const bool has_reflected_visit_IObjects = 0;
    static const bool has_reflected_visit_Prefs = 0;
    static const bool implements_IObject = 0;
    static const bool implements_IPersistable = 0;
    static const bool can_serialise_model = 1;
    static const bool has_model = 1;
    static const bool using_model_base_class = 0;
};
} // namespace vesk

template <typename BC>
struct M_model_mixin : public BC
{
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
    
    static void GetaPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetaPath() { vesk::Path _path; GetaPath(_path); return _path; }
    vesk::int32 const& _model__a() const { return _model_.a; }
    vesk::int32& _model__a() { return _model_.a; }
    vesk::int32 const& Geta() const { vesk::DataSourceReadBarrier(&_model_.a,vesk::null,"R::_model_.a"); return _model_.a; }
    vesk::int32& Writea() { vesk::DataSourceWriteBarrier(&_model_.a,vesk::null,"R::_model_.a");  return _model_.a; }
    void Seta(vesk::int32 const& _v) { vesk::DataSourceWriteBarrier(&_model_.a,vesk::null,"R::_model_.a"); _model_.a = _v; }
    union
    {
        struct
        {
            operator vesk::int32 const&() const { return CONST_ATTRIB_CAST(M_model_mixin,a)->Geta(); }
            vesk::int32 const& read() const { return CONST_ATTRIB_CAST(M_model_mixin,a)->Geta(); }
            vesk::int32 & write() { return ATTRIB_CAST(M_model_mixin,a)->Writea(); }
            vesk::int32 const& model() const { return CONST_ATTRIB_CAST(M_model_mixin,a)->_model__a(); }
            vesk::int32& model() { return ATTRIB_CAST(M_model_mixin,a)->_model__a(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(M_model_mixin,a)->GetaPath(); }
            void operator=(vesk::int32 const& _v) { ATTRIB_CAST(M_model_mixin,a)->Seta(_v); }
        } a;
    };
    typedef R model_type;
    R const& model() const { return _model_; }
    R& model() { return _model_; }
    R const& read() const { vesk::DataSourceReadBarrier(static_cast<const typename BC::FinalClass*>(this), vesk::null,"M"); return _model_; }
    R & write() { vesk::DataSourceWriteBarrier(static_cast<typename BC::FinalClass*>(this), vesk::null,"M"); return _model_; }
    R _model_;
};
template <typename BC>
struct M : public M_model_mixin<BC>
{
    typedef M_model_mixin<BC> BaseClass;
 
public:
    
    void Serialise(vesk::Archive&) const;
    void Deserialise(vesk::InputArchive&);
};


template <typename BC>
struct A_model_mixin : public BC
{
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
    
    static void GetaPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetaPath() { vesk::Path _path; GetaPath(_path); return _path; }
    vesk::int32 const& _model__a() const { return _model_.a; }
    vesk::int32& _model__a() { return _model_.a; }
    vesk::int32 const& Geta() const { vesk::DataSourceReadBarrier(&_model_.a,vesk::null,"R::_model_.a"); return _model_.a; }
    vesk::int32& Writea() { vesk::DataSourceWriteBarrier(&_model_.a,vesk::null,"R::_model_.a");  return _model_.a; }
    void Seta(vesk::int32 const& _v) { vesk::DataSourceWriteBarrier(&_model_.a,vesk::null,"R::_model_.a"); _model_.a = _v; }
    union
    {
        struct
        {
            operator vesk::int32 const&() const { return CONST_ATTRIB_CAST(A_model_mixin,a)->Geta(); }
            vesk::int32 const& read() const { return CONST_ATTRIB_CAST(A_model_mixin,a)->Geta(); }
            vesk::int32 & write() { return ATTRIB_CAST(A_model_mixin,a)->Writea(); }
            vesk::int32 const& model() const { return CONST_ATTRIB_CAST(A_model_mixin,a)->_model__a(); }
            vesk::int32& model() { return ATTRIB_CAST(A_model_mixin,a)->_model__a(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(A_model_mixin,a)->GetaPath(); }
            void operator=(vesk::int32 const& _v) { ATTRIB_CAST(A_model_mixin,a)->Seta(_v); }
        } a;
    };
    typedef R model_type;
    R const& model() const { return _model_; }
    R& model() { return _model_; }
    R const& read() const { vesk::DataSourceReadBarrier(static_cast<const typename BC::FinalClass*>(this), vesk::null,"A"); return _model_; }
    R & write() { vesk::DataSourceWriteBarrier(static_cast<typename BC::FinalClass*>(this), vesk::null,"A"); return _model_; }
    R _model_;
};
template <typename BC>
struct A : public A_model_mixin<BC>
{
    typedef A_model_mixin<BC> BaseClass;
 
public:
    
    void Serialise(vesk::Archive&) const;
    void Deserialise(vesk::InputArchive&);
};

template <typename BC> 
template<typename Archive> inline void Serialise(Archive& _ar,A const& _x) { _x.Serialise(_ar); }
template <typename BC> 
template<typename Archive> inline void Deserialise(Archive& _ar,A& _x) { _x.Deserialise(_ar); }

template <typename BC>
struct K_model_mixin : public BC
{
    using typename BC::FinalClass;
    
    bool operator<(K_model_mixin const& _rhs) const {return _model_ < _rhs._model_;}
    bool operator==(K_model_mixin const& _rhs) const {return _model_ == _rhs._model_;}
    bool operator!=(K_model_mixin const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(K_model_mixin const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(K_model_mixin const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(K_model_mixin const& _rhs) const { return !operator<(_rhs); }
    void EvictDgsNodes() const {BC::EvictDgsNodes();_model_.EvictDgsNodes();}
    void VisitObjects(vesk::IObjectVisitor& _v) const {BC::VisitObjects(_v); _model_.VisitObjects(_v);}
    void VisitPrefs(vesk::IPrefVisitor& _v) const {BC::VisitPrefs(_v); _model_.VisitPrefs(_v);}
    
    static void GetaPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetaPath() { vesk::Path _path; GetaPath(_path); return _path; }
    vesk::int32 const& _model__a() const { return _model_.a; }
    vesk::int32& _model__a() { return _model_.a; }
    vesk::int32 const& Geta() const { vesk::DataSourceReadBarrier(&_model_.a,vesk::null,"R::_model_.a"); return _model_.a; }
    vesk::int32& Writea() { vesk::DataSourceWriteBarrier(&_model_.a,vesk::null,"R::_model_.a");  return _model_.a; }
    void Seta(vesk::int32 const& _v) { vesk::DataSourceWriteBarrier(&_model_.a,vesk::null,"R::_model_.a"); _model_.a = _v; }
    union
    {
        struct
        {
            operator vesk::int32 const&() const { return CONST_ATTRIB_CAST(K_model_mixin,a)->Geta(); }
            vesk::int32 const& read() const { return CONST_ATTRIB_CAST(K_model_mixin,a)->Geta(); }
            vesk::int32 & write() { return ATTRIB_CAST(K_model_mixin,a)->Writea(); }
            vesk::int32 const& model() const { return CONST_ATTRIB_CAST(K_model_mixin,a)->_model__a(); }
            vesk::int32& model() { return ATTRIB_CAST(K_model_mixin,a)->_model__a(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(K_model_mixin,a)->GetaPath(); }
            void operator=(vesk::int32 const& _v) { ATTRIB_CAST(K_model_mixin,a)->Seta(_v); }
        } a;
    };
    typedef R model_type;
    R const& model() const { return _model_; }
    R& model() { return _model_; }
    R const& read() const { vesk::DataSourceReadBarrier(static_cast<const typename BC::FinalClass*>(this), vesk::null,"K"); return _model_; }
    R & write() { vesk::DataSourceWriteBarrier(static_cast<typename BC::FinalClass*>(this), vesk::null,"K"); return _model_; }
    R _model_;
};
struct K;

namespace vesk
{
template<> struct TypeTraits<K>
{
    static const bool is_exported = 0;
    static const bool is_reflected = 0;
    static const bool is_registered = 0;
    static const vesk::ETypeTraitKind kind = vesk::TTK_struct;
    static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<K>
{
    static const bool has_reflected_default_ctor = 0;
    static const bool has_reflected_dtor = 0;
    static const bool has_reflected_copy_ctor = 0;
    static const bool has_reflected_equality = 0;
    static const bool has_reflected_compare = 0;
    static const bool has_reflected_write_xostream = 0;
    static const bool has_reflected_serialise = 0;
    static const bool has_reflected_visit_IObjects = 0;
    static const bool has_reflected_visit_Prefs = 0;
    static const bool implements_IObject = 0;
    static const bool implements_IPersistable = 0;
    static const bool can_serialise_model = 0;
    static const bool has_model = 0;
    static const bool using_model_base_class = 1;
};
} // namespace vesk
struct K : public K_model_mixin<vesk::BaseMixin<K,vesk::EmptyBase>>
{
    typedef K_model_mixin<vesk::BaseMixin<K,vesk::EmptyBase>> BaseClass;
 
public:
    
    void Serialise(vesk::Archive&) const;
    void Deserialise(vesk::InputArchive&);
};


inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,K const& _x) { _x.VisitObjects(_v); return _v; }
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,K const*) { return _v; }
inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,K const& _x) { _x.VisitPrefs(_v); return _v; }

template<typename Archive> inline void Serialise(Archive& _ar,K const& _x) { _x.Serialise(_ar); }

template<typename Archive> inline void Deserialise(Archive& _ar,K& _x) { _x.Deserialise(_ar); }

inline vesk::xostream& operator<<(vesk::xostream& _os,K const& _x) { _os << _x._model_; return _os; }


#endif // include guard
