// What the targets that read archives begin with.
#pragma once

#include "kinds/graph.h"
#include "kinds/kinds.h"
#include "kinds/models.h"
#include "seeds.h"

using Bytes = vesk::xvector<vesk::octet_t>;

template <typename T>
Bytes Written(T const& value) {
  vesk::Archive ar;
  ar << value;
  return ar.m_bytes;
}

// An archive of each kind, in the order of the kinds.
inline std::vector<Bytes> ArchiveSeeds() {
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
          vesk::WriteObject(vesk::ptr<kinds::IDoc>(&doc))};
}
