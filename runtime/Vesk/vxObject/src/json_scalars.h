// Numbers, bools, characters and labels in JSON. Each is read at the next token, checked, and then set; what does not
// fit fails there. The Set functions take the text of a token or of a key that stood `at` a position.

@import "Vesk/vxObject/src/json_scanner.h"

namespace vesk {

void ReadJsonBool(JsonScanner& scanner, void* address);
void ReadJsonInteger(JsonScanner& scanner, ValueType const& type, void* address);
void SetJsonInteger(JsonScanner& scanner, ValueType const& type, void* address, std::string_view text, std::size_t at);
void ReadJsonFloat(JsonScanner& scanner, float32& value);
void ReadJsonFloat(JsonScanner& scanner, float64& value);
void ReadJsonChar(JsonScanner& scanner, ValueType const& type, void* address);
void ReadJsonEnum(JsonScanner& scanner, ValueType const& type, int32& value);
void SetJsonEnum(JsonScanner& scanner, ValueType const& type, int32& value, std::string const& text, bool isLabel,
                 std::size_t at);

}  // namespace vesk
