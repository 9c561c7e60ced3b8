// The job server of a make that runs this program: a pipe with a token for each program that may run beside the first
// one. MAKEFLAGS names it.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "platform/descriptor.h"

namespace qrex::platform {

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
  JobServer(Descriptor read, Descriptor write) : m_read(std::move(read)), m_write(std::move(write)) {}

  Descriptor m_read, m_write;
  std::vector<char> m_tokens;  // each goes back as it came
};

}  // namespace qrex::platform
