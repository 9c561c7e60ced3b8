// What the build of one project has to do with the key schemaLock, beyond what translations ask of the lock.
//
// Beside the dependency file stands PROJECT.qrexschemas: a line with the release of the project's target and the source
// that defines it, then the lines of the lock that its sources were found to agree with. Where the lock has others, a
// merge or an edit has changed it: then all sources are asked, also those that are up to date.
#pragma once

#include <string>

#include "builder/build_files.h"
#include "builder/schema_lock.h"

namespace qrex {

class ProjectSchemas {
 public:
  ProjectSchemas(BuildFiles& builder, SchemaLock& lock, const std::string& dependencyFile);

  // Behind the translations. Raises a LexScannerException where a source contradicts the lock, or defines the target of
  // the project with a release below the last one.
  void Check();
  void Save();  // what Check, if it came to its end, has found
  static std::string NotePath(const std::string& dependencyFile);

 private:
  bool SeesAll() const;
  void TranslateAll(BuildFiles& files) const;
  void TellGone() const;
  void CheckTarget();

  BuildFiles& m_builder;
  SchemaLock& m_lock;
  const std::string m_path, m_project;
  std::string m_note, m_noteLines;  // as it was read
  DefinedTarget m_target;
  bool m_agrees = false;
};

}  // namespace qrex
