#include "translator/type_expansion.h"

#include <algorithm>

namespace qrex {

namespace {

class TypeExpansion {
 public:
  TypeExpansion(NameSpace& root, Follow follow) : m_root(root), m_follow(follow) {}

  void Enter(const ClassDef* def) { m_path.push_back(def); }

  std::string Fault(std::string_view type, size_t depth) {
    uint32_t decorators = 0;
    type = SkipDecorators(type, m_root, decorators);
    if (depth > kMaxDepth || ++m_steps > kMaxSteps) return "type nested too deeply";
    switch (static_cast<uint8_t>(type.front())) {
      case kOpClass:
        return ClassFault(type, depth);
      case kOpVector:
        return m_follow == Follow::Vectors ? Fault(type.substr(1), depth + 1) : "";
      case kOpDynArray:
        return m_follow == Follow::Elements ? Fault(type.substr(1), depth + 1) : "";
      case kOpArray:
        return m_follow == Follow::Elements ? Fault(ArrayElement(type), depth + 1) : "";
      case kOpMap:
        return m_follow == Follow::Elements ? Fault(MapValue(type), depth + 1) : "";
      default:
        return {};
    }
  }

 private:
  // The text grows with the square of the depth, and with the number of fields reached.
  static constexpr size_t kMaxDepth = 50;
  static constexpr size_t kMaxSteps = 100000;

  std::string ClassFault(std::string_view type, size_t depth) {
    const NameSpaceElement* element = NamedElement(type, m_root);
    if (!element || element->category != Category::Class) return {};
    const auto* def = static_cast<const ClassDef*>(element);
    if (std::find(m_path.begin(), m_path.end(), def) != m_path.end()) return PrintedElement(*def) + " contains itself";
    Enter(def);
    for (const ModelField* field : def->m_modelFields) {
      if (field->IsDropped()) continue;
      if (std::string fault = Fault(field->m_type, depth + 1); !fault.empty()) return fault;
    }
    m_path.pop_back();
    return {};
  }

  NameSpace& m_root;
  const Follow m_follow;
  std::vector<const ClassDef*> m_path;
  size_t m_steps = 0;
};

}  // namespace

std::string ExpansionFault(std::string_view type, NameSpace& root, Follow follow, const ClassDef* self) {
  TypeExpansion expansion(root, follow);
  if (self) expansion.Enter(self);
  return expansion.Fault(type, 0);
}

}  // namespace qrex
