// What the modules of a process have in common where they see each other's symbols.

@import "Vesk/vxObject/Text.h"

namespace vesk {

// One T for all modules, as a variable of an inline function of a header would be. It outlives every static object.
template <typename T>
T& Shared() {
  static T* const shared = new T;
  return *shared;
}

}  // namespace vesk
