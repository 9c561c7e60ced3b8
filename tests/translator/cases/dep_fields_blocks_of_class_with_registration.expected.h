namespace n { class S;

} //n
namespace vesk {
template<> struct TypeTraits<n::S> {
    static const bool is_exported = 1; static const bool is_reflected = 1; static const bool is_registered = 1; static const vesk::ETypeTraitKind kind = vesk::TTK_class; static const bool has_metadata = 0;
};
template<> struct ClassTypeTraits<n::S> {
    static const bool has_reflected_default_ctor = 1; static const bool has_reflected_dtor = 1; static const bool has_reflected_copy_ctor = 1; static const bool has_reflected_equality = 0; static const bool has_reflected_compare = 0; static const bool has_reflected_write_xostream = 0; static const bool has_reflected_serialise = 0; static const bool has_reflected_visit_IObjects = 0; static const bool has_reflected_visit_Prefs = 0; static const bool implements_IObject = 1; static const bool implements_IPersistable = 0; static const bool can_serialise_model = 0; static const bool has_model = 0; static const bool using_model_base_class = 0;
};
template<> struct directly_implements_interface<n::S,vesk::IObject> { static const bool value = true; };
} // namespace vesk
namespace n {
class S : public vesk::IObjectBaseMixin<S,vesk::EmptyBase> {
public:
    typedef vesk::IObjectBaseMixin<S,vesk::EmptyBase> BaseClass;
//
void EvictDgsNodes_extra() const;


void VisitObjects(vesk::IObjectVisitor& v) const;


public:
    void EvictDgsNodes() const {
        EvictDgsNodes_extra();
        BaseClass::EvictDgsNodes();
    }
    
    static vesk::ptr<vesk::IObject> __stdcall sfnCreateInstance();
    friend vesk::ReflectedClass const& _GetReflected(S const*);
    vesk::AnyInterface QueryInterface(const vesk::ReflectedInterface&);
    vesk::ReflectedClass const* GetReflectedClass() const;
};

vesk::ReflectedClass const& _GetReflected(S const*);
vesk::TypeOps const& _GetTypeOps(S const*);
 }
