#include "translator/model/type_shape.h"

namespace qrex {

namespace {

constexpr char kChar8[] = {kOpChar8}, kChar16[] = {kOpChar16};

TypeView CodeOf(const char (&op)[1]) { return std::string_view(op, 1); }

const ClassDef* ModelOfType(TypeView type, NameSpace& root) {
  const auto* element = NamedElement(type, root);
  if (!element || element->category != Category::Class) return nullptr;
  const auto* def = static_cast<const ClassDef*>(element);
  return def->IsPureModel() ? def : nullptr;
}

}  // namespace

TypeShape ShapeOf(TypeView type, NameSpace& root) {
  switch (type.Op()) {
    case kOpClass: {
      const ClassDef* const model = ModelOfType(type, root);
      return {.shape = model ? Shape::Model : Shape::Value, .model = model};
    }
    case kOpVector:
      return {.shape = Shape::Vector, .element = type.Inner()};
    case kOpString8:
      return {.shape = Shape::Vector, .element = CodeOf(kChar8)};
    case kOpString16:
      return {.shape = Shape::Vector, .element = CodeOf(kChar16)};
    case kOpArray:
      return {.shape = Shape::Indexed, .element = type.Inner(), .bound = type.Count()};
    case kOpDynArray:
      return {.shape = Shape::Indexed, .element = type.Inner()};
    case kOpMap:
      return {.shape = Shape::Indexed, .element = type.Value(), .key = type.Key()};
    case kOpSet:
      return {.shape = Shape::KeySet, .element = type.Inner()};
    default:
      return {};
  }
}

}  // namespace qrex
