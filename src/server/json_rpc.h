// Messages of JSON-RPC as the language server protocol frames them: a header that tells the length of the body.
#pragma once

#include <nlohmann/json.hpp>
#include <optional>
#include <string>
#include <string_view>

namespace qrex::server {

using Json = nlohmann::json;

std::string Framed(const Json& message);

// Takes bytes as they come. What is no frame is skipped up to the next header that tells a length, so that a fault of
// the other side costs its message alone.
class FrameReader {
 public:
  void Add(std::string_view bytes) { m_bytes.append(bytes); }
  std::optional<std::string> Next();  // the body of the next frame that is whole

 private:
  static constexpr size_t kMostHeader = 4096;
  static constexpr size_t kMostBody = size_t{1} << 28;
  std::optional<size_t> ReadHeader();  // the length of the body, which then begins at m_at
  std::string m_bytes;
  size_t m_at = 0;
  std::optional<size_t> m_body;  // its length, once the header is read
};

// Of an object, by a path such as "position/line"; null where a part of it is missing or of another kind.
const Json& At(const Json& json, std::string_view path);
std::string TextAt(const Json& json, std::string_view path);  // empty where there is none
int64_t NumberAt(const Json& json, std::string_view path, int64_t otherwise = 0);

}  // namespace qrex::server
