// A further stack, for calculations within each other that the thread's own one has no room for: address space, of
// which only what is used takes memory.

@import "Vesk/vxObject/Platform.h"
#include <cstdint>

namespace vesk {

class CalculationStack {
 public:
  CalculationStack() {}
  CalculationStack(CalculationStack const&) = delete;
  void operator=(CalculationStack const&) = delete;
  ~CalculationStack() { Close(); }

  // Whether it is there and not in use; it is never there where the system has no means for it.
  bool Open();
  void Close() {
    if (m_memory) Unmap();
  }

  // Carries the action out on this stack; what it throws is thrown here.
  template <typename Action>
  void Run(Action const& action) {
    RunOn([](void* of) { (*static_cast<Action const*>(of))(); }, const_cast<Action*>(&action));
  }

  // How much of it calculations may use before the next one: the last of them has the rest.
  std::uintptr_t Usable() const;

 private:
  struct Switch;
  void RunOn(void (*action)(void*), void* of);
  static void Enter(unsigned high, unsigned low);
  void Unmap();

  void* m_memory = nullptr;
  std::size_t m_size = 0;
  bool m_isInUse = false;
};

}  // namespace vesk
