// What an ArchiveView consists of: the parts as nodes of a tree, in the order of the bytes, and what was read.

@import "Vesk/vxObject/ValueTypes.h"
@import "Vesk/vxObject/views/limit_text.h"

namespace vesk {

constexpr uint32 kNoNode = 0xFFFFFFFF;

// How a node's path goes on from that of the group around it.
enum class EPathStep : octet_t {
  None,
  Field,    // ".label"
  Element,  // "[position]"
  Entry,    // "[key]", of a map: the key is the first node in it
  Key,      // the same as of the entry
  Object    // "#position": a path begins
};

struct ArchiveNode {
  EArchivePart m_kind = AP_GROUP;
  EPathStep m_step = EPathStep::None;
  bool m_isBlock = false;     // a list's scalars, side by side
  bool m_isNew = false;       // a reference to an object that was not mentioned before
  uint32 m_parent = kNoNode;  // the group around it
  uint32 m_end = 0;           // behind its last part
  uint32 m_position = 0;      // of an element; the number of an object
  uint32 m_detail = 0;        // what a reference leads to; the release that a project is in today
  std::size_t m_offset = 0;
  std::size_t m_size = 0;
  ValueType const* m_type = nullptr;  // of a value, a class, a container
  ConstStringZ m_label = nullptr;     // of a field; the text of what has no value
};

// Nodes that stand in a group, not in another one in it. The contents of objects are none of it.
template <typename Each>
void EachArchiveChild(xvector<ArchiveNode> const& nodes, uint32 group, Each each) {
  for (uint32 at = group + 1; at < nodes[group].m_end; at = nodes[at].m_end) {
    if (nodes[at].m_step != EPathStep::Object) each(at);
  }
}

// Whether a limit or an error may have cut off what else stands in a group.
inline bool IsCutOff(xvector<ArchiveNode> const& nodes, uint32 group) {
  return nodes.back().m_kind == AP_REST && nodes[group].m_end + 1 >= nodes.size();
}
// The value of a map's entry; any other node itself.
inline uint32 ArchiveValueIn(xvector<ArchiveNode> const& nodes, uint32 node) {
  if (nodes[node].m_step != EPathStep::Entry || node + 1 >= nodes[node].m_end) return node;
  const uint32 value = nodes[node + 1].m_end;
  return value < nodes[node].m_end ? value : node;
}

enum EArchiveName { AN_PROJECT, AN_CLASS, AN_TYPE };

// An object as it was mentioned first.
struct ArchivedObject {
  ValueType const* m_type = nullptr;  // null where it is not known
  uint32 m_node = kNoNode;            // its content
  bool m_isWalked = false;
};

struct ArchiveView::Content {
  Content(xvector<octet_t> bytes, ArchiveOptions const& options);
  ~Content();
  Content(Content const&) = delete;
  void operator=(Content const&) = delete;

  ArchiveOptions m_options;
  InputArchive m_archive;
  ValueTypes m_types;
  xstring m_error;
  xvector<ArchiveNode> m_nodes;
  xvector<std::size_t> m_firstParts;  // of each node; those of a block are many. At the end that of all.
  xvector<ArchivedObject> m_objects;
  xvector<ArchiveRelease> m_releases;
  ReflectedType m_declared;           // of what was written by `<<`
  ValueType const* m_type = nullptr;  // the same; null in an archive of objects
  TypeOps const* m_ops = nullptr;
  std::shared_ptr<void> m_hold;
  void* m_value = nullptr;  // what was read of it, held; or null
  bool m_isWhole = false;   // all was read, as of today

  octet_t const* BytesOf(ArchiveNode const& node) const { return m_archive.m_bytes.data() + node.m_offset; }
};

// --- Texts of nodes

// In quotes where it is a text; shortened.
xstring ArchiveValueText(ArchiveView::Content const& content, ValueType const& type, octet_t const* bytes);
xstring ArchivePathText(ArchiveView::Content const& content, uint32 node);
// Of a node that is no block and no group.
xstring ArchiveNodeText(ArchiveView::Content const& content, ArchiveNode const& node);

// Of a group, too: "3 elements", or the name of its type.
xstring ArchiveShortText(ArchiveView::Content const& content, uint32 node);

// The model that a class is archived by; null for a class without one.
ReflectedClass const* ModelOf(ReflectedClass const& record);

// A compact integer that is known to stand there.
uint32 CompactAt(octet_t const* bytes);

// Elements of a block that are shown as one part.
inline std::size_t PerPart(ValueType const& item) { return std::max<std::size_t>(1, 8 / item.m_size); }

}  // namespace vesk
