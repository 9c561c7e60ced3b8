#include "translator/class/text_checks.h"

#include <algorithm>
#include <set>

#include "translator/declared/class_def.h"
#include "translator/reader/qrex_parser.h"

namespace qrex {

namespace {

// Appends those of the class's mixins, and of theirs, that bring a model; the outermost comes last. What several mixins
// list is walked once: a ladder of them has more ways down than can be gone.
void CollectModels(const ClassDef& def, std::vector<const ClassDef*>& models, std::set<const ClassDef*>& walked) {
  for (const ClassDef* mixin : def.m_mixins) {
    if (walked.insert(mixin).second) CollectModels(*mixin, models, walked);
    if (mixin->IsPureModel() || mixin->m_inheritsModel) models.push_back(mixin);
  }
}

// All models are `_model_`, so that the outermost hides the others.
void CheckModels(QrexParser& parser, const ClassDef& def) {
  std::vector<const ClassDef*> models;
  std::set<const ClassDef*> walked;
  CollectModels(def, models, walked);
  if (models.empty()) return;
  if (def.m_inheritsModel) {
    parser.ReportWarning(Warning::TwoModels,
                         PrintedElement(def) + " archives and prints the model of " + PrintedElement(*models.back()) +
                             " in place of its own: write one model that has the fields of both",
                         &def);
  } else if (def.m_reflected && models.size() > 1) {
    parser.WarnOfText(PrintedElement(def) + " lists several models: write one that has the fields of all", def);
  }
}

// What archives an object is the model in the head of its class; a mixin has no part in it.
void CheckArchivedModel(QrexParser& parser, const ClassDef& def) {
  if (!def.m_implementsIPersistable || def.m_inheritsModel || def.IsMixin()) return;
  std::vector<const ClassDef*> models;
  std::set<const ClassDef*> walked;
  CollectModels(def, models, walked);
  if (models.empty()) return;
  parser.WarnOfText(PrintedElement(def) + " does not archive " + PrintedElement(*models.back()) +
                        ", which it lists: put the model into the head, or write Serialise and Deserialise",
                    def);
}

void CheckModelField(QrexParser& parser, const ClassDef& def, const ModelField& field) {
  if (field.m_name == "model") {
    parser.WarnOfText("Model field " + field.m_name + " of " + PrintedElement(def) +
                          " has the name of the function that gives the model: give it another one",
                      def);
  }
  if (const NameSpaceElement* variant = VariantWithoutDefault(field.m_type, *def.owner.rootNameSpace)) {
    parser.WarnOfText("Model field " + field.m_name + " of " + PrintedElement(def) + " begins with no value of " +
                          HowToGiveDefault(*variant),
                      def);
  }
}

// Both would be templates with a parameter of one name.
void CheckEnclosing(QrexParser& parser, const ClassDef& def) {
  if (!def.IsMixin() && !def.m_inheritsModel) return;
  const ClassDef* around = def.m_enclosing;
  while (around && !around->IsMixin()) around = around->m_enclosing;
  if (!around) return;
  parser.WarnOfText(PrintedElement(def) + " can't stand in " + PrintedElement(*around) + ": write it ahead of that",
                    def);
}

// The record of the class makes objects without a value for the field.
void CheckConstFields(QrexParser& parser, const ClassDef& def) {
  if (!def.m_reflected || !def.HasDefaultCtor()) return;
  std::vector<const ClassDef*> holders = {&def};
  holders.insert(holders.end(), def.m_mixins.begin(), def.m_mixins.end());
  for (const ClassDef* holder : holders) {
    if (holder->m_hasConstructor) continue;
    for (const ClassField& field : holder->m_fields) {
      if (field.kind != FieldKind::Plain || !IsConstField(field.type, *holder->owner.rootNameSpace)) continue;
      parser.WarnOfText("Const field " + field.name + " of " + PrintedElement(*holder) +
                            " gets no value: write a constructor, or leave $ out and give the value behind the name",
                        def);
    }
  }
}

// Whether generated text beside the class, or a friend in it, names the class.
bool HasFunctionsBeside(const ClassDef& def) {
  return def.m_reflected || def.HasEmbeddedModel() || def.m_referencedModel || !def.m_methods.empty() ||
         def.m_hasVisitBlock || def.HasSerialise() || def.HasPrint();
}

// A model in the body writes functions that the class needs for other things too.
void CheckBodyModel(QrexParser& parser, const ClassDef& def) {
  if (!def.HasEmbeddedModel() || def.m_inheritsModel || def.IsPureModel()) return;
  const auto warn = [&](std::string_view what, std::string_view function) {
    parser.WarnOfText(PrintedElement(def) + " has both " + std::string(what) +
                          " and a model in its body, and each of them is " + std::string(function) +
                          ": put the model into the head",
                      def);
  };
  const auto isNode = [](const ClassField& field) { return field.kind != FieldKind::Plain; };
  if (def.m_hasVisitBlock) warn("$visit", "VisitObjects");
  if (def.m_hasEvictBlock) {
    warn("$evict", "EvictDgsNodes");
  } else if (!def.m_evictionMembers.empty() || std::any_of(def.m_fields.begin(), def.m_fields.end(), isNode)) {
    warn("nodes", "EvictDgsNodes");
  }
}

void CheckTemplateParameters(QrexParser& parser, const ClassDef& def) {
  const std::string& list = def.m_templateArgList;
  if (list.find('=') == std::string::npos && list.find("...") == std::string::npos) return;
  if (def.m_mixinBaseClass.empty() && !HasFunctionsBeside(def)) return;
  parser.WarnOfText("Template parameters of " + PrintedElement(def) + " can have no defaults and be no packs: leave " +
                        "these out, or write what needs them in a template without $",
                    def);
}

void CheckLocal(QrexParser& parser, const ClassDef& def) {
  if (!parser.inCodeBlock || (!def.IsMixin() && !def.IsTemplate() && !HasFunctionsBeside(def))) return;
  parser.WarnOfText(PrintedElement(def) + " is local to a function, where neither templates nor functions can stand: " +
                        "write it outside of the block",
                    def);
}

}  // namespace

void CheckTextOfClass(QrexParser& parser, const ClassDef& def) {
  if (!parser.WantsCompilableText()) return;
  CheckModels(parser, def);
  CheckEnclosing(parser, def);
  CheckArchivedModel(parser, def);
  CheckConstFields(parser, def);
  CheckTemplateParameters(parser, def);
  CheckLocal(parser, def);
  CheckBodyModel(parser, def);
  for (const ModelField* field : def.m_modelFields) CheckModelField(parser, def, *field);
  if (def.IsAdt() && def.IsTemplate() && !def.m_methods.empty()) {
    parser.WarnOfText(PrintedElement(def) +
                          " is a template with methods: write a $struct template, or an $adt of its own "
                          "for each argument",
                      def);
  }
}

void CheckTextOfMethod(QrexParser& parser, const ClassDef& def, bool isPrivate, const char* position) {
  if (!parser.WantsCompilableText()) return;
  const FunctionSignature& method = def.m_methods.back();
  if (isPrivate) {
    parser.WarnOfText("$ method " + method.name + " of " + PrintedElement(def) +
                          " is called by a function outside of the class: write public: ahead of it, or leave $ out",
                      def, position);
  }
  const bool needsTable = !method.arguments.empty() || !IsVoid(method.returnType);
  const bool isOverload =
      std::any_of(def.m_methods.begin(), def.m_methods.end() - 1, [&](const FunctionSignature& other) {
        return other.name == method.name && (needsTable || !other.arguments.empty() || !IsVoid(other.returnType));
      });
  if (def.m_reflected && isOverload) {
    parser.WarnOfText("$ methods of one name, " + method.name + ", in " + PrintedElement(def) +
                          ", share the tables of their record: give each a name of its own, or leave $ out",
                      def, position);
  }
}

}  // namespace qrex
