// What the inspector shows, as a tree: the values that the program gave names, their fields, elements and entries. A
// place in it is found anew for each request, by a path in JSON: the name, then for each level
//
//   "field"                   a field or `$dep` field of a class
//   3                         an element of a list or set
//   {"k": "apple", "at": 5}   an entry of a map, and where it stood; without "k" for a key that is not UTF-8
//
// What a reference leads to, and what a variant holds, stands in its place. Nothing here calculates a `$dep` value.

@import "Vesk/vxObject/InspectorJson.h"
@import "Vesk/vxObject/Json.h"
@import "Vesk/vxObject/ValueTypes.h"

namespace vesk {

// What metadata say, as far as the page makes something of it: unit("kg"), range(0, 10), min(0), max(10),
// help("text") or a text by itself, color().
struct InspectorMetadata {
  explicit InspectorMetadata(xvector<MetadataValue> const& values) { Read(values); }

  xstring m_unit, m_help;
  bool m_isColor = false, m_hasLeast = false, m_hasMost = false;
  float64 m_least = 0, m_most = 0;

  void Put(InspectorWriter& out) const {
    if (!m_unit.empty()) out.Member("unit", m_unit);
    if (!m_help.empty()) out.Member("help", m_help);
    if (m_isColor) out.Member("color", true);
    if (m_hasLeast) out.Member("min", m_least);
    if (m_hasMost) out.Member("max", m_most);
  }

 private:
  void Read(xvector<MetadataValue> const& values) {
    for (MetadataValue const& value : values) {
      if (value.m_kind == MetadataValue::List) Read(value.m_values);
      if (value.m_kind == MetadataValue::String && m_help.empty()) m_help = value.m_text;
      if (value.m_kind == MetadataValue::Functor) ReadFunctor(value.m_text, value.m_values);
    }
  }
  void ReadFunctor(xstring const& name, xvector<MetadataValue> const& values) {
    m_isColor |= name == "color" || name == "colour";
    if (values.empty()) return;
    if (name == "unit") m_unit = values[0].m_text;
    if (name == "help") m_help = values[0].m_text;
    if (name == "min" || name == "range") m_hasLeast = ReadNumber(values[0], m_least);
    if (name == "max") m_hasMost = ReadNumber(values[0], m_most);
    if (name == "range" && values.size() > 1) m_hasMost = ReadNumber(values[1], m_most);
  }
  static bool ReadNumber(MetadataValue const& value, float64& number) {
    number = value.m_kind == MetadataValue::Float ? value.m_float : value.m_int;
    return value.m_kind == MetadataValue::Float || value.m_kind == MetadataValue::Int;
  }
};

struct InspectorPlace {
  xstring m_name;
  Value m_value;                             // empty for what has none
  ReflectedType m_declared;                  // its type with the metadata in front
  ReflectedDepField const* m_dep = nullptr;  // of a `$dep` field, with its node
  DGNode const* m_node = nullptr;
  bool m_isFixed = false;  // it is part of a copy or of a set, or calculated

  bool IsOf(std::initializer_list<EValueKind> kinds) const {
    return std::find(kinds.begin(), kinds.end(), m_value.Kind()) != kinds.end();
  }
};

// The type of a field as it is declared, by the record of its class; of the models that this has as well.
inline ReflectedType InspectorDeclared(ReflectedClass const& record, std::string_view name) {
  for (ssize_t i = 0; i < record.m_numFields; ++i) {
    ReflectedField const& field = record.m_fields[i];
    if (field.m_name == name) return DecodeType({field.m_type, record.m_strings});
  }
  for (ssize_t i = 0; i < record.m_numModelFields; ++i) {
    ReflectedModelField const& field = record.m_modelFields[i];
    if (field.m_type && field.m_offset >= 0 && field.m_name == name)
      return DecodeType({field.m_type, record.m_strings});
    ReflectedClass const* const model = field.m_type ? nullptr : Find<ReflectedClass>(field.m_name);
    if (!model) continue;
    ReflectedType type = InspectorDeclared(*model, name);
    if (type.m_code != RC_VOID) return type;
  }
  return ReflectedType();
}

// Of a container's entries.
inline ReflectedType InspectorInner(ReflectedType type) {
  while (type.m_inner.size() == 1 && type.m_code >= RC_VOLATILE && type.m_code <= RC_OFFSETTABLE) {
    ReflectedType inner = type.m_inner[0];
    type = std::move(inner);
  }
  if (type.m_code == RC_TYPEDEF) {
    ReflectedTypedef const* const record = Find<ReflectedTypedef>(type.m_name);
    return record ? InspectorInner(DecodeType({record->m_type, record->m_strings})) : ReflectedType();
  }
  return type.m_inner.empty() ? ReflectedType() : type.m_inner.back();
}

class InspectorTree {
 public:
  typedef std::function<Value()> Source;
  struct Shown {
    Source m_source;
    bool m_isFixed;
  };
  typedef std::function<bool(ssize_t position, InspectorPlace const& place)> EachFunction;

  // `isFixed`: of what must not be changed.
  void Show(xstring const& name, Source source, bool isFixed) { m_roots[name] = {std::move(source), isFixed}; }
  bool Hide(xstring const& name) { return m_roots.erase(name) > 0; }
  std::map<xstring, Shown> const& Roots() const { return m_roots; }

  // InspectorError where there is nothing at the path (any more).
  InspectorPlace Find(InspectorJson const& path) const {
    if (path.m_kind != InspectorJson::List || path.m_items.empty()) throw InspectorError("expected a path");
    InspectorPlace place = Root(path.m_items[0].AsText());
    for (std::size_t i = 1; i < path.m_items.size(); ++i) place = Child(Opened(place), path.m_items[i]);
    return place;
  }
  InspectorPlace Root(xstring const& name) const {
    const auto at = m_roots.find(name);
    if (at == m_roots.end()) throw InspectorError("nothing is shown as " + name);
    InspectorPlace place;
    place.m_name = name;
    place.m_value = at->second.m_source();
    place.m_isFixed = at->second.m_isFixed;
    return place;
  }

  // What stands in place of a reference or variant.
  static InspectorPlace Opened(InspectorPlace place) {
    for (int i = 0; i < kMostTargets && place.IsOf({VK_REFERENCE, VK_VARIANT, VK_OPENVARIANT}); ++i) {
      place.m_isFixed = place.m_value.Kind() != VK_REFERENCE;
      place.m_value = place.m_value.Target();
      place.m_declared = ReflectedType();
    }
    return place;
  }

  // How many rows stand below it. Of a variant's and reference's those of what stands in its place.
  static ssize_t Count(InspectorPlace const& place) {
    const InspectorPlace opened = Opened(place);
    const ssize_t count = opened.m_value.Count();
    return opened.m_value.Kind() == VK_CLASS ? count + opened.m_value.Class()->m_numDepFields : count;
  }
  // [first, first + count) of them, until `each` answers false.
  static void Each(InspectorPlace const& outer, ssize_t first, ssize_t count, EachFunction const& each) {
    const InspectorPlace opened = Opened(outer);
    const ssize_t end = first + std::min(count, std::numeric_limits<ssize_t>::max() - first);
    bool goesOn = true;
    ssize_t position = first;
    auto one = [&](xstring const& name, Value const& value) {
      return goesOn = each(position++, Inner(opened, name, value));
    };
    // A walk passes all that stands ahead; by its position an element of a vector is found at once.
    const bool isDirect = opened.m_value.Kind() == VK_LIST && opened.m_value.Type().m_code != RC_LIST;
    if (isDirect) {
      const ssize_t last = std::min(end, opened.m_value.Count());
      while (goesOn && position < last) one(vxMakeString(position), opened.m_value.At(position));
    } else {
      opened.m_value.EachOf(first, count, one);
    }
    if (opened.m_value.Kind() != VK_CLASS) return;
    ReflectedClass const& record = *opened.m_value.Class();
    const ssize_t fields = opened.m_value.Count();
    for (position = std::max(first, fields); goesOn && position < std::min(end, fields + record.m_numDepFields);) {
      const ssize_t at = position++;
      goesOn = each(at, Dep(opened, record.m_depFields[at - fields]));
    }
  }

  // The step from a place to the one below it, as a path has it.
  static void PutStep(InspectorWriter& out, InspectorPlace const& outer, ssize_t position, xstring const& name) {
    const EValueKind kind = Opened(outer).m_value.Kind();
    if (kind == VK_CLASS) {
      out.Put(name);
    } else if (kind == VK_MAP) {
      out.Open('{');
      if (IsUtf8(name)) out.Member("k", name);
      out.Member("at", position).Close('}');
    } else {
      out.Put(position);
    }
  }
  static bool IsUtf8(std::string_view text) {
    while (!text.empty()) {
      const std::size_t length = InspectorUtf8Length(text);
      if (length == 0) return false;
      text.remove_prefix(length);
    }
    return true;
  }

 private:
  static constexpr int kMostTargets = 8;  // of references to references

  static InspectorPlace Inner(InspectorPlace const& outer, xstring const& name, Value const& value) {
    InspectorPlace place;
    place.m_name = name;
    place.m_value = value;
    const EValueKind kind = outer.m_value.Kind();
    place.m_isFixed = outer.m_isFixed || kind == VK_SET;
    if (kind == VK_CLASS) {
      place.m_declared = InspectorDeclared(*outer.m_value.Class(), name);
    } else {
      // What is said of a list of numbers is said of the numbers.
      place.m_declared = InspectorInner(outer.m_declared);
      if (place.m_declared.m_metadata.empty()) place.m_declared.m_metadata = outer.m_declared.m_metadata;
    }
    return place;
  }
  static InspectorPlace Dep(InspectorPlace const& outer, ReflectedDepField const& field) {
    InspectorPlace place;
    place.m_name = field.m_name;
    place.m_value = outer.m_value.Dep(field);
    if (field.m_type) place.m_declared = DecodeType({field.m_type, outer.m_value.Class()->m_strings});
    place.m_dep = &field;
    octet_t* const object = static_cast<octet_t*>(outer.m_value.Address());
    place.m_node = static_cast<DGNode const*>(static_cast<void*>(object + field.m_nodeOffset));
    place.m_isFixed = true;
    return place;
  }

  static InspectorPlace Child(InspectorPlace const& outer, InspectorJson const& step) {
    const EValueKind kind = outer.m_value.Kind();
    if (kind == VK_CLASS) return Field(outer, step.AsText());
    if (kind != VK_LIST && kind != VK_SET && kind != VK_MAP) throw InspectorError("nothing is there any more");
    const bool isEntry = step.m_kind == InspectorJson::Object;
    if (isEntry != (kind == VK_MAP)) throw InspectorError("expected an element");
    const ssize_t position = (isEntry ? step["at"] : step).AsCount(0);
    InspectorPlace found;
    Each(outer, std::max<ssize_t>(position, 0), 1, [&](ssize_t, InspectorPlace const& place) {
      found = place;
      return false;
    });
    if (!isEntry || step["k"].m_kind == InspectorJson::Null) return Present(found, position);
    xstring const& key = step["k"].AsText();
    if (found.m_value && found.m_name == key) return found;
    found = InspectorPlace();
    Each(outer, 0, outer.m_value.Count(), [&](ssize_t, InspectorPlace const& place) {
      if (place.m_name != key) return true;
      found = place;
      return false;
    });
    return Present(found, position);
  }
  static InspectorPlace const& Present(InspectorPlace const& place, ssize_t position) {
    if (position < 0 || !place.m_value) throw InspectorError("nothing is there any more");
    return place;
  }
  static InspectorPlace Field(InspectorPlace const& outer, xstring const& name) {
    xvector<ValueField> const& fields = outer.m_value.Types()->FieldsOf(outer.m_value.Type());
    for (std::size_t i = 0; i < fields.size(); ++i) {
      if (fields[i].m_name == name) return Inner(outer, name, outer.m_value.At(static_cast<ssize_t>(i)));
    }
    ReflectedClass const& record = *outer.m_value.Class();
    for (ssize_t i = 0; i < record.m_numDepFields; ++i) {
      if (record.m_depFields[i].m_name == name) return Dep(outer, record.m_depFields[i]);
    }
    throw InspectorError("no field " + name + " in " + outer.m_value.TypeName());
  }

  std::map<xstring, Shown> m_roots;
};

}  // namespace vesk
