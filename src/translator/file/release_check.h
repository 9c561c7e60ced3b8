// Whether the release number of a project is that of its models.
#pragma once

namespace qrex {

class QrexParser;

// Warns where the file, which is translated, defines its project's target with a release that is earlier than the last
// one of a model of the project: what it writes could not be read again. Known are the models of the files that the
// build has read so far. With the key schemaLock its host is told of the release instead.
void CheckTargetRelease(QrexParser& parser);

}  // namespace qrex
