// Like work on many things by several threads.
#pragma once

#include <cstddef>
#include <functional>

namespace qrex {

// As many threads as the machine runs at once, but each with that much work at least.
size_t UsefulThreads(size_t work, size_t leastOfThread);

// Calls work(0), work(1), ... work(count - 1), some of them at the same time, but each behind begin(0), begin(1), ...
// of its own number, which are called one after the other. What they write to trace log and console comes out in this
// order. When one throws, no other is begun, and the exception of the first in order is raised here, behind the output
// of those before it.
using IndexedWork = std::function<void(size_t)>;
void ForEachInParallel(size_t count, const IndexedWork& begin, const IndexedWork& work);

}  // namespace qrex
