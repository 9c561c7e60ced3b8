// What differs: an archive and what is read of it today, and two archives.

@import "Vesk/vxObject/src/archive_view.h"

namespace vesk {

Value ArchiveView::Today() const {
  Content const& content = *m_content;
  if (!content.m_isWhole) return Value();
  return Value();
}
xvector<ArchiveChange> ArchiveView::Evolved() const { return {}; }
xvector<ArchiveChange> CompareArchives(ArchiveView const&, ArchiveView const&) { return {}; }

}  // namespace vesk
