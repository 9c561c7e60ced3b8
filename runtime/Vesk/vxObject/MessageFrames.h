// The messages in a stream of bytes: each is its length in four bytes, little-endian, and its bytes.

@import "Vesk/vxObject/Channel.h"

namespace vesk {

class MessageFrames {
 public:
  static constexpr std::size_t LengthBytes = 4;

  // `keepsHeads`: of who calls, who keeps the head of a message that is too long.
  explicit MessageFrames(bool keepsHeads) : m_keepsHeads(keepsHeads) {}

  static void Write(xvector<octet_t> const& message, xvector<octet_t>& bytes);

  std::size_t Limit() const { return m_limit; }
  // Both are false for a message that is too long and cannot be told of; Append where memory runs out as well.
  bool SetLimit(std::size_t bytes) {
    m_limit = bytes;
    return Find();
  }
  bool Append(octet_t const* bytes, std::size_t size);

  bool HasMessage() const { return m_framed > 0 || m_tooLong > 0; }
  // As many bytes wait as one message may take.
  bool IsFull() const { return m_skip == 0 && m_in.size() - m_begin >= m_limit + LengthBytes; }
  // False when there is none. MessageTooLong for one of which the head was kept.
  bool Take(xvector<octet_t>& message);
  void Clear();

 private:
  static constexpr std::size_t KeptBytes = 1 << 16;  // of memory, while nothing waits

  bool Find();
  std::size_t LengthAt(std::size_t at) const;

  const bool m_keepsHeads;
  std::size_t m_limit = kMessageLimit;
  // From m_begin on whole messages, then perhaps the head of one that is too long, then a part of one.
  xvector<octet_t> m_in;
  std::size_t m_begin = 0;
  std::size_t m_framed = 0;   // of these bytes: the whole messages
  std::size_t m_tooLong = 0;  // how long the one behind them is, whose head stands there; 0 for none
  std::size_t m_skip = 0;     // so much of it is to come, and is dropped
};

}  // namespace vesk
