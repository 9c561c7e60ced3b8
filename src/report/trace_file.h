// The trace-event format of trace viewers (Perfetto, chrome://tracing): an object with the list `traceEvents`, of which
// each complete event ("X") has a begin and a duration in microseconds, and a thread: 0 is the translation, the others
// are slots.
#pragma once

#include <string>

#include "report/build_record.h"

namespace qrex {

std::string TraceText(const BuildRecord& record);

}  // namespace qrex
