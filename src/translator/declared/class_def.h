// $struct, $class, $adt, $mixin and $model are one statement with one data type that has a kind.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "translator/declared/qualifiers.h"
#include "translator/emit/records.h"
#include "translator/symbols/name_space.h"
#include "translator/symbols/type_predicates.h"
#include "translator/types/type_view.h"

namespace qrex {

class InterfaceDef;

enum class ClassKind { Struct, Class, Adt, Mixin, Model };
std::string_view KeywordOf(ClassKind kind);

enum class Placement { InClass, OutOfClass };

struct ModelField {
  std::string m_name;
  TypeCode m_type;
  int64_t m_rsnAdded = -1;           // release number; -1 until added
  int64_t m_rsnDropped = -1;         // -1 while not dropped
  std::vector<size_t> m_evolveArgs;  // indices into m_modelFields that the evolve code reads
  std::string m_evolveCode;
  bool IsDropped() const { return m_rsnDropped >= 0; }
};

class ClassDef : public RecordedElement, public TypeBehaviour {
 public:
  ClassDef(ScannedFile& owner, const char* position, ClassKind kind);

  bool HaveSomethingToRegister() const override;
  void WriteReflectedDefinition(TextWriter& out) override;
  void WriteReflection(TextWriter& out, RegistrationLists& lists) override;
  void CollectReferences(std::vector<const NameSpaceElement*>& out) const override;
  bool ContainsMetaData() const override;
  void WriteExtraTraits(TextWriter& out) const override;

  // --- What it is
  bool IsAdt() const { return m_kind == ClassKind::Adt; }
  bool IsMixin() const { return m_kind == ClassKind::Mixin; }
  bool IsPureModel() const { return m_kind == ClassKind::Model; }
  bool IsUnderlyingStruct() const { return m_kind != ClassKind::Class; }
  bool IsTemplate() const { return !m_templateArgList.empty(); }
  // Where its generated members are defined; what depends on template parameters stays in the class.
  Placement MemberPlacement() const;
  // All of its text is where the class is, as templates of C++ and members of classes need it: its functions are
  // templates or friends, and its reflection tail is empty.
  bool IsWholeInPlace() const { return WantsCompilableText() && MemberPlacement() == Placement::InClass; }
  // What need not be in the class is in a tail.
  bool HasTail() const { return HaveSomethingToRegister() && MemberPlacement() == Placement::OutOfClass; }
  bool ExternalDefinition() const { return m_qualifiers.extern_ == TriState::On; }
  bool WriteTraits() const { return m_qualifiers.traits != TriState::Off && !m_nested && !IsTemplate(); }
  std::string_view StructWord() const { return IsUnderlyingStruct() ? "struct " : "class "; }
  const std::string& GetTemplateClassName() const;  // N, or N<argument names>
  std::string TemplateArgs() const;                 // <argument names> or nothing
  std::string TemplateParameters() const;           // "typename BC,typename T", or nothing
  // "template <...>" and what follows it; or nothing.
  std::string TemplatePrefix(std::string_view behind = " ") const;
  std::string_view FriendWord() const;  // ahead of a function behind the class that is in another class
  std::string FunctionPrefix() const { return TemplatePrefix().append(FriendWord()); }

  // --- What it can do: each answer serves the traits, the TypeOps bits and the members alike
  bool CanBeCreated() const;
  bool HasDefaultCtor() const;
  bool HasDtor() const { return CanBeCreated(); }
  bool HasCopy() const;
  bool HasEquality() const;
  bool HasPrint() const;
  bool HasSerialise() const;
  bool AutoGenerateInsertionToXostream() const;
  bool IsIObjectVisitable() const override;
  bool IsPrefVisitable() const override;
  bool CanSerialise() const override;  // as a type of fields
  uint32_t TypeOpsBits() const;

  // --- Its model (model.h)
  bool HasEmbeddedModel() const { return m_numModelSchema > 0; }
  bool GenerateOps() const;
  int64_t GetNumNonDroppedModelFields() const;
  bool CanSerialiseEmbeddedModel() const;
  bool WriteInsertionExtractionInTermsOfSerialise() const;
  std::string ModelStructName() const;           // N for a named $model, else N_model
  std::string QualifiedModelStructName() const;  // with the enclosing name spaces

  ClassKind m_kind;
  bool m_isAnonymous = false;             // a model without a name of its own
  const ClassDef* m_enclosing = nullptr;  // the class that it is in; m_nested may be said of others, too
  ClassQualifiers m_qualifiers;
  std::vector<ClassDef*> m_bases;  // plain bases that resolve to a known class
  std::vector<ClassDef*> m_mixins;
  std::vector<ClassDef*> m_postMixinBases;
  std::vector<FunctionSignature> m_methods;
  std::vector<ClassField> m_fields;
  bool m_hasConstructor = false;  // its own, not a generated one
  bool m_hasEvictBlock = false;
  bool m_hasVisitBlock = false;
  std::vector<std::string> m_evictionMembers;
  ClassDef* m_referencedModel = nullptr;  // `model Name`
  int64_t m_firstRsn = -1;
  int64_t m_numModelSchema = 0;  // 0: no model; a model without $schema counts 1
  std::vector<std::unique_ptr<ModelField>> m_currentThenDroppedModelFields;
  const char* m_schemaPosition = nullptr;  // of `$schema` in the source text; null without one
  size_t m_numCurrentModelFields = 0;
  std::vector<ModelField*> m_modelFields;  // in the order of their addition: the serialised order
  std::vector<InterfaceDef*> m_interfaces;
  bool m_implementsIPersistable = false;
  bool m_implementsIObject = false;
  std::string m_templateArgList;   // source text between < and >
  std::string m_templateArgNames;  // "T,N"
  std::string m_mixinBaseClass;    // text of the generated base, empty without one
  bool m_haveModelDefaultCtor = false;
  bool m_inheritsModel = false;                                    // the class derives from a model mixin
  std::string m_deferredText;                                      // written into the reflection tail
  std::vector<std::unique_ptr<NameSpaceElement>> m_ownedElements;  // nested ones and anonymous mixins: in no name space

 private:
  bool AnyModelField(bool (*test)(TypeView, NameSpace&), TriState& cache) const;
  mutable std::string m_templateClassName;
  mutable TriState m_isIObjectVisitable{}, m_isPrefVisitable{};
  enum class Memo { NotComputed, BeingComputed, No, Yes };
  mutable Memo m_canSerialiseModel = Memo::NotComputed;
};

}  // namespace qrex
