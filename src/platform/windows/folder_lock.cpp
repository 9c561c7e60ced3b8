// The lock is a mutex with the folder's number, whatever path leads there.

#include "platform/folder_lock.h"

#include "platform/windows/api.h"

namespace qrex::platform {

namespace {

intptr_t MutexOf(const std::string& folder) {
  const Handle opened = OpenFile(folder, FILE_READ_ATTRIBUTES, OPEN_EXISTING, FILE_FLAG_BACKUP_SEMANTICS);
  BY_HANDLE_FILE_INFORMATION info;
  if (!opened || !GetFileInformationByHandle(opened.Get(), &info)) return kNoHandle;
  std::wstring name = L"Global\\qrex-folder";
  for (const DWORD part : {info.dwVolumeSerialNumber, info.nFileIndexHigh, info.nFileIndexLow}) {
    name += L'-' + std::to_wstring(part);
  }
  const HANDLE mutex = CreateMutexW(nullptr, FALSE, name.c_str());
  return mutex ? AsNumber(mutex) : kNoHandle;
}

}  // namespace

FolderLock::FolderLock(const std::string& folder) : m_handle(MutexOf(folder)) {}

FolderLock::~FolderLock() {
  if (m_handle == kNoHandle) return;
  ReleaseMutex(AsHandle(m_handle));  // no more than a failure where it was not taken
  CloseHandle(AsHandle(m_handle));
}

// One whose holder was killed is taken as well.
bool FolderLock::TryToTake() {
  return m_handle == kNoHandle || WaitForSingleObject(AsHandle(m_handle), 0) != WAIT_TIMEOUT;
}

void FolderLock::Take() {
  if (m_handle != kNoHandle) WaitForSingleObject(AsHandle(m_handle), INFINITE);
}

uint64_t FolderLock::Holder() const { return 0; }

}  // namespace qrex::platform
