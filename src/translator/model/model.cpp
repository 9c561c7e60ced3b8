#include "translator/model/model.h"

#include <algorithm>

#include "translator/emit/emit.h"
#include "translator/model/model_accessors.h"
#include "translator/reader/qrex_parser.h"
#include "translator/symbols/scanned_file.h"

namespace qrex {

namespace {

std::vector<const ModelField*> NonDropped(const ClassDef& def) {
  std::vector<const ModelField*> fields;
  for (const ModelField* field : def.m_modelFields) {
    if (!field->IsDropped()) fields.push_back(field);
  }
  return fields;
}

// The class that carries the functions of the model: N, or N_model where the class derives from a mixin that holds it.
std::string ModelScope(const ClassDef& def) { return def.name + (def.m_inheritsModel ? "_model" : ""); }

void WriteDefaultConstructor(TextWriter& out, const ClassDef& def) {
  out << def.ModelStructName() << "()";
  bool first = true;
  for (const ModelField* field : NonDropped(def)) {
    const TypeView type = WithoutDecorators(field->m_type, *def.owner.rootNameSpace).type;
    if (!type.IsScalar() && type.Op() != kOpEnum && type.Op() != kOpPointer) continue;
    out << (first ? " : " : ",") << field->m_name;
    first = false;
    if (type.Op() == kOpEnum) {
      out << "((" << TypeText(type) << ")0)";
    } else {
      out << "(0)";
    }
  }
  out << " {}\n";
}

void WriteMemberwiseConstructor(TextWriter& out, const ClassDef& def) {
  const auto fields = NonDropped(def);
  if (fields.empty()) return;
  if (fields.size() == 1) out << "explicit ";
  out << def.ModelStructName() << "(";
  WriteJoined(out, fields, ",", [&](const ModelField* field) {
    PrintType(out, field->m_type);
    out << " const& " << field->m_name << "_";
  });
  out << ") : ";
  WriteJoined(out, fields, ",", [&](const ModelField* field) { out << field->m_name << "(" << field->m_name << "_)"; });
  out << " {}\n";
}

// The four comparisons that follow from == and <.
void WriteDerivedComparisons(TextWriter& out, std::string_view name) {
  WriteText(out,
            "bool operator!=($0 const& _rhs) const { return !operator==(_rhs); }\n"
            "bool operator<=($0 const& _rhs) const { return !_rhs.operator<(*this); }\n"
            "bool operator>($0 const& _rhs) const { return _rhs.operator<(*this); }\n"
            "bool operator>=($0 const& _rhs) const { return !operator<(_rhs); }\n",
            {name});
}

void WriteComparisons(TextWriter& out, const ClassDef& def) {
  const auto fields = NonDropped(def);
  const std::string name = def.ModelStructName();
  out << "bool operator<(" << name << " const& _rhs) const\n";
  {
    Block body(out);
    out << "return ";
    for (const ModelField* field : fields) {
      WriteText(out, field == fields.back() ? "($0 < _rhs.$0" : "($0 < _rhs.$0 || ($0 == _rhs.$0 &&\n",
                {field->m_name});
    }
    if (fields.empty()) {
      out << "true";
    } else {
      out << std::string(2 * fields.size() - 1, ')');
    }
    out << ";\n";
  }
  out << "bool operator==(" << name << " const& _rhs) const\n";
  {
    Block body(out);
    out << "return ";
    WriteJoined(out, fields, " &&\n",
                [&](const ModelField* field) { WriteText(out, "$0 == _rhs.$0", {field->m_name}); });
    if (fields.empty()) out << "true";
    out << ";\n";
  }
  WriteDerivedComparisons(out, name);
}

void WriteFieldDeclarations(TextWriter& out, const ClassDef& def) {
  for (const ModelField* field : NonDropped(def)) {
    PrintDeclaration(out, field->m_type, field->m_name, DeclarationMode::Plain);
    out << ";\n";
  }
}

void WriteStructMembers(TextWriter& out, const ClassDef& def) {
  if (!def.m_haveModelDefaultCtor) WriteDefaultConstructor(out, def);
  WriteMemberwiseConstructor(out, def);
  if (def.CanSerialiseEmbeddedModel()) {
    out << "void Serialise(vesk::Archive&) const;\n"
           "void Deserialise(vesk::InputArchive&);\n";
  }
  if (def.MemberPlacement() == Placement::InClass || def.m_isAnonymous) {
    WriteVisiting(out, def, Placement::InClass);
  } else {
    WriteVisitingDeclarations(out, def);
  }
  WriteComparisons(out, def);
  WriteModelStructAccessors(out, def);
  out << "\n";
  WriteFieldDeclarations(out, def);
}

}  // namespace

void ParseModelStruct(QrexParser& parser, ClassDef& def) {
  TextWriter& out = parser.out;
  if (def.IsTemplate()) out << "template <" << def.m_templateArgList << "> ";
  out << "struct " << ExportPrefix(def) << def.ModelStructName() << "\n";
  Block body(out, ";");
  ParseModelBlock(parser, def, Expansion::AttributeStructs);  // a mixin goes with the struct
  out << "\n";
  WriteStructMembers(out, def);
}

void WriteModelFieldsAndAccessors(TextWriter& out, const ClassDef& def) {
  WriteFieldDeclarations(out, def);
  WriteModelStructAccessors(out, def);
}

// --- Archives

void WriteSerialise(TextWriter& out, const ClassDef& def, Placement placement) {
  if (!def.CanSerialiseEmbeddedModel()) return;
  if (placement == Placement::InClass) {
    out << "template<typename Archive> void Serialise(Archive& _ar) const\n";
  } else {
    out << "void " << ModelScope(def) << "::Serialise(vesk::Archive& _ar) const\n";
  }
  Block body(out);
  const auto fields = NonDropped(def);
  if (fields.empty()) return;
  out << "_ar ";
  WriteJoined(out, fields, "\n   ", [&](const ModelField* field) { out << "<< this->" << field->m_name; });
  out << ";\n";
}

namespace {

void WriteEvolveCode(TextWriter& out, const ClassDef& def) {
  out << "struct EvolveCode\n";
  Block body(out, ";");
  for (const ModelField* field : def.m_modelFields) {
    if (field->m_evolveCode.empty()) continue;
    out << "static void calc_" << field->m_name << "(" << TypeText(field->m_type) << "& " << field->m_name;
    for (size_t index : field->m_evolveArgs) {
      const ModelField& argument = *def.m_modelFields[index];
      out << "," << TypeText(argument.m_type) << " const& " << argument.m_name;
    }
    out << ") { " << field->m_evolveCode << " }\n";
  }
}

std::string EvolveCall(const ClassDef& def, const ModelField& field) {
  if (field.m_evolveCode.empty()) return {};
  std::string call = "EvolveCode::calc_" + field.m_name + "(" + field.m_name;
  for (size_t index : field.m_evolveArgs) call += "," + def.m_modelFields[index]->m_name;
  return call + ");";
}

void WriteVersionedRead(TextWriter& out, const ClassDef& def, const ModelField& field) {
  const bool isFirst = field.m_rsnAdded == def.m_firstRsn;
  out << "\n";
  // A dropped field is read into a local variable, where later evolve calls find it.
  if (field.IsDropped()) out << TypeText(field.m_type) << " " << field.m_name << ";\n";
  if (!isFirst) out << "if (_rsn <= " << field.m_rsnAdded - 1 << ") { " << EvolveCall(def, field) << " }\n";
  if (!isFirst) out << "else ";
  if (field.IsDropped()) {
    out << "if (_rsn < " << field.m_rsnDropped << ") _ar >> " << field.m_name << ";\n";
  } else {
    out << "_ar >> this->" << field.m_name << ";\n";
  }
}

}  // namespace

void WriteDeserialise(TextWriter& out, const ClassDef& def, Placement placement) {
  if (!def.CanSerialiseEmbeddedModel()) return;
  out << "void ";
  if (placement == Placement::OutOfClass) out << ModelScope(def) << "::";
  out << "Deserialise(vesk::InputArchive& _ar)\n";
  Block body(out);
  if (def.m_numModelSchema < 2) {
    if (def.m_modelFields.empty()) return;
    out << "_ar ";
    WriteJoined(out, def.m_modelFields, "\n   ", [&](const ModelField* field) { out << ">> this->" << field->m_name; });
    out << ";\n";
    return;
  }
  out << "vesk::RSN _rsn = vesk::" << TargetIdentifier(def) << "_GetModelRsn();\n";
  WriteEvolveCode(out, def);
  for (const ModelField* field : def.m_modelFields) WriteVersionedRead(out, def, *field);
}

// --- Visiting

void WriteVisiting(TextWriter& out, const ClassDef& def, Placement placement) {
  NameSpace& root = *def.owner.rootNameSpace;
  const auto fields = NonDropped(def);
  std::string heading = "void ";
  if (placement == Placement::OutOfClass) {
    heading = def.TemplatePrefix() + "void " + ModelScope(def) + def.TemplateArgs() + "::";
  }
  if (!def.GenerateOps()) {
    out << heading << "EvictDgsNodes() const {";
    for (const ModelField* field : fields) out << "vesk::DataSourceEvict(&" << field->m_name << ");";
    out << "}\n";
  }
  auto writeVisit = [&](std::string_view function, bool (*isVisitable)(TypeView, NameSpace&)) {
    out << heading << function << "& _v) const {";
    bool any = false;
    for (const ModelField* field : fields) {
      if (!isVisitable(field->m_type, root)) continue;
      out << (any ? "" : "_v") << " << " << field->m_name;
      any = true;
    }
    out << (any ? ";}\n" : "}\n");
  };
  writeVisit("VisitObjects(vesk::IObjectVisitor", NeedsVisitObjects);
  writeVisit("VisitPrefs(vesk::IPrefVisitor", NeedsVisitPrefs);
}

void WriteVisitingDeclarations(TextWriter& out, const ClassDef& def) {
  if (!def.GenerateOps()) out << "void EvictDgsNodes() const;\n";
  out << "void VisitObjects(vesk::IObjectVisitor& _v) const;\n"
         "void VisitPrefs(vesk::IPrefVisitor& _v) const;\n";
}

// --- Mixin

void WriteModelMixin(TextWriter& out, const ClassDef& def) {
  const ClassDef& model = def.m_referencedModel ? *def.m_referencedModel : def;
  const std::string mixin = def.name + "_model_mixin";
  const std::string type = model.QualifiedModelStructName() + model.TemplateArgs();
  const bool operations = def.GenerateOps() && model.qualifiers.genop != TriState::Off;
  const Access access = operations ? Access::Operations : Access::Barriers;
  out << "template <typename BC" << (def.IsTemplate() ? "," + def.m_templateArgList : "") << ">\n";
  out << "struct " << mixin << " : public BC\n";
  Block body(out, ";");
  out << "using typename BC::FinalClass;\n\n";
  WriteText(out,
            "bool operator<($0 const& _rhs) const {return _model_ < _rhs._model_;}\n"
            "bool operator==($0 const& _rhs) const {return _model_ == _rhs._model_;}\n",
            {mixin});
  WriteDerivedComparisons(out, mixin);
  out << "void EvictDgsNodes() const {BC::EvictDgsNodes();"
      << (def.GenerateOps() ? "vesk::EvictIndepFieldsUnderObject(static_cast<const typename BC::FinalClass*>(this));"
                            : "_model_.EvictDgsNodes();")
      << "}\n";
  out << "void VisitObjects(vesk::IObjectVisitor& _v) const {BC::VisitObjects(_v); _model_.VisitObjects(_v);}\n"
         "void VisitPrefs(vesk::IPrefVisitor& _v) const {BC::VisitPrefs(_v); _model_.VisitPrefs(_v);}\n";
  WriteModelMixinAccessors(out, def, model, access);
  if (model.GetNumNonDroppedModelFields() > 0) {
    out << "union\n";
    Block attributes(out, ";");
    WriteModelMixinAttributeStructs(out, def, model, access);
  }
  WriteText(out,
            "typedef $0 model_type;\n"
            "$0 const& model() const { return _model_; }\n"
            "$0& model() { return _model_; }\n",
            {type});
  const std::string_view constObject =
      model.m_implementsIObject ? "static_cast<const typename BC::FinalClass*>(this)" : "vesk::null";
  const std::string_view object =
      model.m_implementsIObject ? "static_cast<typename BC::FinalClass*>(this)" : "vesk::null";
  if (operations) {
    out << type
        << " const& read() const { vesk::IndepFieldReadBarrier(static_cast<const typename BC::FinalClass*>(this), "
           "vesk::Path()); return _model_; }\n";
  } else {
    WriteText(out,
              "$0 const& read() const { vesk::DataSourceReadBarrier(static_cast<const typename "
              "BC::FinalClass*>(this), $1,\"$3\"); return _model_; }\n"
              "$0 & write() { vesk::DataSourceWriteBarrier(static_cast<typename BC::FinalClass*>(this), $2,\"$3\"); "
              "return _model_; }\n",
              {type, constObject, object, def.name});
  }
  out << type << " _model_;\n";
}

// --- Around the class

namespace {

bool KeepsDataSourceRsn(const ClassDef& def) {
  if (def.MemberPlacement() == Placement::InClass) return false;
  return (def.m_inheritsModel && def.CanSerialiseEmbeddedModel()) ||
         (def.m_referencedModel && def.m_referencedModel->CanSerialiseEmbeddedModel());
}

}  // namespace

void WriteModelRsnDeclarations(TextWriter& out, const ClassDef& def) {
  const std::string target = TargetIdentifier(def);
  if (def.HasEmbeddedModel() && def.CanSerialiseEmbeddedModel()) {
    out << "namespace vesk { RSN " << target << "_GetModelRsn(); }\n";
  }
  if (KeepsDataSourceRsn(def)) {
    WriteText(out,
              "namespace vesk\n"
              "{\n"
              "    void $0_WriteDataSourceRsn(Archive& ar);\n"
              "    void $0_ReadDataSourceRsn(InputArchive& ar);\n"
              "}\n",
              {target});
  }
}

void WriteDataSourceRsnFunctions(TextWriter& out, const ClassDef& def) {
  if (!KeepsDataSourceRsn(def)) return;
  const std::string target = TargetIdentifier(def);
  out << "void " << def.name << "::Serialise(vesk::Archive& _ar) const\n";
  {
    Block body(out);
    out << "vesk::" << target << "_WriteDataSourceRsn(_ar);\n_model_.Serialise(_ar);\n";
  }
  out << "void " << def.name << "::Deserialise(vesk::InputArchive& _ar)\n";
  Block body(out);
  out << "vesk::" << target << "_ReadDataSourceRsn(_ar);\n_model_.Deserialise(_ar);\n";
}

void WriteModelStreamInsertion(TextWriter& out, const ClassDef& def) {
  const std::string heading = "inline vesk::xostream& operator<<(vesk::xostream& _os," + def.name;
  if (def.m_referencedModel) {
    out << "\n" << heading << " const& _x) { _os << _x._model_; return _os; }\n";
    return;
  }
  if (!def.IsPureModel() && !def.m_inheritsModel) return;
  out << heading << " const& _x)\n";
  Block body(out);
  const std::string path = def.IsPureModel() ? "" : "_model_.";
  if (def.qualifiers.multiline == TriState::On) {
    out << "_os << \"" << def.name << "\\n\";\n";
    out << "vesk::ScopeWriter2 sw(_os);\n";
    for (const ModelField* field : NonDropped(def)) {
      out << "_os << \"" << field->m_name << " = \" << _x." << path << field->m_name << " << '\\n';\n";
    }
  } else {
    out << "_os << \"" << def.name << "(\"";
    WriteJoined(out, NonDropped(def), " << ','",
                [&](const ModelField* field) { out << " << _x." << path << field->m_name; });
    out << " << ')';\n";
  }
  out << "return _os;\n";
}

TypeView MapOrSetIn(TypeView type) {
  type = type.WithoutMetadata();
  while (type.IsDecorator() || type.Op() == kOpArray) type = type.Inner().WithoutMetadata();
  return type.Op() == kOpMap || type.Op() == kOpSet ? type : TypeView();
}

std::vector<MixedModelField> AllModelFields(const ClassDef& def) {
  std::vector<MixedModelField> fields;
  for (const ModelField* field : def.m_modelFields) fields.push_back({field, false});
  for (const ClassDef* mixin : def.m_mixins) {
    for (const ModelField* field : mixin->m_modelFields) fields.push_back({field, true});
  }
  return fields;
}

size_t WriteModelFieldRows(TextWriter& out, const ClassDef& def) {
  const std::vector<MixedModelField> fields = AllModelFields(def);
  for (const auto& [field, fromMixin] : fields) {
    const std::string type = def.name + "_" + field->m_name;
    out << "{ \"" << field->m_name << "\", ";
    if (field->IsDropped()) {
      out << "-1";
    } else {
      out << "offsetof(" << def.name << "," << (def.m_inheritsModel || fromMixin ? "_model_." : "") << field->m_name
          << ")";
    }
    out << ", " << type << ", " << field->m_rsnAdded << ", " << field->m_rsnDropped;
    if (HoldsMapOrSet(field->m_type)) out << "," << type << "_mapOrSetfns";
    out << " },\n";
  }
  if (!def.m_referencedModel) return fields.size();
  out << "{ \"" << def.m_referencedModel->GetQualifiedName() << "\", offsetof(" << def.name
      << ",_model_), NULL, -1, -1 }\n";
  return fields.size() + 1;
}

}  // namespace qrex
