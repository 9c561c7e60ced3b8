// Going on on another stack, and back. Sanitizers are told of it.

@import "Vesk/vxObject/src/parts/graph_rest.h"

#include <algorithm>
#include <exception>
#include <iterator>

#if defined(__GLIBC__)
#include <sys/mman.h>
#include <ucontext.h>
#endif

#if defined(__SANITIZE_ADDRESS__)
#define VESK_ADDRESS_SANITIZER
#elif defined(__SANITIZE_THREAD__)
#define VESK_THREAD_SANITIZER
#elif defined(__has_feature)
#if __has_feature(address_sanitizer)
#define VESK_ADDRESS_SANITIZER
#elif __has_feature(thread_sanitizer)
#define VESK_THREAD_SANITIZER
#endif
#endif

#if defined(VESK_ADDRESS_SANITIZER)
#include <sanitizer/common_interface_defs.h>
#elif defined(VESK_THREAD_SANITIZER)
#include <sanitizer/tsan_interface.h>
#endif

namespace vesk {

namespace {

// What any calculation has, however many it stands within, and what keeps an overflow off other memory.
constexpr std::size_t Reserve = 8 << 20, Guard = 64 << 10;
// Sanitizers keep books of a stack, whose own bounds are narrower.
#if defined(VESK_ADDRESS_SANITIZER) || defined(VESK_THREAD_SANITIZER)
constexpr std::size_t Most = Reserve + (1 << 20), Least = Most;
#else
// Memcheck tells of each map of 256 MiB.
constexpr std::size_t Most = (sizeof(void*) > 4 ? 240 : 60) << 20, Least = 2 * Reserve;
#endif

}  // namespace

std::uintptr_t CalculationStack::Usable() const { return m_size - Reserve; }

#if !defined(__GLIBC__)

bool CalculationStack::Open() { return false; }
void CalculationStack::RunOn(void (*action)(void*), void* of) { action(of); }
void CalculationStack::Unmap() {}

#else

bool CalculationStack::Open() {
  if (m_isInUse) return false;
  for (std::size_t size = Most; !m_memory && size >= Least; size /= 2) {
    void* memory =
        mmap(nullptr, size, PROT_READ | PROT_WRITE, MAP_PRIVATE | MAP_ANONYMOUS | MAP_NORESERVE | MAP_STACK, -1, 0);
    if (memory == MAP_FAILED) continue;
    m_memory = memory;
    m_size = size;
    mprotect(memory, Guard, PROT_NONE);
    // A deep chain touches most of it, at up to 17 microseconds for each small page on a virtual machine.
    madvise(memory, size, MADV_HUGEPAGE);
  }
  return m_memory != nullptr;
}

void CalculationStack::Unmap() { munmap(std::exchange(m_memory, nullptr), m_size); }

struct CalculationStack::Switch {
  // To the other stack and, once the action is done, back from it.
  void There(void const* stack, std::size_t size) {
#if defined(VESK_ADDRESS_SANITIZER)
    __sanitizer_start_switch_fiber(&m_fake, stack, size);
#elif defined(VESK_THREAD_SANITIZER)
    m_fiber = __tsan_get_current_fiber();
    m_otherFiber = __tsan_create_fiber(0);
    __tsan_switch_to_fiber(m_otherFiber, 0);
#endif
    (void)stack, (void)size;
    swapcontext(&m_here, &m_there);
#if defined(VESK_ADDRESS_SANITIZER)
    __sanitizer_finish_switch_fiber(m_fake, nullptr, nullptr);
#elif defined(VESK_THREAD_SANITIZER)
    __tsan_destroy_fiber(m_otherFiber);
#endif
  }
  void Arrive() {
#if defined(VESK_ADDRESS_SANITIZER)
    __sanitizer_finish_switch_fiber(nullptr, &m_stack, &m_size);
#endif
  }
  void Back() {
#if defined(VESK_ADDRESS_SANITIZER)
    __sanitizer_start_switch_fiber(nullptr, m_stack, m_size);
#elif defined(VESK_THREAD_SANITIZER)
    __tsan_switch_to_fiber(m_fiber, 0);
#endif
    swapcontext(&m_there, &m_here);
  }

  void (*m_action)(void*);
  void* m_of;
  std::exception_ptr m_error;
  ucontext_t m_here, m_there;
  void* m_fake;  // of AddressSanitizer, as are the bounds of the stack that was left
  void const* m_stack;
  std::size_t m_size;
  void* m_fiber;  // of ThreadSanitizer
  void* m_otherFiber;
};

// No exception leaves the stack that it was thrown on.
void CalculationStack::Enter(unsigned high, unsigned low) {
  Switch& to = *reinterpret_cast<Switch*>(static_cast<std::uintptr_t>(std::uint64_t(high) << 32 | low));
  to.Arrive();
  try {
    to.m_action(to.m_of);
  } catch (...) {
    to.m_error = std::current_exception();
  }
  to.Back();
}

void CalculationStack::RunOn(void (*action)(void*), void* of) {
  Switch to{};
  to.m_action = action;
  to.m_of = of;
  char* const usable = static_cast<char*>(m_memory) + Guard;
  const std::size_t size = m_size - Guard;
  getcontext(&to.m_there);
  to.m_there.uc_stack.ss_sp = usable;
  to.m_there.uc_stack.ss_size = size;
  const std::uint64_t address = reinterpret_cast<std::uintptr_t>(&to);
  makecontext(&to.m_there, reinterpret_cast<void (*)()>(Enter), 2, unsigned(address >> 32), unsigned(address));
  m_isInUse = true;
  to.There(usable, size);
  m_isInUse = false;
  if (to.m_error) std::rethrow_exception(std::move(to.m_error));
}

#endif

// On the next stack; where all are used up, or there is none, further out.
void GraphState::CalculateElsewhere(DGNode const& node) {
  auto& stacks = NeedRest().m_otherStacks;
  CalculationStack* const next =
      std::find_if(std::begin(stacks), std::end(stacks), [](CalculationStack& stack) { return stack.Open(); });
  if (next == std::end(stacks)) {
    m_deep = &node;
    throw DeepRead();
  }
  struct Stack {
    ~Stack() {
      m_state.m_stack = m_stack;
      m_state.m_mostStack = m_most;
    }
    GraphState& m_state;
    std::uintptr_t m_stack = m_state.m_stack, m_most = m_state.m_mostStack;
  } stack{*this};
  const auto calculate = [&] {
    MeasureStack(next->Usable());
    CalculateHere(node);
  };
  next->Run(calculate);
}

}  // namespace vesk
