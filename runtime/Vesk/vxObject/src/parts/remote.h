// Remote calls: what carries messages within a thread, and how either side makes and reads them.

@import "Vesk/vxObject/IObject.h"
@import "Vesk/vxObject/src/shared.h"

#include <algorithm>
#include <deque>
#include <map>

namespace vesk {

// --- The channel of a thread

struct LocalChannel::Ends {
  typedef std::deque<xvector<octet_t>> Queue;
  struct End : Channel {
    End(Queue& out, Queue& in) : m_out(out), m_in(in) {}
    void Send(xvector<octet_t> const& message) override { m_out.push_back(message); }
    bool Receive(xvector<octet_t>& message) override {
      if (m_in.empty()) return false;
      message = std::move(m_in.front());
      m_in.pop_front();
      return true;
    }
    Peer GetPeer() const override {
      Peer peer;
      peer.m_kind = PK_THREAD;
      return peer;
    }
    Queue& m_out;
    Queue& m_in;
  };
  Queue m_out, m_back;
  End m_client{m_out, m_back}, m_server{m_back, m_out};
};

LocalChannel::LocalChannel() : m_ends(new Ends) {}
LocalChannel::~LocalChannel() { delete m_ends; }
Channel& LocalChannel::Client() { return m_ends->m_client; }
Channel& LocalChannel::Server() { return m_ends->m_server; }

std::chrono::steady_clock::time_point EndOf(std::chrono::milliseconds time) {
  typedef std::chrono::milliseconds Time;
  return std::chrono::steady_clock::now() + std::clamp<Time>(time, Time(0), std::chrono::hours(24 * 365 * 100));
}

xstring PeerText(Peer const& peer) {
  static constexpr ConstStringZ kKinds[] = {"someone", "this thread", "a client over TCP", "a local process",
                                            "a client over TLS"};
  const std::string token = peer.m_token.empty() ? "" : " with the token " + peer.m_token;
  std::string who = kKinds[peer.m_kind];
  if (peer.m_user >= 0) who = "user " + std::to_string(peer.m_user);
  if (!peer.m_subject.empty()) who = peer.m_subject;
  return who + (peer.m_address.empty() ? "" : " at " + peer.m_address) + token;
}

bool IsEqualInConstantTime(std::string_view given, std::string_view secret) {
  unsigned difference = given.size() != secret.size() || secret.empty();
  for (std::size_t i = 0, at = 0; i < given.size() && !secret.empty(); ++i, at = at + 1 == secret.size() ? 0 : at + 1) {
    difference |= static_cast<unsigned>(static_cast<octet_t>(given[i] ^ secret[at]));
  }
  return difference == 0;
}

xstring TooLongText(std::size_t size, std::size_t limit) {
  return vxMakeString("message of " << size << " bytes, the limit is " << limit);
}

void CheckMessageSize(std::size_t size, std::size_t limit) {
  if (size > limit) throw RemoteError(TooLongText(size, limit));
}

MessageTooLong::MessageTooLong(std::size_t size, std::size_t limit, xvector<octet_t> head)
    : RemoteError(TooLongText(size, limit)), m_head(std::move(head)) {}

// --- Client

// The number by which a token is given; that of no object.
constexpr uint32 kTokenObject = 0;

// A call within another one stands behind it in the list.
struct ClientConnection::Pending {
  Pending(ClientConnection& connection, uint32 answer, PendingResponse& response)
      : m_connection(connection), m_answer(answer), m_response(response) {
    connection.m_pending.push_back(this);
  }
  ~Pending() { m_connection.m_pending.pop_back(); }
  Pending(Pending const&) = delete;
  void operator=(Pending const&) = delete;

  ClientConnection& m_connection;
  uint32 m_answer;
  PendingResponse& m_response;
  bool m_isDone = false;
  std::string m_error;
};

ClientConnection::ClientConnection(Channel& channel, std::function<void()> serve)
    : m_channel(channel), m_serve(std::move(serve)) {}
ClientConnection::~ClientConnection() {}

void ClientConnection::Send(Archive const& message) {
  CheckMessageSize(message.m_bytes.size(), m_messageLimit);
  m_channel.Send(message.m_bytes);
}

void ClientConnection::Call(Archive const& message, uint32 answer, PendingResponse& response) {
  Pending pending(*this, answer, response);
  if (!m_serve && !m_channel.CanAnswer()) throw RemoteError("the object is served by the thread that calls it");
  Send(message);
  if (m_serve) m_serve();
  const auto end = EndOf(m_timeout);
  while (!pending.m_isDone) {
    const auto left = std::chrono::duration_cast<std::chrono::milliseconds>(end - std::chrono::steady_clock::now());
    if (!DispatchWithin(left)) {
      if (!m_channel.IsOpen()) throw ChannelClosed("the other side is gone");
      throw RemoteTimeout("remote call without an answer");
    }
  }
  if (!pending.m_error.empty()) throw RemoteError(pending.m_error);
}

// Waits for an answer, of whatever call.
bool ClientConnection::DispatchWithin(std::chrono::milliseconds time) {
  xvector<octet_t> message;
  try {
    if (!m_channel.ReceiveWithin(message, std::max(time, std::chrono::milliseconds(0)))) return false;
  } catch (MessageTooLong const& error) {
    Dispatch(error.Head(), error.what());
    return true;
  }
  const std::size_t size = message.size();
  Dispatch(std::move(message), size > m_messageLimit ? TooLongText(size, m_messageLimit) : xstring());
  return true;
}

void ClientConnection::GiveToken(xstring const& token) {
  Archive message;
  const uint32 answer = NextAnswer();
  for (uint32 number : {kTokenObject, uint32(0), answer}) SerialiseVariableLengthUint(message, number);
  message << token;
  struct : PendingResponse {
    void** OutParams() override { return nullptr; }
  } response;
  response.m_fn = ReadResults([](InputArchive&, void**) {});
  Call(message, answer, response);
}

// An answer that nobody waits for any more is dropped. `error`: why its values cannot be read.
void ClientConnection::Dispatch(xvector<octet_t> message, std::string error) {
  if (message.empty()) throw RemoteError("empty message");
  InputArchive ar(std::move(message));
  uint32 answer;
  try {
    DeserialiseVariableLengthUint(ar, answer);
  } catch (ArchiveError const& e) {
    throw RemoteError(std::string("bad answer: ") + e.what());
  }
  const auto at = std::find_if(m_pending.begin(), m_pending.end(), [=](Pending* p) { return p->m_answer == answer; });
  if (at == m_pending.end()) return;
  Pending& pending = **at;
  pending.m_isDone = true;
  pending.m_error = std::move(error);
  if (!pending.m_error.empty()) return;
  try {
    ReadAnswer(ar, pending);
  } catch (std::exception const& e) {
    pending.m_error = std::string("bad answer: ") + e.what();
  }
}

void ClientConnection::ReadAnswer(InputArchive& ar, Pending& pending) {
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

Stub::~Stub() { delete m_response; }

Archive& Stub::StubBegin(ssize_t method, PendingResponse* response) const {
  delete std::exchange(m_response, response);
  if (!m_connection) throw RemoteError("stub without a connection");
  m_message = Archive();
  m_answer = response ? m_connection->NextAnswer() : 0;
  SerialiseVariableLengthUint(m_message, m_object);
  SerialiseVariableLengthUint(m_message, method);
  SerialiseVariableLengthUint(m_message, m_answer);
  return m_message;
}

void Stub::StubEnd() const {
  const Archive message = std::move(m_message);
  const std::unique_ptr<PendingResponse> response(std::exchange(m_response, nullptr));
  if (response) {
    m_connection->Call(message, m_answer, *response);
  } else {
    m_connection->Send(message);
  }
}

std::unique_ptr<Stub> ImportStub(ClientConnection& connection, uint32 object, ConstStringZ name) {
  std::unique_ptr<Stub> stub(FactoryOf<IStubFactory>(name).CreateStub());
  stub->Connect(connection, object);
  return stub;
}

// --- Server

Dispatcher::Dispatcher(ThunkFn const* thunks, ssize_t count) : m_thunks(thunks), m_count(count) {}
Dispatcher::~Dispatcher() {}

// The call that is carried out; the one around it goes on with what is its own.
struct Dispatcher::Scope {
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

Archive Dispatcher::Call(void* self, ssize_t method, InputArchive arguments) {
  CheckMethod(method);
  const Scope scope(*this, std::move(arguments));
  m_thunks[method](self);
  CheckArgumentsRead();
  return std::move(m_results);
}

void Dispatcher::CheckMethod(ssize_t method) const {
  if (method < 0 || method >= m_count) throw RemoteError("no such remote method");
}

void Dispatcher::CheckArgumentsRead() const {
  if (m_arguments.Remaining() > 0) throw RemoteError("bytes behind the arguments");
}

// Of one kind; all have the same map, as the compiler takes a while over each.
template <typename Factory>
struct Factories {
  std::map<std::string, void*> m_byName;
  static std::map<std::string, void*>& Get() { return Shared<Factories<Factory>>().m_byName; }
};

void RegisterStub(ConstStringZ name, IStubFactory* factory) { Factories<IStubFactory>::Get()[name] = factory; }
void UnregisterStub(ConstStringZ name) { Factories<IStubFactory>::Get().erase(name); }
void RegisterSkeleton(ConstStringZ name, ISkeletonFactory* factory) {
  Factories<ISkeletonFactory>::Get()[name] = factory;
}
void UnregisterSkeleton(ConstStringZ name) { Factories<ISkeletonFactory>::Get().erase(name); }
void RegisterScion(ConstStringZ name, IScionFactory* factory) { Factories<IScionFactory>::Get()[name] = factory; }
void UnregisterScion(ConstStringZ name) { Factories<IScionFactory>::Get().erase(name); }

template <typename Factory>
Factory& FactoryOf(ConstStringZ name) {
  auto const& factories = Factories<Factory>::Get();
  const auto at = factories.find(name);
  if (at == factories.end()) throw RemoteError("no remote interface of this name: " + std::string(name));
  return *static_cast<Factory*>(at->second);
}
template IStubFactory& FactoryOf<IStubFactory>(ConstStringZ);
template ISkeletonFactory& FactoryOf<ISkeletonFactory>(ConstStringZ);
template IScionFactory& FactoryOf<IScionFactory>(ConstStringZ);

struct Server::Exported {
  std::shared_ptr<Dispatcher> m_dispatcher;  // an object may be taken back by its own method
  void* m_self = nullptr;                    // as its thunks see it
  ConstStringZ m_interface = nullptr;
  ReflectedInterface const* m_record = nullptr;  // null where that is not registered
};
struct Server::Objects : std::map<uint32, Exported> {};

Server::Server(Channel& channel) : m_channel(channel), m_objects(new Objects) {}
Server::~Server() { delete m_objects; }

uint32 Server::ExportSkeleton(ConstStringZ name, AnyInterface object) {
  if (!name) throw RemoteError("null cannot be exported");
  Skeleton* skeleton = FactoryOf<ISkeletonFactory>(name).CreateSkeleton();
  return Add({std::shared_ptr<Dispatcher>(skeleton), skeleton}, name, object);
}
uint32 Server::ExportScion(ConstStringZ name, AnyInterface object) {
  if (!name) throw RemoteError("null cannot be exported");
  Scion* scion = FactoryOf<IScionFactory>(name).CreateScion();
  return Add({std::shared_ptr<Dispatcher>(scion), scion}, name, object);
}
uint32 Server::Add(Exported exported, ConstStringZ name, AnyInterface object) {
  exported.m_dispatcher->SetDelegate(object);
  exported.m_interface = name;
  ReflectedInterface const* const record = Find<ReflectedInterface>(name);
  if (record && record->m_numMethods == exported.m_dispatcher->CountMethods()) exported.m_record = record;
  (*m_objects)[++m_lastNumber] = std::move(exported);
  return m_lastNumber;
}
bool Server::Unexport(uint32 number) { return m_objects->erase(number) > 0; }

void Server::AddToken(xstring token, xstring name) {
  if (token.size() < 16) throw RemoteError("a token has at least 16 bytes");
  if (name.empty()) throw RemoteError("a token needs a name");
  m_tokens.emplace_back(std::move(token), std::move(name));
}

Peer const& Server::GetPeer() const {
  if (m_peer.m_kind == PK_UNKNOWN) {
    Peer peer = m_channel.GetPeer();
    peer.m_token = m_peer.m_token;
    m_peer = std::move(peer);
  }
  return m_peer;
}

// All tokens are compared, whichever it is.
void Server::CheckToken(uint32 object, uint32 method, InputArchive& ar) {
  if (object != kTokenObject || method != 0) throw RemoteError("the server asks for a token first");
  xstring given;
  ar >> given;
  if (ar.Remaining() > 0) throw RemoteError("bytes behind the token");
  xstring found;
  for (auto const& [token, name] : m_tokens) {
    if (IsEqualInConstantTime(given, token)) found = name;
  }
  if (found.empty()) throw RemoteError("not a token of the server");
  m_peer.m_token = found;
}

void Server::CheckAuthorized(Exported const& exported, uint32 method) const {
  if (!m_authorize) return;
  const std::string name = exported.m_record ? exported.m_record->m_methods[method].m_name : std::to_string(method);
  Peer const& peer = GetPeer();
  if (m_authorize(exported.m_interface, name.c_str(), peer)) return;
  throw RemoteError(PeerText(peer) + " may not call " + exported.m_interface + "." + name);
}

void Server::OnError(ErrorFunction function) { m_onError = std::move(function); }

bool Server::ServeWithin(std::chrono::milliseconds time) {
  try {
    xvector<octet_t> message;
    bool has = time.count() > 0 ? m_channel.ReceiveWithin(message, time) : m_channel.Receive(message);
    while (has && Dispatch(std::move(message)) != EServed::NotAnswered) has = m_channel.ReceiveArrived(message);
  } catch (std::exception const& error) {
    Report(error.what());
  }
  return m_channel.IsOpen();
}

EServed Server::ServeNext() {
  try {
    xvector<octet_t> message;
    return m_channel.ReceiveArrived(message) ? Dispatch(std::move(message)) : EServed::Nothing;
  } catch (std::exception const& error) {
    Report(error.what());
    return EServed::NotAnswered;
  }
}

// Throws nothing.
EServed Server::Dispatch(xvector<octet_t> message) {
  Call call;
  Archive results;
  try {
    results = Carry(std::move(message), call);
  } catch (std::exception const& error) {
    return AnswerError(call, error.what());
  } catch (...) {
    return AnswerError(call, "remote method failed");
  }
  if (!call.m_answer) return EServed::Carried;
  try {
    SendValues(call.m_answer, results);
    return EServed::Carried;
  } catch (ChannelClosed const& error) {
    Report(error.what());
    return EServed::NotAnswered;
  } catch (std::exception const& error) {
    return AnswerError(call, error.what());
  }
}

Archive Server::Carry(xvector<octet_t> message, Call& call) {
  const std::size_t size = message.size();
  InputArchive ar(std::move(message));
  uint32 object, method, answer;
  DeserialiseVariableLengthUint(ar, object);
  DeserialiseVariableLengthUint(ar, method);
  DeserialiseVariableLengthUint(ar, answer);
  call.m_answer = answer;
  CheckMessageSize(size, m_messageLimit);
  if (WaitsForToken() || (object == kTokenObject && !m_tokens.empty())) {
    call.m_served = EServed::NoToken;
    CheckToken(object, method, ar);
    call.m_served = EServed::Carried;
    return Archive();
  }
  const auto at = m_objects->find(object);
  if (at == m_objects->end()) throw RemoteError("no such remote object");
  const Exported exported = at->second;
  exported.m_dispatcher->CheckMethod(method);
  CheckAuthorized(exported, method);
  call.m_served = EServed::Carried;
  return exported.m_dispatcher->Call(exported.m_self, method, std::move(ar));
}

void Server::SendValues(uint32 answer, Archive const& results) {
  Archive reply;
  SerialiseVariableLengthUint(reply, answer);
  reply << octet_t(AN_VALUES);
  reply.Write(results.m_bytes.data(), results.m_bytes.size());
  CheckMessageSize(reply.m_bytes.size(), m_messageLimit);
  m_channel.Send(reply.m_bytes);
}

// So much of the text as the limit leaves room for.
void Server::SendError(uint32 answer, std::string_view text) {
  Archive reply;
  SerialiseVariableLengthUint(reply, answer);
  reply << octet_t(AN_ERROR);
  const std::size_t head = reply.m_bytes.size() + 5;  // with the text's length
  std::size_t size = std::min(text.size(), m_messageLimit > head ? m_messageLimit - head : 0);
  while (size > 0 && size < text.size() && (text[size] & 0xC0) == 0x80) --size;  // within a character of UTF-8
  reply << xstring(std::string(text.substr(0, size)));
  m_channel.Send(reply.m_bytes);
}

// Throws nothing. Where the text cannot be sent (the channel's limit may be a smaller one), that there was an error is.
EServed Server::AnswerError(Call const& call, ConstStringZ text) {
  Report(text);
  if (!call.m_answer) return call.m_served;
  for (std::string_view part : {std::string_view(text), std::string_view()}) {
    try {
      SendError(call.m_answer, part);
      return call.m_served;
    } catch (std::exception const& error) {
      Report(error.what());
    }
  }
  return EServed::NotAnswered;
}

// Throws nothing: nobody is there for what the function throws.
void Server::Report(ConstStringZ text) const {
  try {
    if (m_onError) m_onError(text);
  } catch (...) {
  }
}

}  // namespace vesk
