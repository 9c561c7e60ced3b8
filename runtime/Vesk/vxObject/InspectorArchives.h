// Archives that are dropped on the page: their bytes part by part, what was read of them, the release that wrote them,
// what
// `$evolve` made of them, and how the second differs from the first. Reading one makes objects of registered classes,
// as ReadObject does: docs/trust.md says what that may do.

@import "Vesk/vxObject/DumpArchive.h"
@import "Vesk/vxObject/InspectorJson.h"
@import "Vesk/vxObject/Json.h"

namespace vesk {

class InspectorArchives {
 public:
  static constexpr std::size_t kMostParts = 500;  // of an answer

  // Takes what WriteObject wrote, or with a type's name what `<<` wrote of a value.
  void Open(InspectorWriter& out, ssize_t slot, xstring const& type, std::string_view bytes) {
    std::optional<ArchiveView>& view = At(slot);
    view.reset();
    ArchiveOptions options;
    options.m_parts = 200000;
    options.m_changes = 1000;
    options.m_limits.m_objects = 1 << 20;
    xvector<octet_t> copy(bytes.begin(), bytes.end());
    view.emplace(type.empty() ? ArchiveView(std::move(copy), options)
                              : ArchiveView::OfType(type, std::move(copy), options));
    out.Member("size", view->Bytes().size()).Member("class", view->Class()).Member("parts", view->CountParts());
    if (!view->Error().empty()) out.Member("error", view->Error());
    out.Name("releases").Open('[');
    for (ArchiveRelease const& release : view->Releases()) {
      out.Open('{').Member("project", release.m_project).Member("release", release.m_release);
      out.Member("current", release.m_current).Member("occurs", release.m_occurs).Close('}');
    }
    out.Close(']').Name("evolved");
    PutChanges(out, view->Evolved());
    PutToday(out, view->Today());
  }

  void Parts(InspectorWriter& out, ssize_t slot, ssize_t first, ssize_t count) {
    ArchiveView const& view = Opened(slot);
    xvector<octet_t> const& bytes = view.Bytes();
    out.Name("parts").Open('[');
    const std::size_t most = std::min<std::size_t>(static_cast<std::size_t>(std::max<ssize_t>(count, 0)), kMostParts);
    for (ArchivePart const& part : view.Parts(static_cast<std::size_t>(std::max<ssize_t>(first, 0)), most)) {
      out.Open('{').Member("at", part.m_offset).Member("size", part.m_size).Member("depth", part.m_depth);
      out.Member("group", part.m_kind == AP_GROUP).Member("rest", part.m_kind == AP_REST);
      out.Member("path", part.m_path).Member("type", part.m_type).Member("text", part.m_value);
      out.Member("bytes", Hex(bytes, part)).Close('}');
    }
    out.Close(']');
  }

  // What the second has other than the first.
  void Compare(InspectorWriter& out) {
    out.Name("changes");
    PutChanges(out, CompareArchives(Opened(0), Opened(1)));
  }

 private:
  static constexpr std::size_t kMostText = 256 << 10;

  std::optional<ArchiveView>& At(ssize_t slot) {
    if (slot != 0 && slot != 1) throw InspectorError("there are two archives");
    return m_views[slot];
  }
  ArchiveView const& Opened(ssize_t slot) {
    if (!At(slot)) throw InspectorError("no archive is open");
    return *At(slot);
  }
  static xstring Hex(xvector<octet_t> const& bytes, ArchivePart const& part) {
    constexpr std::size_t kMostBytes = 12;
    constexpr char kDigits[] = "0123456789abcdef";
    xstring text;
    if (part.m_kind == AP_GROUP) return text;
    for (std::size_t i = part.m_offset; i < part.m_offset + part.m_size && i < bytes.size(); ++i) {
      if (i - part.m_offset == kMostBytes) return text + "\xE2\x80\xA6";
      text += kDigits[bytes[i] >> 4];
      text += kDigits[bytes[i] & 15];
      text += ' ';
    }
    return text;
  }
  static void PutChanges(InspectorWriter& out, xvector<ArchiveChange> const& changes) {
    constexpr ConstStringZ kKinds[] = {"added", "removed", "changed"};
    constexpr std::size_t kMostChanges = 1000;
    out.Open('[');
    for (ArchiveChange const& change : changes) {
      if (out.Size() > kMostText || &change - changes.data() >= static_cast<ssize_t>(kMostChanges)) break;
      out.Open('{').Member("kind", kKinds[change.m_kind]).Member("path", change.m_path).Member("type", change.m_type);
      out.Member("old", change.m_old).Member("now", change.m_new).Close('}');
    }
    out.Close(']');
  }
  static void PutToday(InspectorWriter& out, Value const& value) {
    if (!value) return;
    JsonStyle style;
    style.m_indent = 2;
    style.m_replaceInvalid = true;
    JsonLimits limits;
    limits.m_bytes = 8 << 20;
    try {
      xstring text = ToJson(value, style, limits);
      if (text.size() > kMostText) text.resize(kMostText);
      out.Member("today", text);
    } catch (AccessError const& error) {
      out.Member("today", error.what());
    }
  }

  std::optional<ArchiveView> m_views[2];
};

}  // namespace vesk
