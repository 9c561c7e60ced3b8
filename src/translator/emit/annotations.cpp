#include "translator/emit/annotations.h"

#include <cmath>

#include "text/numbers.h"
#include "translator/emit/write.h"
#include "translator/symbols/scanned_file.h"
#include "translator/types/metadata.h"

namespace qrex {

namespace {

// Octal, since a hexadecimal escape would take the letters behind it along.
std::string Literal(std::string_view text) {
  std::string out = "\"";
  for (const char c : text) {
    const auto byte = static_cast<unsigned char>(c);
    if (byte < ' ' || byte > '~') {
      out += '\\';
      for (int shift = 6; shift >= 0; shift -= 3) out += static_cast<char>('0' + (byte >> shift & 7));
      continue;
    }
    if (c == '"' || c == '\\') out += '\\';
    out += c;
  }
  return out + '"';
}

std::string Literal(double value) {
  if (std::isnan(value)) return "__builtin_nan(\"\")";
  if (std::isinf(value)) return value < 0 ? "-__builtin_inf()" : "__builtin_inf()";
  const std::string text = ToString(value);
  return text.find_first_of(".e") == std::string::npos ? text + ".0" : text;
}

std::string Literal(int32_t value) {
  return value == INT32_MIN ? "(-2147483647 - 1)" : ToString(value);  // the number alone would be a long
}

std::string Expression(const MetadataValue& value, bool isArgument);

std::string Expressions(const std::vector<MetadataValue>& values, bool areArguments) {
  std::string text;
  for (const MetadataValue& value : values) {
    if (!text.empty()) text += ", ";
    text += Expression(value, areArguments);
  }
  return text;
}

// An annotation can hold neither a pointer to a literal nor a list: types of the runtime do.
std::string Expression(const MetadataValue& value, bool isArgument) {
  switch (value.kind) {
    case MetadataValue::Kind::Bool:
      return value.number != 0 ? "true" : "false";
    case MetadataValue::Kind::Int:
      return Literal(value.number);
    case MetadataValue::Kind::Float:
      return Literal(value.real);
    case MetadataValue::Kind::String:
      return isArgument ? Literal(value.text) : "vesk::AnnotationText(" + Literal(value.text) + ")";
    case MetadataValue::Kind::List:
      return "vesk::AnnotationList(" + Expressions(value.values, false) + ")";
    case MetadataValue::Kind::Functor:
      break;
  }
  const std::string name(value.text);
  return value.values.empty() ? name : name + "(" + Expressions(value.values, true) + ")";
}

}  // namespace

void WriteAnnotations(TextWriter& out, const NameSpaceElement& owner, TypeView type, OutputLine line) {
  if (!type.IsMetadata() || !owner.owner.host.Settings().annotations) return;
  std::string text;
  for (const MetadataValue& item : ItemsOfMetadata(type.Metadata())) {
    text += (text.empty() ? "=" : ", =") + Expression(item, false);
  }
  if (text.empty()) return;
  if (line == OutputLine::HasText) out << "\n";
  Write(out, R"(
    #ifdef __cpp_impl_reflection
    [[$annotations$]]
    #endif
  )",
        "annotations"_ = text);
}

}  // namespace qrex
