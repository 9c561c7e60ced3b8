// What a type is and can do where that depends on declarations: typedefs are resolved, classes and variants are asked.
#pragma once

#include <cstdint>
#include <string_view>
#include <vector>

#include "translator/symbols/name_space.h"
#include "translator/types/type_view.h"

namespace qrex {

// `root`, throughout: the root name space of the file of the element that holds the type.
enum DecoratorBits : uint32_t {
  kHasVolatile = 1,
  kHasConst = 2,
  kHasAssignable = 4,
  kHasMovable = 8,
  kHasOffsettable = 16
};

// A type behind its metadata, typedefs and decorators, and which decorators these were.
struct Undecorated {
  TypeView type;
  uint32_t decorators = 0;
  bool Has(DecoratorBits bit) const { return (decorators & bit) != 0; }
};
Undecorated WithoutDecorators(TypeView type, NameSpace& root);
// Behind metadata and typedefs alone; a view of the typedef's own code where there was one.
TypeView Resolved(TypeView type, NameSpace& root);
bool IsConstField(TypeView type, NameSpace& root);  // a field of it, or each of its elements, is never assigned
NameSpaceElement* NamedElement(TypeView type, NameSpace& root);  // of a named type; null: it isn't declared

bool IsSerialisable(TypeView type, NameSpace& root);
bool HasConstElements(TypeView type, NameSpace& root);  // of a container anywhere in it, but for fixed arrays
// The first variant without a default value that a value of the type holds, also as an element; or null.
const NameSpaceElement* VariantWithoutDefault(TypeView type, NameSpace& root);
std::string HowToGiveDefault(const NameSpaceElement& variant);  // " $variant V: give that ...", the end of a warning
bool NeedsVisitObjects(TypeView type, NameSpace& root);
bool NeedsVisitPrefs(TypeView type, NameSpace& root);
void CollectNamedTypes(TypeView type, NameSpace& root, std::vector<const NameSpaceElement*>& out);  // appends
void CollectNamedTypes(const FunctionSignature& signature, NameSpace& root, std::vector<const NameSpaceElement*>& out);
int64_t SizeInBytes(TypeView type, NameSpace& root);  // -1 unknown
bool SameType(TypeView a, NameSpace& rootA, TypeView b, NameSpace& rootB);

struct TypeContext {
  TypeOp enclosing = kOpVoid;
  bool isMutable = false;
  bool inModel = false;
  bool serialisable = false;
  bool allowVoid = false;
};
// The first rule for fields that the type breaks ("void not permitted here"); empty when it keeps all.
std::string_view TypeFault(TypeView type, NameSpace& root, TypeContext context);

// The target of a typedef; implemented by TypedefDef.
class TypedefTarget {
 public:
  virtual ~TypedefTarget() = default;
  virtual const TypeCode& TargetType() const = 0;
};

// What IsSerialisable and the visit predicates ask of a class or variant; implemented by both.
class TypeBehaviour {
 public:
  virtual ~TypeBehaviour() = default;
  virtual bool CanSerialise() const = 0;
  virtual bool HasDefaultValue() const { return true; }          // a variant may have none
  virtual std::string_view NamedVoidItem() const { return {}; }  // of a variant, the first; empty: it has none
  virtual bool IsIObjectVisitable() const = 0;
  virtual bool IsPrefVisitable() const = 0;
};

}  // namespace qrex
