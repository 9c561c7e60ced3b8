#pragma once
#ifndef _app_src_t_h
#define _app_src_t_h

#include "Vesk/vxObject/IObject.h"
struct Point
{
    
    Point() {}
    explicit Point(vesk::string8 const& name_) : name(name_) {}
    void Serialise(vesk::Archive&) const;
    void Deserialise(vesk::InputArchive&);
    void EvictDgsNodes() const;
    void VisitObjects(vesk::IObjectVisitor& _v) const;
    void VisitPrefs(vesk::IPrefVisitor& _v) const;
    bool operator<(Point const& _rhs) const
    {
        return (name < _rhs.name);
    }
    bool operator==(Point const& _rhs) const
    {
        return name == _rhs.name;
    }
    bool operator!=(Point const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(Point const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(Point const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(Point const& _rhs) const { return !operator<(_rhs); }
    
    static void GetnamePath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetnamePath() { vesk::Path _path; GetnamePath(_path); return _path; }
    vesk::string8 const& _model__name() const { return name; }
    vesk::string8& _model__name() { return name; }
    vesk::string8 const& Getname() const { return name; }
    void CreateIntoname(vesk::ssize_t _i,vesk::char8 const* _src,vesk::ssize_t _n)
    {
        name.insert(name.begin()+_i,_src,_src+_n);
    }
    void DeleteFromname(vesk::ssize_t _i1,vesk::ssize_t _i2)
    {
        name.erase(_i1,_i2-_i1);
    }
    
    vesk::string8 name;
};
template <typename BC>
struct Point_model_mixin : public BC
{
    using typename BC::FinalClass;
    
    bool operator<(Point_model_mixin const& _rhs) const {return _model_ < _rhs._model_;}
    bool operator==(Point_model_mixin const& _rhs) const {return _model_ == _rhs._model_;}
    bool operator!=(Point_model_mixin const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(Point_model_mixin const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(Point_model_mixin const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(Point_model_mixin const& _rhs) const { return !operator<(_rhs); }
    void EvictDgsNodes() const {BC::EvictDgsNodes();_model_.EvictDgsNodes();}
    void VisitObjects(vesk::IObjectVisitor& _v) const {BC::VisitObjects(_v); _model_.VisitObjects(_v);}
    void VisitPrefs(vesk::IPrefVisitor& _v) const {BC::VisitPrefs(_v); _model_.VisitPrefs(_v);}
    
    static void GetnamePath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetnamePath() { vesk::Path _path; GetnamePath(_path); return _path; }
    vesk::string8 const& _model__name() const { return _model_.name; }
    vesk::string8& _model__name() { return _model_.name; }
    vesk::string8 const& Getname() const { vesk::DataSourceReadBarrier(&_model_.name,vesk::null,"Point::_model_.name"); return _model_.name; }
    void CreateIntoname(vesk::ssize_t _i,vesk::char8 const* _src,vesk::ssize_t _n)
    {
        vesk::DataSourceWriteBarrier(&_model_.name,vesk::null,"Point::_model_.name"); _model_.name.insert(_model_.name.begin()+_i,_src,_src+_n);
    }
    void DeleteFromname(vesk::ssize_t _i1,vesk::ssize_t _i2)
    {
        vesk::DataSourceWriteBarrier(&_model_.name,vesk::null,"Point::_model_.name"); _model_.name.erase(_i1,_i2-_i1);
    }
    union
    {
        struct
        {
            operator vesk::string8 const&() const { return CONST_ATTRIB_CAST(Point_model_mixin,name)->Getname(); }
            vesk::string8 const& read() const { return CONST_ATTRIB_CAST(Point_model_mixin,name)->Getname(); }
            vesk::string8 & write() { return ATTRIB_CAST(Point_model_mixin,name)->Writename(); }
            vesk::string8 const& model() const { return CONST_ATTRIB_CAST(Point_model_mixin,name)->_model__name(); }
            vesk::string8& model() { return ATTRIB_CAST(Point_model_mixin,name)->_model__name(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(Point_model_mixin,name)->GetnamePath(); }
            void insert(vesk::ssize_t _i,vesk::char8 const* _src,vesk::ssize_t _n)
            {
                ATTRIB_CAST(Point_model_mixin,name)->CreateIntoname(_i,_src,_n);
            }
            void insert(vesk::ssize_t _i,vesk::char8 const& _v)
            {
                insert(_i,&_v,1);
            }
            void push_front(vesk::char8 const& _v)
            {
                insert(0,_v);
            }
            void push_back(vesk::char8 const& _v)
            {
                insert(model().size(),_v);
            }
            void erase_range(vesk::ssize_t _i1,vesk::ssize_t _i2)
            {
                ATTRIB_CAST(Point_model_mixin,name)->DeleteFromname(_i1,_i2);
            }
            void erase(vesk::ssize_t _i)
            {
                erase_range(_i,_i+1);
            }
            void pop_front()
            {
                erase(0);
            }
            void pop_back()
            {
                erase(model().size()-1);
            }
            void clear()
            {
                erase_range(0,model().size());
            }
        } name;
    };
    typedef Point model_type;
    Point const& model() const { return _model_; }
    Point& model() { return _model_; }
    Point const& read() const { vesk::DataSourceReadBarrier(static_cast<const typename BC::FinalClass*>(this), vesk::null,"Point"); return _model_; }
    Point & write() { vesk::DataSourceWriteBarrier(static_cast<typename BC::FinalClass*>(this), vesk::null,"Point"); return _model_; }
    Point _model_;
};

inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,Point const& _x) { _x.VisitObjects(_v); return _v; }
inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,Point const*) { return _v; }
inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,Point const& _x) { _x.VisitPrefs(_v); return _v; }

template<typename Archive> inline void Serialise(Archive& _ar,Point const& _x) { _x.Serialise(_ar); }

template<typename Archive> inline void Deserialise(Archive& _ar,Point& _x) { _x.Deserialise(_ar); }
inline vesk::xostream& operator<<(vesk::xostream& _os,Point const& _x)
{
    _os << "Point(" << _x.name << ')';
    return _os;
}

namespace vesk
{
template<> struct TypeTraits<Point>
{
    static const bool is_exported = 0;
    static const bool is_reflected = 0;
    static const bool is_registered = 0;
    static const vesk::ETypeTraitKind kind = vesk::TTK_model;
    static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<Point>
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
