// Deques of elements of any size, without the elements: these are made and destroyed by who asks. The blocks of a deque
// depend on that size. Where the library does not tell how, there is a view for each size, and each takes the compiler
// a while.

@import "Vesk/vxObject/Containers.h"

#include <deque>
#include <vector>

namespace vesk {

#if defined(__GLIBCXX__) && !defined(_GLIBCXX_DEBUG)

// The representation of any deque of this library, which its binary interface fixes.
class DequeView {
 public:
  static DequeView& Of(void const* deque) { return *static_cast<DequeView*>(const_cast<void*>(deque)); }
  static bool IsSize(std::size_t size) { return size > 0; }

  DequeView(std::size_t size, std::size_t count) {
    const std::size_t blocks = count / PerBlock(size) + 1;
    m_mapSize = std::max<std::size_t>(8, blocks + 2);
    m_map = std::allocator<octet_t*>().allocate(m_mapSize);
    octet_t** const first = m_map + (m_mapSize - blocks) / 2;
    m_begin.m_block = m_end.m_block = first;
    try {
      for (; m_end.m_block < first + blocks; ++m_end.m_block) *m_end.m_block = NewBlock(size);
    } catch (...) {
      FreeUpTo(m_end.m_block, size);
      throw;
    }
    m_begin.Set(first, size, 0);
    m_end.Set(m_end.m_block - 1, size, count % PerBlock(size));
  }
  void Free(std::size_t size) { FreeUpTo(m_end.m_block + 1, size); }

  std::size_t Count(std::size_t size) const {
    const std::size_t blocks = static_cast<std::size_t>(m_end.m_block - m_begin.m_block);
    return blocks * PerBlock(size) + m_end.Position(size) - m_begin.Position(size);
  }
  void* At(std::size_t size, std::size_t i) const {
    const std::size_t position = m_begin.Position(size) + i;
    return m_begin.m_block[position / PerBlock(size)] + position % PerBlock(size) * size;
  }

 private:
  struct End {
    void Set(octet_t** block, std::size_t size, std::size_t position) {
      m_block = block;
      m_first = *block;
      m_last = m_first + PerBlock(size) * size;
      m_at = m_first + position * size;
    }
    std::size_t Position(std::size_t size) const { return static_cast<std::size_t>(m_at - m_first) / size; }
    octet_t *m_at, *m_first, *m_last, **m_block;
  };

  static std::size_t PerBlock(std::size_t size) { return std::__deque_buf_size(size); }
  static octet_t* NewBlock(std::size_t size) { return std::allocator<octet_t>().allocate(PerBlock(size) * size); }
  void FreeUpTo(octet_t** end, std::size_t size) {
    for (octet_t** at = m_begin.m_block; at < end; ++at)
      std::allocator<octet_t>().deallocate(*at, PerBlock(size) * size);
    std::allocator<octet_t*>().deallocate(m_map, m_mapSize);
  }

  octet_t** m_map;
  std::size_t m_mapSize;
  End m_begin, m_end;
};
static_assert(sizeof(DequeView) == sizeof(std::deque<octet_t>), "a deque of this library");

#else

template <std::size_t Size>
struct DequeOf {
  struct Bytes {
    octet_t m_bytes[Size];
  };
  typedef std::deque<Bytes> View;
  static void Make(void* deque, std::size_t count) { new (deque) View(count); }
  static void Free(void* deque) { static_cast<View*>(deque)->~View(); }
  static std::size_t Count(void const* deque) { return static_cast<View const*>(deque)->size(); }
  static void* At(void* deque, std::size_t i) { return (*static_cast<View*>(deque))[i].m_bytes; }
};

class DequeView {
 public:
  static DequeView& Of(void const* deque) { return *static_cast<DequeView*>(const_cast<void*>(deque)); }
  static bool IsSize(std::size_t size) {
    return size == 1 || size == 2 || (size > 0 && size <= Most && size % Step == 0);
  }

  DequeView(std::size_t size, std::size_t count) { FunctionsOf(size).m_make(m_deque, count); }
  void Free(std::size_t size) { FunctionsOf(size).m_free(m_deque); }
  std::size_t Count(std::size_t size) const { return FunctionsOf(size).m_count(m_deque); }
  void* At(std::size_t size, std::size_t i) const { return FunctionsOf(size).m_at(const_cast<octet_t*>(m_deque), i); }

 private:
  enum : std::size_t { Step = 4, Most = 256 };
  struct Functions {
    void (*m_make)(void*, std::size_t);
    void (*m_free)(void*);
    std::size_t (*m_count)(void const*);
    void* (*m_at)(void*, std::size_t);
  };
  template <std::size_t S>
  static constexpr Functions s_functions = {DequeOf<S>::Make, DequeOf<S>::Free, DequeOf<S>::Count, DequeOf<S>::At};
  template <std::size_t... I>
  static Functions const& FunctionsIn(std::size_t size, std::index_sequence<I...>) {
    static constexpr Functions table[] = {s_functions<(I + 1) * Step>...};
    return table[size / Step - 1];
  }
  static Functions const& FunctionsOf(std::size_t size) {
    if (size <= 2) return size == 1 ? s_functions<1> : s_functions<2>;
    return FunctionsIn(size, std::make_index_sequence<Most / Step>());
  }

  alignas(std::deque<octet_t>) octet_t m_deque[sizeof(std::deque<octet_t>)];
};

#endif

}  // namespace vesk
