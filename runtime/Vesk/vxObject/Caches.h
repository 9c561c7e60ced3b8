// The nodes of `$cache` functions: N the node's own class, C the class of the function, K its key, I the input of an
// async calculation, O its output. A keyed function has one node per key. An async node answers the output that it has,
// and queues the calculation when that is out of date; RunAsyncCalculations carries the queues out and tells who read
// it.

@import "Vesk/vxObject/CacheValues.h"
#include <map>

namespace vesk {

// --- One node per function, or one per key

template <typename Node, typename N, typename C, typename O>
class DGCacheNode : public Node {
 public:
  typedef O output_type;
  ssize_t ByteSize() const override { return CacheValueAdditionalSize(_output); }
  void VisitContainingObject(IObjectVisitor& v) const override {
    v << _output << static_cast<N const*>(this)->_GetFinalSelf();
  }
  bool IsEvictable() const override { return CacheValueIsEvictable(_output); }
  void OnEvict() const override {
    OnEvictCacheValue(_output);
    ClearCacheValue(_output);
  }
  O const& read() const {
    this->ReadBarrier();
    return _output;
  }

  mutable O _output = O();

 protected:
  // Only keyed nodes have these; the using-declarations of _GetFinalSelf name them for all.
  void _self() const;
  void _GetKey() const;
};

template <typename N, typename K>
class DGNodeMap {
 public:
  N& operator[](K const& key) {
    try {
      const auto [at, isNew] = m_nodes.try_emplace(key);
      if (isNew) at->second.m_key = &at->first;
      return at->second;
    } catch (...) {
      GraphState::Get().LoseInput();
      throw;
    }
  }
  ssize_t size() const { return static_cast<ssize_t>(m_nodes.size()); }
  typename std::map<K, N>::const_iterator begin() const { return m_nodes.begin(); }
  typename std::map<K, N>::const_iterator end() const { return m_nodes.end(); }

  DGNodeMap() {}
  DGNodeMap(DGNodeMap const&) {}
  DGNodeMap& operator=(DGNodeMap const&) {
    for (auto const& [key, node] : m_nodes) node.TryEvict(true);
    return *this;
  }

 private:
  std::map<K, N> m_nodes;
};

template <typename N, typename K>
void TryEvict(DGNodeMap<N, K> const& nodes) {
  for (auto const& [key, node] : nodes) node.TryEvict(false);
}

template <typename Base, typename N, typename C, typename K>
class DGKeyed : public Base {
 public:
  typedef K key_type;
  typedef DGNodeMap<N, K> map_type;
  typename Base::output_type const& read(C const* self) {
    _self = self;
    return Base::read();
  }
  K const& _GetKey() const { return *m_key; }

  C const* _self = nullptr;
  K const* m_key = nullptr;
};

// --- Async: the calculation waits in a queue

struct DGWaitPlace : DGPlace {};
class DGAsyncNode;

struct AsyncQueues : PerThread<AsyncQueues> {
  enum EQueue { Calculations, InputOutput };

  static void Join(DGAsyncNode const& node);
  static void Leave(DGAsyncNode const& node);
  // Runs what waits now in this thread. Answers how many calculations ran. One that throws ends it; its node is
  // calculated again when it is next read.
  static ssize_t Run(EQueue queue);

  NodeList<DGWaitPlace> m_waiting[2];
};

class DGAsyncNode : public DGNode, private DGWaitPlace {
 public:
  DGAsyncNode() {}
  DGAsyncNode(DGAsyncNode const& rhs) : DGNode(rhs), DGWaitPlace() {}
  DGAsyncNode& operator=(DGAsyncNode const& rhs) {
    DGNode::operator=(rhs);
    return *this;
  }
  ~DGAsyncNode() override { AsyncQueues::Leave(*this); }

 protected:
  virtual bool CalculateOutput() const = 0;  // whether it changed

 private:
  friend struct AsyncQueues;
  mutable AsyncQueues* m_queues = nullptr;  // where it waits
};

// Both queues of this thread until nothing waits.
inline ssize_t RunAsyncCalculations() {
  ssize_t count = 0;
  for (ssize_t more = 1; more > 0; count += more) {
    more = AsyncQueues::Run(AsyncQueues::Calculations) + AsyncQueues::Run(AsyncQueues::InputOutput);
  }
  return count;
}

template <typename Base, typename O, typename Calculate>
bool ReplaceOutput(Base const& node, Calculate calculate) {
  O output = O();
  calculate(output);
  if (output == node._output) return false;
  node._output = std::move(output);
  return true;
}

// --- The six that generated text derives from

template <typename N, typename C, typename O>
class DGSyncDepNode : public DGCacheNode<DGDepNode, N, C, O> {};

template <typename N, typename C, typename K, typename O>
class DGKeyedSyncDepNode : public DGKeyed<DGCacheNode<DGDepNode, N, C, O>, N, C, K> {};

// Without an input the calculation depends on nothing: it runs once, and again when the value was evicted.
template <typename N, typename C, typename O>
class DGAsyncIndepNode : public DGCacheNode<DGAsyncNode, N, C, O> {
 protected:
  bool RecalcCache() const override {
    AsyncQueues::Join(*this);
    return false;
  }
  bool CalculateOutput() const override {
    N const* node = static_cast<N const*>(this);
    return ReplaceOutput<DGAsyncIndepNode, O>(*this, [&](O& output) { N::CalcOutput(node->_GetSelf(), output); });
  }
};

template <typename N, typename C, typename K, typename O>
class DGKeyedAsyncIndepNode : public DGKeyed<DGCacheNode<DGAsyncNode, N, C, O>, N, C, K> {
 protected:
  bool RecalcCache() const override {
    AsyncQueues::Join(*this);
    return false;
  }
  bool CalculateOutput() const override {
    return ReplaceOutput<DGKeyedAsyncIndepNode, O>(
        *this, [&](O& output) { N::CalcOutput(this->_self, output, this->_GetKey()); });
  }
};

// With an input, taking the input is what depends on the graph. The calculation sees only the input.
template <typename N, typename C, typename I, typename O>
class DGAsyncNodeOnInput : public DGCacheNode<DGAsyncNode, N, C, O> {
 public:
  typedef I input_type;

 protected:
  bool RecalcCache() const override {
    m_input = I();
    N::CalcInput(static_cast<N const*>(this)->_GetSelf(), m_input);
    AsyncQueues::Join(*this);
    return false;
  }
  bool CalculateOutput() const override {
    N const* node = static_cast<N const*>(this);
    return ReplaceOutput<DGAsyncNodeOnInput, O>(*this,
                                                [&](O& output) { N::CalcOutput(node->_GetSelf(), output, m_input); });
  }

 private:
  mutable I m_input = I();
};

template <typename N, typename C, typename K, typename I, typename O>
class DGKeyedAsyncNodeOnInput : public DGKeyed<DGCacheNode<DGAsyncNode, N, C, O>, N, C, K> {
 public:
  typedef I input_type;

 protected:
  bool RecalcCache() const override {
    m_input = I();
    N::CalcInput(this->_self, m_input, this->_GetKey());
    AsyncQueues::Join(*this);
    return false;
  }
  bool CalculateOutput() const override {
    return ReplaceOutput<DGKeyedAsyncNodeOnInput, O>(
        *this, [&](O& output) { N::CalcOutput(this->_self, output, this->_GetKey(), m_input); });
  }

 private:
  mutable I m_input = I();
};

}  // namespace vesk

// Generated nodes name what they inherit without `this->`, which a template does not find in a base that depends on its
// parameters: those of mixins and class templates. Every node declares _GetFinalSelf once, behind its typedef `base`;
// the names are made its own in front of that. The declaration that is cut off belongs to a function that nobody calls.
#define _GetFinalSelf()       \
  _NoSelf() const;            \
  using base::_output;        \
  using base::_self;          \
  using base::_GetKey;        \
  using base::SetFlag;        \
  using base::UpdateByteSize; \
  const auto* _GetFinalSelf()
