// What reading and writing of JSON share: strings, keys, and how variants and objects are named.

@import "Vesk/vxObject/Json.h"
@import "Vesk/vxObject/ValueTypes.h"

namespace vesk {

constexpr char kHexDigits[] = "0123456789abcdef";

// The length of the UTF-8 sequence that the text begins with; 0 when it is none.
std::size_t Utf8Length(std::string_view text);

// What a value takes of JsonLimits::m_memory, counted alike by who reads and who writes it.
class JsonMemory {
 public:
  explicit JsonMemory(std::size_t limit) : m_limit(limit) {}
  // Whether there was as much.
  bool Take(std::size_t size, std::size_t count = 1) {
    if (size > 0 && count > (m_limit - m_taken) / size) return false;
    m_taken += size * count;
    return true;
  }
  void Reset() { m_taken = 0; }
  // For an element of a list, for an entry of a set or map.
  static std::size_t OfElement(ValueType const& list) {
    return list.m_item->m_size + (list.m_code == RC_LIST ? 16 : 0);
  }
  static std::size_t OfEntry(ValueType const& container) { return container.EntrySize() + 32; }

 private:
  std::size_t m_limit;
  std::size_t m_taken = 0;
};

// In quotes, with escapes. Bytes that are not UTF-8 become U+FFFD or throw.
void PutJsonString(std::string& out, std::string_view text, bool replaceInvalid);
void PutJsonString(std::string& out, std::u16string_view text);

// Whether a map with such keys is an object.
bool IsJsonKey(ValueType const& type);
// "int32" for "vesk::int32".
std::string_view JsonItemName(std::string_view name);
// The type that an openvariant's archive names; null for one that only its operations know.
ValueType const* JsonTypeOfName(ValueTypes& types, xstring const& name);
// An item's archive stands by itself: JsonError for a type that refers to objects.
void CheckNoReferences(ValueTypes& types, ValueType const& type);
// An interface handle as the object that it is. JsonError for an interface that does not begin with IObject.
ptr<IObject> JsonObjectOf(xstring interface, AnyInterface any);

}  // namespace vesk
