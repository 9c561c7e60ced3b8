struct Pos;

namespace vesk {
template<> struct TypeTraits<Pos> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_struct; static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<Pos> {
    static const bool has_reflected_default_ctor = 0; static const bool has_reflected_dtor = 0; static const bool has_reflected_copy_ctor = 0; static const bool has_reflected_equality = 0; static const bool has_reflected_compare = 0; static const bool has_reflected_write_xostream = 0; static const bool has_reflected_serialise = 0; static const bool has_reflected_visit_IObjects = 0; static const bool has_reflected_visit_Prefs = 0; static const bool implements_IObject = 0; static const bool implements_IPersistable = 0; static const bool can_serialise_model = 0; static const bool has_model = 0; static const bool using_model_base_class = 0;
};
} // namespace vesk
struct Pos
{ 
public:
    
};


namespace n {
struct J {
    struct FnTable {
        void (__stdcall *none)(void const* _self);
        void (__stdcall *all)(void* _self,vesk::int32 a,vesk::string8 const& b,vesk::string8& c,vesk::xvector<vesk::int8>& d,Pos* e);
        void (__stdcall *back)(void* _self,vesk::int8& r);
    };
    J(void* _self, const FnTable* table) : m_self(_self), m_table(table) {}
    
    void AssignFrom(J& _rhs) { m_self = _rhs.m_self; m_table = _rhs.m_table; }
    void AssignFrom(J const& _rhs) const { const_cast<J*>(this)->m_self = _rhs.m_self; const_cast<J*>(this)->m_table = _rhs.m_table; }
    
    template<typename T> struct Stubs {
        static void __stdcall none(void const* _self) { ((const T*)_self)->none(); }
        static void __stdcall all(void* _self,vesk::int32 a,vesk::string8 const& b,vesk::string8& c,vesk::xvector<vesk::int8>& d,Pos* e) { ((T*)_self)->all(a,b,c,d,e); }
        static void __stdcall back(void* _self,vesk::int8& r) { ((T*)_self)->back(r); }
        static const FnTable& GetTable() {
            static const FnTable t = {
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
    
    union {
        void* m_self;
    };
    FnTable const* m_table;
};
template <typename BC>
struct JDelegatorMixin : public BC {
    void none() const { BC::GetJ().none(); }
    void all(vesk::int32 a,vesk::string8 const& b,vesk::string8& c,vesk::xvector<vesk::int8>& d,Pos* e) { BC::GetJ().all(a,b,c,d,e); }
    void back(vesk::int8& r) { BC::GetJ().back(r); }
};

vesk::ReflectedInterface const& _GetReflected(J const*);

inline vesk::ConstStringZ _GetIpcInterfaceName(J const*) { return "n::J"; }

} //n
namespace vesk {
template<> struct TypeTraits<n::J> {
    static const bool is_exported = 1; static const bool is_reflected = 1; static const bool is_registered = 1; static const vesk::ETypeTraitKind kind = vesk::TTK_interface; static const bool has_metadata = 0;
};
template<> struct InterfaceTypeTraits<n::J> {
    static const bool is_ipc = true; static const bool is_rmi = true;
};
} // namespace vesk
namespace n {

}
