#include "questions/type_json.h"

#include <cmath>

#include "text/numbers.h"
#include "translator/symbols/declaration_kinds.h"
#include "translator/types/metadata.h"

namespace qrex {

namespace {

void WriteFloat(JsonWriter& json, double value) {
  std::isfinite(value) ? json.Value(value) : json.Value(ToString(value));
}

void WriteValue(JsonWriter& json, const MetadataValue& value);

void WriteValues(JsonWriter& json, const std::vector<MetadataValue>& values) {
  json.Open('[');
  for (const MetadataValue& value : values) WriteValue(json, value);
  json.Close(']');
}

void WriteValue(JsonWriter& json, const MetadataValue& value) {
  switch (value.kind) {
    case MetadataValue::Kind::Bool:
      json.Value(value.number != 0);
      break;
    case MetadataValue::Kind::Int:
      json.Value(int64_t{value.number});
      break;
    case MetadataValue::Kind::Float:
      WriteFloat(json, value.real);
      break;
    case MetadataValue::Kind::String:
      json.Value(value.text);
      break;
    case MetadataValue::Kind::List:
      WriteValues(json, value.values);
      break;
    case MetadataValue::Kind::Functor:
      json.Open('{').Member("call", value.text).Key("arguments");
      WriteValues(json, value.values);
      json.Close('}');
  }
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
  const std::string_view metadata = type.Metadata();
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
  std::vector<MetadataValue> values;
  while (!metadata.empty()) values.push_back(TakeMetadataValue(metadata));
  const bool isOneList = values.size() == 1 && values[0].kind == MetadataValue::Kind::List;
  WriteValues(json, isOneList ? values[0].values : values);
}

void WriteTypeMembers(JsonWriter& json, TypeView type) {
  json.Member("type", TypeText(type)).Key("shape");
  WriteShape(json, type, true);
  WriteMetadata(json, type.Metadata());
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
