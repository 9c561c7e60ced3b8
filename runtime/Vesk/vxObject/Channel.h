// What carries the messages of remote calls between two sides: an interface for transports, the queue within a process,
// and the errors of calls. SocketChannel.h and those beside it carry them between processes.

@import "Vesk/vxObject/Containers.h"

#include <chrono>
#include <stdexcept>

namespace vesk {

// What is wrong with a call or a message.
class RemoteError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

// No answer in time. The call may have been carried out; an answer that comes later is dropped.
class RemoteTimeout : public RemoteError {
 public:
  using RemoteError::RemoteError;
};

// The other side is gone.
class ChannelClosed : public RemoteError {
 public:
  using RemoteError::RemoteError;
};

// The message that comes next was too long to be kept: it is gone but for its first bytes, which say whose it was.
class MessageTooLong : public RemoteError {
 public:
  MessageTooLong(std::size_t size, std::size_t limit, xvector<octet_t> head);
  xvector<octet_t> const& Head() const { return m_head; }
  static constexpr std::size_t HeadBytes = 5;  // an answer's number takes no more

 private:
  xvector<octet_t> m_head;
};

enum EPeerKind {
  PK_UNKNOWN,
  PK_THREAD,  // LocalChannel
  PK_TCP,
  PK_LOCAL,  // a Unix socket
  PK_TLS,
};

// Who is on the other side of a channel, as far as that has been proved; what has not is empty, or -1.
struct Peer {
  EPeerKind m_kind = PK_UNKNOWN;
  xstring m_address;     // of TCP and TLS, "127.0.0.1:4711"; it proves nothing
  int64 m_user = -1;     // of a Unix socket: the number of the user
  int64 m_process = -1;  // of a Unix socket: that which connected or listened; it may have ended since
  xstring m_subject;     // of TLS: that of the certificate, "CN=ada,O=Example"
  xstring m_token;       // the name of the token that was given
};

// As in "CN=ada at 127.0.0.1:4711".
xstring PeerText(Peer const& peer);

// Takes the same time wherever the two differ: it depends on the length of what was given alone.
bool IsEqualInConstantTime(std::string_view given, std::string_view secret);

// Carries whole messages, in order. Send and the Receives throw RemoteError where the transport fails.
class Channel {
 public:
  virtual ~Channel() {}
  virtual void Send(xvector<octet_t> const& message) = 0;
  // False when nothing waits.
  virtual bool Receive(xvector<octet_t>& message) = 0;
  // Waits up to `time` for a message where the channel can wait. False when none came.
  virtual bool ReceiveWithin(xvector<octet_t>& message, std::chrono::milliseconds) { return Receive(message); }
  // The same of what has come already: who sends faster than it is received does not keep the receiver.
  virtual bool ReceiveArrived(xvector<octet_t>& message) { return Receive(message); }
  // Whether messages can still come or go.
  virtual bool IsOpen() const { return true; }
  // False where the other side works in this thread only, and cannot while a call waits here.
  virtual bool CanAnswer() const { return true; }
  virtual Peer GetPeer() const { return Peer(); }
};

// Two ends of a queue in each direction, for one thread.
class LocalChannel {
 public:
  LocalChannel();
  ~LocalChannel();
  LocalChannel(LocalChannel const&) = delete;
  void operator=(LocalChannel const&) = delete;
  Channel& Client();
  Channel& Server();

 private:
  struct Ends;
  Ends* m_ends;
};

// The largest message that either side sends or reads, unless told otherwise.
constexpr std::size_t kMessageLimit = std::size_t(64) << 20;

// RemoteError for a message that is too long.
void CheckMessageSize(std::size_t size, std::size_t limit);
xstring TooLongText(std::size_t size, std::size_t limit);

// So long from now. Any time may be given; what is over a century is one.
std::chrono::steady_clock::time_point EndOf(std::chrono::milliseconds time);

}  // namespace vesk
