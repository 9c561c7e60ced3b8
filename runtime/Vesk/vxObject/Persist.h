// References in archives. A pref or cref is written as the number of its object; at the first one the object follows:
// the name of its class and what its Serialise writes, so that objects which refer to each other are written once.
// Objects behind a pref are IPersistable and of a registered class that can be created; a cref may also lead to a plain
// struct, which is then written as a value.

@import "Vesk/vxObject/Mixins.h"

namespace vesk {

// Writes the number of the object. Answers whether the object must follow.
inline bool WriteObjectNumber(Archive& ar, void const* object) {
  if (ar.m_writesAddresses) {
    ar.Write(&object, sizeof(object));
    return false;
  }
  if (!object) {
    SerialiseVariableLengthUint(ar, 0);
    return false;
  }
  const auto [at, isNew] = ar.m_objects.insert({object, static_cast<uint32>(ar.m_objects.size() + 1)});
  SerialiseVariableLengthUint(ar, at->second);
  return isNew;
}

// Reads a number: 0 for null. An object that has not been read yet gets a place, and the answer is true.
inline bool ReadObjectNumber(InputArchive& ar, std::size_t& number) {
  DeserialiseVariableLengthUint(ar, number);
  if (number <= ar.m_objects.size()) return false;
  if (number != ar.m_objects.size() + 1) throw ArchiveError("reference to an object that is not in the archive");
  if (number > ar.m_limits.m_objects) throw ArchiveError("too many objects in an archive");
  ar.m_objects.push_back({nullptr, AnyInterface(), nullptr});
  return true;
}

// What tells the class of an object in an archive from others: its record, else the address of something of its own.
template <typename C>
void const* ArchivedType() {
  static const char mark = 0;
  void const* record = RecordOf<std::remove_const_t<C>>();
  return record ? record : &mark;
}

inline void WritePersistable(Archive& ar, ptr<IPersistable> const& object) {
  ReflectedClass const* record = object ? object->GetReflectedClass() : nullptr;
  if (!record) throw ArchiveError("object is not persistable");
  ar << xstring(record->m_name);
  object->Serialise(ar);
}

// Makes an object of the class that the archive names, and reads it.
inline ptr<IPersistable> ReadPersistable(InputArchive& ar, InputArchive::ReadObject* place) {
  xstring name;
  ar >> name;
  ReflectedClass const* record = Find<ReflectedClass>(name);
  if (!record || !record->m_create) throw ArchiveError("no class to create: " + name);
  const ptr<IPersistable> object = QueryInterface<IPersistable>(record->m_create());
  if (!object) throw ArchiveError("not persistable: " + name);
  if (place) *place = {object.Object(), object.Any(), record};
  object->Deserialise(ar);
  return object;
}

template <typename I>
void Serialise(Archive& ar, pref<I> const& reference) {
  if (WriteObjectNumber(ar, reference.Object())) WritePersistable(ar, QueryInterface<IPersistable>(reference.Get()));
}

template <typename I>
void Deserialise(InputArchive& ar, pref<I>& reference) {
  std::size_t number;
  if (ReadObjectNumber(ar, number)) ReadPersistable(ar, &ar.m_objects[number - 1]);
  reference = pref<I>();
  if (number == 0) return;
  reference = QueryInterface<I>(ptr<IPersistable>(ar.m_objects[number - 1].m_persistable));
  if (!reference) throw ArchiveError("reference to an object without the interface");
}

template <typename C>
void Serialise(Archive& ar, cref<C> const& reference) {
  if (!WriteObjectNumber(ar, reference.Object())) return;
  if constexpr (IsObjectClass<C>) {
    WritePersistable(ar, QueryInterface<IPersistable>(ptr<IObject>(reference.Get())));
  } else {
    SerialiseArray(ar, reference.Get(), 0, 1);
  }
}

template <typename C>
void Deserialise(InputArchive& ar, cref<C>& reference) {
  std::size_t number;
  if (ReadObjectNumber(ar, number)) {
    if constexpr (IsObjectClass<C>) {
      ReadPersistable(ar, &ar.m_objects[number - 1]);
    } else {
      C* object = new C();
      ar.m_objects[number - 1] = {object, AnyInterface(), ArchivedType<C>()};
      DeserialiseArray(ar, object, 0, 1);
    }
  }
  reference = cref<C>();
  if (number == 0) return;
  InputArchive::ReadObject const& object = ar.m_objects[number - 1];
  if (object.m_type != ArchivedType<C>()) throw ArchiveError("reference to an object of another class");
  reference = static_cast<C*>(object.m_self);
}

// Stands ahead of a whole object; the last byte is the version of the form. No reference begins so, hence what was
// written without it can be read as well.
constexpr octet_t ObjectMark[] = {0xFF, 'v', 'x', 1};

inline void ReadObjectMark(InputArchive& ar) {
  if (ar.Remaining() == 0 || ar.m_bytes[ar.m_position] != ObjectMark[0]) return;
  octet_t const* mark = ar.Take(sizeof(ObjectMark));
  if (!std::equal(mark, mark + 3, ObjectMark)) throw ArchiveError("not the archive of an object");
  if (mark[3] > ObjectMark[3]) throw ArchiveError("archive in a later form than is known here");
}

// A whole object: its class and its content.
template <typename I>
xvector<octet_t> WriteObject(ptr<I> const& object) {
  Archive ar;
  ar.Write(ObjectMark, sizeof(ObjectMark));
  ar << pref<I>(object);
  return ar.m_bytes;
}

template <typename I>
ptr<I> ReadObject(xvector<octet_t> bytes, ArchiveLimits const& limits = ArchiveLimits()) {
  InputArchive ar(std::move(bytes), limits);
  ReadObjectMark(ar);
  pref<I> reference;
  ar >> reference;
  return reference.Get();
}

}  // namespace vesk
