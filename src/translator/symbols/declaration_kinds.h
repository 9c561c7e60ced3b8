// The kinds of declarations, one row each. Code that needs the keyword, record or opcode of a kind reads a field of its
// row. A new kind is an enumerator and a row; the switches over categories have no default, so that the compiler
// reports each one that lacks a new category.
#pragma once

#include <cstdint>
#include <iterator>
#include <string_view>

#include "translator/types/type_code.h"

namespace qrex {

// What kinds conflict by: two declarations of one name must agree in it.
enum class Category { Typedef, Interface, Class, NameSpace, Functor, GlobalFunction, GlobalVar, Variant, Enum };

enum class DeclKind {
  Typedef,
  Interface,
  Struct,
  Class,
  Adt,
  Mixin,
  Model,
  NameSpace,
  Functor,
  Function,
  Var,
  Variant,
  Enum,
  End  // their number
};

struct KindTraits {
  DeclKind kind;
  Category category;
  std::string_view keyword;  // behind `$`, and in messages
  std::string_view traits;   // ETypeTraitKind in the runtime
  std::string_view record;   // the runtime's RegisterReflected... and Reflected...; empty: it has no record
  TypeOp op;                 // of a type that names it; kOpCppText: it is no type, or one that stays text
};

inline constexpr KindTraits kDeclKinds[] = {
    {DeclKind::Typedef, Category::Typedef, "typedef", "TTK_other", "Typedef", kOpTypedef},
    {DeclKind::Interface, Category::Interface, "interface", "TTK_interface", "Interface", kOpInterface},
    {DeclKind::Struct, Category::Class, "struct", "TTK_struct", "Class", kOpClass},
    {DeclKind::Class, Category::Class, "class", "TTK_class", "Class", kOpClass},
    {DeclKind::Adt, Category::Class, "adt", "TTK_adt", "Class", kOpClass},
    {DeclKind::Mixin, Category::Class, "mixin", "TTK_other", "Class", kOpClass},
    {DeclKind::Model, Category::Class, "model", "TTK_model", "Class", kOpClass},
    {DeclKind::NameSpace, Category::NameSpace, "namespace", "TTK_other", "", kOpCppText},
    {DeclKind::Functor, Category::Functor, "functor", "TTK_functor", "Functor", kOpFunctor},
    {DeclKind::Function, Category::GlobalFunction, "function", "TTK_other", "GlobalFunction", kOpGlobalFunction},
    {DeclKind::Var, Category::GlobalVar, "var", "TTK_other", "GlobalVariable", kOpCppText},
    {DeclKind::Variant, Category::Variant, "variant", "TTK_variant", "Variant", kOpVariant},
    {DeclKind::Enum, Category::Enum, "enum", "TTK_enum", "Enum", kOpEnum},
};

constexpr const KindTraits& TraitsOf(DeclKind kind) { return kDeclKinds[static_cast<size_t>(kind)]; }

static_assert(
    [] {
      for (size_t i = 0; i < std::size(kDeclKinds); ++i) {
        if (kDeclKinds[i].kind != static_cast<DeclKind>(i)) return false;
      }
      return std::size(kDeclKinds) == static_cast<size_t>(DeclKind::End);
    }(),
    "a row for each DeclKind, in its order");

// The category of what a named type refers to; NameSpace for kOpCppText, which is no declaration.
constexpr Category CategoryOf(TypeOp op) {
  for (const KindTraits& row : kDeclKinds) {
    if (row.op == op) return row.category;
  }
  return Category::NameSpace;
}

}  // namespace qrex
