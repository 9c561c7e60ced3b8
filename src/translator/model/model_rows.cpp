// What the record of a class tells of its model fields.

#include "translator/emit/emit.h"
#include "translator/model/model.h"

namespace qrex {

TypeView MapOrSetIn(TypeView type) {
  type = type.WithoutMetadata();
  while (type.IsDecorator() || type.Op() == kOpArray) type = type.Inner().WithoutMetadata();
  return type.Op() == kOpMap || type.Op() == kOpSet ? type : TypeView();
}

std::vector<MixedModelField> AllModelFields(const ClassDef& def) {
  std::vector<MixedModelField> fields;
  for (const ModelField* field : def.m_modelFields) fields.push_back({field, def.m_inheritsModel});
  for (const ClassDef* mixin : def.m_mixins) {
    // The fields of a model in the body of a mixin are its own.
    const bool inMember = !def.WantsCompilableText() || mixin->m_inheritsModel || mixin->IsPureModel();
    for (const ModelField* field : mixin->m_modelFields) fields.push_back({field, inMember});
  }
  return fields;
}

size_t WriteModelFieldRows(TextWriter& out, const ClassDef& def) {
  const std::vector<MixedModelField> fields = AllModelFields(def);
  for (const auto& [field, inMember] : fields) {
    const std::string type = def.name + "_" + field->m_name;
    const std::string path = (inMember ? "_model_." : "") + field->m_name;
    Write(out, R"(
      { "$name$", $offset$, $type$, $added$, $dropped$$mapOrSet$ },
    )",
          "name"_ = field->m_name, "offset"_ = field->IsDropped() ? "-1" : "offsetof(" + def.name + "," + path + ")",
          "type"_ = type, "added"_ = field->m_rsnAdded, "dropped"_ = field->m_rsnDropped,
          "mapOrSet"_ = HoldsMapOrSet(field->m_type) ? "," + type + "_mapOrSetfns" : "");
  }
  if (!def.m_referencedModel) return fields.size();
  Write(out, R"(
    { "$model$", offsetof($name$,_model_), NULL, -1, -1 }
  )",
        "model"_ = def.m_referencedModel->GetQualifiedName(), "name"_ = def.name);
  return fields.size() + 1;
}

}  // namespace qrex
