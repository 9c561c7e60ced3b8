#pragma once
#ifndef _app_src_t_h
#define _app_src_t_h

#include "Vesk/vxObject/IObject.h"
struct I
{
    struct FnTable
    {
        vesk::IObject::FnTable _IObject;
    };
    I(void* _self, const FnTable* table) : m_self(_self), m_table(table) {}
    
    void AssignFrom(I& _rhs) { m_self = _rhs.m_self; m_table = _rhs.m_table; }
    void AssignFrom(I const& _rhs) const { const_cast<I*>(this)->m_self = _rhs.m_self; const_cast<I*>(this)->m_table = _rhs.m_table; }
    
    template<typename T> struct Stubs
    {
        static const FnTable& GetTable()
        {
            static const FnTable t =
            {
                {
                },
            };
            return t;
        }
    };
    
    template<typename T> void CoerceFrom(T* _rhs) { m_self = _rhs; m_table = &Stubs<T>::GetTable(); }
    template<typename T> void CoerceFrom(const T* _rhs) const { const_cast<I*>(this)->m_self = const_cast<T*>(_rhs); const_cast<I*>(this)->m_table = &Stubs<T>::GetTable(); }
    
    
    operator vesk::IObject() const { return vesk::IObject(m_self, &m_table->_IObject); }
    
    union
    {
        void* m_self;
    };
    FnTable const* m_table;
};
template <typename BC>
struct IDelegatorMixin : public BC
{
};

vesk::ReflectedInterface const& _GetReflected(I const*);

namespace vesk
{
template<> struct TypeTraits<I>
{
    static const bool is_exported = 1;
    static const bool is_reflected = 1;
    static const bool is_registered = 1;
    static const vesk::ETypeTraitKind kind = vesk::TTK_interface;
    static const bool has_metadata = 0;
};
template<> struct InterfaceTypeTraits<I>
{
    static const bool is_ipc = false;
    static const bool is_rmi = false;
};
template<> struct _is_direct_superinterface_of<vesk::IObject,I> { static const bool value = true; };
} // namespace vesk

enum E : int
{
    e1
};
template<typename Archive> inline void Serialise(Archive& _ar,E _x) { vesk::SerialiseVariableLengthUint(_ar, (int)_x); }
template<typename Archive> inline void Deserialise(Archive& _ar,E& _x) { vesk::DeserialiseVariableLengthUint(_ar, (int&)_x); }

namespace vesk
{
template<> struct TypeTraits<E>
{
    static const bool is_exported = 0;
    static const bool is_reflected = 0;
    static const bool is_registered = 0;
    static const vesk::ETypeTraitKind kind = vesk::TTK_enum;
    static const bool has_metadata = 0;
};
} // namespace vesk

struct Inner
{
    
    Inner() : y(0) {}
    explicit Inner(bool const& y_) : y(y_) {}
    void Serialise(vesk::Archive&) const;
    void Deserialise(vesk::InputArchive&);
    void EvictDgsNodes() const;
    void VisitObjects(vesk::IObjectVisitor& _v) const;
    void VisitPrefs(vesk::IPrefVisitor& _v) const;
    bool operator<(Inner const& _rhs) const
    {
        return (y < _rhs.y);
    }
    bool operator==(Inner const& _rhs) const
    {
        return y == _rhs.y;
    }
    bool operator!=(Inner const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(Inner const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(Inner const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(Inner const& _rhs) const { return !operator<(_rhs); }
    
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
struct Inner_model_mixin : public BC
{
    using typename BC::FinalClass;
    
    bool operator<(Inner_model_mixin const& _rhs) const {return _model_ < _rhs._model_;}
    bool operator==(Inner_model_mixin const& _rhs) const {return _model_ == _rhs._model_;}
    bool operator!=(Inner_model_mixin const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(Inner_model_mixin const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(Inner_model_mixin const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(Inner_model_mixin const& _rhs) const { return !operator<(_rhs); }
    void EvictDgsNodes() const {BC::EvictDgsNodes();_model_.EvictDgsNodes();}
    void VisitObjects(vesk::IObjectVisitor& _v) const {BC::VisitObjects(_v); _model_.VisitObjects(_v);}
    void VisitPrefs(vesk::IPrefVisitor& _v) const {BC::VisitPrefs(_v); _model_.VisitPrefs(_v);}
    
    static void GetyPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetyPath() { vesk::Path _path; GetyPath(_path); return _path; }
    bool const& _model__y() const { return _model_.y; }
    bool& _model__y() { return _model_.y; }
    bool const& Gety() const { vesk::DataSourceReadBarrier(&_model_.y,vesk::null,"Inner::_model_.y"); return _model_.y; }
    bool& Writey() { vesk::DataSourceWriteBarrier(&_model_.y,vesk::null,"Inner::_model_.y");  return _model_.y; }
    void Sety(bool const& _v) { vesk::DataSourceWriteBarrier(&_model_.y,vesk::null,"Inner::_model_.y"); _model_.y = _v; }
    union
    {
        struct
        {
            operator bool const&() const { return CONST_ATTRIB_CAST(Inner_model_mixin,y)->Gety(); }
            bool const& read() const { return CONST_ATTRIB_CAST(Inner_model_mixin,y)->Gety(); }
            bool & write() { return ATTRIB_CAST(Inner_model_mixin,y)->Writey(); }
            bool const& model() const { return CONST_ATTRIB_CAST(Inner_model_mixin,y)->_model__y(); }
            bool& model() { return ATTRIB_CAST(Inner_model_mixin,y)->_model__y(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(Inner_model_mixin,y)->GetyPath(); }
            void operator=(bool const& _v) { ATTRIB_CAST(Inner_model_mixin,y)->Sety(_v); }
        } y;
    };
    typedef Inner model_type;
    Inner const& model() const { return _model_; }
    Inner& model() { return _model_; }
    Inner const& read() const { vesk::DataSourceReadBarrier(static_cast<const typename BC::FinalClass*>(this), vesk::null,"Inner"); return _model_; }
    Inner & write() { vesk::DataSourceWriteBarrier(static_cast<typename BC::FinalClass*>(this), vesk::null,"Inner"); return _model_; }
    Inner _model_;
};

inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,Inner const& _x) { _x.VisitObjects(_v); return _v; }
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,Inner const*) { return _v; }
inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,Inner const& _x) { _x.VisitPrefs(_v); return _v; }

template<typename Archive> inline void Serialise(Archive& _ar,Inner const& _x) { _x.Serialise(_ar); }

template<typename Archive> inline void Deserialise(Archive& _ar,Inner& _x) { _x.Deserialise(_ar); }
inline vesk::xostream& operator<<(vesk::xostream& _os,Inner const& _x)
{
    _os << "Inner(" << _x.y << ')';
    return _os;
}

namespace vesk
{
template<> struct TypeTraits<Inner>
{
    static const bool is_exported = 0;
    static const bool is_reflected = 0;
    static const bool is_registered = 0;
    static const vesk::ETypeTraitKind kind = vesk::TTK_model;
    static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<Inner>
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

typedef vesk::int32 Number;
inline vesk::ConstStringZ GetTypedefName_Number()
{
    return "Number";
}

class K;
struct K_model
{
    
    K_model() {}
    explicit K_model(vesk::Array<vesk::Array<vesk::int32,3>,2> const& x_) : x(x_) {}
    void Serialise(vesk::Archive&) const;
    void Deserialise(vesk::InputArchive&);
    void EvictDgsNodes() const;
    void VisitObjects(vesk::IObjectVisitor& _v) const;
    void VisitPrefs(vesk::IPrefVisitor& _v) const;
    bool operator<(K_model const& _rhs) const
    {
        return (x < _rhs.x);
    }
    bool operator==(K_model const& _rhs) const
    {
        return x == _rhs.x;
    }
    bool operator!=(K_model const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(K_model const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(K_model const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(K_model const& _rhs) const { return !operator<(_rhs); }
    
    static void GetxPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetxPath() { vesk::Path _path; GetxPath(_path); return _path; }
    vesk::Array<vesk::Array<vesk::int32,3>,2> const& _model__x() const { return x; }
    vesk::Array<vesk::Array<vesk::int32,3>,2>& _model__x() { return x; }
    vesk::Array<vesk::Array<vesk::int32,3>,2> const& Getx() const { return x; }
    
    static void GetxElementPath(vesk::Path& _path,vesk::ssize_t _k0) { vxAssert(0 <= _k0 && _k0 < 2); vesk::octet_t* p=_path.InitLocalBuffer(2); p[0]=0; p[1]=(vesk::octet_t)_k0; }
    static vesk::Path GetxElementPath(vesk::ssize_t _k0) { vesk::Path _path; GetxElementPath(_path,_k0); return _path; }
    vesk::Array<vesk::int32,3> const& _model__xElement(vesk::ssize_t _k0) const { return x[_k0]; }
    vesk::Array<vesk::int32,3>& _model__xElement(vesk::ssize_t _k0) { return x[_k0]; }
    vesk::Array<vesk::int32,3> const& GetxElement(vesk::ssize_t _k0) const { return x[_k0]; }
    
    static void GetxElementElementPath(vesk::Path& _path,vesk::ssize_t _k0,vesk::ssize_t _k1) { vxAssert(0 <= _k0 && _k0 < 2); vxAssert(0 <= _k1 && _k1 < 3); vesk::octet_t* p=_path.InitLocalBuffer(3); p[0]=0; p[1]=(vesk::octet_t)_k0; p[2]=(vesk::octet_t)_k1; }
    static vesk::Path GetxElementElementPath(vesk::ssize_t _k0,vesk::ssize_t _k1) { vesk::Path _path; GetxElementElementPath(_path,_k0,_k1); return _path; }
    vesk::int32 const& _model__xElementElement(vesk::ssize_t _k0,vesk::ssize_t _k1) const { return x[_k0][_k1]; }
    vesk::int32& _model__xElementElement(vesk::ssize_t _k0,vesk::ssize_t _k1) { return x[_k0][_k1]; }
    vesk::int32 const& GetxElementElement(vesk::ssize_t _k0,vesk::ssize_t _k1) const { return x[_k0][_k1]; }
    vesk::int32& WritexElementElement(vesk::ssize_t _k0,vesk::ssize_t _k1) {  return x[_k0][_k1]; }
    void SetxElementElement(vesk::ssize_t _k0,vesk::ssize_t _k1,vesk::int32 const& _v) { x[_k0][_k1] = _v; }
    
    vesk::Array<vesk::Array<vesk::int32,3>,2> x;
};
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
    
    static void GetxPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetxPath() { vesk::Path _path; GetxPath(_path); return _path; }
    vesk::Array<vesk::Array<vesk::int32,3>,2> const& _model__x() const { return _model_.x; }
    vesk::Array<vesk::Array<vesk::int32,3>,2>& _model__x() { return _model_.x; }
    vesk::Array<vesk::Array<vesk::int32,3>,2> const& Getx() const { vesk::DataSourceReadBarrier(&_model_.x,vesk::null,"K::_model_.x"); return _model_.x; }
    
    static void GetxElementPath(vesk::Path& _path,vesk::ssize_t _k0) { vxAssert(0 <= _k0 && _k0 < 2); vesk::octet_t* p=_path.InitLocalBuffer(2); p[0]=0; p[1]=(vesk::octet_t)_k0; }
    static vesk::Path GetxElementPath(vesk::ssize_t _k0) { vesk::Path _path; GetxElementPath(_path,_k0); return _path; }
    vesk::Array<vesk::int32,3> const& _model__xElement(vesk::ssize_t _k0) const { return _model_.x[_k0]; }
    vesk::Array<vesk::int32,3>& _model__xElement(vesk::ssize_t _k0) { return _model_.x[_k0]; }
    vesk::Array<vesk::int32,3> const& GetxElement(vesk::ssize_t _k0) const { vesk::DataSourceReadBarrier(&_model_.x[_k0],vesk::null,"K::_model_.x[_k0]"); return _model_.x[_k0]; }
    
    static void GetxElementElementPath(vesk::Path& _path,vesk::ssize_t _k0,vesk::ssize_t _k1) { vxAssert(0 <= _k0 && _k0 < 2); vxAssert(0 <= _k1 && _k1 < 3); vesk::octet_t* p=_path.InitLocalBuffer(3); p[0]=0; p[1]=(vesk::octet_t)_k0; p[2]=(vesk::octet_t)_k1; }
    static vesk::Path GetxElementElementPath(vesk::ssize_t _k0,vesk::ssize_t _k1) { vesk::Path _path; GetxElementElementPath(_path,_k0,_k1); return _path; }
    vesk::int32 const& _model__xElementElement(vesk::ssize_t _k0,vesk::ssize_t _k1) const { return _model_.x[_k0][_k1]; }
    vesk::int32& _model__xElementElement(vesk::ssize_t _k0,vesk::ssize_t _k1) { return _model_.x[_k0][_k1]; }
    vesk::int32 const& GetxElementElement(vesk::ssize_t _k0,vesk::ssize_t _k1) const { vesk::DataSourceReadBarrier(&_model_.x[_k0][_k1],vesk::null,"K::_model_.x[_k0][_k1]"); return _model_.x[_k0][_k1]; }
    vesk::int32& WritexElementElement(vesk::ssize_t _k0,vesk::ssize_t _k1) { vesk::DataSourceWriteBarrier(&_model_.x[_k0][_k1],vesk::null,"K::_model_.x[_k0][_k1]");  return _model_.x[_k0][_k1]; }
    void SetxElementElement(vesk::ssize_t _k0,vesk::ssize_t _k1,vesk::int32 const& _v) { vesk::DataSourceWriteBarrier(&_model_.x[_k0][_k1],vesk::null,"K::_model_.x[_k0][_k1]"); _model_.x[_k0][_k1] = _v; }
    union
    {
        struct
        {
            operator vesk::Array<vesk::Array<vesk::int32,3>,2> const&() const { return CONST_ATTRIB_CAST(K_model_mixin,x)->Getx(); }
            vesk::Array<vesk::Array<vesk::int32,3>,2> const& read() const { return CONST_ATTRIB_CAST(K_model_mixin,x)->Getx(); }
            vesk::Array<vesk::Array<vesk::int32,3>,2> & write() { return ATTRIB_CAST(K_model_mixin,x)->Writex(); }
            vesk::Array<vesk::Array<vesk::int32,3>,2> const& model() const { return CONST_ATTRIB_CAST(K_model_mixin,x)->_model__x(); }
            vesk::Array<vesk::Array<vesk::int32,3>,2>& model() { return ATTRIB_CAST(K_model_mixin,x)->_model__x(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(K_model_mixin,x)->GetxPath(); }
            struct xElement
            {
                xElement(K_model_mixin* _self, vesk::ssize_t _k) : _self(_self),_k0(_k) {}
                vesk::Path GetxElementPath() const { return _self->GetxElementPath(_k0); }
                vesk::Array<vesk::int32,3> const& _model__xElement() const { return _self->_model__xElement(_k0); }
                vesk::Array<vesk::int32,3>& _model__xElement() { return _self->_model__xElement(_k0); }
                vesk::Array<vesk::int32,3> const& GetxElement() const { return _self->GetxElement(_k0); }
                vesk::ssize_t GetxElementSize() const { return _self->GetxElementSize(_k0); }
                vesk::int32 const& GetxElementElement(vesk::ssize_t _k1) const { return _self->GetxElementElement(_k0,_k1); }
                void SetxElementElement(vesk::ssize_t _k1,vesk::int32 _e) { _self->SetxElementElement(_k0,_k1,_e); }
                operator vesk::Array<vesk::int32,3> const&() const { return _self->GetxElement(_k0); }
                vesk::Array<vesk::int32,3> const& read() const { return _self->GetxElement(_k0); }
                vesk::Array<vesk::int32,3> & write() { return _self->WritexElement(_k0); }
                vesk::Array<vesk::int32,3> const& model() const { return _self->_model__xElement(_k0); }
                vesk::Array<vesk::int32,3>& model() { return _self->_model__xElement(_k0); }
                vesk::Path path() const { return _self->GetxElementPath(_k0); }
                struct xElementElement
                {
                    xElementElement(xElement* _self, vesk::ssize_t _k) : _self(_self),_k1(_k) {}
                    operator vesk::int32 const&() const { return _self->GetxElementElement(_k1); }
                    vesk::int32 const& read() const { return _self->GetxElementElement(_k1); }
                    vesk::int32 & write() { return _self->WritexElementElement(_k1); }
                    vesk::int32 const& model() const { return _self->_model__xElementElement(_k1); }
                    vesk::int32& model() { return _self->_model__xElementElement(_k1); }
                    vesk::Path path() const { return _self->GetxElementElementPath(_k1); }
                    void operator=(vesk::int32 const& _v) { _self->SetxElementElement(_k1,_v); }
                    xElement* _self;
                    vesk::ssize_t _k1;
                };
                xElementElement operator[](vesk::ssize_t _k1)
                {
                    return xElementElement(this,_k1);
                }
                xElementElement const operator[](vesk::ssize_t _k1) const
                {
                    return xElementElement(const_cast<xElement*>(this),_k1);
                }
                K_model_mixin* _self;
                vesk::ssize_t _k0;
            };
            xElement operator[](vesk::ssize_t _k0)
            {
                return xElement(ATTRIB_CAST(K_model_mixin,x),_k0);
            }
            xElement const operator[](vesk::ssize_t _k0) const
            {
                return xElement(const_cast<K_model_mixin*>(CONST_ATTRIB_CAST(K_model_mixin,x)),_k0);
            }
        } x;
    };
    typedef K_model model_type;
    K_model const& model() const { return _model_; }
    K_model& model() { return _model_; }
    K_model const& read() const { vesk::DataSourceReadBarrier(static_cast<const typename BC::FinalClass*>(this), vesk::null,"K"); return _model_; }
    K_model & write() { vesk::DataSourceWriteBarrier(static_cast<typename BC::FinalClass*>(this), vesk::null,"K"); return _model_; }
    K_model _model_;
};

namespace vesk
{
template<> struct TypeTraits<K>
{
    static const bool is_exported = 0;
    static const bool is_reflected = 0;
    static const bool is_registered = 0;
    static const vesk::ETypeTraitKind kind = vesk::TTK_class;
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
    static const bool can_serialise_model = 1;
    static const bool has_model = 1;
    static const bool using_model_base_class = 1;
};
} // namespace vesk
class K : public K_model_mixin<vesk::BaseMixin<K,vesk::EmptyBase>>
{
public:
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
inline vesk::xostream& operator<<(vesk::xostream& _os,K const& _x)
{
    _os << "K(" << _x._model_.x << ')';
    return _os;
}


#endif // include guard
