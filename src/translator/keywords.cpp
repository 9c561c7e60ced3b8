#include "translator/keywords.h"

#include "translator/class_parser.h"
#include "translator/interface_def.h"
#include "translator/mixin_list.h"
#include "translator/model.h"
#include "translator/qrex_parser.h"
#include "translator/records.h"

namespace qrex {

namespace {

template <ClassKind kind>
void ParseFileClass(QrexParser& parser) {
  ParseClass(parser, kind, nullptr);
}

template <ClassKind kind>
void ParseNestedClass(QrexParser& parser, ClassDef& def) {
  ParseClass(parser, kind, &def);
}

void ParseModelInBody(QrexParser& parser, ClassDef& def) {
  if (def.HasEmbeddedModel()) parser.Fail("Repeated model declaration");
  parser.Advance();
  ParseModelBlock(parser, def);
  parser.DropBehindCurrent();
}

constexpr Keyword kKeywords[] = {
    {"type", ParseType},
    {"interface", [](QrexParser& parser) { ParseInterface(parser, nullptr); }},
    {"struct", ParseFileClass<ClassKind::Struct>},
    {"class", ParseFileClass<ClassKind::Class>},
    {"adt", ParseFileClass<ClassKind::Adt>},
    {"mixin", ParseFileClass<ClassKind::Mixin>},
    {"model", ParseFileClass<ClassKind::Model>},
    {"new", ParseNew, true},
    {"warning", ParseWarning},
    {"init", ParseInit, true},
    {"uninit", ParseUninit, true},
};

constexpr ClassKeyword kClassKeywords[] = {
    {"class", ParseNestedClass<ClassKind::Class>},
    {"struct", ParseNestedClass<ClassKind::Struct>},
    {"mixin", ParseNestedClass<ClassKind::Mixin>},
    {"interface", [](QrexParser& parser, ClassDef& def) { ParseInterface(parser, &def); }},
    {"model", ParseModelInBody},
    {"implementing", ParseImplementing},
    {"new", [](QrexParser& parser, ClassDef&) { ParseNew(parser); }, true},
    {"this", ParseThis, true},
};

}  // namespace

std::span<const Keyword> FileLevelKeywords() { return kKeywords; }
std::span<const ClassKeyword> ClassLevelKeywords() { return kClassKeywords; }

}  // namespace qrex
