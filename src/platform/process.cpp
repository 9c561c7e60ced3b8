#include "platform/process.h"

#include <algorithm>
#include <array>
#include <cstdio>
#include <utility>

#include "platform/system.h"

namespace qrex::platform {

// --- Captured text

void CapturedText::Append(std::string_view bytes) {
  if (!m_spilled && m_text.size() + bytes.size() > kCapturedInMemory) {
    m_spilled = OpenTemporary();
    m_isWhole = m_spilled != nullptr;
  }
  if (!m_isWhole) return;
  if (!m_spilled) {
    m_text += bytes;
  } else if (std::fwrite(bytes.data(), 1, bytes.size(), m_spilled.get()) != bytes.size()) {
    m_isWhole = false;
  }
}

std::optional<std::string> CapturedText::Take() {
  if (m_spilled) {
    if (std::fflush(m_spilled.get()) != 0) m_isWhole = false;
    std::rewind(m_spilled.get());
    std::array<char, 65536> block;
    while (const size_t size = std::fread(block.data(), 1, block.size(), m_spilled.get())) {
      m_text.append(block.data(), size);
    }
    m_isWhole = m_isWhole && !std::ferror(m_spilled.get());
    m_spilled.reset();
  }
  if (!m_isWhole) return std::nullopt;
  return TextOfTool(std::exchange(m_text, {}));
}

// --- Processes

std::optional<Processes::Ended> Processes::WaitForAny(int milliseconds) {
  const uint64_t begin = PerformanceCounter();
  while (m_ended.empty() && RunningCount() > 0) {
    if (milliseconds < 0) {
      ReadAndReap(kForever);
      continue;
    }
    const int64_t passed = static_cast<int64_t>((PerformanceCounter() - begin) / (PerformanceFrequency() / 1000));
    const int left = static_cast<int>(std::max<int64_t>(0, milliseconds - passed));
    ReadAndReap(left);
    if (left == 0) break;
  }
  if (m_ended.empty()) return std::nullopt;
  Ended first = std::move(m_ended.front());
  m_ended.pop_front();
  return first;
}

Processes::Ended Processes::Run(const Program& program) {
  const Id id = Start(program);
  for (;;) {
    const auto found =
        std::find_if(m_ended.begin(), m_ended.end(), [id](const Ended& ended) { return ended.id == id; });
    if (found == m_ended.end()) {
      ReadAndReap(kForever);
      continue;
    }
    Ended ended = std::move(*found);
    m_ended.erase(found);
    return ended;
  }
}

}  // namespace qrex::platform
