#include "platform/system.h"

#include <rpc.h>

#include <algorithm>
#include <exception>
#include <iterator>

#include "platform/dynamic_library.h"
#include "platform/file_system.h"
#include "platform/windows/api.h"

// Of the C library, which has no header for it. CommandLineToArgvW does the same, but its library starts all of the
// window system: most of the time of a short run.
extern "C" int __cdecl __wgetmainargs(int* count, wchar_t*** words, wchar_t*** environment, int expandsWildcards,
                                      int* mode);

namespace qrex::platform {

int64_t SystemFileTime() {
  FILETIME now;
  GetSystemTimeAsFileTime(&now);
  return FileTimeOf(now);
}

uint64_t PerformanceCounter() {
  LARGE_INTEGER count;
  QueryPerformanceCounter(&count);
  return static_cast<uint64_t>(count.QuadPart);
}

uint64_t PerformanceFrequency() {
  LARGE_INTEGER frequency;
  QueryPerformanceFrequency(&frequency);
  return static_cast<uint64_t>(frequency.QuadPart);
}

std::array<uint8_t, 16> MakeUuid() {
  using Create = RPC_STATUS(RPC_ENTRY*)(UUID*);
  std::string error;  // the library is always there, but few runs need it, with all that it brings along
  static const auto create =
      reinterpret_cast<Create>(FindSymbol(LoadDynamicLibrary("rpcrt4.dll", error), "UuidCreate"));
  UUID made;
  create(&made);  // one that is good on this machine alone serves, too
  std::array<uint8_t, 16> bytes;
  auto put = [at = bytes.begin()](auto value) mutable {
    for (size_t i = sizeof value; i-- > 0;) *at++ = static_cast<uint8_t>(value >> (8 * i));
  };
  put(static_cast<uint32_t>(made.Data1));
  put(static_cast<uint16_t>(made.Data2));
  put(static_cast<uint16_t>(made.Data3));
  for (const unsigned char byte : made.Data4) put(byte);
  return bytes;
}

std::optional<std::string> EnvironmentValue(const char* name) {
  const std::wstring wide = Wide(name);
  std::wstring value(GetEnvironmentVariableW(wide.c_str(), nullptr, 0), L'\0');
  if (value.empty()) return GetLastError() == ERROR_ENVVAR_NOT_FOUND ? std::nullopt : std::optional<std::string>("");
  value.resize(GetEnvironmentVariableW(wide.c_str(), value.data(), static_cast<DWORD>(value.size())));
  return Narrow(value);
}

void SetEnvironment(const std::string& name, const std::string& value) {
  SetEnvironmentVariableW(Wide(name).c_str(), Wide(value).c_str());
}

const char kPathListSeparator = ';';

namespace {

std::string CurrentFolder() {
  std::wstring folder(GetCurrentDirectoryW(0, nullptr), L'\0');
  folder.resize(GetCurrentDirectoryW(static_cast<DWORD>(folder.size()), folder.data()));
  return Narrow(folder);
}

}  // namespace

bool GoToFolder(const std::string& path) { return SetCurrentDirectoryW(Wide(path).c_str()) != 0; }

void EndAtOnce(int status) {
  TerminateProcess(GetCurrentProcess(), static_cast<UINT>(status));
  ExitProcess(static_cast<UINT>(status));  // for the compiler: the former does not return
}

WorkingFolder::WorkingFolder() : m_handle(kNoHandle), m_path(CurrentFolder()) {}
WorkingFolder::~WorkingFolder() = default;
void WorkingFolder::Return() const { SetCurrentDirectoryW(Wide(m_path).c_str()); }

size_t ProcessorCount() { return std::max<size_t>(1, GetActiveProcessorCount(ALL_PROCESSOR_GROUPS)); }

namespace {

std::vector<std::string> ListOf(std::string_view text) {
  std::vector<std::string> entries;
  while (!text.empty()) {
    const size_t end = std::min(text.find(kPathListSeparator), text.size());
    if (end > 0) entries.emplace_back(text.substr(0, end));
    text.remove_prefix(std::min(end + 1, text.size()));
  }
  return entries;
}

bool EndsWithIgnoringCase(std::string_view text, std::string_view end) {
  auto lower = [](char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c; };
  return text.size() >= end.size() &&
         std::equal(end.begin(), end.end(), text.end() - static_cast<ptrdiff_t>(end.size()),
                    [&](char a, char b) { return lower(a) == lower(b); });
}

bool IsPlainFile(const std::string& path) {
  FileInfo info;
  return Stat(path, info) && info.isPlain;
}

// A name without one of the extensions of programs stands for those that have one.
std::string WithExtension(const std::string& path) {
  const std::vector<std::string> extensions = ListOf(EnvironmentValue("PATHEXT").value_or(".COM;.EXE;.BAT;.CMD"));
  const bool isOfProgram = std::any_of(extensions.begin(), extensions.end(), [&](const std::string& extension) {
    return EndsWithIgnoringCase(path, extension);
  });
  if (isOfProgram && IsPlainFile(path)) return path;
  for (const std::string& extension : extensions) {
    std::string lower = extension;
    for (char& c : lower) c = c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
    if (IsPlainFile(path + lower)) return path + lower;
  }
  return {};
}

std::string PathOnPath(const std::string& program) {
  for (std::string folder : ListOf(EnvironmentValue("PATH").value_or(""))) {
    std::erase(folder, '"');
    if (const std::string found = WithExtension(folder + "/" + program); !found.empty()) return found;
  }
  return {};
}

}  // namespace

std::string FindProgram(const std::string& calledAs) {
  if (calledAs.empty()) return {};
  const bool isPath = calledAs.find_first_of("/\\:") != std::string::npos;
  const std::string found = isPath ? WithExtension(calledAs) : PathOnPath(calledAs);
  std::string path;
  return !found.empty() && FullPath(found, path) ? path : std::string();
}

bool CanRun(const std::string& calledAs) { return !FindProgram(calledAs).empty(); }

std::vector<std::string> CommandLineWords(int, char**) {
  std::vector<std::string> words;
  int count = 0, startup = 0;
  wchar_t **wide = nullptr, **environment = nullptr;
  __wgetmainargs(&count, &wide, &environment, 0, &startup);
  for (int i = 0; i < count; ++i) words.push_back(Narrow(wide[i]));
  return words;
}

std::string ProgramPath(const std::string& calledAs) {
  std::wstring path(32768, L'\0');
  path.resize(GetModuleFileNameW(nullptr, path.data(), static_cast<DWORD>(path.size())));
  std::string real;
  return RealPath(PathFrom(path), real) ? real : FindProgram(calledAs);
}

uint64_t CurrentThreadId() { return GetCurrentThreadId(); }

bool IsProcessRunning(uint64_t id) {
  const Handle process(OpenProcess(SYNCHRONIZE, FALSE, static_cast<DWORD>(id)));
  if (!process) return GetLastError() == ERROR_ACCESS_DENIED;
  return WaitForSingleObject(process.Get(), 0) == WAIT_TIMEOUT;
}

LocalTime CurrentLocalTime() {
  SYSTEMTIME now;
  GetLocalTime(&now);
  return {now.wDay, now.wMonth, now.wYear, now.wHour, now.wMinute, now.wSecond, now.wMilliseconds};
}

namespace {

constexpr size_t kLeastStack = 8 << 20;
constexpr size_t kOneLevel = 1 << 20;  // more than one level of anything takes

thread_local uintptr_t stackBegin = 0;  // of the thread's own stack; 0: it has none of RunOnStack's

struct StackRun {
  const std::function<void()>& body;
  std::exception_ptr failure;
};

DWORD WINAPI RunBody(void* argument) {
  StackRun& run = *static_cast<StackRun*>(argument);
  MEMORY_BASIC_INFORMATION here = {};
  VirtualQuery(&here, &here, sizeof here);
  stackBegin = reinterpret_cast<uintptr_t>(here.AllocationBase);
  try {
    run.body();
  } catch (...) {
    run.failure = std::current_exception();
  }
  return 0;
}

}  // namespace

bool RunOnStack(size_t bytes, const std::function<void()>& body) {
  StackRun run{body, nullptr};
  Handle thread;
  for (const size_t least = std::min(bytes, kLeastStack); !thread; bytes /= 2) {
    if (bytes < least) return false;
    thread = Handle(CreateThread(nullptr, bytes, RunBody, &run, STACK_SIZE_PARAM_IS_A_RESERVATION, nullptr));
  }
  WaitForSingleObject(thread.Get(), INFINITE);
  if (run.failure) std::rethrow_exception(run.failure);
  return true;
}

bool IsStackShort() {
  return stackBegin != 0 && reinterpret_cast<uintptr_t>(__builtin_frame_address(0)) < stackBegin + kOneLevel;
}

// What cannot be read, as a drive without a disk, is an error of this process, not a window that waits for an answer.
void SetSignals() { SetErrorMode(SEM_FAILCRITICALERRORS | SEM_NOOPENFILEERRORBOX); }

void TuneHeap() {}

}  // namespace qrex::platform
