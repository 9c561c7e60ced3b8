// Writes values as JSON.

@import "Vesk/vxObject/Json.h"
@import "Vesk/vxObject/ValueTypes.h"
@import "Vesk/vxObject/JsonText.h"

#include <charconv>
#include <cmath>

namespace vesk {

namespace {

class JsonWriter {
 public:
  JsonWriter(ValueTypes& types, JsonStyle const& style, JsonLimits const& limits)
      : m_types(types), m_style(style), m_limits(limits), m_memory(limits.m_memory) {}

  xstring Write(ValueType const& type, void* address) {
    Put(type, address);
    CheckSize();
    if (m_objects.empty()) return std::move(m_text);
    CheckDepth(m_deepest + 1);  // it stands one level deeper
    if (m_style.m_indent > 0) {
      m_text.clear();
      m_memory.Reset();
      m_depth = 1;
      Put(type, address);
    }
    const std::string value = std::exchange(m_text, {});
    m_depth = 0;
    Open('{');
    PutName("$objects");
    Open('[');
    for (std::size_t i = 0; i < m_objects.size(); ++i) {
      Next();
      PutObject(m_objects[i]);  // may add to them
    }
    Close(']');
    PutName("$value");
    m_text += value;
    Close('}');
    CheckSize();
    return std::move(m_text);
  }

 private:
  struct Object {
    ReflectedClass const* m_record;
    void* m_self;
  };

  // --- Structure

  void CheckSize() const {
    if (m_text.size() > m_limits.m_bytes) {
      throw JsonError(vxMakeString("text of more than " << m_limits.m_bytes << " bytes"));
    }
  }
  void CheckDepth(int depth) const {
    if (depth > m_limits.m_depth) throw JsonError("value nested too deeply");
  }
  void Charge(std::size_t size, std::size_t count = 1) {
    if (!m_memory.Take(size, count)) throw JsonError("value takes more memory than is allowed");
  }

  void Open(char bracket) {
    CheckDepth(++m_depth);
    m_deepest = std::max(m_deepest, m_depth);
    m_text += bracket;
    m_isFirst = true;
  }
  void Close(char bracket) {
    --m_depth;
    if (!m_isFirst) NewLine();
    m_text += bracket;
    m_isFirst = false;
  }
  void Next() {
    if (!std::exchange(m_isFirst, false)) m_text += ',';
    NewLine();
    CheckSize();
  }
  void NewLine() {
    if (m_style.m_indent <= 0) return;
    m_text += '\n';
    m_text.append(static_cast<std::size_t>(m_depth) * m_style.m_indent, ' ');
  }
  void PutName(std::string_view name) {
    Next();
    PutJsonString(m_text, name, m_style.m_replaceInvalid);
    m_text += m_style.m_indent > 0 ? ": " : ":";
  }

  // --- Values

  void Put(ValueType const& type, void* address) {
    switch (type.m_kind) {
      case VK_BOOL:
        m_text += *static_cast<bool*>(address) ? "true" : "false";
        return;
      case VK_INT:
      case VK_UINT:
        return PutInteger(type, address);
      case VK_FLOAT:
        return type.m_size == 4 ? PutFloat(*static_cast<float32*>(address)) : PutFloat(*static_cast<float64*>(address));
      case VK_CHAR:
        return PutChar(type, address);
      case VK_TEXT:
        return PutText(type, address);
      case VK_ENUM:
        return PutEnum(type, *static_cast<int32*>(address));
      case VK_CLASS:
        Open('{');
        PutFields(type, address);
        return Close('}');
      case VK_LIST:
      case VK_SET:
        return PutList(type, address);
      case VK_MAP:
        return IsJsonKey(*type.m_key) ? PutMap(type, address) : PutPairs(type, address);
      case VK_VARIANT:
        return PutVariant(type, address);
      case VK_OPENVARIANT:
        return PutOpenVariant(address);
      case VK_REFERENCE:
        return PutReference(type, address);
      case VK_NONE:
        m_text += "null";
    }
  }

  void PutInteger(ValueType const& type, void* address) {
    const bool isText = type.m_size > 4;
    if (isText) m_text += '"';
    m_text += TextOf([&](xostream& os) { type.m_ops->m_print(os, address); });
    if (isText) m_text += '"';
  }

  template <typename F>
  void PutFloat(F value) {
    if (std::isnan(value)) {
      m_text += "\"NaN\"";
    } else if (std::isinf(value)) {
      m_text += value < 0 ? "\"-Infinity\"" : "\"Infinity\"";
    } else {
      char digits[64];
      m_text.append(digits, std::to_chars(digits, digits + sizeof(digits), value).ptr - digits);
    }
  }

  void PutChar(ValueType const& type, void* address) {
    const uint32 c = type.m_size == 1 ? *static_cast<octet_t*>(address) : *static_cast<char16*>(address);
    if ((type.m_size == 1 && c >= 0x80) || (c & 0xF800) == 0xD800) {
      m_text += std::to_string(c);
    } else {
      std::string text;
      AppendUtf8(text, c);
      PutJsonString(m_text, text, false);
    }
  }

  void PutText(ValueType const& type, void* address) {
    if (type.m_code == RC_STRING8) {
      string8 const& text = *static_cast<string8*>(address);
      Charge(text.size());
      PutJsonString(m_text, text, m_style.m_replaceInvalid);
    } else {
      string16 const& text = *static_cast<string16*>(address);
      Charge(text.size(), sizeof(char16));
      PutJsonString(m_text, std::u16string_view(text));
    }
  }

  void PutEnum(ValueType const& type, int32 number) {
    ReflectedEnum const* record = type.m_enum;
    for (ssize_t i = 0; record && i < record->m_numLabels; ++i) {
      if ((record->m_values ? record->m_values[i] : i) != number) continue;
      return PutJsonString(m_text, record->m_labels[i], false);
    }
    m_text += std::to_string(number);
  }

  void PutFields(ValueType const& type, void* object) {
    for (ValueField const& field : m_types.FieldsOf(type)) {
      void* address = static_cast<octet_t*>(object) + field.m_offset;
      if (DGIndepNode* node = IndepNodeAt(*type.m_class, object, field)) {
        node->ReadBarrier();
        address = ValueBeforeNode(*node, *field.m_type);
      }
      if (!address || field.m_type->m_kind == VK_NONE) continue;
      PutName(field.m_name);
      Put(*field.m_type, address);
    }
  }

  void PutList(ValueType const& type, void* container) {
    const bool isSet = type.m_kind == VK_SET;
    if (!isSet && type.m_code != RC_ARRAY) Charge(JsonMemory::OfElement(type), CountOf(type, container));
    Open('[');
    EachEntry(type, container, [&](void* element) {
      Next();
      if (isSet) Charge(JsonMemory::OfEntry(type));
      Put(*type.m_item, element);
      return true;
    });
    Close(']');
  }

  void PutMap(ValueType const& type, void* map) {
    Open('{');
    EachEntry(type, map, [&](void* entry) {
      Next();
      Charge(JsonMemory::OfEntry(type));
      PutKey(*type.m_key, entry);
      m_text += m_style.m_indent > 0 ? ": " : ":";
      Put(*type.m_item, type.ItemOf(entry));
      return true;
    });
    Close('}');
  }
  // What is no string by itself is put in quotes.
  void PutKey(ValueType const& type, void* key) {
    if (type.m_kind == VK_TEXT) {
      const std::string text =
          type.m_code == RC_STRING8 ? *static_cast<string8*>(key) : Utf8Text(*static_cast<string16*>(key));
      Charge(text.size());
      return PutJsonString(m_text, (text.empty() || text[0] != '$' ? "" : "$") + text, m_style.m_replaceInvalid);
    }
    const std::size_t begin = m_text.size();
    Put(type, key);
    if (m_text[begin] == '"') return;
    m_text.insert(begin, 1, '"');
    m_text += '"';
  }

  void PutPairs(ValueType const& type, void* map) {
    Open('[');
    EachEntry(type, map, [&](void* entry) {
      Next();
      Charge(JsonMemory::OfEntry(type));
      Open('[');
      Next();
      Put(*type.m_key, entry);
      Next();
      Put(*type.m_item, type.ItemOf(entry));
      Close(']');
      return true;
    });
    Close(']');
  }

  // Where an item stands in a variant only the variant knows: its archive tells.
  void PutVariant(ValueType const& type, void* variant) {
    ReflectedVariant const& record = *type.m_variant;
    Archive archive;
    WriteValue(archive, type, variant);
    InputArchive ar(archive);
    ssize_t tag;
    DeserialiseVariableLengthUint(ar, tag);
    if (tag >= record.m_numItems) throw JsonError("no such item in " + type.m_text);
    Open('{');
    PutName(JsonItemName(record.m_items[tag].m_name));
    PutArchived(m_types.ItemOf(record, tag), ar);
    Close('}');
  }

  void PutOpenVariant(void* variant) {
    Archive archive;
    static_cast<openvariant<int32>*>(variant)->Serialise(archive);
    InputArchive ar(archive);
    xstring name;
    ar >> name;
    if (name.empty()) {
      m_text += "null";
      return;
    }
    Open('{');
    PutName("$type");
    PutJsonString(m_text, name, false);
    PutName("$value");
    PutArchived(JsonTypeOfName(m_types, name), ar);
    Close('}');
  }

  void PutArchived(ValueType const* type, InputArchive& ar) {
    if (type && type->m_code == RC_VOID) {
      m_text += "null";
    } else if (type) {
      CheckNoReferences(m_types, *type);
      const HeldValue value(*type);
      ReadValue(ar, *type, value.Get());
      Put(*type, value.Get());
    } else {
      Open('{');
      PutName("$bytes");
      m_text += '"';
      while (ar.Remaining() > 0) {
        octet_t byte;
        ar.Read(&byte, 1);
        m_text += kHexDigits[byte >> 4];
        m_text += kHexDigits[byte & 15];
      }
      m_text += '"';
      Close('}');
    }
  }

  // --- References

  void PutReference(ValueType const& type, void* reference) {
    void* const self = *static_cast<void**>(reference);
    if (!self) {
      m_text += "null";
      return;
    }
    const auto [at, isNew] = m_numbers.insert({self, m_objects.size() + 1});
    if (isNew) m_objects.push_back({RecordOf(type, reference), self});
    Open('{');
    PutName("$ref");
    m_text += std::to_string(at->second);
    Close('}');
  }

  static ReflectedClass const* RecordOf(ValueType const& type, void* reference) {
    ReflectedClass const* record = nullptr;
    if (type.m_code == RC_PREF) {
      const AnyInterface any = static_cast<pref<IObject>*>(reference)->Get().Any();
      record = JsonObjectOf(type.m_target, any)->GetReflectedClass();
    } else if ((record = Find<ReflectedClass>(type.m_target)) && record->m_objectTable) {
      record = ptr<IObject>(*static_cast<void**>(reference), record->m_objectTable)->GetReflectedClass();
    }
    if (!record) throw JsonError("object without a record behind a reference to " + type.m_target);
    if (!Find<ReflectedClass>(record->m_name)) throw JsonError(NotRegistered("class", record->m_name));
    return record;
  }

  void PutObject(Object object) {
    Charge(object.m_record->m_size);
    Open('{');
    PutName("$class");
    PutJsonString(m_text, object.m_record->m_name, false);
    PutFields(m_types.Of(*object.m_record), object.m_self);
    Close('}');
  }

  ValueTypes& m_types;
  JsonStyle const& m_style;
  JsonLimits const& m_limits;
  JsonMemory m_memory;
  std::string m_text;
  int m_depth = 0;
  int m_deepest = 0;
  bool m_isFirst = true;
  xvector<Object> m_objects;
  std::unordered_map<void*, std::size_t> m_numbers;
};

}  // namespace

xstring ToJson(Value const& value, JsonStyle const& style, JsonLimits const& limits) {
  ValueType const& type = value.Type();
  try {
    return JsonWriter(*value.Types(), style, limits).Write(type, value.Address());
  } catch (ArchiveError const& error) {  // of a variant
    throw JsonError(error.what());
  }
}

}  // namespace vesk
