namespace a {
enum E : int {
    a=0,
    b=7
};
vesk::ReflectedEnum const& _GetReflected(E const*);
inline vesk::TypeOps const& _GetTypeOps(E const*) { return vesk::GetTypeOps<vesk::int32>(); }
template<typename Archive> inline void Serialise(Archive& _ar,E _x) { vesk::SerialiseVariableLengthUint(_ar, (int)_x); }
template<typename Archive> inline void Deserialise(Archive& _ar,E& _x) { vesk::DeserialiseVariableLengthUint(_ar, (int&)_x); }

} //a
namespace vesk {
template<> struct TypeTraits<a::E> {
    static const bool is_exported = 0; static const bool is_reflected = 1; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_enum; static const bool has_metadata = 1;
};
} // namespace vesk
namespace a {

}
