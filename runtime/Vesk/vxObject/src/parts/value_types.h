// Types resolved against the registry, and values of them.

@import "Vesk/vxObject/ValueTypes.h"

namespace vesk {

namespace {

EValueKind KindOf(octet_t code) {
  if (code == RC_VOID) return VK_NONE;
  if (code == 1) return VK_BOOL;
  if (code <= 6) return VK_INT;
  if (code <= 11) return VK_UINT;
  if (code <= 13) return VK_FLOAT;
  if (code <= 15) return VK_CHAR;
  if (code <= RC_STRING16) return VK_TEXT;
  switch (code) {
    case RC_CLASS:
      return VK_CLASS;
    case RC_ENUM:
      return VK_ENUM;
    case RC_VARIANT:
      return VK_VARIANT;
    case RC_OPENVARIANT:
      return VK_OPENVARIANT;
    case RC_PREF:
    case RC_CREF:
      return VK_REFERENCE;
    case RC_VECTOR:
    case RC_DEQUE:
    case RC_LIST:
    case RC_DYNARRAY:
    case RC_ARRAY:
      return VK_LIST;
    case RC_SET:
    case RC_BAG:
      return VK_SET;
    case RC_MAP:
      return VK_MAP;
  }
  return VK_NONE;
}

// What stands behind const, decorators and typedefs.
ReflectedType Bare(ReflectedType type) {
  type = PlainType(std::move(type));
  while (type.m_code >= RC_VOLATILE && type.m_code <= RC_OFFSETTABLE) {
    ReflectedType inner = std::move(type.m_inner.front());
    type = std::move(inner);
  }
  return type;
}

template <typename C>
void SetLayout(ValueType& type) {
  type.m_size = sizeof(C);
  type.m_align = alignof(C);
}

void SetOps(ValueType& type, TypeOps const& ops) {
  type.m_ops = &ops;
  type.m_size = ops.m_size;
  type.m_align = AlignmentOf(ops);
}

}  // namespace

template <typename Fill>
ValueType const& ValueTypes::Add(xstring const& text, Fill fill) {
  const auto [at, isNew] = m_types.insert({text, ValueType()});
  if (!isNew) return at->second;
  try {
    at->second.m_text = text;
    fill(at->second);
  } catch (...) {
    m_types.erase(at);
    throw;
  }
  return at->second;
}

ValueType const& ValueTypes::Of(ReflectedType const& declared) {
  const ReflectedType plain = Bare(declared);
  return Add(vxMakeString(plain), [&](ValueType& type) { Resolve(type, plain); });
}

ValueType const& ValueTypes::Of(ReflectedClass const& record) {
  return Add(record.m_name, [&](ValueType& type) {
    type.m_code = RC_CLASS;
    type.m_kind = VK_CLASS;
    type.m_class = &record;
    SetOps(type, record.m_ops);
  });
}

void ValueTypes::Resolve(ValueType& type, ReflectedType const& plain) {
  type.m_code = plain.m_code;
  type.m_kind = KindOf(plain.m_code);
  switch (type.m_kind) {
    case VK_CLASS:
      type.m_class = vesk::Find<ReflectedClass>(plain.m_name);
      if (type.m_class) return SetOps(type, type.m_class->m_ops);
      break;
    case VK_VARIANT:
      type.m_variant = vesk::Find<ReflectedVariant>(plain.m_name);
      if (type.m_variant) return SetOps(type, type.m_variant->m_ops);
      break;
    case VK_ENUM:
      type.m_enum = vesk::Find<ReflectedEnum>(plain.m_name);
      return SetLayout<int32>(type);
    case VK_OPENVARIANT:
      return SetLayout<openvariant<int32>>(type);
    case VK_REFERENCE:
      type.m_target = Bare(plain.m_inner.front()).m_name;
      return plain.m_code == RC_PREF ? SetLayout<pref<IObject>>(type) : SetLayout<cref<int32>>(type);
    case VK_LIST:
    case VK_SET:
    case VK_MAP:
      return ResolveContainer(type, plain);
    case VK_NONE:
      if (plain.m_code == RC_PTR) SetLayout<ptr<IObject>>(type);
      if (plain.m_code == RC_POINTER) SetLayout<void*>(type);
      return;
    default:
      return SetOps(type, *FindTypeOps(plain));
  }
  type.m_kind = VK_NONE;
  type.m_forgotten = plain.m_name;
}

void ValueTypes::ResolveContainer(ValueType& type, ReflectedType const& plain) {
  type.m_item = &Of(plain.m_inner.back());
  if (type.m_kind == VK_MAP) type.m_key = &Of(plain.m_inner.front());
  if (type.m_item->m_size == 0 || (type.m_key && type.m_key->m_size == 0)) {
    type.m_kind = VK_NONE;
    type.m_forgotten = type.m_key && type.m_key->m_size == 0 ? type.m_key->m_forgotten : type.m_item->m_forgotten;
    return;
  }
  switch (type.m_code) {
    case RC_ARRAY:
      type.m_count = plain.m_size;
      type.m_size = plain.m_size * type.m_item->m_size;
      type.m_align = type.m_item->m_align;
      return;
    case RC_VECTOR:
      return type.m_item->m_kind == VK_BOOL ? SetLayout<xvector<bool>>(type) : SetLayout<xvector<octet_t>>(type);
    case RC_DEQUE:
      return SetLayout<xdeque<octet_t>>(type);
    case RC_LIST:
      return SetLayout<xlist<octet_t>>(type);
    case RC_DYNARRAY:
      return SetLayout<DynArray<octet_t>>(type);
    default:
      return SetLayout<xset<octet_t>>(type);
  }
}

xvector<ValueField> const& ValueTypes::FieldsOf(ValueType const& type) {
  if (xvector<ValueField> const* fields = KnownFieldsOf(type)) return *fields;
  xvector<ValueField> fields;
  AddFields(fields, *type.m_class, 0);
  return m_fields[type.m_class] = std::move(fields);
}

xvector<ValueField> const* ValueTypes::KnownFieldsOf(ValueType const& type) const {
  const auto at = m_fields.find(type.m_class);
  return at == m_fields.end() ? nullptr : &at->second;
}

void ValueTypes::AddFields(xvector<ValueField>& fields, ReflectedClass const& record, ssize_t offset) {
  for (ssize_t i = 0; i < record.m_numFields; ++i) {
    ReflectedField const& field = record.m_fields[i];
    fields.push_back({field.m_name, offset + field.m_offset, &Of(DecodeType({field.m_type, record.m_strings}))});
  }
  for (ssize_t i = 0; i < record.m_numModelFields; ++i) {
    ReflectedModelField const& field = record.m_modelFields[i];
    if (field.m_offset < 0) continue;
    if (field.m_type) {
      fields.push_back({field.m_name, offset + field.m_offset, &Of(DecodeType({field.m_type, record.m_strings}))});
    } else if (ReflectedClass const* model = vesk::Find<ReflectedClass>(field.m_name)) {
      AddFields(fields, *model, offset + field.m_offset);
    }
  }
}

ValueType const* ValueTypes::ItemOf(ReflectedVariant const& record, ssize_t item) {
  octet_t const* code = record.m_items[item].m_type;
  return code ? &Of(DecodeType({code, record.m_strings})) : nullptr;
}

// --- Values

void MakeValue(ValueType const& type, void* address) {
  switch (type.m_kind) {
    case VK_TEXT:
    case VK_CLASS:
    case VK_VARIANT:
      if (!type.m_ops->m_construct) throw AccessError("no default constructor: " + type.m_text);
      return type.m_ops->m_construct(address, 0, 1);
    case VK_LIST:
    case VK_SET:
    case VK_MAP:
      return MakeContainer(type, address);
    case VK_OPENVARIANT:
      new (address) openvariant<int32>();
      return;
    default:
      std::memset(address, 0, type.m_size);  // numbers and null references
  }
}

void DestroyValue(ValueType const& type, void* address) {
  switch (type.m_kind) {
    case VK_TEXT:
    case VK_CLASS:
    case VK_VARIANT:
      if (type.m_ops->m_destruct) type.m_ops->m_destruct(address, 0, 1);
      return;
    case VK_LIST:
    case VK_SET:
    case VK_MAP:
      return DestroyContainer(type, address);
    case VK_OPENVARIANT:
      static_cast<openvariant<int32>*>(address)->~openvariant<int32>();
      return;
    default:
      return;
  }
}

bool LessValue(ValueType const& type, void const* a, void const* b) {
  switch (type.m_kind) {
    case VK_ENUM:
      return *static_cast<int32 const*>(a) < *static_cast<int32 const*>(b);
    case VK_OPENVARIANT:
      return *static_cast<openvariant<int32> const*>(a) < *static_cast<openvariant<int32> const*>(b);
    case VK_NONE:
    case VK_REFERENCE:  // by the object, which comes first
      return std::less<void*>()(*static_cast<void* const*>(a), *static_cast<void* const*>(b));
    case VK_LIST:
    case VK_SET:
    case VK_MAP: {
      xvector<void*> entries[2];
      for (int side : {0, 1}) {
        EachEntry(type, const_cast<void*>(side ? b : a), [&](void* entry) {
          entries[side].push_back(entry);
          return true;
        });
      }
      return std::lexicographical_compare(
          entries[0].begin(), entries[0].end(), entries[1].begin(), entries[1].end(), [&type](void* x, void* y) {
            if (!type.m_key) return LessValue(*type.m_item, x, y);
            if (LessValue(*type.m_key, x, y)) return true;
            return !LessValue(*type.m_key, y, x) && LessValue(*type.m_item, type.ItemOf(x), type.ItemOf(y));
          });
    }
    default:
      if (!type.m_ops->m_less) throw AccessError("no order: " + type.m_text);
      return type.m_ops->m_less(a, b);
  }
}

// --- Archives

void WriteValue(Archive& ar, ValueType const& type, void* address) {
  if (type.m_kind == VK_ENUM) {
    SerialiseVariableLengthUint(ar, *static_cast<uint32 const*>(address));
  } else if (type.m_ops) {
    if (!type.m_ops->m_serialise) throw AccessError("type cannot be archived: " + type.m_text);
    type.m_ops->m_serialise(ar, address, 0, 1);
  } else if (type.m_item) {
    SerialiseVariableLengthUint(ar, CountOf(type, address));
    EachEntry(type, address, [&](void* entry) {
      if (type.m_key) WriteValue(ar, *type.m_key, entry);
      WriteValue(ar, *type.m_item, type.ItemOf(entry));
      return true;
    });
  } else {
    throw AccessError("type cannot be archived by itself: " + type.m_text);
  }
}

void ReadValue(InputArchive& ar, ValueType const& type, void* address) {
  if (type.m_kind == VK_ENUM) {
    return DeserialiseVariableLengthUint(ar, *static_cast<int32*>(address));
  }
  if (type.m_ops) {
    if (!type.m_ops->m_deserialise) throw AccessError("type cannot be archived: " + type.m_text);
    return type.m_ops->m_deserialise(ar, address, 0, 1);
  }
  if (!type.m_item) throw AccessError("type cannot be archived by itself: " + type.m_text);
  ssize_t count;
  DeserialiseVariableLengthUint(ar, count);
  if (count > static_cast<ssize_t>(ar.Remaining())) throw ArchiveError("container longer than its archive");
  if (type.m_kind == VK_LIST) {
    if (type.m_code != RC_ARRAY) ResizeList(type, address, count);
    if (count != CountOf(type, address)) throw ArchiveError("fixed array of another size");
    ssize_t position = 0;
    EachEntry(type, address, [&](void* element) {
      ReadValue(ar, *type.m_item, element);
      if (type.m_code == RC_VECTOR && type.m_item->m_kind == VK_BOOL) {
        (*static_cast<xvector<bool>*>(address))[position++] = *static_cast<bool*>(element);
      }
      return true;
    });
    return;
  }
  ClearContainer(type, address);
  for (ssize_t i = 0; i < count; ++i) {
    void* entry =
        InsertEntry(type, address, [&](void* key) { ReadValue(ar, type.m_key ? *type.m_key : *type.m_item, key); });
    if (!entry) throw ArchiveError("repeated key");
    if (type.m_key) ReadValue(ar, *type.m_item, type.ItemOf(entry));
  }
}

// --- `$indep` fields

namespace {

// The value of a node whose class visits it.
struct ValueSeeker : IObjectVisitor {
  void VisitObject(ptr<IObject> const&) override {}
};

}  // namespace

DGIndepNode* IndepNodeAt(ReflectedClass const& record, void* object, ValueField const& field) {
  if (field.m_offset + sizeof(DGIndepNode) > record.m_size) return nullptr;
  return IndepNodeAt(static_cast<octet_t*>(object) + field.m_offset);
}

// The value is the last thing before its node: at the node's address less its size, or somewhat further away where the
// node's alignment is larger; then the node's own visit tells.
void* ValueBeforeNode(DGIndepNode& node, ValueType const& type) {
  octet_t* const end = static_cast<octet_t*>(static_cast<void*>(&node));
  if (type.m_size % alignof(DGIndepNode) == 0) return end - type.m_size;
  ValueSeeker seeker;
  seeker.m_seeks = true;
  node.VisitContainingObject(seeker);
  octet_t* const value = static_cast<octet_t*>(const_cast<void*>(seeker.m_found));
  const bool isNear = value && value + type.m_size <= end && value + type.m_size + alignof(DGIndepNode) > end;
  return isNear ? value : nullptr;
}

}  // namespace vesk
