// The files page.html, page.css and *.js beside this one, as the build of the tool has embedded them.
#pragma once

#include <string_view>

namespace qrex {

extern const std::string_view kPageHtml, kPageStyle, kPageScript;

}  // namespace qrex
