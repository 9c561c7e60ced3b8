// What the program itself reads of an archive that is taken apart.

@import "Vesk/vxObject/views/archive_walker.h"

namespace vesk {

// --- Layouts

inline ArchiveWalker::Layout const& ArchiveWalker::LayoutOf(ReflectedClass const& record) {
  const auto [at, isNew] = m_layouts.try_emplace(&record);
  if (isNew) FillLayout(at->second, record);
  return at->second;
}

inline ReflectedClass const* ModelOf(ReflectedClass const& record) {
  if (record.m_flags & CF_REFERENCES_MODEL) {
    return Find<ReflectedClass>(record.m_modelFields[record.m_numModelFields - 1].m_name);
  }
  return record.m_flags & (CF_MODEL | CF_HAS_MODEL) ? &record : nullptr;
}

// The fields stand in the order in which they are archived, those that were dropped included.
inline void ArchiveWalker::FillLayout(Layout& layout, ReflectedClass const& record) {
  ReflectedClass const* const model = ModelOf(record);
  layout.m_target = TargetOf(record);
  layout.m_modelTarget = model ? TargetOf(*model) : nullptr;
  if (!layout.m_target || !layout.m_modelTarget) return;
  layout.m_isKnown = true;
  layout.m_hasRelease = model != &record || (!(record.m_flags & CF_MODEL) && BeginsWithRelease(record));
  for (ssize_t i = 0; i < model->m_numModelFields; ++i) {
    ReflectedModelField const& field = model->m_modelFields[i];
    if (!field.m_type) continue;
    if (layout.m_fields.empty() || field.m_added < layout.m_first) layout.m_first = field.m_added;
    layout.m_fields.push_back({&field, &m_content.m_types.Of(DecodeType({field.m_type, model->m_strings}))});
    layout.m_isOpen |= layout.m_fields.back().m_type->m_kind == VK_NONE;
  }
  layout.m_asksRelease = LastRelease(*model) > layout.m_first;
}

// Memory for a value that its operations make.
struct ArchiveWalker::Scratch {
  explicit Scratch(TypeOps const& ops) : m_ops(ops) {
    if (!ops.m_construct || !ops.m_destruct || !ops.m_deserialise) FailArchive("type that cannot be read by itself");
    m_value = ::operator new(std::max<std::size_t>(ops.m_size, 1));
    try {
      ops.m_construct(m_value, 0, 1);
    } catch (...) {
      ::operator delete(m_value);
      throw;
    }
  }
  ~Scratch() {
    m_ops.m_destruct(m_value, 0, 1);
    ::operator delete(m_value);
  }
  Scratch(Scratch const&) = delete;
  void operator=(Scratch const&) = delete;

  TypeOps const& m_ops;
  void* m_value;
};

// A class with a model in its head does, one with a model in its body does not, and its record does not tell which it
// is. What it holds is not read: that would be too deep.
inline bool ArchiveWalker::BeginsWithRelease(ReflectedClass const& record) {
  if (!record.m_ops.m_construct || !record.m_ops.m_destruct || !record.m_ops.m_deserialise) return true;
  InputArchive first(xvector<octet_t>{0});
  first.m_limits.m_depth = 1;
  Scratch scratch(record.m_ops);
  try {
    record.m_ops.m_deserialise(first, scratch.m_value, 0, 1);
  } catch (ArchiveError const&) {
  }
  return !first.m_releases.empty();
}

// --- Reading

inline namespace views {

// What an object that is not there leaves in its place.
inline NumberedObject NoObject() {
  NumberedObject none;
  none.m_type = &typeid(void);
  none.m_isRead = true;
  return none;
}

// The objects of an archive up to a number, while the others are put aside.
class FirstObjects {
 public:
  FirstObjects(ReadObjects& objects, std::size_t count, bool isReading)
      : m_objects(objects), m_count(count), m_next(objects.m_next), m_wasReading(objects.m_isReading) {
    auto& list = objects.m_list;
    while (list.size() < count) list.push_back(NoObject());
    m_others.assign(list.begin() + count, list.end());
    list.resize(count);
    objects.m_next = count;
    objects.m_isReading = isReading;
  }
  ~FirstObjects() {
    m_objects.Destroy(m_count);
    m_objects.m_list.insert(m_objects.m_list.end(), m_others.begin(), m_others.end());
    m_objects.m_next = m_next;
    m_objects.m_isReading = m_wasReading;
  }

 private:
  ReadObjects& m_objects;
  std::size_t m_count, m_next;
  bool m_wasReading;
  xvector<NumberedObject> m_others;
};

}  // namespace views

// What was made is destroyed ahead of the objects that it refers to.
template <typename Read>
ArchiveWalker::Extent ArchiveWalker::Probe(Read read) {
  const Mark mark = Here();
  const FirstObjects objects(m_archive.m_objects, mark.m_objects, m_isInReference);
  read();
  const Extent extent = {m_archive.m_position, ObjectsFrom(mark.m_objects), m_archive.m_releases};
  GoBack(mark);
  return extent;
}

inline ArchiveWalker::Extent ArchiveWalker::ProbeValue(TypeOps const& ops) {
  return Probe([this, &ops] {
    const Scratch scratch(ops);
    ops.m_deserialise(m_archive, scratch.m_value, 0, 1);
  });
}

// A class without a model has no operations of archives, though it be an object that has them.
inline ArchiveWalker::Extent ArchiveWalker::ProbeClass(ReflectedClass const& record) {
  if (record.m_ops.m_deserialise || !record.m_create) return ProbeValue(record.m_ops);
  return Probe([this, &record] {
    struct Made {
      ~Made() {
        m_object.m_forget(m_object);
        m_object.m_destroy(m_object);
      }
      NumberedObject m_object;
    } made{MakePersistable(record)};
    made.m_object.m_read(m_archive, made.m_object);
  });
}

// As far as they were read.
inline xvector<ArchivedObject> ArchiveWalker::ObjectsFrom(std::size_t first) {
  xvector<ArchivedObject> objects;
  auto const& list = m_archive.m_objects.m_list;
  for (std::size_t i = first; i < list.size(); ++i) {
    ReflectedClass const* record = ClassOf(ptr<IPersistable>(list[i].m_persistable));
    objects.push_back({record ? &m_content.m_types.Of(*record) : nullptr, kNoNode, list[i].m_isRead});
  }
  return objects;
}

template <typename Read>
bool ArchiveWalker::ReadAhead(Read read) {
  if (!m_isRead) return false;
  const Mark mark = Here();
  m_archive.m_emptyElements = m_emptyRead;
  try {
    read();
    m_end = m_archive.m_position;
    m_releasesAtEnd = m_archive.m_releases;
  } catch (std::exception const& error) {
    m_isRead = false;
    SetError(error);
  }
  m_emptyRead = m_archive.m_emptyElements;
  GoBack(mark);
  return m_isRead;
}

// An archive of before has the contents within each other: then all is read at once.
inline void ArchiveWalker::ReadRoot() {
  ReadAhead([this] {
    pref<IPersistable> root;
    m_archive >> root;
  });
}

}  // namespace vesk
