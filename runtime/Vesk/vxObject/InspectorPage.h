// The page of the inspector, put together of its parts: runtime/inspector has them as one edits them.

@import "Vesk/vxObject/InspectorPage_archiveJs.h"
@import "Vesk/vxObject/InspectorPage_detailJs.h"
@import "Vesk/vxObject/InspectorPage_graphJs.h"
@import "Vesk/vxObject/InspectorPage_linkJs.h"
@import "Vesk/vxObject/InspectorPage_mainJs.h"
@import "Vesk/vxObject/InspectorPage_pageCss.h"
@import "Vesk/vxObject/InspectorPage_pageHtml.h"
@import "Vesk/vxObject/InspectorPage_treeJs.h"
@import "Vesk/vxObject/InspectorPage_typesJs.h"
@import "Vesk/vxObject/Text.h"

namespace vesk {

// With the nonce by which the browser knows its scripts and styles.
inline xstring InspectorPageText(std::string_view nonce) {
  const std::string_view scripts[] = {kInspectorLinkJs,  kInspectorTreeJs,    kInspectorDetailJs, kInspectorTypesJs,
                                      kInspectorGraphJs, kInspectorArchiveJs, kInspectorMainJs};
  xstring page, script;
  for (std::string_view part : scripts) script += part;
  std::string_view rest = kInspectorPageHtml;
  for (std::size_t hole; (hole = rest.find("/*")) != std::string_view::npos;) {
    const std::size_t end = rest.find("*/", hole) + 2;
    const std::string_view name = rest.substr(hole + 2, end - hole - 4);
    page += rest.substr(0, hole);
    page += name == "style" ? kInspectorPageCss : name == "script" ? std::string_view(script) : nonce;
    rest.remove_prefix(end);
  }
  page += rest;
  return page;
}

}  // namespace vesk
