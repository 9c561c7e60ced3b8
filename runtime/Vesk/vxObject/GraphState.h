// What a thread keeps while it works on its dependency graphs: the calculation that runs, what the outermost read has
// found out, and the eviction queues. It lives as long as the thread or the last node in a queue.

@import "Vesk/vxObject/CalculationStack.h"
@import "Vesk/vxObject/Visitors.h"
#include <stdexcept>

namespace vesk {

class DGNode;
class GraphWatch;
struct GraphAccess;
struct GraphState;

enum EDGFlags {
  DF_SYNC_DEP = 1,
  DF_PROPAGATE_HARD_DIRTINESS = 2,  // each calculation counts as a change
  DF_ASYNC_IO = 4,                  // calculated from the queue for input and output
  DF_SOURCE = 8                     // of a model's field: always up to date
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
// Nodes derive from it, and the names of what they inherit hide those of the user's types: hence no functions.
struct DGPlace {
  DGPlace() {}
  DGPlace(DGPlace const&) = delete;
  void operator=(DGPlace const&) = delete;
  ~DGPlace();

  mutable DGPlace const* m_previous = this;
  mutable DGPlace const* m_next = this;
};
inline void Leave(DGPlace const& place) {
  place.m_previous->m_next = place.m_next;
  place.m_next->m_previous = place.m_previous;
  place.m_previous = place.m_next = &place;
}
inline DGPlace::~DGPlace() { Leave(*this); }

// A node stands in one list of each kind at a time.
struct DGQueuePlace : DGPlace {};
struct DGChangePlace : DGPlace {};

template <typename Place>
struct NodeList : private DGPlace {
  ~NodeList() {
    while (!IsEmpty()) Leave(*m_next);
  }
  bool IsEmpty() const { return m_next == this; }
  DGPlace const* First() const { return m_next; }
  DGPlace const* Last() const { return m_previous; }
  DGPlace const* End() const { return this; }
  // What stands in another list leaves it.
  void Append(Place const& place) {
    Leave(place);
    DGPlace const& last = *m_previous;
    place.m_previous = &last;
    place.m_next = this;
    m_previous = last.m_next = &place;
  }
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

// One end of a link: the node at the other end, and where that lists this one.
struct DGLink {
  DGNode const* m_node;
  std::size_t m_at;
};

// Where there is room, adding a link is a few instructions that cannot fail.
class DGLinks {
 public:
  DGLinks() {}
  DGLinks(DGLinks const&) = delete;
  void operator=(DGLinks const&) = delete;
  ~DGLinks() { delete[] m_links; }

  bool empty() const { return m_size == 0; }
  std::size_t size() const { return m_size; }
  DGLink const* begin() const { return m_links; }
  DGLink const* end() const { return m_links + m_size; }
  DGLink& operator[](std::size_t at) { return m_links[at]; }

  bool IsFull() const { return m_size == m_capacity; }
  void MakeRoom();
  void Add(DGLink link) { m_links[m_size++] = link; }
  // The last one takes its place.
  void Remove(std::size_t at) { m_links[at] = m_links[--m_size]; }
  void Clear() { m_size = 0; }
  void GiveUp() {
    delete[] std::exchange(m_links, nullptr);
    m_size = m_capacity = 0;
  }

 private:
  DGLink* m_links = nullptr;
  std::size_t m_size = 0;
  std::size_t m_capacity = 0;
};

// Hard: calculate again. Soft: only if an input changed.
enum class ENodeState : unsigned char { Hard, Soft, Clean };
// Whether what is being calculated must be calculated again, and how.
enum class EAgain : unsigned char { No, Soft, Hard };

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
  void OnDestroy(DGNode const* input);
  // Whether this is memory of the calculation itself (its variables, its value), of which it cannot depend.
  bool Owns(void const* address) { return address != m_foreign && LookWhetherItOwns(address); }

  DGNode const* m_node;
  GraphState& m_state;
  Calculation* m_outer;

 private:
  struct InputSet;
  bool LookWhetherItOwns(void const* address);

  InputSet* m_inputs = nullptr;  // once there are many
  ValuePlace m_place;
  bool m_isPlaceKnown = false;
  void const* m_foreign = nullptr;  // the last address that was not its own
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
  friend struct GraphAccess;
  friend struct GraphState;
  GraphState* m_state = nullptr;
  NodeList<DGQueuePlace> m_nodes;
  DGPlace const* m_next = m_nodes.End();  // of the eviction that runs
  ssize_t m_count = 0;
  ssize_t m_byteSize = 0;
};

struct GraphState : PerThread<GraphState> {
  typedef NodeList<DGChangePlace> Changes;

  GraphState();
  ~GraphState();

  // --- Reads

  // GraphError where the value depends on itself.
  void BringUpToDate(DGNode const& node);
  // Makes the node that is being calculated depend on this one. Where there is no memory for that, its value is not
  // kept.
  void Link(DGNode const& node);
  // The calculation that runs goes on without something that it wanted to read: its value is not to be kept.
  void LoseInput();

  // --- Changes

  void Invalidate(DGNode const& node, bool hard);
  // What depends on this node looks at it again.
  void InvalidateDependents(DGNode const& node);
  // What depends on a node, or on one of several, calculates again. Until then it needs no inputs, so that the next
  // change has nothing to do. The list is empty afterwards.
  static void Change(DGNode const& node);
  void Change(Changes& nodes);
  static void Join(DGNode const& node, Changes& changes);
  static bool IsRead(DGNode const& node);
  void TryEvict(DGNode const& node);
  void OnDestroy(DGNode const& node);

  Calculation* m_calculation = nullptr;  // the innermost
  EvictionQueue m_queues[8];

 private:
  friend struct Calculation;
  friend struct AsyncQueues;
  friend struct GraphAccess;
  friend class DGNode;
  friend class GraphWatch;
  struct FailedRead;
  struct Steps;
  struct Rest;
  struct Timing;

  // A node that the outermost read calculates; the one in front of it in the list wants it.
  struct Target {
    DGNode const* m_node;
    std::size_t m_serial;  // they ascend
    bool operator==(Target const& rhs) const { return m_serial == rhs.m_serial; }
  };
  // A node whose inputs are looked at, and which of them is next.
  struct Step {
    DGNode const* m_node;
    std::size_t m_input;
  };

  static DGNode const* Changed(DGPlace const* place);
  static void Drop(DGLinks& links, DGLinks DGNode::*backwards, std::size_t at);
  static void Forget(DGNode const& node);
  static void OnNoDependents(DGNode const& node);
  static void OnSourceUnread(DGNode const& source);
  static void CalculateAgain(DGNode const& node, EAgain again);
  static void Mark(DGNode const& node, bool hard, Changes& dirty);
  static void Tell(Changes& dirty);
  static void TellDependents(DGNode const& node);
  static void TellTheOne(DGNode const& node);
  void DropDependents(DGNode const& node, bool isDestroyed, Changes& dirty);
  void Spread(Changes& dirty);

  void BeginRead(DGNode const& node);
  void BringUpToDateWithin(DGNode const& node);
  void End();
  void EndOfRest();
  void UpdateLastTarget();
  void Update(DGNode const& node);
  void LookAtInputs(DGNode const& node);
  void Calculate(DGNode const& node);
  void CheckCalculation(DGNode const& node) const;
  void CalculateTimed(DGNode const& node);
  void CalculateHere(DGNode const& node);
  void CalculateElsewhere(DGNode const& node);
  bool Recalculate(DGNode const& node);
  static void BreakOff(DGNode const& node);
  void SpreadNews(DGNode const& node);
  void JoinEndOfQueue(DGNode const& node);
  static void LeaveQueue(DGNode const& node);

  void Aim(DGNode const* node);
  // A node whose calculation was unwound waits for the next target, until its own one begins again.
  void Unwind(DGNode const& node);
  bool IsWaiting(DGNode const& node) const;
  // Whether what is read next must be calculated further out. Not what the outermost calculation reads: that is
  // there.
  bool IsDeep() const;
  void MeasureStack(std::uintptr_t most) {
    m_stack = reinterpret_cast<std::uintptr_t>(__builtin_frame_address(0));
    m_mostStack = most;
  }
  Rest& NeedRest();

  // Of the outermost read.
  bool m_isEvaluating = false;
  std::uintptr_t m_stack = 0;  // where the calculations began to use the stack, and how much they may
  std::uintptr_t m_mostStack = 0;
  DGNode const* m_deep = nullptr;  // the node of the DeepRead that is on its way
  xvector<Target> m_targets;
  std::size_t m_lastSerial = 0;
  xvector<Step> m_steps;
  Rest* m_rest = nullptr;    // what few reads need
  bool m_isWatched = false;  // by a GraphWatch, which the rest is kept for
};

}  // namespace vesk
