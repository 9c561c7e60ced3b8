// The class of a variant, and the operations behind it that switch on the tag.

#include <functional>

#include "translator/emit/emit.h"
#include "translator/kinds/variant_def.h"

namespace qrex {

namespace {

// `prefix`: the variant and "::" in the out-of-class form.
void WriteStruct(TextWriter& out, const VariantDef& def, const VariantItem& item, const std::string& prefix) {
  const std::string& name = item.name;
  out << "struct " << prefix << name << "\n";
  Block body(out, ";");
  out << "enum { tag=" << item.tag << " };\n";
  out << name << "() {}\n";
  out << name << "(";
  WriteJoined(out, item.fields, ",", [&](const ClassField& field) {
    WriteText(out, "$0 const& $1_", {TypeText(field.type), field.name});
  });
  out << ") : ";
  WriteJoined(out, item.fields, ",", [&](const ClassField& field) { WriteText(out, "$0($0_)", {field.name}); });
  out << " {}\n";
  out << "bool operator==(" << name << " const& _rhs) const { return true";
  for (const ClassField& field : item.fields) WriteText(out, " && $0 == _rhs.$0", {field.name});
  out << "; }\n";
  out << "bool operator<(" << name << " const& _rhs) const { return ";
  if (item.fields.empty()) {
    out << "true; }\n";
  } else {
    for (const ClassField& field : item.fields) {
      const bool isLast = &field == &item.fields.back();
      WriteText(out, isLast ? "($0 < _rhs.$0" : "($0 < _rhs.$0 || $0 == _rhs.$0 &&\n", {field.name});
    }
    out << std::string(item.fields.size(), ')') << "; }\n";
  }
  if (def.WritesToStream()) {
    out << "void Write(vesk::xostream& _os) const { _os << \"" << name << "(\"";
    WriteJoined(out, item.fields, " << ','", [&](const ClassField& field) { out << " << " << field.name; });
    out << " << ')'; }\n";
  }
  if (def.HasSerialise()) {
    out << "template<typename Archive> void Serialise(Archive& _ar) const { _ar";
    for (const ClassField& field : item.fields) out << " << " << field.name;
    out << "; }\n";
    out << "template<typename Archive> void Deserialise(Archive& _ar) { _ar";
    for (const ClassField& field : item.fields) out << " >> " << field.name;
    out << "; }\n";
  }
  out << "typedef " << name << " Value;\n";
  for (const ClassField& field : item.fields) {
    PrintDeclaration(out, field.type, field.name, DeclarationMode::Plain);
    out << ";\n";
  }
}

void WriteItemType(TextWriter& out, const VariantDef& def, const VariantItem& item) {
  if (item.isStruct) {
    if (item.onHeap) {
      out << "struct " << item.name << ";\n";
    } else {
      WriteStruct(out, def, item, "");
    }
  } else if (item.IsNamed()) {
    out << "struct " << item.name << "\n";
    Block body(out, ";");
    out << "enum { tag=" << item.tag << " };\n";
    out << "typedef " << item.typeText << " Value;\n";
    if (!item.isVoid) out << item.name << "(const Value& _v) : value(_v) {}\nValue value;\n";
  }
}

void WriteConstructor(TextWriter& out, const VariantDef& def, const VariantItem& item) {
  const std::string& name = item.EffectiveName();
  out << def.name << (item.IsNamed() || !item.isVoid ? "(" + name + " const& _rhs)" : "()");
  if (item.isStruct && item.onHeap) {
    out << ";\n";
    return;
  }
  out << "\n";
  Block body(out);
  out << "_tag = " << item.tag << ";\n";
  if (item.isVoid) return;
  WriteText(out, item.onHeap ? "*($0**)_data = new $0(_rhs);\n" : "new (_data) $0(_rhs);\n", {name});
}

void WriteAccess(TextWriter& out, const VariantItem& item) {
  const std::string& name = item.EffectiveName();
  if (item.onHeap) {
    const std::string value = item.IsNamed() && !item.isStruct ? name + "::Value" : name;
    WriteText(out,
              "$1 const& as($0*) const { vxAssert((is<$0 >())); return ** ($1 const**) _data; }\n"
              "$1& as($0*) { vxAssert((is<$0 >())); return ** ($1**) _data; }\n",
              {name, value});
  } else if (!item.IsNamed() && !item.isVoid) {
    WriteText(out,
              "$0 const& as($0*) const { vxAssert((is<$0 >())); return *($0 const*) _data; }\n"
              "$0& as($0*) { vxAssert((is<$0 >())); return *($0*) _data; }\n",
              {name});
  }
}

}  // namespace

void WriteVariantBody(TextWriter& out, const VariantDef& def) {
  const bool allVoid = def.AllVoid();
  for (const auto& item : def.m_items) WriteItemType(out, def, *item);
  out << "template<typename T> struct _mapvalue_ { enum { tag=T::tag }; typedef typename T::Value Value; };\n";
  for (const auto& item : def.m_items) WriteConstructor(out, def, *item);
  WriteText(out,
            "$0($0 const& _rhs);\n"
            "~$0();\n"
            "$0& operator=($0 const& _rhs)\n"
            "{\n"
            "    if (this != &_rhs) { this->~$0(); new (this) $0(_rhs); }\n"
            "    return *this;\n"
            "}\n"
            "void VisitObjects(vesk::IObjectVisitor&) const;\n"
            "void VisitPrefs(vesk::IPrefVisitor&) const;\n"
            "vesk::int32 GetTag() const { return _tag; }\n"
            "bool operator==($0 const& _rhs) const;\n"
            "bool operator!=($0 const& _rhs) const { return !operator==(_rhs); }\n"
            "bool operator<($0 const& _rhs) const;\n"
            "template<typename T> bool is() const { return is((T*)0); }\n",
            {def.name});
  if (!allVoid) {
    out << "template<typename T> const typename _mapvalue_<T>::Value& as() const { return as((T*)0); }\n"
           "template<typename T> typename _mapvalue_<T>::Value& as() { return as((T*)0); }\n";
  }
  if (def.WritesToStream()) out << "void Write(vesk::xostream&) const;\n";
  if (def.HasSerialise()) {
    out << "template<typename Archive> void Serialise(Archive&) const;\n"
           "template<typename Archive> void Deserialise(Archive&);\n";
  }
  out << "private:\n";
  if (!allVoid) {
    out << "template<typename T> typename T::Value const& as(T*) const { vxAssert(is<T>()); return *(typename T::Value "
           "const*)_data; }\n"
           "template<typename T> typename T::Value& as(T*) { vxAssert(is<T>()); return *(typename T::Value*)_data; }\n";
    for (const auto& item : def.m_items) WriteAccess(out, *item);
  }
  for (const auto& item : def.m_items) {
    out << "bool is(" << item->EffectiveName() << "*) const { return _tag == " << item->tag << "; }\n";
  }
  out << "vesk::int32 _tag;\n";
  if (allVoid) return;
  out << "vesk::octet_t _data[VESK_MAX" << def.m_items.size() << "(";
  WriteJoined(out, def.m_items, ",", [&](const auto& item) {
    out << (item->onHeap ? "sizeof(void*)" : item->isVoid ? "0" : "sizeof(" + item->EffectiveName() + ")");
  });
  out << ")];\n";
}

// --- Behind the class

namespace {

class VariantTail {
 public:
  VariantTail(TextWriter& out, const VariantDef& def)
      : m_out(out), m_def(def), m_name(def.name), m_allVoid(def.AllVoid()) {
    ComposeDestructorCases();
  }

  void Write() {
    WriteMapValues();
    WriteOperators();
    WriteHeapStructs();
    WriteCopyConstructor();
    WriteDestructor();
    WriteComparisons();
    if (m_def.WritesToStream()) WriteStreamWrite();
    WriteVisit("Objects", "IObjectVisitor", NeedsVisitObjects);
    WriteVisit("Prefs", "IPrefVisitor", NeedsVisitPrefs);
    if (m_def.HasSerialise()) WriteArchives();
  }

 private:
  // switch(_tag) over the items; `writeCase` writes what follows "case N : ".
  void WriteSwitch(const std::function<std::string(const VariantItem&)>& composeCase, std::string_view last = {}) {
    m_out << "switch(_tag)\n";
    Block cases(m_out);
    for (const auto& item : m_def.m_items) {
      const std::string text = composeCase(*item);
      if (!text.empty()) m_out << "case " << item->tag << " : " << text << "\n";
    }
    m_out << last;
  }

  static std::string As(const VariantItem& item, const std::string& object = {}) {
    return object + "as<" + item.EffectiveName() + " >()";
  }

  void WriteMapValues() {
    for (const auto& item : m_def.m_items) {
      if (item->IsNamed()) continue;
      WriteText(m_out, "template <> struct $0::_mapvalue_<$1 > { enum { tag=$2 }; typedef $1 Value; };\n",
                {m_name, item->typeText, std::to_string(item->tag)});
    }
  }

  void WriteOperators() {
    WriteText(m_out,
              "inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,$0 const& _x) "
              "{ _x.VisitObjects(_v); return _v; }\n"
              "inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,$0 const*) { return _v; }\n"
              "inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,$0 const& _x) "
              "{ _x.VisitPrefs(_v); return _v; }\n",
              {m_name});
    if (m_def.WritesToStream()) {
      WriteText(m_out,
                "inline vesk::xostream& operator<<(vesk::xostream& _os,$0 const& _x) { _x.Write(_os); return _os; }\n",
                {m_name});
    }
    if (m_def.m_reflected) {
      const std::string api = ExportPrefix(m_def);
      WriteText(m_out,
                "$0vesk::ReflectedVariant const& _GetReflected($1 const*);\n"
                "$0vesk::TypeOps const& _GetTypeOps($1 const*);\n",
                {api, m_name});
    }
    if (m_def.HasSerialise()) {
      WriteText(m_out,
                "template<typename Archive> inline void Serialise(Archive& _ar,$0 const& _x) { _x.Serialise(_ar); }\n"
                "template<typename Archive> inline void Deserialise(Archive& _ar,$0 & _x) { _x.Deserialise(_ar); }\n",
                {m_name});
    }
  }

  void WriteHeapStructs() {
    for (const auto& item : m_def.m_items) {
      if (item->isStruct && item->onHeap) WriteStruct(m_out, m_def, *item, m_name + "::");
    }
    for (const auto& item : m_def.m_items) {
      if (!item->isStruct || !item->onHeap) continue;
      m_out << "inline " << m_name << "::" << m_name << "(" << item->name << " const& _x)\n";
      Block body(m_out);
      WriteText(m_out, "_tag = $0;\n*($1**)_data = new $1(_x);\n", {std::to_string(item->tag), item->name});
    }
  }

  void WriteCopyConstructor() {
    WriteText(m_out, "inline $0::$0($0 const& _rhs)\n", {m_name});
    Block body(m_out);
    m_out << "_tag = _rhs._tag;\n";
    if (m_allVoid) return;
    WriteSwitch([](const VariantItem& item) {
      if (item.isVoid) return std::string();
      const std::string& name = item.EffectiveName();
      return (item.onHeap ? "*(" + name + "**)_data = new " : std::string("new (_data) ")) + name + "(" +
             As(item, "_rhs.") + "); break;";
    });
  }

  void ComposeDestructorCases() {
    for (const auto& item : m_def.m_items) {
      const std::string& name = item->EffectiveName();
      std::string text;
      if (item->onHeap) {
        text = "delete *(" + name + "**)_data;";
      } else if (item->isStruct) {
        text = "(*(" + name + "**)_data)->~" + name + "();";
      } else if (const std::string destructor = QualifiedDestructorText(item->type); !destructor.empty()) {
        text = As(*item) + "." + destructor + "();";
      }
      m_destructorCases.push_back(text.empty() ? text : text + " break;");
      m_hasDestructorCase = m_hasDestructorCase || !text.empty();
    }
  }

  void WriteDestructor() {
    WriteText(m_out, "inline $0::~$0()\n", {m_name});
    Block body(m_out);
    if (m_hasDestructorCase) WriteSwitch([this](const VariantItem& item) { return m_destructorCases[item.tag]; });
  }

  void WriteComparisons() {
    auto compare = [this](std::string_view op) {
      WriteSwitch([op](const VariantItem& item) {
        if (item.isVoid) return std::string();
        return "return " + As(item) + std::string(op) + As(item, "_rhs.") + ";";
      });
    };
    WriteText(m_out, "inline bool $0::operator==($0 const& _rhs) const\n", {m_name});
    {
      Block body(m_out);
      m_out << "if (_tag != _rhs._tag) return false;\n";
      if (!m_allVoid) compare(" == ");
      m_out << "return true;\n";
    }
    WriteText(m_out, "inline bool $0::operator<($0 const& _rhs) const\n", {m_name});
    Block body(m_out);
    m_out << "if (_tag < _rhs._tag) return true;\nif (_tag > _rhs._tag) return false;\n";
    if (!m_allVoid) compare(" < ");
    m_out << "return false;\n";
  }

  void WriteStreamWrite() {
    m_out << "inline void " << m_name << "::Write(vesk::xostream& _os) const\n";
    Block body(m_out);
    WriteSwitch(
        [](const VariantItem& item) {
          const std::string& name = item.EffectiveName();
          if (item.isStruct) return As(item) + ".Write(_os); break;";
          if (item.isVoid) return "_os << \"" + name + "\"; break;";
          if (item.IsNamed()) return "_os << \"" + name + "(\" << " + As(item) + " << ')'; break;";
          return "_os << " + As(item) + "; break;";
        },
        "default: vxAssert(0);\n");
  }

  void WriteVisit(std::string_view what, std::string_view visitor, bool (*test)(TypeView, NameSpace&)) {
    WriteText(m_out, "inline void $0::Visit$1(vesk::$2& _v) const\n", {m_name, what, visitor});
    Block body(m_out);
    bool any = false;
    for (const auto& item : m_def.m_items) any = any || m_def.ItemVisits(*item, test);
    if (!any) return;
    WriteSwitch([&](const VariantItem& item) {
      return m_def.ItemVisits(item, test) ? "_v << " + As(item) + "; break;" : std::string();
    });
  }

  void WriteArchives() {
    m_out << "template<typename Archive> inline void " << m_name << "::Serialise(Archive& _ar) const\n";
    {
      Block body(m_out);
      m_out << "vesk::SerialiseVariableLengthUint(_ar,_tag);\n";
      if (!m_allVoid) {
        WriteSwitch([](const VariantItem& item) {
          if (item.isStruct) return As(item) + ".Serialise(_ar); break;";
          return item.isVoid ? std::string() : "_ar << " + As(item) + "; break;";
        });
      }
    }
    m_out << "template<typename Archive> inline void " << m_name << "::Deserialise(Archive& _ar)\n";
    Block body(m_out);
    if (m_hasDestructorCase) m_out << "this->~" << m_name << "();\n";
    m_out << "vesk::DeserialiseVariableLengthUint(_ar,_tag);\n";
    if (m_allVoid) return;
    WriteSwitch([](const VariantItem& item) {
      if (item.isVoid) return std::string();
      const std::string& type = item.isStruct ? item.name : item.typeText;
      return (item.onHeap ? "*(" + type + "**)_data = new " : std::string("new (_data) ")) + type + "(); " +
             (item.isStruct ? As(item) + ".Deserialise(_ar); break;" : "_ar >> " + As(item) + "; break;");
    });
  }

  TextWriter& m_out;
  const VariantDef& m_def;
  const std::string& m_name;
  const bool m_allVoid;
  std::vector<std::string> m_destructorCases;
  bool m_hasDestructorCase = false;
};

}  // namespace

void WriteVariantTail(TextWriter& out, const VariantDef& def) { VariantTail(out, def).Write(); }

// --- Record

void VariantDef::WriteReflectedDefinition(TextWriter& out) {
  out << ExportPrefix(*this) << "vesk::ReflectedVariant const& _GetReflected(" << name << " const*)\n";
  {
    Block body(out);
    StringTable strings;
    if (!metadata.empty()) WriteMetadataByteCode(out, name + "_metadata", strings, metadata);
    for (const auto& item : m_items) {
      if (item->isStruct) {
        out << "// todo : byte code for anonymous struct\n";
      } else {
        WriteTypeByteCode(out, name + "_" + item->MangledTagName(), strings, item->type);
      }
    }
    out << "static const vesk::ReflectedField " << name << "_fields[] =\n";
    {
      Block rows(out, ";");
      for (const auto& item : m_items) {
        out << "{ \"" << item->EffectiveName() << "\", 4, "
            << (item->isStruct ? "NULL" : name + "_" + item->MangledTagName()) << " },\n";
      }
    }
    WriteStringTable(out, strings, name);
    out << "static const vesk::ReflectedVariant " << name << "_variant =\n";
    {
      Block record(out, ";");
      out << "\"" << GetQualifiedName() << "\",\nsizeof(" << name << "),\n";
      out << NameOrZero(!metadata.empty(), name + "_metadata") << ",\n";
      out << CountedName(m_items.size(), name + "_fields") << ",\n";
      out << NameOrZero(!strings.Empty(), name + "_stringTable") << ",\n";
      Block ops(out);
      WriteTypeOps(out, name, TypeOpsBits());
    }
    out << "return " << name << "_variant;\n";
  }
  out << ExportPrefix(*this) << "vesk::TypeOps const& _GetTypeOps(" << name << " const*)\n";
  Block body(out);
  out << "return vesk::GetReflectedVariant<" << name << ">().m_ops;\n";
}

}  // namespace qrex
