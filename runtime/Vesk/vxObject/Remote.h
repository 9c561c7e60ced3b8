// Remote calls over a channel of bytes. A stub marshals a call into a message: the object's number, the method's index,
// the number of the answer or 0, and the arguments. On the other side a skeleton (or a scion) unmarshals it, calls the
// object and, where the caller waits for out parameters, sends an answer: the number, 0 and the values, or the number,
// 1 and what went wrong. Calls without out parameters wait in the channel until someone serves it.
//
// Neither side trusts the other. A message that cannot be read, names nothing that is exported, has bytes behind its
// arguments or makes the method throw is answered with its error, and the server serves on; an answer is written to
// the caller's parameters only while the call that asked for it is under way. What both ends share is a Channel:
// LocalChannel in one process, SocketChannel.h, LocalSocketChannel.h and TlsChannel.h between processes, or a class of
// one's own. A connection, a server and what they call belong to one thread.
//
// A server may ask who calls: for a token ahead of all calls, and by a function for each. A token is given by a call of
// the object 0.

@import "Vesk/vxObject/Channel.h"
@import "Vesk/vxObject/Persist.h"

namespace vesk {

// What the first byte behind an answer's number says.
enum EAnswer { AN_VALUES, AN_ERROR };

// --- Client

// The results of an `ipc` call: generated text takes them out of an Archive.
template <typename T>
Archive& operator>>(Archive& ar, T& value) {
  if (!ar.m_answer) FailArchive("archive is not for reading");
  *ar.m_answer >> value;
  return ar;
}

// Reads the values of an answer to where their addresses tell.
class ReadResults {
 public:
  typedef void (*FromInput)(InputArchive&, void**);
  typedef void (*FromArchive)(Archive&, void**);
  ReadResults() {}
  ReadResults(FromInput function) : m_fromInput(function) {}
  ReadResults(FromArchive function) : m_fromArchive(function) {}

  void operator()(InputArchive& answer, void** outParams) const {
    if (m_fromInput) return m_fromInput(answer, outParams);
    Archive ar;
    ar.m_answer = &answer;
    m_fromArchive(ar, outParams);
  }

 private:
  FromInput m_fromInput = nullptr;
  FromArchive m_fromArchive = nullptr;
};

// Where the values of an answer go.
struct PendingResponse {
  virtual ~PendingResponse() {}
  virtual void** OutParams() = 0;
  ReadResults m_fn;
};

template <int N>
struct QueuedResponse : PendingResponse {
  void** OutParams() override { return m_outparams; }
  void* m_outparams[N] = {};
};

class ClientConnection {
 public:
  // `serve`: lets the other side work while a call waits for its answer; empty where it works by itself.
  ClientConnection(Channel& channel, std::function<void()> serve = nullptr);
  ~ClientConnection();

  // How long a call waits for its answer in a channel that can wait: 30 seconds unless told otherwise.
  void SetTimeout(std::chrono::milliseconds timeout) { m_timeout = timeout; }
  void SetMessageLimit(std::size_t bytes) { m_messageLimit = bytes; }

  // The number for the next call that waits.
  uint32 NextAnswer() { return ++m_lastAnswer != 0 ? m_lastAnswer : ++m_lastAnswer; }
  void Send(Archive const& message);
  // Sends a call and waits for its answer, whose values `response` takes. Whatever way the call ends, no later answer
  // finds the response.
  void Call(Archive const& message, uint32 answer, PendingResponse& response);
  // What Server::AddToken asks for. RemoteError when it is not a token of the server, which then ends the connection,
  // and when that asks for none.
  void GiveToken(xstring const& token);

 private:
  struct Pending;  // a call under way

  bool DispatchWithin(std::chrono::milliseconds time);
  void Dispatch(xvector<octet_t> message, std::string error);
  static void ReadAnswer(InputArchive& ar, Pending& pending);

  Channel& m_channel;
  std::function<void()> m_serve;
  std::chrono::milliseconds m_timeout = std::chrono::seconds(30);
  std::size_t m_messageLimit = kMessageLimit;
  uint32 m_lastAnswer = 0;
  xvector<Pending*> m_pending;  // one within the other
};

template <typename I>
using InterfaceRecordExpression =
    decltype(static_cast<ReflectedInterface const&>(_GetReflected(std::declval<I const*>())));

// Stands for an object on the other side. It offers what IObject and IPersistable ask for, so that an interface that
// derives from one of them can be remote; its methods reach the other side, those of the two do not. It has no class,
// so that archives refuse it.
class Stub {
 public:
  template <typename I>
  Stub(ptr<I> self, ssize_t) : m_self(self.Any()) {
    if constexpr (Detects<InterfaceRecordExpression, I>) m_interface = &GetReflectedInterface<I>();
  }
  virtual ~Stub();
  Stub(Stub const&) = delete;
  void operator=(Stub const&) = delete;

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
  void Serialise(Archive&) const { FailArchive("a remote object cannot be archived"); }
  void Deserialise(InputArchive&) { FailArchive("a remote object cannot be archived"); }

 protected:
  // The response is the stub's from here on.
  Archive& StubBegin(ssize_t method, PendingResponse* response) const;
  // A call may lead to another one through this stub while it waits.
  void StubEnd() const;

 private:
  AnyInterface m_self;
  ReflectedInterface const* m_interface = nullptr;
  ClientConnection* m_connection = nullptr;
  uint32 m_object = 0;
  mutable Archive m_message;
  mutable uint32 m_answer = 0;
  mutable PendingResponse* m_response = nullptr;  // its own
};

// --- Server

typedef void (*ThunkFn)(void* self);
typedef ThunkFn SkeletonThunkFn;
typedef ThunkFn ScionThunkFn;

// Unmarshals the calls of one object.
class Dispatcher {
 public:
  Dispatcher(ThunkFn const* thunks, ssize_t count);
  virtual ~Dispatcher();
  Dispatcher(Dispatcher const&) = delete;
  void operator=(Dispatcher const&) = delete;

  virtual void SetDelegate(AnyInterface delegate) = 0;
  ssize_t CountMethods() const { return m_count; }
  // RemoteError for one that is not there.
  void CheckMethod(ssize_t method) const;
  // The values that go back. A call may lead to another one of the same object.
  Archive Call(void* self, ssize_t method, InputArchive arguments);

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

  Arguments Pop() { return Arguments(m_arguments); }
  Archive& Push() { return m_results; }
  void CheckArgumentsRead() const;

 private:
  struct Scope;

  ThunkFn const* m_thunks;
  ssize_t m_count;
  InputArchive m_arguments;
  Archive m_results;
};

class Skeleton : public Dispatcher {
 public:
  Skeleton(ThunkFn const* thunks, ssize_t count) : Dispatcher(thunks, count), m_delegate{{this}, nullptr} {}
  void SetDelegate(AnyInterface delegate) override {
    m_object = delegate.m_self;
    m_delegate.m_table = delegate.m_table;
  }

 private:
  // The object. A thunk asks for it when it has read the arguments, just before it calls: nothing may be left then.
  struct Object {
    Skeleton* m_skeleton;
    operator void*() const {
      m_skeleton->CheckArgumentsRead();
      return m_skeleton->m_object;
    }
  };
  struct Delegate {
    Object m_self;
    void const* m_table;
  };

 protected:
  Delegate m_delegate;

 private:
  void* m_object = nullptr;
};

// Its thunks see the delegate as a handle of their interface, so that the object is called before anyone can look at
// what is left of the arguments.
class Scion : public Dispatcher {
 public:
  using Dispatcher::Dispatcher;
  void SetDelegate(AnyInterface delegate) override { std::memcpy(m_delegate, &delegate, sizeof(delegate)); }

 protected:
  alignas(AnyInterface) octet_t m_delegate[sizeof(AnyInterface)] = {};  // as bytes may be seen as anything
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

void RegisterStub(ConstStringZ name, IStubFactory* factory);
void UnregisterStub(ConstStringZ name);
void RegisterSkeleton(ConstStringZ name, ISkeletonFactory* factory);
void UnregisterSkeleton(ConstStringZ name);
void RegisterScion(ConstStringZ name, IScionFactory* factory);
void UnregisterScion(ConstStringZ name);

// RemoteError when there is none.
template <typename Factory>
Factory& FactoryOf(ConstStringZ name);

// What became of a message. `NoCall`: it led to no method; `NoToken`: the other side has not given the token.
enum class EServed { Nothing, Carried, NoCall, NoToken, NotAnswered };

// The objects that the other side may call, by number. A number is not given out again.
class Server {
 public:
  typedef std::function<void(std::string const&)> ErrorFunction;
  explicit Server(Channel& channel);
  ~Server();
  Server(Server const&) = delete;
  void operator=(Server const&) = delete;

  // The object must live until it is taken back. RemoteError for null and for an interface that is not registered.
  template <typename I>
  uint32 Export(ptr<I> const& object) {
    if constexpr (InterfaceTypeTraits<I>::is_rmi) {
      return ExportSkeleton(object ? GetIpcInterfaceName<I>() : nullptr, object.Any());
    } else {
      return ExportScion(object ? GetIpcInterfaceName<I>() : nullptr, object.Any());
    }
  }
  // Takes an object back: later calls of it are errors. False for a number that is not exported.
  bool Unexport(uint32 number);

  // Is asked ahead of each call, with the names of the interface and of the method (its number where the interface has
  // no record) and with who calls. False refuses the call, and so does what it throws, whose text the caller gets.
  typedef std::function<bool(ConstStringZ, ConstStringZ, Peer const&)> AuthorizeFunction;
  void Authorize(AuthorizeFunction function) { m_authorize = std::move(function); }
  // Until the other side has given one of the tokens, nothing is carried out. RemoteError for less than 16 bytes.
  void AddToken(xstring token, xstring name = "token");
  bool WaitsForToken() const { return !m_tokens.empty() && m_peer.m_token.empty(); }
  // Who is on the other side; for the connect function of a server over sockets, and later.
  Peer const& GetPeer() const;

  void SetMessageLimit(std::size_t bytes) { m_messageLimit = bytes; }
  // Is told each error, also those that go back to a caller. What it throws is dropped.
  void OnError(ErrorFunction function);

  // Carries out what waits in the channel. What a method throws, a bad message and a client that is gone do not come
  // out of here.
  void Serve() { ServeWithin(std::chrono::milliseconds(0)); }
  // The same, and waits for the first message up to `time`. False once the channel is closed.
  bool ServeWithin(std::chrono::milliseconds time);
  // Carries out one message that has come already, for who serves many clients in turn.
  EServed ServeNext();

 private:
  struct Exported;
  struct Objects;

  uint32 ExportSkeleton(ConstStringZ name, AnyInterface object);
  uint32 ExportScion(ConstStringZ name, AnyInterface object);
  uint32 Add(Exported exported, ConstStringZ name, AnyInterface object);

  struct Call {
    uint32 m_answer = 0;
    EServed m_served = EServed::NoCall;
  };
  EServed Dispatch(xvector<octet_t> message);
  Archive Carry(xvector<octet_t> message, Call& call);
  void CheckToken(uint32 object, uint32 method, InputArchive& ar);
  void CheckAuthorized(Exported const& exported, uint32 method) const;
  void SendValues(uint32 answer, Archive const& results);
  void SendError(uint32 answer, std::string_view text);
  EServed AnswerError(Call const& call, ConstStringZ text);
  void Report(ConstStringZ text) const;

  Channel& m_channel;
  std::size_t m_messageLimit = kMessageLimit;
  ErrorFunction m_onError;
  AuthorizeFunction m_authorize;
  xvector<std::pair<xstring, xstring>> m_tokens;  // with their names
  mutable Peer m_peer;                            // asked of the channel when it is first needed
  uint32 m_lastNumber = 0;
  Objects* m_objects;
};

std::unique_ptr<Stub> ImportStub(ClientConnection& connection, uint32 object, ConstStringZ name);

// The client's view of an exported object. The stub behind it is the caller's.
template <typename I>
std::unique_ptr<Stub> Import(ClientConnection& connection, uint32 object) {
  return ImportStub(connection, object, GetIpcInterfaceName<I>());
}

}  // namespace vesk
