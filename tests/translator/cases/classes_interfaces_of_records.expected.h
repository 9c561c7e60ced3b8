struct I {
    struct FnTable {
        vesk::IPersistable::FnTable _IPersistable;
    };
    I(void* _self, const FnTable* table) : m_self(_self), m_table(table) {}
    
    void AssignFrom(I& _rhs) { m_self = _rhs.m_self; m_table = _rhs.m_table; }
    void AssignFrom(I const& _rhs) const { const_cast<I*>(this)->m_self = _rhs.m_self; const_cast<I*>(this)->m_table = _rhs.m_table; }
    
    template<typename T> struct Stubs {
        static const FnTable& GetTable() {
            static const FnTable t = { { {
                    },
                },
            };
            return t;
        }
    };
    
    template<typename T> void CoerceFrom(T* _rhs) { m_self = _rhs; m_table = &Stubs<T>::GetTable(); }
    template<typename T> void CoerceFrom(const T* _rhs) const { const_cast<I*>(this)->m_self = const_cast<T*>(_rhs); const_cast<I*>(this)->m_table = &Stubs<T>::GetTable(); }
    
    
    operator vesk::IObject() const { return vesk::IObject(m_self, &m_table->_IPersistable._IObject); }
    operator vesk::IPersistable() const { return vesk::IPersistable(m_self, &m_table->_IPersistable); }
    
    union {
        void* m_self;
    };
    FnTable const* m_table;
};
template <typename BC>
struct IDelegatorMixin : public BC {
};

vesk::ReflectedInterface const& _GetReflected(I const*);

namespace vesk {
template<> struct TypeTraits<I> {
    static const bool is_exported = 1; static const bool is_reflected = 1; static const bool is_registered = 1; static const vesk::ETypeTraitKind kind = vesk::TTK_interface; static const bool has_metadata = 0;
};
template<> struct InterfaceTypeTraits<I> {
    static const bool is_ipc = false; static const bool is_rmi = false;
};
template<> struct _is_direct_superinterface_of<vesk::IPersistable,I> { static const bool value = true; };
template<> struct _is_indirect_superinterface_of<vesk::IObject,I> { static const bool value = true; };
} // namespace vesk
 struct J {
    struct FnTable {
        vesk::IObject::FnTable _IObject;
    };
    J(void* _self, const FnTable* table) : m_self(_self), m_table(table) {}
    
    void AssignFrom(J& _rhs) { m_self = _rhs.m_self; m_table = _rhs.m_table; }
    void AssignFrom(J const& _rhs) const { const_cast<J*>(this)->m_self = _rhs.m_self; const_cast<J*>(this)->m_table = _rhs.m_table; }
    
    template<typename T> struct Stubs {
        static const FnTable& GetTable() {
            static const FnTable t = { {
                },
            };
            return t;
        }
    };
    
    template<typename T> void CoerceFrom(T* _rhs) { m_self = _rhs; m_table = &Stubs<T>::GetTable(); }
    template<typename T> void CoerceFrom(const T* _rhs) const { const_cast<J*>(this)->m_self = const_cast<T*>(_rhs); const_cast<J*>(this)->m_table = &Stubs<T>::GetTable(); }
    
    
    operator vesk::IObject() const { return vesk::IObject(m_self, &m_table->_IObject); }
    
    union {
        void* m_self;
    };
    FnTable const* m_table;
};
template <typename BC>
struct JDelegatorMixin : public BC {
};

namespace vesk {
template<> struct TypeTraits<J> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_interface; static const bool has_metadata = 0;
};
template<> struct InterfaceTypeTraits<J> {
    static const bool is_ipc = false; static const bool is_rmi = false;
};
template<> struct _is_direct_superinterface_of<vesk::IObject,J> { static const bool value = true; };
} // namespace vesk
 struct K {
    struct FnTable {
        J::FnTable _J;
    };
    K(void* _self, const FnTable* table) : m_self(_self), m_table(table) {}
    
    void AssignFrom(K& _rhs) { m_self = _rhs.m_self; m_table = _rhs.m_table; }
    void AssignFrom(K const& _rhs) const { const_cast<K*>(this)->m_self = _rhs.m_self; const_cast<K*>(this)->m_table = _rhs.m_table; }
    
    template<typename T> struct Stubs {
        static const FnTable& GetTable() {
            static const FnTable t = { { {
                    },
                },
            };
            return t;
        }
    };
    
    template<typename T> void CoerceFrom(T* _rhs) { m_self = _rhs; m_table = &Stubs<T>::GetTable(); }
    template<typename T> void CoerceFrom(const T* _rhs) const { const_cast<K*>(this)->m_self = const_cast<T*>(_rhs); const_cast<K*>(this)->m_table = &Stubs<T>::GetTable(); }
    
    
    operator vesk::IObject() const { return vesk::IObject(m_self, &m_table->_J._IObject); }
    operator J() const { return J(m_self, &m_table->_J); }
    
    union {
        void* m_self;
    };
    FnTable const* m_table;
};
template <typename BC>
struct KDelegatorMixin : public BC {
};

vesk::ReflectedInterface const& _GetReflected(K const*);

namespace vesk {
template<> struct TypeTraits<K> {
    static const bool is_exported = 1; static const bool is_reflected = 1; static const bool is_registered = 1; static const vesk::ETypeTraitKind kind = vesk::TTK_interface; static const bool has_metadata = 0;
};
template<> struct InterfaceTypeTraits<K> {
    static const bool is_ipc = false; static const bool is_rmi = false;
};
template<> struct _is_direct_superinterface_of<J,K> { static const bool value = true; };
template<> struct _is_indirect_superinterface_of<vesk::IObject,K> { static const bool value = true; };
} // namespace vesk

 struct A;

namespace vesk {
template<> struct TypeTraits<A> {
    static const bool is_exported = 0; static const bool is_reflected = 1; static const bool is_registered = 1; static const vesk::ETypeTraitKind kind = vesk::TTK_struct; static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<A> {
    static const bool has_reflected_default_ctor = 1; static const bool has_reflected_dtor = 1; static const bool has_reflected_copy_ctor = 1; static const bool has_reflected_equality = 0; static const bool has_reflected_compare = 0; static const bool has_reflected_write_xostream = 0; static const bool has_reflected_serialise = 0; static const bool has_reflected_visit_IObjects = 0; static const bool has_reflected_visit_Prefs = 0; static const bool implements_IObject = 1; static const bool implements_IPersistable = 1; static const bool can_serialise_model = 0; static const bool has_model = 0; static const bool using_model_base_class = 0;
};
template<> struct directly_implements_interface<A,K> { static const bool value = true; };
template<> struct directly_implements_interface<A,I> { static const bool value = true; };
template<> struct indirectly_implements_interface<A,vesk::IObject> { static const bool value = true; };
template<> struct indirectly_implements_interface<A,J> { static const bool value = true; };
template<> struct indirectly_implements_interface<A,vesk::IPersistable> { static const bool value = true; };
} // namespace vesk
struct A : public vesk::PersistableMixin<vesk::IObjectBaseMixin<A,vesk::EmptyBase>> {
    typedef vesk::PersistableMixin<vesk::IObjectBaseMixin<A,vesk::EmptyBase>> BaseClass;
 
public:
    
    static vesk::ptr<vesk::IObject> __stdcall sfnCreateInstance();
    friend vesk::ReflectedClass const& _GetReflected(A const*);
    vesk::AnyInterface QueryInterface(const vesk::ReflectedInterface&);
    vesk::ReflectedClass const* GetReflectedClass() const;
};

vesk::ReflectedClass const& _GetReflected(A const*);
vesk::TypeOps const& _GetTypeOps(A const*);
