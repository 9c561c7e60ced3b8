// Archives of every kind. The first byte of an input says as what the rest is read; an archive is read or refused with
// an ArchiveError, and what was read is printed, compared, copied, and written again. What is written of it is read
// back as the same bytes.
#include <functional>

#include "archive_seeds.h"

namespace {

// What lies behind references is written too, but without a plain order of addresses: only values are written twice.
template <typename T, bool HasReferences>
void ReadAndUse(Bytes bytes) {
  vesk::InputArchive ar(std::move(bytes));
  T value = T();
  try {
    ar >> value;
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
  } catch (vesk::ArchiveError const&) {
  }
  ar.m_objects.Destroy();  // the reader's
}

void ReadObjectGraph(Bytes bytes) {
  vesk::InputArchive ar(std::move(bytes));
  vesk::pref<kinds::IDoc> root;
  try {
    vesk::ReadObjectHead(ar);
    ar >> root;
    if (root) (void)Written(root);
  } catch (vesk::ArchiveError const&) {
  }
  ar.m_objects.Destroy();  // the reader's
}

using Read = void (*)(Bytes);
const Read kKinds[] = {
    ReadAndUse<kinds::Everything, true>,
    ReadAndUse<kinds::Size, false>,
    ReadAndUse<kinds::Value, false>,
    ReadAndUse<kinds::Tree, false>,
    ReadAndUse<kinds::Nothing, false>,
    ReadAndUse<vesk::openvariant<vesk::int32>, true>,
    ReadAndUse<kinds::Doc, true>,
    ReadAndUse<kinds::NoOps, false>,
    ReadAndUse<vesk::xvector<kinds::None>, false>,
    ReadAndUse<vesk::xmap<vesk::string8, vesk::xvector<kinds::Size>>, false>,
    ReadAndUse<vesk::xlist<vesk::xset<vesk::int16>>, false>,
    ReadAndUse<vesk::DynArray<vesk::string16>, false>,
    ReadAndUse<vesk::xvector<shapes::Colour>, false>,
    ReadAndUse<vesk::xvector<vesk::cref<kinds::Size>>, true>,
    ReadObjectGraph,
};
constexpr std::size_t kKindCount = sizeof(kKinds) / sizeof(*kKinds);

}  // namespace

extern "C" int LLVMFuzzerInitialize(int* count, char*** arguments) { return Begin(*count, *arguments, ArchiveSeeds); }

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size > 0) kKinds[data[0] % kKindCount](Bytes(data + 1, data + size));
  return 0;
}
