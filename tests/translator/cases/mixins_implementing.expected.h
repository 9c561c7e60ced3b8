struct I {
    struct FnTable {
        vesk::IObject::FnTable _IObject;
        vesk::int32 (__stdcall *f)(void const* _self,vesk::int32 a);
        void (__stdcall *g)(void* _self);
    };
    I(void* _self, const FnTable* table) : m_self(_self), m_table(table) {}
    
    void AssignFrom(I& _rhs) { m_self = _rhs.m_self; m_table = _rhs.m_table; }
    void AssignFrom(I const& _rhs) const { const_cast<I*>(this)->m_self = _rhs.m_self; const_cast<I*>(this)->m_table = _rhs.m_table; }
    
    template<typename T> struct Stubs {
        static vesk::int32 __stdcall f(void const* _self,vesk::int32 a) { return ((const T*)_self)->f(a); }
        static void __stdcall g(void* _self) { ((T*)_self)->g(); }
        static const FnTable& GetTable() {
            static const FnTable t = { {
                },
                &f,
                &g
            };
            return t;
        }
    };
    
    template<typename T> void CoerceFrom(T* _rhs) { m_self = _rhs; m_table = &Stubs<T>::GetTable(); }
    template<typename T> void CoerceFrom(const T* _rhs) const { const_cast<I*>(this)->m_self = const_cast<T*>(_rhs); const_cast<I*>(this)->m_table = &Stubs<T>::GetTable(); }
    
    vesk::int32 f(vesk::int32 a=1) const { return m_table->f(m_self,a); }
    void g() { m_table->g(m_self); }
    
    operator vesk::IObject() const { return vesk::IObject(m_self, &m_table->_IObject); }
    
    union {
        void* m_self;
    };
    FnTable const* m_table;
};
template <typename BC>
struct IDelegatorMixin : public BC {
    vesk::int32 f(vesk::int32 a=1) const { return BC::GetI().f(a); }
    void g() { BC::GetI().g(); }
};

vesk::ReflectedInterface const& _GetReflected(I const*);

namespace vesk {
template<> struct TypeTraits<I> {
    static const bool is_exported = 1; static const bool is_reflected = 1; static const bool is_registered = 1; static const vesk::ETypeTraitKind kind = vesk::TTK_interface; static const bool has_metadata = 0;
};
template<> struct InterfaceTypeTraits<I> {
    static const bool is_ipc = false; static const bool is_rmi = false;
};
template<> struct _is_direct_superinterface_of<vesk::IObject,I> { static const bool value = true; };
} // namespace vesk

struct A;

void __stdcall h(A* _self,vesk::string8 s);
namespace vesk {
template<> struct TypeTraits<A> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_adt; static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<A> {
    static const bool has_reflected_default_ctor = 0; static const bool has_reflected_dtor = 0; static const bool has_reflected_copy_ctor = 0; static const bool has_reflected_equality = 0; static const bool has_reflected_compare = 0; static const bool has_reflected_write_xostream = 0; static const bool has_reflected_serialise = 0; static const bool has_reflected_visit_IObjects = 0; static const bool has_reflected_visit_Prefs = 0; static const bool implements_IObject = 0; static const bool implements_IPersistable = 0; static const bool can_serialise_model = 0; static const bool has_model = 0; static const bool using_model_base_class = 0;
};
} // namespace vesk

class K;

namespace vesk {
template<> struct TypeTraits<K> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_class; static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<K> {
    static const bool has_reflected_default_ctor = 0; static const bool has_reflected_dtor = 0; static const bool has_reflected_copy_ctor = 0; static const bool has_reflected_equality = 0; static const bool has_reflected_compare = 0; static const bool has_reflected_write_xostream = 0; static const bool has_reflected_serialise = 0; static const bool has_reflected_visit_IObjects = 0; static const bool has_reflected_visit_Prefs = 0; static const bool implements_IObject = 1; static const bool implements_IPersistable = 0; static const bool can_serialise_model = 0; static const bool has_model = 0; static const bool using_model_base_class = 0;
};
template<> struct directly_implements_interface<K,I> { static const bool value = true; };
template<> struct indirectly_implements_interface<K,vesk::IObject> { static const bool value = true; };
} // namespace vesk
class K : public vesk::IObjectBaseMixin<K,vesk::EmptyBase> {
public:
    typedef vesk::IObjectBaseMixin<K,vesk::EmptyBase> BaseClass;
 void g();
vesk::int32 f(vesk::int32 a=1) const;
void h(vesk::string8 s);
 
public:
    
    vesk::AnyInterface QueryInterface(const vesk::ReflectedInterface&);
    vesk::ReflectedClass const* GetReflectedClass() const;
};


class L;

namespace vesk {
template<> struct TypeTraits<L> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_class; static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<L> {
    static const bool has_reflected_default_ctor = 0; static const bool has_reflected_dtor = 0; static const bool has_reflected_copy_ctor = 0; static const bool has_reflected_equality = 0; static const bool has_reflected_compare = 0; static const bool has_reflected_write_xostream = 0; static const bool has_reflected_serialise = 0; static const bool has_reflected_visit_IObjects = 0; static const bool has_reflected_visit_Prefs = 0; static const bool implements_IObject = 0; static const bool implements_IPersistable = 0; static const bool can_serialise_model = 0; static const bool has_model = 0; static const bool using_model_base_class = 0;
};
} // namespace vesk
class L
{ vesk::int32 f(vesk::int32 a=1) const;
void g();
 
public:
    
};


