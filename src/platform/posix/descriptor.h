// A descriptor of an open file, pipe or socket, which closes it.
#pragma once

#include <unistd.h>

#include <utility>

namespace qrex::platform {

class Descriptor {
 public:
  Descriptor() = default;
  explicit Descriptor(int number) : m_number(number) {}
  Descriptor(Descriptor&& other) noexcept : m_number(std::exchange(other.m_number, -1)) {}
  Descriptor& operator=(Descriptor&& other) noexcept {
    std::swap(m_number, other.m_number);
    return *this;
  }
  ~Descriptor() { Close(); }

  int Number() const { return m_number; }
  bool IsOpen() const { return m_number >= 0; }
  void Close() {
    if (IsOpen()) close(std::exchange(m_number, -1));
  }

 private:
  int m_number = -1;
};

}  // namespace qrex::platform
