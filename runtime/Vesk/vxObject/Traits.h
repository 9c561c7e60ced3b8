// What can be asked of a type at compile time. Generated text specialises these templates; the primaries are the
// answers for everything else.

@import "Vesk/vxObject/Platform.h"
#ifdef __cpp_impl_reflection
@import "Vesk/vxObject/Annotations.h"
#endif

namespace vesk {

enum ETypeTraitKind {
  TTK_other,
  TTK_struct,
  TTK_class,
  TTK_adt,
  TTK_model,
  TTK_interface,
  TTK_functor,
  TTK_variant,
  TTK_enum
};

template <typename T>
struct TypeTraits {
  static const bool is_exported = false;
  static const bool is_reflected = false;
  static const bool is_registered = false;
  static const ETypeTraitKind kind = TTK_other;
  static const bool has_metadata = false;
};

template <typename T>
struct ClassTypeTraits {
  static const bool has_reflected_default_ctor = false;
  static const bool has_reflected_dtor = false;
  static const bool has_reflected_copy_ctor = false;
  static const bool has_reflected_equality = false;
  static const bool has_reflected_compare = false;
  static const bool has_reflected_write_xostream = false;
  static const bool has_reflected_serialise = false;
  static const bool has_reflected_visit_IObjects = false;
  static const bool has_reflected_visit_Prefs = false;
  static const bool implements_IObject = false;
  static const bool implements_IPersistable = false;
  static const bool can_serialise_model = false;
  static const bool has_model = false;
  static const bool using_model_base_class = false;
};

template <typename I>
struct InterfaceTypeTraits {
  static const bool is_ipc = false;
  static const bool is_rmi = false;
};

// By class and interface, then by base interface and interface.
template <typename C, typename I>
struct directly_implements_interface {
  static const bool value = false;
};
template <typename C, typename I>
struct indirectly_implements_interface {
  static const bool value = false;
};
template <typename B, typename I>
struct _is_direct_superinterface_of {
  static const bool value = false;
};
template <typename B, typename I>
struct _is_indirect_superinterface_of {
  static const bool value = false;
};

template <typename C, typename I>
constexpr bool ImplementsInterface =
    directly_implements_interface<C, I>::value || indirectly_implements_interface<C, I>::value;
template <typename B, typename I>
constexpr bool IsSuperInterface =
    _is_direct_superinterface_of<B, I>::value || _is_indirect_superinterface_of<B, I>::value;

// The detection idiom: Detects<Expression, T...> says whether Expression<T...> is a type.
template <typename, template <typename...> class Expression, typename... T>
struct Detector : std::false_type {};
template <template <typename...> class Expression, typename... T>
struct Detector<std::void_t<Expression<T...>>, Expression, T...> : std::true_type {};
template <template <typename...> class Expression, typename... T>
constexpr bool Detects = Detector<void, Expression, T...>::value;

}  // namespace vesk
