#include "server/json_rpc.h"

#include <charconv>

namespace qrex::server {

namespace {

constexpr std::string_view kLength = "Content-Length:";
constexpr std::string_view kHeaderEnd = "\r\n\r\n";

std::optional<size_t> LengthIn(std::string_view header) {
  const size_t begin = header.find(kLength);
  if (begin == std::string_view::npos) return std::nullopt;
  const char* at = header.data() + begin + kLength.size();
  const char* const end = header.data() + header.size();
  while (at < end && *at == ' ') ++at;
  size_t length = 0;
  if (std::from_chars(at, end, length).ec != std::errc()) return std::nullopt;
  return length;
}

}  // namespace

std::string Framed(const Json& message) {
  const std::string body = message.dump(-1, ' ', false, Json::error_handler_t::replace);
  return std::string(kLength) + " " + std::to_string(body.size()) + std::string(kHeaderEnd) + body;
}

std::optional<size_t> FrameReader::ReadHeader() {
  for (;;) {
    const size_t end = m_bytes.find(kHeaderEnd, m_at);
    if (end == std::string::npos) {
      if (m_bytes.size() - m_at > kMostHeader) m_at = m_bytes.size() - kLength.size();  // a part of it may stand there
      return std::nullopt;
    }
    const auto length = LengthIn(std::string_view(m_bytes).substr(m_at, end - m_at));
    m_at = end + kHeaderEnd.size();
    if (length && *length <= kMostBody) return length;
  }
}

std::optional<std::string> FrameReader::Next() {
  if (!m_body) m_body = ReadHeader();
  if (!m_body || m_bytes.size() - m_at < *m_body) {
    m_bytes.erase(0, m_at);
    m_at = 0;
    return std::nullopt;
  }
  std::string body = m_bytes.substr(m_at, *m_body);
  m_at += *m_body;
  m_body.reset();
  return body;
}

const Json& At(const Json& json, std::string_view path) {
  static const Json kNone;
  const Json* at = &json;
  while (!path.empty()) {
    const size_t slash = std::min(path.find('/'), path.size());
    if (!at->is_object()) return kNone;
    const auto found = at->find(std::string(path.substr(0, slash)));
    if (found == at->end()) return kNone;
    at = &*found;
    path.remove_prefix(std::min(slash + 1, path.size()));
  }
  return *at;
}

std::string TextAt(const Json& json, std::string_view path) {
  const Json& found = At(json, path);
  return found.is_string() ? found.get<std::string>() : std::string();
}

int64_t NumberAt(const Json& json, std::string_view path, int64_t otherwise) {
  const Json& found = At(json, path);
  return found.is_number_integer() ? found.get<int64_t>() : otherwise;
}

}  // namespace qrex::server
