#include "text/index_set.h"

namespace qrex {

IndexSet::Node& IndexSet::Own(Link& link) {
  if (!link) {
    link = new Node;
  } else if (link->use_count() > 1) {
    link = new Node(*link);
  }
  return *link;
}

void IndexSet::Add(size_t index) {
  if (Has(index)) return;
  Link* link = &m_root;
  for (size_t block = index / 64; block != 0; block = (block - 1) / kChildren) {
    link = &Own(*link).children[(block - 1) % kChildren];
  }
  Own(*link).bits |= uint64_t{1} << (index % 64);
}

void IndexSet::Unite(Link& ours, const Link& theirs) {
  if (ours == theirs || !theirs) return;
  if (!ours) {
    ours = theirs;
    return;
  }
  if ((theirs->bits & ~ours->bits) != 0) Own(ours).bits |= theirs->bits;
  bool isTheirs = ours->bits == theirs->bits;
  for (size_t i = 0; i < kChildren; ++i) {
    if (ours->use_count() == 1) {
      Unite(ours->children[i], theirs->children[i]);
    } else {
      Link child = ours->children[i];
      Unite(child, theirs->children[i]);
      if (child != ours->children[i]) Own(ours).children[i] = std::move(child);
    }
    isTheirs = isTheirs && ours->children[i] == theirs->children[i];
  }
  if (isTheirs) ours = theirs;
}

}  // namespace qrex
