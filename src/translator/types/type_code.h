// Types as the translator keeps them: a byte string in prefix order. Metadata and decorators come first, then the type
// that they apply to; a named type carries its qualified name inline (compact length, bytes). `const int8*` is 35 31 02
// in hex: pointer to const int8; `int8* const` is 31 35 02.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "text/text_writer.h"

namespace qrex {

using TypeCode = std::string;

enum TypeOp : uint8_t {
  kOpVoid = 0,
  kOpBool,
  kOpInt8,
  kOpInt16,
  kOpInt32,
  kOpInt64,
  kOpInt128,
  kOpUInt8,
  kOpUInt16,
  kOpUInt32,
  kOpUInt64,
  kOpUInt128,
  kOpFloat32,
  kOpFloat64,
  kOpChar8,
  kOpChar16,
  kOpString8,
  kOpString16,
  kOpClass = 32,
  kOpInterface,
  kOpTypedef,
  kOpEnum,
  kOpFunctor,
  kOpVariant,
  kOpGlobalFunction,
  kOpCppText,
  kOpVolatile = 48,
  kOpConst,
  kOpAssignable,
  kOpMovable,
  kOpOffsettable,
  kOpPointer,
  kOpReference,
  kOpPtr = 64,
  kOpOpenVariant,
  kOpPref,
  kOpCref,
  kOpVector,
  kOpDeque,
  kOpList,
  kOpSet,
  kOpBag,
  kOpDynArray,
  kOpArray = 80,
  kOpMap = 81,
  kOpMetaBool = 161,
  kOpMetaInt,
  kOpMetaFloat,
  kOpMetaString,
  kOpMetaFunctor = 192,  // + number of arguments
  kOpMetaList = 224,     // + number of values
};

enum class ArgDirection { None, In, Out, InOut, Copy };

struct FunctionArg {
  ArgDirection direction = ArgDirection::None;
  std::string name;
  TypeCode type;
  std::string defaultValue;  // source text behind `=`
  bool polymorphic = false;  // stood in [ ]
};

struct FunctionSignature {
  bool isInline = false;
  TypeCode returnType;
  std::string name;
  std::string metadata;
  std::vector<FunctionArg> arguments;
  bool isConst = false;
};

std::string_view BuiltInTypeName(uint8_t op);   // of 0..17: "void", "int8", ...
std::string_view TemplateTypeName(uint8_t op);  // of 64..73: "ptr", "xvector", ...

// --- Building and walking. A view is the rest of a code; functions that move it take it by reference.
void AppendNamedType(TypeCode& code, uint8_t op, std::string_view name);
std::string_view SkipMetadata(std::string_view code);   // at the head of the code only
std::string_view InlineName(std::string_view code);     // of an opcode 32..39 at the head
std::string_view SkipWholeType(std::string_view code);  // what stands behind the type at the head
uint32_t ArraySize(std::string_view code);              // of an opcode 80 at the head
std::string_view ArrayElement(std::string_view code);
std::string_view MapKey(std::string_view code);  // of an opcode 81 at the head; the value stands behind it
std::string_view MapValue(std::string_view code);

// --- Metadata and void
bool HasMetadata(std::string_view code);
bool IsVoid(std::string_view code);
bool SignatureHasMetadata(const FunctionSignature& signature);  // its own, or in its return or an argument type

// --- Printing
enum class DeclarationMode { Plain, Reference, ConstReference };
void PrintType(TextWriter& out, std::string_view code);
std::string TypeText(std::string_view code);
void PrintDeclaration(TextWriter& out, std::string_view code, std::string_view name, DeclarationMode mode);
std::string ConstReferenceText(std::string_view code, std::string_view name);  // "T const& name"
std::string MangledType(std::string_view code);
std::string QualifiedDestructorText(std::string_view code);  // "vesk::xset<T>::~xset"; empty for a type without one

}  // namespace qrex