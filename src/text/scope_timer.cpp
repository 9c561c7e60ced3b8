#include "text/scope_timer.h"

#include <boost/multiprecision/cpp_int.hpp>
#include <cstdio>

#include "platform/system.h"

namespace qrex {

namespace {

// 100 ns ticks of a performance counter; the product needs more than 64 bits.
int64_t Ticks(uint64_t counter, uint64_t frequency) {
  const boost::multiprecision::uint128_t product = boost::multiprecision::uint128_t(counter) * 10000000u;
  return static_cast<int64_t>(product / frequency);
}

constexpr size_t kLabelWidth = 88;

}  // namespace

int64_t CurrentFileTime() {
  static const uint64_t frequency = platform::PerformanceFrequency();
  static const int64_t difference = platform::SystemFileTime() - Ticks(platform::PerformanceCounter(), frequency);
  return difference + Ticks(platform::PerformanceCounter(), frequency);
}

ScopeTimer::ScopeTimer(bool autoStop) : m_autoStop(autoStop), m_start(CurrentFileTime()) {}

ScopeTimer::~ScopeTimer() {
  if (m_autoStop) Stop(true);
  Flush();
}

void ScopeTimer::Stop(bool restart) {
  Flush();
  const int64_t now = CurrentFileTime();
  m_elapsed = now - m_start;
  m_pending = true;
  if (restart) m_start = now;
}

void ScopeTimer::Flush() {
  if (!m_pending) return;
  std::string label = m_label.TakeText();
  label.resize(kLabelWidth, '.');
  char milliseconds[32];
  std::snprintf(milliseconds, sizeof milliseconds, "%7.2f", static_cast<double>(m_elapsed) / 10000.0);
  TraceWriter() << label << " " << milliseconds << " ms\n";
  m_pending = false;
}

}  // namespace qrex
