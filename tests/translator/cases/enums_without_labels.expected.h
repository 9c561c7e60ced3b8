class C : public vesk::EnumBase<C> {
    public:
    enum Enum : int {
    };
    C(Enum _v) : EnumBase(_v) {}
    explicit C(int _v = 0) : EnumBase(_v) {}
    enum { LEN = 0 };
    static vesk::ConstStringZ const * stringArray() {
        static vesk::ConstStringZ const _s[] =  { };
        return _s;
    }
};

namespace vesk {
template<> struct TypeTraits<C> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_enum; static const bool has_metadata = 0;
};
} // namespace vesk

vesk::ReflectedEnum const& _GetReflected(P const*);
inline vesk::TypeOps const& _GetTypeOps(P const*) { return vesk::GetTypeOps<vesk::int32>(); }
template<typename Archive> inline void Serialise(Archive& _ar,P _x) { vesk::SerialiseVariableLengthUint(_ar, (int)_x); }
template<typename Archive> inline void Deserialise(Archive& _ar,P& _x) { vesk::DeserialiseVariableLengthUint(_ar, (int&)_x); }

namespace vesk {
template<> struct TypeTraits<P> {
    static const bool is_exported = 1; static const bool is_reflected = 1; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_enum; static const bool has_metadata = 0;
};
} // namespace vesk

