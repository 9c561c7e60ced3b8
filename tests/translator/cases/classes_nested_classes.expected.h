struct A;

namespace vesk {
template<> struct TypeTraits<A> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_struct; static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<A> {
    static const bool has_reflected_default_ctor = 0; static const bool has_reflected_dtor = 0; static const bool has_reflected_copy_ctor = 0; static const bool has_reflected_equality = 0; static const bool has_reflected_compare = 0; static const bool has_reflected_write_xostream = 0; static const bool has_reflected_serialise = 0; static const bool has_reflected_visit_IObjects = 0; static const bool has_reflected_visit_Prefs = 0; static const bool implements_IObject = 0; static const bool implements_IPersistable = 0; static const bool can_serialise_model = 0; static const bool has_model = 0; static const bool using_model_base_class = 0;
};
} // namespace vesk
struct A {
    class B;

    struct C {
        vesk::int32 x;
        class D
{ 
public:
    
};


    
public:
    vesk::int32 Getx() const { return x; }
    void Setx(vesk::int32 _v) { x = _v; }
    
};


inline vesk::xostream& operator<<(vesk::xostream& _os,C const& _x) { ((C&)_x).Write(_os); return _os; }


public:
    
};


