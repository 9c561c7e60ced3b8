// What the generated text takes for granted: scalar types, assertions, calling convention, casts from a member to the
// object that holds it.

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <memory>
#include <new>
#include <type_traits>
#include <utility>
#include <sys/types.h>

// The version of this library: major * 10000 + minor * 100 + patch.
#define VESK_VERSION 10100

// Records list the offsets of fields of classes with bases, and functors are ordered by their functions. Every
// supported compiler does with these what is expected. The text that is warned of stands in the sources of the user, so
// what keeps the warnings away reaches all that follows; who wants them defines VESK_KEEP_WARNINGS.
#ifndef VESK_KEEP_WARNINGS
#pragma GCC diagnostic ignored "-Winvalid-offsetof"
#ifdef __clang__
#pragma clang diagnostic ignored "-Wordered-compare-function-pointers"
#endif
#endif

#if !defined(_WIN32) && !defined(__stdcall)
#define __stdcall
#endif

namespace vesk {

typedef std::int8_t int8;
typedef std::int16_t int16;
typedef std::int32_t int32;
typedef std::int64_t int64;
__extension__ typedef __int128 int128;
typedef std::uint8_t uint8;
typedef std::uint16_t uint16;
typedef std::uint32_t uint32;
typedef std::uint64_t uint64;
__extension__ typedef unsigned __int128 uint128;
typedef float float32;
typedef double float64;
typedef char char8;
typedef char16_t char16;
typedef unsigned char octet_t;
using ::ssize_t;

typedef const char* ConstStringZ;
typedef void (*FunctionPointer)();

// A release number of a model's schema.
typedef int64 RSN;

// The null of interface pointers, functors and barriers without an object.
struct NullInterface {};
constexpr NullInterface null = {};

[[noreturn]] void FailAssertion(ConstStringZ expression, ConstStringZ file, int line);

}  // namespace vesk

// Generated text spells scalar types without a name space in some places. The signatures of `$` members may spell all
// types so: they are copied as they stand, and the type grammar needs no name space. A header that has names like these
// in the global name space can stand beside it: an ambiguous name must then be qualified where it is used.
namespace vesk {
namespace unqualified {
using vesk::char16;
using vesk::char8;
using vesk::float32;
using vesk::float64;
using vesk::int128;
using vesk::int16;
using vesk::int32;
using vesk::int64;
using vesk::int8;
using vesk::uint128;
using vesk::uint16;
using vesk::uint32;
using vesk::uint64;
using vesk::uint8;
}  // namespace unqualified
}  // namespace vesk
using namespace vesk::unqualified;

#if defined(_LIBCPP_VERSION) && !defined(_LIBCPP_ENABLE_CXX17_REMOVED_AUTO_PTR)
// What [copy] parameters arrive in. This library has taken it out.
namespace std {
template <typename T>
class auto_ptr {
 public:
  typedef T element_type;
  explicit auto_ptr(T* object = nullptr) noexcept : m_object(object) {}
  auto_ptr(auto_ptr& rhs) noexcept : m_object(rhs.release()) {}
  auto_ptr(auto_ptr&& rhs) noexcept : m_object(rhs.release()) {}
  ~auto_ptr() { delete m_object; }
  auto_ptr& operator=(auto_ptr& rhs) noexcept {
    reset(rhs.release());
    return *this;
  }
  auto_ptr& operator=(auto_ptr&& rhs) noexcept {
    reset(rhs.release());
    return *this;
  }
  T& operator*() const noexcept { return *m_object; }
  T* operator->() const noexcept { return m_object; }
  T* get() const noexcept { return m_object; }
  T* release() noexcept { return exchange(m_object, nullptr); }
  void reset(T* object = nullptr) noexcept {
    if (object != m_object) delete exchange(m_object, object);
  }

 private:
  T* m_object;
};
}  // namespace std
#endif

#ifdef NDEBUG
#define vxAssert(x) ((void)0)
#else
#define vxAssert(x) ((x) ? (void)0 : ::vesk::FailAssertion(#x, __FILE__, __LINE__))
#endif

// Like vxAssert, but evaluated in every build.
#define vxVerify(x) ((x) ? (void)0 : ::vesk::FailAssertion(#x, __FILE__, __LINE__))
#define vxAssertUnreachable() ::vesk::FailAssertion("unreachable", __FILE__, __LINE__)

// From `this` of a member (an attribute struct, a node) to the object that holds it. No offsetof: MEMBER may be a path.
#define VX_MEMBER_OFFSET(CLS, MEMBER) \
  (reinterpret_cast<char*>(&reinterpret_cast<CLS*>(0x10000)->MEMBER) - reinterpret_cast<char*>(0x10000))
#define ATTRIB_CAST(CLS, MEMBER) (reinterpret_cast<CLS*>(reinterpret_cast<char*>(this) - VX_MEMBER_OFFSET(CLS, MEMBER)))
#define CONST_ATTRIB_CAST(CLS, MEMBER) \
  (reinterpret_cast<CLS const*>(reinterpret_cast<char const*>(this) - VX_MEMBER_OFFSET(CLS, MEMBER)))

// The storage of a variant: as large as its largest item, and aligned for it. The number in the name is that of the
// items; it is kept behind the storage, so that whoever reads a tag knows which there are.
namespace vesk {
template <typename... Sizes>
constexpr std::size_t MaxSize(Sizes... sizes) {
  std::size_t most = 1;
  ((most = static_cast<std::size_t>(sizes) > most ? static_cast<std::size_t>(sizes) : most), ...);
  return most;
}
// As all types but those of 16 byte integers need it.
template <typename... Sizes>
constexpr std::size_t VariantAlignment(Sizes... sizes) {
  std::size_t alignment = 1;
  while (alignment < 8 && 2 * alignment <= MaxSize(sizes...)) alignment *= 2;
  return alignment;
}
}  // namespace vesk

@scope
{
    @let int items = 1
    @while (items <= 64)
    {
        #define VESK_MAX@@@(items)(...) \
          ::vesk::MaxSize(__VA_ARGS__)] __attribute__((aligned(::vesk::VariantAlignment(__VA_ARGS__)))); \
          public: \
          enum { _vesk_items_ = @@@(items) }; \
          private: \
          typedef ::vesk::octet_t _vesk_end_[1
        @let items = items + 1
    }
}
