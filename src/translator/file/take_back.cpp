#include "translator/file/take_back.h"

#include <algorithm>

namespace qrex {

std::vector<ScannedFile*> TakeBack(const std::vector<ScannedFile*>& files, const std::vector<ScannedFile*>& all) {
  IndexSet wanted;
  for (const ScannedFile* file : files) wanted.Add(file->index);
  const auto refersToWanted = [&](const ScannedFile& file) {
    return wanted.Has(file.index) || std::any_of(files.begin(), files.end(), [&](const ScannedFile* imported) {
             return file.importClosure.Has(imported->index);
           });
  };
  std::vector<ScannedFile*> going;
  for (ScannedFile* file : all) {
    if (file->HasBegun() && refersToWanted(*file)) going.push_back(file);
  }
  for (ScannedFile* file : going) file->TakeBack();
  return going;
}

}  // namespace qrex
