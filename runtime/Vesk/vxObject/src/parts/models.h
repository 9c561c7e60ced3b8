// Paths as text, the hooks of models, the release of an archive.

@import "Vesk/vxObject/Model.h"

#include <algorithm>

namespace vesk {

namespace {

class PathPrinter {
 public:
  PathPrinter(xostream& os, Path const& path)
      : m_os(os), m_bytes(xvector<octet_t>(path.Data(), path.Data() + path.Size())) {
    m_bytes.m_hostOrder = true;
    m_bytes.m_limits.m_anyEnumNumber = true;
  }

  void Print(ReflectedClass const& record) {
    ReflectedModelField const* field = ReadField(record);
    if (!field) return;
    m_os << field->m_name;
    PrintInside(DecodeType({field->m_type, record.m_strings}));
  }

 private:
  // The positions of a class that references a model are those of the model.
  ReflectedModelField const* ReadField(ReflectedClass const& record) {
    if (m_bytes.Remaining() == 0) return nullptr;
    if (record.m_flags & CF_REFERENCES_MODEL) {
      ReflectedClass const* model = Find<ReflectedClass>(record.m_modelFields[record.m_numModelFields - 1].m_name);
      if (model) Print(*model);
      return nullptr;
    }
    ssize_t position;
    DeserialiseVariableLengthUint(m_bytes, position);
    return position < record.m_numModelFields ? &record.m_modelFields[position] : nullptr;
  }

  void PrintInside(ReflectedType const& type) {
    if (m_bytes.Remaining() == 0) return;
    if (type.m_code >= RC_VOLATILE && type.m_code <= RC_OFFSETTABLE) return PrintInside(type.m_inner.front());
    if (type.m_code == RC_CLASS) {
      ReflectedClass const* record = Find<ReflectedClass>(type.m_name);
      m_os << '.';
      if (record) Print(*record);
    } else if (type.m_code == RC_ARRAY || type.m_code == RC_DYNARRAY) {
      ssize_t index;
      DeserialiseVariableLengthUint(m_bytes, index);
      m_os << '[' << index << ']';
      PrintInside(type.m_inner.front());
    } else if (type.m_code == RC_MAP || type.m_code == RC_SET) {
      m_os << '[';
      PrintKey(type.m_inner.front());
      m_os << ']';
      PrintInside(type.m_inner.back());
    }
  }

  void PrintKey(ReflectedType const& type) {
    if (type.m_code == RC_ENUM) {
      int32 value;
      m_bytes.Read(&value, sizeof(value));
      return PrintValue(m_os, type, &value);
    }
    if (type.m_code == RC_PREF || type.m_code == RC_CREF) {
      void* object;
      m_bytes.Read(&object, sizeof(object));
      m_os << object;
      return;
    }
    TypeOps const* ops = FindTypeOps(type);
    if (!ops || !ops->m_construct || !ops->m_deserialise) return;
    void* key = ::operator new(ops->m_size);
    ops->m_construct(key, 0, 1);
    ops->m_deserialise(m_bytes, key, 0, 1);
    ops->m_print(m_os, key);
    ops->m_destruct(key, 0, 1);
    ::operator delete(key);
  }

  xostream& m_os;
  InputArchive m_bytes;
};

}  // namespace

xstring PathText(ReflectedClass const& record, Path const& path) {
  return TextOf([&](xostream& os) { PathPrinter(os, path).Print(record); });
}

// --- Hooks

xstring ModelChange::PathText() const {
  return m_name || !m_class ? xstring(m_name ? m_name : "") : vesk::PathText(*m_class, m_path);
}

ModelHook::ModelHook(Function function) : m_hooks(Hooks::Get()), m_called(new Called) {
  m_called->m_function = std::move(function);
  m_called->m_serial = ++m_hooks.m_lastSerial;
  m_hooks.m_list.Append(*m_called);
  m_hooks.Use();
}
ModelHook::~ModelHook() {
  m_called->m_isOver = true;
  Release(*m_called);
  m_hooks.Release();
}

void ModelHook::Release(Called const& called) {
  Called& own = const_cast<Called&>(called);
  if (--own.m_users == 0) delete &own;
}

struct ModelHook::Use {
  explicit Use(DGPlace const* place) : m_called(const_cast<Called&>(*static_cast<Called const*>(place))) {
    ++m_called.m_users;
  }
  ~Use() { Release(m_called); }
  Called& m_called;
};

// Those that are made meanwhile are not called.
void ModelHook::Notify(ModelChange const& change) {
  Hooks& hooks = Hooks::Get();
  const std::size_t last = hooks.m_lastSerial;
  for (DGPlace const* at = hooks.m_list.First(); at != hooks.m_list.End();) {
    const Use use(at);
    if (use.m_called.m_serial > last) break;
    if (!use.m_called.m_isOver) use.m_called.m_function(change);
    at = at->m_next;
  }
}

}  // namespace vesk
