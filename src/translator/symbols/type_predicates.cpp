#include "translator/symbols/type_predicates.h"

namespace qrex {

namespace {

uint8_t Op(std::string_view code) { return code.empty() ? 0 : static_cast<uint8_t>(code.front()); }
bool IsNamed(uint8_t op) { return op >= kOpClass && op <= kOpGlobalFunction; }

constexpr int kMaxTypedefs = 100;

const TypeBehaviour* BehaviourOf(std::string_view code, NameSpace& root) {
  return dynamic_cast<const TypeBehaviour*>(NamedElement(code, root));
}

}  // namespace

NameSpaceElement* NamedElement(std::string_view code, NameSpace& root) { return root.LookupPath(InlineName(code)); }

std::string_view SkipToType(std::string_view code, NameSpace& root) {
  for (int i = 0; i < kMaxTypedefs; ++i) {
    code = SkipMetadata(code);
    if (Op(code) != kOpTypedef) return code;
    const auto* target = dynamic_cast<const TypedefTarget*>(NamedElement(code, root));
    if (!target) return code;
    code = target->TargetType();
  }
  return code;
}

std::string_view SkipDecorators(std::string_view code, NameSpace& root, uint32_t& decorators) {
  for (;;) {
    code = SkipToType(code, root);
    const uint8_t op = Op(code);
    if (op < kOpVolatile || op > kOpOffsettable) return code;
    decorators |= 1u << (op - kOpVolatile);
    code.remove_prefix(1);
  }
}

bool IsSerialisable(std::string_view code, NameSpace& root) {
  for (;;) {
    code = SkipToType(code, root);
    const uint8_t op = Op(code);
    if (op >= kOpBool && op <= kOpString16) return true;
    switch (op) {
      case kOpEnum:
      case kOpOpenVariant:
      case kOpPref:
      case kOpCref:
        return true;
      case kOpClass:
      case kOpVariant: {
        const TypeBehaviour* behaviour = BehaviourOf(code, root);
        return behaviour && behaviour->CanSerialise();
      }
      case kOpAssignable:
      case kOpMovable:
      case kOpOffsettable:
      case kOpVector:
      case kOpDeque:
      case kOpList:
      case kOpSet:
      case kOpBag:
      case kOpDynArray:
        code.remove_prefix(1);
        break;
      case kOpArray:
        code = ArrayElement(code);
        break;
      case kOpMap:
        if (!IsSerialisable(MapKey(code), root)) return false;
        code = MapValue(code);
        break;
      default:
        return false;
    }
  }
}

namespace {

bool NeedsVisit(std::string_view code, NameSpace& root, std::string_view always,
                bool (TypeBehaviour::*isVisitable)() const) {
  for (;;) {
    code = SkipToType(code, root);
    const uint8_t op = Op(code);
    if (always.find(static_cast<char>(op)) != std::string_view::npos) return true;
    if (op == kOpClass || op == kOpVariant) {
      const TypeBehaviour* behaviour = BehaviourOf(code, root);
      return behaviour && (behaviour->*isVisitable)();
    }
    const bool looksInside = (op >= kOpVolatile && op <= kOpOffsettable) || op == kOpReference || op == kOpVector ||
                             op == kOpDeque || op == kOpList || op == kOpBag || op == kOpDynArray;
    if (op == kOpArray) {
      code = ArrayElement(code);
    } else if (looksInside) {
      code.remove_prefix(1);
    } else {
      return false;
    }
  }
}

}  // namespace

bool NeedsVisitObjects(std::string_view code, NameSpace& root) {
  static constexpr char kAlways[] = {kOpPointer, kOpPtr, kOpPref, kOpCref, kOpSet, kOpMap};
  return NeedsVisit(code, root, {kAlways, sizeof kAlways}, &TypeBehaviour::IsIObjectVisitable);
}

bool NeedsVisitPrefs(std::string_view code, NameSpace& root) {
  static constexpr char kAlways[] = {kOpPref, kOpCref, kOpSet, kOpMap};
  return NeedsVisit(code, root, {kAlways, sizeof kAlways}, &TypeBehaviour::IsPrefVisitable);
}

void CollectNamedTypes(std::string_view code, NameSpace& root, std::vector<const NameSpaceElement*>& out) {
  for (;;) {
    code = SkipMetadata(code);
    const uint8_t op = Op(code);
    if (IsNamed(op)) {
      if (const NameSpaceElement* element = NamedElement(code, root)) out.push_back(element);
      return;
    }
    if (op < kOpVolatile) return;
    if (op == kOpMap) {
      CollectNamedTypes(MapKey(code), root, out);
      code = MapValue(code);
    } else {
      code.remove_prefix(op == kOpArray ? 5 : 1);
    }
  }
}

void CollectNamedTypes(const FunctionSignature& signature, NameSpace& root, std::vector<const NameSpaceElement*>& out) {
  CollectNamedTypes(signature.returnType, root, out);
  for (const FunctionArg& argument : signature.arguments) CollectNamedTypes(argument.type, root, out);
}

int64_t SizeInBytes(std::string_view code, NameSpace& root) {
  uint32_t decorators = 0;
  code = SkipDecorators(code, root, decorators);
  switch (Op(code)) {
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
    case kOpEnum:
      return 4;
    case kOpInt64:
    case kOpUInt64:
    case kOpFloat64:
    case kOpGlobalFunction:
    case kOpPointer:
      return 8;
    case kOpInt128:
    case kOpUInt128:
    case kOpFunctor:
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
      const int64_t element = SizeInBytes(ArrayElement(code), root);
      return element < 0 ? -1 : element * ArraySize(code);
    }
    default:
      return -1;
  }
}

// Names of classes and sizes of arrays are not compared.
bool SameType(std::string_view a, NameSpace& rootA, std::string_view b, NameSpace& rootB) {
  for (;;) {
    a = SkipToType(a, rootA);
    b = SkipToType(b, rootB);
    const uint8_t op = Op(a);
    if (op != Op(b)) return false;
    if (op < 40) return true;
    if (op == kOpMap) {
      if (!SameType(MapKey(a), rootA, MapKey(b), rootB)) return false;
      a = MapValue(a);
      b = MapValue(b);
    } else {
      a.remove_prefix(op == kOpArray ? 5 : 1);
      b.remove_prefix(op == kOpArray ? 5 : 1);
    }
  }
}

// --- Fields

namespace {

// The first rule on decorators that the level breaks; empty when none. May clear `isMutable`.
std::string_view CheckDecorators(uint32_t decorators, uint8_t op, const TypeContext& context, bool& isMutable) {
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

std::string_view CheckEnclosing(uint8_t op, uint8_t enclosing) {
  if (enclosing == kOpPref && op != kOpInterface) return "pref<T> requires that T be an interface";
  if (enclosing == kOpPtr && op != kOpInterface) return "ptr<T> requires that T be an interface";
  if (enclosing == kOpCref && op != kOpClass) return "cref<T> requires that T be a class/struct/model";
  return {};
}

// A fault of the opcode itself in its context; empty when there is none.
std::string_view CheckOpcode(uint8_t op, const TypeContext& context) {
  switch (op) {
    case kOpVoid:
      if (!context.allowVoid) return "void not permitted here";
      return context.serialisable ? "void type doesn't support serialisation" : "";
    case kOpInterface:
      return context.enclosing == kOpPtr || context.enclosing == kOpPref
                 ? ""
                 : "Interface specfifer must appear in pref<> or ptr<>";
    case kOpFunctor:
      if (context.inModel) return "functor not permitted within models";
      return context.serialisable ? "functor doesn't support serialisation" : "";
    case kOpGlobalFunction:
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

bool CheckType(std::string_view code, NameSpace& root, TypeContext context, std::string& message) {
  for (;;) {
    uint32_t decorators = 0;
    code = SkipDecorators(code, root, decorators);
    const uint8_t op = Op(code);
    for (std::string_view fault : {CheckDecorators(decorators, op, context, context.isMutable),
                                   CheckEnclosing(op, context.enclosing), CheckOpcode(op, context)}) {
      if (fault.empty()) continue;
      message = fault;
      return false;
    }
    if (op < kOpVolatile) return true;
    if (op == kOpOpenVariant) return true;
    if (op == kOpVector) context.isMutable = false;
    context.enclosing = op;
    context.allowVoid = op == kOpPointer;
    if (op == kOpMap) {
      TypeContext keyContext = context;
      keyContext.isMutable = false;
      if (!CheckType(MapKey(code), root, keyContext, message)) return false;
      code = MapValue(code);
    } else {
      code.remove_prefix(op == kOpArray ? 5 : 1);
    }
  }
}

}  // namespace qrex
