namespace { namespace n { struct J {
    struct FnTable {
    };
    J(void* _self, const FnTable* table) : m_self(_self), m_table(table) {}
    
    void AssignFrom(J& _rhs) { m_self = _rhs.m_self; m_table = _rhs.m_table; }
    void AssignFrom(J const& _rhs) const { const_cast<J*>(this)->m_self = _rhs.m_self; const_cast<J*>(this)->m_table = _rhs.m_table; }
    
    template<typename T> struct Stubs {
        static const FnTable& GetTable() {
            static const FnTable t = {};
            return t;
        }
    };
    
    template<typename T> void CoerceFrom(T* _rhs) { m_self = _rhs; m_table = &Stubs<T>::GetTable(); }
    template<typename T> void CoerceFrom(const T* _rhs) const { const_cast<J*>(this)->m_self = const_cast<T*>(_rhs); const_cast<J*>(this)->m_table = &Stubs<T>::GetTable(); }
    
    
    union {
        void* m_self;
    };
    FnTable const* m_table;
};
template <typename BC>
struct JDelegatorMixin : public BC {
};

inline vesk::ConstStringZ _GetIpcInterfaceName(J const*) { return "n::J"; }

} //n
} //
namespace vesk {
template<> struct TypeTraits<n::J> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_interface; static const bool has_metadata = 0;
};
template<> struct InterfaceTypeTraits<n::J> {
    static const bool is_ipc = true; static const bool is_rmi = false;
};
} // namespace vesk
namespace  {
namespace n {
 } }
