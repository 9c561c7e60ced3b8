// What stands between a model's fields and those who use them: each read and write of a field in a model mixin passes a
// barrier. A read inside a calculation of the dependency graph makes the field an input of it, a write makes its
// readers dirty, and the hooks see each write just before it happens: with its path where the class generates
// operations, with its name where it does not.

@import "Vesk/vxObject/Graph.h"
@import "Vesk/vxObject/Path.h"

#include <functional>

namespace vesk {

// --- Hooks

struct ModelChange {
  enum EKind {
    Write,  // through an accessor without operations: m_name, no path
    Assign,
    Offset,  // by a difference
    Insert,  // into a vector or set
    Delete
  };
  EKind m_kind;
  void const* m_object;           // null where the barrier knows no object
  ReflectedClass const* m_class;  // null for a class without a record
  Path m_path;
  ConstStringZ m_name;  // null with a path

  // "lines[2].amount", or the name.
  xstring PathText() const {
    return m_name || !m_class ? xstring(m_name ? m_name : "") : vesk::PathText(*m_class, m_path);
  }
};

// Calls a function with each change while it lives.
class ModelHook {
 public:
  typedef std::function<void(ModelChange const&)> Function;
  explicit ModelHook(Function function) : m_function(std::move(function)) { Hooks().push_back(this); }
  ~ModelHook() { Hooks().remove(this); }
  ModelHook(ModelHook const&) = delete;
  void operator=(ModelHook const&) = delete;

  static void Notify(ModelChange const& change) {
    for (ModelHook* hook : std::list<ModelHook*>(Hooks())) hook->m_function(change);
  }
  static bool Any() { return !Hooks().empty(); }

 private:
  static std::list<ModelHook*>& Hooks() {
    static std::list<ModelHook*> hooks;
    return hooks;
  }
  Function m_function;
};

// --- Sources: the fields that calculations have read. A source lives as long as someone depends on it.

class DataSource : public DGIndepNode {
 public:
  xstring Name() const override { return m_name; }

  // A calculation read the memory [begin, begin + size).
  static void OnRead(void const* begin, std::size_t size, ConstStringZ name) {
    if (!Calculating()) return;
    octet_t const* address = static_cast<octet_t const*>(begin);
    for (auto [at, end] = ByAddress().equal_range(address); at != end; ++at) {
      if (at->second->m_size == size) return at->second->Link();
    }
    MostBytes() = std::max(MostBytes(), size);
    (new DataSource(address, size, name))->Link();
  }

  // That memory changes. An element in memory of its own (of a map, of a dynamic array) and its container are told
  // apart from other fields by the name, up to the first index.
  static void OnWrite(void const* begin, std::size_t size, ConstStringZ name) {
    if (ByAddress().empty()) return;
    octet_t const* address = static_cast<octet_t const*>(begin);
    xvector<DGNode const*> readers;
    auto at = ByAddress().lower_bound(address - MostBytes());
    for (; at != ByAddress().end() && at->first < address + size; ++at) {
      DataSource const& source = *at->second;
      if (source.m_address + source.m_size > address) source.AddDependents(readers);
    }
    if (name) {
      for (auto [near, end] = ByField().equal_range(FieldOf(name)); near != end; ++near) {
        if (near->second->m_name != name) near->second->AddDependents(readers);
      }
    }
    for (DGNode const* reader : readers) Dirty(reader);
  }

 private:
  typedef std::multimap<octet_t const*, DataSource*> AddressMap;
  typedef std::multimap<std::string_view, DataSource*> FieldMap;

  DataSource(octet_t const* address, std::size_t size, ConstStringZ name)
      : m_address(address),
        m_size(size),
        m_name(name),
        m_byAddress(ByAddress().insert({address, this})),
        m_byField(ByField().insert({FieldOf(m_name), this})) {}
  ~DataSource() override {
    ByAddress().erase(m_byAddress);
    ByField().erase(m_byField);
  }
  void OnNoDependents() const override { delete this; }
  void AddDependents(xvector<DGNode const*>& readers) const {
    readers.insert(readers.end(), Dependents().begin(), Dependents().end());
  }
  static std::string_view FieldOf(std::string_view name) { return name.substr(0, name.find('[')); }
  static AddressMap& ByAddress() {
    static AddressMap* const map = new AddressMap;
    return *map;
  }
  static FieldMap& ByField() {
    static FieldMap* const map = new FieldMap;
    return *map;
  }
  static std::size_t& MostBytes() {
    static std::size_t most = 0;
    return most;
  }

  octet_t const* m_address;
  std::size_t m_size;
  std::string m_name;
  AddressMap::iterator m_byAddress;
  FieldMap::iterator m_byField;
};

// The same for models with operations, whose fields are known by object and path.
class PathSource : public DGIndepNode {
 public:
  xstring Name() const override { return "model field"; }

  static void OnRead(void const* object, Path const& path) {
    if (!Calculating()) return;
    for (PathSource* source : ByObject()[object]) {
      if (source->m_path == path) return source->Link();
    }
    (new PathSource(object, path))->Link();
  }

  static void OnWrite(void const* object, Path const& path) {
    const auto at = ByObject().find(object);
    if (at == ByObject().end()) return;
    xvector<DGNode const*> readers;
    for (PathSource* source : at->second) {
      if (!source->m_path.Holds(path) && !path.Holds(source->m_path)) continue;
      readers.insert(readers.end(), source->Dependents().begin(), source->Dependents().end());
    }
    for (DGNode const* reader : readers) Dirty(reader);
  }

 private:
  typedef std::map<void const*, std::list<PathSource*>> ObjectMap;

  PathSource(void const* object, Path const& path) : m_object(object), m_path(path) {
    ByObject()[object].push_back(this);
  }
  ~PathSource() override {
    const auto at = ByObject().find(m_object);
    at->second.remove(this);
    if (at->second.empty()) ByObject().erase(at);
  }
  void OnNoDependents() const override { delete this; }
  static ObjectMap& ByObject() {
    static ObjectMap* const map = new ObjectMap;
    return *map;
  }

  void const* m_object;
  Path m_path;
};

// --- Barriers

template <typename T>
using ClassRecordExpression = decltype(static_cast<ReflectedClass const&>(_GetReflected(std::declval<T const*>())));

template <typename T>
ReflectedClass const* RecordOf() {
  if constexpr (Detects<ClassRecordExpression, T>) return &_GetReflected(static_cast<T const*>(nullptr));
  return nullptr;
}

template <typename T>
void NotifyHooks(ModelChange::EKind kind, T* object, Path const& path, ConstStringZ name) {
  if (ModelHook::Any()) ModelHook::Notify({kind, object, RecordOf<T>(), path, name});
}

template <typename E, typename T>
void DataSourceReadBarrier(E const* field, T const*, ConstStringZ name) {
  DataSource::OnRead(field, sizeof(E), name);
}
template <typename E>
void DataSourceReadBarrier(E const* field, NullInterface, ConstStringZ name) {
  DataSource::OnRead(field, sizeof(E), name);
}
template <typename E, typename T>
void DataSourceWriteBarrier(E* field, T* object, ConstStringZ name) {
  NotifyHooks(ModelChange::Write, object, Path(), name);
  DataSource::OnWrite(field, sizeof(E), name);
}
template <typename E>
void DataSourceWriteBarrier(E* field, NullInterface, ConstStringZ name) {
  if (ModelHook::Any()) ModelHook::Notify({ModelChange::Write, nullptr, nullptr, Path(), name});
  DataSource::OnWrite(field, sizeof(E), name);
}
template <typename E>
void DataSourceEvict(E const* field) {
  DataSource::OnWrite(field, sizeof(E), nullptr);
}

template <typename T>
void IndepFieldReadBarrier(T const* object, Path const& path) {
  PathSource::OnRead(object, path);
}
template <typename T>
void EvictIndepFieldsUnderObject(T const* object) {
  PathSource::OnWrite(object, Path());
}

// --- Operations: writes to the fields of a model whose class generates them

template <typename T>
void BeginOperation(ModelChange::EKind kind, T* object, Path const& path) {
  NotifyHooks(kind, object, path, nullptr);
  PathSource::OnWrite(object, path);
}

template <typename T, typename E, typename V>
void genop_Assign(T* object, Path const& path, E& field, V const& value) {
  BeginOperation(ModelChange::Assign, object, path);
  field = value;
}
template <typename T, typename E, typename V>
void genop_Assign_VisitPrefs(T* object, Path const& path, E& field, V const& value) {
  genop_Assign(object, path, field, value);
}
template <typename T, typename E, typename V>
void genop_AssignPref(T* object, Path const& path, E& field, V const& value) {
  genop_Assign(object, path, field, value);
}
template <typename T, typename E, typename V>
void genop_OffsetValue(T* object, Path const& path, E& field, V const& value) {
  BeginOperation(ModelChange::Offset, object, path);
  field = static_cast<E>(field + value);
}

template <typename T, typename E, typename V>
void genop_CreateIntoVector(T* object, Path const& path, E& field, ssize_t at, V const* source, ssize_t count) {
  BeginOperation(ModelChange::Insert, object, path);
  field.insert(field.begin() + at, source, source + count);
}
template <typename T, typename E, typename V>
void genop_CreateIntoVector_VisitPrefs(T* object, Path const& path, E& field, ssize_t at, V const* source,
                                       ssize_t count) {
  genop_CreateIntoVector(object, path, field, at, source, count);
}
template <typename T, typename E, typename V>
void genop_CreateIntoMVector(T* object, Path const& path, E& field, ssize_t at, V const* source, ssize_t count) {
  genop_CreateIntoVector(object, path, field, at, source, count);
}
template <typename T, typename E>
void genop_DeleteFromVector(T* object, Path const& path, E& field, ssize_t begin, ssize_t end) {
  BeginOperation(ModelChange::Delete, object, path);
  field.erase(begin, end - begin);
}
template <typename T, typename E>
void genop_DeleteFromVector_VisitPrefs(T* object, Path const& path, E& field, ssize_t begin, ssize_t end) {
  genop_DeleteFromVector(object, path, field, begin, end);
}
template <typename T, typename E>
void genop_DeleteFromMVector(T* object, Path const& path, E& field, ssize_t begin, ssize_t end) {
  genop_DeleteFromVector(object, path, field, begin, end);
}

template <typename T, typename E, typename K>
bool genop_SetInsert(T* object, Path const& path, E& field, K const& key) {
  BeginOperation(ModelChange::Insert, object, path);
  return field.Insert(key);
}
template <typename T, typename E, typename K>
bool genop_SetDelete(T* object, Path const& path, E& field, K const& key) {
  BeginOperation(ModelChange::Delete, object, path);
  return field.Delete(key);
}
template <typename T, typename E, typename K>
bool genop_InsertIntoMSet(T* object, Path const& path, E& field, K const& key) {
  return genop_SetInsert(object, path, field, key);
}
template <typename T, typename E, typename K>
bool genop_DeleteFromMSet(T* object, Path const& path, E& field, K const& key) {
  return genop_SetDelete(object, path, field, key);
}

// --- A project at run time

inline void WriteRsn(XTarget const& target, Archive& ar) { SerialiseVariableLengthUint(ar, target.m_rsn); }

// The release of an archive is the archive's own, for each project that wrote a part of it.
inline void ReadRsn(XTarget const& target, InputArchive& ar) {
  const RSN release = ReadCompact(ar);
  if (release > target.m_rsn) {
    throw ArchiveError(vxMakeString("archive of release " << release << ", this is release " << target.m_rsn));
  }
  auto at = ar.m_releases.begin();
  while (at != ar.m_releases.end() && at->first != &target) ++at;
  if (at == ar.m_releases.end()) at = ar.m_releases.insert(at, {&target, release});
  at->second = release;
  // A class that is not read by `>>`: its model asks next.
  if (t_reading.m_archive != &ar) {
    t_reading.m_target = &target;
    t_reading.m_release = release;
  }
}

// The release that a model is to be read as: that of the archive being read, else the current one.
inline RSN ReleaseBeingRead(XTarget const& target) {
  if (std::exchange(t_reading.m_target, nullptr) == &target) return t_reading.m_release;
  if (!t_reading.m_archive) return target.m_rsn;
  for (auto const& [project, release] : t_reading.m_archive->m_releases) {
    if (project == &target) return release;
  }
  return target.m_rsn;
}

}  // namespace vesk

// In one source of each project: X is the project's folder with `_` for each `/`, RELEASE the release number that its
// models write. Archives of classes begin with it; models are read as of the release that their archive names.
#define vxDefineTarget(X, RELEASE)                                                 \
  namespace vesk {                                                                 \
  XTarget* X##_GetXTarget() {                                                      \
    static XTarget target = {#X, RELEASE};                                         \
    return &target;                                                                \
  }                                                                                \
  RSN X##_GetModelRsn() { return ReleaseBeingRead(*X##_GetXTarget()); }            \
  void X##_WriteDataSourceRsn(Archive& ar) { WriteRsn(*X##_GetXTarget(), ar); }    \
  void X##_ReadDataSourceRsn(InputArchive& ar) { ReadRsn(*X##_GetXTarget(), ar); } \
  }
