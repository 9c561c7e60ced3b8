// Messages in a stream of bytes.

@import "Vesk/vxObject/MessageFrames.h"

#include <algorithm>
#include <new>

namespace vesk {

void MessageFrames::Write(xvector<octet_t> const& message, xvector<octet_t>& bytes) {
  for (std::size_t i = 0; i < LengthBytes; ++i) bytes.push_back(static_cast<octet_t>(message.size() >> 8 * i));
  bytes.insert(bytes.end(), message.begin(), message.end());
}

bool MessageFrames::Append(octet_t const* bytes, std::size_t size) {
  const std::size_t skipped = std::min(size, m_skip);
  m_skip -= skipped;
  try {
    if (m_begin > m_in.size() / 2) {  // what is moved is less than what has been read since
      m_in.erase(m_in.begin(), m_in.begin() + static_cast<ssize_t>(m_begin));
      m_begin = 0;
    }
    m_in.insert(m_in.end(), bytes + skipped, bytes + size);
  } catch (std::bad_alloc const&) {
    return false;
  }
  return Find();
}

// Whole messages in what came. Of one that is too long only the head stays.
bool MessageFrames::Find() {
  while (m_tooLong == 0 && m_in.size() - m_begin - m_framed >= LengthBytes) {
    const std::size_t at = m_begin + m_framed;
    const std::size_t length = LengthAt(at);
    const std::size_t came = m_in.size() - at - LengthBytes;
    if (length > m_limit) {
      const std::size_t head = std::min(length, MessageTooLong::HeadBytes);
      if (!m_keepsHeads) return false;
      if (came < head) break;
      m_tooLong = length;
      const std::size_t rest = std::min(came, length) - head;
      const auto behind = m_in.begin() + static_cast<ssize_t>(at + LengthBytes + head);
      m_in.erase(behind, behind + static_cast<ssize_t>(rest));
      m_skip = length - head - rest;
    } else {
      if (came < length) break;
      m_framed += LengthBytes + length;
    }
  }
  return true;
}

std::size_t MessageFrames::LengthAt(std::size_t at) const {
  std::size_t length = 0;
  for (std::size_t i = 0; i < LengthBytes; ++i) length |= static_cast<std::size_t>(m_in[at + i]) << 8 * i;
  return length;
}

bool MessageFrames::Take(xvector<octet_t>& message) {
  if (!HasMessage()) return false;
  const std::size_t tooLong = m_framed > 0 ? 0 : m_tooLong;
  const std::size_t length = tooLong > 0 ? std::min(tooLong, MessageTooLong::HeadBytes) : LengthAt(m_begin);
  octet_t const* const bytes = m_in.data() + m_begin + LengthBytes;
  message.assign(bytes, bytes + length);
  m_begin += LengthBytes + length;
  if (m_begin == m_in.size()) {
    m_in.clear();
    if (m_in.capacity() > KeptBytes) m_in = xvector<octet_t>();
    m_begin = 0;
  }
  if (tooLong == 0) {
    m_framed -= LengthBytes + length;
    return true;
  }
  m_tooLong = 0;
  Find();
  throw MessageTooLong(tooLong, m_limit, std::move(message));
}

void MessageFrames::Clear() {
  m_in.clear();
  m_begin = m_framed = m_tooLong = 0;
}

}  // namespace vesk
