struct A {
    struct FnTable {
        void (__stdcall *a)(void* _self,vesk::int32 i);
    };
    A(void* _self, const FnTable* table) : m_self(_self), m_table(table) {}
    
    void AssignFrom(A& _rhs) { m_self = _rhs.m_self; m_table = _rhs.m_table; }
    void AssignFrom(A const& _rhs) const { const_cast<A*>(this)->m_self = _rhs.m_self; const_cast<A*>(this)->m_table = _rhs.m_table; }
    
    template<typename T> struct Stubs {
        static void __stdcall a(void* _self,vesk::int32 i) { ((T*)_self)->a(i); }
        static const FnTable& GetTable() {
            static const FnTable t = {
                &a
            };
            return t;
        }
    };
    
    template<typename T> void CoerceFrom(T* _rhs) { m_self = _rhs; m_table = &Stubs<T>::GetTable(); }
    template<typename T> void CoerceFrom(const T* _rhs) const { const_cast<A*>(this)->m_self = const_cast<T*>(_rhs); const_cast<A*>(this)->m_table = &Stubs<T>::GetTable(); }
    
    void a(vesk::int32 i) { m_table->a(m_self,i); }
    
    union {
        void* m_self;
    };
    FnTable const* m_table;
};
template <typename BC>
struct ADelegatorMixin : public BC {
    void a(vesk::int32 i) { BC::GetA().a(i); }
};

vesk::ReflectedInterface const& _GetReflected(A const*);

namespace vesk {
template<> struct TypeTraits<A> {
    static const bool is_exported = 1; static const bool is_reflected = 1; static const bool is_registered = 1; static const vesk::ETypeTraitKind kind = vesk::TTK_interface; static const bool has_metadata = 0;
};
template<> struct InterfaceTypeTraits<A> {
    static const bool is_ipc = false; static const bool is_rmi = false;
};
} // namespace vesk

struct K {
    struct FnTable {
        A::FnTable _A;
        vesk::int32 (__stdcall *k)(void const* _self);
    };
    K(void* _self, const FnTable* table) : m_self(_self), m_table(table) {}
    
    void AssignFrom(K& _rhs) { m_self = _rhs.m_self; m_table = _rhs.m_table; }
    void AssignFrom(K const& _rhs) const { const_cast<K*>(this)->m_self = _rhs.m_self; const_cast<K*>(this)->m_table = _rhs.m_table; }
    
    template<typename T> struct Stubs {
        static vesk::int32 __stdcall k(void const* _self) { return ((const T*)_self)->k(); }
        static const FnTable& GetTable() {
            static const FnTable t = { {
                    &A::Stubs<T>::a,
                },
                &k
            };
            return t;
        }
    };
    
    template<typename T> void CoerceFrom(T* _rhs) { m_self = _rhs; m_table = &Stubs<T>::GetTable(); }
    template<typename T> void CoerceFrom(const T* _rhs) const { const_cast<K*>(this)->m_self = const_cast<T*>(_rhs); const_cast<K*>(this)->m_table = &Stubs<T>::GetTable(); }
    
    void a(vesk::int32 i) { m_table->_A.a(m_self,i); }
    vesk::int32 k() const { return m_table->k(m_self); }
    
    operator A() const { return A(m_self, &m_table->_A); }
    
    union {
        void* m_self;
    };
    FnTable const* m_table;
};
template <typename BC>
struct KDelegatorMixin : public BC {
    vesk::int32 k() const { return BC::GetK().k(); }
};

vesk::ReflectedInterface const& _GetReflected(K const*);

namespace vesk {
template<> struct TypeTraits<K> {
    static const bool is_exported = 1; static const bool is_reflected = 1; static const bool is_registered = 1; static const vesk::ETypeTraitKind kind = vesk::TTK_interface; static const bool has_metadata = 0;
};
template<> struct InterfaceTypeTraits<K> {
    static const bool is_ipc = false; static const bool is_rmi = false;
};
template<> struct _is_direct_superinterface_of<A,K> { static const bool value = true; };
} // namespace vesk

struct L {
    struct FnTable {
        A::FnTable _A;
    };
    L(void* _self, const FnTable* table) : m_self(_self), m_table(table) {}
    
    void AssignFrom(L& _rhs) { m_self = _rhs.m_self; m_table = _rhs.m_table; }
    void AssignFrom(L const& _rhs) const { const_cast<L*>(this)->m_self = _rhs.m_self; const_cast<L*>(this)->m_table = _rhs.m_table; }
    
    template<typename T> struct Stubs {
        static const FnTable& GetTable() {
            static const FnTable t = { {
                    &A::Stubs<T>::a,
                },
            };
            return t;
        }
    };
    
    template<typename T> void CoerceFrom(T* _rhs) { m_self = _rhs; m_table = &Stubs<T>::GetTable(); }
    template<typename T> void CoerceFrom(const T* _rhs) const { const_cast<L*>(this)->m_self = const_cast<T*>(_rhs); const_cast<L*>(this)->m_table = &Stubs<T>::GetTable(); }
    
    void a(vesk::int32 i) { m_table->_A.a(m_self,i); }
    
    operator A() const { return A(m_self, &m_table->_A); }
    
    union {
        void* m_self;
    };
    FnTable const* m_table;
};
template <typename BC>
struct LDelegatorMixin : public BC {
};

vesk::ReflectedInterface const& _GetReflected(L const*);

namespace vesk {
template<> struct TypeTraits<L> {
    static const bool is_exported = 1; static const bool is_reflected = 1; static const bool is_registered = 1; static const vesk::ETypeTraitKind kind = vesk::TTK_interface; static const bool has_metadata = 0;
};
template<> struct InterfaceTypeTraits<L> {
    static const bool is_ipc = false; static const bool is_rmi = false;
};
template<> struct _is_direct_superinterface_of<A,L> { static const bool value = true; };
} // namespace vesk

struct D {
    struct FnTable {
        K::FnTable _K;
        L::FnTable _L;
        void (__stdcall *d)(void* _self,vesk::string8 const& s,vesk::int32 n);
        vesk::int32 (__stdcall *Getv)(void const* _self);
        void (__stdcall *Setv)(void* _self,vesk::int32 v);
        bool (__stdcall *Getw)(void const* _self);
    };
    D(void* _self, const FnTable* table) : m_self(_self), m_table(table) {}
    
    void AssignFrom(D& _rhs) { m_self = _rhs.m_self; m_table = _rhs.m_table; }
    void AssignFrom(D const& _rhs) const { const_cast<D*>(this)->m_self = _rhs.m_self; const_cast<D*>(this)->m_table = _rhs.m_table; }
    
    template<typename T> struct Stubs {
        static void __stdcall d(void* _self,vesk::string8 const& s,vesk::int32 n) { ((T*)_self)->d(s,n); }
        static vesk::int32 __stdcall Getv(void const* _self) { return ((const T*)_self)->Getv(); }
        static void __stdcall Setv(void* _self,vesk::int32 v) { ((T*)_self)->Setv(v); }
        static bool __stdcall Getw(void const* _self) { return ((const T*)_self)->Getw(); }
        static const FnTable& GetTable() {
            static const FnTable t = { { {
                        &A::Stubs<T>::a,
                    },
                    &K::Stubs<T>::k,
                }, { {
                        &A::Stubs<T>::a,
                    },
                },
                &d,
                &Getv,
                &Setv,
                &Getw
            };
            return t;
        }
    };
    
    template<typename T> void CoerceFrom(T* _rhs) { m_self = _rhs; m_table = &Stubs<T>::GetTable(); }
    template<typename T> void CoerceFrom(const T* _rhs) const { const_cast<D*>(this)->m_self = const_cast<T*>(_rhs); const_cast<D*>(this)->m_table = &Stubs<T>::GetTable(); }
    
    void a(vesk::int32 i) { m_table->_K._A.a(m_self,i); }
    vesk::int32 k() const { return m_table->_K.k(m_self); }
    void d(vesk::string8 const& s,vesk::int32 n=3) { m_table->d(m_self,s,n); }
    vesk::int32 Getv() const { return m_table->Getv(m_self); }
    void Setv(vesk::int32 v) { m_table->Setv(m_self,v); }
    bool Getw() const { return m_table->Getw(m_self); }
    
    operator A() const { return A(m_self, &m_table->_K._A); }
    operator K() const { return K(m_self, &m_table->_K); }
    operator L() const { return L(m_self, &m_table->_L); }
    
    union {
        struct {
            operator vesk::int32() const { return CONST_ATTRIB_CAST(D,v)->Getv(); }
            void operator=(vesk::int32 const& _v) { ATTRIB_CAST(D,v)->Setv(_v); }
        } v;
        struct {
            operator bool const() const { return CONST_ATTRIB_CAST(D,w)->Getw(); }
        } w;
        void* m_self;
    };
    FnTable const* m_table;
};
template <typename BC>
struct DDelegatorMixin : public BC {
    void d(vesk::string8 const& s,vesk::int32 n=3) { BC::GetD().d(s,n); }
    vesk::int32 Getv() const { return BC::GetD().Getv(); }
    void Setv(vesk::int32 v) { BC::GetD().Setv(v); }
    bool Getw() const { return BC::GetD().Getw(); }
};

vesk::ReflectedInterface const& _GetReflected(D const*);

namespace vesk {
template<> struct TypeTraits<D> {
    static const bool is_exported = 1; static const bool is_reflected = 1; static const bool is_registered = 1; static const vesk::ETypeTraitKind kind = vesk::TTK_interface; static const bool has_metadata = 1;
};
template<> struct InterfaceTypeTraits<D> {
    static const bool is_ipc = false; static const bool is_rmi = false;
};
template<> struct _is_direct_superinterface_of<K,D> { static const bool value = true; };
template<> struct _is_direct_superinterface_of<L,D> { static const bool value = true; };
template<> struct _is_indirect_superinterface_of<A,D> { static const bool value = true; };
} // namespace vesk

