// What a thread keeps while it works on its dependency graphs: the calculation that runs, what the outermost read has
// found out, and the eviction queues. It lives as long as the thread or the last node in a queue.

@import "Vesk/vxObject/Visitors.h"
#include <exception>
#include <unordered_map>
#include <unordered_set>

namespace vesk {

class DGNode;
struct GraphState;

enum EDGFlags {
  DF_SYNC_DEP = 1,
  DF_PROPAGATE_HARD_DIRTINESS = 2,  // each calculation counts as a change
  DF_ASYNC_IO = 4                   // calculated from the queue for input and output
};

class GraphError : public std::logic_error {
 public:
  using std::logic_error::logic_error;
};

// Unwinds the calculations of an outermost read to where there is stack for what they need next. No std::exception:
// it is none of their business.
struct DeepRead {};

// The stack that calculations within each other may use.
constexpr std::uintptr_t MostCalculationStack = 256 * 1024;

// One T for each thread. It is there for nodes that outlive the thread's other variables, and gone when nobody uses
// it.
template <typename T>
class PerThread {
 public:
  static T& Get() {
    if (!s_state) Make();
    return *s_state;
  }
  static T* Peek() { return s_state; }
  void Use() { ++m_users; }
  void Release() {
    if (--m_users == 0) delete static_cast<T*>(this);
  }

 private:
  struct Owner {
    ~Owner() {
      s_isOver = true;
      if (T* state = std::exchange(s_state, nullptr)) state->Release();
    }
  };
  static void Make() {
    s_state = new T;
    if (!s_isOver) {
      static thread_local Owner owner;
      (void)&owner;
    }
  }

  static inline thread_local T* s_state = nullptr;
  static inline thread_local bool s_isOver = false;
  ssize_t m_users = 1;  // the thread is one
};

// The memory of a node's value, asked of the node's ByteSize: generated text passes the value on from there.
struct ValuePlace {
  void const* m_begin = nullptr;
  std::size_t m_size = 0;

  static ValuePlace*& Asked() {
    static thread_local ValuePlace* place = nullptr;
    return place;
  }
  struct Scope {
    explicit Scope(ValuePlace& place) { Asked() = &place; }
    ~Scope() { Asked() = nullptr; }
  };
};

// A node is being calculated while it lives; without a node, nothing that is read becomes an input.
struct Calculation {
  Calculation(GraphState& state, DGNode const* node);
  ~Calculation();
  Calculation(Calculation const&) = delete;
  void operator=(Calculation const&) = delete;

  // Whether the node has not read this input yet.
  bool IsNew(DGNode const* input);
  // The link from `input` to a node that is being calculated here or further out is gone.
  void Forget(DGNode const* node, DGNode const* input) {
    for (Calculation* at = this; at; at = at->m_outer) {
      if (at->m_node == node) at->m_inputs.erase(input);
    }
  }
  // Whether this is memory of the calculation itself (its variables, its value), of which it cannot depend.
  bool Owns(void const* address);

  DGNode const* m_node;
  GraphState& m_state;
  Calculation* m_outer;
  std::unordered_set<DGNode const*> m_inputs;  // filled once there are many
  ValuePlace m_place;
  bool m_isPlaceKnown = false;
};

// Eight queues in each thread hold the nodes with a cached value, by when it was calculated.
class EvictionQueue {
 public:
  // That of the calling thread; index from 0 to 7.
  static EvictionQueue& Get(ssize_t index);

  ssize_t Count() const { return static_cast<ssize_t>(m_nodes.size()); }
  ssize_t ByteSize() const { return m_byteSize; }

  // Evicts the oldest values until the others hold at most `budget` bytes.
  void EvictDownTo(ssize_t budget);

 private:
  friend class DGNode;
  friend struct GraphState;
  GraphState* m_state = nullptr;
  std::list<DGNode const*> m_nodes;
  std::list<DGNode const*>::iterator m_next = m_nodes.end();  // of the eviction that runs
  ssize_t m_byteSize = 0;
};

struct GraphState : PerThread<GraphState> {
  GraphState() {
    for (EvictionQueue& queue : m_queues) queue.m_state = this;
  }

  void Begin() {
    m_isEvaluating = true;
    m_stack = reinterpret_cast<std::uintptr_t>(__builtin_frame_address(0));
  }
  void End();

  // A node that the outermost read calculates; the one in front of it in the list wants it.
  struct Target {
    DGNode const* m_node;
    std::size_t m_serial;  // they ascend
    bool operator==(Target const& rhs) const { return m_serial == rhs.m_serial; }
  };
  void Aim(DGNode const* node) { m_targets.push_back({node, ++m_lastSerial}); }

  // The calculation of a node was unwound: it waits for the next target, until its own one begins again.
  void Unwind(DGNode const* node) {
    if (!m_targets.empty()) m_unwound[node] = m_targets.back().m_serial;
  }
  bool IsWaiting(DGNode const* node) const {
    const auto at = m_unwound.find(node);
    if (at == m_unwound.end() || m_targets.empty() || at->second == m_targets.back().m_serial) return false;
    const auto target = std::lower_bound(m_targets.begin(), m_targets.end(), at->second,
                                         [](Target const& t, std::size_t serial) { return t.m_serial < serial; });
    return target != m_targets.end() && target->m_serial == at->second;
  }

  // Whether what is read next must be calculated further out. Not what the outermost calculation reads: that is
  // there.
  bool IsDeep() const {
    const std::uintptr_t here = reinterpret_cast<std::uintptr_t>(__builtin_frame_address(0));
    return m_calculation && m_calculation->m_outer && m_stack > here && m_stack - here > MostCalculationStack;
  }

  // Lists of nodes that are being told: a node that is destroyed meanwhile leaves them.
  struct NotifyScope {
    NotifyScope(GraphState& state, xvector<DGNode const*>& nodes) : m_state(state) {
      state.m_notified.push_back(&nodes);
    }
    ~NotifyScope() { m_state.m_notified.pop_back(); }
    GraphState& m_state;
  };
  void OnDestroy(DGNode const* node) {
    for (xvector<DGNode const*>* nodes : m_notified) {
      std::replace(nodes->begin(), nodes->end(), node, static_cast<DGNode const*>(nullptr));
    }
    if (!m_isEvaluating) return;
    m_again.erase(node);
    m_failed.erase(node);
    m_unwound.erase(node);
    m_targets.erase(
        std::remove_if(m_targets.begin(), m_targets.end(), [=](Target const& t) { return t.m_node == node; }),
        m_targets.end());
    for (Calculation* at = m_calculation; at; at = at->m_outer) at->m_inputs.erase(node);
    // What a calculation had made and wanted to read: the calculation itself must begin further out.
    if (m_deep == node) m_deep = m_calculation ? m_calculation->m_node : nullptr;
  }

  Calculation* m_calculation = nullptr;  // the innermost
  EvictionQueue m_queues[8];

  // Of the outermost read.
  bool m_isEvaluating = false;
  std::uintptr_t m_stack = 0;
  DGNode const* m_deep = nullptr;  // the node of the DeepRead that is on its way
  xvector<Target> m_targets;
  std::size_t m_lastSerial = 0;
  std::unordered_map<DGNode const*, std::size_t> m_unwound;  // and the serial of the target
  std::unordered_map<DGNode const*, std::exception_ptr> m_failed;
  std::unordered_map<DGNode const*, bool> m_again;  // dirty when it ends, and whether hard
  xvector<xvector<DGNode const*>*> m_notified;
};

}  // namespace vesk
