#include "builder/times_ahead.h"

#include <algorithm>
#include <optional>
#include <system_error>
#include <utility>

#include "platform/system.h"

namespace qrex {

namespace {

constexpr size_t kFilesOfChunk = 64;
constexpr size_t kFewestFiles = 4 * kFilesOfChunk;
constexpr size_t kMostThreads = 7;

}  // namespace

TimesAhead::TimesAhead(const LeftoverSweep& announced)
    : m_announced(announced), m_writesBefore(announced.WriteCount()) {}

void TimesAhead::Add(Project& project, const ProjectConfig& config, bool withObjects) {
  project.CollectFiles();
  Entry& entry = m_entries.emplace_back(project, config, withObjects);
  entry.files.assign(project.files.begin(), project.files.end());
  entry.stamps.resize(entry.files.size());
  for (size_t begin = 0; begin < entry.files.size(); begin += kFilesOfChunk) {
    m_chunks.emplace_back(entry, begin, std::min(begin + kFilesOfChunk, entry.files.size()));
  }
  entry.lastChunk = m_chunks.size();
  m_entryOf.emplace(&project, &entry);
}

void TimesAhead::Begin() {
  const size_t others = std::min(platform::ProcessorCount() - 1, kMostThreads);
  if (others == 0 || m_chunks.size() * kFilesOfChunk < kFewestFiles) return;
  m_isOver = false;
  try {
    while (m_threads.size() < others) {
      m_threads.emplace_back([this] { ReadOn(m_chunks.size()); });
    }
  } catch (const std::system_error&) {
    // Fewer threads take longer, or none: then all is read when it is asked for.
  }
}

void TimesAhead::ReadOn(size_t last) {
  std::optional<Folders> folders;
  const Entry* entry = nullptr;
  while (!m_isOver) {
    size_t next = m_next;
    while (next < last && !m_next.compare_exchange_weak(next, next + 1)) {
    }
    if (next >= last) return;
    Chunk& chunk = m_chunks[next];
    if (std::exchange(entry, chunk.entry) != chunk.entry) folders.emplace();
    Read(chunk, *folders);
  }
}

void TimesAhead::Read(Chunk& chunk, Folders& folders) {
  Entry& entry = *chunk.entry;
  try {
    for (size_t i = chunk.begin; i < chunk.end; ++i) {
      const ProjectFile& file = *entry.files[i];
      Stamps& stamps = entry.stamps[i];
      stamps.source = folders.sources.StampOf(entry.project.SourcePath(file));
      stamps.translation = folders.translations.StampOf(entry.paths.Translated(file));
      if (!entry.withObjects || !HasObject(file)) continue;
      stamps.objectPath = entry.paths.Object(file);
      stamps.object = folders.objects.StampOf(stamps.objectPath);
    }
  } catch (...) {
    entry.isKnown = false;  // who asks the system anew is told why
  }
  {
    const std::lock_guard lock(m_mutex);
    chunk.isRead = true;
  }
  m_chunkIsRead.notify_one();  // there is one who asks
}

void TimesAhead::WaitFor(const Chunk& chunk) {
  if (chunk.isRead) return;
  std::unique_lock lock(m_mutex);
  m_chunkIsRead.wait(lock, [&] { return chunk.isRead.load(); });
}

std::vector<TimesAhead::Stamps>* TimesAhead::Of(const Project& project) {
  if (m_isOver) return nullptr;
  if (m_announced.WriteCount() != m_writesBefore) {
    End();
    return nullptr;
  }
  const auto known = m_entryOf.find(&project);
  if (known == m_entryOf.end()) return nullptr;
  Entry& entry = *known->second;
  ReadOn(entry.lastChunk);
  for (size_t i = entry.lastChunk; i-- > 0 && m_chunks[i].entry == &entry;) WaitFor(m_chunks[i]);
  return entry.isKnown ? &entry.stamps : nullptr;
}

void TimesAhead::End() {
  m_isOver = true;
  for (std::thread& thread : m_threads) thread.join();
  m_threads.clear();
}

}  // namespace qrex
