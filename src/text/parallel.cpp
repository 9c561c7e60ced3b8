#include "text/parallel.h"

#include <algorithm>
#include <atomic>
#include <exception>
#include <future>
#include <mutex>
#include <thread>
#include <vector>

#include "text/trace.h"

namespace qrex {

namespace {

struct Item {
  HeldOutput output;
  std::exception_ptr failure;
  std::atomic<bool> isDone = false;
};

class ParallelLoop {
 public:
  ParallelLoop(size_t count, const IndexedWork& begin, const IndexedWork& work)
      : m_items(count), m_begin(begin), m_work(work) {}

  // False when there is no item left.
  bool RunNext() {
    std::unique_lock lock(m_lock);
    if (m_next == m_items.size() || m_hasFailed) return false;
    const size_t index = m_next++;
    Item& item = m_items[index];
    try {
      HeldOutput::Scope hold(item.output);
      m_begin(index);
      lock.unlock();
      m_work(index);
    } catch (...) {
      item.failure = std::current_exception();
      m_hasFailed = true;
    }
    item.isDone = true;
    return true;
  }

  // Of the items done so far, as long as none is missing before them. By one thread only.
  void WriteOutput() {
    for (; m_written < m_items.size() && m_items[m_written].isDone && !m_failure; ++m_written) {
      m_items[m_written].output.Write();
      m_failure = m_items[m_written].failure;
    }
  }

  void RaiseFailure() const {
    if (m_failure) std::rethrow_exception(m_failure);
  }

 private:
  std::vector<Item> m_items;
  const IndexedWork& m_begin;
  const IndexedWork& m_work;
  std::mutex m_lock;  // of m_next, and so of the order in which items begin
  size_t m_next = 0;
  std::atomic<bool> m_hasFailed = false;
  size_t m_written = 0;
  std::exception_ptr m_failure;
};

}  // namespace

size_t UsefulThreads(size_t work, size_t leastOfThread) {
  static const size_t kMost = std::max(1u, std::thread::hardware_concurrency());
  return std::clamp<size_t>(work / leastOfThread, 1, kMost);
}

void ForEachInParallel(size_t count, const IndexedWork& begin, const IndexedWork& work) {
  constexpr size_t kFewestOfThread = 4;
  ParallelLoop loop(count, begin, work);
  std::vector<std::future<void>> others;
  for (size_t i = UsefulThreads(count, kFewestOfThread); i > 1; --i) {
    others.push_back(std::async([&loop] {
      while (loop.RunNext()) {
      }
    }));
  }
  while (loop.RunNext()) loop.WriteOutput();
  for (std::future<void>& other : others) other.get();
  loop.WriteOutput();
  loop.RaiseFailure();
}

}  // namespace qrex
