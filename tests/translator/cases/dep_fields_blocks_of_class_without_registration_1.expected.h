struct S;

namespace vesk {
template<> struct TypeTraits<S> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_struct; static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<S> {
    static const bool has_reflected_default_ctor = 0; static const bool has_reflected_dtor = 0; static const bool has_reflected_copy_ctor = 0; static const bool has_reflected_equality = 0; static const bool has_reflected_compare = 0; static const bool has_reflected_write_xostream = 0; static const bool has_reflected_serialise = 0; static const bool has_reflected_visit_IObjects = 0; static const bool has_reflected_visit_Prefs = 0; static const bool implements_IObject = 0; static const bool implements_IPersistable = 0; static const bool can_serialise_model = 0; static const bool has_model = 0; static const bool using_model_base_class = 0;
};
} // namespace vesk
struct S
{//
void EvictDgsNodes_extra() const
{ S::drop(); } 

void VisitObjects(vesk::IObjectVisitor& v) const {
    v << this->GetThisAsFinalClass();
}

int end;

public:
    void EvictDgsNodes() const {
        EvictDgsNodes_extra();
    }
    
};


inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,S const& _x) { _x.VisitObjects(_v); return _v; }

