// The stamps that the builds of the projects of a run ask for first, read by further threads while the projects ahead
// are judged. Where nothing has to be made, to ask the system for stamps is most of what a run costs, and the threads
// share it: who needs the stamps of a project reads those that nobody has begun to read.
//
// They hold as long as the run has written nothing: each write is announced to the sweep of leftovers (text/files.h)
// ahead of it, also those of tools. Behind the first one every project asks the system anew.
#pragma once

#include <atomic>
#include <condition_variable>
#include <deque>
#include <memory>
#include <mutex>
#include <string>
#include <thread>
#include <unordered_map>
#include <vector>

#include "builder/build_paths.h"
#include "text/files.h"

namespace qrex {

class TimesAhead {
 public:
  struct Stamps {
    FileStamp source, translation, object;  // all 0 also where there is no such file to be
    std::string objectPath;                 // empty: it has none
  };

  explicit TimesAhead(const LeftoverSweep& announced);
  ~TimesAhead() { End(); }
  TimesAhead(const TimesAhead&) = delete;
  TimesAhead& operator=(const TimesAhead&) = delete;

  // In the order in which they are going to be asked for. The files of a project stay as they are until the end.
  void Add(Project& project, const ProjectConfig& config, bool withObjects);
  void Begin();  // unless they are too few to be worth a thread
  // Of project.files, in their order, for the caller to keep what it likes; null: not known, or not any more.
  std::vector<Stamps>* Of(const Project& project);
  void End();  // they will not be asked for

 private:
  struct Entry {
    Entry(const Project& project, const ProjectConfig& config, bool withObjects)
        : project(project), paths(project, config), withObjects(withObjects) {}
    const Project& project;
    const BuildPaths paths;
    const bool withObjects;
    std::vector<const ProjectFile*> files;
    std::vector<Stamps> stamps;
    size_t lastChunk = 0;
    std::atomic<bool> isKnown{true};  // no path among them that the system can't be asked for
  };
  struct Chunk {
    Chunk(Entry& entry, size_t begin, size_t end) : entry(&entry), begin(begin), end(end) {}
    Entry* entry;
    size_t begin, end;
    std::atomic<bool> isRead{false};
  };

  struct Folders {
    FileTimes sources, translations, objects;  // open, of the project that a thread is at: descriptors are few
  };

  void ReadOn(size_t last);  // chunks that nobody has begun, up to that one
  void Read(Chunk& chunk, Folders& folders);
  void WaitFor(const Chunk& chunk);

  const LeftoverSweep& m_announced;
  const size_t m_writesBefore;
  std::deque<Entry> m_entries;
  std::unordered_map<const Project*, Entry*> m_entryOf;
  std::deque<Chunk> m_chunks;
  std::atomic<size_t> m_next{0};  // chunk that nobody has begun
  std::atomic<bool> m_isOver{true};
  // Not isRead.wait(): where the system itself has no such wait, that may miss what is told meanwhile.
  std::mutex m_mutex;
  std::condition_variable m_chunkIsRead;
  std::vector<std::thread> m_threads;
};

}  // namespace qrex
