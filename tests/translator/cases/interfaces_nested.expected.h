class C;

namespace vesk {
template<> struct TypeTraits<C> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_class; static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<C> {
    static const bool has_reflected_default_ctor = 0; static const bool has_reflected_dtor = 0; static const bool has_reflected_copy_ctor = 0; static const bool has_reflected_equality = 0; static const bool has_reflected_compare = 0; static const bool has_reflected_write_xostream = 0; static const bool has_reflected_serialise = 0; static const bool has_reflected_visit_IObjects = 0; static const bool has_reflected_visit_Prefs = 0; static const bool implements_IObject = 0; static const bool implements_IPersistable = 0; static const bool can_serialise_model = 0; static const bool has_model = 0; static const bool using_model_base_class = 0;
};
} // namespace vesk
class C {
    int x;
struct I {
    struct FnTable {
        void (__stdcall *f)(void* _self);
    };
    I(void* _self, const FnTable* table) : m_self(_self), m_table(table) {}
    
    void AssignFrom(I& _rhs) { m_self = _rhs.m_self; m_table = _rhs.m_table; }
    void AssignFrom(I const& _rhs) const { const_cast<I*>(this)->m_self = _rhs.m_self; const_cast<I*>(this)->m_table = _rhs.m_table; }
    
    template<typename T> struct Stubs {
        static void __stdcall f(void* _self) { ((T*)_self)->f(); }
        static const FnTable& GetTable() {
            static const FnTable t = {
                &f
            };
            return t;
        }
    };
    
    template<typename T> void CoerceFrom(T* _rhs) { m_self = _rhs; m_table = &Stubs<T>::GetTable(); }
    template<typename T> void CoerceFrom(const T* _rhs) const { const_cast<I*>(this)->m_self = const_cast<T*>(_rhs); const_cast<I*>(this)->m_table = &Stubs<T>::GetTable(); }
    
    void f() { m_table->f(m_self); }
    
    union {
        void* m_self;
    };
    FnTable const* m_table;
};
template <typename BC>
struct IDelegatorMixin : public BC {
    void f() { BC::GetI().f(); }
};

struct N : public IDelegatorMixin<vesk::BaseMixin<N,vesk::EmptyBase> > {
    typedef IDelegatorMixin<vesk::BaseMixin<N,vesk::EmptyBase> > BaseClass;
 I GetI(); 
public:
    
};



public:
    
};

