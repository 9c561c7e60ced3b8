#pragma once

namespace qrex {

// Which of the two forms of a project's or workspace's files is written: that of the sources, or that of their
// translations, whose names begin with "build_".
enum class Form { Plain, Translated };

}  // namespace qrex
