#include "translator/types/type_view.h"

#include <algorithm>

#include "text/numbers.h"

namespace qrex {

namespace {

constexpr size_t kOpBytes = 1;
constexpr size_t kArrayBytes = kOpBytes + sizeof(uint32_t);
constexpr size_t kNameSpaceFree = 2;  // void and bool are C++'s own

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

}  // namespace

TypeView TypeView::WithoutMetadata() const {
  TypeView type = *this;
  while (type.IsMetadata()) type = SkipMetadataValue(type.m_code);
  return type;
}

std::string_view TypeView::Metadata() const {
  return m_code.substr(0, m_code.size() - WithoutMetadata().m_code.size());
}

std::string_view TypeView::Name() const {
  std::string_view rest = m_code.substr(kOpBytes), name;
  ReadCompactString(rest, name);
  return name;
}

TypeView TypeView::Inner() const {
  if (Op() == kOpMap) return TypeView(m_code.substr(kOpBytes)).Behind();
  return m_code.substr(Op() == kOpArray ? kArrayBytes : kOpBytes);
}

TypeView TypeView::Key() const {
  const size_t keyBytes = m_code.size() - kOpBytes - Inner().m_code.size();
  return m_code.substr(kOpBytes, keyBytes);
}

uint32_t TypeView::Count() const {
  uint32_t count = 0;
  for (size_t i = kArrayBytes; i-- > kOpBytes;) count = count << 8 | static_cast<unsigned char>(m_code[i]);
  return count;
}

std::string_view TypeView::Behind() const {
  TypeView type = WithoutMetadata();
  while (type.HasInner()) type = type.Inner().WithoutMetadata();
  if (type.Empty()) return {};
  std::string_view rest = type.m_code.substr(kOpBytes), name;
  if (type.IsNamed()) ReadCompactString(rest, name);
  return rest;
}

// --- Metadata and void

bool HasMetadata(TypeView type) {
  for (;; type = type.Inner()) {
    if (type.IsMetadata()) return true;
    if (!type.HasInner()) return false;
    if (type.Op() == kOpMap && HasMetadata(type.Key())) return true;
  }
}

bool IsVoid(TypeView type) { return type.WithoutMetadata().Op() == kOpVoid; }

bool SignatureHasMetadata(const FunctionSignature& signature) {
  return !signature.metadata.empty() || HasMetadata(signature.returnType) ||
         std::any_of(signature.arguments.begin(), signature.arguments.end(),
                     [](const FunctionArg& argument) { return HasMetadata(argument.type); });
}

// --- Printing

void PrintType(TextWriter& out, TypeView type) {
  type = type.WithoutMetadata();
  const TypeOp op = type.Op();
  if (type.IsBuiltIn()) {
    out << (op < kNameSpaceFree ? "" : "vesk::") << BuiltInTypeName(op);
  } else if (type.IsNamed()) {
    out << type.Name();
  } else if (op == kOpArray) {
    out << "vesk::Array<";
    PrintType(out, type.Inner());
    out << "," << type.Count() << ">";
  } else if (op == kOpMap) {
    out << "vesk::xmap<";
    PrintType(out, type.Key());
    out << ",";
    PrintType(out, type.Value());
    out << " >";
  } else if (type.IsTemplate()) {
    out << "vesk::" << TemplateTypeName(op) << "<";
    PrintType(out, type.Inner());
    out << (type.Inner().WithoutMetadata().IsTemplate() ? " >" : ">");
  } else {
    PrintType(out, type.Inner());
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

std::string TypeText(TypeView type) {
  MemoryTextWriter text;
  PrintType(text, type);
  return text.TakeText();
}

void PrintDeclaration(TextWriter& out, TypeView type, std::string_view name, DeclarationMode mode) {
  PrintType(out, type);
  if (mode == DeclarationMode::Reference) out << "&";
  if (mode == DeclarationMode::ConstReference) out << " const&";
  if (!name.empty()) out << " " << name;
}

std::string ConstReferenceText(TypeView type, std::string_view name) {
  MemoryTextWriter text;
  PrintDeclaration(text, type, name, DeclarationMode::ConstReference);
  return text.TakeText();
}

std::string MangledType(TypeView type) {
  type = type.WithoutMetadata();
  const TypeOp op = type.Op();
  if (type.IsBuiltIn()) return std::string(BuiltInTypeName(op));
  if (type.IsNamed()) {
    std::string name(type.Name());
    ReplaceAllInPlace(name, "::", "_");
    return name;
  }
  if (op == kOpMap) return "map_" + MangledType(type.Key()) + "_" + MangledType(type.Value());
  const std::string inner = MangledType(type.Inner());
  if (op == kOpArray) return "array" + std::to_string(type.Count()) + "_" + inner;
  if (op == kOpPointer) return "ptr_" + inner;
  if (op == kOpReference) return "ref_" + inner;
  return type.IsTemplate() ? std::string(TemplateTypeName(op)) + "_" + inner : inner;
}

namespace {

// The name of a destructor, without the `~`.
std::string_view DestructorStem(TypeView type) {
  const TypeOp op = type.Op();
  if (op == kOpArray) return "Array";
  if (op == kOpMap) return "xmap";
  if (op == kOpString8 || op == kOpString16) return BuiltInTypeName(op);
  if (type.IsTemplate()) return TemplateTypeName(op);
  return type.IsNamed() ? LastPart(type.Name()) : std::string_view();
}

}  // namespace

std::string QualifiedDestructorText(TypeView type) {
  type = type.WithoutMetadata();
  const std::string stem(DestructorStem(type));
  if (stem.empty()) return {};
  const TypeOp op = type.Op();
  if (op == kOpString8 || op == kOpString16) return TypeText(type) + "::~basic_xstring";
  if (type.IsTemplate()) return "vesk::" + stem + "<" + TypeText(type.Inner()) + ">::~" + stem;
  return TypeText(type) + "::~" + (type.IsNamed() && stem == "xstring" ? "basic_xstring" : stem);
}

}  // namespace qrex
