// What the modules of a process have in common where they see each other's symbols, and what parts share.

@import "Vesk/vxObject/Text.h"

namespace vesk {

// At most so many bytes of a text, and dots behind them where there are more.
inline xstring LimitText(std::string_view text, std::size_t most) {
  if (text.size() <= most) return xstring(text);
  while (most > 0 && (static_cast<octet_t>(text[most]) & 0xC0) == 0x80) --most;
  return xstring(text.substr(0, most)) + "...";
}

// One T for all modules, as a variable of an inline function of a header would be. It outlives every static object.
template <typename T>
T& Shared() {
  static T* const shared = new T;
  return *shared;
}

}  // namespace vesk
