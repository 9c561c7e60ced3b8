#include "translator/model/type_expansion.h"

#include <algorithm>

namespace qrex {

namespace {

class TypeExpansion {
 public:
  TypeExpansion(NameSpace& root, Expansion expansion, size_t reached)
      : m_root(root), m_expansion(expansion), m_reached(reached) {}

  void Enter(const ClassDef* def) { m_path.push_back(def); }
  size_t Reached() const { return m_reached; }

  // `intoAnyClass`: the model of any class is followed, not only that of a class of kind model.
  std::string Fault(TypeView type, size_t depth, bool intoAnyClass) {
    const Undecorated undecorated = WithoutDecorators(type, m_root);
    type = undecorated.type;
    if (depth > kMaxDepth) return "type nested too deeply";
    if (++m_reached > kMaxReached) return TooMany();
    const bool isMethods = m_expansion == Expansion::Methods;
    const uint32_t ending = isMethods ? ~uint32_t{kHasConst} : uint32_t{kHasAssignable};
    if (undecorated.decorators & ending) return {};
    switch (type.Op()) {
      case kOpClass:
        return ClassFault(type, depth, intoAnyClass);
      case kOpVector:
        return isMethods ? Fault(type.Inner(), depth + 1, true) : "";
      case kOpDynArray:
      case kOpArray:
      case kOpMap:
        return isMethods ? "" : Fault(type.Inner(), depth + 1, m_expansion == Expansion::AttributeStructs);
      default:
        return {};
    }
  }

 private:
  // The text grows with the square of the depth, and with the number of fields reached: each writes about 1 KB.
  static constexpr size_t kMaxDepth = 50;
  static constexpr size_t kMaxReached = 10000;

  std::string TooMany() const {
    const std::string what = m_path.empty() ? "the type" : PrintedElement(*m_path.front());
    return what + " has more than " + std::to_string(kMaxReached) + " fields, with those of the models in it";
  }

  std::string ClassFault(TypeView type, size_t depth, bool intoAnyClass) {
    const NameSpaceElement* element = NamedElement(type, m_root);
    if (!element || element->category != Category::Class) return {};
    const auto* def = static_cast<const ClassDef*>(element);
    if (!intoAnyClass && !def->IsPureModel()) return {};
    if (std::find(m_path.begin(), m_path.end(), def) != m_path.end()) return PrintedElement(*def) + " contains itself";
    Enter(def);
    for (const ModelField* field : def->m_modelFields) {
      if (field->IsDropped()) continue;
      if (std::string fault = Fault(field->m_type, depth + 1, intoAnyClass); !fault.empty()) return fault;
    }
    m_path.pop_back();
    return {};
  }

  NameSpace& m_root;
  const Expansion m_expansion;
  std::vector<const ClassDef*> m_path;
  size_t m_reached;
};

}  // namespace

std::string ExpansionFault(TypeView type, NameSpace& root, Expansion expansion, const ClassDef* self, size_t* reached) {
  TypeExpansion way(root, expansion, reached ? *reached : 0);
  if (self) way.Enter(self);
  std::string fault = way.Fault(type, 0, expansion == Expansion::Methods);
  if (reached) *reached = way.Reached();
  return fault;
}

}  // namespace qrex
