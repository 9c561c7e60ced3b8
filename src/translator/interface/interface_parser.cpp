#include "translator/interface/interface_parser.h"

#include <algorithm>
#include <set>

#include "translator/interface/interface_def.h"
#include "translator/interface/interface_emission.h"
#include "translator/model/field_path.h"
#include "translator/model/type_expansion.h"
#include "translator/reader/qrex_parser.h"

namespace qrex {

namespace {

// --- Attributes become accessor methods, by type.

class AttributeExpansion {
 public:
  explicit AttributeExpansion(InterfaceDef& interface)
      : m_methods(interface.m_methods), m_root(*interface.owner.rootNameSpace) {}

  void Expand(const std::string& name, TypeView type, size_t depth, bool readOnly) {
    TypeView resolved = Resolved(type, m_root);
    for (; resolved.Op() == kOpConst; resolved = Resolved(type, m_root)) {
      readOnly = true;
      type = resolved.Inner();
    }
    if (resolved.Op() == kOpClass) {
      ExpandClass(name, resolved, depth, readOnly);
    } else if (resolved.Op() == kOpVector) {
      ExpandVector(name, resolved, depth, readOnly);
    } else {
      AddGetter("Get" + name, type, depth);
      if (!readOnly) AddSetter("Set" + name, depth).push_back(Argument(TypeCode(type.Code()), name));
    }
  }

 private:
  static FunctionArg Argument(TypeCode type, std::string name) {
    FunctionArg argument;
    argument.type = std::move(type);
    argument.name = std::move(name);
    return argument;
  }

  static TypeCode Plain(TypeOp op) {
    TypeCode code;
    AppendOp(code, op);
    return code;
  }
  static TypeCode Int32() { return Plain(kOpInt32); }

  FunctionSignature& Add(std::string name, TypeCode returnType, size_t depth) {
    FunctionSignature& method = m_methods.emplace_back();
    method.name = std::move(name);
    method.returnType = std::move(returnType);
    for (size_t i = 0; i < depth; ++i) method.arguments.push_back(Argument(Int32(), ParameterName(i)));
    return method;
  }

  void AddGetter(std::string name, TypeView type, size_t depth) {
    Add(std::move(name), TypeCode(type.Code()), depth).isConst = true;
  }

  std::vector<FunctionArg>& AddSetter(std::string name, size_t depth) {
    return Add(std::move(name), Plain(kOpVoid), depth).arguments;
  }

  void ExpandClass(const std::string& name, TypeView type, size_t depth, bool readOnly) {
    const auto* element = NamedElement(type, m_root);
    if (!element || element->category != Category::Class) return;
    for (const ModelField* field : static_cast<const ClassDef*>(element)->m_modelFields) {
      if (!field->IsDropped()) Expand(name + field->m_name, field->m_type, depth, readOnly);
    }
  }

  void ExpandVector(const std::string& name, TypeView vector, size_t depth, bool readOnly) {
    const TypeView element = vector.Inner();
    TypeCode reference(vector.Code());
    PrependOp(reference, kOpReference);
    AddGetter("Get" + name + "Size", Int32(), depth);
    if (!readOnly) {
      auto& deleted = AddSetter("DeleteFrom" + name, depth);
      for (const char* argument : {"i1", "i2"}) deleted.push_back(Argument(Int32(), argument));
      auto& extracted = AddSetter("RecordExtractFrom" + name, depth);
      for (const char* argument : {"si1", "si2"}) extracted.push_back(Argument(Int32(), argument));
      extracted.push_back(Argument(reference, "dst"));
      extracted.push_back(Argument(Int32(), "di"));
      auto& inserted = AddSetter("InsertInto" + name, depth);
      inserted.push_back(Argument(Int32(), "di"));
      inserted.push_back(Argument(reference, "src"));
      for (const char* argument : {"si1", "si2"}) inserted.push_back(Argument(Int32(), argument));
    }
    const TypeView resolved = Resolved(element, m_root);
    if (resolved.IsBuiltIn() && resolved.Op() != kOpVoid) {
      AddGetter("Get" + name + "Element", element, depth + 1);
      if (!readOnly) AddSetter("Set" + name + "Element", depth + 1).push_back(Argument(TypeCode(element.Code()), "e"));
    } else {
      Expand(name + "Element", element, depth + 1, readOnly);
    }
  }

  std::vector<FunctionSignature>& m_methods;
  NameSpace& m_root;
};

// --- Reading

class InterfaceStatement {
 public:
  InterfaceStatement(QrexParser& parser, ClassDef* enclosing) : m_parser(parser), m_enclosing(enclosing) {}

  void Parse() {
    ReadModifiers();
    MakeElement();
    if (m_parser.Is(kSemicolon)) return ParseForward();
    if (m_old && m_old->status == DeclStatus::Defined) m_parser.FailRepeated(*m_old, *m_def);
    m_parser.Enter(std::move(m_made), m_enclosing);
    m_parser.CheckPublicHeader(*m_def);
    ReadQualifiers();
    if (m_parser.Accept(kColon)) ReadBases();
    CheckBases();
    m_parser.Expect(kOpenBrace, "{");
    ReadMembers();
    m_def->status = DeclStatus::Defined;
    WriteText();
    if (m_parser.WantsCompilableText()) CheckTextOfMethods();
    m_parser.Advance();
    m_parser.RequireSemicolonAfter(*m_def);
    AddDelegatorMixin();
    m_parser.CheckReferences(*m_def);
    m_parser.CheckMetadata(*m_def);
    m_parser.DropBehindCurrent();
  }

 private:
  void ReadModifiers();
  void MakeElement();
  void ParseForward();
  void ReadQualifiers();
  void ReadBases();
  void CheckBases();
  void ReadMembers();
  void CheckAttribute(const std::string& name, const TypeCode& type);
  void WriteText();
  void CheckTextOfMethods() const;
  void CheckInheritedMethods() const;
  void AddDelegatorMixin();
  void RefuseNested(std::string_view modifier) {
    if (m_enclosing) m_parser.Fail("'" + std::string(modifier) + "' modifier not permitted on nested interface");
  }

  QrexParser& m_parser;
  ClassDef* const m_enclosing;
  bool m_exported = false, m_ipc = false, m_rmi = false;
  InterfaceDef* m_old = nullptr;
  std::unique_ptr<InterfaceDef> m_made;
  InterfaceDef* m_def = nullptr;
};

void InterfaceStatement::ReadModifiers() {
  m_parser.Advance();
  if (m_parser.Is(kPlus)) RefuseNested("+");
  m_exported = m_parser.ParseExportModifier();
  while (m_parser.Is("ipc") || m_parser.Is("rmi")) {
    RefuseNested(m_parser.current.text.View());
    m_ipc = true;
    m_rmi = m_rmi || m_parser.Is("rmi");
    m_parser.Advance();
  }
}

void InterfaceStatement::MakeElement() {
  const std::string name = m_parser.RequireIdentifier();
  if (!m_enclosing) {
    if (NameSpaceElement* found = m_parser.Current().Lookup(name)) {
      if (found->category != Category::Interface) m_parser.FailConflict("interface", name, *found);
      m_old = static_cast<InterfaceDef*>(found);
    }
  }
  m_made = std::make_unique<InterfaceDef>(m_parser.file, m_parser.SourcePosition());
  m_def = m_made.get();
  m_def->name = name;
  m_def->parent = &m_parser.Current();
  m_def->m_nested = m_enclosing != nullptr;
  m_def->SetExported(m_exported);
  m_def->m_isIpc = m_ipc;
  m_def->m_isRmi = m_rmi;
}

void InterfaceStatement::ParseForward() {
  m_parser.out << "struct " << m_def->name << ";\n";
  m_parser.EnterForward(std::move(m_made), m_old, m_enclosing);
  m_parser.Flush();
  m_parser.DropBehindCurrent();
}

void InterfaceStatement::ReadQualifiers() {
  if (!m_parser.Is(kShiftLeft)) return;
  m_parser.ParseQualifiers(*m_def);
  m_parser.CheckRedundant(*m_def);
}

void InterfaceStatement::ReadBases() {
  if (m_parser.Is(kOpenBracket)) {
    m_parser.ParseMetadataList(m_def->metadata);
    if (!m_parser.Accept(kColon)) return;
  }
  do {
    NameSpaceElement& element = m_parser.ParseQualifiedId();
    if (element.category != Category::Interface) {
      m_parser.Fail("Base interface name expected when read " + PrintedElement(element));
    }
    if (&element == m_def) m_parser.Fail(PrintedElement(element) + " can't be its own base");
    m_def->m_bases.push_back(static_cast<InterfaceDef*>(&element));
  } while (m_parser.Accept(kComma));
  if (!m_parser.Is(kOpenBrace)) m_parser.FailExpected(", or {");
}

void InterfaceStatement::CheckBases() {
  constexpr size_t kMaxTables = 10000;
  const auto& bases = m_def->m_bases;
  for (const InterfaceDef* base : bases) m_def->m_numTables += base->m_numTables;
  if (m_def->m_numTables > kMaxTables) m_parser.Fail("Too many base interfaces of " + PrintedElement(*m_def));
  const auto subtypes =
      std::count_if(bases.begin(), bases.end(), [](const auto* base) { return base->SubtypesIObject(); });
  if (m_parser.WarningOn(Warning::InconsistentIObject) && subtypes > 0 &&
      static_cast<size_t>(subtypes) < bases.size()) {
    std::string text = "Inconsistent subtyping of IObject in base interfaces";
    for (const InterfaceDef* base : bases) {
      text += "\n    " + PrintedElement(*base) +
              (base->SubtypesIObject() ? " subtypes IObject" : " doesn't subtype IObject");
    }
    m_parser.ReportWarning(Warning::InconsistentIObject, text);
    for (const InterfaceDef* base : bases) m_parser.SeeDeclaration(*base);
  }
  if (!m_def->m_reflected && m_def->SubtypesIObject()) {
    m_parser.ReportWarning(Warning::IObjectUnreflected,
                           PrintedElement(*m_def) + " subtypes IObject but isn't reflected", m_def);
  }
}

void InterfaceStatement::ReadMembers() {
  while (!m_parser.Is(kCloseBrace)) {
    auto [isAttribute, signature] = m_parser.ParseMethodOrAttribute(
        {.constAllowed = true, .directions = m_def->m_isIpc, .reflected = m_def->m_reflected});
    if (isAttribute) {
      if (m_def->m_isIpc) m_parser.Fail("Attributes currently not supported on IPC interfaces");
      CheckAttribute(signature.name, signature.returnType);
      m_def->m_attributes.push_back({signature.name, signature.returnType});
    } else {
      m_def->m_methods.push_back(std::move(signature));
    }
    m_parser.Expect(kSemicolon, ";");
  }
}

void InterfaceStatement::CheckAttribute(const std::string& name, const TypeCode& type) {
  for (Expansion expansion : {Expansion::Methods, Expansion::AttributeStructs}) {
    const std::string fault = ExpansionFault(type, m_parser.Root(), expansion, nullptr);
    if (!fault.empty()) m_parser.Fail("Attribute " + name + " : " + fault);
  }
}

void InterfaceStatement::WriteText() {
  AttributeExpansion expansion(*m_def);
  for (const AttributeDef& attribute : m_def->m_attributes) expansion.Expand(attribute.name, attribute.type, 0, false);
  WriteInterfaceHandle(m_parser.out, *m_def);
  WriteInterfaceDeclarations(m_parser.out, *m_def);
  if (!m_def->m_nested) WriteTypeTraits(m_parser.out, *m_def);
  m_parser.Flush();
}

void InterfaceStatement::CheckTextOfMethods() const {
  const std::string text = PrintedElement(*m_def);
  std::set<std::string_view> names;
  for (const FunctionSignature& method : m_def->m_methods) {
    if (!names.insert(method.name).second) {
      m_parser.WarnOfText("Methods of one name, " + method.name + ", in " + text +
                              ", share an entry of the function table: give each a name of its own",
                          *m_def);
    }
    for (const FunctionArg& argument : method.arguments) {
      const NameSpaceElement* variant =
          m_def->m_isIpc ? VariantWithoutDefault(argument.type, *m_def->owner.rootNameSpace) : nullptr;
      if (!variant) continue;
      m_parser.WarnOfText("Argument " + argument.name + " of " + method.name + " in " + text +
                              " is read into no value of " + HowToGiveDefault(*variant),
                          *m_def);
    }
  }
  for (const AttributeDef& attribute : m_def->m_attributes) {
    if (!HasConstElements(attribute.type, *m_def->owner.rootNameSpace)) continue;
    m_parser.WarnOfText("Attribute " + attribute.name + " of " + text +
                            " is a container of const elements, which none can hold: leave const out",
                        *m_def);
  }
  CheckInheritedMethods();
  if (!m_def->m_isIpc) return;
  for (const InterfaceDef::FlatBase& flat : m_def->FlattenedBases()) {
    const std::string& name = flat.base->GetQualifiedName();
    if (flat.base->m_methods.empty() || name == "vesk::IObject" || name == "vesk::IPersistable") continue;
    m_parser.WarnOfText("The stub of " + text + " has no methods of " + PrintedElement(*flat.base) +
                            ": declare them in it, and leave the base out",
                        *m_def);
  }
}

// The handle has all methods of its bases.
void InterfaceStatement::CheckInheritedMethods() const {
  const auto isAlike = [](const FunctionSignature& a, const FunctionSignature& b) {
    return a.name == b.name && a.isConst == b.isConst &&
           std::equal(a.arguments.begin(), a.arguments.end(), b.arguments.begin(), b.arguments.end(),
                      [](const FunctionArg& x, const FunctionArg& y) { return x.type == y.type; });
  };
  for (const InterfaceDef::FlatBase& flat : m_def->FlattenedBases()) {
    for (const FunctionSignature& inherited : flat.base->m_methods) {
      for (const FunctionSignature& method : m_def->m_methods) {
        if (!isAlike(inherited, method)) continue;
        m_parser.WarnOfText("Method " + method.name + " of " + PrintedElement(*m_def) + " is there already, from " +
                                PrintedElement(*flat.base) + ": give it a name of its own, or leave it out",
                            *m_def);
      }
    }
  }
}

// So that the mixin list of a class can name it.
void InterfaceStatement::AddDelegatorMixin() {
  auto mixin = std::make_unique<ClassDef>(m_parser.file, m_def->position, ClassKind::Mixin);
  mixin->name = m_def->name + "DelegatorMixin";
  mixin->status = DeclStatus::Defined;
  mixin->m_nested = m_def->m_nested;
  m_parser.Current().Add(std::move(mixin));
}

}  // namespace

void ParseInterface(QrexParser& parser, ClassDef* enclosing) { InterfaceStatement(parser, enclosing).Parse(); }

}  // namespace qrex
