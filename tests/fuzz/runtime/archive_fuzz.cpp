// Archives of every kind. The first byte of an input says as what the rest is read; an archive is read or refused with
// an ArchiveError, and what was read is printed, compared, copied, and written again. What is written of it is read
// back as the same bytes. Taken apart, its parts hold each byte once, whatever the bytes are, and it is in error where
// it cannot be read; it is compared with the seed of its kind.
#include "Vesk/vxObject/DumpArchive.h"
#include "kinds/graph.h"
#include "kinds/kinds.h"
#include "kinds/models.h"
#include "seeds.h"

namespace {

using Bytes = vesk::xvector<vesk::octet_t>;

template <typename T>
Bytes Written(T const& value) {
  vesk::Archive ar;
  ar << value;
  return ar.m_bytes;
}

// An archive of each kind, in the order of the kinds.
std::vector<Bytes> ArchiveSeeds() {
  kinds::Doc doc, next;
  doc.title = "title";
  doc.next = &next;
  next.next = &doc;
  doc.list.push_back(vesk::pref<kinds::IDoc>(&next));
  kinds::Size size(4);
  kinds::Everything all;
  all.reference = &size;
  all.any = vesk::string8("any");
  all.docs.push_back(vesk::pref<kinds::IDoc>(&doc));
  const kinds::Tree leaf(vesk::int32(7));
  kinds::Tree::node node;
  node.branches = {leaf, leaf};
  const Bytes numbers = Written(vesk::xvector<vesk::int32>{1, 2, 3});
  return {Written(all),
          Written(size),
          Written(kinds::Value(kinds::Value::list({1, 2}))),
          Written(kinds::Tree(node)),
          {1},
          Written(vesk::openvariant<vesk::int32>(size)),
          Written(doc),
          Written(kinds::NoOps()),
          numbers,
          Written(vesk::xmap<vesk::string8, vesk::xvector<kinds::Size>>{{"key", {size}}}),
          Written(vesk::xlist<vesk::xset<vesk::int16>>{{1, 2}}),
          Written(vesk::DynArray<vesk::string16>{vesk::string16(2, 'a')}),
          {1, 5},
          Written(vesk::xvector<vesk::cref<kinds::Size>>{&size, &size}),
          Written(vesk::xvector<kinds::Direct>(2)),
          vesk::WriteObject(vesk::ptr<kinds::IDoc>(&doc))};
}

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

void UseView(vesk::ArchiveView const& view, vesk::ArchiveView const& other, bool isRead) {
  if (view.Error().empty() != isRead) std::abort();
  CheckParts(view);
  (void)vesk::TextOf([&](vesk::xostream& os) { view.Print(os); });
  if (vesk::Value today = view.Today()) (void)vesk::DumpText(today);
  if (!vesk::CompareArchives(view, view).empty()) std::abort();
  (void)vesk::CompareArchives(other, view);
  (void)vesk::CompareArchives(view, other);
}

// What lies behind references is written too, but without a plain order of addresses: only values are written twice.
template <typename T, bool HasReferences>
void UseValue(T const& value) {
  const T copy = value;
  if constexpr (vesk::HasEqual<T>) (void)(copy == value);
  if constexpr (vesk::HasLess<T>) (void)(copy < value);
  if constexpr (vesk::Detects<vesk::PrintExpression, T>) (void)vxMakeString(value);
  const Bytes written = Written(value);
  if constexpr (!HasReferences) {
    vesk::InputArchive again(written);
    T reread = T();
    again >> reread;
    if (again.Remaining() > 0 || Written(reread) != written) std::abort();
  }
}

// Whether the archive is read to its end; what was read is used.
template <typename Read, typename Use>
bool IsRead(Bytes const& bytes, Read read, Use use) {
  vesk::InputArchive ar(bytes);
  bool isRead = false;
  try {
    auto const value = read(ar);
    isRead = ar.Remaining() == 0;
    use(value);
  } catch (vesk::ArchiveError const&) {
  }
  ar.m_objects.Destroy();  // the reader's
  return isRead;
}

template <typename T>
T ReadAs(vesk::InputArchive& ar) {
  T value = T();
  ar >> value;
  return value;
}

template <typename T>
void TakeApart(Bytes const& bytes, Bytes const& seed, bool isRead) {
  UseView(vesk::ArchiveView::Of<T>(bytes), vesk::ArchiveView::Of<T>(seed), isRead);
  vesk::ArchiveOptions few;
  few.m_parts = 5;
  CheckParts(vesk::ArchiveView::Of<T>(bytes, few));
}

template <typename T, bool HasReferences>
void ReadAndTakeApart(Bytes const& bytes, Bytes const& seed) {
  TakeApart<T>(bytes, seed, IsRead(bytes, ReadAs<T>, UseValue<T, HasReferences>));
}

// Elements without a record, of no bytes.
void ReadNothings(Bytes const& bytes, Bytes const&) {
  using Nothings = vesk::xvector<kinds::None>;
  (void)IsRead(bytes, ReadAs<Nothings>, UseValue<Nothings, false>);
}

// Elements that are not printed.
void TakeModelsApart(Bytes const& bytes, Bytes const& seed) {
  using Models = vesk::xvector<kinds::Direct>;
  TakeApart<Models>(bytes, seed, IsRead(bytes, ReadAs<Models>, Written<Models>));
}

template <typename Interface>
bool IsObjectRead(Bytes const& bytes) {
  const auto read = [](vesk::InputArchive& ar) {
    vesk::pref<Interface> root;
    vesk::ReadObjectHead(ar);
    ar >> root;
    return root;
  };
  return IsRead(bytes, read, [](vesk::pref<Interface> const& root) { return root && !Written(root).empty(); });
}

void ReadObjects(Bytes const& bytes, Bytes const& seed) {
  (void)IsObjectRead<kinds::IDoc>(bytes);
  const bool isRead = IsObjectRead<vesk::IPersistable>(bytes);
  UseView(vesk::ArchiveView(bytes), vesk::ArchiveView(seed), isRead);
}

using Take = void (*)(Bytes const& bytes, Bytes const& seed);
const Take kKinds[] = {
    ReadAndTakeApart<kinds::Everything, true>,
    ReadAndTakeApart<kinds::Size, false>,
    ReadAndTakeApart<kinds::Value, false>,
    ReadAndTakeApart<kinds::Tree, false>,
    ReadAndTakeApart<kinds::Nothing, false>,
    ReadAndTakeApart<vesk::openvariant<vesk::int32>, true>,
    ReadAndTakeApart<kinds::Doc, true>,
    ReadAndTakeApart<kinds::NoOps, false>,
    ReadNothings,
    ReadAndTakeApart<vesk::xmap<vesk::string8, vesk::xvector<kinds::Size>>, false>,
    ReadAndTakeApart<vesk::xlist<vesk::xset<vesk::int16>>, false>,
    ReadAndTakeApart<vesk::DynArray<vesk::string16>, false>,
    ReadAndTakeApart<vesk::xvector<shapes::Colour>, false>,
    ReadAndTakeApart<vesk::xvector<vesk::cref<kinds::Size>>, true>,
    TakeModelsApart,
    ReadObjects,
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
