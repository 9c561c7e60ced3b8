#include "translator/kinds/variant_members.h"

#include <algorithm>

#include "translator/emit/emit.h"
#include "translator/symbols/scanned_file.h"

namespace qrex {

std::string ConstructionText(const VariantItem& item, const std::string& type) {
  return (item.onHeap ? "*(" + type + "**)_data = new " : "new (_data) ") + type;
}

namespace {

// As its value is made and destroyed: not the struct that a name stands for, which copies.
const std::string& ValueTypeText(const VariantItem& item) { return item.isStruct ? item.name : item.typeText; }

}  // namespace

bool MakesValueFirst(const VariantDef& def) { return def.WantsCompilableText() && !def.AllVoid(); }

std::string NoexceptText(const VariantDef& def) {
  std::string text;
  for (const auto& item : def.m_items) {
    if (item->isVoid || item->onHeap) continue;
    text += (text.empty() ? "" : " && ") + ("std::is_nothrow_move_constructible<" + ValueTypeText(*item)) + " >::value";
  }
  return text.empty() ? "true" : text;
}

namespace {

enum class Operation {
  Copy,
  Move,
  Make,
  Destroy,
  Equal,
  Less,
  Print,
  VisitObjects,
  VisitPrefs,
  Serialise,
  Deserialise,  // into the memory of the variant
  Read          // into a new variant
};

// An enumeration has no destructor, and C++ may name a scalar in several ways: a name of the type's own serves for all.
std::string CompilableDestructionText(const VariantDef& def, const VariantItem& item, const std::string& value) {
  if (item.isStruct) return value + ".~" + item.name + "();";
  const TypeView type = WithoutDecorators(item.type, *def.owner.rootNameSpace).type;
  if (item.isVoid || type.IsScalar() || type.Op() == kOpEnum || type.Op() == kOpPointer) return {};
  return "{ typedef " + item.typeText + " _Item; " + value + ".~_Item(); }";
}

std::string DestructionText(const VariantDef& def, const VariantItem& item, const std::string& value) {
  const std::string& name = item.EffectiveName();
  if (item.onHeap) return "delete *(" + name + "**)_data;";
  if (def.WantsCompilableText()) return CompilableDestructionText(def, item, value);
  if (item.isStruct) return "(*(" + name + "**)_data)->~" + name + "();";
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
    case Operation::Move:  // what had a value on the heap has none
      if (item.isVoid) return {};
      return item.onHeap ? "*(" + name + "**)_data = *(" + name + "**)_rhs._data; _rhs._tag = -1;"
                         : ConstructionText(item, ValueTypeText(item)) + "(std::move(_rhs." + value + "));";
    case Operation::Make:
      return item.isVoid ? "" : ConstructionText(item, ValueTypeText(item)) + "();";
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
      return StatementOf(Operation::Make, def, item) + " " +
             (item.isStruct ? value + ".Deserialise(_ar);" : "_ar >> " + value + ";");
    case Operation::Read:
      if (item.isVoid) return {};
      return item.isStruct ? "_value." + value + ".Deserialise(_ar);" : "_ar >> _value." + value + ";";
  }
  return {};
}

class VariantMembers {
 public:
  VariantMembers(TextWriter& out, const VariantDef& def)
      : m_out(out),
        m_def(def),
        m_name(def.name),
        m_inline(def.MemberPlacement() == Placement::OutOfClass ? "inline " : ""),
        m_scope(def.MemberPlacement() == Placement::OutOfClass ? def.name + "::" : "") {}

  void WriteAll() {
    WriteCopying();
    if (MakesValueFirst(m_def)) WriteMaking();
    WriteComparisons();
    if (m_def.WritesToStream()) WriteStreamWrite();
    WriteVisits();
    if (m_def.HasSerialise()) WriteArchives();
  }

 private:
  // A case for each item with which the operation has something to do; nothing without such an item.
  void WriteSwitch(Operation operation) {
    const bool returns = operation == Operation::Equal || operation == Operation::Less;
    const bool isNew = operation == Operation::Move || operation == Operation::Make || operation == Operation::Read;
    std::string cases;
    for (const auto& item : m_def.m_items) {
      const std::string statement = StatementOf(operation, m_def, *item);
      if (statement.empty()) continue;
      if (!cases.empty()) cases += "\n";
      cases += "case " + std::to_string(item->tag) + " : " + statement + (returns ? "" : " break;");
    }
    if (cases.empty()) return;
    Write(m_out, R"(
      switch($tag$)
      {
          $cases$
          $default$
      }
    )",
          "tag"_ = isNew ? "_new" : "_tag", "cases"_ = cases,
          "default"_ = operation == Operation::Print ? "default: vxAssert(0);" : "");
  }
  auto Switch(Operation operation) {
    return [this, operation] { WriteSwitch(operation); };
  }

  auto Vars() const { return WithVars(m_out, "inline"_ = m_inline, "scope"_ = m_scope, "name"_ = m_name); }

  void WriteCopying() {
    Vars().Write(R"(
      $inline$$scope$$name$($name$ const& _rhs)
      {
          _tag = _rhs._tag;
          $copy$
      }
      $inline$$scope$~$name$()
      {
          $destroy$
      }
    )",
                 "copy"_ = Switch(Operation::Copy), "destroy"_ = Switch(Operation::Destroy));
  }

  // The tag comes last: until then there is nothing to destroy.
  void WriteMaking() {
    Vars().Write(R"(
      $inline$$scope$$name$($name$&& _rhs) noexcept($noexcept$)
      {
          const vesk::int32 _new = _rhs._tag;
          _tag = -1;
          $move$
          _tag = _new;
      }
    )",
                 "noexcept"_ = NoexceptText(m_def), "move"_ = Switch(Operation::Move));
    if (!m_def.HasSerialise()) return;
    Vars().Write(R"(
      $inline$$scope$$name$(vesk::int32 _new,vesk::NullInterface)
      {
          _tag = -1;
          $make$
          _tag = _new;
      }
    )",
                 "make"_ = Switch(Operation::Make));
  }

  void WriteComparisons() {
    Vars().Write(R"(
      $inline$bool $scope$operator==($name$ const& _rhs) const
      {
          if (_tag != _rhs._tag) return false;
          $equal$
          return true;
      }
      $inline$bool $scope$operator<($name$ const& _rhs) const
      {
          if (_tag < _rhs._tag) return true;
          if (_tag > _rhs._tag) return false;
          $less$
          return false;
      }
    )",
                 "equal"_ = Switch(Operation::Equal), "less"_ = Switch(Operation::Less));
  }

  void WriteStreamWrite() {
    Vars().Write(R"(
      $inline$void $scope$Write(vesk::xostream& _os) const
      {
          $print$
      }
    )",
                 "print"_ = Switch(Operation::Print));
  }

  void WriteVisits() {
    Vars().Write(R"(
      $inline$void $scope$VisitObjects(vesk::IObjectVisitor& _v) const
      {
          $visitObjects$
      }
      $inline$void $scope$VisitPrefs(vesk::IPrefVisitor& _v) const
      {
          $visitPrefs$
      }
    )",
                 "visitObjects"_ = Switch(Operation::VisitObjects), "visitPrefs"_ = Switch(Operation::VisitPrefs));
  }

  void WriteArchives() {
    Vars().Write(R"(
      template<typename Archive> $inline$void $scope$Serialise(Archive& _ar) const
      {
          vesk::SerialiseVariableLengthUint(_ar,_tag);
          $serialise$
      }
      template<typename Archive> $inline$void $scope$Deserialise(Archive& _ar)
      {
          $deserialise$
      }
    )",
                 "serialise"_ = Switch(Operation::Serialise),
                 "deserialise"_([this] { MakesValueFirst(m_def) ? WriteReading() : WriteReadingInPlace(); }));
  }

  void WriteReading() {
    Vars().Write(R"(
      vesk::int32 _new;
      vesk::DeserialiseVariableLengthUint(_ar,_new);
      $name$ _value(_new,vesk::null);
      $read$
      *this = std::move(_value);
    )",
                 "read"_ = Switch(Operation::Read));
  }

  void WriteReadingInPlace() {
    const bool destroys = std::any_of(m_def.m_items.begin(), m_def.m_items.end(), [this](const auto& item) {
      return !StatementOf(Operation::Destroy, m_def, *item).empty();
    });
    Write(m_out, R"(
      $destruction$
      vesk::DeserialiseVariableLengthUint(_ar,_tag);
      $deserialise$
    )",
          "destruction"_ = destroys ? "this->~" + m_name + "();" : "", "deserialise"_ = Switch(Operation::Deserialise));
  }

  TextWriter& m_out;
  const VariantDef& m_def;
  const std::string& m_name;
  const std::string m_inline, m_scope;  // ahead of a member's heading and its name
};

}  // namespace

void WriteVariantMembers(TextWriter& out, const VariantDef& def) { VariantMembers(out, def).WriteAll(); }

}  // namespace qrex
