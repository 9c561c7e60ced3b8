// What stands between a model's fields and those who use them: each read and write of a field in a model mixin passes a
// barrier. A read inside a calculation of the dependency graph makes the field an input of it, a write makes its
// readers dirty, and the hooks see each write just before it happens: with its path where the class generates
// operations, with its name where it does not.

@import "Vesk/vxObject/Sources.h"

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
  xstring PathText() const;
};

// Calls a function with each change of its thread while it lives. A hook may make others and destroy any.
class ModelHook {
 public:
  typedef std::function<void(ModelChange const&)> Function;
  explicit ModelHook(Function function);
  ~ModelHook();
  ModelHook(ModelHook const&) = delete;
  void operator=(ModelHook const&) = delete;

  static void Notify(ModelChange const& change);
  static bool Any() {
    Hooks const* hooks = Hooks::Peek();
    return hooks && !hooks->m_list.IsEmpty();
  }

 private:
  // A hook's function, which stays in its place while it is called, though the hook be gone.
  struct Called : DGPlace {
    Function m_function;
    std::size_t m_serial;
    ssize_t m_users = 1;  // the hook is one
    bool m_isOver = false;
  };
  struct Hooks : PerThread<Hooks> {
    NodeList<Called> m_list;
    std::size_t m_lastSerial = 0;
  };
  struct Use;
  static void Release(Called const& called);

  Hooks& m_hooks;
  Called* m_called;
};

// --- Barriers

template <typename T>
void NotifyHooks(ModelChange::EKind kind, T* object, Path const& path, ConstStringZ name) {
  if (ModelHook::Any()) ModelHook::Notify({kind, object, RecordOf<T>(), path, name});
}

template <typename E, typename T>
void DataSourceReadBarrier(E const* field, T const* object, ConstStringZ name) {
  DataSource::OnRead(field, sizeof(E), object, name);
}
template <typename E>
void DataSourceReadBarrier(E const* field, NullInterface, ConstStringZ name) {
  DataSource::OnRead(field, sizeof(E), nullptr, name);
}
template <typename E, typename T>
void DataSourceWriteBarrier(E* field, T* object, ConstStringZ name) {
  NotifyHooks(ModelChange::Write, object, Path(), name);
  DataSource::OnWrite(field, sizeof(E), object, name);
}
template <typename E>
void DataSourceWriteBarrier(E* field, NullInterface, ConstStringZ name) {
  if (ModelHook::Any()) ModelHook::Notify({ModelChange::Write, nullptr, nullptr, Path(), name});
  DataSource::OnWrite(field, sizeof(E), nullptr, name);
}
template <typename E>
void DataSourceEvict(E const* field) {
  DataSource::OnWrite(field, sizeof(E), nullptr, nullptr);
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

// A hook may change the field, of which the source may be a part, and take the position away.
template <typename T, typename E, typename V>
void InsertHooked(T* object, Path const& path, E& field, ssize_t at, V const* source, ssize_t count) {
  const E items(source, source + count);
  BeginOperation(ModelChange::Insert, object, path);
  if (at > static_cast<ssize_t>(field.size())) throw std::out_of_range("position to insert at");
  field.insert(field.begin() + at, items.begin(), items.end());
}
template <typename T, typename E, typename V>
void genop_CreateIntoVector(T* object, Path const& path, E& field, ssize_t at, V const* source, ssize_t count) {
  if (ModelHook::Any()) return InsertHooked(object, Path(path), field, at, source, count);
  PathSource::OnWrite(object, path);
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

void WriteRsn(XTarget const& target, Archive& ar);
// The release of an archive is the archive's own, for each project that wrote a part of it.
void ReadRsn(XTarget const& target, InputArchive& ar);
// The release that a model is to be read as: that of the archive being read, else the current one.
RSN ReleaseBeingRead(XTarget const& target);

}  // namespace vesk

// In one source of each project: X is the project's folder with `_` for each `/`, RELEASE the release number that its
// models write. Archives of classes begin with it; models are read as of the release that their archive names. The
// project's Unregister_Project_ function takes its records out of the registry.
@def vxDefineTarget(X, RELEASE) = {vxDefineTargetFunctions(X, RELEASE) $uninit{vxUnregisterTarget(X);
}
}
#define vxUnregisterTarget(X) ::vesk::UnregisterTarget(::vesk::X##_GetXTarget())
#define vxDefineTargetFunctions(X, RELEASE)                                        \
  namespace vesk {                                                                 \
  XTarget* X##_GetXTarget() {                                                      \
    static XTarget target(#X, RELEASE);                                            \
    return &target;                                                                \
  }                                                                                \
  [[maybe_unused]] static XTarget* const X##_target = X##_GetXTarget();            \
  RSN X##_GetModelRsn() { return ReleaseBeingRead(*X##_GetXTarget()); }            \
  void X##_WriteDataSourceRsn(Archive& ar) { WriteRsn(*X##_GetXTarget(), ar); }    \
  void X##_ReadDataSourceRsn(InputArchive& ar) { ReadRsn(*X##_GetXTarget(), ar); } \
  }
