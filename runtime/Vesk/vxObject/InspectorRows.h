// How a place looks in the page: a row, with as much of its value as a line holds, and what the page shows beside the
// tree of the one that is selected.

@import "Vesk/vxObject/InspectorTree.h"

namespace vesk {

class InspectorRows {
 public:
  static constexpr std::size_t kRowBytes = 200;
  static constexpr std::size_t kTextBytes = 256 << 10;  // of a text that is shown whole

  // At most `most` bytes, no character cut in two.
  static std::string_view Cut(std::string_view text, std::size_t most) {
    if (text.size() <= most) return text;
    std::size_t end = most;
    while (end > most - 4 && (static_cast<octet_t>(text[end]) & 0xC0) == 0x80) --end;
    return text.substr(0, end);
  }

  // The members of a row, which is open.
  static void PutRow(InspectorWriter& out, InspectorPlace const& place) {
    out.Member("name", Cut(place.m_name, kRowBytes));
    out.Member("kind", KindName(place.m_value.Kind()));
    const xstring type = place.m_value ? place.m_value.TypeName() : TypeName(place);
    if (!type.empty()) out.Member("type", type);
    const ssize_t count = InspectorTree::Count(place);
    if (count > 0) out.Member("count", count);
    out.Member("text", Text(place));
    const InspectorMetadata metadata(place.m_declared.m_metadata);
    const bool isScalar = IsScalar(place.m_value.Kind());
    if (isScalar && !metadata.m_unit.empty()) out.Member("unit", metadata.m_unit);
    if (isScalar && metadata.m_isColor) out.Member("color", true);
    if (place.m_node) out.Member("fresh", place.m_node->IsUpToDate());
  }

  // What one line tells of a value, however large it is.
  static xstring Text(InspectorPlace const& place) {
    xstring text;
    AddText(text, place.m_value, 0);
    return xstring(Cut(text, kRowBytes));
  }

  // What an editor begins with, as JSON; nothing for what has no editor.
  static void PutEdited(InspectorWriter& out, InspectorPlace const& place) {
    Value const& value = place.m_value;
    if (value.Kind() == VK_TEXT && TextSize(value) > kTextBytes) return;
    if (!IsScalar(value.Kind()) && value.Kind() != VK_VARIANT) return;
    try {
      const xstring json = ToJson(value);
      if (json.size() <= 2 * kTextBytes) out.Name("value").Raw(json);
    } catch (AccessError const&) {  // bytes that are no text, references
    }
  }
  static bool IsScalar(EValueKind kind) { return kind >= VK_BOOL && kind <= VK_ENUM; }
  // Of any number of elements.
  static bool IsList(InspectorPlace const& place) {
    return place.m_value.Kind() == VK_LIST && place.m_value.Type().m_code != RC_ARRAY;
  }

  static void PutEnumLabels(InspectorWriter& out, ReflectedEnum const& record) {
    out.Name("labels").Open('[');
    for (ssize_t i = 0; i < record.m_numLabels; ++i) {
      out.Open('{').Member("label", record.m_labels[i]);
      out.Member("number", record.m_values ? record.m_values[i] : static_cast<int32>(i));
      if (record.m_enabled && !record.m_enabled[i]) out.Member("off", true);
      out.Close('}');
    }
    out.Close(']');
  }
  static void PutLabels(InspectorWriter& out, Value const& value) {
    if (value.Kind() == VK_ENUM && value.Type().m_enum) {
      PutEnumLabels(out, *value.Type().m_enum);
    } else if (value.Kind() == VK_VARIANT) {
      ReflectedVariant const& record = *value.Type().m_variant;
      out.Name("items").Open('[');
      for (ssize_t i = 0; i < record.m_numItems; ++i) out.Put(ItemName(record.m_items[i].m_name));
      out.Close(']');
    }
  }
  static std::string_view ItemName(std::string_view name) {
    constexpr std::string_view kLibrary = "vesk::";
    return name.substr(0, kLibrary.size()) == kLibrary ? name.substr(kLibrary.size()) : name;
  }

  static ConstStringZ KindName(EValueKind kind) {
    constexpr ConstStringZ kNames[] = {"none",  "bool", "int", "uint", "float",   "char",        "text",     "enum",
                                       "class", "list", "set", "map",  "variant", "openvariant", "reference"};
    return kNames[kind];
  }

 private:
  static constexpr int kPreviewFields = 4;

  static xstring TypeName(InspectorPlace const& place) {
    if (place.m_declared.m_code == RC_VOID) return xstring();
    ReflectedType plain = place.m_declared;
    plain.m_metadata.clear();
    return vxMakeString(plain);
  }
  static std::size_t TextSize(Value const& value) {
    return value.Type().m_code == RC_STRING8 ? value.As<string8>().size() : 2 * value.As<string16>().size();
  }

  static void AddText(xstring& text, Value const& value, int depth) {
    const EValueKind kind = value.Kind();
    if (kind == VK_TEXT) {
      AddString(text, value);
    } else if (IsScalar(kind)) {
      text += value.Text();
    } else if (kind == VK_CLASS) {
      if (depth < 2) AddFields(text, value, depth);
    } else if (kind == VK_LIST || kind == VK_SET || kind == VK_MAP) {
      text += CountText(value.Count());
    } else if (kind == VK_REFERENCE || kind == VK_VARIANT || kind == VK_OPENVARIANT) {
      AddTarget(text, value, depth);
    } else {
      text += "?";
    }
  }
  // Long ones by their beginning, of which as much is looked at.
  static void AddString(xstring& text, Value const& value) {
    if (value.Type().m_code == RC_STRING8) {
      text += Cut(value.As<string8>(), kRowBytes);
      if (value.As<string8>().size() > kRowBytes) text += "\xE2\x80\xA6";
    } else {
      string16 const& units = value.As<string16>();
      text += Utf8Text(std::u16string_view(units).substr(0, kRowBytes));
      if (units.size() > kRowBytes) text += "\xE2\x80\xA6";
    }
  }
  static void AddFields(xstring& text, Value const& value, int depth) {
    int shown = 0;
    bool isCut = false;
    value.Each([&](xstring const& name, Value const& field) {
      if (!IsScalar(field.Kind())) return true;
      isCut = shown == kPreviewFields || text.size() > kRowBytes;
      if (isCut) return false;
      if (shown++ > 0) text += ", ";
      text += name;
      text += " = ";
      AddText(text, field, depth + 1);
      return true;
    });
    if (isCut) text += ", \xE2\x80\xA6";
  }
  static void AddTarget(xstring& text, Value const& value, int depth) {
    xstring name;
    const Value target = value.Target(&name);
    if (value.Kind() == VK_REFERENCE) text += target ? "\xE2\x86\x92 " : "null";
    text += name;
    if (!target || depth >= 2) return;
    const std::size_t size = text.size();
    text += value.Kind() == VK_REFERENCE ? ": " : " = ";
    const std::size_t begin = text.size();
    AddText(text, target, depth + 1);
    if (text.size() == begin) text.resize(size);
  }
  static xstring CountText(ssize_t count) {
    xstring digits = vxMakeString(count);
    for (ssize_t at = static_cast<ssize_t>(digits.size()) - 3; at > 0; at -= 3) digits.insert(at, 1, ' ');
    return digits + (count == 1 ? " element" : " elements");
  }
};

}  // namespace vesk
