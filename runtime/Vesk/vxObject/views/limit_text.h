// What is shown of a text that may be long.

@import "Vesk/vxObject/Text.h"

namespace vesk {

// At most so many bytes of a text, and dots behind them where there are more.
inline xstring LimitText(std::string_view text, std::size_t most) {
  if (text.size() <= most) return xstring(text);
  while (most > 0 && (static_cast<octet_t>(text[most]) & 0xC0) == 0x80) --most;
  return xstring(text.substr(0, most)) + "...";
}

}  // namespace vesk
