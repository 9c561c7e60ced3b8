#include "platform/job_server.h"

#include "platform/system.h"

namespace qrex::platform {

namespace {

// The last of the options counts: a make within a make adds its own.
std::string OptionOf(const std::string& flags) {
  std::string found;
  for (const std::string_view option : {"--jobserver-fds=", "--jobserver-auth="}) {
    const size_t at = flags.rfind(option);
    if (at == std::string::npos) continue;
    const size_t begin = at + option.size();
    found = flags.substr(begin, flags.find(' ', begin) - begin);
  }
  return found;
}

}  // namespace

std::unique_ptr<JobServer> JobServer::FromEnvironment() {
  std::unique_ptr<TokenPool> pool = TokenPool::Open(OptionOf(EnvironmentValue("MAKEFLAGS").value_or("")));
  return pool ? std::unique_ptr<JobServer>(new JobServer(std::move(pool))) : nullptr;
}

bool JobServer::TryTakeToken() {
  char token;
  if (!m_pool->TryTake(token)) return false;
  m_tokens.push_back(token);
  return true;
}

void JobServer::KeepTokens(size_t count) {
  while (m_tokens.size() > count) {
    const char token = m_tokens.back();
    m_tokens.pop_back();
    m_pool->Give(token);
  }
}

}  // namespace qrex::platform
