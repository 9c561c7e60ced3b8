// $dep and $indep: fields that are nodes of the runtime's dependency graph; $evict and $visit blocks.

#include <algorithm>

#include "translator/class/class_members.h"
#include "translator/class/node_text.h"
#include "translator/emit/annotations.h"
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

// A section becomes the function NAME_WORD of the object.
struct SectionWord {
  std::string_view word;
  Section section;
  std::string_view result;
  enum class Takes { Nothing, Value, Visitor } takes;
  bool onIndep;
};
constexpr SectionWord kSections[] = {
    {"calc", kCalc, "void", SectionWord::Takes::Value, false},
    {"create", kCreate, "void", SectionWord::Takes::Value, true},
    {"destroy", kDestroy, "void", SectionWord::Takes::Value, true},
    {"visit", kVisit, "void", SectionWord::Takes::Visitor, true},
    {"evictable", kEvictable, "bool", SectionWord::Takes::Nothing, true},
    {"evict", kEvict, "void", SectionWord::Takes::Nothing, true},
    {"invalidate", kInvalidate, "void", SectionWord::Takes::Nothing, false},
};
constexpr const SectionWord& kCalcSection = kSections[0];

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

  void WriteSectionHead(const SectionWord& section);
  void WriteDep();
  void WriteIndep();
  void WriteCreation(std::string_view self);
  void WriteDestructor(std::string_view node, std::string_view self);
  void WriteVisiting();
  void WriteRecalculation();
  void WriteIsEvictable();
  void WriteOnEvict();
  void WriteOnInvalidate();
  void WriteDepReaders();

  bool Has(Section section) const { return (m_sections & section) != 0; }

  QrexParser& m_parser;
  TextWriter& m_out;
  ClassDef& m_def;
  const bool m_isIndep;
  std::string m_name;
  std::string m_storage;
  std::string m_stored;  // the storage as the node names it; empty for void
  std::string m_self;    // the line by which a node finds its object from its own place in it
  TypeCode m_type;
  std::string_view m_passing;  // " const&" when not passed by value
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
  m_passing = PassingSuffix(m_type);
  m_isVoid = TypeView(m_type).Op() == kOpVoid;
  if (!m_isVoid) m_stored = "_self->" + m_storage;
  m_self = m_def.name + " const* _self = CONST_ATTRIB_CAST(" + m_def.name + "," + m_name + ");";
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
  WriteSectionHead(kCalcSection);
  Write(m_out, R"(
    {
        $body$
    }
  )",
        "body"_([&] { m_out << body << "\n"; }));
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
  WriteSectionHead(*row);
  m_parser.Advance();
  CopyCodeBlock(m_parser, m_def);
}

// --- Text

void NodeField::WriteSectionHead(const SectionWord& section) {
  auto parameter = [&] {
    if (section.takes == SectionWord::Takes::Visitor) m_out << "vesk::IObjectVisitor& _v";
    if (section.takes != SectionWord::Takes::Value || m_isVoid) return;
    PrintDeclaration(m_out, m_type, m_name, DeclarationMode::Reference);
  };
  Write(m_out, "$result$ $name$_$word$($parameter$) const\n", "result"_ = section.result, "name"_ = m_name,
        "word"_ = section.word, "parameter"_ = parameter);
}

void NodeField::WriteDep() {
  const TypeView type = m_type;
  if (!m_isVoid) {
    WriteAnnotations(m_out, m_def, type, OutputLine::HasText);
    Write(m_out, "mutable $type$ $storage$;\n", "type"_ = type, "storage"_ = m_storage);
  }
  Write(m_out, R"(
    struct Depnode_$name$ : vesk::DGDepNode
    {
        typedef $type$ value_type;
        Depnode_$name$() : vesk::DGDepNode(vesk::DF_SYNC_DEP$hard$)$noCreation$
        $creation$
        $destructor$
        virtual vesk::ssize_t ByteSize() const
        {
            $valueSelf$
            return $additionalSize$;
        }
        virtual vesk::xstring Name() const { return "$class$::$name$"; }
        $visiting$
        $recalculation$
        $isEvictable$
        $onEvict$
        $onInvalidate$
        $readers$
    } $name$;
  )",
        "name"_ = m_name, "class"_ = m_def.name, "type"_ = type,
        "hard"_ = If(m_hard, "|vesk::DF_PROPAGATE_HARD_DIRTINESS"), "noCreation"_ = If(!Has(kCreate), " {}"),
        "creation"_([&] { WriteCreation(m_self); }), "destructor"_([&] { WriteDestructor("Depnode", m_self); }),
        "valueSelf"_ = If(!m_isVoid, m_self),
        "additionalSize"_ = m_isVoid ? "0" : "vesk::CacheValueAdditionalSize(" + m_stored + ")",
        "visiting"_([&] { WriteVisiting(); }), "recalculation"_([&] { WriteRecalculation(); }),
        "isEvictable"_([&] { WriteIsEvictable(); }), "onEvict"_([&] { WriteOnEvict(); }),
        "onInvalidate"_([&] { WriteOnInvalidate(); }), "readers"_([&] { WriteDepReaders(); }));
  if (m_isVoid) return;
  Write(m_out, "$type$$passing$ Get$name$() const { $name$.ReadBarrier(); return $storage$; }\n", "type"_ = type,
        "passing"_ = m_passing, "name"_ = m_name, "storage"_ = m_storage);
}

void NodeField::WriteIndep() {
  const std::string self = m_def.name + "* _self = ATTRIB_CAST(" + m_def.name + "," + m_name + ");";
  WriteAnnotations(m_out, m_def, m_type, OutputLine::HasText);
  Write(m_out, R"(
    $type$ $storage$;
    struct Indepnode_$name$ : vesk::DGIndepNode
    {
        typedef $type$ value_type;
        $constructor$
        $creation$
        $destructor$
        virtual vesk::ssize_t ByteSize() const { return 0; }
        virtual vesk::xstring Name() const { return "$class$::$name$"; }
        $visiting$
        $isEvictable$
        $onEvict$
        value_type$passing$ read() const { ReadBarrier(); return CONST_ATTRIB_CAST($class$,$name$)->$storage$; }
        value_type& write() { OnChange(); return ATTRIB_CAST($class$,$name$)->$storage$; }
        operator value_type$passing$() const { return CONST_ATTRIB_CAST($class$,$name$)->Get$name$(); }
        void operator=(value_type$passing$ _v) { write() = _v; }
    } $name$;
    $type$$passing$ Get$name$() const { $name$.ReadBarrier(); return $storage$; }
    void Set$name$($type$$passing$ _v) { $name$.OnChange(); $storage$ = _v; }
  )",
        "name"_ = m_name, "class"_ = m_def.name, "type"_ = TypeView(m_type), "passing"_ = m_passing,
        "storage"_ = m_storage, "constructor"_ = If(Has(kCreate), "Indepnode_" + m_name + "()"),
        "creation"_([&] { WriteCreation(self); }), "destructor"_([&] { WriteDestructor("Indepnode", self); }),
        "visiting"_([&] { WriteVisiting(); }), "isEvictable"_([&] { WriteIsEvictable(); }),
        "onEvict"_([&] { WriteOnEvict(); }));
}

// --- Members of a node. Those of an $indep are written only where a section follows them.

void NodeField::WriteCreation(std::string_view self) {
  if (!Has(kCreate)) return;
  Write(m_out, R"(
    {
        $self$
        _self->$name$_create($stored$);
    }
  )",
        "self"_ = self, "name"_ = m_name, "stored"_ = m_stored);
}

void NodeField::WriteDestructor(std::string_view node, std::string_view self) {
  if (!Has(kDestroy)) return;
  Write(m_out, R"(
    ~$node$_$name$()
    {
        $self$
        _self->$name$_destroy($stored$);
    }
  )",
        "node"_ = node, "self"_ = self, "name"_ = m_name, "stored"_ = m_stored);
}

// The value, then the object that holds it; or what the section visits.
void NodeField::WriteVisiting() {
  std::string value(If(m_visit && !m_isVoid, "_v << " + m_stored + ";"));
  std::string_view object = m_def.IsMixin() ? "_v << static_cast<const typename BC::FinalClass*>(_self);"
                                            : If(m_def.m_implementsIObject, "_v << _self;");
  if (Has(kVisit)) {
    value = "_self->" + m_name + "_visit(_v);";
    object = {};
  }
  Write(m_out, R"(
    virtual void VisitContainingObject(vesk::IObjectVisitor& _v) const
    {
        $self$
        $value$
        $object$
    }
  )",
        "self"_ = If(!value.empty() || !object.empty(), m_self), "value"_ = value, "object"_ = object);
}

void NodeField::WriteRecalculation() {
  const NodeValue value{m_stored, m_isVoid ? "" : "value_type", m_hard ? "" : "auto"};
  WriteRecalcCache(m_out, value, m_self,
                   [&] { Write(m_out, "_self->$name$_calc($stored$);\n", "name"_ = m_name, "stored"_ = m_stored); });
}

void NodeField::WriteIsEvictable() {
  if (m_isIndep && !Has(kEvictable)) return;
  Write(m_out, R"(
    virtual bool IsEvictable() const
    {
        $self$
        return $isEvictable$;
    }
  )",
        "self"_ = If(Has(kEvictable) || !m_isVoid, m_self),
        "isEvictable"_ = Has(kEvictable) ? "_self->" + m_name + "_evictable()"
                         : m_isVoid      ? "true"
                                         : "vesk::CacheValueIsEvictable(" + m_stored + ")");
}

void NodeField::WriteOnEvict() {
  if (!Has(kEvict) && (m_isIndep || m_isVoid)) return;
  auto clear = [&] {
    Write(m_out, "vesk::OnEvictCacheValue($stored$); vesk::ClearCacheValue($stored$);\n", "stored"_ = m_stored);
  };
  Write(m_out, R"(
    virtual void OnEvict() const
    {
        $self$
        $section$
        $clear$
    }
  )",
        "self"_ = m_self, "section"_ = If(Has(kEvict), "_self->" + m_name + "_evict();"),
        "clear"_ = If(!Has(kEvict), clear));
}

void NodeField::WriteOnInvalidate() {
  if (!Has(kInvalidate)) return;
  Write(m_out, R"(
    virtual void OnInvalidate() const
    {
        $self$
        _self->$name$_invalidate();
    }
  )",
        "self"_ = m_self, "name"_ = m_name);
}

void NodeField::WriteDepReaders() {
  if (m_isVoid) {
    return Write(m_out, R"(
      void read() const { ReadBarrier(); }
      void operator()() const { ReadBarrier(); }
    )");
  }
  Write(m_out, R"(
    value_type$passing$ read() const { return CONST_ATTRIB_CAST($class$,$name$)->Get$name$(); }
    operator value_type$passing$() const { return CONST_ATTRIB_CAST($class$,$name$)->Get$name$(); }
  )",
        "passing"_ = m_passing, "class"_ = m_def.name, "name"_ = m_name);
}

// --- $evict, $visit

bool HasGeneratedBase(const ClassDef& def) {
  return def.IsMixin() || def.IsPureModel() || !def.m_mixins.empty() || !def.m_bases.empty() ||
         def.HasEmbeddedModel() || def.m_referencedModel || def.m_implementsIObject;
}

// What a class that needs registration declares in place is defined in its reflection tail.
bool IsDefinedInTail(const ClassDef& def) { return def.HaveSomethingToRegister() && !def.IsTemplate(); }

void DropBlock(QrexParser& parser) {
  parser.Flush();
  parser.DropBehindCurrent();
  parser.Advance();
}

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
  Write(deferred, R"(
    void $class$::EvictDgsNodes_extra() const
    {
        $content$
    }
  )",
        "class"_ = def.GetQualifiedName(), "content"_([&] { deferred << content << "\n"; }));
  def.m_deferredText += deferred.TakeText();
  DropBlock(parser);
}

void ParseVisit(QrexParser& parser, ClassDef& def) {
  parser.Advance();
  def.m_hasVisitBlock = true;
  const std::string content = ReadBraceContent(parser, def);
  auto define = [&](TextWriter& out, std::string_view scope) {
    Write(out, R"(
      void $scope$VisitObjects(vesk::IObjectVisitor& v) const
      {
          $visitBase$
          $content$
      }
    )",
          "scope"_ = scope, "visitBase"_ = If(HasGeneratedBase(def), "BaseClass::VisitObjects(v);"),
          "content"_([&] { out << content << "\n"; }));
  };
  parser.out << "\n";
  if (IsDefinedInTail(def)) {
    parser.out << "void VisitObjects(vesk::IObjectVisitor& v) const;\n";
    MemoryTextWriter deferred;
    define(deferred, def.GetQualifiedName() + "::");
    def.m_deferredText += deferred.TakeText();
  } else {
    define(parser.out, "");
  }
  DropBlock(parser);
}

}  // namespace qrex
