#pragma once
#ifndef _app_src_t_h
#define _app_src_t_h

#include "Vesk/vxObject/IObject.h"
struct M
{
    
    M() : a(0),b(0),c(0) {}
    M(bool const& a_,bool const& b_,bool const& c_) : a(a_),b(b_),c(c_) {}
    void Serialise(vesk::Archive&) const;
    void Deserialise(vesk::InputArchive&);
    void EvictDgsNodes() const;
    void VisitObjects(vesk::IObjectVisitor& _v) const;
    void VisitPrefs(vesk::IPrefVisitor& _v) const;
    bool operator<(M const& _rhs) const
    {
        return (a < _rhs.a || (a == _rhs.a &&
        (b < _rhs.b || (b == _rhs.b &&
        (c < _rhs.c)))));
    }
    bool operator==(M const& _rhs) const
    {
        return a == _rhs.a &&
        b == _rhs.b &&
        c == _rhs.c;
    }
    bool operator!=(M const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(M const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(M const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(M const& _rhs) const { return !operator<(_rhs); }
    
    static void GetaPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetaPath() { vesk::Path _path; GetaPath(_path); return _path; }
    bool const& _model__a() const { return a; }
    bool& _model__a() { return a; }
    bool const& Geta() const { return a; }
    bool& Writea() {  return a; }
    void Seta(bool const& _v) { a = _v; }
    
    static void GetbPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=1; }
    static vesk::Path GetbPath() { vesk::Path _path; GetbPath(_path); return _path; }
    bool const& _model__b() const { return b; }
    bool& _model__b() { return b; }
    bool const& Getb() const { return b; }
    bool& Writeb() {  return b; }
    void Setb(bool const& _v) { b = _v; }
    
    static void GetcPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=2; }
    static vesk::Path GetcPath() { vesk::Path _path; GetcPath(_path); return _path; }
    bool const& _model__c() const { return c; }
    bool& _model__c() { return c; }
    bool const& Getc() const { return c; }
    bool& Writec() {  return c; }
    void Setc(bool const& _v) { c = _v; }
    
    bool a;
    bool b;
    bool c;
};
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
    bool const& _model__a() const { return _model_.a; }
    bool& _model__a() { return _model_.a; }
    bool const& Geta() const { vesk::DataSourceReadBarrier(&_model_.a,vesk::null,"M::_model_.a"); return _model_.a; }
    bool& Writea() { vesk::DataSourceWriteBarrier(&_model_.a,vesk::null,"M::_model_.a");  return _model_.a; }
    void Seta(bool const& _v) { vesk::DataSourceWriteBarrier(&_model_.a,vesk::null,"M::_model_.a"); _model_.a = _v; }
    
    static void GetbPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=1; }
    static vesk::Path GetbPath() { vesk::Path _path; GetbPath(_path); return _path; }
    bool const& _model__b() const { return _model_.b; }
    bool& _model__b() { return _model_.b; }
    bool const& Getb() const { vesk::DataSourceReadBarrier(&_model_.b,vesk::null,"M::_model_.b"); return _model_.b; }
    bool& Writeb() { vesk::DataSourceWriteBarrier(&_model_.b,vesk::null,"M::_model_.b");  return _model_.b; }
    void Setb(bool const& _v) { vesk::DataSourceWriteBarrier(&_model_.b,vesk::null,"M::_model_.b"); _model_.b = _v; }
    
    static void GetcPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=2; }
    static vesk::Path GetcPath() { vesk::Path _path; GetcPath(_path); return _path; }
    bool const& _model__c() const { return _model_.c; }
    bool& _model__c() { return _model_.c; }
    bool const& Getc() const { vesk::DataSourceReadBarrier(&_model_.c,vesk::null,"M::_model_.c"); return _model_.c; }
    bool& Writec() { vesk::DataSourceWriteBarrier(&_model_.c,vesk::null,"M::_model_.c");  return _model_.c; }
    void Setc(bool const& _v) { vesk::DataSourceWriteBarrier(&_model_.c,vesk::null,"M::_model_.c"); _model_.c = _v; }
    union
    {
        struct
        {
            operator bool const&() const { return CONST_ATTRIB_CAST(M_model_mixin,a)->Geta(); }
            bool const& read() const { return CONST_ATTRIB_CAST(M_model_mixin,a)->Geta(); }
            bool & write() { return ATTRIB_CAST(M_model_mixin,a)->Writea(); }
            bool const& model() const { return CONST_ATTRIB_CAST(M_model_mixin,a)->_model__a(); }
            bool& model() { return ATTRIB_CAST(M_model_mixin,a)->_model__a(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(M_model_mixin,a)->GetaPath(); }
            void operator=(bool const& _v) { ATTRIB_CAST(M_model_mixin,a)->Seta(_v); }
        } a;
        struct
        {
            operator bool const&() const { return CONST_ATTRIB_CAST(M_model_mixin,b)->Getb(); }
            bool const& read() const { return CONST_ATTRIB_CAST(M_model_mixin,b)->Getb(); }
            bool & write() { return ATTRIB_CAST(M_model_mixin,b)->Writeb(); }
            bool const& model() const { return CONST_ATTRIB_CAST(M_model_mixin,b)->_model__b(); }
            bool& model() { return ATTRIB_CAST(M_model_mixin,b)->_model__b(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(M_model_mixin,b)->GetbPath(); }
            void operator=(bool const& _v) { ATTRIB_CAST(M_model_mixin,b)->Setb(_v); }
        } b;
        struct
        {
            operator bool const&() const { return CONST_ATTRIB_CAST(M_model_mixin,c)->Getc(); }
            bool const& read() const { return CONST_ATTRIB_CAST(M_model_mixin,c)->Getc(); }
            bool & write() { return ATTRIB_CAST(M_model_mixin,c)->Writec(); }
            bool const& model() const { return CONST_ATTRIB_CAST(M_model_mixin,c)->_model__c(); }
            bool& model() { return ATTRIB_CAST(M_model_mixin,c)->_model__c(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(M_model_mixin,c)->GetcPath(); }
            void operator=(bool const& _v) { ATTRIB_CAST(M_model_mixin,c)->Setc(_v); }
        } c;
    };
    typedef M model_type;
    M const& model() const { return _model_; }
    M& model() { return _model_; }
    M const& read() const { vesk::DataSourceReadBarrier(static_cast<const typename BC::FinalClass*>(this), vesk::null,"M"); return _model_; }
    M & write() { vesk::DataSourceWriteBarrier(static_cast<typename BC::FinalClass*>(this), vesk::null,"M"); return _model_; }
    M _model_;
};

inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,M const& _x) { _x.VisitObjects(_v); return _v; }
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,M const*) { return _v; }
inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,M const& _x) { _x.VisitPrefs(_v); return _v; }

template<typename Archive> inline void Serialise(Archive& _ar,M const& _x) { _x.Serialise(_ar); }

template<typename Archive> inline void Deserialise(Archive& _ar,M& _x) { _x.Deserialise(_ar); }
inline vesk::xostream& operator<<(vesk::xostream& _os,M const& _x)
{
    _os << "M(" << _x.a << ',' << _x.b << ',' << _x.c << ')';
    return _os;
}

namespace vesk
{
template<> struct TypeTraits<M>
{
    static const bool is_exported = 0;
    static const bool is_reflected = 0;
    static const bool is_registered = 0;
    static const vesk::ETypeTraitKind kind = vesk::TTK_model;
    static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<M>
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


#endif // include guard
