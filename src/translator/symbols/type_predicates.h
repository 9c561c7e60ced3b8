// What a type is and can do where that depends on declarations: typedefs are resolved, classes and variants are asked.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "translator/symbols/name_space.h"
#include "translator/types/type_code.h"

namespace qrex {

// --- Predicates. `root` is the root name space of the file of the element that holds the type.
enum DecoratorBits : uint32_t {
  kHasVolatile = 1,
  kHasConst = 2,
  kHasAssignable = 4,
  kHasMovable = 8,
  kHasOffsettable = 16
};
// Skips metadata and replaces typedefs by their target at the head; the result may refer to the typedef's own code.
std::string_view SkipToType(std::string_view code, NameSpace& root);
std::string_view SkipDecorators(std::string_view code, NameSpace& root, uint32_t& decorators);
NameSpaceElement* NamedElement(std::string_view code, NameSpace& root);  // of an opcode 32..38 at the head; or null
bool IsSerialisable(std::string_view code, NameSpace& root);
bool NeedsVisitObjects(std::string_view code, NameSpace& root);
bool NeedsVisitPrefs(std::string_view code, NameSpace& root);
void CollectNamedTypes(std::string_view code, NameSpace& root, std::vector<const NameSpaceElement*>& out);
void CollectNamedTypes(const FunctionSignature& signature, NameSpace& root, std::vector<const NameSpaceElement*>& out);
int64_t SizeInBytes(std::string_view code, NameSpace& root);  // -1 unknown
bool SameType(std::string_view a, NameSpace& rootA, std::string_view b, NameSpace& rootB);

struct TypeContext {
  uint8_t enclosing = 0;
  bool isMutable = false;
  bool inModel = false;
  bool serialisable = false;
  bool allowVoid = false;
};
bool CheckType(std::string_view code, NameSpace& root, TypeContext context, std::string& message);

// What stands behind a typedef: TypedefDef derives from this as well.
class TypedefTarget {
 public:
  virtual ~TypedefTarget() = default;
  virtual const TypeCode& TargetType() const = 0;
};

// What IsSerialisable and the visit predicates ask of a class or variant: both derive from this as well.
class TypeBehaviour {
 public:
  virtual ~TypeBehaviour() = default;
  virtual bool CanSerialise() const = 0;
  virtual bool IsIObjectVisitable() const = 0;
  virtual bool IsPrefVisitable() const = 0;
};

}  // namespace qrex
