#include "translator/class/class_head.h"

#include "translator/class/class_emission.h"
#include "translator/class/mixin_list.h"
#include "translator/emit/emit.h"
#include "translator/emit/records.h"
#include "translator/interface/interface_def.h"
#include "translator/model/model.h"
#include "translator/reader/qrex_parser.h"

namespace qrex {

void ParseIsaList(QrexParser& parser, ClassDef& def) {
  do {
    const LexToken entry = parser.current;
    NameSpaceElement& element = parser.ParseQualifiedId();
    if (element.category != Category::Interface) {
      throw LexScannerException("$interface identifier expected when read " + PrintedElement(element), entry);
    }
    auto& interface = static_cast<InterfaceDef&>(element);
    if (interface.status != DeclStatus::Defined) {
      parser.ReportWarning(Warning::IsaUndefined, PrintedElement(interface) + " not defined", nullptr,
                           entry.text.begin);
    }
    if (parser.WarningOn(Warning::IsaNoIObject) && interface.status == DeclStatus::Defined &&
        !interface.SubtypesIObject()) {
      parser.ReportWarning(Warning::IsaNoIObject,
                           "isa on " + PrintedElement(interface) + " doesn't inherit from IObject");
      parser.SeeDeclaration(interface);
    }
    if (parser.WarningOn(Warning::IsaUnreflected) && !interface.m_reflected) {
      parser.ReportWarning(Warning::IsaUnreflected, "isa on " + PrintedElement(interface) + " not reflected");
      parser.SeeDeclaration(interface);
    }
    def.m_interfaces.push_back(&interface);
  } while (parser.Accept(kComma));
}

void ParseBaseList(QrexParser& parser, std::vector<ClassDef*>& bases) {
  do {
    while (parser.Is("private") || parser.Is("public") || parser.Is("protected")) parser.Advance();
    const std::string name = parser.RequireIdentifier("base class identifier");
    bool isQualified = false;
    while (parser.Accept(kColonColon)) {
      isQualified = true;
      parser.RequireIdentifier();
    }
    if (parser.Is(kLess)) {
      parser.SkipAngles("Met EOS before read matching angled bracket");
      parser.Advance();
    } else if (parser.Is(kOpenParen)) {
      parser.SkipToMatching(kOpenParen, kCloseParen, "Met EOS before read matching round bracket");
      parser.Advance();
    } else if (!isQualified) {
      if (auto* base = parser.Root().LookupKind<ClassDef>(name, Category::Class)) bases.push_back(base);
    }
    if (parser.Is(kColon) || parser.Is(kOpenBrace) || parser.Is("mixin") || parser.Is("model")) return;
    if (!parser.Is(kComma)) parser.FailExpected("',' ':' '{' 'model' or 'mixin'");
  } while (parser.Accept(kComma));
}

namespace {

// Parses and writes one head. B, the generated base, grows from the inside out: raw bases or an empty base, the wrapper
// of the runtime, the model mixin, then each entry of the mixin list.
class ClassHead {
 public:
  ClassHead(QrexParser& parser, ClassDef& def, bool isFinal)
      : m_parser(parser), m_out(parser.out), m_def(def), m_isFinal(isFinal) {}

  bool Parse() {
    if (m_parser.Is("mixin") || m_parser.Is("model")) m_parser.FailExpected(":");
    if (m_parser.Accept(kColon)) ReadColon();
    ComposeBase();
    if (m_haveMixinList) {
      m_parser.Advance();
      if (!m_parser.Is(kOpenBracket)) m_parser.FailExpected("[");
      ParseMixinList(m_parser, m_def, m_base);
    }
    if (m_parser.Is(kIdentifier)) m_postMixinText = ReadBases(m_def.m_postMixinBases);
    if (m_colon && m_parser.Accept(kColon)) {
      if (!m_parser.Is(kOpenBracket)) m_parser.FailExpected("[");
      m_parser.ParseMetadataList(m_def.metadata);
    }
    return WriteHead();
  }

 private:
  void ReadColon();
  void ReadModel();
  void CheckReferencedModel(const ClassDef& model);
  void ComposeBase();
  bool WriteHead();
  void WriteBases();

  std::string ReadBases(std::vector<ClassDef*>& bases) {
    const char* begin = m_parser.current.text.begin;
    ParseBaseList(m_parser, bases);
    m_parser.DropTo(m_parser.previous.text.end);
    return std::string(begin, m_parser.previous.text.end);
  }

  QrexParser& m_parser;
  TextWriter& m_out;
  ClassDef& m_def;
  const bool m_isFinal;
  bool m_colon = false;  // a `:` came before the current token
  bool m_haveMixinList = false;
  bool m_forwardWritten = false;
  bool m_folded = false;  // the raw bases went into N__BASE
  bool m_baseIsUsed = false;
  std::string m_rawBases;
  std::string m_postMixinText;
  std::string m_base;
};

void ClassHead::ReadColon() {
  if (m_parser.Is(kOpenBracket)) {
    m_parser.ParseMetadataList(m_def.metadata);
    m_parser.DropTo(m_parser.previous.text.end);
    return;
  }
  if (m_parser.Is(kOpenBrace)) m_parser.Fail("Unexpected { after :");
  m_colon = true;
  if (!m_parser.Is("mixin") && !m_parser.Is("model")) m_rawBases = ReadBases(m_def.m_bases);
  if (m_parser.Is("model")) {
    m_def.m_inheritsModel = true;
    m_parser.Advance();
    ReadModel();
  }
  m_haveMixinList = m_parser.Is("mixin");
}

void ClassHead::ReadModel() {
  if (m_parser.Is(kIdentifier) || m_parser.Is(kColonColon)) {
    NameSpaceElement& element = m_parser.ParseQualifiedId();
    auto* model = element.category == Category::Class ? static_cast<ClassDef*>(&element) : nullptr;
    m_def.m_referencedModel = model;
    if (!model || !model->IsPureModel()) m_parser.Fail("Not a model : " + Printed(m_parser.current));
    CheckReferencedModel(*model);
    WriteModelMixin(m_out, m_def);
    return;
  }
  if (!m_def.IsMixin()) {
    WriteForwardDeclaration(m_out, m_def);
    m_forwardWritten = true;
  }
  ParseModelStruct(m_parser, m_def);
  m_parser.Advance();
  WriteModelMixin(m_out, m_def);
}

// A class that was only declared where the model was read may since have got a model that leads back to itself.
void ClassHead::CheckReferencedModel(const ClassDef& model) {
  size_t reached = 0;
  for (const ModelField* field : model.m_modelFields) {
    if (field->IsDropped()) continue;
    const std::string fault =
        ExpansionFault(field->m_type, *model.owner.rootNameSpace, Expansion::AttributeStructs, &model, &reached);
    if (!fault.empty()) m_parser.Fail("Field " + field->m_name + " : " + fault);
  }
}

void ClassHead::ComposeBase() {
  const std::string& name = m_def.name;
  if (!m_rawBases.empty() && (m_haveMixinList || m_def.m_inheritsModel)) {
    m_folded = true;
    // In text that compiles the raw bases may name the class's own template parameters.
    std::string prefix(If(m_def.IsMixin(), "template <typename BC>"));
    std::string arguments(If(m_def.IsMixin(), "<BC>"));
    if (m_def.WantsCompilableText()) {
      prefix = m_def.TemplatePrefix("");
      arguments = m_def.GetTemplateClassName().substr(name.size());
    }
    Write(m_out, R"(
      $prefix$
      struct $name$__BASE : $base$$bases$ {};
    )",
          "prefix"_ = prefix, "name"_ = name, "base"_ = If(m_def.IsMixin(), "BC,"), "bases"_ = m_rawBases);
    m_base = name + "__BASE" + arguments;
  } else {
    m_base = m_def.IsMixin() ? "BC" : "vesk::EmptyBase";
  }
  if (!m_def.IsMixin()) {
    const std::string arguments = "<" + m_def.GetTemplateClassName() + "," + m_base + ">";
    if (m_def.m_implementsIPersistable) {
      m_base = "vesk::PersistableMixin<vesk::IObjectBaseMixin" + arguments + ">";
    } else if (m_def.m_implementsIObject) {
      m_base = "vesk::IObjectBaseMixin" + arguments;
    } else {
      m_base = "vesk::BaseMixin" + arguments;
    }
  }
  if (m_def.m_inheritsModel) {
    m_base = name + "_model_mixin<" + m_base + (m_def.IsTemplate() ? "," + m_def.m_templateArgNames : "") + ">";
  }
  m_baseIsUsed = m_def.IsMixin() || m_def.m_implementsIPersistable || m_def.m_implementsIObject ||
                 m_def.m_inheritsModel || m_haveMixinList;
}

bool ClassHead::WriteHead() {
  const bool isDefinition = !m_parser.Is(kSemicolon);
  const bool isExternal = m_def.ExternalDefinition();
  bool traitsWritten = false;
  if (isDefinition) {
    m_def.status = DeclStatus::Defined;
    if (m_baseIsUsed) m_def.m_mixinBaseClass = m_base;
  }
  if (!isExternal) {
    if (m_def.WriteTraits() && !m_def.IsAdt() && !m_def.IsMixin() && isDefinition) {
      if (!m_forwardWritten) WriteForwardDeclaration(m_out, m_def);
      WriteTypeTraits(m_out, m_def);
      traitsWritten = true;
    }
    Write(m_out, "$prefix$$struct$$api$$name$$final$$bases$", "prefix"_ = m_def.TemplatePrefix("\n"),
          "struct"_ = m_def.StructWord(), "api"_ = m_def.IsAdt() ? std::string() : ExportPrefix(m_def),
          "name"_ = m_def.name, "final"_ = If(m_isFinal && isDefinition, " final"),
          "bases"_ = If(isDefinition, [&] { WriteBases(); }));
  } else if (isDefinition) {
    m_out << "\n";
    WriteReflectionDeclarations(m_out, m_def);
    m_parser.Flush();
  }
  return traitsWritten;
}

void ClassHead::WriteBases() {
  if (m_baseIsUsed) m_out << " : public " << m_base;
  if (!m_rawBases.empty()) {
    if (!m_folded) m_out << (m_baseIsUsed ? "," : " : ") << m_rawBases;
    m_out << "\n";
  }
  if (!m_postMixinText.empty()) m_out << "," << m_postMixinText;
}

}  // namespace

bool ParseClassHead(QrexParser& parser, ClassDef& def, bool isFinal) { return ClassHead(parser, def, isFinal).Parse(); }

}  // namespace qrex
