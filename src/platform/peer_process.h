// A program that talks with this one over its standard input and output, for as long as both like. Not on Windows.
#pragma once

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

  bool IsStarted() const { return m_id > 0; }
  bool Write(std::string_view bytes);  // false: it is gone
  // Adds what it has written, waiting for it; false at the end. May wait in one thread while another writes.
  bool Read(std::string& bytes);
  void CloseStreams();  // ends a Read that waits

 private:
  int m_id = 0;
  int m_socket = -1;
};

}  // namespace qrex::platform
