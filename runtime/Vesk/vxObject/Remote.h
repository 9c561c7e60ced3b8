// Remote calls over a channel of bytes. A stub marshals a call into a message: the object's number, the method's index,
// the number of the answer or 0, and the arguments. On the other side a skeleton (or a scion) unmarshals it, calls the
// object and, where the caller waits for out parameters, sends an answer: the number, 0 and the values, or the number,
// 1 and what went wrong. Calls without out parameters wait in the channel until someone serves it.
//
// Neither side trusts the other. A message that cannot be read, names nothing that is exported, has bytes behind its
// arguments or makes the method throw is answered with its error, and the server serves on; an answer is written to
// the caller's parameters only while the call that asked for it is under way. What both ends share is a Channel:
// LocalChannel in one process, SocketChannel.h between processes, or a class of one's own. A connection, a server and
// what they call belong to one thread.

@import "Vesk/vxObject/Channel.h"
@import "Vesk/vxObject/Persist.h"

#include <unordered_map>

namespace vesk {

// What the first byte behind an answer's number says.
enum EAnswer { AN_VALUES, AN_ERROR };

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
  // `serve`: lets the other side work while a call waits for its answer; empty where it works by itself.
  ClientConnection(Channel& channel, std::function<void()> serve = nullptr)
      : m_channel(channel), m_serve(std::move(serve)) {}

  // How long a call waits for its answer in a channel that can wait: 30 seconds unless told otherwise.
  void SetTimeout(std::chrono::milliseconds timeout) { m_timeout = timeout; }
  void SetMessageLimit(std::size_t bytes) { m_messageLimit = bytes; }

  // The number for the next call that waits.
  uint32 NextAnswer() { return ++m_lastAnswer != 0 ? m_lastAnswer : ++m_lastAnswer; }
  void Send(Archive const& message) {
    CheckMessageSize(message.m_bytes.size(), m_messageLimit);
    m_channel.Send(message.m_bytes);
  }
  // Sends a call and waits for its answer, whose values `response` takes. Whatever way the call ends, no later answer
  // finds the response.
  void Call(Archive const& message, uint32 answer, PendingResponse& response) {
    Pending pending(*this, answer, response);
    Send(message);
    if (m_serve) m_serve();
    const auto end = std::chrono::steady_clock::now() + m_timeout;
    xvector<octet_t> bytes;
    while (!pending.m_isDone) {
      const auto left = std::chrono::duration_cast<std::chrono::milliseconds>(end - std::chrono::steady_clock::now());
      if (!m_channel.ReceiveWithin(bytes, std::max(left, std::chrono::milliseconds(0)))) {
        if (!m_channel.IsOpen()) throw ChannelClosed("the other side is gone");
        throw RemoteTimeout("remote call without an answer");
      }
      Dispatch(bytes);
    }
    if (!pending.m_error.empty()) throw RemoteError(pending.m_error);
  }

 private:
  // A call under way.
  struct Pending {
    Pending(ClientConnection& connection, uint32 answer, PendingResponse& response)
        : m_connection(connection), m_answer(answer), m_response(response) {
      connection.m_pending[answer] = this;
    }
    ~Pending() { m_connection.m_pending.erase(m_answer); }
    Pending(Pending const&) = delete;
    void operator=(Pending const&) = delete;

    ClientConnection& m_connection;
    uint32 m_answer;
    PendingResponse& m_response;
    bool m_isDone = false;
    std::string m_error;
  };

  // An answer that nobody waits for any more is dropped.
  void Dispatch(xvector<octet_t> const& message) {
    CheckMessageSize(message.size(), m_messageLimit);
    if (message.empty()) throw RemoteError("empty message");
    InputArchive ar(message);
    uint32 answer;
    DeserialiseVariableLengthUint(ar, answer);
    const auto at = m_pending.find(answer);
    if (at == m_pending.end()) return;
    Pending& pending = *at->second;
    pending.m_isDone = true;
    try {
      ReadAnswer(ar, pending);
    } catch (std::exception const& error) {
      pending.m_error = std::string("bad answer: ") + error.what();
    }
  }
  static void ReadAnswer(InputArchive& ar, Pending& pending) {
    octet_t kind;
    ar.Read(&kind, 1);
    if (kind == AN_VALUES) {
      pending.m_response.m_fn(ar, pending.m_response.OutParams());
    } else {
      xstring error;
      ar >> error;
      pending.m_error = error.empty() ? "remote call failed" : error;
    }
    if (ar.Remaining() > 0) throw RemoteError("bytes behind the values");
  }

  Channel& m_channel;
  std::function<void()> m_serve;
  std::chrono::milliseconds m_timeout = std::chrono::seconds(30);
  std::size_t m_messageLimit = kMessageLimit;
  uint32 m_lastAnswer = 0;
  std::unordered_map<uint32, Pending*> m_pending;
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
  // The response is the stub's from here on.
  Archive& StubBegin(ssize_t method, PendingResponse* response) const {
    m_response.reset(response);
    if (!m_connection) throw RemoteError("stub without a connection");
    m_message = Archive();
    m_answer = response ? m_connection->NextAnswer() : 0;
    SerialiseVariableLengthUint(m_message, m_object);
    SerialiseVariableLengthUint(m_message, method);
    SerialiseVariableLengthUint(m_message, m_answer);
    return m_message;
  }
  // A call may lead to another one through this stub while it waits.
  void StubEnd() const {
    const Archive message = std::move(m_message);
    const std::unique_ptr<PendingResponse> response = std::move(m_response);
    if (response) {
      m_connection->Call(message, m_answer, *response);
    } else {
      m_connection->Send(message);
    }
  }

 private:
  AnyInterface m_self;
  ReflectedInterface const* m_interface = nullptr;
  ClientConnection* m_connection = nullptr;
  uint32 m_object = 0;
  mutable Archive m_message;
  mutable uint32 m_answer = 0;
  mutable std::unique_ptr<PendingResponse> m_response;
};

// --- Server

typedef void (*ThunkFn)(void* self);
typedef ThunkFn SkeletonThunkFn;
typedef ThunkFn ScionThunkFn;

// Unmarshals the calls of one object.
class Dispatcher {
 public:
  Dispatcher(ThunkFn const* thunks, ssize_t count) : m_delegate{{this}, nullptr}, m_thunks(thunks), m_count(count) {}
  virtual ~Dispatcher() {}
  Dispatcher(Dispatcher const&) = delete;
  void operator=(Dispatcher const&) = delete;

  void SetDelegate(AnyInterface delegate) {
    m_object = delegate.m_self;
    m_delegate.m_table = delegate.m_table;
  }
  // The values that go back. A call may lead to another one of the same object.
  Archive Call(void* self, ssize_t method, InputArchive arguments) {
    if (method < 0 || method >= m_count) throw RemoteError("no such remote method");
    const Scope scope(*this, std::move(arguments));
    m_thunks[method](self);
    return std::move(m_results);
  }

 protected:
  // Reads the arguments, which stay with the dispatcher.
  class Arguments {
   public:
    explicit Arguments(InputArchive& archive) : m_archive(archive) {}
    template <typename T>
    Arguments& operator>>(T& value) {
      m_archive >> value;
      return *this;
    }

   private:
    InputArchive& m_archive;
  };
  // The object. A thunk asks for it when it has read the arguments, just before it calls: nothing may be left then.
  struct Object {
    Dispatcher* m_dispatcher;
    operator void*() const {
      if (m_dispatcher->m_arguments.Remaining() > 0) throw RemoteError("bytes behind the arguments");
      return m_dispatcher->m_object;
    }
  };
  struct Delegate {
    Object m_self;
    void const* m_table;
  };

  Arguments Pop() { return Arguments(m_arguments); }
  Archive& Push() { return m_results; }
  Delegate m_delegate;

 private:
  // The call that is carried out; the one around it goes on with what is its own.
  struct Scope {
    Scope(Dispatcher& dispatcher, InputArchive arguments)
        : m_dispatcher(dispatcher),
          m_arguments(std::exchange(dispatcher.m_arguments, std::move(arguments))),
          m_results(std::exchange(dispatcher.m_results, Archive())) {}
    ~Scope() {
      m_dispatcher.m_arguments = std::move(m_arguments);
      m_dispatcher.m_results = std::move(m_results);
    }
    Scope(Scope const&) = delete;
    void operator=(Scope const&) = delete;

    Dispatcher& m_dispatcher;
    InputArchive m_arguments;
    Archive m_results;
  };

  ThunkFn const* m_thunks;
  ssize_t m_count;
  void* m_object = nullptr;
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

// The objects that the other side may call, by number. A number is not given out again.
class Server {
 public:
  typedef std::function<void(std::string const&)> ErrorFunction;
  explicit Server(Channel& channel) : m_channel(channel) {}

  // The object must live until it is taken back. RemoteError for null and for an interface that is not registered.
  template <typename I>
  uint32 Export(ptr<I> const& object) {
    if (!object) throw RemoteError("null cannot be exported");
    Exported exported;
    if constexpr (InterfaceTypeTraits<I>::is_rmi) {
      Skeleton* skeleton = FactoryOf<ISkeletonFactory>(GetIpcInterfaceName<I>()).CreateSkeleton();
      exported = {std::shared_ptr<Dispatcher>(skeleton), skeleton};
    } else {
      Scion* scion = FactoryOf<IScionFactory>(GetIpcInterfaceName<I>()).CreateScion();
      exported = {std::shared_ptr<Dispatcher>(scion), scion};
    }
    exported.m_dispatcher->SetDelegate(object.Any());
    m_objects[++m_lastNumber] = std::move(exported);
    return m_lastNumber;
  }
  // Takes an object back: later calls of it are errors. False for a number that is not exported.
  bool Unexport(uint32 number) { return m_objects.erase(number) > 0; }

  void SetMessageLimit(std::size_t bytes) { m_messageLimit = bytes; }
  // Is told each error, also those that go back to a caller.
  void OnError(ErrorFunction function) { m_onError = std::move(function); }

  // Carries out what waits in the channel. What a method throws, a bad message and a client that is gone do not come
  // out of here.
  void Serve() { ServeWithin(std::chrono::milliseconds(0)); }
  // The same, and waits for the first message up to `time`. False once the channel is closed.
  bool ServeWithin(std::chrono::milliseconds time) {
    try {
      xvector<octet_t> message;
      if (!(time.count() > 0 ? m_channel.ReceiveWithin(message, time) : m_channel.Receive(message))) {
        return m_channel.IsOpen();
      }
      do Dispatch(message);
      while (m_channel.Receive(message));
    } catch (std::exception const& error) {
      Report(error.what());
    }
    return m_channel.IsOpen();
  }

 private:
  struct Exported {
    std::shared_ptr<Dispatcher> m_dispatcher;  // an object may be taken back by its own method
    void* m_self = nullptr;                    // as its thunks see it
  };

  // Throws only where the answer cannot be sent.
  void Dispatch(xvector<octet_t> const& message) {
    uint32 answer = 0;
    Archive reply;
    try {
      const Archive results = Carry(message, answer);
      if (!answer) return;
      SerialiseVariableLengthUint(reply, answer);
      reply << octet_t(AN_VALUES);
      reply.Write(results.m_bytes.data(), results.m_bytes.size());
      CheckMessageSize(reply.m_bytes.size(), m_messageLimit);
    } catch (std::exception const& error) {
      reply = ErrorReply(answer, error.what());
    } catch (...) {
      reply = ErrorReply(answer, "remote method failed");
    }
    if (answer) m_channel.Send(reply.m_bytes);
  }

  Archive Carry(xvector<octet_t> const& message, uint32& answer) {
    InputArchive ar(message);
    uint32 object, method, number;
    DeserialiseVariableLengthUint(ar, object);
    DeserialiseVariableLengthUint(ar, method);
    DeserialiseVariableLengthUint(ar, number);
    answer = number;
    CheckMessageSize(message.size(), m_messageLimit);
    const auto at = m_objects.find(object);
    if (at == m_objects.end()) throw RemoteError("no such remote object");
    const Exported exported = at->second;
    return exported.m_dispatcher->Call(exported.m_self, method, std::move(ar));
  }

  Archive ErrorReply(uint32 answer, xstring const& text) {
    Report(text);
    Archive reply;
    SerialiseVariableLengthUint(reply, answer);
    reply << octet_t(AN_ERROR) << text;
    return reply;
  }
  void Report(std::string const& text) const {
    if (m_onError) m_onError(text);
  }

  Channel& m_channel;
  std::size_t m_messageLimit = kMessageLimit;
  ErrorFunction m_onError;
  uint32 m_lastNumber = 0;
  std::map<uint32, Exported> m_objects;
};

// The client's view of an exported object. The stub behind it is the caller's.
template <typename I>
std::unique_ptr<Stub> Import(ClientConnection& connection, uint32 object) {
  std::unique_ptr<Stub> stub(FactoryOf<IStubFactory>(GetIpcInterfaceName<I>()).CreateStub());
  stub->Connect(connection, object);
  return stub;
}

}  // namespace vesk
