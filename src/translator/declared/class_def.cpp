#include "translator/declared/class_def.h"

#include <algorithm>

#include "translator/emit/byte_code.h"
#include "translator/symbols/scanned_file.h"

namespace qrex {

namespace {

DeclKind DeclKindOf(ClassKind kind) {
  switch (kind) {
    case ClassKind::Struct:
      return DeclKind::Struct;
    case ClassKind::Class:
      return DeclKind::Class;
    case ClassKind::Adt:
      return DeclKind::Adt;
    case ClassKind::Mixin:
      return DeclKind::Mixin;
    case ClassKind::Model:
      return DeclKind::Model;
  }
  return DeclKind::Class;
}

}  // namespace

ClassDef::ClassDef(ScannedFile& owner, const char* position, ClassKind kind)
    : RecordedElement(owner, position, DeclKindOf(kind)), m_kind(kind) {}

std::string_view KeywordOf(ClassKind kind) { return TraitsOf(DeclKindOf(kind)).keyword; }

bool ClassDef::HaveSomethingToRegister() const {
  if (m_nested || status != DeclStatus::Defined || IsMixin()) return false;
  return m_reflected || m_implementsIObject || HasEmbeddedModel() ||
         (m_referencedModel && m_referencedModel->CanSerialiseEmbeddedModel());
}

// In the order of the record: the fields of mixins follow the class's own.
void ClassDef::CollectReferences(std::vector<const NameSpaceElement*>& out) const {
  std::vector<const ClassDef*> sources = {this};
  sources.insert(sources.end(), m_mixins.begin(), m_mixins.end());
  for (const ClassDef* source : sources) {
    for (const ClassField& field : source->m_fields) {
      if (field.reflected) CollectNamedTypes(field.type, *source->owner.rootNameSpace, out);
    }
  }
  for (const ClassDef* source : sources) {
    for (const ModelField* field : source->m_modelFields) {
      CollectNamedTypes(field->m_type, *source->owner.rootNameSpace, out);
    }
  }
  for (const FunctionSignature& method : m_methods) CollectNamedTypes(method, *owner.rootNameSpace, out);
}

bool ClassDef::ContainsMetaData() const {
  return !metadata.empty() || std::any_of(m_methods.begin(), m_methods.end(), SignatureHasMetadata) ||
         std::any_of(m_fields.begin(), m_fields.end(), [](const ClassField& f) { return HasMetadata(f.type); }) ||
         std::any_of(m_modelFields.begin(), m_modelFields.end(),
                     [](const ModelField* f) { return HasMetadata(f->m_type); });
}

Placement ClassDef::MemberPlacement() const {
  const bool inClass = IsMixin() || IsTemplate() || (m_enclosing && WantsCompilableText());
  return inClass ? Placement::InClass : Placement::OutOfClass;
}

const std::string& ClassDef::GetTemplateClassName() const {
  if (m_templateClassName.empty()) {
    const bool namesBase = IsMixin() && WantsCompilableText();
    m_templateClassName =
        name + (namesBase ? IsTemplate() ? "<BC," + m_templateArgNames + ">" : "<BC>" : TemplateArgs());
  }
  return m_templateClassName;
}

std::string ClassDef::TemplateArgs() const { return IsTemplate() ? "<" + m_templateArgNames + ">" : std::string(); }

std::string ClassDef::TemplateParameters() const {
  return (!IsMixin() ? "" : IsTemplate() ? "typename BC," : "typename BC") + m_templateArgList;
}

std::string ClassDef::TemplatePrefix(std::string_view behind) const {
  const std::string parameters = TemplateParameters();
  return parameters.empty() ? parameters : ("template <" + parameters + ">").append(behind);
}

std::string_view ClassDef::FriendWord() const { return m_enclosing && WantsCompilableText() ? "friend " : ""; }

bool ClassDef::CanBeCreated() const {
  return m_qualifiers.abstract != TriState::On && (!IsAdt() || m_implementsIPersistable);
}

bool ClassDef::HasDefaultCtor() const { return CanBeCreated() && OnOr(m_qualifiers.dc, m_strict); }

bool ClassDef::HasCopy() const {
  return m_qualifiers.abstract != TriState::On && !IsAdt() && OnOr(m_qualifiers.copy, m_strict);
}

bool ClassDef::HasEquality() const { return m_qualifiers.compare == TriState::On || IsPureModel() || m_inheritsModel; }

bool ClassDef::AutoGenerateInsertionToXostream() const {
  if (m_qualifiers.abstract == TriState::On) return false;
  return OnOr(m_qualifiers.os, !IsMixin() && (m_referencedModel || IsPureModel() || m_inheritsModel));
}

bool ClassDef::HasPrint() const {
  return m_qualifiers.abstract != TriState::On && OnOr(m_qualifiers.print, AutoGenerateInsertionToXostream());
}

bool ClassDef::HasSerialise() const {
  return m_qualifiers.abstract != TriState::On && OnOr(m_qualifiers.ser, WriteInsertionExtractionInTermsOfSerialise());
}

bool ClassDef::CanSerialise() const { return OnOr(m_qualifiers.ser, HasSerialise()); }

// Recursion guard: while being computed the answer is false, since a model may contain containers of its own class. Not
// cached before the body is read, since traits may be written earlier.
bool ClassDef::AnyModelField(bool (*test)(TypeView, NameSpace&), TriState& cache) const {
  if (cache == TriState::Unset && HasEmbeddedModel()) {
    cache = TriState::Off;
    for (const ModelField* field : m_modelFields) {
      if (!field->IsDropped() && test(field->m_type, *owner.rootNameSpace)) cache = TriState::On;
    }
  }
  return cache == TriState::On;
}

bool ClassDef::IsIObjectVisitable() const {
  return m_hasVisitBlock || AnyModelField(NeedsVisitObjects, m_isIObjectVisitable);
}
bool ClassDef::IsPrefVisitable() const { return AnyModelField(NeedsVisitPrefs, m_isPrefVisitable); }

uint32_t ClassDef::TypeOpsBits() const {
  uint32_t bits = 0;
  if (HasEquality()) bits |= kOpsEqual | kOpsLess;
  if (HasPrint()) bits |= kOpsPrint;
  if (HasSerialise()) bits |= kOpsSerialise;
  if (HasDefaultCtor()) bits |= kOpsConstruct;
  if (HasDtor()) bits |= kOpsDestruct;
  if (HasCopy()) bits |= kOpsCopy;
  if (IsIObjectVisitable()) bits |= kOpsVisitObjects;
  if (IsPrefVisitable()) bits |= kOpsVisitPrefs;
  return bits;
}

bool ClassDef::GenerateOps() const {
  return m_qualifiers.genop == TriState::On ||
         (m_inheritsModel && m_implementsIObject && m_qualifiers.genop != TriState::Off);
}

int64_t ClassDef::GetNumNonDroppedModelFields() const {
  return std::count_if(m_modelFields.begin(), m_modelFields.end(), [](const ModelField* f) { return !f->IsDropped(); });
}

bool ClassDef::CanSerialiseEmbeddedModel() const {
  if (m_numModelSchema <= 0) return false;
  if (m_canSerialiseModel == Memo::NotComputed) {
    m_canSerialiseModel = Memo::BeingComputed;
    const bool can = std::all_of(m_modelFields.begin(), m_modelFields.end(), [this](const ModelField* field) {
      return field->IsDropped() || IsSerialisable(field->m_type, *owner.rootNameSpace);
    });
    m_canSerialiseModel = can ? Memo::Yes : Memo::No;
  }
  return m_canSerialiseModel != Memo::No;  // a model that contains itself in a container is no obstacle to itself
}

bool ClassDef::WriteInsertionExtractionInTermsOfSerialise() const {
  if (m_qualifiers.ar == TriState::On) return true;
  if (IsMixin()) return false;
  return CanSerialiseEmbeddedModel() || (m_referencedModel && m_referencedModel->CanSerialiseEmbeddedModel());
}

std::string ClassDef::ModelStructName() const { return IsPureModel() && !m_isAnonymous ? name : name + "_model"; }

std::string ClassDef::QualifiedModelStructName() const {
  if (m_enclosing && WantsCompilableText()) return ModelStructName();
  const std::string& qualified = GetQualifiedName();
  return qualified.substr(0, qualified.size() - name.size()) + ModelStructName();
}

}  // namespace qrex
