#include "questions/type_json.h"

#include <cmath>
#include <cstring>

#include "text/numbers.h"
#include "translator/symbols/declaration_kinds.h"

namespace qrex {

namespace {

uint64_t LittleEndian(std::string_view bytes, size_t count) {
  uint64_t value = 0;
  for (size_t i = count; i-- > 0;) value = value << 8 | static_cast<unsigned char>(bytes[i]);
  return value;
}

void WriteFloat(JsonWriter& json, uint64_t bits) {
  double value;
  std::memcpy(&value, &bits, sizeof value);
  std::isfinite(value) ? json.Value(value) : json.Value(ToString(value));
}

// Writes the value at the head; what is behind it.
std::string_view WriteValue(JsonWriter& json, std::string_view code) {
  const std::string_view behind = SkipMetadataValue(code);
  const auto op = static_cast<uint8_t>(code.front());
  code.remove_prefix(1);
  std::string_view text;
  if (op >= kOpMetaFunctor) {
    const bool isList = op >= kOpMetaList;
    if (!isList) {
      ReadCompactString(code, text);
      json.Open('{').Member("call", text).Key("arguments");
    }
    json.Open('[');
    for (size_t count = op - (isList ? kOpMetaList : kOpMetaFunctor); count > 0; --count) code = WriteValue(json, code);
    json.Close(']');
    if (!isList) json.Close('}');
  } else if (op == kOpMetaString) {
    ReadCompactString(code, text);
    json.Value(text);
  } else if (op == kOpMetaBool) {
    json.Value(code.front() != 0);
  } else if (op == kOpMetaInt) {
    json.Value(int64_t{static_cast<int32_t>(LittleEndian(code, 4))});
  } else {
    WriteFloat(json, LittleEndian(code, 8));
  }
  return behind;
}

// What is in front of a type: each of its values is a list of its own.
std::string_view MetadataOf(TypeView type) {
  const std::string_view code = type.Code();
  return code.substr(0, code.size() - type.WithoutMetadata().Code().size());
}

std::string_view KindOf(TypeView type) {
  static constexpr std::string_view kDecorators[] = {"volatile",    "const",   "assignable", "movable",
                                                     "offsettable", "pointer", "reference"};
  if (type.Op() == kOpCppText) return "text";
  if (type.IsNamed()) {
    for (const KindTraits& row : kDeclKinds) {
      if (row.op == type.Op()) return row.op == kOpClass ? "class" : row.keyword;
    }
  }
  if (type.IsBuiltIn()) return BuiltInTypeName(type.Op());
  if (type.Op() == kOpArray) return "Array";
  if (type.Op() == kOpMap) return "xmap";
  return type.IsTemplate() ? TemplateTypeName(type.Op()) : kDecorators[type.Op() - kOpVolatile];
}

void WriteShape(JsonWriter& json, TypeView type, bool isOuter) {
  const std::string_view metadata = MetadataOf(type);
  type = type.WithoutMetadata();
  json.Open('{').Member("kind", KindOf(type));
  if (!isOuter) WriteMetadata(json, metadata);
  if (type.IsNamed()) json.Member("name", type.Name());
  if (type.Op() == kOpArray) json.Member("count", int64_t{type.Count()});
  if (type.Op() == kOpMap) {
    json.Key("key");
    WriteShape(json, type.Key(), false);
  }
  if (type.HasInner()) {
    json.Key("of");
    WriteShape(json, type.Inner(), false);
  }
  json.Close('}');
}

std::string_view DirectionOf(ArgDirection direction) {
  static constexpr std::string_view kWords[] = {"", "in", "out", "inout", "copy"};
  return kWords[static_cast<size_t>(direction)];
}

}  // namespace

void WriteMetadata(JsonWriter& json, std::string_view metadata) {
  if (metadata.empty()) return;
  json.Key("metadata");
  const auto op = static_cast<uint8_t>(metadata.front());
  const bool isOneList = op >= kOpMetaList && SkipMetadataValue(metadata).empty();
  if (!isOneList) json.Open('[');
  while (!metadata.empty()) metadata = WriteValue(json, metadata);
  if (!isOneList) json.Close(']');
}

void WriteTypeMembers(JsonWriter& json, TypeView type) {
  json.Member("type", TypeText(type)).Key("shape");
  WriteShape(json, type, true);
  WriteMetadata(json, MetadataOf(type));
}

void WriteSignature(JsonWriter& json, const FunctionSignature& signature) {
  json.Key("returns").Open('{');
  WriteTypeMembers(json, signature.returnType);
  json.Close('}').Key("arguments").Open('[');
  for (const FunctionArg& argument : signature.arguments) {
    json.Open('{').Member("name", argument.name);
    WriteTypeMembers(json, argument.type);
    if (argument.direction != ArgDirection::None) json.Member("direction", DirectionOf(argument.direction));
    if (!argument.defaultValue.empty()) json.Member("default", argument.defaultValue);
    if (argument.polymorphic) json.Member("polymorphic", true);
    json.Close('}');
  }
  json.Close(']');
  if (signature.isConst) json.Member("const", true);
}

}  // namespace qrex
