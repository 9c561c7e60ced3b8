// References in archives. A pref or cref is written as the number of its object. The first mention of an object has the
// name of its class behind the number; what its Serialise writes follows when the outermost reference is written, for
// one object after the other, so that objects which refer to each other are written once, however long the chain is.
// A first mention is told by the number: one more than the next free one. (Archives of before have the next free
// number, and the content at once, one object within the other; they are read like that.)
//
// Objects behind a pref are IPersistable and of a registered class that can be created; a cref may also lead to a plain
// struct, which is then written as a value. Objects that were read belong to the reader's caller. When a reference
// cannot be read, all that was made for it is destroyed. Errors are ArchiveErrors.

@import "Vesk/vxObject/Mixins.h"

namespace vesk {

struct IPersistable;  // of IObject.h, which imports this file

// The class of an object; null for null.
ReflectedClass const* ClassOf(ptr<IPersistable> const& object);

// --- Writing

// Sets a flag while it lives.
class FlagScope {
 public:
  explicit FlagScope(bool& flag) : m_flag(flag) { m_flag = true; }
  ~FlagScope() { m_flag = false; }
  FlagScope(FlagScope const&) = delete;
  void operator=(FlagScope const&) = delete;

 private:
  bool& m_flag;
};

void WritePersistable(Archive& ar, WrittenObject const& object);

// The name of an object's class. ArchiveError for one that nobody registered: it could not be read.
void WriteClassOf(Archive& ar, ReflectedClass const& record);

// The contents of the objects that were mentioned, unless someone further out is about to write them.
void WriteContents(Archive& ar);

// Writes the number. Answers whether it was the first mention.
bool WriteMention(Archive& ar, WrittenObject const& object, std::type_info const& type);

template <typename I>
void WriteObjectMention(Archive& ar, ptr<I> const& object) {
  ptr<IPersistable> persistable;
  if (object && !ar.m_writesAddresses) {
    persistable = QueryInterface<IPersistable>(object);
    if (!ClassOf(persistable)) FailArchive("object is not persistable");
  }
  if (!WriteMention(ar, {object.Object(), persistable.Any(), WritePersistable}, typeid(void))) return;
  WriteClassOf(ar, *ClassOf(persistable));
  WriteContents(ar);
}

template <typename I>
void Serialise(Archive& ar, pref<I> const& reference) {
  WriteObjectMention(ar, reference.Get());
}

template <typename C>
void WriteStruct(Archive& ar, WrittenObject const& object) {
  SerialiseArray(ar, static_cast<C const*>(object.m_object), 0, 1);
}

template <typename C>
void Serialise(Archive& ar, cref<C> const& reference) {
  if constexpr (IsObjectClass<C>) {
    WriteObjectMention(ar, ptr<IObject>(reference.Get()));
  } else if (WriteMention(ar, {reference.Get(), AnyInterface(), WriteStruct<C>}, typeid(C))) {
    WriteContents(ar);
  }
}

// --- Reading

enum class EMention { Null, Known, New, NewWithContent };

// What stands next; `number` is the object's, that of a new one included.
EMention ReadMention(InputArchive& ar, std::size_t& number);

// The content of the object at this position, unless it was read.
void ReadContent(InputArchive& ar, std::size_t position);

// Reads a number and what must follow it. Make: NumberedObject(), of an object that the archive begins. Answers its
// position, -1 for null.
template <typename Make>
ssize_t ReadReference(InputArchive& ar, Make make) {
  ReadObjects& objects = ar.m_objects;
  std::size_t number;
  const EMention mention = ReadMention(ar, number);
  const ssize_t position = static_cast<ssize_t>(number) - 1;
  if (mention == EMention::Null || mention == EMention::Known) return position;
  auto read = [&] {
    objects.m_list.emplace_back();  // so that no object is without its place
    try {
      objects.m_list.back() = make();
    } catch (...) {
      objects.m_list.pop_back();
      throw;
    }
    if (mention == EMention::NewWithContent) ReadContent(ar, position);
  };
  if (objects.m_isReading) {
    read();
    return position;
  }
  FlagScope scope(objects.m_isReading);
  try {
    read();
    while (objects.m_next < objects.m_list.size()) ReadContent(ar, objects.m_next++);
  } catch (...) {
    objects.Destroy(position);
    objects.m_next = position;
    throw;
  }
  return position;
}

bool ListsInterface(ReflectedClass const& record, ConstStringZ name);

// Makes an object of the class that the archive names. `fits`: whether a class is what the reference asks for.
NumberedObject MakePersistable(InputArchive& ar, std::function<bool(ReflectedClass const&)> const& fits);
// Of a class that can be created.
NumberedObject MakePersistable(ReflectedClass const& record);

template <typename C>
NumberedObject MakeStruct() {
  NumberedObject object;
  object.m_self = new C();
  object.m_type = &typeid(C);
  object.m_read = [](InputArchive& input, NumberedObject const& o) {
    DeserialiseArray(input, static_cast<C*>(o.m_self), 0, 1);
  };
  object.m_forget = [](NumberedObject const& o) {
    ReferenceCleaner cleaner;
    static_cast<IPrefVisitor&>(cleaner) << *static_cast<C const*>(o.m_self);
  };
  object.m_destroy = [](NumberedObject const& o) { delete static_cast<C*>(o.m_self); };
  return object;
}

template <typename I>
void Deserialise(InputArchive& ar, pref<I>& reference) {
  typedef std::remove_const_t<I> Interface;
  reference = pref<I>();
  const ssize_t position = ReadReference(ar, [&ar] {
    return MakePersistable(ar, [](ReflectedClass const& record) {
      return ListsInterface(record, GetReflectedInterface<Interface>().m_name);
    });
  });
  if (position < 0) return;
  const ptr<IPersistable> object(ar.m_objects.m_list[position].m_persistable);
  const ptr<I> found = QueryInterface<I>(object);
  if (!found) FailArchive("reference to an object of another class");
  reference = found;
}

template <typename C>
void Deserialise(InputArchive& ar, cref<C>& reference) {
  reference = cref<C>();
  ssize_t position;
  bool fits = true;
  if constexpr (IsObjectClass<C>) {
    // The record of the class, not of what it derives from or what derives from it.
    auto isClass = [](ReflectedClass const& record) { return record.m_name == xstring(GetReflectedClass<C>().m_name); };
    position = ReadReference(ar, [&] { return MakePersistable(ar, isClass); });
    if (position >= 0) {
      const ptr<IPersistable> object(ar.m_objects.m_list[position].m_persistable);
      ReflectedClass const* record = ClassOf(object);
      fits = record && isClass(*record);
    }
  } else {
    position = ReadReference(ar, MakeStruct<C>);
    if (position >= 0) fits = *ar.m_objects.m_list[position].m_type == typeid(C);
  }
  if (!fits) FailArchive("reference to an object of another class");
  if (position >= 0) reference = static_cast<C*>(ar.m_objects.m_list[position].m_self);
}

// --- Whole objects

// Stands ahead of a whole object; the last byte is the version of the form. No reference begins so, hence what was
// written without it can be read as well. From the second version on the releases of the projects follow (Releases.h).
constexpr octet_t ObjectMark[] = {0xFF, 'v', 'x', 2};

void ReadObjectHead(InputArchive& ar);
xvector<octet_t> WithObjectHead(Archive const& objects);

// An object with all that it refers to: classes and contents.
template <typename I>
xvector<octet_t> WriteObject(ptr<I> const& object) {
  WrittenModels models;
  Archive ar;
  ar.m_models = &models;
  ar << pref<I>(object);
  return WithObjectHead(ar);
}

// What WriteObject wrote, and nothing behind it. The objects belong to the caller; the archive is refused
// (ArchiveError) where the first is no I. `allow` is asked before an object of a class is made.
template <typename I>
ptr<I> ReadObject(xvector<octet_t> bytes, ArchiveLimits const& limits = ArchiveLimits(),
                  std::function<bool(ReflectedClass const&)> allow = nullptr) {
  InputArchive ar(std::move(bytes), limits);
  ReadObjectHead(ar);
  ar.m_objects.m_allow = std::move(allow);
  pref<I> reference;
  try {
    ar >> reference;
    if (ar.Remaining() > 0) FailArchive("bytes behind the object");
  } catch (...) {
    ar.m_objects.Destroy();
    throw;
  }
  return reference.Get();
}

}  // namespace vesk
