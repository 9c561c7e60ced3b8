// The walk through the bytes of an archive.

@import "Vesk/vxObject/views/archive_probe.h"
@import "Vesk/vxObject/JsonText.h"

namespace vesk {

// What the walk and the program's own code may take between two looks at it.
constexpr std::size_t kLeastStack = 128 * 1024;

// --- Parts

inline ArchiveWalker::Mark ArchiveWalker::Here() const {
  return {m_archive.m_position,      m_covered,           m_content.m_nodes.size(), m_content.m_objects.size(),
          m_archive.m_emptyElements, m_archive.m_releases};
}
inline void ArchiveWalker::GoBack(Mark const& mark) {
  m_archive.m_position = mark.m_position;
  m_archive.m_emptyElements = mark.m_emptyElements;
  m_archive.m_releases = mark.m_releases;
  m_covered = mark.m_covered;
  m_content.m_nodes.resize(mark.m_nodes);
  m_content.m_objects.resize(mark.m_objects);
}

// One place is kept for what is left over.
inline ArchiveNode* ArchiveWalker::Add(EArchivePart kind, ValueType const* type, Step step) {
  auto& nodes = m_content.m_nodes;
  if (nodes.size() + 1 >= std::min<std::size_t>(m_content.m_options.m_parts, kNoNode)) return nullptr;
  ArchiveNode node;
  node.m_kind = kind;
  node.m_step = step.m_step;
  node.m_label = step.m_label;
  node.m_position = step.m_position;
  node.m_parent = m_group;
  node.m_end = static_cast<uint32>(nodes.size() + 1);
  node.m_offset = m_covered;
  node.m_type = type;
  nodes.push_back(node);
  return &nodes.back();
}
inline ArchiveNode* ArchiveWalker::AddLeaf(EArchivePart kind, ValueType const* type, Step step) {
  ArchiveNode* const node = Add(kind, type, step);
  if (!node) return nullptr;
  node->m_size = m_archive.m_position - m_covered;
  m_covered = m_archive.m_position;
  return node;
}

inline void ArchiveWalker::Finish() {
  m_content.m_isWhole = m_isRead && m_content.m_error.empty();
  if (m_covered == m_archive.m_bytes.size()) return;
  ArchiveNode rest;
  rest.m_kind = AP_REST;
  rest.m_end = static_cast<uint32>(m_content.m_nodes.size() + 1);
  rest.m_offset = m_covered;
  rest.m_size = m_archive.m_bytes.size() - m_covered;
  m_content.m_nodes.push_back(rest);
}

// --- Values

inline void ArchiveWalker::Walk(ValueType const& type, Step step) {
  t_reading.m_target = nullptr;
  switch (type.m_kind) {
    case VK_NONE:
      throw ArchiveError("what stands there is not known: " + type.m_text);
    case VK_BOOL:
    case VK_INT:
    case VK_UINT:
    case VK_FLOAT:
    case VK_CHAR:
      return WalkScalar(type, step);
    case VK_TEXT:
      return WalkText(type, step);
    case VK_ENUM:
      return WalkEnum(type, step);
    case VK_CLASS:
      return WalkClass(type, step);
    case VK_LIST:
    case VK_SET:
    case VK_MAP:
      return WalkContainer(type, step);
    case VK_VARIANT:
      return WalkVariant(type, step);
    case VK_OPENVARIANT:
      return WalkOpenVariant(type, step);
    case VK_REFERENCE:
      return WalkReference(type, step);
  }
}

inline namespace views {

inline bool IsScalar(ValueType const& type) { return type.m_kind >= VK_BOOL && type.m_kind <= VK_CHAR; }

inline void CheckBools(ValueType const& type, octet_t const* bytes, std::size_t count) {
  if (type.m_kind != VK_BOOL) return;
  if (std::any_of(bytes, bytes + count, [](octet_t byte) { return byte > 1; })) FailArchive("not a bool");
}

// As LeastBytes has it of the C++ type.
inline std::size_t LeastBytesOf(ValueType const& type) {
  if (IsScalar(type)) return type.m_size;
  return type.m_kind == VK_CLASS || type.m_kind == VK_VARIANT || type.m_kind == VK_OPENVARIANT ? 0 : 1;
}
inline std::size_t LeastBytesOfEntry(ValueType const& container) {
  return LeastBytesOf(*container.m_item) + (container.m_key ? LeastBytesOf(*container.m_key) : 0);
}

}  // namespace views

inline void ArchiveWalker::WalkScalar(ValueType const& type, Step step) {
  CheckBools(type, m_archive.Take(type.m_size), 1);
  AddLeaf(AP_VALUE, &type, step);
}

inline void ArchiveWalker::WalkText(ValueType const& type, Step step) {
  const std::size_t size = type.m_code == RC_STRING16 ? sizeof(char16) : sizeof(char8);
  m_archive.Take(ReadCount(m_archive, size) * size);
  AddLeaf(AP_VALUE, &type, step);
}

inline void ArchiveWalker::WalkEnum(ValueType const& type, Step step) {
  const int32 number = static_cast<int32>(ReadCompact(m_archive));
  if (type.m_enum && number != 0 && !m_archive.m_limits.m_anyEnumNumber && !FindLabel(*type.m_enum, number)) {
    FailArchive("number without a label in an enumeration");
  }
  AddLeaf(AP_VALUE, &type, step);
}

inline xstring ArchiveWalker::TakeText() {
  const std::size_t count = ReadCount(m_archive, 1);
  return xstring(std::string(reinterpret_cast<char const*>(m_archive.Take(count)), count));
}

// --- Classes

inline void ArchiveWalker::WalkClass(ValueType const& type, Step step) {
  const ReadingScope scope(m_archive);
  if (StackLeft() < kLeastStack) FailArchive("values nested too deeply in an archive");
  WalkOpened(type, step);
}

inline void ArchiveWalker::WalkOpened(ValueType const& type, Step step) {
  const Group group(*this, &type, step);
  Layout const& layout = LayoutOf(*type.m_class);
  if (!layout.m_isKnown) return WalkBytes(ProbeClass(*type.m_class), m_content.m_objects.size());
  WalkFields(layout, layout.m_isOpen ? ProbeClass(*type.m_class) : Extent());
}

// What stands behind a field without a record is not known: it takes up the rest of the extent.
inline void ArchiveWalker::WalkFields(Layout const& layout, Extent const& extent) {
  const std::size_t firstMentioned = m_content.m_objects.size();
  if (layout.m_hasRelease) {
    const std::size_t position = m_archive.m_position;
    ReadCompact(m_archive);
    AddRelease(layout.m_target);
    m_archive.m_position = position;
    ReadRsn(*layout.m_target, m_archive);
  }
  const RSN release = layout.m_asksRelease ? ReleaseBeingRead(*layout.m_modelTarget) : layout.m_first;
  for (auto const& [field, type] : layout.m_fields) {
    if (!layout.IsIn(*field, release)) continue;
    const Step step = {EPathStep::Field, field->m_name, 0};
    if (type->m_kind == VK_NONE) return WalkBytes(extent, firstMentioned, step);
    Walk(*type, step);
  }
}

inline void ArchiveWalker::AddRelease(XTarget const* target) {
  ArchiveNode* const node = AddLeaf(AP_RELEASE, nullptr, {EPathStep::None, target ? target->m_name : nullptr, 0});
  if (node) node->m_detail = target ? static_cast<uint32>(target->m_rsn) : kNoNode;
}

// To the end of an extent, some of whose objects may have been walked.
inline void ArchiveWalker::WalkBytes(Extent const& extent, std::size_t firstMentioned, Step step) {
  auto& objects = m_content.m_objects;
  if (m_archive.m_position > extent.m_end || objects.size() - firstMentioned > extent.m_mentioned.size()) {
    FailArchive("not laid out as its record tells");
  }
  m_archive.m_position = extent.m_end;
  m_archive.m_releases = extent.m_releases;
  if (m_covered < extent.m_end) AddLeaf(AP_BYTES, nullptr, step);
  const std::size_t walked = objects.size() - firstMentioned;
  objects.insert(objects.end(), extent.m_mentioned.begin() + walked, extent.m_mentioned.end());
}

// --- Containers

inline void ArchiveWalker::WalkContainer(ValueType const& type, Step step) {
  const Group group(*this, &type, step);
  const std::size_t count = ReadCount(m_archive, LeastBytesOfEntry(type));
  AddLeaf(AP_COUNT);
  if (type.m_code == RC_ARRAY && count != static_cast<std::size_t>(type.m_count)) {
    FailArchive("fixed array of another size");
  }
  if (!type.m_key && IsScalar(*type.m_item)) return WalkBlock(*type.m_item, count);
  WalkEntries(type, count);
}

inline void ArchiveWalker::WalkBlock(ValueType const& item, std::size_t count) {
  if (count == 0) return;
  CheckBools(item, m_archive.Take(count * item.m_size), count);
  if (ArchiveNode* node = AddLeaf(AP_VALUE, &item, {EPathStep::Element, nullptr, 0})) node->m_isBlock = true;
}

inline void ArchiveWalker::WalkEntries(ValueType const& type, std::size_t count) {
  const bool mayBeEmpty = LeastBytesOfEntry(type) == 0;
  for (std::size_t i = 0; i < count; ++i) {
    const std::size_t position = m_archive.m_position;
    const uint32 number = static_cast<uint32>(i);
    if (type.m_key) {
      const Group entry(*this, nullptr, {EPathStep::Entry, nullptr, number});
      Walk(*type.m_key, {EPathStep::Key, nullptr, 0});
      Walk(*type.m_item, Step());
    } else {
      Walk(*type.m_item, {EPathStep::Element, nullptr, number});
    }
    if (mayBeEmpty && m_archive.m_position == position) m_archive.CountEmptyElement();
  }
}

// --- Variants

// An item without a record is read by the variant, which begins with the tag.
inline void ArchiveWalker::WalkVariant(ValueType const& type, Step step) {
  const ReadingScope scope(m_archive);
  if (StackLeft() < kLeastStack) FailArchive("values nested too deeply in an archive");
  const Group group(*this, &type, step);
  ReflectedVariant const& record = *type.m_variant;
  const std::size_t begin = m_archive.m_position;
  const std::size_t tag = ReadCompact(m_archive);
  if (tag >= static_cast<std::size_t>(record.m_numItems)) FailArchive("unknown tag of a variant");
  ConstStringZ const name = JsonItemName(record.m_items[tag].m_name).data();
  AddLeaf(AP_TAG, nullptr, {EPathStep::None, name, 0});
  ValueType const* const item = m_content.m_types.ItemOf(record, static_cast<ssize_t>(tag));
  if (item && item->m_code == RC_VOID) return;
  if (item && item->m_kind != VK_NONE) return Walk(*item, {EPathStep::Field, name, 0});
  m_archive.m_position = begin;
  WalkBytes(ProbeValue(*type.m_ops), m_content.m_objects.size());
}

inline void ArchiveWalker::WalkOpenVariant(ValueType const& type, Step step) {
  const ReadingScope scope(m_archive);
  if (StackLeft() < kLeastStack) FailArchive("values nested too deeply in an archive");
  const Group group(*this, &type, step);
  const std::size_t begin = m_archive.m_position;
  const xstring name = TakeText();
  AddName(AN_TYPE);
  m_archive.m_position = begin;
  TypeOps const* const ops = AnyValue::ReadType(m_archive);
  if (!ops) return;
  if (ValueType const* held = JsonTypeOfName(m_content.m_types, name)) return Walk(*held, Step());
  const std::size_t position = m_archive.m_position;
  m_archive.m_position = begin;
  const Extent extent = ProbeValue(GetTypeOps<openvariant<int32>>());
  m_archive.m_position = position;
  WalkBytes(extent, m_content.m_objects.size());
}

// --- References

inline void ArchiveWalker::WalkReference(ValueType const& type, Step step) {
  auto& objects = m_content.m_objects;
  const std::size_t known = objects.size();
  const std::size_t number = ReadCompact(m_archive);
  if (ArchiveNode* node = AddLeaf(AP_REFERENCE, &type, step)) {
    node->m_isNew = number > known;
    node->m_detail = static_cast<uint32>(std::min(number, known + 1));
  }
  if (number <= known) return;
  if (number > known + 2) FailArchive("reference to an object that is not in the archive");
  if (known >= m_archive.m_limits.m_objects) FailArchive("too many objects in an archive");
  ReflectedClass const* const target = type.m_code == RC_CREF ? Find<ReflectedClass>(type.m_target) : nullptr;
  if (type.m_code == RC_PREF || (target && target->m_objectTable)) {
    objects.push_back({WalkClassName(step), kNoNode, false});
  } else {
    objects.push_back({target ? &m_content.m_types.Of(*target) : nullptr, kNoNode, false});
  }
  if (number == known + 1) WalkContent(known);
  if (m_isInReference) return;
  const FlagScope inReference(m_isInReference);
  for (std::size_t i = known; i < objects.size(); ++i) {
    if (!objects[i].m_isWalked) WalkContent(i);
  }
}

inline void ArchiveWalker::AddName(EArchiveName what, Step step) {
  if (ArchiveNode* node = AddLeaf(AP_NAME, nullptr, step)) node->m_detail = what;
}

inline ValueType const* ArchiveWalker::WalkClassName(Step step) {
  const xstring name = TakeText();
  AddName(AN_CLASS, step);
  ReflectedClass const* const record = Find<ReflectedClass>(name);
  if (!record) throw ArchiveError(NotRegistered("class", name));
  auto const& allow = m_archive.m_objects.m_allow;
  if (allow && !allow(*record)) throw ArchiveError("class is not allowed: " + name);
  return &m_content.m_types.Of(*record);
}

// A plain struct is read by `>>`, an object is not.
inline void ArchiveWalker::WalkContent(std::size_t object) {
  if (StackLeft() < kLeastStack) FailArchive("objects nested too deeply in an archive");
  m_content.m_objects[object].m_isWalked = true;
  ValueType const* const type = m_content.m_objects[object].m_type;
  const Step step = {EPathStep::Object, nullptr, static_cast<uint32>(object + 1)};
  m_content.m_objects[object].m_node = static_cast<uint32>(m_content.m_nodes.size());
  if (!type) throw ArchiveError("what stands there is not known");
  const ArchiveScope scope(m_archive);
  if (type->m_class->m_objectTable) return WalkOpened(*type, step);
  WalkClass(*type, step);
}

// --- Whole archives

// The walk has to end where that ended which was read ahead; if it cannot, the bytes are shown as they are.
template <typename Action>
void ArchiveWalker::WalkAsRead(ValueType const* type, Step step, Action walk) {
  const Extent extent = {m_end, ObjectsFrom(m_content.m_objects.size()), m_releasesAtEnd};
  const Mark mark = Here();
  try {
    walk();
    if (m_archive.m_position == extent.m_end) return;
  } catch (ArchiveError const&) {
  }
  GoBack(mark);
  const Group group(*this, type, step);
  WalkBytes(extent, mark.m_objects);
}

inline void ArchiveWalker::Head() {
  if (m_archive.Remaining() == 0 || m_archive.m_bytes[0] != ObjectMark[0]) return;
  std::exception_ptr error;
  try {
    ReadObjectHead(m_archive);
  } catch (ArchiveError const&) {
    error = std::current_exception();
  }
  m_archive.m_position = 0;
  octet_t const* const mark = m_archive.Take(sizeof(ObjectMark));
  if (std::equal(mark, mark + 3, ObjectMark)) {
    AddLeaf(AP_MARK);
    if (mark[3] == ObjectMark[3]) {
      HeadReleases(true);
      HeadReleases(false);
    }
  }
  if (error) std::rethrow_exception(error);
}

inline void ArchiveWalker::HeadReleases(bool occurs) {
  const xvector<XTarget const*> targets = AllTargets();
  std::size_t count = ReadCount(m_archive, 2);
  AddLeaf(AP_COUNT, nullptr, {EPathStep::None, occurs ? "whose models occur" : "others", 0});
  for (; count > 0; --count) {
    const xstring name = TakeText();
    AddName(AN_PROJECT);
    const RSN release = ReadCompact(m_archive);
    const auto target =
        std::find_if(targets.begin(), targets.end(), [&name](XTarget const* t) { return name == t->m_name; });
    const bool isKnown = target != targets.end();
    AddRelease(isKnown ? *target : nullptr);
    m_content.m_releases.push_back({name, release, isKnown ? (*target)->m_rsn : -1, occurs});
  }
}

inline void ArchiveWalker::Objects() {
  try {
    if (!m_content.m_error.empty()) return Finish();
    Head();
    m_isInReference = m_archive.m_objects.m_isReading = true;
    ReadRoot();
    ValueType const& root = m_content.m_types.Of(TypeAround(RC_PREF, NamedType(RC_INTERFACE, "vesk::IPersistable")));
    const auto walk = [this, &root] { WalkReference(root, Step()); };
    m_isRead ? WalkAsRead(nullptr, Step(), walk) : walk();
    for (std::size_t i = 0; i < m_content.m_objects.size(); ++i) WalkContentAsRead(i);
    if (m_archive.Remaining() > 0) FailArchive("bytes behind the object");
  } catch (std::exception const& error) {
    SetError(error);
  }
  Finish();
}

inline void ArchiveWalker::WalkContentAsRead(std::size_t object) {
  if (m_content.m_objects[object].m_isWalked) return;
  if (!ReadAhead([this, object] { ReadContent(m_archive, object); })) return WalkContent(object);
  WalkAsRead(m_content.m_objects[object].m_type, {EPathStep::Object, nullptr, static_cast<uint32>(object + 1)},
             [this, object] { WalkContent(object); });
  m_content.m_objects[object].m_isWalked = true;
}

inline void ArchiveWalker::Value() {
  ValueType const& type = *m_content.m_type;
  TypeOps const& ops = *m_content.m_ops;
  try {
    if (!m_content.m_error.empty()) return Finish();
    ReadAhead([this, &ops] {
      auto scratch = std::make_unique<Scratch>(ops);
      m_content.m_value = scratch->m_value;
      m_content.m_hold = std::shared_ptr<void>(std::move(scratch));
      ops.m_deserialise(m_archive, m_content.m_value, 0, 1);
    });
    const auto walk = [this, &type] { Walk(type, Step()); };
    m_isRead ? WalkAsRead(&type, Step(), walk) : walk();
    if (m_archive.Remaining() > 0) FailArchive("bytes behind the value");
  } catch (std::exception const& error) {
    SetError(error);
  }
  Finish();
}

}  // namespace vesk
