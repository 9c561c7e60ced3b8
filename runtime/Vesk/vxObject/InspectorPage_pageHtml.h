// runtime/inspector/page.html, by scripts/inspector-page: edit that, not this.

#include <string_view>

namespace vesk {

// clang-format off
constexpr std::string_view kInspectorPageHtml =
    "<!doctype html>\n"
    "<html lang=\x22""en\x22>\n"
    "<head>\n"
    "<meta charset=\x22utf-8\x22>\n"
    "<meta name=\x22viewport\x22 content=\x22width=device-width, initial-scale=1\x22>\n"
    "<meta name=\x22""color-scheme\x22 content=\x22light dark\x22>\n"
    "<link rel=\x22icon\x22 href=\x22""data:,\x22>\n"
    "<title>Inspector</title>\n"
    "<style nonce=\x22/*nonce*/\x22>\n"
    "/*style*/\n"
    "</style>\n"
    "</head>\n"
    "<body>\n"
    "<header class=\x22head\x22>\n"
    "  <h1 id=\x22title\x22>Inspector</h1>\n"
    "  <p id=\x22state\x22 role=\x22status\x22></p>\n"
    "  <div class=\x22tools\x22>\n"
    "    <label class=\x22search\x22><span class=\x22hidden\x22>Search names and values</span>\n"
    "      <input id=\x22search\x22 type=\x22search\x22 placeholder=\x22Search names and values\x22 autocomplete=\x22off\x22 spellcheck=\x22""false\x22></label>\n"
    "    <button id=\x22undo\x22 type=\x22""button\x22 disabled>Undo</button>\n"
    "    <button id=\x22redo\x22 type=\x22""button\x22 disabled>Redo</button>\n"
    "  </div>\n"
    "</header>\n"
    "<div id=\x22tabs\x22 role=\x22tablist\x22 aria-label=\x22Views\x22></div>\n"
    "<main id=\x22panels\x22></main>\n"
    "<div id=\x22""alert\x22 role=\x22""alert\x22 hidden></div>\n"
    "<noscript><p class=\x22""empty\x22>This page shows the program by a script, which is switched off.</p></noscript>\n"
    "<script nonce=\x22/*nonce*/\x22>\n"
    "/*script*/\n"
    "</script>\n"
    "</body>\n"
    "</html>\n";
// clang-format on

}  // namespace vesk
