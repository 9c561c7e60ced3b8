// Values by name, and their text.

@import "Vesk/vxObject/JsonText.h"

#include <charconv>

namespace vesk {

struct Value::Owner {
  std::shared_ptr<Owner> m_outer;
  ReflectedClass const* m_record;  // null for a container
  void* m_object;
  xstring m_path;                     // from the outermost value to what is changed
  DGIndepNode* m_node = nullptr;      // of an `$indep` field
  std::function<void()> m_writeBack;  // of a value that is no object in memory
  std::shared_ptr<void> m_held;       // the same: where it stands meanwhile
};

Value::Value(ReflectedClass const& record, void* object)
    : m_types(std::make_shared<ValueTypes>()), m_type(&m_types->Of(record)), m_address(object) {}

Value::Value(ReflectedType const& type, void* address)
    : m_types(std::make_shared<ValueTypes>()), m_type(&m_types->Of(type)), m_address(address) {
  if (!m_type->m_forgotten.empty()) throw AccessError(NotRegistered("class", m_type->m_forgotten));
}

EValueKind Value::Kind() const { return m_address ? m_type->m_kind : VK_NONE; }

xstring Value::TypeName() const { return m_type ? m_type->m_text : xstring(); }

ReflectedClass const* Value::Class() const { return m_type ? m_type->m_class : nullptr; }

ValueType const& Value::Type() const {
  if (!m_address) throw AccessError("no value");
  return *m_type;
}

ssize_t Value::Count() const {
  switch (Kind()) {
    case VK_CLASS:
      return static_cast<ssize_t>(m_types->FieldsOf(*m_type).size());
    case VK_LIST:
    case VK_SET:
    case VK_MAP:
      return CountOf(*m_type, m_address);
    default:
      return 0;
  }
}

Value Value::Child(ValueType const* type, void* address, xstring const& name) const {
  Value child;
  child.m_types = m_types;
  child.m_type = type;
  child.m_address = address;
  child.m_owner = std::make_shared<Owner>();
  child.m_owner->m_outer = m_owner;
  child.m_owner->m_record = m_type->m_class;
  child.m_owner->m_object = m_address;
  child.m_owner->m_path = m_owner ? m_owner->m_path : xstring();
  if (!child.m_owner->m_path.empty() && name[0] != '[') child.m_owner->m_path += '.';
  child.m_owner->m_path += name;
  return child;
}

Value Value::FieldAt(ssize_t position) const {
  ValueField const& field = m_types->FieldsOf(*m_type)[position];
  Value child = Child(field.m_type, static_cast<octet_t*>(m_address) + field.m_offset, field.m_name);
  if (DGIndepNode* node = IndepNodeAt(*m_type->m_class, m_address, field)) {
    node->ReadBarrier();
    child.m_owner->m_node = node;
    child.m_address = ValueBeforeNode(*node, *field.m_type);
  }
  return child;
}

xstring Value::EntryName(ssize_t position, void* entry) const {
  if (m_type->m_kind == VK_LIST) return vxMakeString(position);
  return Child(m_type->m_key ? m_type->m_key : m_type->m_item, entry, xstring()).Text();
}

Value Value::EntryAt(ssize_t position, void* entry) const {
  Value child = Child(m_type->m_item, m_type->ItemOf(entry), '[' + EntryName(position, entry) + ']');
  if (m_type->m_code != RC_VECTOR || m_type->m_item->m_kind != VK_BOOL) return child;
  // A bit has no address.
  xvector<bool>& bits = *static_cast<xvector<bool>*>(m_address);
  const auto bit = std::make_shared<bool>(bits[position]);
  child.m_address = bit.get();
  child.m_owner->m_held = bit;
  child.m_owner->m_writeBack = [&bits, position, bit = bit.get()] { bits[position] = *bit; };
  return child;
}

void Value::Each(EachFunction const& each) const { EachOf(0, std::numeric_limits<ssize_t>::max(), each); }

void Value::EachOf(ssize_t first, ssize_t count, EachFunction const& each) const {
  const EValueKind kind = Kind();
  ssize_t position = std::max<ssize_t>(first, 0);
  const ssize_t end = position + std::min(count, std::numeric_limits<ssize_t>::max() - position);
  if (kind == VK_CLASS) {
    xvector<ValueField> const& fields = m_types->FieldsOf(*m_type);
    const ssize_t last = std::min(end, static_cast<ssize_t>(fields.size()));
    for (; position < last && each(fields[position].m_name, FieldAt(position)); ++position) {
    }
  } else if (kind == VK_LIST || kind == VK_SET || kind == VK_MAP) {
    ssize_t skipped = 0;
    EachEntry(*m_type, m_address, [&](void* entry) {
      if (skipped < first) return ++skipped > 0;
      if (position >= end) return false;
      const bool goesOn = each(EntryName(position, entry), EntryAt(position, entry));
      ++position;
      return goesOn;
    });
  }
}

Value Value::Archived(ValueType const* type, InputArchive& ar) const {
  if (!type || type->m_size == 0) return Value();
  CheckNoReferences(*m_types, *type);
  const auto held = std::make_shared<HeldValue>(*type);
  ReadValue(ar, *type, held->Get());
  Value value;
  value.m_types = m_types;
  value.m_type = type;
  value.m_address = held->Get();
  value.m_owner = std::make_shared<Owner>();
  value.m_owner->m_held = held;
  return value;
}

Value Value::Target(xstring* name) const {
  Value target;
  const EValueKind kind = Kind();
  if (kind == VK_REFERENCE) {
    target.m_types = m_types;
    target.m_address = *static_cast<void* const*>(m_address);
    if (!target) return Value();
    target.m_type =
        m_type->m_code == RC_CREF
            ? &m_types->Of(NamedType(RC_CLASS, m_type->m_target.c_str()))
            : &m_types->Of(
                  *JsonObjectOf(m_type->m_target, *static_cast<AnyInterface*>(m_address))->GetReflectedClass());
    if (name) *name = target.TypeName();
    return target;
  }
  if (kind != VK_VARIANT && kind != VK_OPENVARIANT) return Value();
  Archive archive;
  if (kind == VK_OPENVARIANT) {
    static_cast<openvariant<int32> const*>(m_address)->Serialise(archive);
  } else {
    WriteValue(archive, *m_type, m_address);
  }
  InputArchive ar(archive);
  if (kind == VK_OPENVARIANT) {
    xstring type;
    ar >> type;
    if (!type.empty()) target = Archived(JsonTypeOfName(*m_types, type), ar);
    if (name) *name = type;
  } else {
    ssize_t tag;
    DeserialiseVariableLengthUint(ar, tag);
    if (tag >= m_type->m_variant->m_numItems) throw AccessError("no such item in " + m_type->m_text);
    target = Archived(m_types->ItemOf(*m_type->m_variant, tag), ar);
    if (name) *name = xstring(JsonItemName(m_type->m_variant->m_items[tag].m_name));
  }
  return target;
}

Value Value::Dep(ReflectedDepField const& field) const {
  if (Kind() != VK_CLASS) throw AccessError("no class");
  if (!field.m_type) return Value();
  ReflectedClass const& record = *m_type->m_class;
  return Child(&m_types->Of(DecodeType({field.m_type, record.m_strings})),
               static_cast<octet_t*>(m_address) + field.m_valueOffset, field.m_name);
}

Value Value::At(ssize_t position) const {
  if (position < 0 || position >= Count()) throw AccessError("no such position");
  if (m_type->m_kind == VK_CLASS) return FieldAt(position);
  return EntryAt(position, EntryOf(*m_type, m_address, position));
}

xstring Value::Name(ssize_t position) const {
  if (position < 0 || position >= Count()) throw AccessError("no such position");
  if (m_type->m_kind == VK_CLASS) return m_types->FieldsOf(*m_type)[position].m_name;
  return EntryName(position, EntryOf(*m_type, m_address, position));
}

bool Value::IsNamed(void* entry, std::string_view name) const {
  ValueType const& key = m_type->m_key ? *m_type->m_key : *m_type->m_item;
  if (key.m_code == RC_STRING8) return *static_cast<string8 const*>(entry) == name;
  return EntryName(0, entry) == name;
}

Value Value::FindChild(std::string_view name) const {
  const EValueKind kind = Kind();
  Value found;
  if (kind == VK_CLASS) {
    xvector<ValueField> const& fields = m_types->FieldsOf(*m_type);
    const auto field = std::find_if(fields.begin(), fields.end(), [name](auto const& f) { return f.m_name == name; });
    if (field != fields.end()) found = FieldAt(field - fields.begin());
  } else if (kind == VK_LIST) {
    ssize_t position = -1;
    std::from_chars(name.data(), name.data() + name.size(), position);
    if (position >= 0 && position < Count() && vxMakeString(position) == name) found = At(position);
  } else if (kind == VK_SET || kind == VK_MAP) {
    ssize_t position = 0;
    EachEntry(*m_type, m_address, [&](void* entry) {
      if (!IsNamed(entry, name)) return ++position > 0;
      found = EntryAt(position, entry);
      return false;
    });
  }
  return found;
}

Value Value::Find(std::string_view path) const {
  Value at = *this;
  while (at && !path.empty()) {
    std::size_t end;
    std::string_view name;
    if (path[0] == '[') {
      end = path.find(']');
      if (end == std::string_view::npos) return Value();
      name = path.substr(1, end++ - 1);
    } else {
      if (path[0] == '.') path.remove_prefix(1);
      end = std::min(path.find_first_of(".["), path.size());
      name = path.substr(0, end);
    }
    path.remove_prefix(end);
    at = at.FindChild(name);
  }
  return at;
}

void Value::CheckType(ReflectedType const& type) const {
  if (Type().m_text != vxMakeString(PlainType(type))) {
    throw AccessError(m_type->m_text + " is no " + vxMakeString(PlainType(type)));
  }
}

void Value::Change(std::function<void()> const& write) const {
  if (!m_address) throw AccessError("no value");
  for (Owner const* owner = m_owner.get(); owner; owner = owner->m_outer.get()) {
    if (owner->m_held && !owner->m_writeBack) throw AccessError("a copy of what a variant holds");
  }
  for (Owner const* owner = m_owner.get(); owner; owner = owner->m_outer.get()) {
    if (!owner->m_outer && ModelHook::Any()) {
      ModelHook::Notify({ModelChange::Write, owner->m_object, owner->m_record, Path(), m_owner->m_path.c_str()});
    }
    if (owner->m_record) PathSource::OnWrite(owner->m_object, Path());
  }
  DataSource::OnWrite(m_address, m_type->m_size, nullptr, nullptr);
  write();
  for (Owner const* owner = m_owner.get(); owner; owner = owner->m_outer.get()) {
    if (owner->m_writeBack) owner->m_writeBack();
    if (owner->m_node) owner->m_node->OnChange();
  }
}

// --- Text

namespace {

void PrintText(xostream& os, Value const& value) {
  if (!value) {
    os << '?';
    return;
  }
  ValueType const& type = value.Type();
  if (type.m_kind == VK_ENUM) {
    PrintEnum(os, type.m_enum, *static_cast<int32 const*>(value.Address()));
  } else if (type.m_kind == VK_OPENVARIANT) {
    os << *static_cast<openvariant<int32> const*>(value.Address());
  } else if (type.m_kind == VK_REFERENCE) {
    os << *static_cast<void* const*>(value.Address());
  } else if (type.m_ops && type.m_ops->m_print) {
    type.m_ops->m_print(os, value.Address());
  } else if (type.m_kind == VK_NONE || type.m_kind == VK_VARIANT) {
    os << '?';
  } else {
    const bool isClass = type.m_kind == VK_CLASS;
    if (isClass) os << type.m_text;
    os << (isClass ? '(' : '[');
    bool isFirst = true;
    value.Each([&](xstring const& name, Value const& item) {
      if (!std::exchange(isFirst, false)) os << ',';
      if (type.m_kind == VK_MAP) os << '(' << name << ',';
      PrintText(os, item);
      if (type.m_kind == VK_MAP) os << ')';
      return true;
    });
    os << (isClass ? ')' : ']');
  }
}

// Values inside values are few levels deep: only references lead further, and they are not followed.
void PrintDump(xostream& os, Value const& value) {
  const EValueKind kind = value.Kind();
  if (kind == VK_TEXT) {
    os << " = \"" << value.Text() << "\"\n";
    return;
  }
  if (kind != VK_CLASS && kind != VK_LIST && kind != VK_MAP) {
    os << " = " << value.Text() << '\n';
    return;
  }
  os << ": " << value.TypeName();
  if (kind != VK_CLASS) os << ", " << value.Count();
  os << '\n';
  os.ChangeIndent(4);
  value.Each([&](xstring const& name, Value const& item) {
    os << (kind == VK_CLASS ? name : xstring('[' + name + ']'));
    PrintDump(os, item);
    return true;
  });
  os.ChangeIndent(-4);
}

}  // namespace

xstring Value::Text() const {
  return TextOf([this](xostream& os) { PrintText(os, *this); });
}

xstring DumpText(Value const& value) {
  return TextOf([&value](xostream& os) {
    os << "value";
    PrintDump(os, value);
  });
}

// --- Methods

ReflectedClassMethod const* FindMethod(ReflectedClass const& record, std::string_view name) {
  for (ssize_t i = 0; i < record.m_numMethods; ++i) {
    if (record.m_methods[i].m_name == name) return &record.m_methods[i];
  }
  return nullptr;
}

void CheckMethod(ReflectedClass const& record, ReflectedClassMethod const& method, ReflectedType const& result,
                 xvector<ReflectedType> const& arguments, bool isConst) {
  auto text = [&record](octet_t const* code) {
    return code ? vxMakeString(PlainType(DecodeType({code, record.m_strings}))) : xstring("void");
  };
  const xstring name = vxMakeString(record.m_name << "::" << method.m_name);
  auto compare = [&name](xstring const& what, xstring const& has, ReflectedType const& given) {
    const xstring asked = vxMakeString(PlainType(given));
    if (has != asked) throw AccessError(name + ": " + what + " is " + has + ", not " + asked);
  };
  if (isConst && !method.m_isConst) throw AccessError(name + " is not const");
  if (method.m_numArgs != static_cast<ssize_t>(arguments.size())) {
    throw AccessError(vxMakeString(name << " takes " << method.m_numArgs << " arguments, not " << arguments.size()));
  }
  compare("the result", text(method.m_return.m_type), result);
  for (ssize_t i = 0; i < method.m_numArgs; ++i) {
    compare(method.m_args[i].m_name, text(method.m_args[i].m_type), arguments[i]);
  }
}

}  // namespace vesk
