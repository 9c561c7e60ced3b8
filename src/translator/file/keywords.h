// The words behind `$`, at file level and in class bodies, with their handlers. A new kind adds its handlers here.
#pragma once

#include "translator/reader/keywords.h"

namespace qrex {

const KeywordTables& AllKeywords();

}  // namespace qrex
