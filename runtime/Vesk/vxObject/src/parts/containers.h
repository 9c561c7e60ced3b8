// Containers whose elements are known only by their type, through containers of stand-ins (see ValueTypes.h). Each view
// takes the time to compile all that it is asked for.

@import "Vesk/vxObject/ValueTypes.h"
@import "Vesk/vxObject/src/parts/deques.h"

namespace vesk {

struct DynArrayView {
  static ssize_t& Size(void* array) { return static_cast<DynArray<octet_t>*>(array)->m_size; }
  static octet_t*& Items(void* array) { return static_cast<DynArray<octet_t>*>(array)->m_items; }
};

namespace {

// --- Lists and trees: one view of each kind, whose nodes have room for what is really in them

// Where an entry stands in its node depends on its alignment alone: a node that was just made tells.
template <std::size_t Align>
struct Probe {
  friend bool operator<(Probe const&, Probe const&) { return false; }
  alignas(Align) octet_t m_bytes[Align];
};
thread_local void* t_node = nullptr;  // the last one that was allocated
template <typename Node>
struct ProbeAllocator {
  typedef Node value_type;
  ProbeAllocator() {}
  template <typename Other>
  ProbeAllocator(ProbeAllocator<Other> const&) {}
  Node* allocate(std::size_t count) {
    t_node = ::operator new(count * sizeof(Node));
    return static_cast<Node*>(t_node);
  }
  void deallocate(Node* node, std::size_t) { ::operator delete(static_cast<void*>(node)); }
  friend bool operator==(ProbeAllocator const&, ProbeAllocator const&) { return true; }
  friend bool operator!=(ProbeAllocator const&, ProbeAllocator const&) { return false; }
};

template <typename Entry>
std::size_t OffsetOf(Entry const& entry) {
  return static_cast<std::size_t>(static_cast<octet_t const*>(entry.m_bytes) - static_cast<octet_t const*>(t_node));
}
struct NodeOffsets {
  std::size_t m_list, m_tree;
};
template <std::size_t Align>
NodeOffsets ProbeOffsets() {
  typedef Probe<Align> Entry;
  NodeOffsets offsets;
  std::list<Entry, ProbeAllocator<Entry>> list;
  offsets.m_list = OffsetOf(*list.emplace(list.end()));
  std::multiset<Entry, std::less<Entry>, ProbeAllocator<Entry>> tree;
  offsets.m_tree = OffsetOf(*tree.insert(Entry()));
  return offsets;
}

constexpr std::size_t kViewAlign = 8;

std::size_t OffsetInNode(ValueType const& type, std::size_t align) {
  static const NodeOffsets offsets[] = {ProbeOffsets<1>(), ProbeOffsets<2>(), ProbeOffsets<4>(), ProbeOffsets<8>(),
                                        ProbeOffsets<16>()};
  std::size_t at = 0;
  while (at < 5 && align != std::size_t(1) << at) ++at;
  if (at == 5) throw AccessError("alignment of the elements of " + type.m_text);
  return type.m_code == RC_LIST ? offsets[at].m_list : offsets[at].m_tree;
}

// How far behind its stand-in an entry is.
ssize_t ShiftOf(ValueType const& type) {
  return static_cast<ssize_t>(OffsetInNode(type, type.EntryAlign()) - OffsetInNode(type, kViewAlign));
}

// What the stand-ins of the container that is worked on stand for. Without a type they stand for nothing.
struct Work {
  explicit Work(ValueType const& type, ValueFunction const* fill = nullptr)
      : m_type(type), m_fill(fill), m_shift(ShiftOf(type)), m_outer(std::exchange(s_current, this)) {}
  ~Work() { s_current = m_outer; }
  Work(Work const&) = delete;
  void operator=(Work const&) = delete;

  ValueType const& m_type;
  ValueFunction const* m_fill;
  ssize_t m_shift;
  Work* m_outer;
  static inline thread_local Work* s_current = nullptr;
};

struct MakeTag {};

// An entry of a list or tree.
struct StandIn {
  explicit StandIn(MakeTag) {
    Work const* work = Work::s_current;
    if (!work) return;
    ValueType const& type = work->m_type;
    ValueType const& first = type.m_key ? *type.m_key : *type.m_item;
    void* const at = At(work->m_shift);
    MakeValue(first, at);
    try {
      if (work->m_fill) (*work->m_fill)(at);
      if (type.m_key) MakeValue(*type.m_item, type.ItemOf(at));
    } catch (...) {
      DestroyValue(first, at);
      throw;
    }
  }
  ~StandIn() {
    Work const* work = Work::s_current;
    if (!work) return;
    ValueType const& type = work->m_type;
    void* const at = At(work->m_shift);
    DestroyValue(*type.m_item, type.ItemOf(at));
    if (type.m_key) DestroyValue(*type.m_key, at);
  }
  StandIn(StandIn const&) = delete;
  void operator=(StandIn const&) = delete;
  void* At(ssize_t shift) const { return const_cast<octet_t*>(m_bytes) + shift; }

  alignas(kViewAlign) octet_t m_bytes[kViewAlign];
};

// Nodes as large as those of the container that is worked on.
template <typename Node>
struct NodeAllocator {
  typedef Node value_type;
  NodeAllocator() {}
  template <typename Other>
  NodeAllocator(NodeAllocator<Other> const&) {}

  Node* allocate(std::size_t) {
    std::size_t size = sizeof(Node);
    if (Work const* work = Work::s_current) {
      ValueType const& type = work->m_type;
      size = RoundUp(OffsetInNode(type, type.EntryAlign()) + type.EntrySize(), alignof(Node));
    }
    return static_cast<Node*>(::operator new(size));
  }
  void deallocate(Node* node, std::size_t) { ::operator delete(static_cast<void*>(node)); }
  static std::size_t RoundUp(std::size_t size, std::size_t align) { return (size + align - 1) / align * align; }

  friend bool operator==(NodeAllocator const&, NodeAllocator const&) { return true; }
  friend bool operator!=(NodeAllocator const&, NodeAllocator const&) { return false; }
};

struct LessKey {
  bool operator()(StandIn const& a, StandIn const& b) const {
    Work const& work = *Work::s_current;
    return LessValue(work.m_type.m_key ? *work.m_type.m_key : *work.m_type.m_item, a.At(work.m_shift),
                     b.At(work.m_shift));
  }
};

struct ListView : std::list<StandIn, NodeAllocator<StandIn>> {
  StandIn const* Make() { return &this->emplace_back(MakeTag()); }
};
struct SetView : std::set<StandIn, LessKey, NodeAllocator<StandIn>> {
  StandIn const* Make() {
    const auto [at, isNew] = this->emplace(MakeTag());
    return isNew ? &*at : nullptr;
  }
};
struct BagView : std::multiset<StandIn, LessKey, NodeAllocator<StandIn>> {
  StandIn const* Make() { return &*this->emplace(MakeTag()); }
};
static_assert(sizeof(ListView) == sizeof(std::list<int128>) && sizeof(SetView) == sizeof(std::set<int128>) &&
                  sizeof(SetView) == sizeof(std::map<char, int128>),
              "containers of one kind are laid out alike");

// Calls `action` with the container as its view.
template <typename Action>
auto WithView(ValueType const& type, void* container, Action action) {
  if (type.m_code == RC_LIST) return action(*static_cast<ListView*>(container));
  if (type.m_code == RC_BAG) return action(*static_cast<BagView*>(container));
  return action(*static_cast<SetView*>(container));
}

// --- Deques

std::size_t DequeSize(ValueType const& type) {
  const std::size_t size = type.m_item->m_size;
  if (!DequeView::IsSize(size)) throw AccessError("size of the elements of " + type.m_text);
  return size;
}

// One that is made whole, and then takes the place of another one, whose elements are destroyed.
struct NewDeque {
  NewDeque(ValueType const& type, ssize_t count) : m_size(DequeSize(type)), m_view(m_size, count) {}
  ~NewDeque() { m_view.Free(m_size); }
  NewDeque(NewDeque const&) = delete;
  void operator=(NewDeque const&) = delete;
  void Replace(void* deque) {
    static_cast<std::deque<octet_t>*>(deque)->swap(*static_cast<std::deque<octet_t>*>(At()));
  }
  void* At() { return &m_view; }

  std::size_t m_size;
  DequeView m_view;
};

// --- Vectors and arrays: elements side by side

bool IsBits(ValueType const& type) { return type.m_code == RC_VECTOR && type.m_item->m_kind == VK_BOOL; }
xvector<bool>& BitsOf(void* container) { return *static_cast<xvector<bool>*>(container); }
xvector<octet_t>& BytesOf(void* container) { return *static_cast<xvector<octet_t>*>(container); }

octet_t* FirstOf(ValueType const& type, void* container) {
  if (type.m_code == RC_ARRAY) return static_cast<octet_t*>(container);
  return type.m_code == RC_DYNARRAY ? DynArrayView::Items(container) : BytesOf(container).data();
}

void MakeElements(ValueType const& item, octet_t* first, ssize_t count) {
  ssize_t made = 0;
  try {
    for (; made < count; ++made) MakeValue(item, first + made * item.m_size);
  } catch (...) {
    while (made > 0) DestroyValue(item, first + --made * item.m_size);
    throw;
  }
}

bool IsSideBySide(octet_t code) { return code == RC_VECTOR || code == RC_ARRAY || code == RC_DYNARRAY; }

void ResizeDeque(ValueType const& type, void* deque, ssize_t count) {
  NewDeque made(type, count);
  ssize_t i = 0;
  try {
    for (; i < count; ++i) MakeValue(*type.m_item, made.m_view.At(made.m_size, i));
  } catch (...) {
    while (i > 0) DestroyValue(*type.m_item, made.m_view.At(made.m_size, --i));
    throw;
  }
  made.Replace(deque);
}

void ResizeSideBySide(ValueType const& type, void* container, ssize_t count) {
  if (IsBits(type)) return BitsOf(container).resize(count);
  const std::size_t size = static_cast<std::size_t>(count) * type.m_item->m_size;
  if (type.m_code == RC_VECTOR) {
    xvector<octet_t> bytes;
    bytes.reserve(size);  // the block is freed by its size
    bytes.resize(size);
    MakeElements(*type.m_item, bytes.data(), count);
    BytesOf(container).swap(bytes);
  } else if (count > 0) {
    DynArray<octet_t> bytes(static_cast<ssize_t>(size));
    MakeElements(*type.m_item, bytes.begin(), count);
    DynArrayView::Items(container) = std::exchange(DynArrayView::Items(&bytes), nullptr);
    DynArrayView::Size(container) = count;
    DynArrayView::Size(&bytes) = 0;
  }
}

}  // namespace

ssize_t CountOf(ValueType const& type, void const* container) {
  void* const at = const_cast<void*>(container);
  switch (type.m_code) {
    case RC_ARRAY:
      return type.m_count;
    case RC_DYNARRAY:
      return DynArrayView::Size(at);
    case RC_VECTOR:
      return IsBits(type) ? static_cast<ssize_t>(BitsOf(at).size())
                          : static_cast<ssize_t>(BytesOf(at).size() / type.m_item->m_size);
    case RC_DEQUE:
      return static_cast<ssize_t>(DequeView::Of(container).Count(DequeSize(type)));
    default:
      return WithView(type, at, [](auto& view) { return static_cast<ssize_t>(view.size()); });
  }
}

void EachEntry(ValueType const& type, void* container, EntryFunction<bool> const& each) {
  if (IsBits(type)) {
    for (bool bit : BitsOf(container)) {
      if (!each(&bit)) return;
    }
    return;
  }
  if (IsSideBySide(type.m_code)) {
    octet_t* at = FirstOf(type, container);
    const ssize_t count = CountOf(type, container);
    for (ssize_t i = 0; i < count && each(at); ++i) at += type.m_item->m_size;
    return;
  }
  if (type.m_code == RC_DEQUE) {
    const std::size_t size = DequeSize(type);
    DequeView const& view = DequeView::Of(container);
    const std::size_t count = view.Count(size);
    for (std::size_t i = 0; i < count && each(view.At(size, i)); ++i) {
    }
    return;
  }
  const ssize_t shift = ShiftOf(type);
  WithView(type, container, [&each, shift](auto& view) {
    for (StandIn const& entry : view) {
      if (!each(entry.At(shift))) return;
    }
  });
}

void* EntryOf(ValueType const& type, void* container, ssize_t position) {
  if (IsBits(type)) return container;
  if (IsSideBySide(type.m_code)) return FirstOf(type, container) + position * type.m_item->m_size;
  if (type.m_code == RC_DEQUE) return DequeView::Of(container).At(DequeSize(type), position);
  void* found = nullptr;
  EachEntry(type, container, [&](void* entry) {
    found = entry;
    return position-- > 0;
  });
  return found;
}

void MakeContainer(ValueType const& type, void* container) {
  switch (type.m_code) {
    case RC_ARRAY:
      return MakeElements(*type.m_item, static_cast<octet_t*>(container), type.m_count);
    case RC_DYNARRAY:
      new (container) DynArray<octet_t>();
      return;
    case RC_VECTOR:
      if (IsBits(type)) {
        new (container) xvector<bool>();
      } else {
        new (container) xvector<octet_t>();
      }
      return;
    case RC_DEQUE:
      new (container) DequeView(DequeSize(type), 0);
      return;
    default:
      WithView(type, container, [](auto& view) { new (&view) std::decay_t<decltype(view)>(); });
  }
}

static void DestroyElements(ValueType const& type, void* container) {
  EachEntry(type, container, [&type](void* element) {
    DestroyValue(*type.m_item, element);
    return true;
  });
}

void ClearContainer(ValueType const& type, void* container) {
  if (IsBits(type)) return BitsOf(container).clear();
  if (type.m_code == RC_DEQUE) {
    NewDeque empty(type, 0);
    DestroyElements(type, container);
    return empty.Replace(container);
  }
  if (IsSideBySide(type.m_code)) {
    DestroyElements(type, container);
    if (type.m_code == RC_VECTOR) xvector<octet_t>().swap(BytesOf(container));
    if (type.m_code == RC_DYNARRAY && DynArrayView::Items(container)) {
      const std::size_t size = static_cast<std::size_t>(DynArrayView::Size(container)) * type.m_item->m_size;
      std::allocator<octet_t>().deallocate(DynArrayView::Items(container), size);
      DynArrayView::Items(container) = nullptr;
      DynArrayView::Size(container) = 0;
    }
    return;
  }
  const Work work(type);
  WithView(type, container, [](auto& view) { view.clear(); });
}

void DestroyContainer(ValueType const& type, void* container) {
  if (type.m_code == RC_DEQUE) {
    DestroyElements(type, container);
    return DequeView::Of(container).Free(DequeSize(type));
  }
  ClearContainer(type, container);
  if (IsBits(type)) {
    BitsOf(container).~xvector<bool>();
  } else if (type.m_code == RC_VECTOR) {
    BytesOf(container).~xvector<octet_t>();
  }
}

void ResizeList(ValueType const& type, void* container, ssize_t count) {
  ClearContainer(type, container);
  if (type.m_code == RC_DEQUE) return ResizeDeque(type, container, count);
  if (type.m_code != RC_LIST) return ResizeSideBySide(type, container, count);
  const Work work(type);
  for (ssize_t i = 0; i < count; ++i) static_cast<ListView*>(container)->Make();
}

void* InsertEntry(ValueType const& type, void* container, ValueFunction const& fill) {
  const Work work(type, &fill);
  StandIn const* const entry =
      type.m_code == RC_BAG ? static_cast<BagView*>(container)->Make() : static_cast<SetView*>(container)->Make();
  return entry ? entry->At(work.m_shift) : nullptr;
}

// --- Copies

namespace {

void CopyEntries(ValueType const& type, void* to, void* from) {
  if (IsBits(type)) {
    BitsOf(to) = BitsOf(from);
    return;
  }
  if (type.m_kind == VK_LIST) {
    if (type.m_code != RC_ARRAY) ResizeList(type, to, CountOf(type, from));
    xvector<void*> elements;
    EachEntry(type, from, [&](void* element) {
      elements.push_back(element);
      return true;
    });
    std::size_t at = 0;
    return EachEntry(type, to, [&](void* element) {
      CopyValue(*type.m_item, element, elements[at++]);
      return true;
    });
  }
  ClearContainer(type, to);
  EachEntry(type, from, [&](void* entry) {
    void* const made =
        InsertEntry(type, to, [&](void* key) { CopyValue(type.m_key ? *type.m_key : *type.m_item, key, entry); });
    if (made && type.m_key) CopyValue(*type.m_item, type.ItemOf(made), type.ItemOf(entry));
    return true;
  });
}

}  // namespace

void CopyValue(ValueType const& type, void* to, void const* from) {
  switch (type.m_kind) {
    case VK_TEXT:
    case VK_CLASS:
    case VK_VARIANT:
      if (!type.m_ops->m_assign) throw AccessError("cannot be copied: " + type.m_text);
      return type.m_ops->m_assign(to, 0, from, 0, 1);
    case VK_LIST:
    case VK_SET:
    case VK_MAP:
      return CopyEntries(type, to, const_cast<void*>(from));
    case VK_OPENVARIANT:
      *static_cast<openvariant<int32>*>(to) = *static_cast<openvariant<int32> const*>(from);
      return;
    default:
      std::memcpy(to, from, type.m_size);
  }
}

void SwapLists(ValueType const& type, void* a, void* b) {
  switch (type.m_code) {
    case RC_VECTOR:
      return IsBits(type) ? BitsOf(a).swap(BitsOf(b)) : BytesOf(a).swap(BytesOf(b));
    case RC_DEQUE:
      return static_cast<std::deque<octet_t>*>(a)->swap(*static_cast<std::deque<octet_t>*>(b));
    case RC_LIST:
      return static_cast<ListView*>(a)->swap(*static_cast<ListView*>(b));
    case RC_DYNARRAY:
      std::swap(DynArrayView::Items(a), DynArrayView::Items(b));
      std::swap(DynArrayView::Size(a), DynArrayView::Size(b));
      return;
    default:
      throw AccessError("no list of any length: " + type.m_text);
  }
}

}  // namespace vesk
