// The class of a variant, and the operations behind it that switch on the tag.

#include <algorithm>

#include "translator/emit/emit.h"
#include "translator/kinds/variant_def.h"
#include "translator/kinds/variant_members.h"
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

bool IsInClass(const VariantDef& def) { return def.MemberPlacement() == Placement::InClass; }

// Of member templates: the parameter of a class around the variant must not be named alike.
std::string_view ParameterOf(const VariantDef& def) { return IsInClass(def) ? "_T" : "T"; }

// What is behind the class where that is not nested in another one: there it can be used as if it were complete.
bool IsDefinedBehind(const VariantDef& def, const VariantItem& item) {
  return item.isStruct && item.onHeap && !IsInClass(def);
}

void WriteItemType(TextWriter& out, const VariantDef& def, const VariantItem& item) {
  if (IsDefinedBehind(def, item)) {
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

void WriteConstructor(TextWriter& out, const VariantDef& def, const VariantItem& item) {
  const std::string& name = item.EffectiveName();
  if (IsDefinedBehind(def, item)) {
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
      template<typename $T$> const typename _mapvalue_<$T$>::Value& as() const { return as(($T$*)0); }
      template<typename $T$> typename _mapvalue_<$T$>::Value& as() { return as(($T$*)0); }
    )",
          "T"_ = ParameterOf(def));
  }
  if (IsInClass(def)) return;
  if (def.WritesToStream()) out << "void Write(vesk::xostream&) const;\n";
  if (def.HasSerialise()) {
    Write(out, R"(
      template<typename Archive> void Serialise(Archive&) const;
      template<typename Archive> void Deserialise(Archive&);
    )");
  }
}

// What `as` answers for the types of items without a name. In a class only a part of the parameters can be specialised.
void WriteMapValues(TextWriter& out, const VariantDef& def) {
  const bool inClass = IsInClass(def);
  for (const auto& item : def.m_items) {
    if (item->IsNamed()) continue;
    Write(out, R"(
      template <$parameter$> struct $scope$_mapvalue_<$type$ $argument$> { enum { tag=$tag$ }; typedef $type$ Value; };
    )",
          "parameter"_ = If(inClass, "typename _Any"),
          "scope"_ = inClass ? "" : def.name + "::", "type"_ = item->typeText, "argument"_ = If(inClass, ",_Any"),
          "tag"_ = item->tag);
  }
}

void WriteAccesses(TextWriter& out, const VariantDef& def) {
  if (def.AllVoid()) return;
  Write(out, R"(
    template<typename $T$> typename $T$::Value const& as($T$*) const { vxAssert(is<$T$>()); return *(typename $T$::Value const*)_data; }
    template<typename $T$> typename $T$::Value& as($T$*) { vxAssert(is<$T$>()); return *(typename $T$::Value*)_data; }
  )",
        "T"_ = ParameterOf(def));
  for (const auto& item : def.m_items) WriteAccess(out, *item);
}

void WriteAssignment(TextWriter& out, const VariantDef& def) {
  if (!MakesValueFirst(def)) {
    Write(out, R"(
      $name$& operator=($name$ const& _rhs)
      {
          if (this != &_rhs) { this->~$name$(); new (this) $name$(_rhs); }
          return *this;
      }
    )",
          "name"_ = def.name);
    return;
  }
  Write(out, R"(
    $name$& operator=($name$ const& _rhs)
    {
        if (this != &_rhs) { $name$ _value(_rhs); this->~$name$(); new (this) $name$(std::move(_value)); }
        return *this;
    }
    $name$& operator=($name$&& _rhs) noexcept($noexcept$)
    {
        if (this != &_rhs) { $name$ _value(std::move(_rhs)); this->~$name$(); new (this) $name$(std::move(_value)); }
        return *this;
    }
  )",
        "name"_ = def.name, "noexcept"_ = NoexceptText(def));
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
  const bool inClass = IsInClass(def);
  // What is defined behind the class.
  auto declared = [&](const std::string& text) { return inClass ? std::string() : text; };
  const bool makesFirst = MakesValueFirst(def);
  const std::string moving =
      makesFirst ? def.name + "(" + def.name + "&& _rhs) noexcept(" + NoexceptText(def) + ");\n" : "";
  const bool declaresReading = makesFirst && def.HasSerialise() && !inClass;
  auto writeItemType = [&](const auto& item) { WriteItemType(out, def, *item); };
  auto writeConstructor = [&](const auto& item) { WriteConstructor(out, def, *item); };
  auto writeTest = [&](const auto& item) {
    Write(out, "bool is($name$*) const { return _tag == $tag$; }\n", "name"_ = item->EffectiveName(),
          "tag"_ = item->tag);
  };
  Write(out, R"(
    $itemTypes$
    template<typename $T$$any$> struct _mapvalue_ { enum { tag=$T$::tag }; typedef typename $T$::Value Value; };
    $mapValues$
    $constructors$
    $copying$
    $assignment$
    $visiting$
    vesk::int32 GetTag() const { return _tag; }
    $equal$
    bool operator!=($name$ const& _rhs) const { return !operator==(_rhs); }
    $less$
    template<typename $T$> bool is() const { return is(($T$*)0); }
    $operations$
    $members$
    private:
    $accesses$
    $tests$
    $ofTag$
    vesk::int32 _tag;
    $data$
  )",
        "name"_ = def.name, "itemTypes"_ = Each(out, def.m_items, "", writeItemType), "T"_ = ParameterOf(def),
        "any"_ = If(inClass, ",typename=void"), "mapValues"_ = If(inClass, [&] { WriteMapValues(out, def); }),
        "constructors"_ = Each(out, def.m_items, "", writeConstructor),
        "copying"_ = declared(def.name + "(" + def.name + " const& _rhs);\n" + moving + "~" + def.name + "();"),
        "assignment"_([&] { WriteAssignment(out, def); }),
        "visiting"_ =
            declared("void VisitObjects(vesk::IObjectVisitor&) const;\nvoid VisitPrefs(vesk::IPrefVisitor&) const;"),
        "equal"_ = declared("bool operator==(" + def.name + " const& _rhs) const;"),
        "less"_ = declared("bool operator<(" + def.name + " const& _rhs) const;"),
        "members"_ = If(inClass, [&] { WriteVariantMembers(out, def); }),
        "operations"_([&] { WriteOperationDeclarations(out, def); }), "accesses"_([&] { WriteAccesses(out, def); }),
        "tests"_ = Each(out, def.m_items, "", writeTest),
        "ofTag"_ = declaresReading ? def.name + "(vesk::int32 _new,vesk::NullInterface);" : "",
        "data"_([&] { WriteData(out, def); }));
}

// --- Behind the class

namespace {

// Through which others use the variant: streams, archives, visitors and the reflection of the runtime.
void WriteFunctions(TextWriter& out, const VariantDef& def) {
  const bool isNested = IsInClass(def);
  const std::string_view friendWord = If(isNested, "friend ");  // else they were members of the enclosing class
  Write(out, R"(
    $friend$inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,$name$ const& _x) { _x.VisitObjects(_v); return _v; }
    $friend$inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,$name$ const*) { return _v; }
    $friend$inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,$name$ const& _x) { _x.VisitPrefs(_v); return _v; }
  )",
        "friend"_ = friendWord, "name"_ = def.name);
  if (def.WritesToStream()) {
    Write(out, R"(
      $friend$inline vesk::xostream& operator<<(vesk::xostream& _os,$name$ const& _x) { _x.Write(_os); return _os; }
    )",
          "friend"_ = friendWord, "name"_ = def.name);
  }
  if (def.m_reflected && !isNested) {
    Write(out, R"(
      $api$vesk::ReflectedVariant const& _GetReflected($name$ const*);
      $api$vesk::TypeOps const& _GetTypeOps($name$ const*);
    )",
          "api"_ = ExportPrefix(def), "name"_ = def.name);
  }
  if (def.HasSerialise()) {
    Write(out, R"(
      template<typename Archive> $friend$inline void Serialise(Archive& _ar,$name$ const& _x) { _x.Serialise(_ar); }
      template<typename Archive> $friend$inline void Deserialise(Archive& _ar,$name$ & _x) { _x.Deserialise(_ar); }
    )",
          "friend"_ = friendWord, "name"_ = def.name);
  }
}

void WriteHeapStructs(TextWriter& out, const VariantDef& def) {
  auto isHeapStruct = [](const auto& item) { return item->isStruct && item->onHeap; };
  for (const auto& item : def.m_items) {
    if (isHeapStruct(item)) WriteStruct(out, def, *item, def.name + "::");
  }
  for (const auto& item : def.m_items) {
    if (!isHeapStruct(item)) continue;
    Write(out, R"(
      inline $variant$::$variant$($name$ const& _x)
      {
          _tag = $tag$;
          $construction$(_x);
      }
    )",
          "variant"_ = def.name, "name"_ = item->name, "tag"_ = item->tag,
          "construction"_ = ConstructionText(*item, item->name));
  }
}

}  // namespace

void WriteVariantTail(TextWriter& out, const VariantDef& def) {
  const bool isNested = IsInClass(def);
  if (!isNested) WriteMapValues(out, def);
  WriteFunctions(out, def);
  if (isNested) return;
  WriteHeapStructs(out, def);
  WriteVariantMembers(out, def);
}

}  // namespace qrex
