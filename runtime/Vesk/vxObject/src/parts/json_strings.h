// Strings of JSON, and how variants and objects are named.

@import "Vesk/vxObject/JsonText.h"

namespace vesk {

std::size_t Utf8Length(std::string_view text) {
  const octet_t first = static_cast<octet_t>(text[0]);
  if (first < 0x80) return 1;
  const std::size_t length = first < 0xC2 ? 0 : first < 0xE0 ? 2 : first < 0xF0 ? 3 : first < 0xF5 ? 4 : 0;
  if (length == 0 || text.size() < length) return 0;
  for (std::size_t i = 1; i < length; ++i) {
    if ((static_cast<octet_t>(text[i]) & 0xC0) != 0x80) return 0;
  }
  const octet_t second = static_cast<octet_t>(text[1]);
  const bool isOverlong = (first == 0xE0 && second < 0xA0) || (first == 0xF0 && second < 0x90);
  const bool isOutside = (first == 0xED && second >= 0xA0) || (first == 0xF4 && second >= 0x90);
  return isOverlong || isOutside ? 0 : length;
}

namespace {

void PutEscape(std::string& out, uint32 unit) {
  out += "\\u";
  for (int shift = 12; shift >= 0; shift -= 4) out += kHexDigits[unit >> shift & 15];
}

void PutAscii(std::string& out, char c) {
  static constexpr char escapes[][2] = {{'"', '"'},  {'\\', '\\'}, {'\b', 'b'}, {'\f', 'f'},
                                        {'\n', 'n'}, {'\r', 'r'},  {'\t', 't'}};
  for (auto const& escape : escapes) {
    if (c != escape[0]) continue;
    out += '\\';
    out += escape[1];
    return;
  }
  if (static_cast<octet_t>(c) < 0x20 || c == 0x7F) {
    PutEscape(out, static_cast<octet_t>(c));
  } else {
    out += c;
  }
}

bool IsPlain(char c) {
  return static_cast<octet_t>(c) >= 0x20 && c != '"' && c != '\\' && static_cast<octet_t>(c) < 0x7F;
}

}  // namespace

void PutJsonString(std::string& out, std::string_view text, bool replaceInvalid) {
  out += '"';
  while (!text.empty()) {
    const std::size_t plain = std::find_if_not(text.begin(), text.end(), IsPlain) - text.begin();
    out += text.substr(0, plain);
    text.remove_prefix(plain);
    if (text.empty()) break;
    std::size_t length = Utf8Length(text);
    if (length == 1) {
      PutAscii(out, text[0]);
    } else if (length > 0) {
      out += text.substr(0, length);
    } else {
      if (!replaceInvalid) throw JsonError("string is not UTF-8");
      AppendUtf8(out, 0xFFFD);
      length = 1;
    }
    text.remove_prefix(length);
  }
  out += '"';
}

void PutJsonString(std::string& out, std::u16string_view text) {
  out += '"';
  for (std::size_t i = 0; i < text.size(); ++i) {
    const bool isPair = (text[i] & 0xFC00) == 0xD800 && i + 1 < text.size() && (text[i + 1] & 0xFC00) == 0xDC00;
    if (text[i] < 0x80) {
      PutAscii(out, static_cast<char>(text[i]));
    } else if ((text[i] & 0xF800) == 0xD800 && !isPair) {
      PutEscape(out, text[i]);
    } else {
      out += Utf8Text(text.substr(i, isPair ? 2 : 1));
      i += isPair;
    }
  }
  out += '"';
}

bool IsJsonKey(ValueType const& type) {
  return type.m_kind == VK_TEXT || type.m_kind == VK_INT || type.m_kind == VK_UINT || type.m_kind == VK_BOOL ||
         type.m_kind == VK_ENUM;
}

std::string_view JsonItemName(std::string_view name) {
  constexpr std::string_view library = "vesk::";
  return name.substr(0, library.size()) == library ? name.substr(library.size()) : name;
}

ValueType const* JsonTypeOfName(ValueTypes& types, xstring const& name) {
  for (octet_t code = RC_VOID + 1; code <= RC_STRING16; ++code) {
    if (name == CodeName(code)) return &types.Of(NamedType(code, ""));
  }
  if (Find<ReflectedClass>(name)) return &types.Of(NamedType(RC_CLASS, name.c_str()));
  if (Find<ReflectedVariant>(name)) return &types.Of(NamedType(RC_VARIANT, name.c_str()));
  return nullptr;
}

namespace {

bool HasReferences(ValueTypes& types, ValueType const& type, xset<ValueType const*>& seen) {
  if (type.m_kind == VK_REFERENCE) return true;
  if (!seen.Insert(&type)) return false;
  if (type.m_key && HasReferences(types, *type.m_key, seen)) return true;
  if (type.m_item && HasReferences(types, *type.m_item, seen)) return true;
  if (type.m_kind == VK_CLASS) {
    for (ValueField const& field : types.FieldsOf(type)) {
      if (HasReferences(types, *field.m_type, seen)) return true;
    }
  }
  for (ssize_t i = 0; type.m_variant && i < type.m_variant->m_numItems; ++i) {
    ValueType const* item = types.ItemOf(*type.m_variant, i);
    if (item && HasReferences(types, *item, seen)) return true;
  }
  return false;
}

}  // namespace

bool HasReferences(ValueTypes& types, ValueType const& type) {
  xset<ValueType const*> seen;
  return HasReferences(types, type, seen);
}

void CheckNoReferences(ValueTypes& types, ValueType const& type) {
  if (HasReferences(types, type)) throw JsonError("references in a variant: " + type.m_text);
}

ptr<IObject> JsonObjectOf(xstring interface, AnyInterface any) {
  // The table of an interface begins with that of its first base.
  while (interface != "vesk::IObject") {
    ReflectedInterface const* record = Find<ReflectedInterface>(interface);
    if (!record || record->m_numBases == 0) throw JsonError("reference to what is no object: " + interface);
    interface = record->m_bases[0];
  }
  return ptr<IObject>(any);
}

}  // namespace vesk
