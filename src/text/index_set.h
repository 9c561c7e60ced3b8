// A set of small numbers: what one file of a build sees of the others. There are as many sets as files, and along a
// chain of imports each is the one before it and a number more; as plain bits they would take memory that grows with
// the square of the chain. So a set is a tree of small nodes, and sets share those in which they agree: a copy is one
// pointer, a union takes over what only the other has, and a number that is added copies the nodes on the way to it.
//
// The root has the numbers below 64. Of the blocks of 64 behind these, each of its children has every fourth, numbered
// anew: block n is block (n - 1) / 4 of child (n - 1) % 4. A tree thus needs no height and looks the same however it
// came to be. Sets that share nodes belong to one thread.
#pragma once

#include <array>
#include <boost/smart_ptr/intrusive_ptr.hpp>
#include <boost/smart_ptr/intrusive_ref_counter.hpp>
#include <cstddef>
#include <cstdint>

namespace qrex {

class IndexSet {
 public:
  void Add(size_t index);
  void Add(const IndexSet& other) { Unite(m_root, other.m_root); }
  bool Has(size_t index) const {
    const Node* node = m_root.get();
    for (size_t block = index / 64; node && block != 0; block = (block - 1) / kChildren) {
      node = node->children[(block - 1) % kChildren].get();
    }
    return node && (node->bits >> (index % 64) & 1) != 0;
  }
  bool Empty() const { return !m_root; }

 private:
  static constexpr size_t kChildren = 4;
  struct Node;
  using Link = boost::intrusive_ptr<Node>;
  struct Node : boost::intrusive_ref_counter<Node, boost::thread_unsafe_counter> {
    uint64_t bits = 0;
    std::array<Link, kChildren> children;
  };

  // The node, to be changed: a new one where there is none or it is another set's as well.
  static Node& Own(Link& link);
  static void Unite(Link& ours, const Link& theirs);

  Link m_root;
};

}  // namespace qrex
