#include "translator/model/model.h"

#include <algorithm>

#include "translator/emit/annotations.h"
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
  auto writeInitialisers = [&] {
    std::string_view separator = " : ";
    for (const ModelField* field : NonDropped(def)) {
      const TypeView type = WithoutDecorators(field->m_type, *def.owner.rootNameSpace).type;
      const bool isEnum = type.Op() == kOpEnum;
      if (!type.IsScalar() && !isEnum && type.Op() != kOpPointer) continue;
      Write(out, "$separator$$name$($cast$0)", "separator"_ = separator, "name"_ = field->m_name,
            "cast"_ = isEnum ? "(" + TypeText(type) + ")" : "");
      separator = ",";
    }
  };
  Write(out, "$name$()$initialisers$ {}\n", "name"_ = def.ModelStructName(), "initialisers"_ = writeInitialisers);
}

void WriteMemberwiseConstructor(TextWriter& out, const ClassDef& def) {
  const auto fields = NonDropped(def);
  if (fields.empty()) return;
  auto writeParameter = [&](const ModelField* field) {
    Write(out, "$type$ const& $name$_", "type"_ = TypeView(field->m_type), "name"_ = field->m_name);
  };
  auto writeInitialiser = [&](const ModelField* field) { Write(out, "$name$($name$_)", "name"_ = field->m_name); };
  Write(out, "$explicit$$name$($parameters$) : $initialisers$ {}\n",
        "explicit"_ = fields.size() == 1 ? "explicit " : "", "name"_ = def.ModelStructName(),
        "parameters"_ = Each(out, fields, ",", writeParameter),
        "initialisers"_ = Each(out, fields, ",", writeInitialiser));
}

// The four comparisons that follow from == and <.
void WriteDerivedComparisons(TextWriter& out, std::string_view name) {
  Write(out, R"(
    bool operator!=($name$ const& _rhs) const { return !operator==(_rhs); }
    bool operator<=($name$ const& _rhs) const { return !_rhs.operator<(*this); }
    bool operator>($name$ const& _rhs) const { return _rhs.operator<(*this); }
    bool operator>=($name$ const& _rhs) const { return !operator<(_rhs); }
  )",
        "name"_ = name);
}

void WriteReturnLess(TextWriter& out, const std::vector<const ModelField*>& fields) {
  out << "return ";
  for (const ModelField* field : fields) {
    Write(out, "($name$ < _rhs.$name$", "name"_ = field->m_name);
    if (field != fields.back()) Write(out, " || ($name$ == _rhs.$name$ &&\n", "name"_ = field->m_name);
  }
  out << (fields.empty() ? "true" : std::string(2 * fields.size() - 1, ')')) << ";\n";
}

void WriteReturnEqual(TextWriter& out, const std::vector<const ModelField*>& fields) {
  if (fields.empty()) {
    out << "return true;\n";
    return;
  }
  auto writeEqual = [&](const ModelField* field) { Write(out, "$name$ == _rhs.$name$", "name"_ = field->m_name); };
  Write(out, "return $fields$;\n", "fields"_ = Each(out, fields, " &&\n", writeEqual));
}

void WriteComparisons(TextWriter& out, const ClassDef& def) {
  const auto fields = NonDropped(def);
  const std::string name = def.ModelStructName();
  Write(out, R"(
    bool operator<($name$ const& _rhs) const
    {
        $returnLess$
    }
    bool operator==($name$ const& _rhs) const
    {
        $returnEqual$
    }
    $derivedComparisons$
  )",
        "name"_ = name, "returnLess"_([&] { WriteReturnLess(out, fields); }),
        "returnEqual"_([&] { WriteReturnEqual(out, fields); }),
        "derivedComparisons"_([&] { WriteDerivedComparisons(out, name); }));
}

void WriteFieldDeclarations(TextWriter& out, const ClassDef& def) {
  for (const ModelField* field : NonDropped(def)) {
    WriteAnnotations(out, def, field->m_type, OutputLine::Begins);
    PrintDeclaration(out, field->m_type, field->m_name, DeclarationMode::Plain);
    out << ";\n";
  }
}

void WriteStructMembers(TextWriter& out, const ClassDef& def) {
  if (!def.m_haveModelDefaultCtor) WriteDefaultConstructor(out, def);
  WriteMemberwiseConstructor(out, def);
  const bool inClass = def.MemberPlacement() == Placement::InClass || def.m_isAnonymous;
  if (inClass && def.WantsCompilableText()) {
    WriteSerialise(out, def, Placement::InClass);
    WriteDeserialise(out, def, Placement::InClass);
  } else if (def.CanSerialiseEmbeddedModel()) {
    Write(out, R"(
      void Serialise(vesk::Archive&) const;
      void Deserialise(vesk::InputArchive&);
    )");
  }
  if (inClass) {
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
  Write(out, "$template$struct $api$$name$\n",
        "template"_ = def.IsTemplate() ? "template <" + def.m_templateArgList + "> " : "", "api"_ = ExportPrefix(def),
        "name"_ = def.ModelStructName());
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
  auto writeFields = [&] {
    const auto fields = NonDropped(def);
    if (fields.empty()) return;
    auto writeField = [&](const ModelField* field) { out << "<< this->" << field->m_name; };
    Write(out, "_ar $fields$;\n", "fields"_ = Each(out, fields, "\n   ", writeField));
  };
  Write(out, R"(
    $heading$
    {
        $fields$
    }
  )",
        "heading"_ = placement == Placement::InClass
                         ? "template<typename Archive> void Serialise(Archive& _ar) const"
                         : "void " + ModelScope(def) + "::Serialise(vesk::Archive& _ar) const",
        "fields"_ = writeFields);
}

namespace {

void WriteEvolveFunctions(TextWriter& out, const ClassDef& def) {
  for (const ModelField* field : def.m_modelFields) {
    if (field->m_evolveCode.empty()) continue;
    auto writeArgument = [&](size_t index) {
      const ModelField& argument = *def.m_modelFields[index];
      Write(out, ",$type$ const& $name$", "type"_ = TypeView(argument.m_type), "name"_ = argument.m_name);
    };
    Write(out, "static void calc_$name$($type$& $name$$arguments$) { $code$ }\n", "name"_ = field->m_name,
          "type"_ = TypeView(field->m_type), "arguments"_ = Each(out, field->m_evolveArgs, "", writeArgument),
          "code"_ = field->m_evolveCode);
  }
}

void WriteEvolveCall(TextWriter& out, const ClassDef& def, const ModelField& field) {
  if (field.m_evolveCode.empty()) return;
  auto writeArgument = [&](size_t index) { out << "," << def.m_modelFields[index]->m_name; };
  Write(out, "EvolveCode::calc_$name$($name$$arguments$);", "name"_ = field.m_name,
        "arguments"_ = Each(out, field.m_evolveArgs, "", writeArgument));
}

void WriteVersionedRead(TextWriter& out, const ClassDef& def, const ModelField& field) {
  out << "\n";
  // A dropped field is read into a local variable, where later evolve calls find it.
  if (field.IsDropped()) {
    const TypeView type = WithoutDecorators(field.m_type, *def.owner.rootNameSpace).type;
    const bool isIndeterminate = type.IsScalar() || type.Op() == kOpEnum;  // where the archive is older than the field
    Write(out, "$type$ $name$$initialiser$;\n", "type"_ = TypeView(field.m_type), "name"_ = field.m_name,
          "initialiser"_ = If(isIndeterminate && def.WantsCompilableText(), "{}"));
  }
  if (field.m_rsnAdded != def.m_firstRsn) {
    Write(out, "if (_rsn <= $lastWithout$) { $evolve$ }\nelse ", "lastWithout"_ = field.m_rsnAdded - 1,
          "evolve"_([&] { WriteEvolveCall(out, def, field); }));
  }
  if (field.IsDropped()) {
    Write(out, "if (_rsn < $dropped$) _ar >> $name$;\n", "dropped"_ = field.m_rsnDropped, "name"_ = field.m_name);
  } else {
    out << "_ar >> this->" << field.m_name << ";\n";
  }
}

void WriteReads(TextWriter& out, const ClassDef& def) {
  if (def.m_numModelSchema >= 2) {
    Write(out, R"(
      vesk::RSN _rsn = vesk::$target$_GetModelRsn();
      struct EvolveCode
      {
          $functions$
      };
    )",
          "target"_ = TargetIdentifier(def), "functions"_([&] { WriteEvolveFunctions(out, def); }));
    for (const ModelField* field : def.m_modelFields) WriteVersionedRead(out, def, *field);
  } else if (!def.m_modelFields.empty()) {
    auto writeField = [&](const ModelField* field) { out << ">> this->" << field->m_name; };
    Write(out, "_ar $fields$;\n", "fields"_ = Each(out, def.m_modelFields, "\n   ", writeField));
  }
}

}  // namespace

void WriteDeserialise(TextWriter& out, const ClassDef& def, Placement placement) {
  if (!def.CanSerialiseEmbeddedModel()) return;
  const bool inClass = placement == Placement::InClass;
  const bool isTemplate = inClass && def.WantsCompilableText();  // the archive functions of the fields may come later
  Write(out, R"(
    $template$void $scope$Deserialise($archive$& _ar)
    {
        $reads$
    }
  )",
        "template"_ = If(isTemplate, "template<typename Archive> "),
        "scope"_ = inClass ? "" : ModelScope(def) + "::", "archive"_ = isTemplate ? "Archive" : "vesk::InputArchive",
        "reads"_([&] { WriteReads(out, def); }));
}

// --- Visiting

void WriteVisiting(TextWriter& out, const ClassDef& def, Placement placement) {
  const auto fields = NonDropped(def);
  const std::string heading = placement == Placement::OutOfClass
                                  ? def.TemplatePrefix() + "void " + ModelScope(def) + def.TemplateArgs() + "::"
                                  : "void ";
  if (!def.GenerateOps()) {
    auto writeEvict = [&](const ModelField* field) { out << "vesk::DataSourceEvict(&" << field->m_name << ");"; };
    Write(out, "$heading$EvictDgsNodes() const {$fields$}\n", "heading"_ = heading,
          "fields"_ = Each(out, fields, "", writeEvict));
  }
  auto writeVisit = [&](std::string_view what, std::string_view visitor, bool (*isVisitable)(TypeView, NameSpace&)) {
    auto writeFields = [&] {
      bool any = false;
      for (const ModelField* field : fields) {
        if (!isVisitable(field->m_type, *def.owner.rootNameSpace)) continue;
        out << (any ? "" : "_v") << " << " << field->m_name;
        any = true;
      }
      if (any) out << ";";
    };
    Write(out, "$heading$Visit$what$(vesk::$visitor$& _v) const {$fields$}\n", "heading"_ = heading, "what"_ = what,
          "visitor"_ = visitor, "fields"_ = writeFields);
  };
  writeVisit("Objects", "IObjectVisitor", NeedsVisitObjects);
  writeVisit("Prefs", "IPrefVisitor", NeedsVisitPrefs);
}

void WriteVisitingDeclarations(TextWriter& out, const ClassDef& def) {
  Write(out, R"(
    $evict$
    void VisitObjects(vesk::IObjectVisitor& _v) const;
    void VisitPrefs(vesk::IPrefVisitor& _v) const;
  )",
        "evict"_ = def.GenerateOps() ? "" : "void EvictDgsNodes() const;");
}

// --- Mixin

namespace {

// The functions of a mixin that give the whole model, behind the barriers that reading and writing need.
void WriteReadAndWrite(TextWriter& out, const ClassDef& def, const ClassDef& model, std::string_view type,
                       Access access) {
  if (access == Access::Operations) {
    Write(out, R"(
      $type$ const& read() const { vesk::IndepFieldReadBarrier($object$, vesk::Path()); return _model_; }
    )",
          "type"_ = type, "object"_ = kConstFinal);
    return;
  }
  Write(out, R"(
    $type$ const& read() const { vesk::DataSourceReadBarrier($constFinal$, $constObject$,"$name$"); return _model_; }
    $type$ & write() { vesk::DataSourceWriteBarrier($final$, $object$,"$name$"); return _model_; }
  )",
        "type"_ = type, "name"_ = def.name, "constFinal"_ = kConstFinal, "final"_ = kFinal,
        "constObject"_ = model.m_implementsIObject ? kConstFinal : "vesk::null",
        "object"_ = model.m_implementsIObject ? kFinal : "vesk::null");
}

void WriteAttributeStructs(TextWriter& out, const ClassDef& def, const ClassDef& model, Access access) {
  if (model.GetNumNonDroppedModelFields() == 0) return;
  Write(out, R"(
    union
    {
        $structs$
    };
  )",
        "structs"_([&] { WriteModelMixinAttributeStructs(out, def, model, access); }));
}

}  // namespace

void WriteModelMixin(TextWriter& out, const ClassDef& def) {
  const ClassDef& model = def.m_referencedModel ? *def.m_referencedModel : def;
  const std::string mixin = def.name + "_model_mixin";
  const std::string type = model.QualifiedModelStructName() + model.TemplateArgs();
  const bool operations = def.GenerateOps() && model.m_qualifiers.genop != TriState::Off;
  const Access access = operations ? Access::Operations : Access::Barriers;
  Write(out, R"(
    template <typename BC$templateParameters$>
    struct $mixin$ : public BC
    {
        using typename BC::FinalClass;

        bool operator<($mixin$ const& _rhs) const {return _model_ < _rhs._model_;}
        bool operator==($mixin$ const& _rhs) const {return _model_ == _rhs._model_;}
        $derivedComparisons$
        void EvictDgsNodes() const {BC::EvictDgsNodes();$evict$;}
        void VisitObjects(vesk::IObjectVisitor& _v) const {BC::VisitObjects(_v); _model_.VisitObjects(_v);}
        void VisitPrefs(vesk::IPrefVisitor& _v) const {BC::VisitPrefs(_v); _model_.VisitPrefs(_v);}
        $accessors$
        $attributeStructs$
        typedef $type$ model_type;
        $type$ const& model() const { return _model_; }
        $type$& model() { return _model_; }
        $readAndWrite$
        $type$ _model_;
    };
  )",
        "templateParameters"_ = def.IsTemplate() ? "," + def.m_templateArgList : "", "mixin"_ = mixin, "type"_ = type,
        "derivedComparisons"_([&] { WriteDerivedComparisons(out, mixin); }),
        "evict"_ = def.GenerateOps() ? "vesk::EvictIndepFieldsUnderObject(" + std::string(kConstFinal) + ")"
                                     : "_model_.EvictDgsNodes()",
        "accessors"_([&] { WriteModelMixinAccessors(out, def, model, access); }),
        "attributeStructs"_([&] { WriteAttributeStructs(out, def, model, access); }),
        "readAndWrite"_([&] { WriteReadAndWrite(out, def, model, type, access); }));
}

// --- Around the class

namespace {

bool KeepsDataSourceRsn(const ClassDef& def) {
  if (def.MemberPlacement() == Placement::InClass && !def.WantsCompilableText()) return false;
  return (def.m_inheritsModel && def.CanSerialiseEmbeddedModel()) ||
         (def.m_referencedModel && def.m_referencedModel->CanSerialiseEmbeddedModel());
}

}  // namespace

void WriteTargetDeclarations(TextWriter& out, const ClassDef& def) {
  Write(out, R"(
    namespace vesk
    {
        RSN $target$_GetModelRsn();
        void $target$_WriteDataSourceRsn(Archive& ar);
        void $target$_ReadDataSourceRsn(InputArchive& ar);
    }
  )",
        "target"_ = TargetIdentifier(def));
}

void WriteModelRsnDeclarations(TextWriter& out, const ClassDef& def) {
  const std::string target = TargetIdentifier(def);
  if (def.HasEmbeddedModel() && def.CanSerialiseEmbeddedModel()) {
    Write(out, "namespace vesk { RSN $target$_GetModelRsn(); }\n", "target"_ = target);
  }
  if (!KeepsDataSourceRsn(def)) return;
  Write(out, R"(
    namespace vesk
    {
        void $target$_WriteDataSourceRsn(Archive& ar);
        void $target$_ReadDataSourceRsn(InputArchive& ar);
    }
  )",
        "target"_ = target);
}

void WriteDataSourceRsnFunctions(TextWriter& out, const ClassDef& def, Placement placement) {
  if (!KeepsDataSourceRsn(def)) return;
  const bool inClass = placement == Placement::InClass;
  Write(out, R"(
    void $scope$Serialise(vesk::Archive& _ar) const
    {
        vesk::$target$_WriteDataSourceRsn(_ar);
        $self$_model_.Serialise(_ar);
    }
    void $scope$Deserialise(vesk::InputArchive& _ar)
    {
        vesk::$target$_ReadDataSourceRsn(_ar);
        $self$_model_.Deserialise(_ar);
    }
  )",
        "scope"_ = If(!inClass, def.name + "::"), "target"_ = TargetIdentifier(def), "self"_ = If(inClass, "this->"));
}

namespace {

// `path`: of the model in the object.
void WriteInsertionLines(TextWriter& out, const ClassDef& def, std::string_view path) {
  Write(out, R"(
    _os << "$name$\n";
    vesk::ScopeWriter2 sw(_os);
  )",
        "name"_ = def.name);
  for (const ModelField* field : NonDropped(def)) {
    Write(out, R"(
      _os << "$name$ = " << _x.$path$$name$ << '\n';
    )",
          "name"_ = field->m_name, "path"_ = path);
  }
}

void WriteInsertionList(TextWriter& out, const ClassDef& def, std::string_view path) {
  const auto fields = NonDropped(def);
  auto writeField = [&](const ModelField* field) { out << " << _x." << path << field->m_name; };
  Write(out, R"(
    _os << "$name$("$fields$ << ')';
  )",
        "name"_ = def.name, "fields"_ = Each(out, fields, " << ','", writeField));
}

void WriteInsertionFunction(TextWriter& out, const ClassDef& def, std::string_view prefix, std::string_view name) {
  const auto writeFields = def.m_qualifiers.multiline == TriState::On ? WriteInsertionLines : WriteInsertionList;
  Write(out, R"(
    $prefix$vesk::xostream& operator<<(vesk::xostream& _os,$name$ const& _x)
    {
        $fields$
        return _os;
    }
  )",
        "prefix"_ = prefix, "name"_ = name,
        "fields"_([&] { writeFields(out, def, def.IsPureModel() ? "" : "_model_."); }));
}

}  // namespace

// The function looks at those of all types of its name space, once for each `<<`: text that compiles has it in the
// tail, so that not every file which sees the class pays for that.
void WriteModelStreamInsertion(TextWriter& out, const ClassDef& def) {
  const bool compilable = def.WantsCompilableText();
  const std::string prefix = compilable ? def.FunctionPrefix() : "";
  const std::string& name = compilable ? def.GetTemplateClassName() : def.name;
  if (def.m_referencedModel) {
    out << "\n";
    Write(out, R"(
      $prefix$inline vesk::xostream& operator<<(vesk::xostream& _os,$name$ const& _x) { _os << _x._model_; return _os; }
    )",
          "prefix"_ = prefix, "name"_ = name);
    return;
  }
  if (!def.IsPureModel() && !def.m_inheritsModel) return;
  if (compilable && def.HasTail()) {
    Write(out, "$api$vesk::xostream& operator<<(vesk::xostream& _os,$name$ const& _x);\n", "api"_ = ExportPrefix(def),
          "name"_ = name);
    return;
  }
  WriteInsertionFunction(out, def, prefix + "inline ", name);
}

void WriteModelStreamInsertionInTail(TextWriter& out, const ClassDef& def) {
  if (!def.WantsCompilableText() || def.m_referencedModel || def.m_qualifiers.os != TriState::Unset) return;
  if (def.IsPureModel() || def.m_inheritsModel) WriteInsertionFunction(out, def, ExportPrefix(def), def.name);
}

}  // namespace qrex
