// The claim is the open file: who opens it and shares it with nobody finds out whether it is held.

#include "platform/file_claim.h"

#include "platform/windows/api.h"

namespace qrex::platform {

FileClaim::~FileClaim() {
  if (m_handle != kNoHandle) CloseHandle(AsHandle(m_handle));
}

Result FileClaim::Make(const std::string& path) {
  Handle file = OpenFile(path, GENERIC_READ, CREATE_NEW, FILE_ATTRIBUTE_NORMAL);
  if (!file) return Result::OfCall(false);
  m_handle = AsNumber(file.Release());
  return {};
}

void FileClaim::RemoveAbandoned(const std::string& path) {
  constexpr DWORD kAccess = GENERIC_READ | DELETE | FILE_WRITE_ATTRIBUTES, kNobody = 0;
  const Handle file = OpenFile(path, kAccess, OPEN_EXISTING, FILE_FLAG_OPEN_REPARSE_POINT, kNobody);
  if (!file) return;
  FILE_BASIC_INFO writable = {};  // times of 0 stay as they are
  writable.FileAttributes = FILE_ATTRIBUTE_NORMAL;
  SetFileInformationByHandle(file.Get(), FileBasicInfo, &writable, sizeof writable);
  FILE_DISPOSITION_INFO deleted = {TRUE};
  SetFileInformationByHandle(file.Get(), FileDispositionInfo, &deleted, sizeof deleted);
}

}  // namespace qrex::platform
