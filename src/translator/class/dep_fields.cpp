// $dep and $indep: fields that are nodes of the runtime's dependency graph; $evict and $visit blocks.

#include <algorithm>

#include "translator/class/class_members.h"
#include "translator/emit/emit.h"
#include "translator/reader/code_block.h"
#include "translator/reader/qrex_parser.h"

namespace qrex {

namespace {

enum Section : unsigned {
  kEvictable = 1,
  kCalc = 2,
  kCreate = 4,
  kDestroy = 8,
  kEvict = 16,
  kInvalidate = 32,
  kVisit = 64,
};

struct SectionWord {
  std::string_view word;
  Section section;
  std::string_view head;  // $0 the field, $1 its parameter
  bool onIndep;
};
constexpr SectionWord kSections[] = {
    {"calc", kCalc, "void $0_calc($1) const\n", false},
    {"create", kCreate, "void $0_create($1) const\n", true},
    {"destroy", kDestroy, "void $0_destroy($1) const\n", true},
    {"visit", kVisit, "void $0_visit(vesk::IObjectVisitor& _v) const\n", true},
    {"evictable", kEvictable, "bool $0_evictable() const\n", true},
    {"evict", kEvict, "void $0_evict() const\n", true},
    {"invalidate", kInvalidate, "void $0_invalidate() const\n", false},
};

// One declaration, from its keyword to its `;`, and the text that it becomes.
class NodeField {
 public:
  NodeField(QrexParser& parser, ClassDef& def, bool isIndep)
      : m_parser(parser), m_out(parser.out), m_def(def), m_isIndep(isIndep) {}

  void Parse() {
    ReadHead();
    if (!m_isIndep && m_parser.Accept(kAssign)) {
      ReadShortForm();
    } else {
      ReadSections();
    }
    if (m_isIndep) {
      WriteIndep();
    } else {
      WriteDep();
    }
    m_parser.Flush();
    m_parser.DropBehindCurrent();
  }

 private:
  void ReadHead();
  void ReadVisitQualifier();
  void ReadShortForm();
  void ReadSections();
  void ReadSection();

  void WriteDep();
  void WriteDepMethods();
  void WriteEviction();
  void WriteIndep();
  void WriteVisitContainingObject();

  bool Has(Section section) const { return (m_sections & section) != 0; }
  std::string Declaration(const std::string& name, DeclarationMode mode = DeclarationMode::Plain) const {
    MemoryTextWriter text;
    PrintDeclaration(text, m_type, name, mode);
    return text.TakeText();
  }
  std::string Parameter() const { return m_isVoid ? "" : Declaration(m_name, DeclarationMode::Reference); }
  std::string SelfStorage() const { return m_isVoid ? "" : "_self->" + m_storage; }
  std::string ConstSelf() const {
    return m_def.name + " const* _self = CONST_ATTRIB_CAST(" + m_def.name + "," + m_name + ");\n";
  }
  std::string Self() const { return m_def.name + "* _self = ATTRIB_CAST(" + m_def.name + "," + m_name + ");\n"; }
  // A member function of the node that begins by finding the object.
  void WriteMethod(const std::string& heading, const std::string& body) {
    m_out << heading << "\n";
    Block block(m_out);
    m_out << body;
  }

  QrexParser& m_parser;
  TextWriter& m_out;
  ClassDef& m_def;
  const bool m_isIndep;
  std::string m_name;
  std::string m_storage;
  TypeCode m_type;
  bool m_isVoid = false;
  bool m_hard = false;
  bool m_visit = true;
  unsigned m_sections = 0;
};

void NodeField::ReadHead() {
  const NodeHead head = ReadNodeHead(m_parser, m_def);
  if (head.hard && m_isIndep) throw LexScannerException("^ not permitted on $indep", m_parser.previous);
  if (m_parser.Accept(kShiftLeft)) ReadVisitQualifier();
  std::optional<ParsedType> parsed = m_parser.ParseTypeWithName(Naming::Required, head.reflected);
  if (!parsed) m_parser.Fail(m_isIndep ? "Syntax error" : "Type expected when read " + Printed(m_parser.current));
  m_name = std::move(parsed->name);
  m_type = std::move(parsed->type);
  m_storage = "_" + m_name + "_";
  m_isVoid = TypeView(m_type).Op() == kOpVoid;
  if (m_isVoid && m_isIndep) m_parser.Fail("void not permitted on $indep");
  m_hard = head.hard || m_isVoid;
  const bool repeats =
      std::any_of(m_def.m_fields.begin(), m_def.m_fields.end(), [&](const auto& f) { return f.name == m_name; }) ||
      std::any_of(m_def.m_modelFields.begin(), m_def.m_modelFields.end(),
                  [&](const ModelField* f) { return f->m_name == m_name; });
  if (repeats) m_parser.Fail("Redefinition of field " + m_name);
  m_def.m_fields.push_back({m_name, m_type, m_isIndep ? FieldKind::Indep : FieldKind::Dep, head.reflected});
}

void NodeField::ReadVisitQualifier() {
  for (; !m_parser.Accept(kShiftRight); m_parser.Advance()) {
    const bool on = !m_parser.Accept(kMinus);
    if (!m_parser.Is("visit")) {
      m_parser.Fail("Unrecognised qualifier << " + Printed(m_parser.current) + " >> on $cache");
    }
    m_visit = on;
  }
}

void NodeField::ReadShortForm() {
  const std::string body = ReadShortBody(m_parser, m_def, m_name);
  m_sections |= kCalc;
  m_out << "void " << m_name << "_calc(" << Parameter() << ") const\n";
  Block block(m_out);
  m_out << body << "\n";
}

void NodeField::ReadSections() {
  while (!m_parser.Is(kSemicolon)) ReadSection();
  if (!m_isIndep && !Has(kCalc)) m_parser.Fail("calc section not specified");
}

void NodeField::ReadSection() {
  const auto* row = std::find_if(std::begin(kSections), std::end(kSections),
                                 [&](const SectionWord& candidate) { return m_parser.Is(candidate.word); });
  if (row == std::end(kSections)) {
    m_parser.FailExpected(m_isIndep ? "'create','destroy' or 'visit'"
                                    : "'evictable','evict','create','destroy','invalidate','visit' or 'calc'");
  }
  const std::string quoted = "'" + std::string(row->word) + "'";
  if (m_isIndep && !row->onIndep) m_parser.Fail(quoted + " can't be specified on $indep");
  if (Has(row->section)) m_parser.Fail(quoted + " already specified");
  m_sections |= row->section;
  WriteText(m_out, row->head, {m_name, Parameter()});
  m_parser.Advance();
  CopyCodeBlock(m_parser, m_def);
}

// --- Text

void NodeField::WriteDep() {
  const std::string node = "Depnode_" + m_name;
  const std::string_view passing = PassingSuffix(m_type);
  if (!m_isVoid) m_out << "mutable " << Declaration(m_storage) << ";\n";
  m_out << "struct " << node << " : vesk::DGDepNode\n";
  {
    Block block(m_out, " " + m_name + ";");
    m_out << "typedef " << Declaration("value_type") << ";\n";
    m_out << node << "() : vesk::DGDepNode(vesk::DF_SYNC_DEP" << (m_hard ? "|vesk::DF_PROPAGATE_HARD_DIRTINESS)" : ")");
    if (Has(kCreate)) {
      WriteMethod("", ConstSelf() + "_self->" + m_name + "_create(" + SelfStorage() + ");\n");
    } else {
      m_out << " {}\n";
    }
    if (Has(kDestroy)) {
      WriteMethod("~" + node + "()", ConstSelf() + "_self->" + m_name + "_destroy(" + SelfStorage() + ");\n");
    }
    WriteMethod(
        "virtual vesk::ssize_t ByteSize() const",
        m_isVoid ? "return 0;\n" : ConstSelf() + "return vesk::CacheValueAdditionalSize(" + SelfStorage() + ");\n");
    WriteText(m_out, "virtual vesk::xstring Name() const { return \"$0::$1\"; }\n", {m_def.name, m_name});
    WriteVisitContainingObject();
    WriteDepMethods();
    if (m_isVoid) {
      m_out << "void read() const { ReadBarrier(); }\nvoid operator()() const { ReadBarrier(); }\n";
    } else {
      WriteText(m_out,
                "value_type$0 read() const { return CONST_ATTRIB_CAST($1,$2)->Get$2(); }\n"
                "operator value_type$0() const { return CONST_ATTRIB_CAST($1,$2)->Get$2(); }\n",
                {passing, m_def.name, m_name});
    }
  }
  if (m_isVoid) return;
  WriteText(m_out, "$0$1 Get$2() const { $2.ReadBarrier(); return $3; }\n",
            {TypeText(m_type), passing, m_name, m_storage});
}

void NodeField::WriteDepMethods() {
  std::string recalc = ConstSelf();
  if (!m_hard) recalc += "auto _prev = " + SelfStorage() + ";\n";
  recalc += "_self->" + m_name + "_calc(" + SelfStorage() + ");\n";
  if (!m_isVoid) recalc += "if (vesk::TypeHasAdditionalSize<value_type>()) UpdateByteSize();\n";
  recalc += m_hard ? "return true;\n" : "return _prev != " + SelfStorage() + ";\n";
  WriteMethod("virtual bool RecalcCache() const", recalc);
  WriteMethod("virtual bool IsEvictable() const",
              Has(kEvictable) ? ConstSelf() + "return _self->" + m_name + "_evictable();\n"
              : m_isVoid      ? std::string("return true;\n")
                              : ConstSelf() + "return vesk::CacheValueIsEvictable(" + SelfStorage() + ");\n");
  WriteEviction();
  if (Has(kInvalidate)) {
    WriteMethod("virtual void OnInvalidate() const", ConstSelf() + "_self->" + m_name + "_invalidate();\n");
  }
}

void NodeField::WriteEviction() {
  if (!Has(kEvict) && m_isVoid) return;
  WriteMethod("virtual void OnEvict() const",
              ConstSelf() + (Has(kEvict) ? "_self->" + m_name + "_evict();\n"
                                         : "vesk::OnEvictCacheValue(" + SelfStorage() + "); vesk::ClearCacheValue(" +
                                               SelfStorage() + ");\n"));
}

void NodeField::WriteVisitContainingObject() {
  std::string body;
  if (Has(kVisit)) {
    body = "_self->" + m_name + "_visit(_v);\n";
  } else {
    if (m_visit && !m_isVoid) body += "_v << " + SelfStorage() + ";\n";
    if (m_def.IsMixin()) {
      body += "_v << static_cast<const typename BC::FinalClass*>(_self);\n";
    } else if (m_def.m_implementsIObject) {
      body += "_v << _self;\n";
    }
  }
  WriteMethod("virtual void VisitContainingObject(vesk::IObjectVisitor& _v) const",
              body.empty() ? body : ConstSelf() + body);
}

void NodeField::WriteIndep() {
  const std::string node = "Indepnode_" + m_name;
  const std::string_view passing = PassingSuffix(m_type);
  m_out << Declaration(m_storage) << ";\n";
  m_out << "struct " << node << " : vesk::DGIndepNode\n";
  {
    Block block(m_out, " " + m_name + ";");
    m_out << "typedef " << Declaration("value_type") << ";\n";
    if (Has(kCreate)) WriteMethod(node + "()", Self() + "_self->" + m_name + "_create(" + SelfStorage() + ");\n");
    if (Has(kDestroy)) {
      WriteMethod("~" + node + "()", Self() + "_self->" + m_name + "_destroy(" + SelfStorage() + ");\n");
    }
    m_out << "virtual vesk::ssize_t ByteSize() const { return 0; }\n";
    WriteText(m_out, "virtual vesk::xstring Name() const { return \"$0::$1\"; }\n", {m_def.name, m_name});
    WriteVisitContainingObject();
    if (Has(kEvictable)) {
      WriteMethod("virtual bool IsEvictable() const", ConstSelf() + "return _self->" + m_name + "_evictable();\n");
    }
    if (Has(kEvict)) WriteMethod("virtual void OnEvict() const", ConstSelf() + "_self->" + m_name + "_evict();\n");
    WriteText(m_out,
              "value_type$0 read() const { ReadBarrier(); return CONST_ATTRIB_CAST($1,$2)->$3; }\n"
              "value_type& write() { OnChange(); return ATTRIB_CAST($1,$2)->$3; }\n"
              "operator value_type$0() const { return CONST_ATTRIB_CAST($1,$2)->Get$2(); }\n"
              "void operator=(value_type$0 _v) { write() = _v; }\n",
              {passing, m_def.name, m_name, m_storage});
  }
  WriteText(m_out,
            "$0$1 Get$2() const { $2.ReadBarrier(); return $3; }\n"
            "void Set$2($0$1 _v) { $2.OnChange(); $3 = _v; }\n",
            {TypeText(m_type), passing, m_name, m_storage});
}

// --- $evict, $visit

bool HasGeneratedBase(const ClassDef& def) {
  return def.IsMixin() || def.IsPureModel() || !def.m_mixins.empty() || !def.m_bases.empty() ||
         def.HasEmbeddedModel() || def.m_referencedModel || def.m_implementsIObject;
}

// What a class that needs registration declares in place is defined in its reflection tail.
bool IsDefinedInTail(const ClassDef& def) { return def.HaveSomethingToRegister() && !def.IsTemplate(); }

}  // namespace

void ParseDep(QrexParser& parser, ClassDef& def) { NodeField(parser, def, false).Parse(); }
void ParseIndep(QrexParser& parser, ClassDef& def) { NodeField(parser, def, true).Parse(); }

void ParseEvict(QrexParser& parser, ClassDef& def) {
  parser.Advance();
  def.m_hasEvictBlock = true;
  if (!IsDefinedInTail(def)) {
    parser.out << "void EvictDgsNodes_extra() const\n";
    return CopyCodeBlock(parser, def);
  }
  const std::string content = ReadBraceContent(parser, def);
  parser.out << "void EvictDgsNodes_extra() const;\n";
  MemoryTextWriter deferred;
  deferred << "void " << def.GetQualifiedName() << "::EvictDgsNodes_extra() const\n";
  {
    Block body(deferred);
    deferred << content << "\n";
  }
  def.m_deferredText += deferred.TakeText();
  parser.Flush();
  parser.DropBehindCurrent();
  parser.Advance();
}

void ParseVisit(QrexParser& parser, ClassDef& def) {
  parser.Advance();
  def.m_hasVisitBlock = true;
  const bool isDeferred = IsDefinedInTail(def);
  const std::string content = ReadBraceContent(parser, def);
  MemoryTextWriter text;
  text << "void " << (isDeferred ? def.GetQualifiedName() + "::" : "")
       << "VisitObjects(vesk::IObjectVisitor& v) const\n";
  {
    Block body(text);
    if (HasGeneratedBase(def)) text << "BaseClass::VisitObjects(v);\n";
    text << content << "\n";
  }
  if (isDeferred) {
    parser.out << "\nvoid VisitObjects(vesk::IObjectVisitor& v) const;\n";
    def.m_deferredText += text.TakeText();
  } else {
    parser.out << "\n" << text.TakeText();
  }
  parser.Flush();
  parser.DropBehindCurrent();
  parser.Advance();
}

}  // namespace qrex
