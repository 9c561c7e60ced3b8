// A type as everybody reads it. Only this class and the functions of type_code.h know how a type is laid out in bytes.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "text/text_writer.h"
#include "translator/types/type_code.h"

namespace qrex {

// Views a code, or the part of one that is a type within a type. The code must outlive the view.
class TypeView {
 public:
  TypeView() = default;  // no type; Op() answers kOpVoid
  TypeView(std::string_view code) : m_code(code) {}
  TypeView(const TypeCode& code) : m_code(code) {}

  bool Empty() const { return m_code.empty(); }
  std::string_view Code() const { return m_code; }

  // What is at the head: metadata, a decorator, a container, or a plain type.
  TypeOp Op() const { return m_code.empty() ? kOpVoid : static_cast<TypeOp>(static_cast<uint8_t>(m_code.front())); }
  bool IsMetadata() const { return Op() >= kOpMetaBool; }
  bool IsBuiltIn() const { return Op() <= kOpString16; }
  bool IsNamed() const { return Op() >= kOpClass && Op() < kOpNamedEnd; }
  bool IsDecorator() const { return Op() >= kOpVolatile && Op() <= kOpOffsettable; }
  bool IsTemplate() const { return Op() >= kOpPtr && Op() <= kOpDynArray; }  // written NAME<T>
  bool HasInner() const { return Op() >= kOpVolatile && !IsMetadata(); }
  bool IsScalar() const { return Op() >= kOpBool && Op() <= kOpChar16; }

  // The answers below are about the head, which must not be metadata.
  std::string_view Name() const;  // of a named type, qualified
  TypeView Inner() const;         // what a decorator, pointer, container or array is of; of a map, its values
  TypeView Key() const;           // of a map
  TypeView Value() const { return Inner(); }
  uint32_t Count() const;  // of a fixed array

  TypeView WithoutMetadata() const;   // the head's metadata skipped
  std::string_view Metadata() const;  // of the head: lists, one behind the other

 private:
  std::string_view Behind() const;  // what is in the code behind the type at the head

  std::string_view m_code;
};

// --- Metadata and void
bool HasMetadata(TypeView type);  // anywhere in it
bool IsVoid(TypeView type);
bool SignatureHasMetadata(const FunctionSignature& signature);  // its own, or in its return or an argument type

// --- Printing
enum class DeclarationMode { Plain, Reference, ConstReference };
void PrintType(TextWriter& out, TypeView type);
std::string TypeText(TypeView type);
void PrintDeclaration(TextWriter& out, TypeView type, std::string_view name, DeclarationMode mode);
std::string ConstReferenceText(TypeView type, std::string_view name);  // "T const& name"
std::string MangledType(TypeView type);
std::string QualifiedDestructorText(TypeView type);  // "vesk::xset<T>::~xset"; empty for a type without one

}  // namespace qrex
