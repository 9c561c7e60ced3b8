#pragma once
#ifndef _app_src_t_h
#define _app_src_t_h

#include "Vesk/vxObject/IObject.h"
struct Pos
{
    
    Pos() : y(0) {}
    explicit Pos(bool const& y_) : y(y_) {}
    void Serialise(vesk::Archive&) const;
    void Deserialise(vesk::InputArchive&);
    void EvictDgsNodes() const;
    void VisitObjects(vesk::IObjectVisitor& _v) const;
    void VisitPrefs(vesk::IPrefVisitor& _v) const;
    bool operator<(Pos const& _rhs) const
    {
        return (y < _rhs.y);
    }
    bool operator==(Pos const& _rhs) const
    {
        return y == _rhs.y;
    }
    bool operator!=(Pos const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(Pos const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(Pos const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(Pos const& _rhs) const { return !operator<(_rhs); }
    
    static void GetyPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetyPath() { vesk::Path _path; GetyPath(_path); return _path; }
    bool const& _model__y() const { return y; }
    bool& _model__y() { return y; }
    bool const& Gety() const { return y; }
    bool& Writey() {  return y; }
    void Sety(bool const& _v) { y = _v; }
    
    bool y;
};
template <typename BC>
struct Pos_model_mixin : public BC
{
    using typename BC::FinalClass;
    
    bool operator<(Pos_model_mixin const& _rhs) const {return _model_ < _rhs._model_;}
    bool operator==(Pos_model_mixin const& _rhs) const {return _model_ == _rhs._model_;}
    bool operator!=(Pos_model_mixin const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(Pos_model_mixin const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(Pos_model_mixin const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(Pos_model_mixin const& _rhs) const { return !operator<(_rhs); }
    void EvictDgsNodes() const {BC::EvictDgsNodes();_model_.EvictDgsNodes();}
    void VisitObjects(vesk::IObjectVisitor& _v) const {BC::VisitObjects(_v); _model_.VisitObjects(_v);}
    void VisitPrefs(vesk::IPrefVisitor& _v) const {BC::VisitPrefs(_v); _model_.VisitPrefs(_v);}
    
    static void GetyPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetyPath() { vesk::Path _path; GetyPath(_path); return _path; }
    bool const& _model__y() const { return _model_.y; }
    bool& _model__y() { return _model_.y; }
    bool const& Gety() const { vesk::DataSourceReadBarrier(&_model_.y,vesk::null,"Pos::_model_.y"); return _model_.y; }
    bool& Writey() { vesk::DataSourceWriteBarrier(&_model_.y,vesk::null,"Pos::_model_.y");  return _model_.y; }
    void Sety(bool const& _v) { vesk::DataSourceWriteBarrier(&_model_.y,vesk::null,"Pos::_model_.y"); _model_.y = _v; }
    union
    {
        struct
        {
            operator bool const&() const { return CONST_ATTRIB_CAST(Pos_model_mixin,y)->Gety(); }
            bool const& read() const { return CONST_ATTRIB_CAST(Pos_model_mixin,y)->Gety(); }
            bool & write() { return ATTRIB_CAST(Pos_model_mixin,y)->Writey(); }
            bool const& model() const { return CONST_ATTRIB_CAST(Pos_model_mixin,y)->_model__y(); }
            bool& model() { return ATTRIB_CAST(Pos_model_mixin,y)->_model__y(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(Pos_model_mixin,y)->GetyPath(); }
            void operator=(bool const& _v) { ATTRIB_CAST(Pos_model_mixin,y)->Sety(_v); }
        } y;
    };
    typedef Pos model_type;
    Pos const& model() const { return _model_; }
    Pos& model() { return _model_; }
    Pos const& read() const { vesk::DataSourceReadBarrier(static_cast<const typename BC::FinalClass*>(this), vesk::null,"Pos"); return _model_; }
    Pos & write() { vesk::DataSourceWriteBarrier(static_cast<typename BC::FinalClass*>(this), vesk::null,"Pos"); return _model_; }
    Pos _model_;
};

inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,Pos const& _x) { _x.VisitObjects(_v); return _v; }
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,Pos const*) { return _v; }
inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,Pos const& _x) { _x.VisitPrefs(_v); return _v; }

template<typename Archive> inline void Serialise(Archive& _ar,Pos const& _x) { _x.Serialise(_ar); }

template<typename Archive> inline void Deserialise(Archive& _ar,Pos& _x) { _x.Deserialise(_ar); }
inline vesk::xostream& operator<<(vesk::xostream& _os,Pos const& _x)
{
    _os << "Pos(" << _x.y << ')';
    return _os;
}

namespace vesk
{
template<> struct TypeTraits<Pos>
{
    static const bool is_exported = 0;
    static const bool is_reflected = 0;
    static const bool is_registered = 0;
    static const vesk::ETypeTraitKind kind = vesk::TTK_model;
    static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<Pos>
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

namespace n
{
struct J
{
    struct FnTable
    {
        void (__stdcall *none)(void const* _self);
        void (__stdcall *all)(void* _self,vesk::int32 a,vesk::string8 const& b,vesk::string8& c,vesk::xvector<vesk::int8>& d,Pos* e);
        void (__stdcall *back)(void* _self,vesk::int8& r);
    };
    J(void* _self, const FnTable* table) : m_self(_self), m_table(table) {}
    
    void AssignFrom(J& _rhs) { m_self = _rhs.m_self; m_table = _rhs.m_table; }
    void AssignFrom(J const& _rhs) const { const_cast<J*>(this)->m_self = _rhs.m_self; const_cast<J*>(this)->m_table = _rhs.m_table; }
    
    template<typename T> struct Stubs
    {
        static void __stdcall none(void const* _self) { ((const T*)_self)->none(); }
        static void __stdcall all(void* _self,vesk::int32 a,vesk::string8 const& b,vesk::string8& c,vesk::xvector<vesk::int8>& d,Pos* e) { ((T*)_self)->all(a,b,c,d,e); }
        static void __stdcall back(void* _self,vesk::int8& r) { ((T*)_self)->back(r); }
        static const FnTable& GetTable()
        {
            static const FnTable t =
            {
                &none,
                &all,
                &back
            };
            return t;
        }
    };
    
    template<typename T> void CoerceFrom(T* _rhs) { m_self = _rhs; m_table = &Stubs<T>::GetTable(); }
    template<typename T> void CoerceFrom(const T* _rhs) const { const_cast<J*>(this)->m_self = const_cast<T*>(_rhs); const_cast<J*>(this)->m_table = &Stubs<T>::GetTable(); }
    
    void none() const { m_table->none(m_self); }
    void all(vesk::int32 a,vesk::string8 const& b,vesk::string8& c,vesk::xvector<vesk::int8>& d,Pos* e) { m_table->all(m_self,a,b,c,d,e); }
    void back(vesk::int8& r) { m_table->back(m_self,r); }
    
    union
    {
        void* m_self;
    };
    FnTable const* m_table;
};
template <typename BC>
struct JDelegatorMixin : public BC
{
    void none() const { BC::GetJ().none(); }
    void all(vesk::int32 a,vesk::string8 const& b,vesk::string8& c,vesk::xvector<vesk::int8>& d,Pos* e) { BC::GetJ().all(a,b,c,d,e); }
    void back(vesk::int8& r) { BC::GetJ().back(r); }
};

vesk::ReflectedInterface const& _GetReflected(J const*);

inline vesk::ConstStringZ _GetIpcInterfaceName(J const*) { return "n::J"; }

} //n
namespace vesk
{
template<> struct TypeTraits<n::J>
{
    static const bool is_exported = 1;
    static const bool is_reflected = 1;
    static const bool is_registered = 1;
    static const vesk::ETypeTraitKind kind = vesk::TTK_interface;
    static const bool has_metadata = 0;
};
template<> struct InterfaceTypeTraits<n::J>
{
    static const bool is_ipc = true;
    static const bool is_rmi = false;
};
} // namespace vesk
namespace n
{

}

#endif // include guard
