// What a thread keeps while it works on its dependency graphs: the calculation that runs, what the outermost read has
// found out, and the eviction queues. It lives as long as the thread or the last node in a queue.

@import "Vesk/vxObject/CalculationStack.h"
@import "Vesk/vxObject/Visitors.h"
#include <exception>
#include <memory>
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

// What calculations within each other may use of a thread's own stack.
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

// A place in a list. To join one and to leave it takes no memory, so that neither fails; what is destroyed leaves.
struct NodePlace {
  NodePlace() {}
  NodePlace(NodePlace const&) = delete;
  void operator=(NodePlace const&) = delete;
  ~NodePlace() { Leave(); }

  void Leave() const {
    m_previous->m_next = m_next;
    m_next->m_previous = m_previous;
    m_previous = m_next = this;
  }
  // Leaves the list where it is.
  void JoinAhead(NodePlace const& place) const {
    Leave();
    m_next = &place;
    m_previous = place.m_previous;
    m_previous->m_next = m_next->m_previous = this;
  }

  mutable NodePlace const* m_previous = this;
  mutable NodePlace const* m_next = this;
};

// A node stands in one list of each kind at a time.
struct QueuePlace : NodePlace {};
struct ChangePlace : NodePlace {};

template <typename Place>
struct NodeList : private NodePlace {
  ~NodeList() {
    while (!IsEmpty()) m_next->Leave();
  }
  bool IsEmpty() const { return m_next == this; }
  NodePlace const* First() const { return m_next; }
  NodePlace const* End() const { return this; }
  void Append(Place const& place) { place.JoinAhead(*this); }
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

  // Whether the node has not read this input yet; from now on it has.
  bool IsNew(DGNode const* input);
  // The link from `input` to a node that is being calculated here or further out is gone.
  void Forget(DGNode const* node, DGNode const* input);
  // Whether this is memory of the calculation itself (its variables, its value), of which it cannot depend.
  bool Owns(void const* address);

  DGNode const* m_node;
  GraphState& m_state;
  Calculation* m_outer;
  std::unique_ptr<std::unordered_set<DGNode const*>> m_inputs;  // once there are many
  ValuePlace m_place;
  bool m_isPlaceKnown = false;
};

// Eight queues in each thread hold the nodes with a cached value, by when it was calculated.
class EvictionQueue {
 public:
  // That of the calling thread; index from 0 to 7.
  static EvictionQueue& Get(ssize_t index);

  ssize_t Count() const { return m_count; }
  ssize_t ByteSize() const { return m_byteSize; }

  // Evicts the oldest values until the others hold at most `budget` bytes.
  void EvictDownTo(ssize_t budget);

 private:
  friend class DGNode;
  friend struct GraphState;
  GraphState* m_state = nullptr;
  NodeList<QueuePlace> m_nodes;
  NodePlace const* m_next = m_nodes.End();  // of the eviction that runs
  ssize_t m_count = 0;
  ssize_t m_byteSize = 0;
};

struct GraphState : PerThread<GraphState> {
  GraphState();
  ~GraphState();

  void Begin();
  void End();

  // A node that the outermost read calculates; the one in front of it in the list wants it.
  struct Target {
    DGNode const* m_node;
    std::size_t m_serial;  // they ascend
    bool operator==(Target const& rhs) const { return m_serial == rhs.m_serial; }
  };
  void Aim(DGNode const* node);

  // A node whose calculation was unwound waits for the next target, until its own one begins again.
  void Unwind(DGNode const* node);
  bool IsWaiting(DGNode const* node) const;

  // Whether what is read next must be calculated further out. Not what the outermost calculation reads: that is
  // there.
  bool IsDeep() const;
  void MeasureStack(std::uintptr_t most) {
    m_stack = reinterpret_cast<std::uintptr_t>(__builtin_frame_address(0));
    m_mostStack = most;
  }

  void OnDestroy(DGNode const* node);
  // The calculation that runs goes on without something that it wanted to read: its value is not to be kept.
  void LoseInput();

  Calculation* m_calculation = nullptr;  // the innermost
  EvictionQueue m_queues[8];

  // Of the outermost read.
  bool m_isEvaluating = false;
  std::uintptr_t m_stack = 0;  // where the calculations began to use the stack, and how much they may
  std::uintptr_t m_mostStack = 0;
  CalculationStack m_otherStacks[4];
  DGNode const* m_deep = nullptr;  // the node of the DeepRead that is on its way
  xvector<Target> m_targets;
  std::size_t m_lastSerial = 0;
  // A node whose inputs are looked at, and which of them is next.
  struct Step {
    DGNode const* m_node;
    std::size_t m_input;
  };
  xvector<Step> m_steps;
  std::unordered_map<DGNode const*, std::exception_ptr> m_failed;
  std::unordered_map<DGNode const*, bool> m_again;  // dirty when it ends, and whether hard
};

}  // namespace vesk
