// Takes an archive apart along the records of its types, as `>>` would read it: with the same releases, limits and
// errors. What records do not tell is read by the program's own code, into values that are made for it. That code also
// reads each object as of today, ahead of the walk: should both not end at the same byte, the record does not tell how
// the object is written, and its bytes are shown as they are.

@import "Vesk/vxObject/views/archive_view.h"

namespace vesk {

// How the path goes on to a part.
struct ArchiveStep {
  EPathStep m_step = EPathStep::None;
  ConstStringZ m_label = nullptr;
  uint32 m_position = 0;
};

class ArchiveWalker {
 public:
  explicit ArchiveWalker(ArchiveView::Content& content) : m_content(content), m_archive(content.m_archive) {}
  ~ArchiveWalker() { t_reading = m_outer; }
  ArchiveWalker(ArchiveWalker const&) = delete;
  void operator=(ArchiveWalker const&) = delete;

  void Objects();
  void Value();

 private:
  typedef ArchiveStep Step;
  // How a class stands in an archive, by its record.
  struct Layout {
    struct Field {
      ReflectedModelField const* m_field;
      ValueType const* m_type;
    };
    bool IsIn(ReflectedModelField const& field, RSN release) const {
      return (field.m_added == m_first || release >= field.m_added) &&
             (field.m_dropped < 0 || release < field.m_dropped);
    }
    bool m_isKnown = false;
    bool m_hasRelease = false;  // begins with that of its project
    bool m_asksRelease = false;
    bool m_isOpen = false;                   // a field has no record
    XTarget const* m_target = nullptr;       // of the class
    XTarget const* m_modelTarget = nullptr;  // of its model
    RSN m_first = 0;
    xvector<Field> m_fields;
  };
  typedef xvector<std::pair<XTarget const*, RSN>> ReleaseList;
  // Where the walk can go on from.
  struct Mark {
    std::size_t m_position, m_covered, m_nodes, m_objects, m_emptyElements;
    ReleaseList m_releases;
  };
  struct Group;
  struct Scratch;

  // --- What the program reads (parts/archive_probe.h)

  Layout const& LayoutOf(ReflectedClass const& record);
  void FillLayout(Layout& layout, ReflectedClass const& record);
  static bool BeginsWithRelease(ReflectedClass const& record);
  // Where a value ends that begins here, and what it mentions.
  struct Extent {
    std::size_t m_end;
    xvector<ArchivedObject> m_mentioned;
    ReleaseList m_releases;
  };
  template <typename Read>
  Extent Probe(Read read);
  Extent ProbeValue(TypeOps const& ops);
  Extent ProbeClass(ReflectedClass const& record);
  xvector<ArchivedObject> ObjectsFrom(std::size_t first);
  // Reads what begins here; the walk stays where it is. False once that has failed.
  template <typename Read>
  bool ReadAhead(Read read);
  void ReadRoot();

  // --- The walk (parts/archive_walk.h)

  void Head();
  void HeadReleases(bool occurs);
  void WalkAllContents();
  void WalkContentAsRead(std::size_t object);
  void WalkContent(std::size_t object);
  template <typename Action>
  void WalkAsRead(ValueType const* type, Step step, Action walk);
  void Walk(ValueType const& type, Step step);
  void WalkScalar(ValueType const& type, Step step);
  void WalkText(ValueType const& type, Step step);
  void WalkEnum(ValueType const& type, Step step);
  void WalkClass(ValueType const& type, Step step);
  void WalkOpened(ValueType const& type, Step step);
  void WalkFields(Layout const& layout, Extent const& extent);
  void WalkContainer(ValueType const& type, Step step);
  void WalkEntries(ValueType const& type, std::size_t count);
  void WalkBlock(ValueType const& item, std::size_t count);
  void WalkVariant(ValueType const& type, Step step);
  void WalkOpenVariant(ValueType const& type, Step step);
  void WalkReference(ValueType const& type, Step step);
  ValueType const* WalkClassName(Step step);
  void AddName(EArchiveName what, Step step = Step());
  void AddRelease(XTarget const* target);  // null: not of this program
  void WalkBytes(Extent const& extent, std::size_t firstMentioned, Step step = Step());
  xstring TakeText();

  Mark Here() const;
  void GoBack(Mark const& mark);
  // Where the last part ended. Null where there are too many.
  ArchiveNode* Add(EArchivePart kind, ValueType const* type, Step step);
  // Goes on to the position.
  ArchiveNode* AddLeaf(EArchivePart kind, ValueType const* type = nullptr, Step step = Step());
  void Finish();
  void SetError(std::exception const& error) {
    if (m_content.m_error.empty()) m_content.m_error = *error.what() ? error.what() : "error";
  }

  ArchiveView::Content& m_content;
  InputArchive& m_archive;
  const ReadingState m_outer = t_reading;
  std::unordered_map<ReflectedClass const*, Layout> m_layouts;
  uint32 m_group = kNoNode;      // the innermost one
  std::size_t m_covered = 0;     // by parts
  std::size_t m_end = 0;         // of what was read ahead
  ReleaseList m_releasesAtEnd;   // there
  std::size_t m_emptyRead = 0;   // elements
  std::size_t m_checkable = 0;   // bytes: checks within checks may read the same again and again
  bool m_isRead = true;          // so far all could be read as of today
  bool m_isChecked = false;      // each class is held against what its own code reads
  bool m_isInReference = false;  // the contents of what is mentioned follow later
};

// Parts up to its end stand in it.
struct ArchiveWalker::Group {
  Group(ArchiveWalker& walker, ValueType const* type, Step step) : m_walker(walker), m_outer(walker.m_group) {
    auto& nodes = walker.m_content.m_nodes;
    if (!walker.Add(AP_GROUP, type, step)) return;
    m_node = static_cast<uint32>(nodes.size() - 1);
    walker.m_group = m_node;
  }
  ~Group() {
    if (m_node != kNoNode) {
      ArchiveNode& node = m_walker.m_content.m_nodes[m_node];
      node.m_size = m_walker.m_covered - node.m_offset;
      node.m_end = static_cast<uint32>(m_walker.m_content.m_nodes.size());
    }
    m_walker.m_group = m_outer;
  }
  Group(Group const&) = delete;
  void operator=(Group const&) = delete;

  ArchiveWalker& m_walker;
  uint32 m_node = kNoNode;
  uint32 m_outer;
};

}  // namespace vesk
