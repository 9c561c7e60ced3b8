#pragma once
#ifndef _app_src_t_h
#define _app_src_t_h

#include "Vesk/vxObject/IObject.h"
namespace vesk
{
    RSN app_GetModelRsn();
    void app_WriteDataSourceRsn(Archive& ar);
    void app_ReadDataSourceRsn(InputArchive& ar);
}
template <typename T> struct S;
template <typename T> struct S_model
{
    
    S_model() : a(0) {}
    explicit S_model(vesk::int32 const& a_) : a(a_) {}
    template<typename Archive> void Serialise(Archive& _ar) const
    {
        _ar << this->a;
    }
    template<typename Archive> void Deserialise(Archive& _ar)
    {
        _ar >> this->a;
    }
    void EvictDgsNodes() const {vesk::DataSourceEvict(&a);}
    void VisitObjects(vesk::IObjectVisitor& _v) const {}
    void VisitPrefs(vesk::IPrefVisitor& _v) const {}
    bool operator<(S_model const& _rhs) const
    {
        return (a < _rhs.a);
    }
    bool operator==(S_model const& _rhs) const
    {
        return a == _rhs.a;
    }
    bool operator!=(S_model const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(S_model const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(S_model const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(S_model const& _rhs) const { return !operator<(_rhs); }
    
    static void GetaPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetaPath() { vesk::Path _path; GetaPath(_path); return _path; }
    vesk::int32 const& _model__a() const { return a; }
    vesk::int32& _model__a() { return a; }
    vesk::int32 const& Geta() const { return a; }
    vesk::int32& Writea() {  return a; }
    void Seta(vesk::int32 const& _v) { a = _v; }
    
    vesk::int32 a;
};
template <typename BC,typename T>
struct S_model_mixin : public BC
{
    using typename BC::FinalClass;
    
    bool operator<(S_model_mixin const& _rhs) const {return _model_ < _rhs._model_;}
    bool operator==(S_model_mixin const& _rhs) const {return _model_ == _rhs._model_;}
    bool operator!=(S_model_mixin const& _rhs) const { return !operator==(_rhs); }
    bool operator<=(S_model_mixin const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>(S_model_mixin const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=(S_model_mixin const& _rhs) const { return !operator<(_rhs); }
    void EvictDgsNodes() const {BC::EvictDgsNodes();_model_.EvictDgsNodes();}
    void VisitObjects(vesk::IObjectVisitor& _v) const {BC::VisitObjects(_v); _model_.VisitObjects(_v);}
    void VisitPrefs(vesk::IPrefVisitor& _v) const {BC::VisitPrefs(_v); _model_.VisitPrefs(_v);}
    
    static void GetaPath(vesk::Path& _path) { vesk::octet_t* p=_path.InitLocalBuffer(1); p[0]=0; }
    static vesk::Path GetaPath() { vesk::Path _path; GetaPath(_path); return _path; }
    vesk::int32 const& _model__a() const { return _model_.a; }
    vesk::int32& _model__a() { return _model_.a; }
    vesk::int32 const& Geta() const { vesk::DataSourceReadBarrier(&_model_.a,vesk::null,"S::_model_.a"); return _model_.a; }
    vesk::int32& Writea() { vesk::DataSourceWriteBarrier(&_model_.a,vesk::null,"S::_model_.a");  return _model_.a; }
    void Seta(vesk::int32 const& _v) { vesk::DataSourceWriteBarrier(&_model_.a,vesk::null,"S::_model_.a"); _model_.a = _v; }
    union
    {
        struct
        {
            operator vesk::int32 const&() const { return CONST_ATTRIB_CAST(S_model_mixin,a)->Geta(); }
            vesk::int32 const& read() const { return CONST_ATTRIB_CAST(S_model_mixin,a)->Geta(); }
            vesk::int32 & write() { return ATTRIB_CAST(S_model_mixin,a)->Writea(); }
            vesk::int32 const& model() const { return CONST_ATTRIB_CAST(S_model_mixin,a)->_model__a(); }
            vesk::int32& model() { return ATTRIB_CAST(S_model_mixin,a)->_model__a(); }
            vesk::Path path() const { return CONST_ATTRIB_CAST(S_model_mixin,a)->GetaPath(); }
            void operator=(vesk::int32 const& _v) { ATTRIB_CAST(S_model_mixin,a)->Seta(_v); }
        } a;
    };
    typedef S_model<T> model_type;
    S_model<T> const& model() const { return _model_; }
    S_model<T>& model() { return _model_; }
    S_model<T> const& read() const { vesk::DataSourceReadBarrier(static_cast<const typename BC::FinalClass*>(this), vesk::null,"S"); return _model_; }
    S_model<T> & write() { vesk::DataSourceWriteBarrier(static_cast<typename BC::FinalClass*>(this), vesk::null,"S"); return _model_; }
    S_model<T> _model_;
};
template <typename T>
struct S : public S_model_mixin<vesk::BaseMixin<S<T>,vesk::EmptyBase>,T>
{
    typedef S_model_mixin<vesk::BaseMixin<S<T>,vesk::EmptyBase>,T> BaseClass;

    int32 f(int32 b) const { return b; }
    void g() { }

public:
    
    void Serialise(vesk::Archive& _ar) const
    {
        vesk::app_WriteDataSourceRsn(_ar);
        this->_model_.Serialise(_ar);
    }
    void Deserialise(vesk::InputArchive& _ar)
    {
        vesk::app_ReadDataSourceRsn(_ar);
        this->_model_.Deserialise(_ar);
    }
    friend vesk::ReflectedClass const& _GetReflected(S const*)
    {
        static const vesk::octet_t S_a[] =
        {
            0x04
        };
        static const vesk::ReflectedModelField S_modelFields[] =
        {
            { "a", offsetof(S,_model_.a), S_a, 0, -1 },
        };
        static const vesk::octet_t S_f_return[] =
        {
            0x04
        };
        static const vesk::octet_t S_f_b[] =
        {
            0x04
        };
        static const vesk::ReflectedArg S_f_args[] =
        {
            { "b", S_f_b },
        };
        static const vesk::ReflectedClassMethod S_methods[] =
        {
            {"f",{S_f_return},S_f_args,1,0,true,(vesk::FunctionPointer)(vesk::int32 (__stdcall *)(S const* _self,vesk::int32 b))[](S const* _self,vesk::int32 b) -> vesk::int32 { return _self->f(b); }},
            {"g",{0},0,0,0,false,(vesk::FunctionPointer)(void (__stdcall *)(S* _self))[](S* _self) -> void { _self->g(); }},
        };
        static const vesk::ReflectedClass S_class =
        {
            4,
            "S",
            sizeof(S<T>),
            0,
            0,0,
            S_modelFields,1,
            0,0,
            S_methods,2,
            0,
            0,0,0,
            0,
            0,
            {
                sizeof(S),
                (vesk::CompareVariableFn) (bool (*)(S const*, S const*)) vesk::VariableEqual<S>,
                (vesk::CompareVariableFn) (bool (*)(S const*, S const*)) vesk::VariableLess<S>,
                (vesk::PrintVariableFn) (void (*)(vesk::xostream&, S const*)) vesk::PrintVariable<S>,
                (vesk::ConstructArrayFn) (void (*)( S*, vesk::ssize_t, vesk::ssize_t)) vesk::ConstructArray<S>,
                (vesk::CopyConstructArrayFn) (void (*)(S*, vesk::ssize_t, S const*, vesk::ssize_t, vesk::ssize_t)) vesk::CopyConstructArray<S>,
                (vesk::AssignArrayFn) (void (*)(S*, vesk::ssize_t, S const*, vesk::ssize_t, vesk::ssize_t)) vesk::AssignArray<S>,
                (vesk::DestructArrayFn) (void (*)( S*, vesk::ssize_t, vesk::ssize_t)) vesk::DestructArray<S>,
                (vesk::SerialiseArrayFn) (void (*)(vesk::Archive&, S const*, vesk::ssize_t, vesk::ssize_t)) vesk::SerialiseArray<S>,
                (vesk::DeserialiseArrayFn) (void (*)(vesk::InputArchive&, S*, vesk::ssize_t, vesk::ssize_t)) vesk::DeserialiseArray<S>,
                0,
                0,
                (vesk::FindInArrayFn) (vesk::ssize_t (*)(S const*, vesk::ssize_t, vesk::ssize_t, S const*)) vesk::BinaryLowerBound<S>,
                (vesk::FindInArrayFn) (vesk::ssize_t (*)(S const*, vesk::ssize_t, vesk::ssize_t, S const*)) vesk::BinaryUpperBound<S>
            }
        };
        
        return S_class;
    }
};

template <typename T> vesk::TypeOps const& _GetTypeOps(S<T> const*)
{
    return vesk::GetReflectedClass<S<T>>().m_ops;
}

template <typename T> inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,S<T> const& _x) { _x.VisitObjects(_v); return _v; }
template <typename T> inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,S<T> const*) { return _v; }
template <typename T> inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,S<T> const& _x) { _x.VisitPrefs(_v); return _v; }
template<typename Archive,typename T> inline void Serialise(Archive& _ar,S<T> const& _x) { _x.Serialise(_ar); }
template<typename Archive,typename T> inline void Deserialise(Archive& _ar,S<T>& _x) { _x.Deserialise(_ar); }
template <typename T> inline vesk::xostream& operator<<(vesk::xostream& _os,S<T> const& _x)
{
    _os << "S(" << _x._model_.a << ')';
    return _os;
}

template <typename T> inline vesk::int32 __stdcall f(S<T> const* _self,vesk::int32 b) { return _self->f(b); }
template <typename T> inline void __stdcall g(S<T>* _self) { _self->g(); }

#endif // include guard
