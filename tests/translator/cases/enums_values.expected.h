enum A : int {
    a=0,
    b=10,
    c=11
};
template<typename Archive> inline void Serialise(Archive& _ar,A _x) { vesk::SerialiseVariableLengthUint(_ar, (int)_x); }
template<typename Archive> inline void Deserialise(Archive& _ar,A& _x) { vesk::DeserialiseVariableLengthUint(_ar, (int&)_x); }

namespace vesk {
template<> struct TypeTraits<A> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_enum; static const bool has_metadata = 0;
};
} // namespace vesk

enum B : int {
    d=-2,
    e=-1,
    f=0
};
template<typename Archive> inline void Serialise(Archive& _ar,B _x) { vesk::SerialiseVariableLengthUint(_ar, (int)_x); }
template<typename Archive> inline void Deserialise(Archive& _ar,B& _x) { vesk::DeserialiseVariableLengthUint(_ar, (int&)_x); }

namespace vesk {
template<> struct TypeTraits<B> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_enum; static const bool has_metadata = 0;
};
} // namespace vesk

enum C : int {
    g=-1,
    h=0
};
template<typename Archive> inline void Serialise(Archive& _ar,C _x) { vesk::SerialiseVariableLengthUint(_ar, (int)_x); }
template<typename Archive> inline void Deserialise(Archive& _ar,C& _x) { vesk::DeserialiseVariableLengthUint(_ar, (int&)_x); }

namespace vesk {
template<> struct TypeTraits<C> {
    static const bool is_exported = 0; static const bool is_reflected = 0; static const bool is_registered = 0; static const vesk::ETypeTraitKind kind = vesk::TTK_enum; static const bool has_metadata = 0;
};
} // namespace vesk
  // the low 32 bits
class D;

enum E : int;

enum E : int;

