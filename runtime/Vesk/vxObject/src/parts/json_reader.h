// Reads values from JSON.

@import "Vesk/vxObject/src/json_scalars.h"

#include <charconv>

namespace vesk {

namespace {

class JsonReader {
 public:
  JsonReader(ValueTypes& types, std::string_view text, JsonLimits const& limits)
      : m_types(types), m_scanner(text), m_limits(limits), m_memory(limits.m_memory) {
    if (text.size() > limits.m_bytes) throw JsonError(vxMakeString("text of " << text.size() << " bytes"));
    m_scanner.Check(limits.m_depth);
  }
  ~JsonReader() {
    for (Object const& object : m_objects) Destroy(object);
  }
  JsonReader(JsonReader const&) = delete;
  void operator=(JsonReader const&) = delete;

  void Read(ValueType const& type, void* address) {
    try {
      const bool hasObjects = ReadObjects();
      if (hasObjects) ExpectNext("$value");
      Get(type, address);
      if (hasObjects) m_scanner.Expect('}');
      CheckReached();
    } catch (...) {
      Forget(type, address);
      throw;
    }
    m_objects.clear();  // the value has them
  }

 private:
  struct Object {
    ReflectedClass const* m_record = nullptr;
    void* m_self = nullptr;
    ptr<IObject> m_object;  // null for a plain struct
  };

  // --- Tokens

  void Charge(std::size_t size, std::size_t count = 1) {
    if (!m_memory.Take(size, count)) m_scanner.Fail("more memory than is allowed");
  }
  void ExpectName(std::string_view name) {
    const std::size_t at = m_scanner.Here();
    const bool isName = m_scanner.Peek() == '"' && m_scanner.ReadString8() == name;
    if (!isName) m_scanner.FailAt(at, "expected " + std::string(name));
    m_scanner.Expect(':');
  }
  void ExpectNext(std::string_view name) {
    m_scanner.Expect(',');
    ExpectName(name);
  }
  // Calls `each` with the name of each member.
  template <typename Each>
  void EachMember(Each each) {
    m_scanner.Expect('{');
    if (m_scanner.Accept('}')) return;
    do {
      const std::size_t at = m_scanner.Here();
      const std::string name = m_scanner.ReadString8();
      m_scanner.Expect(':');
      each(name, at);
    } while (m_scanner.Accept(','));
    m_scanner.Expect('}');
  }
  template <typename Each>
  void EachElement(Each each) {
    m_scanner.Expect('[');
    if (m_scanner.Accept(']')) return;
    do each();
    while (m_scanner.Accept(','));
    m_scanner.Expect(']');
  }

  // --- Values

  void Get(ValueType const& type, void* address) {
    switch (type.m_kind) {
      case VK_BOOL:
        return ReadJsonBool(m_scanner, address);
      case VK_INT:
      case VK_UINT:
        return ReadJsonInteger(m_scanner, type, address);
      case VK_FLOAT:
        return type.m_size == 4 ? ReadJsonFloat(m_scanner, *static_cast<float32*>(address))
                                : ReadJsonFloat(m_scanner, *static_cast<float64*>(address));
      case VK_CHAR:
        return ReadJsonChar(m_scanner, type, address);
      case VK_TEXT:
        return GetText(type, address);
      case VK_ENUM:
        return ReadJsonEnum(m_scanner, type, *static_cast<int32*>(address));
      case VK_CLASS:
        return GetFields(type, address);
      case VK_LIST:
        return GetList(type, address);
      case VK_SET:
        return GetSet(type, address);
      case VK_MAP:
        return IsJsonKey(*type.m_key) ? GetMap(type, address) : GetPairs(type, address);
      case VK_VARIANT:
        return GetVariant(type, address);
      case VK_OPENVARIANT:
        return GetOpenVariant(type, address);
      case VK_REFERENCE:
        return GetReference(type, address);
      case VK_NONE:
        if (!m_scanner.AcceptNull()) m_scanner.Fail("a value of this type cannot be read: " + type.m_text);
    }
  }

  void GetText(ValueType const& type, void* address) {
    if (type.m_code == RC_STRING8) {
      std::string text = m_scanner.ReadString8();
      Charge(text.size());
      *static_cast<string8*>(address) = std::move(text);
    } else {
      std::u16string text = m_scanner.ReadString16();
      Charge(text.size(), sizeof(char16));
      *static_cast<string16*>(address) = std::move(text);
    }
  }

  // --- Containers

  void GetList(ValueType const& type, void* list) {
    const std::size_t at = m_scanner.Here();
    if (m_scanner.Peek() != '[') m_scanner.Fail("expected an array");
    const ssize_t count = m_scanner.CountHere();
    if (type.m_code == RC_ARRAY) {
      if (count != type.m_count) m_scanner.FailAt(at, vxMakeString("expected " << type.m_count << " elements"));
    } else {
      Charge(JsonMemory::OfElement(type), static_cast<std::size_t>(count));
      ResizeList(type, list, count);
    }
    m_scanner.Expect('[');
    ssize_t position = 0;
    EachEntry(type, list, [&](void* element) {
      if (position > 0) m_scanner.Expect(',');
      Get(*type.m_item, element);
      if (type.m_code == RC_VECTOR && type.m_item->m_kind == VK_BOOL) {
        (*static_cast<xvector<bool>*>(list))[position] = *static_cast<bool*>(element);
      }
      return ++position < count;
    });
    m_scanner.Expect(']');
  }

  void* Insert(ValueType const& type, void* container, std::size_t at, ValueFunction const& fill) {
    Charge(JsonMemory::OfEntry(type));
    void* const entry = InsertEntry(type, container, fill);
    if (!entry) m_scanner.FailAt(at, type.m_key ? "repeated key" : "repeated element");
    return entry;
  }

  void GetSet(ValueType const& type, void* set) {
    ClearContainer(type, set);
    EachElement([&] { Insert(type, set, m_scanner.Here(), [&](void* element) { Get(*type.m_item, element); }); });
  }

  void GetMap(ValueType const& type, void* map) {
    ClearContainer(type, map);
    EachMember([&](std::string const& name, std::size_t at) {
      void* const entry = Insert(type, map, at, [&](void* key) { SetKey(*type.m_key, key, name, at); });
      Get(*type.m_item, type.ItemOf(entry));
    });
  }
  void SetKey(ValueType const& type, void* key, std::string const& name, std::size_t at) {
    switch (type.m_kind) {
      case VK_TEXT: {
        const std::string text = name.substr(name.compare(0, 1, "$") == 0 ? 1 : 0);
        Charge(text.size());
        if (type.m_code == RC_STRING8) {
          *static_cast<string8*>(key) = text;
        } else {
          m_scanner.GoTo(at);
          std::u16string units = m_scanner.ReadString16();
          m_scanner.Expect(':');
          if (text.size() < name.size()) units.erase(0, 1);
          *static_cast<string16*>(key) = std::move(units);
        }
        return;
      }
      case VK_BOOL:
        if (name != "true" && name != "false") m_scanner.FailAt(at, "expected true or false");
        *static_cast<bool*>(key) = name == "true";
        return;
      case VK_ENUM:
        return SetJsonEnum(m_scanner, type, *static_cast<int32*>(key), name,
                           name.find_first_not_of("-0123456789") != std::string::npos, at);
      default:
        return SetJsonInteger(m_scanner, type, key, name, at);
    }
  }

  void GetPairs(ValueType const& type, void* map) {
    ClearContainer(type, map);
    EachElement([&] {
      m_scanner.Expect('[');
      void* const entry = Insert(type, map, m_scanner.Here(), [&](void* key) { Get(*type.m_key, key); });
      m_scanner.Expect(',');
      Get(*type.m_item, type.ItemOf(entry));
      m_scanner.Expect(']');
    });
  }

  // --- Classes

  void GetFields(ValueType const& type, void* object, bool isObject = false) {
    xvector<ValueField> const& fields = m_types.FieldsOf(type);
    xvector<bool> seen(fields.size());
    std::size_t next = 0;
    PathSource::OnWrite(object, Path());
    EachMember([&](std::string const& name, std::size_t at) {
      if (isObject && name == "$class") return m_scanner.SkipValue();
      if (next >= fields.size() || fields[next].m_name != name) {
        next = 0;
        while (next < fields.size() && fields[next].m_name != name) ++next;
      }
      if (next == fields.size()) {
        if (!m_limits.m_ignoreUnknown) m_scanner.FailAt(at, "no field " + name + " in " + type.m_text);
        return m_scanner.SkipValue();
      }
      if (seen[next]) m_scanner.FailAt(at, "repeated member " + name);
      seen[next] = true;
      GetField(*type.m_class, object, fields[next++], at);
    });
  }

  void GetField(ReflectedClass const& record, void* object, ValueField const& field, std::size_t at) {
    void* address = static_cast<octet_t*>(object) + field.m_offset;
    DGIndepNode* const node = IndepNodeAt(record, object, field);
    if (node) address = ValueBeforeNode(*node, *field.m_type);
    if (!address) m_scanner.FailAt(at, "field cannot be set: " + field.m_name);
    if (ModelHook::Any()) {
      ModelHook::Notify({ModelChange::Write, object, &record, Path(), field.m_name.c_str()});
    }
    DataSource::OnWrite(address, field.m_type->m_size, nullptr, nullptr);
    Get(*field.m_type, address);
    if (node) node->OnChange();
  }

  // --- Variants

  // The archive of one value: of an item's type, or as the bytes that stand for it.
  void ArchiveOne(Archive& ar, ValueType const* type) {
    if (type && type->m_code == RC_VOID) {
      if (!m_scanner.AcceptNull()) m_scanner.Fail("expected null");
    } else if (type) {
      CheckNoReferences(m_types, *type);
      const HeldValue value(*type);
      Get(*type, value.Get());
      WriteValue(ar, *type, value.Get());
    } else {
      m_scanner.Expect('{');
      ExpectName("$bytes");
      const std::size_t at = m_scanner.Here();
      const std::string digits = m_scanner.ReadString8();
      if (digits.size() % 2 != 0) m_scanner.FailAt(at, "expected pairs of hexadecimal digits");
      for (std::size_t i = 0; i < digits.size(); i += 2) {
        const std::size_t high = std::string_view(kHexDigits).find(digits[i]);
        const std::size_t low = std::string_view(kHexDigits).find(digits[i + 1]);
        if (!(high < 16 && low < 16)) m_scanner.FailAt(at, "expected pairs of hexadecimal digits");
        ar << static_cast<octet_t>(high << 4 | low);
      }
      m_scanner.Expect('}');
    }
  }

  // The whole variant from its archive.
  void SetFromArchive(Archive const& archive, ValueType const& type, void* address, std::size_t at) {
    try {
      InputArchive ar(archive);
      if (type.m_kind == VK_VARIANT) {
        ReadValue(ar, type, address);
      } else {
        static_cast<openvariant<int32>*>(address)->Deserialise(ar);
      }
      if (ar.Remaining() > 0) throw ArchiveError("bytes behind the value");
    } catch (ArchiveError const& error) {
      m_scanner.FailAt(at, error.what());
    }
  }

  void GetVariant(ValueType const& type, void* variant) {
    ReflectedVariant const& record = *type.m_variant;
    const std::size_t at = m_scanner.Here();
    Archive archive;
    int members = 0;
    EachMember([&](std::string const& name, std::size_t where) {
      if (members++ > 0) m_scanner.FailAt(where, "expected one item");
      ssize_t tag = 0;
      while (tag < record.m_numItems && JsonItemName(record.m_items[tag].m_name) != name) ++tag;
      if (tag == record.m_numItems) m_scanner.FailAt(where, "no item " + name + " in " + type.m_text);
      SerialiseVariableLengthUint(archive, tag);
      ArchiveOne(archive, m_types.ItemOf(record, tag));
    });
    if (members == 0) m_scanner.FailAt(at, "expected one item");
    SetFromArchive(archive, type, variant, at);
  }

  void GetOpenVariant(ValueType const& type, void* variant) {
    const std::size_t at = m_scanner.Here();
    Archive archive;
    if (m_scanner.AcceptNull()) {
      archive << xstring();
    } else {
      m_scanner.Expect('{');
      ExpectName("$type");
      const xstring name = m_scanner.ReadString8();
      if (!IsTypeAllowed(m_limits.m_allow, m_limits.m_allowType, name)) {
        m_scanner.FailAt(at, "type is not allowed: " + name);
      }
      ExpectNext("$value");
      archive << name;
      ArchiveOne(archive, JsonTypeOfName(m_types, name));
      m_scanner.Expect('}');
    }
    SetFromArchive(archive, type, variant, at);
  }

  // --- Objects

  // Makes all objects before any is read: they may refer to each other in any order.
  bool ReadObjects() {
    const std::size_t begin = m_scanner.Here();
    if (!m_scanner.Accept('{') || m_scanner.Peek() != '"' || m_scanner.ReadString8() != "$objects") {
      m_scanner.GoTo(begin);
      return false;
    }
    m_scanner.Expect(':');
    const std::size_t list = m_scanner.Here();
    EachElement([this] {
      const std::size_t at = m_scanner.Here();
      m_scanner.Expect('{');
      ExpectName("$class");
      Make(m_scanner.ReadString8(), at);
      m_scanner.GoTo(at);
      m_scanner.SkipValue();
    });
    m_scanner.GoTo(list);
    EachElement([this] {
      const Object object = m_objects[m_reader++];
      GetFields(m_types.Of(*object.m_record), object.m_self, true);
    });
    m_reader = 0;
    return true;
  }

  void Make(xstring const& name, std::size_t at) {
    ReflectedClass const* record = Find<ReflectedClass>(name);
    if (!record) m_scanner.FailAt(at, NotRegistered("class", name));
    const bool isObject = record->m_objectTable;
    if (!(isObject ? record->m_create != nullptr : record->m_ops.m_construct && record->m_ops.m_destruct)) {
      m_scanner.FailAt(at, "no class to create: " + name);
    }
    if (m_limits.m_allow && !m_limits.m_allow(*record)) m_scanner.FailAt(at, "class is not allowed: " + name);
    Charge(record->m_size);
    Object& object = m_objects.emplace_back();  // so that no object is without its place
    if (isObject) {
      object.m_object = record->m_create();
      object.m_self = object.m_object.Object();
    } else {
      object.m_self = ::operator new(record->m_size);
      try {
        record->m_ops.m_construct(object.m_self, 0, 1);
      } catch (...) {
        ::operator delete(std::exchange(object.m_self, nullptr));
        throw;
      }
    }
    object.m_record = record;
  }

  static void Destroy(Object const& object) {
    if (!object.m_self) return;
    if (object.m_object) return object.m_object->DestroyObject();
    object.m_record->m_ops.m_destruct(object.m_self, 0, 1);
    ::operator delete(object.m_self);
  }

  void GetReference(ValueType const& type, void* reference) {
    const std::size_t at = m_scanner.Here();
    if (m_scanner.AcceptNull()) return SetReference(type, reference, AnyInterface());
    m_scanner.Expect('{');
    ExpectName("$ref");
    const std::string_view text = m_scanner.ReadNumber();
    std::size_t number = 0;
    const char* const end = text.data() + text.size();
    if (std::from_chars(text.data(), end, number).ptr != end || number == 0 || number > m_objects.size()) {
      m_scanner.FailAt(at, "no such object");
    }
    m_scanner.Expect('}');
    Object const& object = m_objects[number - 1];
    AnyInterface any;
    if (type.m_code == RC_CREF) {
      if (object.m_record->m_name == type.m_target) any.m_self = object.m_self;
    } else if (ReflectedInterface const* record = Find<ReflectedInterface>(type.m_target)) {
      if (object.m_object) any = object.m_object->QueryInterface(*record);
    }
    if (!any.m_self) m_scanner.FailAt(at, xstring(object.m_record->m_name) + " is no " + type.m_target);
    SetReference(type, reference, any);
    m_references.push_back({m_reader, number});
  }
  // An object that the value does not lead to would be nobody's.
  void CheckReached() {
    std::sort(m_references.begin(), m_references.end());
    xvector<bool> reached(m_objects.size() + 1);
    xvector<std::size_t> pending = {0};
    while (!pending.empty()) {
      const std::size_t from = pending.back();
      pending.pop_back();
      auto at = std::lower_bound(m_references.begin(), m_references.end(), std::make_pair(from, std::size_t(0)));
      for (; at != m_references.end() && at->first == from; ++at) {
        if (!reached[at->second]) pending.push_back(at->second);
        reached[at->second] = true;
      }
    }
    for (std::size_t number = 1; number <= m_objects.size(); ++number) {
      if (!reached[number]) m_scanner.Fail(vxMakeString("object " << number << " is not reached from the value"));
    }
  }
  static void SetReference(ValueType const& type, void* reference, AnyInterface any) {
    if (type.m_code == RC_CREF) {
      *static_cast<cref<int32>*>(reference) = static_cast<int32*>(any.m_self);
    } else {
      *static_cast<pref<IObject>*>(reference) = pref<IObject>(ptr<IObject>(any));
    }
  }

  // After an error: references to objects that go are null again. Sets of references are emptied. It takes no memory,
  // of which there may be none: a class whose fields are not known was not reached.
  void Forget(ValueType const& type, void* address) {
    if (m_objects.empty()) return;
    if (type.m_kind == VK_REFERENCE) {
      void* const self = *static_cast<void**>(address);
      const bool goes =
          std::any_of(m_objects.begin(), m_objects.end(), [self](Object const& o) { return o.m_self == self; });
      if (goes) SetReference(type, address, AnyInterface());
    } else if (type.m_kind == VK_CLASS) {
      xvector<ValueField> const* fields = m_types.KnownFieldsOf(type);
      for (std::size_t i = 0; fields && i < fields->size(); ++i) {
        ValueField const& field = (*fields)[i];
        void* const at = static_cast<octet_t*>(address) + field.m_offset;
        if (!IndepNodeAt(*type.m_class, address, field)) Forget(*field.m_type, at);
      }
    } else if (type.m_kind == VK_SET || (type.m_key && type.m_key->m_kind == VK_REFERENCE)) {
      ClearContainer(type, address);
    } else if (type.m_kind == VK_LIST || type.m_kind == VK_MAP) {
      EachEntry(type, address, [&](void* entry) {
        Forget(*type.m_item, type.ItemOf(entry));
        return true;
      });
    }
  }

  ValueTypes& m_types;
  JsonScanner m_scanner;
  JsonLimits const& m_limits;
  JsonMemory m_memory;
  xvector<Object> m_objects;
  std::size_t m_reader = 0;                                   // the object that is read, by number; 0 for the value
  xvector<std::pair<std::size_t, std::size_t>> m_references;  // who leads to what
};

}  // namespace

void FromJson(Value const& value, std::string_view text, JsonLimits const& limits) {
  ValueType const& type = value.Type();
  JsonReader reader(*value.Types(), text, limits);
  value.Change([&] { reader.Read(type, value.Address()); });
}

}  // namespace vesk
