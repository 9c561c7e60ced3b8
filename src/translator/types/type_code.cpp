#include "translator/types/type_code.h"

#include <algorithm>

#include "text/numbers.h"

namespace qrex {

namespace {

uint8_t Op(std::string_view code) { return code.empty() ? 0 : static_cast<uint8_t>(code.front()); }
bool IsNamed(uint8_t op) { return op >= kOpClass && op <= kOpCppText; }
bool IsTemplate(uint8_t op) { return op >= kOpPtr && op <= kOpDynArray; }
bool IsMetadata(uint8_t op) { return op >= 160; }

constexpr std::string_view kBuiltIns[] = {"void",    "bool",    "int8",   "int16",  "int32",   "int64",
                                          "int128",  "uint8",   "uint16", "uint32", "uint64",  "uint128",
                                          "float32", "float64", "char8",  "char16", "string8", "string16"};
constexpr std::string_view kTemplates[] = {"ptr",    "openvariant", "pref", "cref", "xvector",
                                           "xdeque", "xlist",       "xset", "xbag", "DynArray"};
constexpr size_t kNameSpaceFree = 2;  // void and bool are C++'s own

std::string_view ShortTemplate(uint8_t op) { return kTemplates[op - kOpPtr]; }

// Of std::vector<std::string>: vector<std::string>.
std::string_view LastPart(std::string_view name) {
  int depth = 0;  // of template arguments
  for (size_t i = name.size(); i-- > 0;) {
    if (name[i] == '>') ++depth;
    if (name[i] == '<') --depth;
    if (name[i] == ':' && depth == 0) return name.substr(i + 1);
  }
  return name;
}

// Behind the metadata value at the head.
std::string_view SkipMetadataValue(std::string_view code) {
  const uint8_t op = Op(code);
  code.remove_prefix(1);
  size_t values = 0;
  std::string_view text;
  if (op >= kOpMetaList) {
    values = op - kOpMetaList;
  } else if (op >= kOpMetaFunctor) {
    values = op - kOpMetaFunctor;
    ReadCompactString(code, text);
  } else if (op == kOpMetaString) {
    ReadCompactString(code, text);
  } else {
    code.remove_prefix(op == kOpMetaBool ? 1 : op == kOpMetaInt ? 4 : 8);
  }
  for (; values > 0; --values) code = SkipMetadataValue(code);
  return code;
}

}  // namespace

std::string_view BuiltInTypeName(uint8_t op) { return kBuiltIns[op]; }
std::string_view TemplateTypeName(uint8_t op) { return ShortTemplate(op); }

void AppendNamedType(TypeCode& code, uint8_t op, std::string_view name) {
  code += static_cast<char>(op);
  AppendCompactString(code, name);
}

std::string_view SkipMetadata(std::string_view code) {
  while (!code.empty() && IsMetadata(Op(code))) code = SkipMetadataValue(code);
  return code;
}

std::string_view InlineName(std::string_view code) {
  code.remove_prefix(1);
  std::string_view name;
  ReadCompactString(code, name);
  return name;
}

std::string_view SkipWholeType(std::string_view code) {
  for (;;) {
    code = SkipMetadata(code);
    const uint8_t op = Op(code);
    if (IsNamed(op))
      return code.substr(static_cast<size_t>(InlineName(code).data() + InlineName(code).size() - code.data()));
    if (op < kOpClass) return code.substr(code.empty() ? 0 : 1);
    if (op == kOpMap) {
      code = MapValue(code);
    } else {
      code.remove_prefix(op == kOpArray ? 5 : 1);
    }
  }
}

uint32_t ArraySize(std::string_view code) {
  uint32_t size = 0;
  for (size_t i = 4; i > 0; --i) size = size << 8 | static_cast<unsigned char>(code[i]);
  return size;
}

std::string_view ArrayElement(std::string_view code) { return code.substr(5); }
std::string_view MapKey(std::string_view code) {
  return code.substr(1, SkipWholeType(code.substr(1)).data() - code.data() - 1);
}
std::string_view MapValue(std::string_view code) { return SkipWholeType(code.substr(1)); }

// --- Metadata and void

bool HasMetadata(std::string_view code) {
  for (;;) {
    const uint8_t op = Op(code);
    if (op >= 160) return true;
    if (op < 40) return false;
    if (op == kOpMap) {
      if (HasMetadata(MapKey(code))) return true;
      code = MapValue(code);
    } else {
      code.remove_prefix(op == kOpArray ? 5 : 1);
    }
  }
}

bool IsVoid(std::string_view code) { return Op(SkipMetadata(code)) == kOpVoid; }

bool SignatureHasMetadata(const FunctionSignature& signature) {
  return !signature.metadata.empty() || HasMetadata(signature.returnType) ||
         std::any_of(signature.arguments.begin(), signature.arguments.end(),
                     [](const FunctionArg& argument) { return HasMetadata(argument.type); });
}

// --- Printing

void PrintType(TextWriter& out, std::string_view code) {
  code = SkipMetadata(code);
  const uint8_t op = Op(code);
  if (op <= kOpString16) {
    out << (op < kNameSpaceFree ? "" : "vesk::") << kBuiltIns[op];
  } else if (IsNamed(op)) {
    out << InlineName(code);
  } else if (op == kOpArray) {
    out << "vesk::Array<";
    PrintType(out, ArrayElement(code));
    out << "," << ArraySize(code) << ">";
  } else if (op == kOpMap) {
    out << "vesk::xmap<";
    PrintType(out, MapKey(code));
    out << ",";
    PrintType(out, MapValue(code));
    out << " >";
  } else if (IsTemplate(op)) {
    const std::string_view inner = code.substr(1);
    out << "vesk::" << ShortTemplate(op) << "<";
    PrintType(out, inner);
    out << (IsTemplate(Op(SkipMetadata(inner))) ? " >" : ">");
  } else {
    PrintType(out, code.substr(1));
    switch (op) {
      case kOpVolatile:
        out << " volatile";
        break;
      case kOpConst:
        out << " const";
        break;
      case kOpPointer:
        out << "*";
        break;
      case kOpReference:
        out << "&";
        break;
      default:
        break;  // the other decorators have no text in C++
    }
  }
}

std::string TypeText(std::string_view code) {
  MemoryTextWriter text;
  PrintType(text, code);
  return text.TakeText();
}

void PrintDeclaration(TextWriter& out, std::string_view code, std::string_view name, DeclarationMode mode) {
  PrintType(out, code);
  if (mode == DeclarationMode::Reference) out << "&";
  if (mode == DeclarationMode::ConstReference) out << " const&";
  if (!name.empty()) out << " " << name;
}

std::string ConstReferenceText(std::string_view code, std::string_view name) {
  MemoryTextWriter text;
  PrintDeclaration(text, code, name, DeclarationMode::ConstReference);
  return text.TakeText();
}

std::string MangledType(std::string_view code) {
  code = SkipMetadata(code);
  const uint8_t op = Op(code);
  if (op <= kOpString16) return std::string(kBuiltIns[op]);
  if (IsNamed(op)) {
    std::string name(InlineName(code));
    ReplaceAllInPlace(name, "::", "_");
    return name;
  }
  if (op == kOpArray) return "array" + std::to_string(ArraySize(code)) + "_" + MangledType(ArrayElement(code));
  if (op == kOpMap) return "map_" + MangledType(MapKey(code)) + "_" + MangledType(MapValue(code));
  const std::string inner = MangledType(code.substr(1));
  if (op == kOpPointer) return "ptr_" + inner;
  if (op == kOpReference) return "ref_" + inner;
  return IsTemplate(op) ? std::string(ShortTemplate(op)) + "_" + inner : inner;
}

namespace {

// The name under which a destructor stands, without the `~`.
std::string DestructorStem(std::string_view code) {
  const uint8_t op = Op(code);
  if (op == kOpArray) return "Array";
  if (op == kOpMap) return "xmap";
  if (op == kOpString8 || op == kOpString16) return std::string(kBuiltIns[op]);
  if (IsTemplate(op)) return std::string(ShortTemplate(op));
  if (!IsNamed(op)) return {};
  return std::string(LastPart(InlineName(code)));
}

}  // namespace

std::string QualifiedDestructorText(std::string_view code) {
  code = SkipMetadata(code);
  const std::string stem = DestructorStem(code);
  if (stem.empty()) return {};
  const uint8_t op = Op(code);
  if (op == kOpString8 || op == kOpString16) return TypeText(code) + "::~basic_xstring";
  if (IsTemplate(op)) return "vesk::" + stem + "<" + TypeText(code.substr(1)) + ">::~" + stem;
  return TypeText(code) + "::~" + (IsNamed(op) && stem == "xstring" ? "basic_xstring" : stem);
}

}  // namespace qrex
