// A program that talks with this one over its standard input and output, for as long as both like.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace qrex::platform {

class PeerProcess {
 public:
  // The program is found on PATH unless it is a path; what it prints as errors is dropped. IsStarted: it could be run.
  explicit PeerProcess(const std::vector<std::string>& words);
  ~PeerProcess();  // ends it
  PeerProcess(const PeerProcess&) = delete;
  PeerProcess& operator=(const PeerProcess&) = delete;

  bool IsStarted() const { return m_process != 0; }
  bool Write(std::string_view bytes);  // false: it is gone
  // Adds what it has written, waiting for it; false at the end. May wait in one thread while another writes.
  bool Read(std::string& bytes);
  void CloseStreams();  // ends a Read that waits

 private:
  // Numbers or handles of the system: the process, or a job; where it is read from and written to, which may be one.
  intptr_t m_process = 0;
  intptr_t m_reads = kNone, m_writes = kNone;
  static constexpr intptr_t kNone = -1;
};

}  // namespace qrex::platform
