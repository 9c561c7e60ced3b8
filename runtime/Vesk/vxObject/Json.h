// Values and objects as JSON, both ways, by their records alone (see Access.h for what has a value).
//
//   bool                      true, false
//   integers to 32 bits       numbers; those of 64 and 128 bits strings of digits: many readers keep 53 bits.
//                             Either is read as either; a fraction or a number out of range is refused
//   float32, float64          the shortest number that reads back the same; "NaN", "Infinity", "-Infinity"
//   char8, char16             a string of one character; a number where the byte or unit is none by itself
//   string8, string16         strings. string8 must be UTF-8; a lone surrogate of a string16 is an escape
//   enumerations              the label; a number without a label is written as it is, and refused when it is read
//   classes                   objects, a member for each field. Members may be missing: the field stays as it is. An
//                             unknown or repeated member is refused
//   lists, arrays, sets       arrays. A fixed array must have its number of elements
//   xmap                      an object where the key is a string, an integer, a bool or an enumeration (a `$` in front
//                             is doubled), else an array of pairs
//   variants                  an object with one member, the item: {"ratio": 2.5}, {"nothing": null}. Items without
//                             reflection are {"$bytes": "0a1f"}, as an archive has them
//   openvariant               null, or {"$type": "a::Name", "$value": ...}
//   pref, cref                null, or {"$ref": 2}, the second object of the text
//   anything else             has no member. null as an element, which is left as it is when it is read
//
// A text with objects is {"$objects": [{"$class": "a::Doc", ...}, ...], "$value": ...}: the objects that the value
// leads to, each once, in a flat list, so that cycles and long chains are no trouble. A `$dep` field is calculated and
// not written. What is read is changed field by field: after an error the fields before it have their new values.
//
// A reader trusts nothing: the text is checked whole before anything is changed, the limits hold for it, and objects
// are made only of registered classes that the reference may lead to and that `m_allow` admits, values of an
// openvariant of types that `m_allowType` (and for a class `m_allow`) admits.

@import "Vesk/vxObject/Access.h"

namespace vesk {

// "line 3, column 7: ...", or the path of what cannot be written.
class JsonError : public AccessError {
 public:
  using AccessError::AccessError;
};

// Of arrays and objects in each other.
constexpr int kJsonDepth = 100;

struct JsonStyle {
  int m_indent = 0;  // 0: one line
  // Bytes that are not UTF-8 become U+FFFD. Otherwise they are an error, as they would not read back.
  bool m_replaceInvalid = false;
};

// Of a text that is read, and of one that is written: what a writer with the same limits wrote is read.
struct JsonLimits {
  std::size_t m_bytes = std::size_t(64) << 20;    // of the text
  std::size_t m_memory = std::size_t(256) << 20;  // of the elements and objects that it makes
  int m_depth = kJsonDepth;
  bool m_ignoreUnknown = false;                        // members that no field has
  std::function<bool(ReflectedClass const&)> m_allow;  // classes that may be made; empty: all registered
  std::function<bool(xstring const&)> m_allowType;     // types of values of an openvariant; the same
};

xstring ToJson(Value const& value, JsonStyle const& style = JsonStyle(), JsonLimits const& limits = JsonLimits());
void FromJson(Value const& value, std::string_view text, JsonLimits const& limits = JsonLimits());

template <typename T>
xstring ToJsonText(T const& value, JsonStyle const& style = JsonStyle(), JsonLimits const& limits = JsonLimits()) {
  return ToJson(Value::Of(value), style, limits);
}
template <typename T>
void FromJsonText(T& value, std::string_view text, JsonLimits const& limits = JsonLimits()) {
  FromJson(Value::Of(value), text, limits);
}

// An object and what it leads to. What is read belongs to the caller, as with ReadObject.
template <typename I>
xstring ObjectToJson(ptr<I> const& object, JsonStyle const& style = JsonStyle(),
                     JsonLimits const& limits = JsonLimits()) {
  return ToJsonText(pref<I>(object), style, limits);
}
template <typename I>
ptr<I> ObjectFromJson(std::string_view text, JsonLimits const& limits = JsonLimits()) {
  pref<I> reference;
  FromJsonText(reference, text, limits);
  return reference.Get();
}

}  // namespace vesk
