// What carries the messages of remote calls between two sides: an interface for transports, the queue within a process,
// and the errors of calls. SocketChannel.h carries them between processes.

@import "Vesk/vxObject/Containers.h"

#include <chrono>
#include <deque>
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

// Carries whole messages, in order. Send and the two Receives throw RemoteError where the transport fails.
class Channel {
 public:
  virtual ~Channel() {}
  virtual void Send(xvector<octet_t> const& message) = 0;
  // False when nothing waits.
  virtual bool Receive(xvector<octet_t>& message) = 0;
  // Waits up to `time` for a message where the channel can wait. False when none came.
  virtual bool ReceiveWithin(xvector<octet_t>& message, std::chrono::milliseconds) { return Receive(message); }
  // Whether messages can still come or go.
  virtual bool IsOpen() const { return true; }
};

// Two ends of a queue in each direction, for one thread.
class LocalChannel {
 public:
  LocalChannel();
  ~LocalChannel();
  Channel& Client() { return m_ends[0]; }
  Channel& Server() { return m_ends[1]; }

 private:
  typedef std::deque<xvector<octet_t>> Queue;
  class End : public Channel {
   public:
    End(Queue& out, Queue& in) : m_out(out), m_in(in) {}
    void Send(xvector<octet_t> const& message) override;
    bool Receive(xvector<octet_t>& message) override;

   private:
    Queue& m_out;
    Queue& m_in;
  };
  Queue m_queues[2];
  End m_ends[2];
};

// The largest message that either side sends or reads, unless told otherwise.
constexpr std::size_t kMessageLimit = std::size_t(64) << 20;

// RemoteError for a message that is too long.
void CheckMessageSize(std::size_t size, std::size_t limit);

}  // namespace vesk
