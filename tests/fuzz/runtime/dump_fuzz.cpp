// Archives that are taken apart: the parts hold each byte once, whatever the bytes are, and the archive is in error
// where it cannot be read. The first byte of an input says as what the rest is taken, which is compared with the seed
// of its kind.
#include "Vesk/vxObject/DumpArchive.h"
#include "archive_seeds.h"

namespace {

void CheckParts(vesk::ArchiveView const& view) {
  std::size_t covered = 0;
  for (vesk::ArchivePart const& part : view.Parts()) {
    if (part.m_kind == vesk::AP_GROUP) {
      if (part.m_offset != covered || part.m_offset + part.m_size > view.Bytes().size()) std::abort();
      continue;
    }
    if (part.m_offset != covered || part.m_size == 0) std::abort();
    covered += part.m_size;
  }
  if (covered != view.Bytes().size()) std::abort();
}

void Use(vesk::ArchiveView const& view, vesk::ArchiveView const& other, bool isRead) {
  if (view.Error().empty() != isRead) std::abort();
  CheckParts(view);
  (void)vesk::TextOf([&](vesk::xostream& os) { view.Print(os); });
  if (vesk::Value today = view.Today()) (void)vesk::DumpText(today);
  if (!vesk::CompareArchives(view, view).empty()) std::abort();
  (void)vesk::CompareArchives(other, view);
  (void)vesk::CompareArchives(view, other);
}

template <typename T>
void TakeApart(Bytes const& bytes, Bytes const& seed) {
  vesk::InputArchive ar(bytes);
  T value = T();
  bool isRead = true;
  try {
    ar >> value;
    isRead = ar.Remaining() == 0;
  } catch (vesk::ArchiveError const&) {
    isRead = false;
  }
  ar.m_objects.Destroy();
  Use(vesk::ArchiveView::Of<T>(bytes), vesk::ArchiveView::Of<T>(seed), isRead);
  vesk::ArchiveOptions few;
  few.m_parts = 5;
  CheckParts(vesk::ArchiveView::Of<T>(bytes, few));
}

void TakeObjectsApart(Bytes const& bytes, Bytes const& seed) {
  bool isRead = true;
  try {
    vesk::InputArchive ar(bytes);
    vesk::pref<vesk::IPersistable> root;
    vesk::ReadObjectHead(ar);
    try {
      ar >> root;
      isRead = ar.Remaining() == 0;
    } catch (vesk::ArchiveError const&) {
      isRead = false;
    }
    ar.m_objects.Destroy();
  } catch (vesk::ArchiveError const&) {
    isRead = false;
  }
  Use(vesk::ArchiveView(bytes), vesk::ArchiveView(seed), isRead);
}

using TakeApartFunction = void (*)(Bytes const&, Bytes const&);
const TakeApartFunction kKinds[] = {
    TakeApart<kinds::Everything>,
    TakeApart<kinds::Size>,
    TakeApart<kinds::Value>,
    TakeApart<kinds::Tree>,
    TakeApart<kinds::Nothing>,
    TakeApart<vesk::openvariant<vesk::int32>>,
    TakeApart<kinds::Doc>,
    TakeApart<kinds::NoOps>,
    TakeApart<vesk::xvector<kinds::Direct>>,
    TakeApart<vesk::xmap<vesk::string8, vesk::xvector<kinds::Size>>>,
    TakeApart<vesk::xlist<vesk::xset<vesk::int16>>>,
    TakeApart<vesk::DynArray<vesk::string16>>,
    TakeApart<vesk::xvector<shapes::Colour>>,
    TakeApart<vesk::xvector<vesk::cref<kinds::Size>>>,
    TakeObjectsApart,
};
constexpr std::size_t kKindCount = sizeof(kKinds) / sizeof(*kKinds);

std::vector<Bytes> const& Seeds() {
  static const std::vector<Bytes> seeds = ArchiveSeeds();
  return seeds;
}

}  // namespace

extern "C" int LLVMFuzzerInitialize(int* count, char*** arguments) { return Begin(*count, *arguments, ArchiveSeeds); }

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size == 0) return 0;
  const std::size_t kind = data[0] % kKindCount;
  kKinds[kind](Bytes(data + 1, data + size), Seeds()[kind]);
  return 0;
}
