// Containers whose elements are known only by their type, through containers of stand-ins (see ValueTypes.h).

@import "Vesk/vxObject/ValueTypes.h"

namespace vesk {

struct DynArrayView {
  static ssize_t& Size(void* array) { return static_cast<DynArray<octet_t>*>(array)->m_size; }
  static octet_t*& Items(void* array) { return static_cast<DynArray<octet_t>*>(array)->m_items; }
};

namespace {

// What the stand-ins of the container that is worked on stand for. Without a type they stand for nothing.
struct Work {
  ValueType const* m_type = nullptr;
  ValueFunction const* m_fill = nullptr;
  void* m_node = nullptr;  // the last one that was allocated

  static Work& Current() {
    static thread_local Work work;
    return work;
  }
};

struct WorkScope {
  explicit WorkScope(ValueType const* type, ValueFunction const* fill = nullptr)
      : m_outer(std::exchange(Work::Current(), {type, fill, nullptr})) {}
  ~WorkScope() { Work::Current() = m_outer; }
  WorkScope(WorkScope const&) = delete;
  void operator=(WorkScope const&) = delete;
  Work m_outer;
};

struct MakeTag {};

// An entry of a list or tree.
template <std::size_t Align>
struct StandIn {
  explicit StandIn(MakeTag) {
    Work const& work = Work::Current();
    ValueType const* type = work.m_type;
    if (!type) return;
    ValueType const& first = type->m_key ? *type->m_key : *type->m_item;
    MakeValue(first, this);
    try {
      if (work.m_fill) (*work.m_fill)(this);
      if (type->m_key) MakeValue(*type->m_item, type->ItemOf(this));
    } catch (...) {
      DestroyValue(first, this);
      throw;
    }
  }
  ~StandIn() {
    ValueType const* type = Work::Current().m_type;
    if (!type) return;
    DestroyValue(*type->m_item, type->ItemOf(this));
    if (type->m_key) DestroyValue(*type->m_key, this);
  }
  StandIn(StandIn const&) = delete;
  void operator=(StandIn const&) = delete;

  alignas(Align) octet_t m_bytes[Align];
};

template <typename C>
std::size_t NodeOffset();

// Nodes as large as those of the container that is worked on.
template <typename Node, typename C>
struct NodeAllocator {
  typedef Node value_type;
  template <typename Other>
  struct rebind {
    typedef NodeAllocator<Other, C> other;
  };
  NodeAllocator() {}
  template <typename Other>
  NodeAllocator(NodeAllocator<Other, C> const&) {}

  Node* allocate(std::size_t) {
    Work& work = Work::Current();
    std::size_t size = sizeof(Node);
    if (work.m_type) size = RoundUp(NodeOffset<C>() + work.m_type->EntrySize(), alignof(Node));
    work.m_node = ::operator new(size);
    return static_cast<Node*>(work.m_node);
  }
  void deallocate(Node* node, std::size_t) { ::operator delete(static_cast<void*>(node)); }
  static std::size_t RoundUp(std::size_t size, std::size_t align) { return (size + align - 1) / align * align; }

  friend bool operator==(NodeAllocator const&, NodeAllocator const&) { return true; }
  friend bool operator!=(NodeAllocator const&, NodeAllocator const&) { return false; }
};

struct LessKey {
  template <typename T>
  bool operator()(T const& a, T const& b) const {
    ValueType const& type = *Work::Current().m_type;
    return LessValue(type.m_key ? *type.m_key : *type.m_item, &a, &b);
  }
};

template <std::size_t A>
struct ListView : std::list<StandIn<A>, NodeAllocator<StandIn<A>, ListView<A>>> {
  void* Make() { return &this->emplace_back(MakeTag()); }
};
template <std::size_t A>
struct SetView : std::set<StandIn<A>, LessKey, NodeAllocator<StandIn<A>, SetView<A>>> {
  void* Make() {
    const auto [at, isNew] = this->emplace(MakeTag());
    return isNew ? const_cast<StandIn<A>*>(&*at) : nullptr;
  }
};
template <std::size_t A>
struct BagView : std::multiset<StandIn<A>, LessKey, NodeAllocator<StandIn<A>, BagView<A>>> {
  void* Make() { return const_cast<StandIn<A>*>(&*this->emplace(MakeTag())); }
};
static_assert(sizeof(ListView<8>) == sizeof(std::list<int128>) && sizeof(SetView<8>) == sizeof(std::set<int128>) &&
                  sizeof(SetView<1>) == sizeof(std::map<char, int128>),
              "containers of one kind are laid out alike");

// Where an entry stands in its node.
template <typename C>
std::size_t NodeOffset() {
  static const std::size_t offset = [] {
    const WorkScope scope(nullptr);
    C container;
    void const* entry = container.Make();
    return static_cast<std::size_t>(static_cast<octet_t const*>(entry) -
                                    static_cast<octet_t const*>(Work::Current().m_node));
  }();
  return offset;
}

// Calls `action` with the container as its view.
template <template <std::size_t> class View, typename Action>
auto WithAlign(ValueType const& type, void* container, Action action) {
  switch (type.EntryAlign()) {
    case 1:
      return action(*static_cast<View<1>*>(container));
    case 2:
      return action(*static_cast<View<2>*>(container));
    case 4:
      return action(*static_cast<View<4>*>(container));
    case 8:
      return action(*static_cast<View<8>*>(container));
    case 16:
      return action(*static_cast<View<16>*>(container));
  }
  throw AccessError("alignment of the elements of " + type.m_text);
}

// --- Deques: their blocks depend on the size of an element

template <std::size_t Size>
struct Bytes {
  octet_t m_bytes[Size];
};

struct DequeOps {
  std::size_t (*m_count)(void const*);
  octet_t* (*m_at)(void*, std::size_t);
  void (*m_add)(void*);
  void (*m_removeLast)(void*);
  void (*m_make)(void*);
  void (*m_destroy)(void*);
};

template <std::size_t Size>
DequeOps const& DequeOpsOf() {
  typedef std::deque<Bytes<Size>> View;
  static const DequeOps ops = {[](void const* deque) { return static_cast<View const*>(deque)->size(); },
                               [](void* deque, std::size_t i) { return (*static_cast<View*>(deque))[i].m_bytes; },
                               [](void* deque) { static_cast<View*>(deque)->emplace_back(); },
                               [](void* deque) { static_cast<View*>(deque)->pop_back(); },
                               [](void* deque) { new (deque) View(); },
                               [](void* deque) { static_cast<View*>(deque)->~View(); }};
  return ops;
}

constexpr std::size_t kDequeStep = 4;
constexpr std::size_t kLargestDequeElement = 256;

template <std::size_t... I>
DequeOps const& DequeOpsOfSize(std::size_t size, std::index_sequence<I...>) {
  typedef DequeOps const& (*Function)();
  static constexpr Function table[] = {&DequeOpsOf<(I + 1) * kDequeStep>...};
  return table[size / kDequeStep - 1]();
}

DequeOps const& DequeOpsFor(ValueType const& type) {
  const std::size_t size = type.m_item->m_size;
  if (size == 1) return DequeOpsOf<1>();
  if (size == 2) return DequeOpsOf<2>();
  if (size == 0 || size % kDequeStep != 0 || size > kLargestDequeElement) {
    throw AccessError("size of the elements of " + type.m_text);
  }
  return DequeOpsOfSize(size, std::make_index_sequence<kLargestDequeElement / kDequeStep>());
}

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
  DequeOps const& ops = DequeOpsFor(type);
  for (ssize_t i = 0; i < count; ++i) {
    ops.m_add(deque);
    try {
      MakeValue(*type.m_item, ops.m_at(deque, i));
    } catch (...) {
      ops.m_removeLast(deque);
      throw;
    }
  }
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
  auto size = [](auto& view) { return static_cast<ssize_t>(view.size()); };
  switch (type.m_code) {
    case RC_ARRAY:
      return type.m_count;
    case RC_DYNARRAY:
      return DynArrayView::Size(at);
    case RC_VECTOR:
      return IsBits(type) ? static_cast<ssize_t>(BitsOf(at).size())
                          : static_cast<ssize_t>(BytesOf(at).size() / type.m_item->m_size);
    case RC_DEQUE:
      return static_cast<ssize_t>(DequeOpsFor(type).m_count(container));
    case RC_LIST:
      return WithAlign<ListView>(type, at, size);
    case RC_BAG:
      return WithAlign<BagView>(type, at, size);
    default:
      return WithAlign<SetView>(type, at, size);
  }
}

void EachEntry(ValueType const& type, void* container, std::function<bool(void*)> const& each) {
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
    DequeOps const& ops = DequeOpsFor(type);
    const std::size_t count = ops.m_count(container);
    for (std::size_t i = 0; i < count && each(ops.m_at(container, i)); ++i) {
    }
    return;
  }
  auto walk = [&each](auto& view) {
    for (auto& entry : view) {
      if (!each(const_cast<octet_t*>(entry.m_bytes))) return;
    }
  };
  if (type.m_code == RC_LIST) return WithAlign<ListView>(type, container, walk);
  if (type.m_code == RC_BAG) return WithAlign<BagView>(type, container, walk);
  WithAlign<SetView>(type, container, walk);
}

void* EntryOf(ValueType const& type, void* container, ssize_t position) {
  if (IsBits(type)) return container;
  if (IsSideBySide(type.m_code)) return FirstOf(type, container) + position * type.m_item->m_size;
  if (type.m_code == RC_DEQUE) return DequeOpsFor(type).m_at(container, position);
  void* found = nullptr;
  EachEntry(type, container, [&](void* entry) {
    found = entry;
    return position-- > 0;
  });
  return found;
}

void MakeContainer(ValueType const& type, void* container) {
  auto make = [](auto& view) { new (&view) std::decay_t<decltype(view)>(); };
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
      return DequeOpsFor(type).m_make(container);
    case RC_LIST:
      return WithAlign<ListView>(type, container, make);
    case RC_BAG:
      return WithAlign<BagView>(type, container, make);
    default:
      return WithAlign<SetView>(type, container, make);
  }
}

void ClearContainer(ValueType const& type, void* container) {
  if (IsBits(type)) return BitsOf(container).clear();
  if (IsSideBySide(type.m_code) || type.m_code == RC_DEQUE) {
    EachEntry(type, container, [&type](void* element) {
      DestroyValue(*type.m_item, element);
      return true;
    });
    if (type.m_code == RC_VECTOR) xvector<octet_t>().swap(BytesOf(container));
    if (type.m_code == RC_DEQUE) {
      DequeOpsFor(type).m_destroy(container);
      DequeOpsFor(type).m_make(container);
    }
    if (type.m_code == RC_DYNARRAY && DynArrayView::Items(container)) {
      const std::size_t size = static_cast<std::size_t>(DynArrayView::Size(container)) * type.m_item->m_size;
      std::allocator<octet_t>().deallocate(DynArrayView::Items(container), size);
      DynArrayView::Items(container) = nullptr;
      DynArrayView::Size(container) = 0;
    }
    return;
  }
  const WorkScope scope(&type);
  auto clear = [](auto& view) { view.clear(); };
  if (type.m_code == RC_LIST) return WithAlign<ListView>(type, container, clear);
  if (type.m_code == RC_BAG) return WithAlign<BagView>(type, container, clear);
  WithAlign<SetView>(type, container, clear);
}

void DestroyContainer(ValueType const& type, void* container) {
  ClearContainer(type, container);
  if (IsBits(type)) {
    BitsOf(container).~xvector<bool>();
  } else if (type.m_code == RC_VECTOR) {
    BytesOf(container).~xvector<octet_t>();
  } else if (type.m_code == RC_DEQUE) {
    DequeOpsFor(type).m_destroy(container);
  }
}

void ResizeList(ValueType const& type, void* container, ssize_t count) {
  ClearContainer(type, container);
  if (type.m_code == RC_DEQUE) return ResizeDeque(type, container, count);
  if (type.m_code != RC_LIST) return ResizeSideBySide(type, container, count);
  const WorkScope scope(&type);
  WithAlign<ListView>(type, container, [count](auto& view) {
    for (ssize_t i = 0; i < count; ++i) view.Make();
  });
}

void* InsertEntry(ValueType const& type, void* container, ValueFunction const& fill) {
  const WorkScope scope(&type, &fill);
  auto make = [](auto& view) { return view.Make(); };
  if (type.m_code == RC_BAG) return WithAlign<BagView>(type, container, make);
  return WithAlign<SetView>(type, container, make);
}

}  // namespace vesk
