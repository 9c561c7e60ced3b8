// Remote calls over a channel of bytes. A stub marshals a call into a message: the object's number, the method's index,
// the number of the answer or 0, and the arguments. On the other side a skeleton (or a scion) unmarshals it, calls the
// object and, where the caller waits for out parameters, sends a message back. Calls without out parameters wait in the
// channel until someone serves it. Both ends live in this process; a transport of one's own derives from Channel.

@import "Vesk/vxObject/Persist.h"

#include <unordered_map>

namespace vesk {

class Channel {
 public:
  virtual ~Channel() {}
  virtual void Send(xvector<octet_t> const& message) = 0;
  // False when nothing waits.
  virtual bool Receive(xvector<octet_t>& message) = 0;
};

// Two ends of a queue in each direction.
class LocalChannel {
 public:
  LocalChannel() : m_ends{End(m_queues[0], m_queues[1]), End(m_queues[1], m_queues[0])} {}
  Channel& Client() { return m_ends[0]; }
  Channel& Server() { return m_ends[1]; }

 private:
  typedef xdeque<xvector<octet_t>> Queue;
  class End : public Channel {
   public:
    End(Queue& out, Queue& in) : m_out(out), m_in(in) {}
    void Send(xvector<octet_t> const& message) override { m_out.push_back(message); }
    bool Receive(xvector<octet_t>& message) override {
      if (m_in.empty()) return false;
      message = std::move(m_in.front());
      m_in.pop_front();
      return true;
    }

   private:
    Queue& m_out;
    Queue& m_in;
  };
  Queue m_queues[2];
  End m_ends[2];
};

class RemoteError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

// --- Client

// Where the values of an answer go.
struct PendingResponse {
  typedef void (*Function)(InputArchive&, void**);
  virtual ~PendingResponse() {}
  virtual void** OutParams() = 0;
  Function m_fn = nullptr;
};

template <int N>
struct QueuedResponse : PendingResponse {
  void** OutParams() override { return m_outparams; }
  void* m_outparams[N] = {};
};

class ClientConnection {
 public:
  // `serve`: lets the other side work while a call waits for its answer.
  ClientConnection(Channel& channel, std::function<void()> serve) : m_channel(channel), m_serve(std::move(serve)) {}

  uint32 Expect(PendingResponse* response) {
    m_pending[++m_lastAnswer].reset(response);
    return m_lastAnswer;
  }
  void Send(Archive const& message) { m_channel.Send(message.m_bytes); }
  void AwaitAnswer(uint32 answer) {
    m_serve();
    xvector<octet_t> message;
    while (m_pending.count(answer) > 0 && m_channel.Receive(message)) Dispatch(message);
    if (m_pending.erase(answer) > 0) throw RemoteError("remote call without an answer");
  }

 private:
  void Dispatch(xvector<octet_t> const& message) {
    InputArchive ar(message);
    uint32 answer;
    DeserialiseVariableLengthUint(ar, answer);
    const auto at = m_pending.find(answer);
    if (at == m_pending.end()) throw RemoteError("unexpected answer");
    const std::unique_ptr<PendingResponse> response = std::move(at->second);
    m_pending.erase(at);
    response->m_fn(ar, response->OutParams());
  }

  Channel& m_channel;
  std::function<void()> m_serve;
  uint32 m_lastAnswer = 0;
  std::unordered_map<uint32, std::unique_ptr<PendingResponse>> m_pending;
};

template <typename I>
using InterfaceRecordExpression =
    decltype(static_cast<ReflectedInterface const&>(_GetReflected(std::declval<I const*>())));

// Stands for an object on the other side. It offers what IObject asks for, so that an interface that derives from it
// can be remote; its methods reach the other side, those of IObject do not.
class Stub {
 public:
  template <typename I>
  Stub(ptr<I> self, ssize_t) : m_self(self.Any()) {
    if constexpr (Detects<InterfaceRecordExpression, I>) m_interface = &GetReflectedInterface<I>();
  }
  virtual ~Stub() {}

  void Connect(ClientConnection& connection, uint32 object) {
    m_connection = &connection;
    m_object = object;
  }
  AnyInterface Interface() const { return m_self; }

  AnyInterface QueryInterface(ReflectedInterface const& interface) {
    return &interface == m_interface ? m_self : AnyInterface();
  }
  ReflectedClass const* GetReflectedClass() const { return nullptr; }
  void VisitObjects(IObjectVisitor&) const {}
  void VisitPrefs(IPrefVisitor&) const {}
  void EvictDgsNodes() const {}
  void DestroyObject() { delete this; }

 protected:
  Archive& StubBegin(ssize_t method, PendingResponse* response) const {
    m_message = Archive();
    m_answer = response ? m_connection->Expect(response) : 0;
    SerialiseVariableLengthUint(m_message, m_object);
    SerialiseVariableLengthUint(m_message, method);
    SerialiseVariableLengthUint(m_message, m_answer);
    return m_message;
  }
  void StubEnd() const {
    m_connection->Send(m_message);
    if (m_answer) m_connection->AwaitAnswer(m_answer);
  }

 private:
  AnyInterface m_self;
  ReflectedInterface const* m_interface = nullptr;
  ClientConnection* m_connection = nullptr;
  uint32 m_object = 0;
  mutable Archive m_message;
  mutable uint32 m_answer = 0;
};

// --- Server

typedef void (*ThunkFn)(void* self);
typedef ThunkFn SkeletonThunkFn;
typedef ThunkFn ScionThunkFn;

// Unmarshals the calls of one object.
class Dispatcher {
 public:
  Dispatcher(ThunkFn const* thunks, ssize_t count) : m_thunks(thunks), m_count(count) {}
  virtual ~Dispatcher() {}

  void SetDelegate(AnyInterface delegate) { m_delegate = delegate; }
  // The values that go back.
  Archive Call(void* self, ssize_t method, InputArchive arguments) {
    if (method < 0 || method >= m_count) throw RemoteError("no such remote method");
    m_arguments = std::move(arguments);
    m_results = Archive();
    m_thunks[method](self);
    return std::move(m_results);
  }

 protected:
  InputArchive Pop() { return std::move(m_arguments); }
  Archive& Push() { return m_results; }
  AnyInterface m_delegate;

 private:
  ThunkFn const* m_thunks;
  ssize_t m_count;
  InputArchive m_arguments;
  Archive m_results;
};

class Skeleton : public Dispatcher {
 public:
  using Dispatcher::Dispatcher;
};

class Scion : public Dispatcher {
 public:
  using Dispatcher::Dispatcher;
};

// --- Factories, by the name of the interface

struct IStubFactory {
  virtual ~IStubFactory() {}
  virtual Stub* CreateStub() = 0;
};
struct ISkeletonFactory {
  virtual ~ISkeletonFactory() {}
  virtual Skeleton* CreateSkeleton() = 0;
};
struct IScionFactory {
  virtual ~IScionFactory() {}
  virtual Scion* CreateScion() = 0;
};

template <typename Factory>
std::map<std::string, Factory*>& FactoryTable() {
  static std::map<std::string, Factory*>* const table = new std::map<std::string, Factory*>;
  return *table;
}

inline void RegisterStub(ConstStringZ name, IStubFactory* factory) { FactoryTable<IStubFactory>()[name] = factory; }
inline void UnregisterStub(ConstStringZ name) { FactoryTable<IStubFactory>().erase(name); }
inline void RegisterSkeleton(ConstStringZ name, ISkeletonFactory* factory) {
  FactoryTable<ISkeletonFactory>()[name] = factory;
}
inline void UnregisterSkeleton(ConstStringZ name) { FactoryTable<ISkeletonFactory>().erase(name); }
inline void RegisterScion(ConstStringZ name, IScionFactory* factory) { FactoryTable<IScionFactory>()[name] = factory; }
inline void UnregisterScion(ConstStringZ name) { FactoryTable<IScionFactory>().erase(name); }

template <typename Factory>
Factory& FactoryOf(ConstStringZ name) {
  const auto at = FactoryTable<Factory>().find(name);
  if (at == FactoryTable<Factory>().end()) throw RemoteError("no remote interface of this name: " + std::string(name));
  return *at->second;
}

// The objects that the other side may call, by number.
class Server {
 public:
  explicit Server(Channel& channel) : m_channel(channel) {}

  template <typename I>
  uint32 Export(ptr<I> const& object) {
    m_objects.emplace_back();
    Exported& exported = m_objects.back();
    if constexpr (InterfaceTypeTraits<I>::is_rmi) {
      Skeleton* skeleton = FactoryOf<ISkeletonFactory>(GetIpcInterfaceName<I>()).CreateSkeleton();
      exported = {std::unique_ptr<Dispatcher>(skeleton), skeleton};
    } else {
      Scion* scion = FactoryOf<IScionFactory>(GetIpcInterfaceName<I>()).CreateScion();
      exported = {std::unique_ptr<Dispatcher>(scion), scion};
    }
    exported.m_dispatcher->SetDelegate(object.Any());
    return static_cast<uint32>(m_objects.size());
  }

  // Carries out what waits in the channel.
  void Serve() {
    xvector<octet_t> message;
    while (m_channel.Receive(message)) Dispatch(message);
  }

 private:
  struct Exported {
    std::unique_ptr<Dispatcher> m_dispatcher;
    void* m_self = nullptr;  // as its thunks see it
  };

  void Dispatch(xvector<octet_t> const& message) {
    InputArchive ar(message);
    uint32 object, method, answer;
    DeserialiseVariableLengthUint(ar, object);
    DeserialiseVariableLengthUint(ar, method);
    DeserialiseVariableLengthUint(ar, answer);
    if (object == 0 || object > m_objects.size()) throw RemoteError("no such remote object");
    Exported& exported = m_objects[object - 1];
    const Archive results = exported.m_dispatcher->Call(exported.m_self, method, std::move(ar));
    if (!answer) return;
    Archive reply;
    SerialiseVariableLengthUint(reply, answer);
    reply.Write(results.m_bytes.data(), results.m_bytes.size());
    m_channel.Send(reply.m_bytes);
  }

  Channel& m_channel;
  std::vector<Exported> m_objects;
};

// The client's view of an exported object. The stub behind it is the caller's.
template <typename I>
std::unique_ptr<Stub> Import(ClientConnection& connection, uint32 object) {
  std::unique_ptr<Stub> stub(FactoryOf<IStubFactory>(GetIpcInterfaceName<I>()).CreateStub());
  stub->Connect(connection, object);
  return stub;
}

}  // namespace vesk
