// The objects of archives: how they are mentioned, written, read and destroyed; the heap of `$new`.

@import "Vesk/vxObject/IObject.h"
@import "Vesk/vxObject/src/shared.h"

#include <algorithm>
#include <cstring>
#include <map>
#include <mutex>
#include <typeindex>
#include <unordered_set>
#if defined(__linux__)
#include <pthread.h>
#endif

namespace vesk {

// An address is several objects where a struct begins with another one. Those with interfaces share the type void.
struct ObjectNumbers::Table : std::map<std::pair<void const*, std::type_index>, std::size_t> {};

ObjectNumbers::ObjectNumbers(ObjectNumbers const& rhs) : m_table(rhs.m_table ? new Table(*rhs.m_table) : nullptr) {}
void ObjectNumbers::Drop() { delete m_table; }
std::size_t ObjectNumbers::Of(void const* object, std::type_info const& type, std::size_t next) {
  if (!m_table) m_table = new Table;
  return m_table->insert({{object, type}, next}).first->second;
}

// --- What would otherwise be compiled wherever an archive is used

WrittenObjects::WrittenObjects() = default;
WrittenObjects::WrittenObjects(WrittenObjects const&) = default;
WrittenObjects::WrittenObjects(WrittenObjects&&) = default;
WrittenObjects& WrittenObjects::operator=(WrittenObjects const&) = default;
WrittenObjects& WrittenObjects::operator=(WrittenObjects&&) = default;
WrittenObjects::~WrittenObjects() = default;

ArchiveError::~ArchiveError() = default;
void FailArchive(ConstStringZ text) { throw ArchiveError(text); }

ByteBuffer::operator xvector<octet_t>() const { return xvector<octet_t>(begin(), end()); }
void ByteBuffer::Reserve(std::size_t more) {
  const std::size_t capacity = std::max(m_size + more, 2 * m_capacity + 64);
  void* data = capacity < more ? nullptr : std::realloc(m_data, capacity);
  if (!data) throw std::bad_alloc();
  m_data = static_cast<octet_t*>(data);
  m_capacity = capacity;
}

InputArchive::InputArchive() = default;
InputArchive::InputArchive(xvector<octet_t> bytes, ArchiveLimits const& limits)
    : m_bytes(std::move(bytes)), m_limits(limits) {
  if (m_bytes.size() > limits.m_bytes) throw ArchiveError("archive larger than allowed");
}
InputArchive::InputArchive(Archive const& archive, ArchiveLimits const& limits)
    : InputArchive(archive.m_bytes, limits) {}
InputArchive::InputArchive(InputArchive const&) = default;
InputArchive::InputArchive(InputArchive&&) noexcept = default;
InputArchive& InputArchive::operator=(InputArchive const&) = default;
InputArchive& InputArchive::operator=(InputArchive&&) noexcept = default;
InputArchive::~InputArchive() = default;

// --- The objects of archives

std::pair<std::size_t, bool> WrittenObjects::Insert(WrittenObject const& object, std::type_info const& type) {
  const std::size_t next = m_list.size() + 1;
  const std::size_t number = m_numbers.Of(object.m_object, type, next);
  if (number == next) m_list.push_back(object);
  return {number, number == next};
}

void ReadObjects::Destroy(std::size_t first) {
  for (std::size_t i = first; i < m_list.size(); ++i) {
    if (m_list[i].m_self) m_list[i].m_forget(m_list[i]);
  }
  while (m_list.size() > first) {
    const auto object = m_list.back();
    m_list.pop_back();
    if (object.m_self) object.m_destroy(object);
  }
}

std::size_t StackLeft() {
  char const* here = static_cast<char const*>(__builtin_frame_address(0));
#if defined(__linux__)
  static thread_local char const* s_end = nullptr;
  if (!s_end) {
    pthread_attr_t attributes;
    void* end = nullptr;
    std::size_t size;
    if (pthread_getattr_np(pthread_self(), &attributes) == 0) {
      pthread_attr_getstack(&attributes, &end, &size);
      pthread_attr_destroy(&attributes);
    }
    s_end = static_cast<char const*>(end);
  }
#else
  static thread_local char const* s_end = here - 256 * 1024;
#endif
  return here > s_end ? static_cast<std::size_t>(here - s_end) : 0;
}

// --- References

// Where contents stand within each other the stack grows with them.
constexpr std::size_t LeastStackForContent = 128 * 1024;

void WritePersistable(Archive& ar, WrittenObject const& object) {
  ptr<IPersistable>(object.m_persistable)->Serialise(ar);
}

void WriteContents(Archive& ar) {
  WrittenObjects& objects = ar.m_objects;
  if (objects.m_isWriting) return;
  FlagScope scope(objects.m_isWriting);
  while (objects.m_next < objects.m_list.size()) {
    const WrittenObject object = objects.m_list[objects.m_next++];
    object.m_write(ar, object);
  }
}

bool WriteMention(Archive& ar, WrittenObject const& object, std::type_info const& type) {
  if (ar.m_writesAddresses) {
    ar.Write(&object.m_object, sizeof(object.m_object));
    return false;
  }
  if (!object.m_object) {
    SerialiseVariableLengthUint(ar, 0);
    return false;
  }
  const auto [number, isNew] = ar.m_objects.Insert(object, type);
  SerialiseVariableLengthUint(ar, isNew ? number + 1 : number);
  return isNew;
}

EMention ReadMention(InputArchive& ar, std::size_t& number) {
  DeserialiseVariableLengthUint(ar, number);
  const std::size_t known = ar.m_objects.m_list.size();
  if (number == 0) return EMention::Null;
  if (number <= known) return EMention::Known;
  if (number > known + 2) throw ArchiveError("reference to an object that is not in the archive");
  if (known >= ar.m_limits.m_objects) throw ArchiveError("too many objects in an archive");
  const bool hasContent = number == known + 1;
  number = known + 1;
  return hasContent ? EMention::NewWithContent : EMention::New;
}

// An object is not read by `>>`, but what its model asks for is asked of this archive all the same.
void ReadContent(InputArchive& ar, std::size_t position) {
  if (ar.m_objects.m_list[position].m_isRead) return;
  if (StackLeft() < LeastStackForContent) throw ArchiveError("objects nested too deeply in an archive");
  ar.m_objects.m_list[position].m_isRead = true;
  const auto object = ar.m_objects.m_list[position];
  const ArchiveScope scope(ar);
  object.m_read(ar, object);
}

bool ListsInterface(ReflectedClass const& record, ConstStringZ name) {
  ConstStringZ const* end = record.m_interfaces + record.m_numBaseInterfaces + record.m_numInterfaces;
  return std::any_of(record.m_interfaces, end, [name](ConstStringZ other) { return std::strcmp(name, other) == 0; });
}

ReflectedClass const* ClassOf(ptr<IPersistable> const& object) {
  return object ? object->GetReflectedClass() : nullptr;
}

NumberedObject MakePersistable(InputArchive& ar, std::function<bool(ReflectedClass const&)> const& fits) {
  xstring name;
  ar >> name;
  ReflectedClass const* record = Find<ReflectedClass>(name);
  if (!record) throw ArchiveError(NotRegistered("class", name));
  if (!record->m_create) throw ArchiveError("no class to create: " + name);
  if (!fits(*record) || !ListsInterface(*record, GetReflectedInterface<IPersistable>().m_name)) {
    throw ArchiveError("not the class of the reference: " + name);
  }
  if (ar.m_objects.m_allow && !ar.m_objects.m_allow(*record)) throw ArchiveError("class is not allowed: " + name);
  return MakePersistable(*record);
}

NumberedObject MakePersistable(ReflectedClass const& record) {
  const ptr<IObject> whole = record.m_create();
  const ptr<IPersistable> made = QueryInterface<IPersistable>(whole);
  if (!made) {
    whole->DestroyObject();
    throw ArchiveError(vxMakeString("not persistable: " << record.m_name));
  }
  NumberedObject object;
  object.m_self = made.Object();
  object.m_persistable = made.Any();
  object.m_type = &typeid(void);
  object.m_read = [](InputArchive& input, NumberedObject const& o) {
    ptr<IPersistable>(o.m_persistable)->Deserialise(input);
  };
  object.m_forget = [](NumberedObject const& o) {
    ReferenceCleaner cleaner;
    ptr<IPersistable>(o.m_persistable)->VisitPrefs(cleaner);
  };
  object.m_destroy = [](NumberedObject const& o) { ptr<IPersistable>(o.m_persistable)->DestroyObject(); };
  return object;
}

// --- Values of openvariants

namespace {

struct Memory {
  explicit Memory(TypeOps const& ops) : m_memory(::operator new(ops.m_size)) {}
  ~Memory() { ::operator delete(m_memory); }
  Memory(Memory const&) = delete;
  void operator=(Memory const&) = delete;
  void* Release() { return std::exchange(m_memory, nullptr); }
  void* m_memory;
};

TypeOps const* OpsOfName(xstring const& name) {
  const auto at = TypeOpsTable().find(name);
  if (at != TypeOpsTable().end()) return at->second;
  if (ReflectedClass const* record = Find<ReflectedClass>(name)) return &record->m_ops;
  if (ReflectedVariant const* record = Find<ReflectedVariant>(name)) return &record->m_ops;
  return nullptr;
}

}  // namespace

void* AnyValue::Clone(TypeOps const* ops, void const* value) {
  if (!value) return nullptr;
  if (!ops->m_copyConstruct || !ops->m_destruct) throw std::logic_error("type of an openvariant cannot be copied");
  Memory memory(*ops);
  ops->m_copyConstruct(memory.m_memory, 0, value, 0, 1);
  return memory.Release();
}
void* AnyValue::Default(TypeOps const& ops) {
  Memory memory(ops);
  ops.m_construct(memory.m_memory, 0, 1);
  return memory.Release();
}
void AnyValue::Destroy(TypeOps const& ops, void* value) {
  ops.m_destruct(value, 0, 1);
  ::operator delete(value);
}

xstring AnyValue::NameOf(TypeOps const* ops) {
  if (!ops) return xstring();
  for (auto const& [name, registered] : TypeOpsTable()) {
    if (registered == ops) return name;
  }
  for (ReflectedClass const* record : All<ReflectedClass>()) {
    if (&record->m_ops == ops) return record->m_name;
  }
  for (ReflectedVariant const* record : All<ReflectedVariant>()) {
    if (&record->m_ops == ops) return record->m_name;
  }
  throw ArchiveError(NotRegistered("type of an openvariant", ""));
}

// A name in an archive may be that of any registered type, also of one that no openvariant can hold.
TypeOps const* AnyValue::ReadType(InputArchive& ar) {
  xstring name;
  ar >> name;
  if (name.empty()) return nullptr;
  if (!IsTypeAllowed(ar.m_objects.m_allow, ar.m_objects.m_allowType, name)) {
    throw ArchiveError("type is not allowed: " + name);
  }
  TypeOps const* ops = OpsOfName(name);
  if (!ops) throw ArchiveError(NotRegistered("type of an openvariant", name));
  if (!ops->m_construct || !ops->m_copyConstruct || !ops->m_destruct || !ops->m_deserialise) {
    throw ArchiveError("type cannot be the value of an openvariant: " + name);
  }
  return ops;
}

// --- The heap

struct ObjectHeap::Objects : IObjectVisitor {
  typedef std::uintptr_t Number;
  struct Made {
    ptr<IObject> m_object;
    std::size_t m_size;
    uint64 m_serial;
  };

  static Number Address(void const* object) { return reinterpret_cast<Number>(object); }

  void VisitObject(ptr<IObject> const& object) override {
    if (!object) return;
    const ptr<IObject> whole = WholeObject(object);
    if (m_reached.insert(whole.Object()).second) m_pending.push_back(whole);
  }
  // The object of this heap that holds the other one, as it was made.
  ptr<IObject> WholeObject(ptr<IObject> const& object) const {
    std::lock_guard<std::mutex> lock(m_mutex);
    auto at = m_made.upper_bound(Address(object.Object()));
    if (at == m_made.begin()) return object;
    --at;
    return Address(object.Object()) - at->first < at->second.m_size ? at->second.m_object : object;
  }
  xvector<Made> Unreached() const {
    std::lock_guard<std::mutex> lock(m_mutex);
    xvector<Made> unreached;
    for (auto const& [address, made] : m_made) {
      if (m_reached.count(made.m_object.Object()) == 0) unreached.push_back(made);
    }
    std::sort(unreached.begin(), unreached.end(), [](Made const& a, Made const& b) { return a.m_serial < b.m_serial; });
    return unreached;
  }
  // Whether the object is still there, and no other one stands in its place.
  bool Take(Made const& made) {
    std::lock_guard<std::mutex> lock(m_mutex);
    const auto at = m_made.find(Address(made.m_object.Object()));
    if (at == m_made.end() || at->second.m_serial != made.m_serial) return false;
    m_made.erase(at);
    return true;
  }

  mutable std::mutex m_mutex;
  std::map<Number, Made> m_made;
  uint64 m_lastSerial = 0;
  std::unordered_set<void const*> m_reached;
  xvector<ptr<IObject>> m_pending;
};

ObjectHeap& ObjectHeap::Get() { return Shared<ObjectHeap>(); }
ObjectHeap::ObjectHeap() : m_objects(new Objects) {}
ObjectHeap::~ObjectHeap() { delete m_objects; }

void ObjectHeap::Add(ptr<IObject> const& object, std::size_t size) {
  std::lock_guard<std::mutex> lock(m_objects->m_mutex);
  m_objects->m_made[Objects::Address(object.Object())] = {object, size, ++m_objects->m_lastSerial};
}

void ObjectHeap::Remove(void const* object) {
  std::lock_guard<std::mutex> lock(m_objects->m_mutex);
  m_objects->m_made.erase(Objects::Address(object));
}

ssize_t ObjectHeap::Count() const {
  std::lock_guard<std::mutex> lock(m_objects->m_mutex);
  return static_cast<ssize_t>(m_objects->m_made.size());
}

ssize_t ObjectHeap::Collect(xvector<ptr<IObject>> const& roots) {
  Objects& objects = *m_objects;
  // Of one that was given up when a visit threw.
  objects.m_reached.clear();
  objects.m_pending.clear();
  for (ptr<IObject> const& root : roots) objects.VisitObject(root);
  while (!objects.m_pending.empty()) {
    const ptr<IObject> object = objects.m_pending.back();
    objects.m_pending.pop_back();
    object->VisitObjects(objects);
  }
  ssize_t count = 0;
  for (Objects::Made const& made : objects.Unreached()) {
    if (!objects.Take(made)) continue;
    made.m_object->DestroyObject();
    ++count;
  }
  return count;
}

}  // namespace vesk
