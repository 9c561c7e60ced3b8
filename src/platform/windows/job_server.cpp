#include "platform/job_server.h"

#include "platform/windows/api.h"

namespace qrex::platform {

namespace {

// Its tokens are all alike.
class Semaphore : public TokenPool {
 public:
  explicit Semaphore(Handle semaphore) : m_semaphore(std::move(semaphore)) {}
  bool TryTake(char& token) override {
    token = '+';
    return WaitForSingleObject(m_semaphore.Get(), 0) == WAIT_OBJECT_0;
  }
  void Give(char) override { ReleaseSemaphore(m_semaphore.Get(), 1, nullptr); }

 private:
  Handle m_semaphore;
};

}  // namespace

std::unique_ptr<TokenPool> TokenPool::Open(std::string_view name) {
  if (name.empty()) return nullptr;
  Handle semaphore(OpenSemaphoreW(SYNCHRONIZE | SEMAPHORE_MODIFY_STATE, FALSE, Wide(name).c_str()));
  return semaphore ? std::make_unique<Semaphore>(std::move(semaphore)) : nullptr;
}

}  // namespace qrex::platform
