#include "translator/keywords.h"

#include "translator/qrex_parser.h"
#include "translator/records.h"

namespace qrex {

namespace {

constexpr Keyword kKeywords[] = {
    {"type", ParseType},       {"new", ParseNew, true},       {"warning", ParseWarning},
    {"init", ParseInit, true}, {"uninit", ParseUninit, true},
};

}  // namespace

std::span<const Keyword> FileLevelKeywords() { return kKeywords; }

}  // namespace qrex
