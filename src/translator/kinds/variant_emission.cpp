// The class of a variant, and the operations behind it that switch on the tag.

#include <algorithm>

#include "translator/emit/emit.h"
#include "translator/kinds/variant_def.h"
#include "translator/symbols/scanned_file.h"

namespace qrex {

namespace {

// --- The struct of an item { ... } name

// By the first field that differs.
std::string LessText(const std::vector<ClassField>& fields) {
  if (fields.empty()) return "true";
  std::string text;
  for (const ClassField& field : fields) {
    text += "(" + field.name + " < _rhs." + field.name;
    if (&field != &fields.back()) text += " || " + field.name + " == _rhs." + field.name + " &&\n";
  }
  return text + std::string(fields.size(), ')');
}

void WriteStreamWrite(TextWriter& out, const VariantItem& item) {
  auto writeField = [&](const ClassField& field) { out << " << " << field.name; };
  Write(out, R"(
    void Write(vesk::xostream& _os) const { _os << "$name$("$fields$ << ')'; }
  )",
        "name"_ = item.name, "fields"_ = Each(out, item.fields, " << ','", writeField));
}

void WriteArchives(TextWriter& out, const VariantItem& item, bool isEmpty) {
  auto writeOut = [&](const ClassField& field) { out << " << " << field.name; };
  auto writeIn = [&](const ClassField& field) { out << " >> " << field.name; };
  Write(out, R"(
    template<typename Archive> void Serialise(Archive& _ar) const { $archive$$out$; }
    template<typename Archive> void Deserialise(Archive& _ar) { $archive$$in$; }
  )",
        "archive"_ = isEmpty ? "(void)_ar" : "_ar", "out"_ = Each(out, item.fields, "", writeOut),
        "in"_ = Each(out, item.fields, "", writeIn));
}

// `scope`: the variant and "::" in the out-of-class form.
void WriteStruct(TextWriter& out, const VariantDef& def, const VariantItem& item, std::string_view scope) {
  const bool isEmpty = item.fields.empty() && def.WantsCompilableText();  // all its values are equal
  auto writeParameter = [&](const ClassField& field) {
    Write(out, "$type$ const& $name$_", "type"_ = TypeView(field.type), "name"_ = field.name);
  };
  auto writeInitialiser = [&](const ClassField& field) { Write(out, "$name$($name$_)", "name"_ = field.name); };
  auto writeMemberwise = [&] {
    Write(out, "$name$($parameters$) : $initialisers$ {}\n", "name"_ = item.name,
          "parameters"_ = Each(out, item.fields, ",", writeParameter),
          "initialisers"_ = Each(out, item.fields, ",", writeInitialiser));
  };
  auto writeEquality = [&](const ClassField& field) { Write(out, " && $name$ == _rhs.$name$", "name"_ = field.name); };
  auto writeField = [&](const ClassField& field) {
    PrintDeclaration(out, field.type, field.name, DeclarationMode::Plain);
    out << ";\n";
  };
  auto writeOperations = [&] {
    if (def.WritesToStream()) WriteStreamWrite(out, item);
    if (def.HasSerialise()) WriteArchives(out, item, isEmpty);
  };
  Write(out, R"(
    struct $scope$$name$
    {
        enum { tag=$tag$ };
        $name$() {}
        $memberwise$
        bool operator==($name$ const& _rhs) const { return true$equalities$; }
        bool operator<($name$ const& _rhs) const { return $less$; }
        $operations$
        typedef $name$ Value;
        $fields$
    };
  )",
        "scope"_ = scope, "name"_ = item.name, "tag"_ = item.tag, "memberwise"_ = If(!isEmpty, writeMemberwise),
        "equalities"_ = Each(out, item.fields, "", writeEquality), "less"_ = isEmpty ? "false" : LessText(item.fields),
        "operations"_ = writeOperations, "fields"_ = Each(out, item.fields, "", writeField));
}

// --- The class

void WriteItemType(TextWriter& out, const VariantDef& def, const VariantItem& item) {
  if (item.isStruct && item.onHeap) {
    out << "struct " << item.name << ";\n";
  } else if (item.isStruct) {
    WriteStruct(out, def, item, "");
  } else if (item.IsNamed()) {
    auto writeValue = [&] {
      if (item.isVoid) return;
      Write(out, R"(
        $name$(const Value& _v) : value(_v) {}
        Value value;
      )",
            "name"_ = item.name);
    };
    Write(out, R"(
      struct $name$
      {
          enum { tag=$tag$ };
          typedef $type$ Value;
          $value$
      };
    )",
          "name"_ = item.name, "tag"_ = item.tag, "type"_ = item.typeText, "value"_ = writeValue);
  }
}

// Without its arguments.
std::string ConstructionText(const VariantItem& item, const std::string& type) {
  return (item.onHeap ? "*(" + type + "**)_data = new " : "new (_data) ") + type;
}

void WriteConstructor(TextWriter& out, const VariantDef& def, const VariantItem& item) {
  const std::string& name = item.EffectiveName();
  if (item.isStruct && item.onHeap) {
    Write(out, "$variant$($name$ const& _rhs);\n", "variant"_ = def.name, "name"_ = name);
    return;
  }
  Write(out, R"(
    $variant$($parameter$)
    {
        _tag = $tag$;
        $construction$
    }
  )",
        "variant"_ = def.name, "parameter"_ = item.isVoid && !item.IsNamed() ? "" : name + " const& _rhs",
        "tag"_ = item.tag, "construction"_ = item.isVoid ? "" : ConstructionText(item, name) + "(_rhs);");
}

void WriteAccess(TextWriter& out, const VariantItem& item) {
  const std::string& name = item.EffectiveName();
  if (item.onHeap) {
    Write(out, R"(
      $value$ const& as($name$*) const { vxAssert((is<$name$ >())); return ** ($value$ const**) _data; }
      $value$& as($name$*) { vxAssert((is<$name$ >())); return ** ($value$**) _data; }
    )",
          "name"_ = name, "value"_ = item.IsNamed() && !item.isStruct ? name + "::Value" : name);
  } else if (!item.IsNamed() && !item.isVoid) {
    Write(out, R"(
      $name$ const& as($name$*) const { vxAssert((is<$name$ >())); return *($name$ const*) _data; }
      $name$& as($name$*) { vxAssert((is<$name$ >())); return *($name$*) _data; }
    )",
          "name"_ = name);
  }
}

void WriteOperationDeclarations(TextWriter& out, const VariantDef& def) {
  if (!def.AllVoid()) {
    Write(out, R"(
      template<typename T> const typename _mapvalue_<T>::Value& as() const { return as((T*)0); }
      template<typename T> typename _mapvalue_<T>::Value& as() { return as((T*)0); }
    )");
  }
  if (def.WritesToStream()) out << "void Write(vesk::xostream&) const;\n";
  if (def.HasSerialise()) {
    Write(out, R"(
      template<typename Archive> void Serialise(Archive&) const;
      template<typename Archive> void Deserialise(Archive&);
    )");
  }
}

void WriteAccesses(TextWriter& out, const VariantDef& def) {
  if (def.AllVoid()) return;
  Write(out, R"(
    template<typename T> typename T::Value const& as(T*) const { vxAssert(is<T>()); return *(typename T::Value const*)_data; }
    template<typename T> typename T::Value& as(T*) { vxAssert(is<T>()); return *(typename T::Value*)_data; }
  )");
  for (const auto& item : def.m_items) WriteAccess(out, *item);
}

void WriteData(TextWriter& out, const VariantDef& def) {
  if (def.AllVoid()) return;
  auto writeSize = [&](const std::unique_ptr<VariantItem>& item) {
    out << (item->onHeap ? "sizeof(void*)" : item->isVoid ? "0" : "sizeof(" + item->EffectiveName() + ")");
  };
  Write(out, "vesk::octet_t _data[VESK_MAX$count$($sizes$)];\n", "count"_ = def.m_items.size(),
        "sizes"_ = Each(out, def.m_items, ",", writeSize));
}

}  // namespace

void WriteVariantBody(TextWriter& out, const VariantDef& def) {
  auto writeItemType = [&](const auto& item) { WriteItemType(out, def, *item); };
  auto writeConstructor = [&](const auto& item) { WriteConstructor(out, def, *item); };
  auto writeTest = [&](const auto& item) {
    Write(out, "bool is($name$*) const { return _tag == $tag$; }\n", "name"_ = item->EffectiveName(),
          "tag"_ = item->tag);
  };
  Write(
      out, R"(
    $itemTypes$
    template<typename T> struct _mapvalue_ { enum { tag=T::tag }; typedef typename T::Value Value; };
    $constructors$
    $name$($name$ const& _rhs);
    ~$name$();
    $name$& operator=($name$ const& _rhs)
    {
        if (this != &_rhs) { this->~$name$(); new (this) $name$(_rhs); }
        return *this;
    }
    void VisitObjects(vesk::IObjectVisitor&) const;
    void VisitPrefs(vesk::IPrefVisitor&) const;
    vesk::int32 GetTag() const { return _tag; }
    bool operator==($name$ const& _rhs) const;
    bool operator!=($name$ const& _rhs) const { return !operator==(_rhs); }
    bool operator<($name$ const& _rhs) const;
    template<typename T> bool is() const { return is((T*)0); }
    $operations$
    private:
    $accesses$
    $tests$
    vesk::int32 _tag;
    $data$
  )",
      "name"_ = def.name, "itemTypes"_ = Each(out, def.m_items, "", writeItemType),
      "constructors"_ = Each(out, def.m_items, "", writeConstructor),
      "operations"_ = [&] { WriteOperationDeclarations(out, def); }, "accesses"_ = [&] { WriteAccesses(out, def); },
      "tests"_ = Each(out, def.m_items, "", writeTest), "data"_ = [&] { WriteData(out, def); });
}

// --- Behind the class

namespace {

enum class Operation { Copy, Destroy, Equal, Less, Print, VisitObjects, VisitPrefs, Serialise, Deserialise };

// Under compilableText. An enumeration has no destructor, and C++ may name a scalar in several words or a typedef.
std::string NamedDestructionText(const VariantDef& def, const VariantItem& item, const std::string& value) {
  const TypeView type = WithoutDecorators(item.type, *def.owner.rootNameSpace).type;
  if (type.IsScalar() || type.Op() == kOpEnum || type.Op() == kOpPointer) return {};
  return "{ typedef " + item.typeText + " _Item; " + value + ".~_Item(); }";
}

std::string DestructionText(const VariantDef& def, const VariantItem& item, const std::string& value) {
  const std::string& name = item.EffectiveName();
  const bool compilable = def.WantsCompilableText();
  if (item.onHeap) return "delete *(" + name + "**)_data;";
  if (item.isStruct) return compilable ? value + ".~" + name + "();" : "(*(" + name + "**)_data)->~" + name + "();";
  if (compilable && TypeView(item.type).WithoutMetadata().IsNamed()) return NamedDestructionText(def, item, value);
  const std::string destructor = QualifiedDestructorText(item.type);
  return destructor.empty() ? "" : value + "." + destructor + "();";
}

std::string PrintText(const VariantItem& item, const std::string& value) {
  const std::string& name = item.EffectiveName();
  if (item.isStruct) return value + ".Write(_os);";
  if (item.isVoid) return "_os << \"" + name + "\";";
  if (item.IsNamed()) return "_os << \"" + name + "(\" << " + value + " << ')';";
  return "_os << " + value + ";";
}

// What an operation does with an item; empty for nothing.
std::string StatementOf(Operation operation, const VariantDef& def, const VariantItem& item) {
  const std::string& name = item.EffectiveName();
  const std::string value = "as<" + name + " >()";
  switch (operation) {
    case Operation::Copy:
      return item.isVoid ? "" : ConstructionText(item, name) + "(_rhs." + value + ");";
    case Operation::Destroy:
      return DestructionText(def, item, value);
    case Operation::Equal:
      return item.isVoid ? "" : "return " + value + " == _rhs." + value + ";";
    case Operation::Less:
      return item.isVoid ? "" : "return " + value + " < _rhs." + value + ";";
    case Operation::Print:
      return PrintText(item, value);
    case Operation::VisitObjects:
      return def.ItemVisits(item, NeedsVisitObjects) ? "_v << " + value + ";" : "";
    case Operation::VisitPrefs:
      return def.ItemVisits(item, NeedsVisitPrefs) ? "_v << " + value + ";" : "";
    case Operation::Serialise:
      return item.isStruct ? value + ".Serialise(_ar);" : item.isVoid ? "" : "_ar << " + value + ";";
    case Operation::Deserialise:
      if (item.isVoid) return {};
      return ConstructionText(item, item.isStruct ? name : item.typeText) + "(); " +
             (item.isStruct ? value + ".Deserialise(_ar);" : "_ar >> " + value + ";");
  }
  return {};
}

class VariantTail {
 public:
  VariantTail(TextWriter& out, const VariantDef& def) : m_out(out), m_def(def), m_name(def.name) {}

  void WriteAll() {
    WriteMapValues();
    WriteFunctions();
    WriteHeapStructs();
    WriteCopying();
    WriteComparisons();
    if (m_def.WritesToStream()) WriteStreamWrite();
    WriteVisits();
    if (m_def.HasSerialise()) WriteArchives();
  }

 private:
  // A case for each item with which the operation has something to do; nothing without such an item.
  void WriteSwitch(Operation operation) {
    const bool returns = operation == Operation::Equal || operation == Operation::Less;
    std::string cases;
    for (const auto& item : m_def.m_items) {
      const std::string statement = StatementOf(operation, m_def, *item);
      if (statement.empty()) continue;
      if (!cases.empty()) cases += "\n";
      cases += "case " + std::to_string(item->tag) + " : " + statement + (returns ? "" : " break;");
    }
    if (cases.empty()) return;
    Write(m_out, R"(
      switch(_tag)
      {
          $cases$
          $default$
      }
    )",
          "cases"_ = cases, "default"_ = operation == Operation::Print ? "default: vxAssert(0);" : "");
  }
  auto Switch(Operation operation) {
    return [this, operation] { WriteSwitch(operation); };
  }

  void WriteMapValues() {
    for (const auto& item : m_def.m_items) {
      if (item->IsNamed()) continue;
      Write(m_out, R"(
        template <> struct $name$::_mapvalue_<$type$ > { enum { tag=$tag$ }; typedef $type$ Value; };
      )",
            "name"_ = m_name, "type"_ = item->typeText, "tag"_ = item->tag);
    }
  }

  // Through which others use the variant: streams, archives, visitors and the reflection of the runtime.
  void WriteFunctions() {
    Write(m_out, R"(
      inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,$name$ const& _x) { _x.VisitObjects(_v); return _v; }
      inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,$name$ const*) { return _v; }
      inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,$name$ const& _x) { _x.VisitPrefs(_v); return _v; }
    )",
          "name"_ = m_name);
    if (m_def.WritesToStream()) {
      Write(m_out, R"(
        inline vesk::xostream& operator<<(vesk::xostream& _os,$name$ const& _x) { _x.Write(_os); return _os; }
      )",
            "name"_ = m_name);
    }
    if (m_def.m_reflected) {
      Write(m_out, R"(
        $api$vesk::ReflectedVariant const& _GetReflected($name$ const*);
        $api$vesk::TypeOps const& _GetTypeOps($name$ const*);
      )",
            "api"_ = ExportPrefix(m_def), "name"_ = m_name);
    }
    if (m_def.HasSerialise()) {
      Write(m_out, R"(
        template<typename Archive> inline void Serialise(Archive& _ar,$name$ const& _x) { _x.Serialise(_ar); }
        template<typename Archive> inline void Deserialise(Archive& _ar,$name$ & _x) { _x.Deserialise(_ar); }
      )",
            "name"_ = m_name);
    }
  }

  void WriteHeapStructs() {
    auto isHeapStruct = [](const auto& item) { return item->isStruct && item->onHeap; };
    for (const auto& item : m_def.m_items) {
      if (isHeapStruct(item)) WriteStruct(m_out, m_def, *item, m_name + "::");
    }
    for (const auto& item : m_def.m_items) {
      if (!isHeapStruct(item)) continue;
      Write(m_out, R"(
        inline $variant$::$variant$($name$ const& _x)
        {
            _tag = $tag$;
            $construction$(_x);
        }
      )",
            "variant"_ = m_name, "name"_ = item->name, "tag"_ = item->tag,
            "construction"_ = ConstructionText(*item, item->name));
    }
  }

  void WriteCopying() {
    Write(m_out, R"(
      inline $name$::$name$($name$ const& _rhs)
      {
          _tag = _rhs._tag;
          $copy$
      }
      inline $name$::~$name$()
      {
          $destroy$
      }
    )",
          "name"_ = m_name, "copy"_ = Switch(Operation::Copy), "destroy"_ = Switch(Operation::Destroy));
  }

  void WriteComparisons() {
    Write(m_out, R"(
      inline bool $name$::operator==($name$ const& _rhs) const
      {
          if (_tag != _rhs._tag) return false;
          $equal$
          return true;
      }
      inline bool $name$::operator<($name$ const& _rhs) const
      {
          if (_tag < _rhs._tag) return true;
          if (_tag > _rhs._tag) return false;
          $less$
          return false;
      }
    )",
          "name"_ = m_name, "equal"_ = Switch(Operation::Equal), "less"_ = Switch(Operation::Less));
  }

  void WriteStreamWrite() {
    Write(m_out, R"(
      inline void $name$::Write(vesk::xostream& _os) const
      {
          $print$
      }
    )",
          "name"_ = m_name, "print"_ = Switch(Operation::Print));
  }

  void WriteVisits() {
    Write(m_out, R"(
      inline void $name$::VisitObjects(vesk::IObjectVisitor& _v) const
      {
          $visitObjects$
      }
      inline void $name$::VisitPrefs(vesk::IPrefVisitor& _v) const
      {
          $visitPrefs$
      }
    )",
          "name"_ = m_name, "visitObjects"_ = Switch(Operation::VisitObjects),
          "visitPrefs"_ = Switch(Operation::VisitPrefs));
  }

  void WriteArchives() {
    const bool destroys = std::any_of(m_def.m_items.begin(), m_def.m_items.end(), [this](const auto& item) {
      return !StatementOf(Operation::Destroy, m_def, *item).empty();
    });
    Write(m_out, R"(
      template<typename Archive> inline void $name$::Serialise(Archive& _ar) const
      {
          vesk::SerialiseVariableLengthUint(_ar,_tag);
          $serialise$
      }
      template<typename Archive> inline void $name$::Deserialise(Archive& _ar)
      {
          $destruction$
          vesk::DeserialiseVariableLengthUint(_ar,_tag);
          $deserialise$
      }
    )",
          "name"_ = m_name, "serialise"_ = Switch(Operation::Serialise),
          "destruction"_ = destroys ? "this->~" + m_name + "();" : "", "deserialise"_ = Switch(Operation::Deserialise));
  }

  TextWriter& m_out;
  const VariantDef& m_def;
  const std::string& m_name;
};

}  // namespace

void WriteVariantTail(TextWriter& out, const VariantDef& def) { VariantTail(out, def).WriteAll(); }

}  // namespace qrex
