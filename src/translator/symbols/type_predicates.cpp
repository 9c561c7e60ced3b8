#include "translator/symbols/type_predicates.h"

namespace qrex {

namespace {

constexpr int kMaxTypedefs = 100;

const TypeBehaviour* BehaviourOf(TypeView type, NameSpace& root) {
  return dynamic_cast<const TypeBehaviour*>(NamedElement(type, root));
}

}  // namespace

bool IsConstField(TypeView type, NameSpace& root) {
  for (Undecorated field = WithoutDecorators(type, root);; field = WithoutDecorators(field.type.Inner(), root)) {
    if (field.Has(kHasConst)) return true;
    if (field.type.Op() != kOpArray) return false;
  }
}

NameSpaceElement* NamedElement(TypeView type, NameSpace& root) { return root.LookupPath(type.Name()); }

TypeView Resolved(TypeView type, NameSpace& root) {
  for (int i = 0; i < kMaxTypedefs; ++i) {
    type = type.WithoutMetadata();
    if (type.Op() != kOpTypedef) return type;
    const auto* target = dynamic_cast<const TypedefTarget*>(NamedElement(type, root));
    if (!target) return type;
    type = target->TargetType();
  }
  return type;
}

Undecorated WithoutDecorators(TypeView type, NameSpace& root) {
  Undecorated result;
  for (result.type = Resolved(type, root); result.type.IsDecorator();
       result.type = Resolved(result.type.Inner(), root)) {
    result.decorators |= 1u << (result.type.Op() - kOpVolatile);
  }
  return result;
}

namespace {

bool IsDeclaredSerialisable(TypeView type, NameSpace& root) {
  switch (CategoryOf(type.Op())) {
    case Category::Enum:
      return true;
    case Category::Class:
    case Category::Variant: {
      const TypeBehaviour* behaviour = BehaviourOf(type, root);
      return behaviour && behaviour->CanSerialise();
    }
    case Category::Typedef:  // one that leads nowhere
    case Category::Interface:
    case Category::Functor:
    case Category::GlobalFunction:
    case Category::GlobalVar:
    case Category::NameSpace:
      return false;
  }
  return false;
}

}  // namespace

bool IsSerialisable(TypeView type, NameSpace& root) {
  for (;; type = type.Inner()) {
    type = Resolved(type, root);
    if (type.IsNamed()) return IsDeclaredSerialisable(type, root);
    switch (type.Op()) {
      case kOpOpenVariant:
      case kOpPref:
      case kOpCref:
        return true;
      case kOpAssignable:
      case kOpMovable:
      case kOpOffsettable:
      case kOpVector:
      case kOpDeque:
      case kOpList:
      case kOpSet:
      case kOpBag:
      case kOpDynArray:
      case kOpArray:
        break;
      case kOpMap:
        if (!IsSerialisable(type.Key(), root)) return false;
        break;
      default:
        return type.IsBuiltIn() && type.Op() != kOpVoid;
    }
  }
}

namespace {

bool NeedsVisit(TypeView type, NameSpace& root, std::string_view always, bool (TypeBehaviour::*isVisitable)() const) {
  for (;; type = type.Inner()) {
    type = Resolved(type, root);
    const TypeOp op = type.Op();
    if (always.find(static_cast<char>(op)) != std::string_view::npos) return true;
    if (op == kOpClass || op == kOpVariant) {
      const TypeBehaviour* behaviour = BehaviourOf(type, root);
      return behaviour && (behaviour->*isVisitable)();
    }
    const bool looksInside = type.IsDecorator() || op == kOpReference || op == kOpVector || op == kOpDeque ||
                             op == kOpList || op == kOpBag || op == kOpDynArray || op == kOpArray;
    if (!looksInside) return false;
  }
}

}  // namespace

bool NeedsVisitObjects(TypeView type, NameSpace& root) {
  static constexpr char kAlways[] = {kOpPointer, kOpPtr, kOpPref, kOpCref, kOpSet, kOpMap};
  return NeedsVisit(type, root, {kAlways, sizeof kAlways}, &TypeBehaviour::IsIObjectVisitable);
}

bool NeedsVisitPrefs(TypeView type, NameSpace& root) {
  static constexpr char kAlways[] = {kOpPref, kOpCref, kOpSet, kOpMap};
  return NeedsVisit(type, root, {kAlways, sizeof kAlways}, &TypeBehaviour::IsPrefVisitable);
}

void CollectNamedTypes(TypeView type, NameSpace& root, std::vector<const NameSpaceElement*>& out) {
  for (type = type.WithoutMetadata(); type.HasInner(); type = type.Inner().WithoutMetadata()) {
    if (type.Op() == kOpMap) CollectNamedTypes(type.Key(), root, out);
  }
  if (!type.IsNamed() || type.Op() == kOpCppText) return;
  if (const NameSpaceElement* element = NamedElement(type, root)) out.push_back(element);
}

void CollectNamedTypes(const FunctionSignature& signature, NameSpace& root, std::vector<const NameSpaceElement*>& out) {
  CollectNamedTypes(signature.returnType, root, out);
  for (const FunctionArg& argument : signature.arguments) CollectNamedTypes(argument.type, root, out);
}

namespace {

int64_t DeclaredSize(Category category) {
  switch (category) {
    case Category::Enum:
      return 4;
    case Category::GlobalFunction:
      return 8;
    case Category::Functor:
      return 16;
    case Category::Typedef:
    case Category::Interface:
    case Category::Class:
    case Category::Variant:
    case Category::GlobalVar:
    case Category::NameSpace:
      return -1;
  }
  return -1;
}

}  // namespace

bool HasConstElements(TypeView decorated, NameSpace& root) {
  const TypeView type = WithoutDecorators(decorated, root).type;
  if (!type.HasInner()) return false;
  const bool isContainer = (type.Op() >= kOpVector && type.Op() <= kOpDynArray) || type.Op() == kOpMap;
  if (isContainer && WithoutDecorators(type.Inner(), root).Has(kHasConst)) return true;
  return HasConstElements(type.Inner(), root);
}

const NameSpaceElement* VariantWithoutDefault(TypeView decorated, NameSpace& root) {
  const TypeView type = WithoutDecorators(decorated, root).type;
  if (type.Op() == kOpVariant) {
    const TypeBehaviour* variant = BehaviourOf(type, root);
    return variant && !variant->HasDefaultValue() ? NamedElement(type, root) : nullptr;
  }
  constexpr TypeOp kHold[] = {kOpReference, kOpVector, kOpDeque,    kOpList, kOpSet,
                              kOpBag,       kOpMap,    kOpDynArray, kOpArray};
  if (std::find(std::begin(kHold), std::end(kHold), type.Op()) == std::end(kHold)) return nullptr;
  if (type.Op() == kOpMap) {
    if (const NameSpaceElement* key = VariantWithoutDefault(type.Key(), root)) return key;
  }
  return VariantWithoutDefault(type.Inner(), root);
}

std::string HowToGiveDefault(const NameSpaceElement& variant) {
  const auto* behaviour = dynamic_cast<const TypeBehaviour*>(&variant);
  const std::string item(behaviour ? behaviour->NamedVoidItem() : std::string_view());
  const std::string advice =
      item.empty() ? "give that a default or a void item" : "write default " + item + "(); in that";
  return PrintedElement(variant) + ": " + advice;
}

int64_t SizeInBytes(TypeView decorated, NameSpace& root) {
  const TypeView type = WithoutDecorators(decorated, root).type;
  if (type.IsNamed()) return DeclaredSize(CategoryOf(type.Op()));
  switch (type.Op()) {
    case kOpBool:
    case kOpInt8:
    case kOpUInt8:
    case kOpChar8:
      return 1;
    case kOpInt16:
    case kOpUInt16:
    case kOpChar16:
      return 2;
    case kOpInt32:
    case kOpUInt32:
    case kOpFloat32:
      return 4;
    case kOpInt64:
    case kOpUInt64:
    case kOpFloat64:
    case kOpPointer:
      return 8;
    case kOpInt128:
    case kOpUInt128:
    case kOpPtr:
    case kOpOpenVariant:
      return 16;
    case kOpString8:
    case kOpString16:
    case kOpPref:
    case kOpCref:
    case kOpVector:
    case kOpSet:
    case kOpDynArray:
    case kOpMap:
      return 24;
    case kOpArray: {
      const int64_t element = SizeInBytes(type.Inner(), root);
      return element < 0 ? -1 : element * type.Count();
    }
    default:
      return -1;
  }
}

// Names of classes and sizes of arrays are not compared.
bool SameType(TypeView a, NameSpace& rootA, TypeView b, NameSpace& rootB) {
  for (;; a = a.Inner(), b = b.Inner()) {
    a = Resolved(a, rootA);
    b = Resolved(b, rootB);
    if (a.Op() != b.Op()) return false;
    if (!a.HasInner()) return true;
    if (a.Op() == kOpMap && !SameType(a.Key(), rootA, b.Key(), rootB)) return false;
  }
}

// --- Fields

namespace {

// The first rule on decorators that the level breaks; empty when none. May clear `isMutable`.
std::string_view CheckDecorators(uint32_t decorators, TypeOp op, const TypeContext& context, bool& isMutable) {
  const bool insidePointer = context.enclosing == kOpPointer || context.enclosing == kOpPtr ||
                             context.enclosing == kOpPref || context.enclosing == kOpCref;
  if (decorators & (kHasConst | kHasVolatile)) {
    if (!insidePointer && context.inModel) return "const or volatile qualifiers not permitted within models";
    if (context.serialisable) return "const or volatile qualifiers not permitted on serialisable types";
    if (decorators & kHasConst) isMutable = false;
  } else if (decorators & kHasAssignable) {
    if (!context.inModel) return "assignable<> only permitted within models";
    if (decorators & kHasMovable) return "assignable<> and movable<> are incompatible decorators";
    if (decorators & kHasOffsettable) return "assignable<> and offsetable<> are incompatible decorators";
    if (!isMutable) return "assignable<> not permitted here - data type is immutable";
    isMutable = false;
  } else if (decorators & kHasMovable) {
    if (!context.inModel) return "movable<> only permitted within models";
    if (decorators & kHasOffsettable) return "movable<> and offsetable<> are incompatible decorators";
    if (!isMutable && context.enclosing != kOpVector && context.enclosing != kOpSet) {
      return "movable<> not permitted here";
    }
    if (op != kOpPref && op != kOpCref) return "movable<T> only permitted where T is a pref/cref";
  } else if (decorators & kHasOffsettable) {
    if (!context.inModel) return "offsetable<> only permitted within models";
    if (!isMutable) return "offsetable<> not permitted here - data type is immutable";
    if (op < kOpInt8 || op > kOpUInt128) return "Only integral types are offsetable";
  }
  return {};
}

std::string_view CheckEnclosing(TypeOp op, TypeOp enclosing) {
  if (enclosing == kOpPref && op != kOpInterface) return "pref<T> requires that T be an interface";
  if (enclosing == kOpPtr && op != kOpInterface) return "ptr<T> requires that T be an interface";
  if (enclosing == kOpCref && op != kOpClass) return "cref<T> requires that T be a class/struct/model";
  return {};
}

std::string_view CheckDeclared(Category category, const TypeContext& context) {
  switch (category) {
    case Category::Interface:
      return context.enclosing == kOpPtr || context.enclosing == kOpPref
                 ? ""
                 : "Interface specfifer must appear in pref<> or ptr<>";
    case Category::Functor:
      if (context.inModel) return "functor not permitted within models";
      return context.serialisable ? "functor doesn't support serialisation" : "";
    case Category::GlobalFunction:
      return context.serialisable ? "Pointers don't support serialisation" : "";
    case Category::Typedef:
    case Category::Class:
    case Category::Variant:
    case Category::Enum:
    case Category::GlobalVar:
    case Category::NameSpace:
      return {};
  }
  return {};
}

// A fault of the opcode itself in its context; empty when there is none.
std::string_view CheckOpcode(TypeOp op, const TypeContext& context) {
  switch (op) {
    case kOpVoid:
      if (!context.allowVoid) return "void not permitted here";
      return context.serialisable ? "void type doesn't support serialisation" : "";
    case kOpPointer:
      return context.serialisable ? "Pointers don't support serialisation" : "";
    case kOpReference:
      if (context.inModel) return "References not permitted within models";
      return context.serialisable ? "References don't support serialisation" : "";
    case kOpPtr:
      return context.serialisable ? "ptr<T> doesn't support serialisation" : "";
    case kOpDeque:
      return "deque<T> currently not supported";
    case kOpList:
      return "list<T> currently not supported";
    case kOpBag:
      return "bag<T> currently not supported";
    default:
      return {};
  }
}

}  // namespace

std::string_view TypeFault(TypeView type, NameSpace& root, TypeContext context) {
  for (;; type = type.Inner()) {
    const Undecorated undecorated = WithoutDecorators(type, root);
    type = undecorated.type;
    const TypeOp op = type.Op();
    for (std::string_view fault :
         {CheckDecorators(undecorated.decorators, op, context, context.isMutable),
          CheckEnclosing(op, context.enclosing),
          type.IsNamed() ? CheckDeclared(CategoryOf(op), context) : CheckOpcode(op, context)}) {
      if (!fault.empty()) return fault;
    }
    if (!type.HasInner() || op == kOpOpenVariant) return {};
    if (op == kOpVector) context.isMutable = false;
    context.enclosing = op;
    context.allowVoid = op == kOpPointer;
    if (op != kOpMap) continue;
    TypeContext keyContext = context;
    keyContext.isMutable = false;
    if (std::string_view fault = TypeFault(type.Key(), root, keyContext); !fault.empty()) return fault;
  }
}

}  // namespace qrex
