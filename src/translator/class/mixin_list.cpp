#include "translator/class/mixin_list.h"

#include <algorithm>

#include "translator/class/class_body.h"
#include "translator/class/class_emission.h"
#include "translator/emit/emit.h"
#include "translator/interface/interface_def.h"
#include "translator/model/model.h"
#include "translator/reader/qrex_parser.h"

namespace qrex {

namespace {

// Each entry wraps the base: its name, then the base and its own arguments in angle brackets.
class MixinList {
 public:
  MixinList(QrexParser& parser, ClassDef& def, std::string& baseText)
      : m_parser(parser), m_def(def), m_baseText(baseText) {}

  void Parse() {
    m_parser.Advance();
    while (!m_parser.Is(kCloseBracket)) {
      const std::string name = ParseEntry();
      m_baseText = name + "<" + m_baseText + (m_arguments.empty() ? "" : "," + m_arguments) + " >";
    }
    m_parser.Advance();
  }

 private:
  std::string ParseEntry() {
    m_arguments.clear();
    if (m_parser.Is(kOpenBrace)) return ParseAnonymousMixin();
    if (m_parser.Is("model")) return ParseAnonymousModel();
    std::string name = m_parser.Accept(kQuestion) ? ReadUnknown() : ReadKnown();
    if (m_parser.Is(kLess)) {
      const char* begin = m_parser.current.text.end;
      m_parser.SkipAngles("Met EOS before read matching angled bracket");
      m_arguments = std::string(begin, m_parser.current.text.begin);
      m_parser.Advance();
    }
    return name;
  }

  ClassDef& MakeAnonymous(ClassKind kind) {
    auto made = std::make_unique<ClassDef>(m_parser.file, m_parser.SourcePosition(), kind);
    ClassDef& def = *made;
    def.name = m_def.name + "_Mixin_" + std::to_string(m_counter++);
    def.parent = m_def.parent;
    def.m_enclosing = m_def.m_enclosing;
    def.status = DeclStatus::Defined;
    m_def.m_ownedElements.push_back(std::move(made));
    m_def.m_mixins.push_back(&def);
    return def;
  }

  std::string ParseAnonymousMixin() {
    ClassDef& mixin = MakeAnonymous(ClassKind::Mixin);
    TextWriter& out = m_parser.out;
    Write(out, R"(
      template <typename BC>
      struct $name$ : public BC
      {
          typedef BC BaseClass;
          using typename BC::FinalClass;
    )",
          "name"_ = mixin.name);
    m_parser.Flush();
    m_parser.DropBehindCurrent();
    ParseClassBody(m_parser, mixin);
    m_parser.CopyToCurrent();
    m_parser.Advance();
    out << "\n";
    WriteEvictDgsNodes(out, mixin);
    out << "\n};\n\n";
    m_parser.Flush();
    return mixin.name;
  }

  std::string ParseAnonymousModel() {
    const LexToken entry = m_parser.current;
    m_parser.Advance();
    if (!m_parser.Is(kOpenBrace)) {
      throw LexScannerException("Expected { after 'model' when read " + Printed(m_parser.current), entry);
    }
    ClassDef& model = MakeAnonymous(ClassKind::Model);
    model.m_isAnonymous = true;
    model.m_qualifiers.genop = m_def.m_qualifiers.genop;
    ParseModelStruct(m_parser, model);
    m_parser.Advance();
    WriteModelMixin(m_parser.out, model);
    model.name += "_model_mixin";
    return model.name;
  }

  // The text as it is written; the translator knows nothing of it.
  std::string ReadUnknown() {
    const char* begin = m_parser.current.text.begin;
    if (!m_parser.Is(kIdentifier)) m_parser.Fail("Expected mixin name when read " + Printed(m_parser.current));
    m_parser.Advance();
    while (m_parser.Accept(kColonColon)) {
      if (!m_parser.Is(kIdentifier)) {
        m_parser.Fail("Expected identifier after " + std::string(begin, m_parser.previous.text.end) + " when read " +
                      Printed(m_parser.current));
      }
      m_parser.Advance();
    }
    return std::string(begin, m_parser.current.text.begin);
  }

  std::string ReadKnown() {
    const LexToken entry = m_parser.current;
    NameSpaceElement& element = m_parser.ParseQualifiedId();
    if (element.category != Category::Class) {
      throw LexScannerException(PrintedElement(element) + " is not a $class or $struct", entry);
    }
    auto& mixin = static_cast<ClassDef&>(element);
    if (!mixin.IsMixin() && !mixin.IsPureModel()) {
      throw LexScannerException(PrintedElement(element) + " is not a $mixin or $model", entry);
    }
    m_def.m_mixins.push_back(&mixin);
    return mixin.GetQualifiedName() + (mixin.IsPureModel() ? "_model_mixin" : "");
  }

  QrexParser& m_parser;
  ClassDef& m_def;
  std::string& m_baseText;
  std::string m_arguments;
  int m_counter = 0;
};

// --- implementing

void WriteMethod(TextWriter& out, const FunctionSignature& method) {
  Write(out, "$signature$;\n", "signature"_ = method);
}

const std::vector<FunctionSignature>& ReadMethodOwner(QrexParser& parser, ClassDef& def,
                                                      const std::vector<const InterfaceDef*>& implemented,
                                                      const NameSpaceElement*& owner) {
  const LexToken entry = parser.current;
  if (parser.AcceptWord("adt")) {
    NameSpaceElement& element = parser.ParseQualifiedId();
    const bool isAdt = element.category == Category::Class && static_cast<ClassDef&>(element).IsAdt();
    if (!isAdt) throw LexScannerException("$adt identifier expected when read " + PrintedElement(element), entry);
    owner = &element;
    return static_cast<ClassDef&>(element).m_methods;
  }
  NameSpaceElement& element = parser.ParseQualifiedId();
  if (element.category != Category::Interface) {
    throw LexScannerException("$interface identifier expected when read " + PrintedElement(element), entry);
  }
  auto& interface = static_cast<InterfaceDef&>(element);
  if (parser.WarningOn(Warning::ImplementedWithoutIsa) &&
      std::find(implemented.begin(), implemented.end(), &interface) == implemented.end()) {
    parser.ReportWarning(Warning::ImplementedWithoutIsa, PrintedElement(def) + " implementing " +
                                                             PrintedElement(interface) + " without associated 'isa'");
    parser.SeeDeclaration(interface);
  }
  owner = &element;
  return interface.m_methods;
}

}  // namespace

void ParseMixinList(QrexParser& parser, ClassDef& def, std::string& baseText) {
  MixinList(parser, def, baseText).Parse();
}

void ParseAdtBody(QrexParser& parser, ClassDef& adt) {
  parser.Advance();
  for (int64_t depth = 1;;) {
    if (parser.Is(kEndOfText)) parser.Fail("Met EOS before read matching brace");
    if (parser.Is(kOpenBrace)) ++depth;
    if (parser.Is(kCloseBrace)) {
      if (--depth == 0) return;
      parser.Advance();
      continue;
    }
    ParseFieldOrMethod(parser, adt);
    parser.Advance();
  }
}

void ParseImplementing(QrexParser& parser, ClassDef& def) {
  std::vector<const InterfaceDef*> implemented;
  if (parser.WarningOn(Warning::ImplementedWithoutIsa)) implemented = AllInterfaces(def);
  parser.Advance();
  for (;; parser.Advance()) {
    const NameSpaceElement* owner = nullptr;
    const std::vector<FunctionSignature>& methods = ReadMethodOwner(parser, def, implemented, owner);
    if (parser.Is(kMinus)) parser.Fail("- not supported");
    if (parser.Accept(kOpenBrace)) {
      for (; !parser.Is(kCloseBrace); parser.Advance()) {
        if (!parser.Is(kIdentifier)) parser.FailExpected("identifier");
        auto method =
            std::find_if(methods.begin(), methods.end(), [&](const FunctionSignature& m) { return parser.Is(m.name); });
        if (method == methods.end()) {
          parser.Fail(PrintedElement(*owner) + " has no method named " + parser.current.text.Text());
        }
        WriteMethod(parser.out, *method);
      }
      parser.Advance();
    } else {
      for (const FunctionSignature& method : methods) WriteMethod(parser.out, method);
    }
    if (parser.Is(kSemicolon)) break;
    if (!parser.Is(kComma)) parser.FailExpected(", or ;");
  }
  parser.Flush();
  parser.DropBehindCurrent();
}

}  // namespace qrex
