// The job server of a make that runs this program: a token for each program that may run beside the first one.
// MAKEFLAGS names it: a pipe, or on Windows a semaphore.
#pragma once

#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace qrex::platform {

// Where the tokens that nobody has are.
class TokenPool {
 public:
  static std::unique_ptr<TokenPool> Open(std::string_view name);  // as MAKEFLAGS has it; null: it leads to none
  virtual ~TokenPool() = default;
  virtual bool TryTake(char& token) = 0;  // at once or not at all
  virtual void Give(char token) = 0;      // each goes back as it came
};

class JobServer {
 public:
  // Null: no make runs this program, or it has kept its job server to itself.
  static std::unique_ptr<JobServer> FromEnvironment();
  ~JobServer() { KeepTokens(0); }
  JobServer(const JobServer&) = delete;
  JobServer& operator=(const JobServer&) = delete;

  bool TryTakeToken();  // at once or not at all
  size_t TokenCount() const { return m_tokens.size(); }
  void KeepTokens(size_t count);  // gives back those that are above it

 private:
  explicit JobServer(std::unique_ptr<TokenPool> pool) : m_pool(std::move(pool)) {}

  std::unique_ptr<TokenPool> m_pool;
  std::vector<char> m_tokens;
};

}  // namespace qrex::platform
