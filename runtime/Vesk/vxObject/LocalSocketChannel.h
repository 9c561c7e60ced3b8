// Remote calls between processes of this machine over a Unix socket, as SocketChannel.h has them over TCP. Its file
// lets in its owner (and root) from the first moment, and both sides can ask whose process the other one is: GetPeer().
//
//   vesk::LocalSocketServer server(path, [&](vesk::Server& client) { client.Export(board); });
//   const auto channel = vesk::LocalSocketChannel::Connect(path);
//
// Beside the file is a lock, PATH.lock, which a server holds as long as it lives: of two that start at once, one has
// it. The socket that a killed server left is replaced by who has the lock; where one answers that has none, it is not.
// Keep both in a folder that others cannot write to, as that of XDG_RUNTIME_DIR. For Linux, which has SO_PEERCRED.

@import "Vesk/vxObject/StreamServer.h"

#include <fcntl.h>
#include <sys/file.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <unistd.h>

namespace vesk {

struct LocalSocketTransport : PlainTransport {
  typedef boost::asio::local::stream_protocol Protocol;
  typedef Protocol::socket Stream;

  static void SetUp(Stream&) {}
  static Peer PeerOf(Stream& socket) {
    Peer peer;
    peer.m_kind = PK_LOCAL;
    ucred who;
    socklen_t size = sizeof(who);
    if (getsockopt(socket.native_handle(), SOL_SOCKET, SO_PEERCRED, &who, &size) == 0) {
      peer.m_user = who.uid;
      peer.m_process = who.pid;
    }
    return peer;
  }
  static bool IsAt(Protocol::endpoint const& server, Stream& socket) {
    boost::system::error_code error;
    return socket.remote_endpoint(error) == server && !error && PeerOf(socket).m_process == getpid();
  }
};

// The lock of a server's path. It is removed at the end; who opened it before looks whether it is still there.
class LocalSocketLock {
 public:
  // RemoteError when another server has it.
  explicit LocalSocketLock(std::string const& path) : m_path(path + ".lock") {
    do {
      m_file = open(m_path.c_str(), O_RDWR | O_CREAT | O_CLOEXEC | O_NOFOLLOW, 0600);
      if (m_file < 0) throw RemoteError("cannot open " + m_path + ": " + std::generic_category().message(errno));
      if (flock(m_file, LOCK_EX | LOCK_NB) != 0) {
        close(m_file);
        throw RemoteError("another server listens on " + path);
      }
    } while (!IsThere() && close(m_file) == 0);
  }
  ~LocalSocketLock() {
    unlink(m_path.c_str());
    flock(m_file, LOCK_UN);  // a child process may have the file, too
    close(m_file);
  }
  LocalSocketLock(LocalSocketLock const&) = delete;
  void operator=(LocalSocketLock const&) = delete;

 private:
  bool IsThere() const {
    struct stat opened, there;
    return fstat(m_file, &opened) == 0 && stat(m_path.c_str(), &there) == 0 && opened.st_ino == there.st_ino &&
           opened.st_dev == there.st_dev;
  }

  std::string m_path;
  int m_file;
};

class LocalSocketChannel : public StreamChannel<LocalSocketTransport> {
 public:
  using StreamChannel::StreamChannel;

  // RemoteError when nobody listens there.
  static std::unique_ptr<LocalSocketChannel> Connect(std::string const& path) {
    const auto io = std::make_shared<boost::asio::io_context>();
    Stream socket(*io);
    try {
      socket.connect(path);
    } catch (boost::system::system_error const& error) {
      throw RemoteError("cannot connect to " + path + ": " + error.code().message());
    }
    return std::make_unique<LocalSocketChannel>(io, std::move(socket), true);
  }
};

class LocalSocketServer : public StreamServer<LocalSocketTransport> {
 public:
  // RemoteError when another server listens there, or the path cannot be had, or is not that of a socket.
  LocalSocketServer(std::string const& path, ConnectFunction connect)
      : StreamServer(std::move(connect)), m_path(path), m_lock(path) {
    RemoveStale();
    // The file gets the mode of the socket, so that there is no moment in which others could connect.
    Listen(Place(path), path, [](auto& acceptor) {
      if (fchmod(acceptor.native_handle(), 0600) != 0) throw RemoteError("cannot set the mode of the socket");
    });
    lstat(path.c_str(), &m_file);
    if ((m_file.st_mode & 0777) != 0600) chmod(path.c_str(), 0600);
  }
  ~LocalSocketServer() {
    struct stat there;
    if (lstat(m_path.c_str(), &there) != 0) return;
    if (there.st_ino == m_file.st_ino && there.st_dev == m_file.st_dev) unlink(m_path.c_str());
  }
  std::string const& Path() const { return m_path; }

 private:
  // Nobody with a lock listens. A server without one is asked for.
  void RemoveStale() const {
    struct stat there;
    if (lstat(m_path.c_str(), &there) != 0) return;
    if (!S_ISSOCK(there.st_mode)) throw RemoteError("cannot listen on " + m_path + ": it is not a socket");
    boost::asio::io_context io;
    LocalSocketTransport::Stream probe(io, Protocol());
    probe.non_blocking(true);  // one that is too busy to take it must not hold us up
    const Protocol::endpoint place = Place(m_path);
    if (::connect(probe.native_handle(), place.data(), static_cast<socklen_t>(place.size())) == 0 || errno == EAGAIN) {
      throw RemoteError("another server listens on " + m_path);
    }
    if (unlink(m_path.c_str()) == 0) return;
    throw RemoteError("cannot remove " + m_path + ": " + std::generic_category().message(errno));
  }

  static Protocol::endpoint Place(std::string const& path) {
    try {
      return path;
    } catch (boost::system::system_error const& error) {
      throw RemoteError("cannot listen on " + path + ": " + error.code().message());
    }
  }

  std::string m_path;
  LocalSocketLock m_lock;  // given back when the socket's file is gone
  struct stat m_file = {};
};

}  // namespace vesk
