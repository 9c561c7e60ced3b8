// What every channel over a stream of bytes shares: each message is its length in four bytes, little-endian, and its
// bytes. SocketChannel.h has TCP, LocalSocketChannel.h Unix sockets, TlsChannel.h TLS; StreamServer.h what serves them.
// It needs Boost.Asio (Debian's libboost-dev, headers alone).
//
// Messages that wait are kept as the bytes that came, so that the other side's take no memory beyond the limit: one
// that sends faster than it is served waits. A read is begun just before its end is waited for, not as soon as the one
// before it is done: so the system is asked for what cannot have come while the other side works, not while it waits.

@import "Vesk/vxObject/MessageFrames.h"
@import "Vesk/vxObject/Remote.h"

#include <boost/asio.hpp>
#ifndef _WIN32
#include <poll.h>
#endif

namespace vesk {

// What is at the end of a channel's stream. A transport has
//   Protocol, Stream, Context        of Asio; what its streams are made from
//   kHandshakes                      whether they begin with async_handshake
//   kIsSocket                        whether the stream is a socket, that can be read and written without waiting
//   Stream Make(socket, context)
//   void SetUp(Stream&)
//   Peer PeerOf(Stream&)
//   void BeginEnd(Stream&, handler)  tells the other side that no more comes, as far as that goes without waiting
//   bool IsAt(endpoint, Stream&)     whether a server that listens at the endpoint is the other side
//   string TextOf(error, Stream&)    what became of a handshake
struct PlainTransport {
  struct Context {};
  static constexpr bool kHandshakes = false;
  static constexpr bool kIsSocket = true;
  template <typename Stream>
  static Stream Make(Stream socket, Context&) {
    return socket;
  }
  template <typename Stream, typename Handler>
  static void BeginEnd(Stream&, Handler&&) {}
};

// A server at work in this thread, and those around it.
template <typename Protocol>
struct ServingHere {
  typename Protocol::endpoint m_endpoint;
  ServingHere const* m_outer;
};
template <typename Protocol>
inline thread_local ServingHere<Protocol> const* t_servingHere = nullptr;

// One end of a stream. It lives as long as an operation is under way. One that lacks memory to go on closes it.
template <typename Transport>
class StreamEnd : public std::enable_shared_from_this<StreamEnd<Transport>> {
 public:
  typedef typename Transport::Stream Stream;
  StreamEnd(Stream stream, bool waits) : m_stream(std::move(stream)), m_waits(waits), m_frames(waits) {
    boost::system::error_code ignored;
    if (Transport::kIsSocket) Socket().non_blocking(true, ignored);
    Transport::SetUp(m_stream);
  }

  Stream& Get() { return m_stream; }
  auto& Socket() { return m_stream.lowest_layer(); }
  void Close() {
    boost::system::error_code ignored;
    if (!Socket().is_open()) return;
    if (!m_isHandshaking && !m_hasFailed && !IsSending()) {
      try {
        Transport::BeginEnd(m_stream, [self = this->shared_from_this()](boost::system::error_code const&) {});
      } catch (std::exception const&) {
      }
    }
    Socket().close(ignored);
  }
  void Drop() {
    m_hasFailed = true;
    Close();
    m_frames.Clear();
    m_out.clear();
  }
  // Takes no more messages; what is to be sent still is.
  void Finish() {
    m_hasEnded = true;
    m_frames.Clear();
  }

  bool IsOpen() const { return m_stream.lowest_layer().is_open(); }
  bool CanRead() const { return IsOpen() && !m_hasEnded; }
  bool HasEnded() const { return !CanRead(); }
  bool HasMessage() const { return m_frames.HasMessage(); }
  bool IsSending() const { return m_written < m_writing.size() || !m_out.empty(); }
  bool IsHandshaking() const { return m_isHandshaking; }
  bool IsReading() const { return m_isReading; }
  bool Waits() const { return m_waits; }
  std::size_t Limit() const { return m_frames.Limit(); }
  std::size_t Unsent() const { return m_out.size(); }
  // What went wrong with the handshake, or behind it; empty when nothing did.
  std::string const& Failure() const { return m_failure; }
  void SetLimit(std::size_t bytes) {
    if (!m_frames.SetLimit(bytes)) Close();
  }
  bool Take(xvector<octet_t>& message) { return m_frames.Take(message); }

  template <typename Side>
  void StartHandshake(Side side) {
    m_isHandshaking = true;
    Begin([&](auto handler) { m_stream.async_handshake(side, std::move(handler)); },
          [](StreamEnd& self, boost::system::error_code const& error, std::size_t) {
            self.m_isHandshaking = false;
            if (error) self.Fail(error);
          });
  }
  // Nothing is read while as much waits as one message may take: there is a whole one then.
  void StartRead() {
    if (m_isReading || m_isHandshaking || !CanRead() || m_frames.IsFull()) return;
    m_isReading = true;
    Begin([this](auto handler) { m_stream.async_read_some(boost::asio::buffer(m_buffer), std::move(handler)); },
          [](StreamEnd& self, boost::system::error_code const& error, std::size_t size) {
            self.m_isReading = false;
            self.EndRead(error, size);
          });
  }
#ifndef _WIN32
  // Whether the other side can be waited for by ReadUntil, which asks the system for nothing else, and so for less.
  bool CanReadAlone() const { return Transport::kIsSocket && m_waits && !m_isReading && CanRead() && !IsSending(); }
  // False when the time is over.
  bool ReadUntil(std::chrono::steady_clock::time_point end) {
    pollfd waiting = {Socket().native_handle(), POLLIN, 0};
    const auto left = std::chrono::ceil<std::chrono::milliseconds>(end - std::chrono::steady_clock::now());
    if (poll(&waiting, 1, static_cast<int>(std::clamp<long long>(left.count(), 0, 1000))) <= 0) {
      return std::chrono::steady_clock::now() < end;
    }
    boost::system::error_code error;
    const std::size_t size = m_stream.read_some(boost::asio::buffer(m_buffer), error);
    if (error != boost::asio::error::would_block) EndRead(error, size);
    return true;
  }
#endif
  // ChannelClosed where the other side does not read what it is sent.
  void Queue(xvector<octet_t> const& message) {
    const std::size_t size = m_out.size() + MessageFrames::LengthBytes + message.size();
    if (size + m_writing.size() > 2 * (Limit() + MessageFrames::LengthBytes)) CloseUnread();
    if (size > m_out.capacity()) m_out.reserve(std::max(size, 2 * m_out.capacity()));
    MessageFrames::Write(message, m_out);
    if (m_writing.empty()) StartWrite();
  }
  [[noreturn]] void CloseUnread() {
    Close();
    throw ChannelClosed("the other side does not read");
  }

  // Answers may wait so long, in bytes, until the next message is served.
  static constexpr std::size_t kMostUnread = 65536;

 private:
  typedef void (*EndFunction)(StreamEnd&, boost::system::error_code const&, std::size_t);

  // What is called when an operation ends. Where that is given up in the middle, for want of memory, it fails.
  class Operation {
   public:
    Operation(std::shared_ptr<StreamEnd> self, EndFunction end) : m_self(std::move(self)), m_end(end) {}
    Operation(Operation&&) = default;
    ~Operation() {
      if (m_self) m_end(*m_self, boost::asio::error::no_memory, 0);
    }
    void operator()(boost::system::error_code const& error, std::size_t size = 0) {
      const auto self = std::move(m_self);
      m_end(*self, error, size);
    }

   private:
    std::shared_ptr<StreamEnd> m_self;
    EndFunction m_end;
  };

  template <typename Start>
  void Begin(Start start, EndFunction end) {
    try {
      start(Operation(this->shared_from_this(), end));
    } catch (std::exception const&) {  // the operation has ended
    }
  }
  void EndRead(boost::system::error_code const& error, std::size_t size) {
    if (m_hasEnded) return;
    if (error == boost::asio::error::eof && !m_waits) {
      m_hasEnded = true;
    } else if (error) {
      Fail(error);
    } else if (!m_frames.Append(m_buffer, size)) {
      Close();
    } else if (!HasMessage() || size == sizeof(m_buffer)) {
      if (!m_waits) StartRead();
    }
  }
  void StartWrite() {
    if (m_writing.empty()) m_writing.swap(m_out);
    if (Transport::kIsSocket && !WriteAtOnce()) return;
    Begin([this](auto handler) { m_stream.async_write_some(ToWrite(), std::move(handler)); },
          [](StreamEnd& self, boost::system::error_code const& error, std::size_t size) {
            if (error) return self.Fail(error);
            self.Written(size);
            if (self.IsSending()) self.StartWrite();
          });
  }
  // Whether there is something left to write.
  bool WriteAtOnce() {
    boost::system::error_code error;
    const std::size_t size = m_stream.write_some(ToWrite(), error);
    if (error && error != boost::asio::error::would_block) {
      Fail(error);
      return false;
    }
    Written(size);
    return IsSending();
  }
  boost::asio::const_buffer ToWrite() const { return {m_writing.data() + m_written, m_writing.size() - m_written}; }
  void Written(std::size_t size) {
    m_written += size;
    if (m_written < m_writing.size()) return;
    m_writing.clear();
    if (m_writing.capacity() > kMostUnread) m_writing.shrink_to_fit();
    m_written = 0;
  }
  // What a caller got already is still good; of who calls no more nothing is.
  void Fail(boost::system::error_code const& error) {
    if constexpr (Transport::kHandshakes) {
      const bool isFirst = !m_hasFailed && error != boost::asio::error::operation_aborted;
      if (isFirst) m_failure = Transport::TextOf(error, m_stream);
    }
    m_hasFailed = true;
    m_waits ? Close() : Drop();
  }

  Stream m_stream;
  const bool m_waits;
  MessageFrames m_frames;
  octet_t m_buffer[16384];
  xvector<octet_t> m_out, m_writing;
  std::size_t m_written = 0;  // of m_writing
  std::string m_failure;
  bool m_isHandshaking = false;
  bool m_isReading = false;
  bool m_hasEnded = false;  // the other side sends no more
  bool m_hasFailed = false;
};

template <typename Transport>
class StreamChannel : public Channel {
 public:
  typedef typename Transport::Stream Stream;
  typedef std::chrono::steady_clock Clock;

  // A connected stream. `waits`: of who calls, whose Send waits until the message is on its way. Otherwise of who is
  // called: that goes on during Receive, and while the other side, which has ended its sending, still reads.
  StreamChannel(std::shared_ptr<boost::asio::io_context> io, Stream stream, bool waits)
      : m_io(std::move(io)), m_end(std::make_shared<StreamEnd<Transport>>(std::move(stream), waits)) {}
  ~StreamChannel() override { Close(); }
  StreamChannel(StreamChannel const&) = delete;
  void operator=(StreamChannel const&) = delete;

  // Of a message, in bytes; of those that wait as well.
  void SetMessageLimit(std::size_t bytes) { m_end->SetLimit(bytes); }
  // How long Send waits.
  void SetTimeout(std::chrono::milliseconds timeout) { m_timeout = timeout; }
  void Close() { m_end->Close(); }
  // Closes, and drops what waits.
  void Drop() { m_end->Drop(); }

  // ChannelClosed when the other side is gone, or does not read what it is sent.
  void Send(xvector<octet_t> const& message) override {
    CheckMessageSize(message.size(), m_end->Limit());
    if (!m_end->IsOpen()) throw ChannelClosed("the other side is gone");
    m_end->Queue(message);
    if (m_end->Waits() && m_end->IsSending()) WaitUntilSent();
    if (!m_end->IsOpen() && m_end->IsSending()) throw ChannelClosed("the other side is gone");
  }
  bool Receive(xvector<octet_t>& message) override {
    m_end->StartRead();
    m_io->restart();
    m_io->poll();
    return m_end->Take(message);
  }
  bool ReceiveWithin(xvector<octet_t>& message, std::chrono::milliseconds time) override {
    const auto end = EndOf(time);
    while (!m_end->Take(message)) {
      if (!IsOpen() || !RunOneUntil(end)) return m_end->Take(message);
    }
    return true;
  }
  // None while answers wait that the other side does not read.
  bool ReceiveArrived(xvector<octet_t>& message) override { return CanServe() && m_end->Take(message); }
  // Messages that came before the other side went can still be received, and their answers sent if it still reads.
  bool IsOpen() const override {
    return m_end->CanRead() || m_end->HasMessage() || (m_end->IsOpen() && m_end->IsSending());
  }
  bool CanAnswer() const override {
    typedef typename Transport::Protocol Protocol;
    if (!m_end->Waits()) return true;
    for (ServingHere<Protocol> const* server = t_servingHere<Protocol>; server; server = server->m_outer) {
      if (Transport::IsAt(server->m_endpoint, m_end->Get())) return false;
    }
    return true;
  }
  Peer GetPeer() const override { return Transport::PeerOf(m_end->Get()); }

  // --- Of who serves many
  bool CanServe() const { return m_end->HasMessage() && m_end->Unsent() < StreamEnd<Transport>::kMostUnread; }
  bool HasMessage() const { return m_end->HasMessage(); }
  // The other side sends no more.
  bool HasEnded() const { return m_end->HasEnded(); }
  // Whether the other side has proved by now who it is; why it could not.
  bool IsEntering() const { return m_end->IsHandshaking(); }
  std::string const& Failure() const { return m_end->Failure(); }
  bool IsReading() const { return m_end->IsReading(); }
  // Begins to read, where that is not under way.
  void Listen() { m_end->StartRead(); }
  // Closes when what waits is sent; takes no more messages.
  void Finish() { m_end->Finish(); }
  template <typename Side>
  void StartHandshake(Side side) {
    m_end->StartHandshake(side);
  }

 protected:
  // False when the time is over.
  bool RunOneUntil(Clock::time_point end) {
#ifndef _WIN32
    if (m_end->CanReadAlone()) return m_end->ReadUntil(end);
#endif
    m_end->StartRead();
    m_io->restart();
    return m_io->run_one_until(end) > 0;
  }

 private:
  void WaitUntilSent() {
    if (!CanAnswer()) {  // nobody reads meanwhile
      m_io->restart();
      m_io->poll();
    }
    const auto end = EndOf(m_timeout);
    while (m_end->IsSending() && m_end->IsOpen()) {
      if (!CanAnswer() || !RunOneUntil(end)) m_end->CloseUnread();
    }
  }

  std::shared_ptr<boost::asio::io_context> m_io;
  std::shared_ptr<StreamEnd<Transport>> m_end;
  std::chrono::milliseconds m_timeout = std::chrono::seconds(30);
};

}  // namespace vesk
