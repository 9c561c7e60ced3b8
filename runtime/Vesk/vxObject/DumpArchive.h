// The bytes of archives, as who looks into them sees them: DumpArchive is an annotated text of every byte of what
// WriteObject wrote; an ArchiveView has the same as data, with the release that wrote it, what the `$evolve` code makes
// of it, and what differs from another one.
//
//   offset    bytes                     path             type            value
//   00000000  ff 76 78 02                                head            objects, form 2
//   00000005  03 61 70 70                                project         "app"
//   00000009  01                                         release         1 of app, today 2
//   ...
//   00000013  03 41 6e 6e               #1.customer      string8         "Ann"
//   as it is read today:
//     #1.mean: not written -> 2
//
// The records of classes tell how their models were laid out in each release, so an archive of an old release is read
// as it was written. A class that has a Deserialise of its own tells nothing: its bytes are shown as they are, as far
// as it reads them. To know that, and what is made of the archive today, the objects are made and read as ReadObject
// does: what docs/trust.md says of archives of strangers goes for these functions.

@import "Vesk/vxObject/Access.h"

namespace vesk {

enum EArchivePart {
  AP_GROUP,      // an object, a class, a container: its parts follow, one deeper
  AP_MARK,       // what an archive of objects begins with
  AP_COUNT,      // how many follow
  AP_NAME,       // of a project, a class, a type
  AP_RELEASE,    // of a project
  AP_REFERENCE,  // the number of an object
  AP_TAG,        // which item of a variant follows
  AP_VALUE,      // a scalar, or several of a list; a text, an enumeration
  AP_BYTES,      // of something that its record does not tell
  AP_REST        // what was not read: it stands behind an error, the end of the object, or a limit
};

// Each byte is in one part that is no group.
struct ArchivePart {
  EArchivePart m_kind = AP_GROUP;
  std::size_t m_offset = 0;
  std::size_t m_size = 0;
  ssize_t m_depth = 0;
  xstring m_path;   // "#1.lines[2].amount" of the first object; without a number in an archive of `<<`
  xstring m_type;   // "int32", "a::Name"
  xstring m_value;  // enumerations by label, texts in quotes, shortened to the limit
};

struct ArchiveRelease {
  xstring m_project;
  RSN m_release;
  RSN m_current;  // of this program; -1 where it lacks the project
  bool m_occurs;  // whether models of it are in the archive
};

// Of `Added` there is no old text, of `Removed` no new one.
struct ArchiveChange {
  enum EKind { Added, Removed, Changed };
  EKind m_kind = Changed;
  xstring m_path;
  xstring m_type;
  xstring m_old;
  xstring m_new;
};

struct ArchiveOptions {
  ArchiveLimits m_limits;
  // As of an InputArchive: which classes and types may be made.
  std::function<bool(ReflectedClass const&)> m_allow;
  std::function<bool(xstring const&)> m_allowType;
  std::size_t m_parts = 1000000;  // what follows is one part, AP_REST
  std::size_t m_changes = 10000;  // told of a difference
  std::size_t m_text = 200;       // bytes of a value
};

// Bytes that were taken apart. It owns what was read of them. A hostile archive gives parts up to where it is wrong,
// and Error().
class ArchiveView {
 public:
  // What WriteObject wrote.
  explicit ArchiveView(xvector<octet_t> bytes, ArchiveOptions const& options = ArchiveOptions());
  // What `ar << x` wrote of a T, or of a type by its record or name: AccessError for one that is not registered.
  template <typename T>
  static ArchiveView Of(xvector<octet_t> bytes, ArchiveOptions const& options = ArchiveOptions()) {
    return ArchiveView(TypeOf<T>(), GetTypeOps<T>(), std::move(bytes), options);
  }
  ArchiveView(ReflectedType const& type, TypeOps const& ops, xvector<octet_t> bytes, ArchiveOptions const& options);
  static ArchiveView OfType(xstring const& name, xvector<octet_t> bytes,
                            ArchiveOptions const& options = ArchiveOptions());
  ArchiveView(ArchiveView&&) noexcept;
  ArchiveView& operator=(ArchiveView&&) noexcept;
  ~ArchiveView();

  // Why it cannot be read; empty when it can.
  xstring const& Error() const;
  xvector<octet_t> const& Bytes() const;
  // The class of the first object, or the type of the value; empty where it is not known.
  xstring Class() const;
  // Those that the archive names.
  xvector<ArchiveRelease> const& Releases() const;
  // What was read, as of today: good as long as this. Empty after an error.
  Value Today() const;

  std::size_t CountParts() const;
  // Part `first` and those behind it, at most `count`, in the order of the bytes.
  xvector<ArchivePart> Parts(std::size_t first = 0, std::size_t count = std::size_t(-1)) const;

  // How what was read differs from what was written: fields that were dropped since, and fields that were added, with
  // what `$evolve` made of them.
  xvector<ArchiveChange> Evolved() const;

  // All parts, the error and what evolved, as text.
  void Print(xostream& os) const;

  struct Content;
  Content const& Inside() const { return *m_content; }

 private:
  std::unique_ptr<Content> m_content;
};

// What was written differently, by paths; elements of lists that are the same are found though they have moved, entries
// of maps are found by their keys, and objects by the references to them. Both must outlive the call only.
xvector<ArchiveChange> CompareArchives(ArchiveView const& old, ArchiveView const& now);

xstring DumpArchive(xvector<octet_t> bytes, ArchiveOptions const& options = ArchiveOptions());
template <typename T>
xstring DumpArchiveOf(xvector<octet_t> bytes, ArchiveOptions const& options = ArchiveOptions()) {
  return TextOf([&](xostream& os) { ArchiveView::Of<T>(std::move(bytes), options).Print(os); });
}

}  // namespace vesk

// What stands above is defined here: a program that looks into no archive does not compile it.
@import "Vesk/vxObject/views/archive_walk.h"
@import "Vesk/vxObject/views/archive_text.h"
@import "Vesk/vxObject/views/archive_today.h"
@import "Vesk/vxObject/views/archive_changes.h"
