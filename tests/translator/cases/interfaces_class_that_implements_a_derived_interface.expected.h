#pragma once
#ifndef _app_src_t_h
#define _app_src_t_h

#include "Vesk/vxObject/IObject.h"
struct A
{
    struct FnTable
    {
        vesk::IObject::FnTable _IObject;
    };
    A(void* _self, const FnTable* table) : m_self(_self), m_table(table) {}
    
    void AssignFrom(A& _rhs) { m_self = _rhs.m_self; m_table = _rhs.m_table; }
    void AssignFrom(A const& _rhs) const { const_cast<A*>(this)->m_self = _rhs.m_self; const_cast<A*>(this)->m_table = _rhs.m_table; }
    
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
    template<typename T> void CoerceFrom(const T* _rhs) const { const_cast<A*>(this)->m_self = const_cast<T*>(_rhs); const_cast<A*>(this)->m_table = &Stubs<T>::GetTable(); }
    
    
    operator vesk::IObject() const { return vesk::IObject(m_self, &m_table->_IObject); }
    
    union
    {
        void* m_self;
    };
    FnTable const* m_table;
};
template <typename BC>
struct ADelegatorMixin : public BC
{
};

vesk::ReflectedInterface const& _GetReflected(A const*);

namespace vesk
{
template<> struct TypeTraits<A>
{
    static const bool is_exported = 1;
    static const bool is_reflected = 1;
    static const bool is_registered = 1;
    static const vesk::ETypeTraitKind kind = vesk::TTK_interface;
    static const bool has_metadata = 0;
};
template<> struct InterfaceTypeTraits<A>
{
    static const bool is_ipc = false;
    static const bool is_rmi = false;
};
template<> struct _is_direct_superinterface_of<vesk::IObject,A> { static const bool value = true; };
} // namespace vesk

struct B
{
    struct FnTable
    {
        A::FnTable _A;
    };
    B(void* _self, const FnTable* table) : m_self(_self), m_table(table) {}
    
    void AssignFrom(B& _rhs) { m_self = _rhs.m_self; m_table = _rhs.m_table; }
    void AssignFrom(B const& _rhs) const { const_cast<B*>(this)->m_self = _rhs.m_self; const_cast<B*>(this)->m_table = _rhs.m_table; }
    
    template<typename T> struct Stubs
    {
        static const FnTable& GetTable()
        {
            static const FnTable t =
            {
                {
                    {
                    },
                },
            };
            return t;
        }
    };
    
    template<typename T> void CoerceFrom(T* _rhs) { m_self = _rhs; m_table = &Stubs<T>::GetTable(); }
    template<typename T> void CoerceFrom(const T* _rhs) const { const_cast<B*>(this)->m_self = const_cast<T*>(_rhs); const_cast<B*>(this)->m_table = &Stubs<T>::GetTable(); }
    
    
    operator vesk::IObject() const { return vesk::IObject(m_self, &m_table->_A._IObject); }
    operator A() const { return A(m_self, &m_table->_A); }
    
    union
    {
        void* m_self;
    };
    FnTable const* m_table;
};
template <typename BC>
struct BDelegatorMixin : public BC
{
};

vesk::ReflectedInterface const& _GetReflected(B const*);

namespace vesk
{
template<> struct TypeTraits<B>
{
    static const bool is_exported = 1;
    static const bool is_reflected = 1;
    static const bool is_registered = 1;
    static const vesk::ETypeTraitKind kind = vesk::TTK_interface;
    static const bool has_metadata = 0;
};
template<> struct InterfaceTypeTraits<B>
{
    static const bool is_ipc = false;
    static const bool is_rmi = false;
};
template<> struct _is_direct_superinterface_of<A,B> { static const bool value = true; };
template<> struct _is_indirect_superinterface_of<vesk::IObject,B> { static const bool value = true; };
} // namespace vesk

struct U
{
    struct FnTable
    {
    };
    U(void* _self, const FnTable* table) : m_self(_self), m_table(table) {}
    
    void AssignFrom(U& _rhs) { m_self = _rhs.m_self; m_table = _rhs.m_table; }
    void AssignFrom(U const& _rhs) const { const_cast<U*>(this)->m_self = _rhs.m_self; const_cast<U*>(this)->m_table = _rhs.m_table; }
    
    template<typename T> struct Stubs
    {
        static const FnTable& GetTable()
        {
            static const FnTable t = {};
            return t;
        }
    };
    
    template<typename T> void CoerceFrom(T* _rhs) { m_self = _rhs; m_table = &Stubs<T>::GetTable(); }
    template<typename T> void CoerceFrom(const T* _rhs) const { const_cast<U*>(this)->m_self = const_cast<T*>(_rhs); const_cast<U*>(this)->m_table = &Stubs<T>::GetTable(); }
    
    
    union
    {
        void* m_self;
    };
    FnTable const* m_table;
};
template <typename BC>
struct UDelegatorMixin : public BC
{
};

namespace vesk
{
template<> struct TypeTraits<U>
{
    static const bool is_exported = 0;
    static const bool is_reflected = 0;
    static const bool is_registered = 0;
    static const vesk::ETypeTraitKind kind = vesk::TTK_interface;
    static const bool has_metadata = 0;
};
template<> struct InterfaceTypeTraits<U>
{
    static const bool is_ipc = false;
    static const bool is_rmi = false;
};
} // namespace vesk

class K;

namespace vesk
{
template<> struct TypeTraits<K>
{
    static const bool is_exported = 1;
    static const bool is_reflected = 1;
    static const bool is_registered = 1;
    static const vesk::ETypeTraitKind kind = vesk::TTK_class;
    static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<K>
{
    static const bool has_reflected_default_ctor = 1;
    static const bool has_reflected_dtor = 1;
    static const bool has_reflected_copy_ctor = 1;
    static const bool has_reflected_equality = 0;
    static const bool has_reflected_compare = 0;
    static const bool has_reflected_write_xostream = 0;
    static const bool has_reflected_serialise = 0;
    static const bool has_reflected_visit_IObjects = 0;
    static const bool has_reflected_visit_Prefs = 0;
    static const bool implements_IObject = 1;
    static const bool implements_IPersistable = 0;
    static const bool can_serialise_model = 0;
    static const bool has_model = 0;
    static const bool using_model_base_class = 0;
};
template<> struct directly_implements_interface<K,U> { static const bool value = true; };
template<> struct directly_implements_interface<K,B> { static const bool value = true; };
template<> struct indirectly_implements_interface<K,vesk::IObject> { static const bool value = true; };
template<> struct indirectly_implements_interface<K,A> { static const bool value = true; };
} // namespace vesk
class K : public vesk::IObjectBaseMixin<K,vesk::EmptyBase>
{
public:
    typedef vesk::IObjectBaseMixin<K,vesk::EmptyBase> BaseClass;
 
public:
    
    static vesk::ptr<vesk::IObject> __stdcall sfnCreateInstance();
    friend vesk::ReflectedClass const& _GetReflected(K const*);
    vesk::AnyInterface QueryInterface(const vesk::ReflectedInterface&);
    vesk::ReflectedClass const* GetReflectedClass() const;
};

vesk::ReflectedClass const& _GetReflected(K const*);
vesk::TypeOps const& _GetTypeOps(K const*);


#endif // include guard
