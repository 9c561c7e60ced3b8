// Loops over several threads, and the order of what they print.

#include "text/parallel.h"

#include <gtest/gtest.h>

#include <atomic>
#include <chrono>
#include <thread>

#include "text/exceptions.h"
#include "text/text_writer.h"
#include "text/trace.h"

namespace qrex {

class ParallelTest : public testing::Test, public TraceHook {
 protected:
  ParallelTest() { SetTraceHook(this); }
  ~ParallelTest() override { SetTraceHook(nullptr); }
  void OnTrace(std::string_view text) override { m_trace += text; }

  std::string m_trace;
};

// The earlier ones take longest, and each prints twice. They begin in order.
TEST_F(ParallelTest, OutputKeepsItsOrder) {
  constexpr size_t kCount = 20;
  std::string expected;
  for (size_t i = 0; i < kCount; ++i) expected += std::to_string(i) + "a " + std::to_string(i) + "b ";
  size_t begun = 0;
  std::atomic<size_t> calls = 0;
  auto begin = [&](size_t i) {
    EXPECT_EQ(begun++, i);
    TraceWriter() << i << "a ";
  };
  auto work = [&](size_t i) {
    std::this_thread::sleep_for(std::chrono::microseconds(200 * (kCount - i)));
    TraceWriter() << i << "b ";
    ++calls;
  };
  ForEachInParallel(kCount, begin, work);
  EXPECT_EQ(kCount, calls);
  EXPECT_EQ(expected, m_trace);
  TraceWriter() << "behind";
  EXPECT_EQ(expected + "behind", m_trace);
  ForEachInParallel(0, begin, work);
  EXPECT_EQ(kCount, calls);
}

TEST_F(ParallelTest, FirstFailureIsRaised) {
  std::atomic<size_t> calls = 0;
  try {
    auto begin = [](size_t i) { TraceWriter() << i << " "; };
    auto work = [&](size_t i) {
      ++calls;
      if (i >= 3) throw FileException(2, std::to_string(i));
    };
    ForEachInParallel(1000, begin, work);
    FAIL();
  } catch (const FileException& exception) {
    EXPECT_EQ("3", exception.path);
  }
  EXPECT_EQ("0 1 2 3 ", m_trace);
  EXPECT_LT(calls, 1000u);
}

// Trace log and console are two places; what one thread gave to both comes in its order, and each to its own.
TEST_F(ParallelTest, HeldOutput) {
  HeldOutput held;
  testing::internal::CaptureStdout();
  {
    HeldOutput::Scope hold(held);
    WriteToConsole("console\n");
    TraceWriter() << "trace\n";
    EXPECT_EQ("", m_trace);
  }
  EXPECT_EQ("", testing::internal::GetCapturedStdout());
  testing::internal::CaptureStdout();
  held.Write();
  EXPECT_EQ("console\n", testing::internal::GetCapturedStdout());
  EXPECT_EQ("trace\n", m_trace);
}

}  // namespace qrex
