#include "platform/error.h"

#include <cerrno>

namespace qrex::platform {

namespace {

struct Mapping {
  int number;
  uint32_t code;
};
constexpr Mapping kMappings[] = {{ENOENT, 2},   {ENOTDIR, 3},        {EMFILE, 4}, {EACCES, 5},
                                 {EPERM, 5},    {EISDIR, 5},         {EROFS, 19}, {EEXIST, 80},
                                 {ENOSPC, 112}, {ENAMETOOLONG, 206}, {EFBIG, 223}};
constexpr uint32_t kGeneralFailure = 31;

struct Sentence {
  uint32_t code;
  const char* text;
};
constexpr Sentence kSentences[] = {
    {2, "The system cannot find the file specified."},
    {3, "The system cannot find the path specified."},
    {4, "The system cannot open the file."},
    {5, "Access is denied."},
    {19, "The media is write protected."},
    {29, "The system cannot write to the specified device."},
    {31, "A device attached to the system is not functioning."},
    {80, "The file exists."},
    {112, "There is not enough space on the disk."},
    {206, "The filename or extension is too long."},
    {223, "The file size exceeds the limit allowed and cannot be saved."},
};

uint32_t CodeOf(int error) {
  for (const Mapping& mapping : kMappings) {
    if (mapping.number == error) return mapping.code;
  }
  return kGeneralFailure;
}

}  // namespace

Result Result::OfSystem(int error) { return error == 0 ? Result() : Failure(CodeOf(error)); }
Result Result::OfCall(bool isWell) { return isWell ? Result() : Failure(LastError()); }

uint32_t LastError() { return CodeOf(errno); }

bool ErrorSentence(uint32_t code, std::string& text) {
  for (const Sentence& sentence : kSentences) {
    if (sentence.code != code) continue;
    text = sentence.text;
    return true;
  }
  return false;
}

}  // namespace qrex::platform
